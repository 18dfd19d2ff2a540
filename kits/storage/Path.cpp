#include <Path.h>

#include <Directory.h>
#include <Entry.h>
#include <HostConversions.h>
#include <TypeConstants.h>

#include "host/api/file_system.h"

#include <string.h>

namespace {

// Two numbers and the name with its terminating zero.
constexpr ssize_t kFlattenedNumbers = 16;

// Whether every part between slashes is a name that stands for itself.
bool IsPlainPath(std::string_view path) {
    if (!path.starts_with('/'))
        return false;
    if (path == "/")
        return true;
    while (!path.empty()) {
        path.remove_prefix(1);
        size_t end = std::min(path.find('/'), path.size());
        if (!IsPlainLeaf(path.substr(0, end)))
            return false;
        path.remove_prefix(end);
    }
    return true;
}

status_t Normalize(std::string& path) {
    if (status_t status = MakeAbsolute(path); status != B_OK)
        return status;
    host::Result<host::EntryRef> ref = host::file_system().entry_of(path, host::Follow::no);
    if (!ref)
        return StatusOf(ref);
    host::Result<std::string> normalized = host::file_system().path_of(*ref);
    if (normalized)
        path = *std::move(normalized);
    return StatusOf(normalized);
}

void PutNumber(unsigned char* buffer, uint64 number) {
    for (int i = 0; i < 8; i++)
        buffer[i] = static_cast<unsigned char>(number >> (8 * i));
}

uint64 TakeNumber(const unsigned char* buffer) {
    uint64 number = 0;
    for (int i = 7; i >= 0; i--)
        number = number << 8 | buffer[i];
    return number;
}

} // namespace

BPath::BPath() = default;

BPath::BPath(const char* directory, const char* leaf, bool normalize) {
    SetTo(directory, leaf, normalize);
}

BPath::BPath(const BDirectory* directory, const char* leaf, bool normalize) {
    SetTo(directory, leaf, normalize);
}

BPath::BPath(const BEntry* entry) {
    SetTo(entry);
}

BPath::BPath(const entry_ref* ref) {
    SetTo(ref);
}

BPath::BPath(const BPath& other) = default;
BPath& BPath::operator=(const BPath& other) = default;

BPath& BPath::operator=(const char* path) {
    if (path == nullptr)
        Unset();
    else
        SetTo(path);
    return *this;
}

BPath::~BPath() = default;

status_t BPath::InitCheck() const {
    return mStatus;
}

status_t BPath::SetTo(const char* path, const char* leaf, bool normalize) {
    if (path == nullptr || path[0] == '\0' || (leaf != nullptr && leaf[0] == '/'))
        return Fail(B_BAD_VALUE);
    std::string joined = path;
    if (leaf != nullptr && leaf[0] != '\0') {
        if (!joined.ends_with('/'))
            joined += '/';
        joined += leaf;
    }
    if (normalize || !IsPlainPath(joined)) {
        if (status_t status = Normalize(joined); status != B_OK)
            return Fail(status);
    }
    mPath = std::move(joined);
    mLeaf = mPath.rfind('/') + 1;
    mStatus = B_OK;
    return B_OK;
}

status_t BPath::SetTo(const BDirectory* directory, const char* leaf, bool normalize) {
    if (directory == nullptr)
        return Fail(B_BAD_VALUE);
    BEntry entry;
    BPath path;
    status_t status = directory->GetEntry(&entry);
    if (status == B_OK)
        status = entry.GetPath(&path);
    return status == B_OK ? SetTo(path.Path(), leaf, normalize) : Fail(status);
}

status_t BPath::SetTo(const BEntry* entry) {
    if (entry == nullptr)
        return Fail(B_BAD_VALUE);
    entry_ref ref;
    status_t status = entry->GetRef(&ref);
    return status == B_OK ? SetTo(&ref) : Fail(status);
}

