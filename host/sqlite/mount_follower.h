#pragma once

#include "host/api/thread_safety.h"
#include "host/api/volumes.h"
#include <condition_variable>
#include <deque>
#include <functional>
#include <memory>
#include <thread>
#include <utility>

namespace host {

/// Tells of volumes that come and go on a thread of its own, where the listener may block. Any thread.
class MountFollower {
  public:
    using Listener = std::function<void(Volumes::Change, DeviceId)>;

    explicit MountFollower(Listener listener);
    /// Waits for a call under way.
    ~MountFollower();
    MountFollower(const MountFollower&) = delete;
    MountFollower& operator=(const MountFollower&) = delete;

  private:
    void run();

    const Listener listener_;
    Mutex mutex_;
    std::condition_variable_any changed_;
    std::deque<std::pair<Volumes::Change, DeviceId>> changes_ GUARDED_BY(mutex_);
    bool stopping_ GUARDED_BY(mutex_) = false;
    std::shared_ptr<void> registration_;
    std::thread thread_;
};

} // namespace host
