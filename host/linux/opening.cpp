#include "host/linux/opening.h"

#include "host/linux/system_calls.h"
#include <cerrno>
#include <fcntl.h>
#include <sys/stat.h>

namespace host {

namespace {

constexpr int kReadingFlags = O_RDONLY | O_NONBLOCK | O_NOCTTY | O_CLOEXEC;

int open_retrying(int directory, const char* leaf, int flags) {
    int descriptor = -1;
    do {
        descriptor = system_calls().openat(directory, leaf, flags, 0);
    } while (descriptor < 0 && errno == EINTR);
    return descriptor;
}

// O_NOATIME is for a file's owner alone: anyone else gets EPERM and reads with the access time moving.
int open_without_access_time(int directory, const char* leaf, int flags) {
    const int descriptor = open_retrying(directory, leaf, flags | O_NOATIME);
    if (descriptor >= 0 || errno != EPERM)
        return descriptor;
    return open_retrying(directory, leaf, flags);
}

} // namespace

Result<Descriptor> open_for_reading(int directory, const char* leaf, struct stat* status) {
    struct stat own = {};
    struct stat& found = status != nullptr ? *status : own;
    found = {};
    // Looked at first because opening some devices has effects of its own.
    if (system_calls().fstatat(directory, leaf, &found, AT_SYMLINK_NOFOLLOW) != 0)
        return Status(errno);
    if (S_ISREG(found.st_mode) || S_ISDIR(found.st_mode) || S_ISFIFO(found.st_mode)) {
        const int descriptor = open_without_access_time(directory, leaf, kReadingFlags | O_NOFOLLOW);
        if (descriptor >= 0)
            return Descriptor(descriptor);
        // ELOOP: a symbolic link has taken its place meanwhile.
        if (errno != ELOOP)
            return Status(errno);
    }
    const int descriptor = open_retrying(directory, leaf, O_PATH | O_NOFOLLOW | O_CLOEXEC);
    if (descriptor < 0)
        return Status(errno);
    return Descriptor(descriptor);
}

Result<Descriptor> open_file_for_reading(int directory, const char* leaf) {
    const int descriptor = open_without_access_time(directory, leaf, kReadingFlags | O_NOFOLLOW);
    if (descriptor < 0)
        return Status(errno);
    return Descriptor(descriptor);
}

Result<Descriptor> open_directory(int directory, const char* leaf, SymbolicLink symbolic_link) {
    const int more = O_DIRECTORY | (symbolic_link == SymbolicLink::refuse ? O_NOFOLLOW : 0);
    int descriptor = open_without_access_time(directory, leaf, kReadingFlags | more);
    if (descriptor < 0 && errno == EACCES)
        descriptor = open_retrying(directory, leaf, O_PATH | O_CLOEXEC | more);
    if (descriptor < 0) {
        const bool is_link = errno == ELOOP && symbolic_link == SymbolicLink::refuse;
        return Status(is_link ? ENOTDIR : errno);
    }
    return Descriptor(descriptor);
}

Result<Descriptor> reopen_directory(int directory) {
    const int descriptor = open_without_access_time(directory, ".", kReadingFlags | O_DIRECTORY);
    if (descriptor < 0)
        return Status(errno);
    return Descriptor(descriptor);
}

} // namespace host
