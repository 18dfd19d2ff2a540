#include "host/sqlite/mount_follower.h"
#include "host/api/threads.h"

namespace host {

MountFollower::MountFollower(Listener listener)
    : listener_(std::move(listener)),
      registration_(volumes().listen([this](Volumes::Change change, DeviceId device, const VolumeInfo&) {
          MutexLock lock(mutex_);
          changes_.emplace_back(change, device);
          changed_.notify_one();
      })),
      thread_([this] { run(); }) {}

MountFollower::~MountFollower() {
    registration_.reset();
    {
        MutexLock lock(mutex_);
        stopping_ = true;
        changed_.notify_one();
    }
    thread_.join();
}

void MountFollower::run() {
    (void)set_thread_name(current_native_thread(), "mount follower");
    MutexLock lock(mutex_);
    while (!stopping_) {
        if (changes_.empty()) {
            changed_.wait(lock);
            continue;
        }
        const auto [change, device] = changes_.front();
        changes_.pop_front();
        lock.unlock();
        listener_(change, device);
        lock.lock();
    }
}

} // namespace host
