// What is known of a volume, and ways to find one.
#pragma once

#include <StorageDefs.h>

inline constexpr uint32 B_FS_IS_READONLY = 0x00000001;
inline constexpr uint32 B_FS_IS_REMOVABLE = 0x00000002;
inline constexpr uint32 B_FS_IS_PERSISTENT = 0x00000004;
inline constexpr uint32 B_FS_IS_SHARED = 0x00000008;
inline constexpr uint32 B_FS_HAS_MIME = 0x00010000;
inline constexpr uint32 B_FS_HAS_ATTR = 0x00020000;
inline constexpr uint32 B_FS_HAS_QUERY = 0x00040000;

struct fs_info {
    dev_t dev;
    ino_t root;
    uint32 flags;
    off_t block_size; // bytes
    off_t io_size;    // bytes that are best moved at once
    off_t total_blocks;
    off_t free_blocks;
    off_t total_nodes; // 0: not known
    off_t free_nodes;  // 0: not known
    char device_name[B_DEV_NAME_LENGTH];
    char volume_name[B_FILE_NAME_LENGTH];
    char fsh_name[B_DEV_NAME_LENGTH]; // kind of file system
};

// What dev_for_path() and next_dev() answer for "none": B_BAD_VALUE, as a device number.
inline constexpr dev_t kNoDevice = static_cast<dev_t>(B_BAD_VALUE);

// The volume that answers for a path, kNoDevice when there is none.
dev_t dev_for_path(const char* path);
// Starts at *position 0, which the caller keeps between calls; kNoDevice at the end.
dev_t next_dev(int32* position);
// 0, or B_BAD_VALUE when there is no such volume.
int fs_stat_dev(dev_t device, fs_info* info);
