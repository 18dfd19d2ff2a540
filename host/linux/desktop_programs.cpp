#include "host/api/desktop_programs.h"

#include "data_directories.h"
#include "exec_line.h"
#include "key_file.h"
#include "mime_names.h"

#include <algorithm>
#include <cctype>
#include <cstdlib>
#include <dirent.h>
#include <memory>
#include <optional>
#include <set>
#include <string_view>
#include <sys/stat.h>
#include <unistd.h>

namespace host {

namespace {

constexpr const char* entry_group = "Desktop Entry";
constexpr const char* applications = "/applications/";
constexpr std::string_view entry_suffix = ".desktop";

std::vector<std::string> listed(const std::string& value) {
    std::vector<std::string> items;
    std::string_view rest = value;
    while (!rest.empty()) {
        const std::size_t end = rest.find(';');
        if (const std::string_view item = rest.substr(0, end); !item.empty())
            items.emplace_back(item);
        rest.remove_prefix(end == std::string_view::npos ? rest.size() : end + 1);
    }
    return items;
}

bool can_run(const std::string& path) {
    struct stat status = {};
    return ::stat(path.c_str(), &status) == 0 && S_ISREG(status.st_mode) && ::access(path.c_str(), X_OK) == 0;
}

std::string found_program(const std::string& name) {
    if (name.empty() || name.front() != '/')
        return program_in_path(name);
    return can_run(name) ? name : std::string();
}

// Where the user's and the system's choices are written down, the one that counts most first.
std::vector<KeyFile> association_files() {
    std::vector<std::string> names;
    const char* desktops = std::getenv("XDG_CURRENT_DESKTOP");
    std::string_view rest = desktops != nullptr ? desktops : "";
    while (!rest.empty()) {
        const std::size_t end = rest.find(':');
        std::string desktop(rest.substr(0, end));
        rest.remove_prefix(end == std::string_view::npos ? rest.size() : end + 1);
        std::transform(desktop.begin(), desktop.end(), desktop.begin(),
                       [](unsigned char letter) { return static_cast<char>(std::tolower(letter)); });
        if (!desktop.empty() && desktop.find('/') == std::string::npos)
            names.push_back(desktop + "-mimeapps.list");
    }
    names.emplace_back("mimeapps.list");
    std::vector<std::string> directories = config_directories();
    for (const std::string& directory : data_directories())
        directories.push_back(directory + "/applications");
    std::vector<KeyFile> files;
    for (const std::string& directory : directories) {
        for (const std::string& name : names) {
            if (std::optional<KeyFile> file = KeyFile::read(directory + "/" + name))
                files.push_back(*std::move(file));
        }
    }
    return files;
}

// A dash in an id may stand for a folder.
std::optional<std::string> file_of_entry(const std::string& id) {
    if (id.find('/') != std::string::npos)
        return std::nullopt;
    for (const std::string& directory : data_directories()) {
        std::string leaf = id;
        for (std::size_t dash = 0;;) {
            const std::string path = directory + applications + leaf;
            if (::access(path.c_str(), R_OK) == 0)
                return path;
            dash = leaf.find('-', dash);
            if (dash == std::string::npos)
                break;
            leaf[dash++] = '/';
        }
    }
    return std::nullopt;
}

std::optional<DesktopProgram> program_of_entry(const std::string& id) {
    const std::optional<std::string> path = file_of_entry(id);
    const std::optional<KeyFile> file = path ? KeyFile::read(*path) : std::nullopt;
    if (!file || file->flag(entry_group, "Hidden") || file->raw(entry_group, "Type") != "Application")
        return std::nullopt;
    const std::string tried = file->text(entry_group, "TryExec");
    if (!tried.empty() && found_program(tried).empty())
        return std::nullopt;
    const auto words = split_exec_line(file->text(entry_group, "Exec"));
    if (!words)
        return std::nullopt;
    DesktopProgram program;
    program.id = id;
    program.file = *path;
    program.name = file->text(entry_group, "Name");
    program.icon = file->text(entry_group, "Icon");
    program.in_terminal = file->flag(entry_group, "Terminal");
    program.executable = found_program(words->front());
    program.arguments.assign(words->begin() + 1, words->end());
    if (program.executable.empty())
        return std::nullopt;
    return program;
}

// The entries of one data directory that say they open the type.
std::vector<std::string> entries_opening(const std::string& data_directory, const std::string& type) {
    const std::string directory = data_directory + applications;
    if (const std::optional<KeyFile> cache = KeyFile::read(directory + "mimeinfo.cache"))
        return listed(cache->raw("MIME Cache", type));
    const std::unique_ptr<DIR, int (*)(DIR*)> stream(::opendir(directory.c_str()), ::closedir);
    std::vector<std::string> ids;
    while (stream != nullptr) {
        const dirent* entry = ::readdir(stream.get());
        if (entry == nullptr)
            break;
        const std::string id = entry->d_name;
        if (!id.ends_with(entry_suffix))
            continue;
        const std::optional<KeyFile> file = KeyFile::read(directory + id);
        const std::vector<std::string> types =
            listed(file ? file->raw(entry_group, "MimeType") : std::string());
        if (std::find(types.begin(), types.end(), type) != types.end())
            ids.push_back(id);
    }
    std::sort(ids.begin(), ids.end());
    return ids;
}

std::optional<DesktopProgram> first_that_runs(const std::vector<std::string>& ids,
                                              const std::set<std::string>& removed) {
    for (const std::string& id : ids) {
        if (removed.count(id) != 0)
            continue;
        if (std::optional<DesktopProgram> program = program_of_entry(id))
            return program;
    }
    return std::nullopt;
}

std::optional<DesktopProgram> program_for(const std::string& type, const std::vector<KeyFile>& choices) {
    for (const KeyFile& file : choices) {
        if (auto program = first_that_runs(listed(file.raw("Default Applications", type)), {}))
            return program;
    }
    // What is removed in one file does not come back from those behind it.
    std::set<std::string> removed;
    for (const KeyFile& file : choices) {
        if (auto program = first_that_runs(listed(file.raw("Added Associations", type)), removed))
            return program;
        for (const std::string& id : listed(file.raw("Removed Associations", type)))
            removed.insert(id);
    }
    for (const std::string& directory : data_directories()) {
        if (auto program = first_that_runs(entries_opening(directory, type), removed))
            return program;
    }
    return std::nullopt;
}

// One argument with its field codes replaced. `path` is empty when the program is started for no file.
std::string with_codes_replaced(const std::string& argument, const DesktopProgram& program,
                                const std::string& path) {
    std::string text;
    for (std::size_t at = 0; at < argument.size(); ++at) {
        if (argument[at] != '%' || at + 1 == argument.size()) {
            text += argument[at];
            continue;
        }
        switch (argument[++at]) {
        case '%':
            text += '%';
            break;
        case 'f':
        case 'F':
            text += path;
            break;
        case 'u':
        case 'U':
            text += path.empty() ? path : file_uri(path);
            break;
        case 'c':
            text += program.name;
            break;
        case 'k':
            text += program.file;
            break;
        default:
            // Codes that mean nothing any more are taken out.
            break;
        }
    }
    return text;
}

bool takes(const std::vector<std::string>& arguments, std::string_view codes) {
    return std::any_of(arguments.begin(), arguments.end(), [codes](const std::string& argument) {
        for (std::size_t at = argument.find('%'); at != std::string::npos && at + 1 < argument.size();
             at = argument.find('%', at + 2)) {
            if (codes.find(argument[at + 1]) != std::string_view::npos)
                return true;
        }
        return false;
    });
}

std::vector<std::string> arguments_at_once(const DesktopProgram& program,
                                           const std::vector<std::string>& paths) {
    std::vector<std::string> arguments;
    for (const std::string& argument : program.arguments) {
        if (argument == "%F") {
            arguments.insert(arguments.end(), paths.begin(), paths.end());
        } else if (argument == "%U") {
            for (const std::string& path : paths)
                arguments.push_back(file_uri(path));
        } else if (argument == "%i") {
            if (!program.icon.empty())
                arguments.insert(arguments.end(), {"--icon", program.icon});
        } else if ((argument == "%f" || argument == "%u") && paths.empty()) {
            continue;
        } else {
            std::string text = with_codes_replaced(argument, program, paths.empty() ? "" : paths.front());
            // A code that is a whole argument and means nothing leaves none.
            if (!text.empty() || argument.empty() || argument.front() != '%')
                arguments.push_back(std::move(text));
        }
    }
    return arguments;
}

} // namespace

Result<DesktopProgram> preferred_program(const std::string& mime_type) {
    const std::vector<KeyFile> choices = association_files();
    for (const std::string& name : names_of_type(mime_type)) {
        if (std::optional<DesktopProgram> program = program_for(name, choices))
            return *std::move(program);
    }
    return Status(ENOENT);
}

std::vector<std::vector<std::string>> arguments_for(const DesktopProgram& program,
                                                    const std::vector<std::string>& paths) {
    DesktopProgram taking = program;
    // Many programs leave the code out and take a file all the same.
    if (!takes(program.arguments, "fFuU"))
        taking.arguments.emplace_back("%f");
    if (paths.size() <= 1 || takes(taking.arguments, "FU"))
        return {arguments_at_once(taking, paths)};
    std::vector<std::vector<std::string>> starts;
    for (const std::string& path : paths)
        starts.push_back(arguments_at_once(taking, {path}));
    return starts;
}

std::string program_in_path(const std::string& name) {
    if (name.empty() || name.find('/') != std::string::npos)
        return {};
    const char* path = std::getenv("PATH");
    for (const std::string& directory : directories_of(path != nullptr ? path : "/usr/bin:/bin")) {
        const std::string candidate = directory + "/" + name;
        if (can_run(candidate))
            return candidate;
    }
    return {};
}

std::string file_uri(const std::string& path) {
    constexpr std::string_view plain = "ABCDEFGHIJKLMNOPQRSTUVWXYZabcdefghijklmnopqrstuvwxyz0123456789-._~/";
    constexpr char digits[] = "0123456789ABCDEF";
    std::string uri = "file://";
    for (const char byte : path) {
        if (plain.find(byte) != std::string_view::npos) {
            uri += byte;
        } else {
            const auto value = static_cast<unsigned char>(byte);
            uri += '%';
            uri += digits[value >> 4];
            uri += digits[value & 15];
        }
    }
    return uri;
}

} // namespace host
