#include <HostConversions.h>

#include <StatFields.h>

#include "host/api/file_system.h"

#include <filesystem>
#include <sys/stat.h>
#include <system_error>

namespace {

constexpr std::int64_t kNanosecondsPerSecond = 1'000'000'000;

timespec TimeSpec(std::int64_t nanoseconds) {
    std::int64_t seconds = nanoseconds / kNanosecondsPerSecond;
    std::int64_t rest = nanoseconds % kNanosecondsPerSecond;
    // Times before 1970: the fraction counts forward from the whole second below.
    if (rest < 0) {
        seconds--;
        rest += kNanosecondsPerSecond;
    }
    return {static_cast<time_t>(seconds), static_cast<long>(rest)};
}

std::int64_t Nanoseconds(const timespec& time) {
    return static_cast<std::int64_t>(time.tv_sec) * kNanosecondsPerSecond + time.tv_nsec;
}

} // namespace

status_t MakeAbsolute(std::string& path) {
    if (path.starts_with('/'))
        return B_OK;
    std::error_code error;
    std::filesystem::path current = std::filesystem::current_path(error);
    if (error)
        return status_from_errno(error.value());
    path = path.empty() ? current.native() : current.native() + "/" + path;
    return B_OK;
}

bool IsPlainLeaf(std::string_view leaf) {
    return !leaf.empty() && leaf != "." && leaf != ".." && leaf.find('/') == std::string_view::npos;
}

void FillStat(const host::NodeStat& from, struct stat* stat) {
    *stat = {};
    stat->st_dev = from.id.device;
    stat->st_ino = from.id.inode;
    stat->st_mode = from.mode;
    stat->st_nlink = from.links;
    stat->st_uid = from.user;
    stat->st_gid = from.group;
    stat->st_size = from.size;
    stat->st_blksize = 4096;
    stat->st_blocks = from.blocks;
    stat->st_atim = TimeSpec(from.access_time);
    stat->st_mtim = TimeSpec(from.modification_time);
    stat->st_ctim = TimeSpec(from.change_time);
}

status_t ChangeStat(host::Node& node, const struct stat& stat, uint32 what) {
    constexpr std::uint32_t kPermissionBits = 07777;
    if ((what & kStatPermissions) != 0) {
        if (host::Status status = node.set_mode(stat.st_mode & kPermissionBits); !status)
            return StatusOf(status);
    }
    if ((what & (kStatOwner | kStatGroup)) != 0) {
        if (host::Status status = node.set_owner(stat.st_uid, stat.st_gid); !status)
            return StatusOf(status);
    }
    if ((what & (kStatAccessTime | kStatModificationTime)) != 0) {
        constexpr std::int64_t kUnchanged = -1;
        std::int64_t access = (what & kStatAccessTime) != 0 ? Nanoseconds(stat.st_atim) : kUnchanged;
        std::int64_t modification =
            (what & kStatModificationTime) != 0 ? Nanoseconds(stat.st_mtim) : kUnchanged;
        return StatusOf(node.set_times(access, modification));
    }
    return B_OK;
}
