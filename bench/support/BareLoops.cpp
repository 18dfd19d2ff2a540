#include "support/BareLoops.h"

#include <array>
#include <cstring>
#include <dirent.h>
#include <fcntl.h>
#include <sys/xattr.h>
#include <unistd.h>

namespace bench {
namespace {

constexpr std::array<const char*, 7> kWritten = {
    "user.be.Audio:Songname", "user.be.Audio:Artist",  "user.be.Audio:Album", "user.be.Audio:TrackNo",
    "user.be.Audio:Disc",     "user.be.Audio:Version", "user.be.Audio:Length"};
constexpr std::array<const char*, 17> kRemoved = {
    "user.be.Audio:Songname",  "user.be.Audio:Artist",     "user.be.Audio:Album",
    "user.be.Audio:TrackNo",   "user.be.Audio:Disc",       "user.be.Audio:Version",
    "user.be.Audio:Length",    "user.be.Audio:LengthUsec", "user.be.Audio:Samplerate",
    "user.be.Video:Framerate", "user.be.Audio:Bitrate",    "user.be.Audio:Channels",
    "user.be.Media:Encoder",   "user.be.Media:CoverImage", "user.be.Media:CoverColor",
    "user.be.Audio:Length",    "user.be.Audio:Bitrate"};

template <typename PerFile>
void Walk(int directory, const char* folder, Visited& visited, const PerFile& per_file) {
    DIR* stream = fdopendir(directory);
    if (stream == nullptr) {
        close(directory);
        return;
    }
    while (const dirent* entry = readdir(stream)) {
        if (entry->d_type == DT_DIR) {
            if (std::strcmp(entry->d_name, ".") == 0 || std::strcmp(entry->d_name, "..") == 0)
                continue;
            const int below = openat(dirfd(stream), entry->d_name, O_RDONLY | O_DIRECTORY | O_CLOEXEC);
            if (below >= 0)
                Walk(below, entry->d_name, visited, per_file);
            continue;
        }
        const std::size_t length = std::strlen(entry->d_name);
        if (length < 4 || std::strcmp(entry->d_name + length - 4, ".mp3") != 0)
            continue;
        const int file = openat(dirfd(stream), entry->d_name, O_RDONLY | O_CLOEXEC);
        if (file < 0)
            continue;
        per_file(file, folder, entry->d_name);
        close(file);
        ++visited.files;
    }
    closedir(stream);
}

template <typename PerFile>
Visited WalkFrom(const std::string& root, const PerFile& per_file) {
    Visited visited;
    const int directory = open(root.c_str(), O_RDONLY | O_DIRECTORY | O_CLOEXEC);
    if (directory >= 0)
        Walk(directory, "", visited, per_file);
    return visited;
}

} // namespace

Visited BareTag(const std::string& root) {
    return WalkFrom(root, [](int file, const char* folder, const char* name) {
        // The job's own values for the sample library's names: equal values in many files would be another
        // load, because the file system shares equal blocks of attributes.
        std::array<char, 300> value{};
        std::memcpy(value.data(), "CSTR", 4);
        const auto write = [&](std::size_t at, const char* text, std::size_t length) {
            std::memcpy(value.data() + 4, text, length);
            value[4 + length] = '\0';
            fsetxattr(file, kWritten[at], value.data(), 4 + length + 1, 0);
        };
        const char* dash = std::strchr(folder, '-');
        const std::size_t artist = dash ? static_cast<std::size_t>(dash - folder) : 0;
        const char* album = dash ? dash + 2 : "";
        write(0, name + 5, std::strlen(name) - 9);
        write(1, folder, artist);
        write(2, album, std::strlen(album));
        write(3, name, 3);
        write(4, "", 0);
        write(5, "", 0);
        write(6, " 0:00", 5);
    });
}

Visited BareRead(const std::string& root) {
    return WalkFrom(root, [](int file, const char*, const char*) {
        std::array<char, 260> value;
        for (const char* name : kWritten)
            static_cast<void>(fgetxattr(file, name, value.data(), value.size()));
    });
}

Visited BareStrip(const std::string& root) {
    return WalkFrom(root, [](int file, const char*, const char*) {
        for (const char* name : kRemoved)
            fremovexattr(file, name);
    });
}

} // namespace bench
