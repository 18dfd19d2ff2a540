#include "host/api/directories.h"

#include <cerrno>
#include <cstdlib>
#include <fstream>
#include <pwd.h>
#include <string_view>
#include <sys/stat.h>
#include <unistd.h>
#include <vector>

namespace host {

namespace {

std::string without_trailing_slashes(std::string path) {
    while (path.size() > 1 && path.back() == '/')
        path.pop_back();
    return path;
}

// The XDG rules let relative values count as not set.
std::string absolute_variable(const char* name) {
    const char* value = std::getenv(name);
    if (value == nullptr || value[0] != '/')
        return {};
    return without_trailing_slashes(value);
}

std::string base_directory(const char* variable, const char* below_home) {
    const std::string base = absolute_variable(variable);
    return (base.empty() ? home_directory() + below_home : base) + "/bekits";
}

std::string config_home() {
    const std::string base = absolute_variable("XDG_CONFIG_HOME");
    return base.empty() ? home_directory() + "/.config" : base;
}

std::string data_home() {
    const std::string base = absolute_variable("XDG_DATA_HOME");
    return base.empty() ? home_directory() + "/.local/share" : base;
}

bool is_directory(const std::string& path) {
    struct stat status = {};
    return ::stat(path.c_str(), &status) == 0 && S_ISDIR(status.st_mode);
}

// One line `KEY="value"` of user-dirs.dirs, whose value is "$HOME/..." or absolute, with backslashes before
// what a shell would take for its own.
std::string users_directory_value(const std::string& line, std::string_view key) {
    const std::size_t start = line.find_first_not_of(" \t");
    if (start == std::string::npos || line.compare(start, key.size(), key) != 0)
        return {};
    std::size_t at = start + key.size();
    if (line.compare(at, 2, "=\"") != 0)
        return {};
    at += 2;
    std::string value;
    constexpr std::string_view kHome = "$HOME";
    if (line.compare(at, kHome.size(), kHome) == 0) {
        value = home_directory();
        at += kHome.size();
    }
    for (; at < line.size() && line[at] != '"'; ++at) {
        if (line[at] == '\\' && at + 1 < line.size())
            ++at;
        value += line[at];
    }
    return !value.empty() && value[0] == '/' ? without_trailing_slashes(value) : std::string();
}

// By the xdg-user-dirs file; a directory set to the home directory itself counts as none.
std::string users_directory(std::string_view key, const char* below_home) {
    std::ifstream file(config_home() + "/user-dirs.dirs");
    std::string found;
    for (std::string line; std::getline(file, line);) {
        const std::string value = users_directory_value(line, key);
        if (!value.empty())
            found = value;
    }
    if (found.empty())
        found = home_directory() + below_home;
    return found == home_directory() ? std::string() : found;
}

// Ours alone, or not to be used: others could have made it first in a directory that all may write to.
bool is_private(const std::string& path) {
    struct stat status = {};
    return ::lstat(path.c_str(), &status) == 0 && S_ISDIR(status.st_mode) && status.st_uid == ::geteuid() &&
           (status.st_mode & 0077) == 0;
}

} // namespace

std::string home_directory() {
    const std::string home = absolute_variable("HOME");
    if (!home.empty())
        return home;
    struct passwd record = {};
    struct passwd* found = nullptr;
    std::vector<char> buffer(4096);
    if (::getpwuid_r(::geteuid(), &record, buffer.data(), buffer.size(), &found) == 0 && found != nullptr &&
        found->pw_dir != nullptr && found->pw_dir[0] == '/')
        return without_trailing_slashes(found->pw_dir);
    return "/";
}

std::string config_directory() {
    return base_directory("XDG_CONFIG_HOME", "/.config");
}

std::string data_directory() {
    return base_directory("XDG_DATA_HOME", "/.local/share");
}

std::string cache_directory() {
    return base_directory("XDG_CACHE_HOME", "/.cache");
}

std::string temporary_directory() {
    const std::string directory = absolute_variable("TMPDIR");
    return directory.empty() ? "/tmp" : directory;
}

std::string runtime_directory() {
    const std::string base = absolute_variable("XDG_RUNTIME_DIR");
    if (!base.empty())
        return base + "/bekits";
    const std::string path = temporary_directory() + "/bekits-" + std::to_string(::geteuid());
    if (::mkdir(path.c_str(), 0700) == 0 || is_private(path))
        return path;
    return cache_directory() + "/run";
}

std::string music_directory() {
    const std::string path = users_directory("XDG_MUSIC_DIR", "/Music");
    return is_directory(path) ? path : std::string();
}

std::string desktop_directory() {
    const std::string path = users_directory("XDG_DESKTOP_DIR", "/Desktop");
    return path.empty() ? home_directory() : path;
}

std::string trash_directory() {
    return data_home() + "/Trash";
}

Status make_directories(const std::string& path) {
    if (path.empty() || path[0] != '/')
        return EINVAL;
    for (std::size_t end = path.find('/', 1);; end = path.find('/', end + 1)) {
        const std::string part = path.substr(0, end);
        if (::mkdir(part.c_str(), 0700) != 0 && !is_directory(part)) {
            // EEXIST here means that something else stands in the way.
            const int error = errno;
            return error == EEXIST ? ENOTDIR : error;
        }
        if (end == std::string::npos)
            return {};
    }
}

} // namespace host
