#include <fs_info.h>

#include <CopyText.h>
#include <HostConversions.h>

#include "host/api/volumes.h"

namespace {

uint32 FlagsOf(const host::VolumeInfo& info) {
    uint32 flags = 0;
    if (info.read_only)
        flags |= B_FS_IS_READONLY;
    if (info.removable)
        flags |= B_FS_IS_REMOVABLE;
    if (info.persistent)
        flags |= B_FS_IS_PERSISTENT;
    if (info.shared)
        flags |= B_FS_IS_SHARED;
    if (info.knows_attributes)
        flags |= B_FS_HAS_ATTR | B_FS_HAS_MIME;
    if (info.knows_queries)
        flags |= B_FS_HAS_QUERY;
    return flags;
}

} // namespace

dev_t dev_for_path(const char* path) {
    if (path == nullptr || path[0] == '\0')
        return kNoDevice;
    std::string absolute = path;
    if (MakeAbsolute(absolute) != B_OK)
        return kNoDevice;
    host::Result<host::DeviceId> device = host::volumes().volume_of(absolute);
    return device ? static_cast<dev_t>(*device) : kNoDevice;
}

dev_t next_dev(int32* position) {
    if (position == nullptr || *position < 0)
        return kNoDevice;
    std::vector<host::DeviceId> volumes = host::volumes().list();
    if (static_cast<size_t>(*position) >= volumes.size())
        return kNoDevice;
    return volumes[static_cast<size_t>((*position)++)];
}

int fs_stat_dev(dev_t device, fs_info* info) {
    if (info == nullptr)
        return B_BAD_VALUE;
    host::Result<host::VolumeInfo> found = host::volumes().info(device);
    if (!found)
        return B_BAD_VALUE;
    *info = {};
    info->dev = device;
    info->root = found->root_inode;
    info->flags = FlagsOf(*found);
    info->block_size = found->block_size;
    info->io_size = 64 * 1024;
    if (found->block_size > 0) {
        info->total_blocks = found->capacity / found->block_size;
        info->free_blocks = found->free_bytes / found->block_size;
    }
    CopyText(info->device_name, found->device_path.c_str());
    CopyText(info->volume_name, found->name.c_str());
    CopyText(info->fsh_name, found->file_system.c_str());
    return B_OK;
}
