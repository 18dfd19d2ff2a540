#pragma once

#include "host/api/thread_safety.h"
#include "host/api/volumes.h"
#include "host/linux/descriptor.h"
#include <atomic>
#include <cstdint>
#include <memory>
#include <string>
#include <sys/stat.h>
#include <vector>

namespace host {

/// One volume as the table knows it. Immutable.
struct Volume {
    VolumeInfo info; ///< capacity and free bytes are not filled in here
    /// st_dev of the root and of everything on the volume. Equal to info.id for a mounted file system.
    dev_t file_system_device = 0;
    /// Names the volume across mounts and restarts, as far as the file system allows: made from the file
    /// system's own identity and the root's inode. Hexadecimal digits and '-' only: fit for a file name.
    std::string stable_key;
};

/// All volumes at one moment. Immutable, so it may be read for as long as it is held.
class VolumeSnapshot {
  public:
    explicit VolumeSnapshot(std::vector<Volume> volumes) : volumes_(std::move(volumes)) {}

    const std::vector<Volume>& volumes() const { return volumes_; }
    /// Null when there is no such volume.
    const Volume* find(DeviceId id) const;
    /// The volume whose root is this directory; null for any other directory.
    const Volume* rooted_at(dev_t device, ino_t inode) const;
    /// A walk through `volume` must not enter this directory: it belongs to another file system, or it is
    /// the root of another volume. `device` and `inode` are those of the opened directory (fstat), not of its
    /// directory entry.
    bool is_border(const Volume& volume, dev_t device, ino_t inode) const;
    /// The volume with the deepest root at or above the absolute path (no symbolic links in it) among those
    /// on `device`; null when there is none.
    const Volume* above(const std::string& path, dev_t device) const;
    /// True when a declared directory lies on this file system, so that st_dev alone names no volume.
    bool has_declared(dev_t device) const;

  private:
    std::vector<Volume> volumes_;
};

/// The volumes of this machine. list(), info(), volume_of() and refresh() look whether environment, volumes
/// file, declared directories or mounts have changed; current() does not.
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

    /// The root directory, newly opened and verified to be the one that the table knows. ENODEV when the
    /// volume is gone.
    Result<Descriptor> open_root(DeviceId volume);

    /// The number of the volume that an open directory belongs to, given its fstat. A directory on a file
    /// system that is no volume answers with the bare st_dev.
    DeviceId device_of_directory(int descriptor, const struct stat& status);
    /// st_dev behind a volume number; 0 when there is no such volume.
    dev_t file_system_device(DeviceId volume);

  private:
    VolumeTable();
    ~VolumeTable() override;
    class Watcher;
    struct Sources;

    Mutex mutex_;
    std::shared_ptr<const VolumeSnapshot> snapshot_ GUARDED_BY(mutex_);
    std::unique_ptr<Sources> sources_ GUARDED_BY(mutex_);
    std::unique_ptr<Watcher> watcher_;
};

/// A declared directory's volume number: made from device and inode, top bit set.
DeviceId declared_device_id(dev_t device, ino_t inode);

} // namespace host
