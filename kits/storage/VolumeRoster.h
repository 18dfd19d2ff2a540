// BVolumeRoster: walks the mounted volumes and tells of those that come and go.
#pragma once

#include <Messenger.h>
#include <StorageDefs.h>

#include <memory>
#include <vector>

class BVolume;

// One thread at a time.
class BVolumeRoster {
  public:
    BVolumeRoster();
    BVolumeRoster(const BVolumeRoster&) = delete;
    BVolumeRoster& operator=(const BVolumeRoster&) = delete;
    virtual ~BVolumeRoster();

    // The next of the volumes that there were at the first call (or the first after Rewind()); those that
    // went meanwhile are left out. B_BAD_VALUE at the end, and from then on: a volume that is mounted later
    // shows up only after Rewind().
    status_t GetNextVolume(BVolume* volume);
    void Rewind();

    status_t GetBootVolume(BVolume* volume);

    // From now on each mount and unmount sends the target a B_NODE_MONITOR message: int32 "opcode"
    // B_DEVICE_MOUNTED with int64 "new device" (and "device", "directory" of the place it is mounted on), or
    // B_DEVICE_UNMOUNTED with int64 "device". A second call replaces the target. Ends with the roster.
    status_t StartWatching(BMessenger target = be_app_messenger);
    void StopWatching();
    // The target, invalid while not watching.
    BMessenger Messenger() const;

  private:
    std::vector<dev_t> mVolumes;
    size_t mNext = 0;
    bool mListed = false;
    BMessenger mTarget;
    std::shared_ptr<void> mSubscription;
};
