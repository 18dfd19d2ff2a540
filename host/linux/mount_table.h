#pragma once

#include <string>
#include <string_view>
#include <sys/types.h>
#include <vector>

namespace host {

/// One line of /proc/self/mountinfo.
struct MountEntry {
    dev_t device = 0;        ///< of the file system; on btrfs not what stat says of its files
    std::string root;        ///< what of the file system is mounted: "/" unless a bind mount or subvolume
    std::string mount_point; ///< absolute path, escapes undone
    std::string file_system; ///< "ext4", "fuse.sshfs" ...
    std::string source;      ///< "/dev/sda1", "server:/export", "tmpfs" ...
    bool read_only = false;  ///< the mount, or the file system under it
};

/// Parses the text of a mountinfo file. Lines that are not understood are passed over.
std::vector<MountEntry> parse_mount_table(std::string_view text);

/// Mounts of this process as they are now. There is always one at "/", made up where the table has none: a
/// process whose root was changed may see no mount point there, and without /proc it sees none at all.
std::vector<MountEntry> read_mount_table();
/// The same from a table's text.
std::vector<MountEntry> mounts_with_root(std::string_view text);

/// A file system whose files lie on a disk, a medium or another machine: none that the kernel makes up, that
/// packages a program (squashfs), or that stacks on others (overlay, but the root may be one).
bool is_storage(const MountEntry& entry);
bool is_memory_file_system(std::string_view type);
bool is_network_file_system(std::string_view type);

/// Of several mounts of one file system, the one that stands for it: whole before part, then the first.
/// `device_of` gives st_dev of an entry's mount point, 0 where it is not reachable or no directory. In the
/// order of the table.
std::vector<MountEntry> select_storage_mounts(const std::vector<MountEntry>& entries,
                                              dev_t (*device_of)(const MountEntry& entry));

} // namespace host