status_t BPath::SetTo(const entry_ref* ref) {
    if (ref == nullptr || ref->name == nullptr)
        return Fail(B_BAD_VALUE);
    host::Result<std::string> path = host::file_system().path_of(HostRef(*ref));
    if (!path)
        return Fail(StatusOf(path));
    mPath = *std::move(path);
    mLeaf = mPath.rfind('/') + 1;
    mStatus = B_OK;
    return B_OK;
}

status_t BPath::Fail(status_t status) {
    mPath.clear();
    mLeaf = 0;
    mStatus = status;
    return status;
}

void BPath::Unset() {
    Fail(B_NO_INIT);
}

status_t BPath::Append(const char* path, bool normalize) {
    if (mStatus != B_OK)
        return B_NO_INIT;
    if (path == nullptr)
        return Fail(B_BAD_VALUE);
    std::string base = mPath;
    return SetTo(base.c_str(), path, normalize);
}

const char* BPath::Path() const {
    return mStatus == B_OK ? mPath.c_str() : nullptr;
}

const char* BPath::Leaf() const {
    return mStatus == B_OK ? mPath.c_str() + mLeaf : nullptr;
}

status_t BPath::GetParent(BPath* path) const {
    if (mStatus != B_OK)
        return B_NO_INIT;
    if (path == nullptr)
        return B_BAD_VALUE;
    if (mPath == "/")
        return B_ENTRY_NOT_FOUND;
    std::string parent = mLeaf > 1 ? mPath.substr(0, mLeaf - 1) : "/";
    return path->SetTo(parent.c_str());
}

bool BPath::IsAbsolute() const {
    return mStatus == B_OK && mPath[0] == '/';
}

bool BPath::operator==(const BPath& other) const {
    return mPath == other.mPath && (mStatus == B_OK) == (other.mStatus == B_OK);
}

bool BPath::operator==(const char* path) const {
    return mStatus == B_OK ? path != nullptr && mPath == path : path == nullptr;
}

bool BPath::IsFixedSize() const {
    return false;
}

type_code BPath::TypeCode() const {
    return B_REF_TYPE;
}

ssize_t BPath::FlattenedSize() const {
    if (mStatus != B_OK)
        return B_NO_INIT;
    entry_ref ref;
    status_t status = get_ref_for_path(mPath.c_str(), &ref);
    return status == B_OK ? kFlattenedNumbers + static_cast<ssize_t>(strlen(ref.name)) + 1 : status;
}

status_t BPath::Flatten(void* buffer, ssize_t size) const {
    if (buffer == nullptr)
        return B_BAD_VALUE;
    if (mStatus != B_OK)
        return B_NO_INIT;
    entry_ref ref;
    if (status_t status = get_ref_for_path(mPath.c_str(), &ref); status != B_OK)
        return status;
    size_t nameSize = strlen(ref.name) + 1;
    if (size < kFlattenedNumbers + static_cast<ssize_t>(nameSize))
        return B_BAD_VALUE;
    auto* bytes = static_cast<unsigned char*>(buffer);
    PutNumber(bytes, ref.device);
    PutNumber(bytes + 8, ref.directory);
    memcpy(bytes + kFlattenedNumbers, ref.name, nameSize);
    return B_OK;
}

bool BPath::AllowsTypeCode(type_code code) const {
    return code == B_REF_TYPE;
}

status_t BPath::Unflatten(type_code code, const void* buffer, ssize_t size) {
    Unset();
    if (code != B_REF_TYPE)
        return Fail(B_BAD_TYPE);
    const auto* bytes = static_cast<const unsigned char*>(buffer);
    if (bytes == nullptr || size <= kFlattenedNumbers || bytes[size - 1] != 0)
        return Fail(B_BAD_VALUE);
    entry_ref ref(TakeNumber(bytes), TakeNumber(bytes + 8),
                  reinterpret_cast<const char*>(bytes + kFlattenedNumbers));
    return SetTo(&ref);
}
