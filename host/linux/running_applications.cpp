#include "host/api/running_applications.h"

#include "event_thread.h"
#include "host/api/threads.h"
#include "local_endpoint.h"
#include "runtime_files.h"
#include "team_file.h"

#include <algorithm>
#include <array>
#include <dirent.h>
#include <fcntl.h>
#include <memory>
#include <strings.h>
#include <sys/epoll.h>
#include <sys/inotify.h>
#include <unistd.h>

namespace host {

namespace {

struct OwnApplication {
    Mutex mutex;
    std::optional<RunningApplication> application GUARDED_BY(mutex);
};

// Never read back from its file: closing that would give up the lock on it.
OwnApplication& own() {
    static OwnApplication* const kept = new OwnApplication;
    return *kept;
}

std::optional<RunningApplication> own_application() {
    OwnApplication& kept = own();
    MutexLock lock(kept.mutex);
    return kept.application && kept.application->process == ::getpid() ? kept.application : std::nullopt;
}

void set_own_application(std::optional<RunningApplication> application) {
    OwnApplication& kept = own();
    MutexLock lock(kept.mutex);
    kept.application = std::move(application);
}

std::optional<RunningApplication> application_of(const Descriptor& directory, std::int32_t process) {
    const Descriptor file(::openat(directory.get(), team_file_name(process).c_str(),
                                   O_RDONLY | O_CLOEXEC | O_NOFOLLOW | O_NONBLOCK));
    if (!file.valid())
        return std::nullopt;
    std::array<char, 16384> bytes;
    const ssize_t count = ::read(file.get(), bytes.data(), bytes.size());
    if (count <= 0)
        return std::nullopt;
    std::optional<RunningApplication> application =
        read_team_file({bytes.data(), static_cast<std::size_t>(count)});
    if (!application || application->process != process || !team_lives(directory, process))
        return std::nullopt;
    return application;
}

std::vector<RunningApplication> others_in(const Descriptor& directory) {
    std::vector<RunningApplication> others;
    const int again = ::openat(directory.get(), ".", O_RDONLY | O_DIRECTORY | O_CLOEXEC);
    const std::unique_ptr<DIR, int (*)(DIR*)> stream(again >= 0 ? ::fdopendir(again) : nullptr, ::closedir);
    if (stream == nullptr) {
        if (again >= 0)
            ::close(again);
        return others;
    }
    while (const dirent* entry = ::readdir(stream.get())) {
        const std::int32_t process = static_cast<std::int32_t>(std::strtol(entry->d_name, nullptr, 10));
        if (process <= 0 || process == ::getpid() || entry->d_name != team_file_name(process))
            continue;
        if (std::optional<RunningApplication> application = application_of(directory, process))
            others.push_back(*std::move(application));
    }
    return others;
}

bool in_the_way(const RunningApplication& wanted, const RunningApplication& other, Instances instances) {
    if (instances == Instances::any || ::strcasecmp(wanted.signature.c_str(), other.signature.c_str()) != 0)
        return false;
    return instances == Instances::one_per_signature || wanted.executable == other.executable;
}

// What was told last, and to whom. The event thread's alone, but for the watcher.
class Watching {
  public:
    static Watching& instance() {
        static Watching* const watching = new Watching;
        return *watching;
    }

    Status set(ApplicationWatcher watcher) {
        const bool wanted = watcher != nullptr;
        {
            MutexLock lock(mutex_);
            watcher_ = std::move(watcher);
        }
        if (!wanted)
            return {};
        const Status begun = begin();
        if (begun.ok())
            EventThread::instance().call_at(0, [this] { tick(); });
        return begun;
    }

  private:
    Status begin() {
        MutexLock lock(mutex_);
        if (begun_)
            return {};
        const Result<Descriptor> directory = open_runtime_directory();
        if (!directory)
            return directory.status();
        notifier_ = Descriptor(::inotify_init1(IN_CLOEXEC | IN_NONBLOCK));
        const std::string path = "/proc/self/fd/" + std::to_string(directory->get());
        if (!notifier_.valid() ||
            ::inotify_add_watch(notifier_.get(), path.c_str(), IN_MODIFY | IN_DELETE) < 0)
            return errno;
        // Whoever runs already is no news.
        known_ = running_applications();
        if (EventThread::instance().watch(notifier_.get(), EPOLLIN, [this](std::uint32_t) { changed(); }) ==
            0)
            return errno;
        begun_ = true;
        return {};
    }

