#pragma once

#include "host/linux/mount_table.h"
#include "host/linux/volume_snapshot.h"
#include <optional>
#include <string>
#include <sys/stat.h>
#include <vector>

namespace host {

/// Finds out what is to be known of a volume. Each looks at the system anew.

/// A declared directory. Nothing when it is not there or is no directory. Symbolic links in the path are
/// resolved.
std::optional<Volume> probe_declared_volume(const std::string& path, const std::vector<MountEntry>& mounts);
/// A mounted file system; `mount` as select_storage_mounts gives it.
std::optional<Volume> probe_mounted_volume(const MountEntry& mount);

/// st_dev of the mount point, 0 where it is no directory or not reachable.
dev_t mount_point_device(const MountEntry& mount);

/// The root takes and gives back a user attribute; where it may not be written, it answers a read with "no
/// such attribute".
bool knows_attributes(int root);

} // namespace host
