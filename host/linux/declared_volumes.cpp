#include "host/linux/declared_volumes.h"

#include "host/api/directories.h"
#include "host/linux/descriptor.h"
#include <algorithm>
#include <cstdlib>
#include <fcntl.h>
#include <fstream>
#include <string_view>
#include <unistd.h>

namespace host {

namespace {

const char* volumes_variable() {
    const char* value = std::getenv("BEKITS_VOLUMES");
    return value != nullptr && value[0] != '\0' ? value : nullptr;
}

std::string volumes_file() {
    return config_directory() + "/volumes";
}

void add(DeclaredVolumes& declared, std::string path) {
    if (path.starts_with("~/"))
        path.replace(0, 1, home_directory());
    while (path.size() > 1 && path.back() == '/')
        path.pop_back();
    if (!path.empty() && path[0] == '/')
        declared.paths.push_back(std::move(path));
}

} // namespace

DeclaredVolumes read_declared_volumes() {
    DeclaredVolumes declared;
    if (const char* value = volumes_variable()) {
        declared.exclusive = true;
        std::string_view rest(value);
        while (!rest.empty()) {
            const std::size_t end = std::min(rest.find(':'), rest.size());
            add(declared, std::string(rest.substr(0, end)));
            rest.remove_prefix(std::min(end + 1, rest.size()));
        }
        return declared;
    }
    std::ifstream file(volumes_file(), std::ios::binary);
    for (std::string line; std::getline(file, line);) {
        if (!line.starts_with("#"))
            add(declared, std::move(line));
    }
    return declared;
}

void make_volumes_file() {
    const std::string path = volumes_file();
    if (volumes_variable() != nullptr || ::access(path.c_str(), F_OK) == 0)
        return;
    const std::string music = music_directory();
    // A name with a line break cannot be written down.
    if (music.empty() || music.find('\n') != std::string::npos || !make_directories(config_directory()).ok())
        return;
    const std::string text = "# Directories that count as volumes of their own, one a line.\n" + music + "\n";
    // Complete under another name first: another program may be starting and read it.
    const std::string temporary = path + ".new-" + std::to_string(::getpid());
    const Descriptor file(::open(temporary.c_str(), O_WRONLY | O_CREAT | O_TRUNC | O_CLOEXEC, 0600));
    if (!file.valid())
        return;
    const bool written = ::write(file.get(), text.data(), text.size()) == static_cast<ssize_t>(text.size());
    // link() fails where another program was faster; its file stands. On any other failure the next start
    // tries again.
    if (written)
        (void)!::link(temporary.c_str(), path.c_str());
    ::unlink(temporary.c_str());
}

} // namespace host
