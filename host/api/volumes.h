#pragma once

#include "host/api/entry.h"
#include "host/api/result.h"
#include <functional>
#include <memory>
#include <string>
#include <vector>

namespace host {

/// What is known of one volume. A volume is a mounted, storage-backed file system or a directory declared to
/// be one.
struct VolumeInfo {
    DeviceId id = 0;
    /// Absolute path of the root directory, without trailing slash ("/" for the root of the system).
    std::string root;
    std::uint64_t root_inode = 0;
    /// Declared directory: its leaf. Else the file system's label, else the mount point's leaf, "/" for the
    /// root.
    std::string name;
    std::string file_system; ///< "ext4", "vfat", ...
    std::string device_path; ///< "/dev/sda1", empty where there is none
    bool declared = false;
    bool read_only = false;
    bool removable = false;
    bool persistent = false; ///< false for memory file systems that were not declared
    bool shared = false;     ///< reached over a network
    /// The root takes and gives back a user attribute, or (on a read-only volume) answers a read with "no
    /// such attribute".
    bool knows_attributes = false;
    /// knows_attributes, and the user's data directory can hold an index.
    bool knows_queries = false;
    std::int64_t capacity = 0;   ///< bytes
    std::int64_t free_bytes = 0; ///< bytes
    std::int64_t block_size = 0; ///< bytes
};

/// The volumes of this machine, in their fixed order: declared directories first, then mounted file systems,
/// each once. `BEKITS_VOLUMES` (colon-separated directories) names exactly the volumes there are; otherwise
/// the lines of
/// `$XDG_CONFIG_HOME/bekits/volumes` come first. All calls from any thread.
class Volumes {
  public:
    enum class Change { mounted, unmounted };
    /// Called on a thread of the host's own. Must not block.
    using Listener = std::function<void(Change, DeviceId volume, const VolumeInfo& info)>;

    virtual ~Volumes() = default;

    virtual std::vector<DeviceId> list() = 0;
    /// ENODEV when there is no such volume (any more). Capacity, free bytes and whether it knows queries are
    /// fresh.
    virtual Result<VolumeInfo> info(DeviceId volume) = 0;
    /// The volume that answers for an absolute path: the deepest volume root at or above it.
    virtual Result<DeviceId> volume_of(const std::string& path) = 0;
    virtual DeviceId boot_volume() = 0;

    /// The listener is called until the returned token is destroyed; destruction waits for a call under way.
    virtual std::shared_ptr<void> listen(Listener listener) = 0;
};

Volumes& volumes();

} // namespace host
