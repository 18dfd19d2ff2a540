// quirnelctl: the music library on the command line.

#include "Commands.h"
#include "app/QuirnelApp.h"
#include <IndexMaintenance.h>
#include <Volume.h>
#include <VolumeRoster.h>
#include <array>
#include <cerrno>
#include <cstdio>
#include <cstring>
#include <fcntl.h>
#include <string_view>
#include <unistd.h>

namespace {

constexpr char kUsage[] =
    "usage: quirnelctl [--json] [--verbose] COMMAND ...\n"
    "\n"
    "  volumes                             the volumes: device, name, root, attributes and queries yes or "
    "no\n"
    "  index [VOLUME-ROOT...]              tag the MP3 files that carry no tags; Ctrl+C stops it\n"
    "  strip [VOLUME-ROOT...]              remove the music attributes from the MP3 files\n"
    "  find [--fields] TEXT                songs whose name, artist, album or track number contains TEXT\n"
    "  query [--fields] PREDICATE [VOLUME-ROOT...]\n"
    "                                      files that satisfy PREDICATE, such as "
    "'Audio:Artist==\"*Lanterns*\"'\n"
    "  attr FILE...                        every attribute: name, type, size, value\n"
    "  cover FILE IMAGE                    make IMAGE the cover of the song FILE\n"
    "  reindex [VOLUME-ROOT...]            rebuild a volume's index from the attributes on its files\n"
    "  send [--launch] WHAT [--to SIGNATURE]\n"
    "                                      post a message code, such as 103 or 'ABCD', to a running program\n"
    "  layer play FILE                     play FILE together with what plays already; Ctrl+C ends it\n"
    "  layer list                          what plays: number, state, position, length, pitch, volume, name\n"
    "  layer pitch NUMBER PITCH            1 is the track's own, 2 twice as fast and high; 0 halts\n"
    "  layer seek NUMBER SECONDS           go on from there\n"
    "  layer volume NUMBER VOLUME          from 0 to 1\n"
    "  layer stop NUMBER                   end it\n"
    "\n"
    "  --json       one JSON object a line        --fields     a table of the songs' fields instead of "
    "paths\n"
    "  --null       end each path with a zero byte instead of a new line\n"
    "  --to         the program that the message is for; Quirnel when it is left out\n"
    "  --launch     start that program first when it does not run\n"
    "  --verbose    what the application would print on standard output, on standard error\n"
    "\n"
    "Without VOLUME-ROOT a command works on every volume that it can work on. Exit status 0, or 1 and one "
    "line on\n"
    "standard error.\n";

struct Command {
    std::string_view name;
    int (*run)(const Request&, Output&);
    /// Columns for the file manager come first, as at the application's start.
    bool writes;
    /// Indices on the volumes come first, as at the application's start: without one nothing is found.
    bool indexes;
    /// What other programs did to the files since the index last looked is taken in first.
    bool searches;
};

constexpr std::array<Command, 10> kCommands = {{
    {"volumes", ListVolumes, false, false, false},
    {"index", IndexVolumes, true, true, false},
    {"strip", StripVolumes, false, false, false},
    {"find", FindSongs, false, true, true},
    {"query", QueryFiles, false, true, true},
    {"attr", ShowAttributes, false, false, false},
    {"cover", SetCover, true, true, false},
    {"reindex", ReindexVolumes, true, true, false},
    {"send", SendCode, false, false, false},
    {"layer", ControlLayer, false, false, false},
}};

/// An empty text, or what is wrong with the command line.
std::string Parse(int count, char** arguments, Request& request, Output& output) {
    bool options_end = false;
    for (int at = 1; at < count; ++at) {
        const std::string_view argument = arguments[at];
        if (options_end || argument.size() < 2 || argument.front() != '-') {
            if (request.command.empty())
                request.command = argument;
            else
                request.arguments.emplace_back(argument);
        } else if (argument == "--") {
            options_end = true;
        } else if (argument == "--json") {
            output.SetForm(Output::Form::json);
        } else if (argument == "--null") {
            output.SetForm(Output::Form::null_ended);
        } else if (argument == "--fields") {
            request.fields = true;
        } else if (argument == "--verbose") {
            request.verbose = true;
        } else if (argument == "--launch") {
            request.launch = true;
        } else if (argument == "--to") {
            if (++at == count || arguments[at][0] == '\0')
                return "--to wants the signature of a program";
            request.signature = arguments[at];
        } else {
            return "no such option: " + Printable(std::string(argument));
        }
    }
    return request.command.empty() ? "no command given; 'quirnelctl --help' lists them" : "";
}

void TakeInChanges() {
    BVolumeRoster roster;
    BVolume volume;
    while (roster.GetNextVolume(&volume) == B_OK) {
        if (volume.KnowsQuery())
            refresh_index(volume.Device(), B_REFRESH_DIRECTORIES);
    }
}

// A standard descriptor that the caller had closed would be given to the next file that is opened, such as
// the index, and then written to. Results that have nowhere to go are an error.
void KeepStandardDescriptorsTaken() {
    for (const int descriptor : {STDIN_FILENO, STDOUT_FILENO, STDERR_FILENO}) {
        if (fcntl(descriptor, F_GETFD) >= 0 || errno != EBADF)
            continue;
        // The lowest free number is this one.
        if (open(descriptor == STDOUT_FILENO ? "/dev/full" : "/dev/null", O_RDWR) < 0)
            return;
    }
}

int PrintUsage() {
    std::fputs(kUsage, stdout);
    return std::fflush(stdout) == 0 ? 0 : Fail("the results could not be written");
}

int Run(const Command& command, const Request& request, Output& output) {
    output.Silence(request.verbose);
    QuirnelApp app;
    brindle_app = &app;
    if (command.writes)
        app.CheckTrackerDisplayAttributes();
    if (command.indexes)
        app.CheckCreateIndices();
    if (command.searches)
        TakeInChanges();
    const int status = command.run(request, output);
    brindle_app = nullptr;
    return status;
}

} // namespace

int Fail(const std::string& text) {
    std::fprintf(stderr, "quirnelctl: %s\n", text.c_str());
    return 1;
}

int main(int count, char** arguments) {
    KeepStandardDescriptorsTaken();
    for (int at = 1; at < count; ++at) {
        if (std::strcmp(arguments[at], "--help") == 0 || std::strcmp(arguments[at], "-h") == 0) {
            return PrintUsage();
        }
        if (std::strcmp(arguments[at], "--") == 0)
            break;
    }
    Request request;
    Output output;
    if (const std::string problem = Parse(count, arguments, request, output); !problem.empty())
        return Fail(problem);
    for (const Command& command : kCommands) {
        if (command.name != request.command)
            continue;
        int status = Run(command, request, output);
        close_indices();
        if (!output.Finish() && status == 0)
            status = Fail("the results could not be written");
        return status;
    }
    return Fail("no such command: " + Printable(request.command) + "; 'quirnelctl --help' lists them");
}
