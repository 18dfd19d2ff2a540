// Writes a library of real MP3 files to try things on.

#include "samples/SampleLibrary.h"
#include <cstdio>
#include <cstdlib>
#include <string>

int main(int argc, char** argv) {
    char* end = nullptr;
    const unsigned long long count = argc >= 3 ? std::strtoull(argv[2], &end, 10) : 0;
    const bool bad_count = argc >= 3 && (count == 0 || *end != '\0');
    samples::SongContent content;
    if (argc == 4) {
        content.frames = static_cast<int>(std::strtol(argv[3], &end, 10));
        content.tags = samples::Sample::Tags::before;
    }
    if (argc < 2 || argc > 4 || argv[1][0] == '-' || bad_count ||
        (argc == 4 && (content.frames <= 0 || *end != '\0'))) {
        std::fprintf(
            stderr,
            "usage: sample-library FOLDER [COUNT [FRAMES]]\n"
            "Writes MP3 files below FOLDER: a small collection of every style of name, or COUNT songs in\n"
            "album folders, of one frame without tags inside, or of FRAMES frames with them.\n");
        return 2;
    }
    const std::string problem =
        argc >= 3 ? samples::WriteLargeLibrary(argv[1], static_cast<std::size_t>(count), content)
                  : samples::WriteSmallLibrary(argv[1]);
    if (!problem.empty()) {
        std::fprintf(stderr, "sample-library: %s\n", problem.c_str());
        return 1;
    }
    return 0;
}
