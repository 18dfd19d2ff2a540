#include "host/linux/volume_watcher.h"

#include "host/linux/volume_table.h"
#include <algorithm>
#include <cstdint>
#include <fcntl.h>
#include <mutex>
#include <poll.h>
#include <sys/eventfd.h>
#include <unistd.h>

namespace host {

namespace {
constexpr int kLookAgainMilliseconds = 3000;
}

class VolumeWatcher::Registration {
  public:
    explicit Registration(Volumes::Listener listener) : listener_(std::move(listener)) {}

    void call(Volumes::Change change, const VolumeInfo& info) {
        const std::lock_guard lock(mutex_);
        if (listener_)
            listener_(change, info.id, info);
    }
    /// Waits for a call under way on another thread.
    void end() {
        const std::lock_guard lock(mutex_);
        ended_ = true;
    }
    bool ended() {
        const std::lock_guard lock(mutex_);
        return ended_;
    }

  private:
    // Recursive because a listener may drop its own token during its call.
    std::recursive_mutex mutex_;
    const Volumes::Listener listener_;
    bool ended_ = false; // guarded by mutex_
};

VolumeWatcher::~VolumeWatcher() {
    MutexLock lock(mutex_);
    registrations_.clear();
    if (wake_.valid())
        (void)!::write(wake_.get(), "\1\0\0\0\0\0\0\0", 8);
    std::thread thread = std::move(thread_);
    lock.unlock();
    if (thread.joinable())
        thread.join();
}

std::shared_ptr<void> VolumeWatcher::listen(Volumes::Listener listener) {
    auto registration = std::make_shared<Registration>(std::move(listener));
    // Looked at here: whatever changes after this call is news.
    auto known = table_.refresh();
    MutexLock lock(mutex_);
    registrations_.push_back(registration);
    start(std::move(known));
    return std::shared_ptr<void>(registration.get(),
                                 [this](void* token) { remove(static_cast<Registration*>(token)); });
}

void VolumeWatcher::start(std::shared_ptr<const VolumeSnapshot> known) {
    if (running_)
        return;
    wake_ = Descriptor(::eventfd(0, EFD_CLOEXEC | EFD_NONBLOCK));
    running_ = true;
    thread_ = std::thread([this, known = std::move(known)] { run(known); });
}

void VolumeWatcher::remove(Registration* registration) {
    std::shared_ptr<Registration> removed;
    {
        MutexLock lock(mutex_);
        const auto found =
            std::ranges::find(registrations_, registration, &std::shared_ptr<Registration>::get);
        if (found == registrations_.end())
            return;
        removed = std::move(*found);
        registrations_.erase(found);
        if (registrations_.empty())
            (void)!::write(wake_.get(), "\1\0\0\0\0\0\0\0", 8);
    }
    removed->end();
}

void VolumeWatcher::tell(Volumes::Change change, const VolumeInfo& info) {
    std::vector<std::shared_ptr<Registration>> registrations;
    {
        MutexLock lock(mutex_);
        registrations = registrations_;
    }
    for (const auto& registration : registrations) {
        if (!registration->ended())
            registration->call(change, info);
    }
}

void VolumeWatcher::run(std::shared_ptr<const VolumeSnapshot> known) {
    const Descriptor mounts(::open("/proc/self/mountinfo", O_RDONLY | O_CLOEXEC));
    for (;;) {
        int wake = -1;
        {
            MutexLock lock(mutex_);
            if (registrations_.empty()) {
                running_ = false;
                // Nobody joins it then, unless this object is ending and waits.
                if (thread_.joinable())
                    thread_.detach();
                return;
            }
            wake = wake_.get();
        }
        const auto now = table_.refresh();
        for (const Volume& volume : known->volumes()) {
            if (now->find(volume.info.id) == nullptr)
                tell(Volumes::Change::unmounted, volume.info);
        }
        for (const Volume& volume : now->volumes()) {
            if (known->find(volume.info.id) == nullptr)
                tell(Volumes::Change::mounted, volume.info);
        }
        known = now;
        wait_for_change(mounts.get(), wake);
    }
}

void VolumeWatcher::wait_for_change(int mounts, int wake) {
    struct pollfd watched[] = {{mounts, POLLPRI, 0}, {wake, POLLIN, 0}};
    (void)::poll(watched, 2, kLookAgainMilliseconds);
    std::uint64_t count = 0;
    (void)!::read(wake, &count, sizeof(count));
}

} // namespace host
