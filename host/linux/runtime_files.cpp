#include "runtime_files.h"

#include "host/api/directories.h"
#include "host/api/threads.h"

#include <charconv>
#include <dirent.h>
#include <fcntl.h>
#include <memory>
#include <sys/file.h>
#include <sys/stat.h>
#include <unistd.h>
#include <vector>

namespace host {

namespace {

constexpr const char* team_suffix = ".team";
constexpr const char* socket_suffix = ".socket";
constexpr const char* lock_name = "lock";

/// The process of "NUMBER.team" or "NUMBER.socket", 0 for any other name.
std::int32_t process_of(std::string_view name) {
    std::int32_t process = 0;
    const auto [end, error] = std::from_chars(name.data(), name.data() + name.size(), process);
    const std::string_view suffix = name.substr(static_cast<std::size_t>(end - name.data()));
    return error == std::errc() && process > 0 && (suffix == team_suffix || suffix == socket_suffix) ? process
                                                                                                     : 0;
}

} // namespace

Result<Descriptor> open_runtime_directory() {
    const std::string path = runtime_directory();
    constexpr int flags = O_RDONLY | O_DIRECTORY | O_NOFOLLOW | O_CLOEXEC;
    Descriptor directory(::open(path.c_str(), flags));
    if (!directory.valid() && errno == ENOENT) {
        if (const Status made = make_directories(path); !made)
            return made;
        directory = Descriptor(::open(path.c_str(), flags));
    }
    if (!directory.valid())
        return Status(errno);
    struct stat status = {};
    if (::fstat(directory.get(), &status) != 0)
        return Status(errno);
    if (status.st_uid != ::geteuid())
        return Status(EPERM);
    if ((status.st_mode & 07777) != 0700 && ::fchmod(directory.get(), 0700) != 0)
        return Status(errno);
    return directory;
}

std::string team_file_name(std::int32_t process) {
    return std::to_string(process) + team_suffix;
}

std::string socket_name(std::int32_t process) {
    return std::to_string(process) + socket_suffix;
}

std::string socket_path(const Descriptor& directory, std::int32_t process) {
    return "/proc/self/fd/" + std::to_string(directory.get()) + "/" + socket_name(process);
}

Result<RuntimeLock> RuntimeLock::take(const Descriptor& directory) {
    constexpr std::int64_t longest_wait = 5'000'000'000;
    constexpr std::int64_t pause = 1'000'000;
    Descriptor file(
        ::openat(directory.get(), lock_name, O_RDWR | O_CREAT | O_CLOEXEC | O_NOFOLLOW, S_IRUSR | S_IWUSR));
    if (!file.valid())
        return Status(errno);
    for (const std::int64_t end = uptime_nanoseconds() + longest_wait;;) {
        if (::flock(file.get(), LOCK_EX | LOCK_NB) == 0)
            return RuntimeLock(std::move(file));
        if (errno != EWOULDBLOCK && errno != EINTR)
            return Status(errno);
        if (uptime_nanoseconds() > end)
            return Status(ETIMEDOUT);
        sleep_until(uptime_nanoseconds() + pause);
    }
}

bool team_lives(const Descriptor& directory, std::int32_t process) {
    const Descriptor file(
        ::openat(directory.get(), team_file_name(process).c_str(), O_RDWR | O_CLOEXEC | O_NOFOLLOW));
    if (!file.valid())
        return false;
    struct flock wanted = {};
    wanted.l_type = F_WRLCK;
    wanted.l_whence = SEEK_SET;
    return ::fcntl(file.get(), F_GETLK, &wanted) == 0 && wanted.l_type != F_UNLCK;
}

void remove_stale_files(const Descriptor& directory, const RuntimeLock&) {
    const int again = ::openat(directory.get(), ".", O_RDONLY | O_DIRECTORY | O_CLOEXEC);
    const std::unique_ptr<DIR, int (*)(DIR*)> stream(again >= 0 ? ::fdopendir(again) : nullptr, ::closedir);
    if (stream == nullptr) {
        if (again >= 0)
            ::close(again);
        return;
    }
    std::vector<std::int32_t> processes;
    while (const dirent* entry = ::readdir(stream.get())) {
        const std::int32_t process = process_of(entry->d_name);
        if (process != 0 && process != ::getpid())
            processes.push_back(process);
    }
    for (const std::int32_t process : processes) {
        if (team_lives(directory, process))
            continue;
        ::unlinkat(directory.get(), socket_name(process).c_str(), 0);
        ::unlinkat(directory.get(), team_file_name(process).c_str(), 0);
    }
}

} // namespace host
