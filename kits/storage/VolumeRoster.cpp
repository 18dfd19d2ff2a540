#include <VolumeRoster.h>

#include <AppDefs.h>
#include <EntryRef.h>
#include <Message.h>
#include <NodeMonitor.h>
#include <Volume.h>

#include "host/api/file_system.h"
#include "host/api/volumes.h"

namespace {

void TellOfMount(BMessage& message, dev_t device, const host::VolumeInfo& info) {
    message.AddInt32("opcode", B_DEVICE_MOUNTED);
    message.AddInt64("new device", static_cast<int64>(device));
    host::Result<host::EntryRef> place = host::file_system().entry_of_directory({device, info.root_inode});
    if (!place)
        return;
    message.AddInt64("device", static_cast<int64>(place->device));
    message.AddInt64("directory", static_cast<int64>(place->directory));
}

} // namespace

BVolumeRoster::BVolumeRoster() = default;
BVolumeRoster::~BVolumeRoster() = default;

status_t BVolumeRoster::GetNextVolume(BVolume* volume) {
    if (volume == nullptr)
        return B_BAD_VALUE;
    if (!mListed) {
        std::vector<host::DeviceId> volumes = host::volumes().list();
        mVolumes.assign(volumes.begin(), volumes.end());
        mNext = 0;
        mListed = true;
    }
    while (mNext < mVolumes.size()) {
        if (volume->SetTo(mVolumes[mNext++]) == B_OK)
            return B_OK;
    }
    volume->Unset();
    return B_BAD_VALUE;
}

void BVolumeRoster::Rewind() {
    mListed = false;
}

status_t BVolumeRoster::GetBootVolume(BVolume* volume) {
    return volume != nullptr ? volume->SetTo(host::volumes().boot_volume()) : B_BAD_VALUE;
}

status_t BVolumeRoster::StartWatching(BMessenger target) {
    if (!target.IsValid())
        return B_BAD_VALUE;
    StopWatching();
    mTarget = target;
    mSubscription = host::volumes().listen(
        [target](host::Volumes::Change change, host::DeviceId device, const host::VolumeInfo& info) mutable {
            BMessage message(B_NODE_MONITOR);
            if (change == host::Volumes::Change::mounted) {
                TellOfMount(message, device, info);
            } else {
                message.AddInt32("opcode", B_DEVICE_UNMOUNTED);
                message.AddInt64("device", static_cast<int64>(device));
            }
            // Without waiting: a full target's message is lost rather than the host's thread held up.
            target.SendMessage(&message, static_cast<BHandler*>(nullptr), 0);
        });
    return B_OK;
}

void BVolumeRoster::StopWatching() {
    mSubscription.reset();
    mTarget = BMessenger();
}

BMessenger BVolumeRoster::Messenger() const {
    return mTarget;
}
