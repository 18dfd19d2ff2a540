#include <Entry.h>

#include <Directory.h>
#include <HostConversions.h>
#include <Path.h>

#include "host/api/file_system.h"

#include <string.h>

namespace {

// The path of something below a directory, or below the current one when `directory` is null.
status_t PathBelow(const BDirectory* directory, const char* path, std::string& result) {
    if (path[0] == '/' || directory == nullptr) {
        result = path;
        return MakeAbsolute(result);
    }
    BEntry self;
    status_t status = directory->GetEntry(&self);
    BPath base;
    if (status == B_OK)
        status = self.GetPath(&base);
    if (status == B_OK)
        result = std::string(base.Path()) + "/" + path;
    return status;
}

// Whether a reference's directory is there. Whether the leaf is matters to nobody.
status_t CheckDirectory(const entry_ref& ref) {
    return StatusOf(host::file_system().check_directory(HostRef(ref)));
}

} // namespace

BEntry::BEntry() = default;

BEntry::BEntry(const BDirectory* directory, const char* path, bool traverse) {
    SetTo(directory, path, traverse);
}

BEntry::BEntry(const entry_ref* ref, bool traverse) {
    SetTo(ref, traverse);
}

BEntry::BEntry(const char* path, bool traverse) {
    SetTo(path, traverse);
}

BEntry::BEntry(const BEntry& other) = default;
BEntry& BEntry::operator=(const BEntry& other) = default;
BEntry::~BEntry() = default;

status_t BEntry::InitCheck() const {
    return mStatus;
}

bool BEntry::Exists() const {
    host::NodeStat found;
    return ReadStat(&found) == B_OK;
}

status_t BEntry::SetTo(const BDirectory* directory, const char* path, bool traverse) {
    if (directory == nullptr)
        return Fail(B_BAD_VALUE);
    if (directory->InitCheck() != B_OK)
        return Fail(B_BAD_VALUE);
    if (path != nullptr && IsPlainLeaf(path)) {
        node_ref node;
        if (status_t status = directory->GetNodeRef(&node); status != B_OK)
            return Fail(status);
        entry_ref ref(node.device, node.node, path);
        return SetTo(&ref, traverse);
    }
    // No path means the directory itself.
    if (path == nullptr || path[0] == '\0') {
        BEntry self;
        status_t status = directory->GetEntry(&self);
        return status == B_OK ? SetTo(&self.mRef, traverse) : Fail(status);
    }
    std::string absolute;
    status_t status = PathBelow(directory, path, absolute);
    return status == B_OK ? SetToPath(absolute, traverse) : Fail(status);
}

status_t BEntry::SetTo(const entry_ref* ref, bool traverse) {
    if (ref == nullptr || ref->name == nullptr || ref->name[0] == '\0' || strchr(ref->name, '/') != nullptr)
        return Fail(B_BAD_VALUE);
    if (strlen(ref->name) >= B_FILE_NAME_LENGTH)
        return Fail(B_NAME_TOO_LONG);
    if (traverse) {
        host::Result<host::NodeStat> found = host::file_system().stat(HostRef(*ref));
        if (found && found->kind == host::NodeKind::symbolic_link) {
            host::Result<std::string> path = host::file_system().path_of(HostRef(*ref));
            return path ? SetToPath(*path, true) : Fail(StatusOf(path));
        }
    }
    if (status_t status = CheckDirectory(*ref); status != B_OK)
        return Fail(status);
    mRef = *ref;
    mStatus = B_OK;
    return B_OK;
}

status_t BEntry::SetTo(const char* path, bool traverse) {
    if (path == nullptr || path[0] == '\0')
        return Fail(B_BAD_VALUE);
    std::string absolute = path;
    status_t status = MakeAbsolute(absolute);
    return status == B_OK ? SetToPath(absolute, traverse) : Fail(status);
}

status_t BEntry::SetToPath(const std::string& path, bool traverse) {
    host::Result<host::EntryRef> ref =
        host::file_system().entry_of(path, traverse ? host::Follow::yes : host::Follow::no);
    if (!ref)
        return Fail(StatusOf(ref));
    if (ref->leaf.size() >= B_FILE_NAME_LENGTH)
        return Fail(B_NAME_TOO_LONG);
    mRef = KitRef(*ref);
    mStatus = B_OK;
    return B_OK;
}

status_t BEntry::Fail(status_t status) {
    mRef = entry_ref();
    mStatus = status;
    return status;
}

void BEntry::Unset() {
    Fail(B_NO_INIT);
}

