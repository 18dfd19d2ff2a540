#include "host/linux/directory.h"

#include "host/linux/system_calls.h"
#include <cerrno>
#include <ctime>
#include <fcntl.h>
#include <linux/magic.h>
#include <sys/statfs.h>

namespace host {

namespace {

std::int64_t nanoseconds(const struct timespec& time) {
    return std::int64_t{time.tv_sec} * 1'000'000'000 + time.tv_nsec;
}

// Two changes within one tick of the file system's clock have the same time, so a fresh one proves nothing.
bool is_settled(std::int64_t change_time) {
    constexpr std::int64_t kTick = 50'000'000;
    struct timespec now = {};
    ::clock_gettime(CLOCK_REALTIME_COARSE, &now);
    const std::int64_t age = nanoseconds(now) - change_time;
    return age > kTick;
}

} // namespace

Directory::Directory(Descriptor descriptor, DeviceId device, const struct stat& status)
    : descriptor_(std::move(descriptor)), device_(device), file_system_device_(status.st_dev),
      inode_(status.st_ino) {}

Result<std::string> Directory::path() const {
    struct stat status = {};
    if (system_calls().fstat(descriptor(), &status) != 0)
        return Status(errno);
    if (status.st_nlink == 0)
        return Status(ENOENT);
    const std::string link = "/proc/self/fd/" + std::to_string(descriptor());
    std::string path(4096, '\0');
    const ssize_t length = system_calls().readlinkat(AT_FDCWD, link.c_str(), path.data(), path.size());
    if (length < 0)
        return Status(errno);
    if (static_cast<std::size_t>(length) == path.size())
        return Status(ENAMETOOLONG);
    path.resize(static_cast<std::size_t>(length));
    // A directory that lies outside of what this process can see has no absolute path.
    if (path.empty() || path[0] != '/')
        return Status(ENOENT);
    // Not every file system counts a removed directory's links down; the name says it too.
    constexpr std::string_view kRemoved = " (deleted)";
    if (path.ends_with(kRemoved)) {
        struct stat found = {};
        const bool same = system_calls().fstatat(AT_FDCWD, path.c_str(), &found, AT_SYMLINK_NOFOLLOW) == 0 &&
                          found.st_ino == status.st_ino && found.st_dev == status.st_dev;
        if (!same)
            return Status(ENOENT);
    }
    return path;
}

// Whether the file system moves a directory's change time when it is renamed or moved, and counts its links
// down when it is removed.
bool Directory::keeps_books() const {
    constexpr unsigned long kXfsMagic = 0x58465342;
    Answer answer = keeps_books_.load(std::memory_order_relaxed);
    if (answer == Answer::unknown) {
        struct statfs status = {};
        if (system_calls().fstatfs(descriptor(), &status) != 0)
            return false;
        const auto type = static_cast<unsigned long>(status.f_type);
        const bool does =
            type == EXT4_SUPER_MAGIC || type == BTRFS_SUPER_MAGIC || type == TMPFS_MAGIC || type == kXfsMagic;
        answer = does ? Answer::yes : Answer::no;
        keeps_books_.store(answer, std::memory_order_relaxed);
    }
    return answer == Answer::yes;
}

Result<Directory::Place> Directory::place() const {
    struct stat status = {};
    if (system_calls().fstat(descriptor(), &status) != 0)
        return Status(errno);
    if (status.st_nlink == 0)
        return Status(ENOENT);
    const std::int64_t change_time = nanoseconds(status.st_ctim);
    {
        MutexLock lock(place_mutex_);
        if (place_change_time_ == change_time && change_time >= 0)
            return place_;
    }
    const Result<std::string> whole = path();
    if (!whole.ok())
        return whole.status();
    struct stat above = {};
    if (system_calls().fstatat(descriptor(), "..", &above, 0) != 0)
        return Status(errno);
    Place place{*whole == "/" ? "." : whole->substr(whole->rfind('/') + 1), above.st_dev, above.st_ino};
    // What is above a file system's root is another file system's matter, whose changes do not show here.
    const bool lasting = above.st_dev == file_system_device_ && is_settled(change_time) && keeps_books();
    MutexLock lock(place_mutex_);
    place_ = place;
    place_change_time_ = lasting ? change_time : -1;
    return place;
}

Status Directory::check_exists(const char* leaf) const {
    struct stat status = {};
    if (system_calls().fstat(descriptor(), &status) != 0)
        return errno;
    if (status.st_nlink == 0)
        return ENOENT;
    if (keeps_books() ||
        system_calls().fstatat(descriptor(), leaf, &status, AT_SYMLINK_NOFOLLOW | AT_NO_AUTOMOUNT) == 0)
        return {};
    return errno == ENOENT ? path().status() : Status(errno);
}

} // namespace host
