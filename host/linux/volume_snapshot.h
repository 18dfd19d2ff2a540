#pragma once

#include "host/api/volumes.h"
#include <cstdint>
#include <string>
#include <string_view>
#include <sys/types.h>
#include <utility>
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

/// A mounted file system that is no volume, or none of its own: files on it are still found by their
/// references, under its bare st_dev.
struct UnlistedMount {
    dev_t device = 0;
    std::string root; ///< path of the mount point
};

/// All volumes at one moment. Immutable, so it may be read for as long as it is held.
class VolumeSnapshot {
  public:
    VolumeSnapshot() = default;
    VolumeSnapshot(std::vector<Volume> volumes, std::vector<UnlistedMount> unlisted)
        : volumes_(std::move(volumes)), unlisted_(std::move(unlisted)) {}

    const std::vector<Volume>& volumes() const { return volumes_; }
    /// Null when there is no such volume.
    const Volume* find(DeviceId id) const;
    /// The volume whose root is this directory; null for any other directory.
    const Volume* rooted_at(dev_t device, ino_t inode) const;
    /// Where a file system is mounted that is no volume; null when there is no such mount.
    const UnlistedMount* find_unlisted(DeviceId id) const;

    /// A walk through `volume` must not enter this directory: it belongs to another file system, or it is
    /// the root of another volume. `device` and `inode` are those of the opened directory (fstat), not of its
    /// directory entry.
    bool is_border(const Volume& volume, dev_t device, ino_t inode) const;
    /// The same by the volume's number, which may be the bare st_dev of a file system that is no volume.
    bool is_border(DeviceId volume, dev_t device, ino_t inode) const;

    /// The volume with the deepest root at or above the absolute path (no symbolic links in it) among those
    /// on `device`; null when there is none.
    const Volume* above(std::string_view path, dev_t device) const;
    /// True when a declared directory lies on this file system, so that st_dev alone names no volume.
    bool has_declared(dev_t device) const;
    /// st_dev behind a volume number, or behind a bare st_dev; 0 when nothing such is mounted.
    dev_t file_system_device(DeviceId id) const;

  private:
    std::vector<Volume> volumes_;
    std::vector<UnlistedMount> unlisted_;
};

/// `path` is `directory` or lies below it. Both absolute, without trailing slash and symbolic links.
bool is_at_or_below(std::string_view path, std::string_view directory);

} // namespace host