status_t BEntry::GetRef(entry_ref* ref) const {
    if (mStatus != B_OK)
        return B_NO_INIT;
    if (ref == nullptr)
        return B_BAD_VALUE;
    *ref = mRef;
    return B_OK;
}

status_t BEntry::GetPath(BPath* path) const {
    if (mStatus != B_OK)
        return B_NO_INIT;
    return path != nullptr ? path->SetTo(&mRef) : B_BAD_VALUE;
}

status_t BEntry::GetParent(BEntry* entry) const {
    if (mStatus != B_OK)
        return B_NO_INIT;
    if (entry == nullptr)
        return B_BAD_VALUE;
    // The system's root lies in itself.
    if (strcmp(mRef.name, ".") == 0)
        return B_ENTRY_NOT_FOUND;
    host::Result<host::EntryRef> parent =
        host::file_system().entry_of_directory({mRef.device, mRef.directory});
    if (!parent)
        return StatusOf(parent);
    entry->mRef = KitRef(*parent);
    entry->mStatus = B_OK;
    return B_OK;
}

status_t BEntry::GetParent(BDirectory* directory) const {
    if (mStatus != B_OK)
        return B_NO_INIT;
    if (directory == nullptr)
        return B_BAD_VALUE;
    if (strcmp(mRef.name, ".") == 0)
        return B_ENTRY_NOT_FOUND;
    node_ref node(mRef.device, mRef.directory);
    return directory->SetTo(&node);
}

status_t BEntry::GetName(char* buffer) const {
    if (mStatus != B_OK)
        return B_NO_INIT;
    if (buffer == nullptr)
        return B_BAD_VALUE;
    memcpy(buffer, mRef.name, strlen(mRef.name) + 1);
    return B_OK;
}

status_t BEntry::Rename(const char* path, bool clobber) {
    if (mStatus != B_OK)
        return B_NO_INIT;
    if (path == nullptr || path[0] == '\0')
        return B_BAD_VALUE;
    if (IsPlainLeaf(path))
        return MoveToRef(entry_ref(mRef.device, mRef.directory, path), clobber);
    BDirectory directory;
    status_t status = GetParent(&directory);
    return status == B_OK ? MoveTo(&directory, path, clobber) : status;
}

status_t BEntry::MoveTo(BDirectory* directory, const char* path, bool clobber) {
    if (mStatus != B_OK)
        return B_NO_INIT;
    if (directory == nullptr || directory->InitCheck() != B_OK)
        return B_BAD_VALUE;
    BEntry goal;
    status_t status = goal.SetTo(directory, path != nullptr && path[0] != '\0' ? path : mRef.name);
    return status == B_OK ? MoveToRef(goal.mRef, clobber) : status;
}

status_t BEntry::MoveToRef(const entry_ref& goal, bool clobber) {
    if (strlen(goal.name) >= B_FILE_NAME_LENGTH)
        return B_NAME_TOO_LONG;
    using Replace = host::FileSystem::Replace;
    host::Status status =
        host::file_system().rename(HostRef(mRef), HostRef(goal), clobber ? Replace::yes : Replace::no);
    if (status)
        mRef = goal;
    return StatusOf(status);
}

status_t BEntry::Remove() {
    if (mStatus != B_OK)
        return B_NO_INIT;
    return StatusOf(host::file_system().remove(HostRef(mRef)));
}

bool BEntry::operator==(const BEntry& other) const {
    if (mStatus != B_OK || other.mStatus != B_OK)
        return mStatus != B_OK && other.mStatus != B_OK;
    return mRef == other.mRef;
}

status_t BEntry::ReadStat(host::NodeStat* stat) const {
    if (mStatus != B_OK)
        return B_NO_INIT;
    host::Result<host::NodeStat> found = host::file_system().stat(HostRef(mRef));
    if (found)
        *stat = *found;
    return StatusOf(found);
}

status_t BEntry::WriteStat(const struct stat& stat, uint32 what) {
    if (mStatus != B_OK)
        return B_NO_INIT;
    host::OpenOptions options;
    options.access = host::Access::none;
    host::Result<std::unique_ptr<host::Node>> node = host::file_system().open(HostRef(mRef), options);
    return node ? ChangeStat(**node, stat, what) : StatusOf(node);
}

status_t get_ref_for_path(const char* path, entry_ref* ref) {
    if (path == nullptr || ref == nullptr)
        return B_BAD_VALUE;
    BEntry entry(path);
    return entry.InitCheck() == B_OK ? entry.GetRef(ref) : entry.InitCheck();
}
