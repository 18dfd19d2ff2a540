#include <Statable.h>

#include <EntryRef.h>
#include <HostConversions.h>
#include <StatFields.h>
#include <Volume.h>

namespace {

constexpr std::int64_t kNanosecondsPerSecond = 1'000'000'000;

} // namespace

BStatable::~BStatable() = default;

status_t BStatable::GetStat(struct stat* stat) const {
    if (stat == nullptr)
        return B_BAD_VALUE;
    host::NodeStat found;
    status_t status = ReadStat(&found);
    if (status == B_OK)
        FillStat(found, stat);
    return status;
}

bool BStatable::IsFile() const {
    host::NodeStat found;
    return ReadStat(&found) == B_OK && found.kind == host::NodeKind::file;
}

bool BStatable::IsDirectory() const {
    host::NodeStat found;
    return ReadStat(&found) == B_OK && found.kind == host::NodeKind::directory;
}

bool BStatable::IsSymLink() const {
    host::NodeStat found;
    return ReadStat(&found) == B_OK && found.kind == host::NodeKind::symbolic_link;
}

status_t BStatable::GetNodeRef(node_ref* ref) const {
    if (ref == nullptr)
        return B_BAD_VALUE;
    host::NodeStat found;
    status_t status = ReadStat(&found);
    if (status == B_OK)
        *ref = node_ref(found.id.device, found.id.inode);
    return status;
}

status_t BStatable::GetOwner(uid_t* owner) const {
    if (owner == nullptr)
        return B_BAD_VALUE;
    host::NodeStat found;
    status_t status = ReadStat(&found);
    if (status == B_OK)
        *owner = found.user;
    return status;
}

status_t BStatable::SetOwner(uid_t owner) {
    struct stat stat;
    status_t status = GetStat(&stat);
    if (status != B_OK)
        return status;
    stat.st_uid = owner;
    return WriteStat(stat, kStatOwner);
}

status_t BStatable::GetGroup(gid_t* group) const {
    if (group == nullptr)
        return B_BAD_VALUE;
    host::NodeStat found;
    status_t status = ReadStat(&found);
    if (status == B_OK)
        *group = found.group;
    return status;
}

status_t BStatable::SetGroup(gid_t group) {
    struct stat stat;
    status_t status = GetStat(&stat);
    if (status != B_OK)
        return status;
    stat.st_gid = group;
    return WriteStat(stat, kStatGroup);
}

status_t BStatable::GetPermissions(mode_t* permissions) const {
    if (permissions == nullptr)
        return B_BAD_VALUE;
    host::NodeStat found;
    status_t status = ReadStat(&found);
    if (status == B_OK)
        *permissions = found.mode & 07777;
    return status;
}

status_t BStatable::SetPermissions(mode_t permissions) {
    struct stat stat = {};
    stat.st_mode = permissions;
    return WriteStat(stat, kStatPermissions);
}

status_t BStatable::GetSize(off_t* size) const {
    if (size == nullptr)
        return B_BAD_VALUE;
    host::NodeStat found;
    status_t status = ReadStat(&found);
    if (status == B_OK)
        *size = found.size;
    return status;
}

status_t BStatable::GetModificationTime(time_t* time) const {
    if (time == nullptr)
        return B_BAD_VALUE;
    struct stat stat;
    status_t status = GetStat(&stat);
    if (status == B_OK)
        *time = stat.st_mtim.tv_sec;
    return status;
}

status_t BStatable::SetModificationTime(time_t time) {
    struct stat stat = {};
    stat.st_mtim.tv_sec = time;
    return WriteStat(stat, kStatModificationTime);
}

status_t BStatable::GetCreationTime(time_t* time) const {
    if (time == nullptr)
        return B_BAD_VALUE;
    host::NodeStat found;
    status_t status = ReadStat(&found);
    if (status != B_OK)
        return status;
    if (found.creation_time == 0)
        return B_UNSUPPORTED;
    *time = static_cast<time_t>(found.creation_time / kNanosecondsPerSecond);
    return B_OK;
}

status_t BStatable::SetCreationTime(time_t) {
    return B_UNSUPPORTED;
}

status_t BStatable::GetAccessTime(time_t* time) const {
    if (time == nullptr)
        return B_BAD_VALUE;
    struct stat stat;
    status_t status = GetStat(&stat);
    if (status == B_OK)
        *time = stat.st_atim.tv_sec;
    return status;
}

status_t BStatable::SetAccessTime(time_t time) {
    struct stat stat = {};
    stat.st_atim.tv_sec = time;
    return WriteStat(stat, kStatAccessTime);
}

status_t BStatable::GetVolume(BVolume* volume) const {
    if (volume == nullptr)
        return B_BAD_VALUE;
    node_ref ref;
    status_t status = GetNodeRef(&ref);
    return status == B_OK ? volume->SetTo(ref.device) : status;
}
