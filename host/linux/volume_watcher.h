#pragma once

#include "host/api/thread_safety.h"
#include "host/api/volumes.h"
#include "host/linux/descriptor.h"
#include <memory>
#include <thread>
#include <vector>

namespace host {

class VolumeSnapshot;
class VolumeTable;

/// Tells listeners of volumes that come and go. Its thread runs while there are listeners; it sleeps until
/// the mounts change, and looks every few seconds whether declared directories have appeared or gone.
class VolumeWatcher {
  public:
    explicit VolumeWatcher(VolumeTable& table) : table_(table) {}
    ~VolumeWatcher();

    /// See Volumes::listen. A listener may drop its own token.
    std::shared_ptr<void> listen(Volumes::Listener listener);

  private:
    class Registration;

    void run(std::shared_ptr<const VolumeSnapshot> known);
    void wait_for_change(int mounts, int wake);
    void start(std::shared_ptr<const VolumeSnapshot> known) REQUIRES(mutex_);
    void remove(Registration* registration);
    void tell(Volumes::Change change, const VolumeInfo& info);

    VolumeTable& table_;
    Mutex mutex_;
    std::vector<std::shared_ptr<Registration>> registrations_ GUARDED_BY(mutex_);
    std::thread thread_ GUARDED_BY(mutex_);
    bool running_ GUARDED_BY(mutex_) = false;
    /// Wakes the thread when the last listener has gone; made with the thread.
    Descriptor wake_ GUARDED_BY(mutex_);
};

} // namespace host