    void changed() {
        std::array<char, 4096> events;
        while (::read(notifier_.get(), events.data(), events.size()) > 0) {
        }
        tell();
    }

    // A process that is killed changes no file.
    void tick() {
        constexpr std::int64_t second = 1'000'000'000;
        tell();
        {
            MutexLock lock(mutex_);
            if (watcher_ == nullptr || next_tick_ > uptime_nanoseconds())
                return;
            next_tick_ = uptime_nanoseconds() + second;
        }
        EventThread::instance().call_at(uptime_nanoseconds() + second, [this] { tick(); });
    }

    void tell() {
        const std::vector<RunningApplication> now = running_applications();
        ApplicationWatcher watcher;
        std::vector<RunningApplication> before;
        {
            MutexLock lock(mutex_);
            watcher = watcher_;
            before = std::exchange(known_, now);
        }
        if (watcher == nullptr)
            return;
        const auto same = [](const RunningApplication& a) {
            return [&a](const RunningApplication& b) { return a.process == b.process && a.began == b.began; };
        };
        for (const RunningApplication& application : before) {
            if (std::none_of(now.begin(), now.end(), same(application)))
                watcher(application, false);
        }
        for (const RunningApplication& application : now) {
            if (std::none_of(before.begin(), before.end(), same(application)))
                watcher(application, true);
        }
    }

    Mutex mutex_;
    ApplicationWatcher watcher_ GUARDED_BY(mutex_);
    std::vector<RunningApplication> known_ GUARDED_BY(mutex_);
    std::int64_t next_tick_ GUARDED_BY(mutex_) = 0;
    bool begun_ GUARDED_BY(mutex_) = false;
    // Set once, before the event thread hears of it.
    Descriptor notifier_;
};

} // namespace

Status register_application(RunningApplication application, Instances instances, RunningApplication& other) {
    application.process = ::getpid();
    application.began = uptime_nanoseconds();
    const Result<Descriptor> directory = open_runtime_directory();
    if (!directory)
        return directory.status();
    // Between looking and writing nobody else may do the same.
    const Result<RuntimeLock> lock = RuntimeLock::take(*directory);
    if (!lock)
        return lock.status();
    for (const RunningApplication& runs : others_in(*directory)) {
        if (in_the_way(application, runs, instances)) {
            other = runs;
            return EEXIST;
        }
    }
    if (const Status written = LocalEndpoint::instance().write_team_file(team_file_text(application));
        !written)
        return written;
    set_own_application(std::move(application));
    return {};
}

Status set_application_thread(std::int32_t thread) {
    std::optional<RunningApplication> application = own_application();
    if (!application)
        return ENOENT;
    application->thread = thread;
    const Status written = LocalEndpoint::instance().write_team_file(team_file_text(*application));
    set_own_application(std::move(application));
    return written;
}

void unregister_application() {
    if (!own_application())
        return;
    set_own_application(std::nullopt);
    // Should that fail, the process's end does the same.
    (void)LocalEndpoint::instance().write_team_file({});
}

std::vector<RunningApplication> running_applications() {
    std::vector<RunningApplication> all;
    if (const Result<Descriptor> directory = open_runtime_directory())
        all = others_in(*directory);
    if (std::optional<RunningApplication> application = own_application())
        all.push_back(*std::move(application));
    std::sort(all.begin(), all.end(), [](const RunningApplication& a, const RunningApplication& b) {
        return a.began != b.began ? a.began < b.began : a.process < b.process;
    });
    return all;
}

bool process_lives(std::int32_t process) {
    if (process == ::getpid())
        return true;
    const Result<Descriptor> directory = open_runtime_directory();
    return directory.ok() && team_lives(*directory, process);
}

Status watch_running_applications(ApplicationWatcher watcher) {
    return Watching::instance().set(std::move(watcher));
}

} // namespace host
