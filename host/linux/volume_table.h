#pragma once

#include "host/api/thread_safety.h"
#include "host/api/volumes.h"
#include "host/linux/descriptor.h"
#include "host/linux/volume_snapshot.h"
#include <atomic>
#include <cstdint>
#include <memory>
#include <string>
#include <sys/stat.h>
#include <vector>

namespace host {

class VolumeWatcher;

/// The volumes of this machine. list(), volume_of() and refresh() look whether environment, volumes file,
/// declared directories or mounts have changed; info() of all directories at that volume's only; current() at
/// none of this.
///
/// Keeps no descriptor open on any volume, so that nothing keeps one from being unmounted.
class VolumeTable final : public Volumes {
  public:
    static VolumeTable& instance();

    std::vector<DeviceId> list() override;
    Result<VolumeInfo> info(DeviceId volume) override;
    Result<DeviceId> volume_of(const std::string& path) override;
    DeviceId boot_volume() override;
    std::shared_ptr<void> listen(Listener listener) override;

    /// As last looked at; cheap, never null.
    std::shared_ptr<const VolumeSnapshot> current();
    /// After looking again where something may have changed. Never null.
    std::shared_ptr<const VolumeSnapshot> refresh();

    /// Moves whenever current() begins to answer with another snapshot. Costs next to nothing.
    std::uint64_t generation() const { return generation_.load(std::memory_order_acquire); }

    /// The root directory, newly opened and verified to be the one that the table knows. ENODEV when the
    /// volume is gone.
    Result<Descriptor> open_root(DeviceId volume);

    /// The number of the volume that an open directory belongs to, given its fstat. A directory on a file
    /// system that is no volume answers with the bare st_dev.
    DeviceId device_of_directory(int descriptor, const struct stat& status);
    /// st_dev behind a volume number; 0 when there is no such volume.
    dev_t file_system_device(DeviceId volume);

  private:
    struct Sources;

    VolumeTable();
    ~VolumeTable() override;
    /// After looking again where something about this volume may have changed. Never null.
    std::shared_ptr<const VolumeSnapshot> refresh_for(DeviceId volume);

    Mutex mutex_;
    std::unique_ptr<Sources> sources_ GUARDED_BY(mutex_);
    std::shared_ptr<const VolumeSnapshot> snapshot_ GUARDED_BY(mutex_);
    std::atomic<std::uint64_t> generation_{0};
    const std::unique_ptr<VolumeWatcher> watcher_;
};

/// A declared directory's volume number: made from device and inode, top bit set.
DeviceId declared_device_id(dev_t device, ino_t inode);

} // namespace host
