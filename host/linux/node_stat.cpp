#include "host/linux/node_stat.h"

#include <sys/sysmacros.h>

namespace host {

namespace {

std::int64_t nanoseconds(const struct statx_timestamp& time) {
    return time.tv_sec * 1'000'000'000 + time.tv_nsec;
}

} // namespace

NodeKind to_node_kind(unsigned mode) {
    if (S_ISREG(mode))
        return NodeKind::file;
    if (S_ISDIR(mode))
        return NodeKind::directory;
    return S_ISLNK(mode) ? NodeKind::symbolic_link : NodeKind::other;
}

dev_t to_device(const struct statx& status) {
    return makedev(status.stx_dev_major, status.stx_dev_minor);
}

NodeStat to_node_stat(const struct statx& status, DeviceId device) {
    NodeStat result;
    result.id = {device, status.stx_ino};
    result.kind = to_node_kind(status.stx_mode);
    result.mode = status.stx_mode;
    result.user = status.stx_uid;
    result.group = status.stx_gid;
    result.links = status.stx_nlink;
    result.size = static_cast<std::int64_t>(status.stx_size);
    result.blocks = static_cast<std::int64_t>(status.stx_blocks);
    result.access_time = nanoseconds(status.stx_atime);
    result.modification_time = nanoseconds(status.stx_mtime);
    result.change_time = nanoseconds(status.stx_ctime);
    if ((status.stx_mask & STATX_BTIME) != 0)
        result.creation_time = nanoseconds(status.stx_btime);
    return result;
}

} // namespace host
