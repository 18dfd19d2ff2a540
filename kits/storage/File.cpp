#include <File.h>

#include <Entry.h>
#include <HostConversions.h>

#include "host/api/file_system.h"

#include <stdio.h>

namespace {

constexpr uint32 kAccessBits = 0x03;

host::OpenOptions OptionsOf(uint32 openMode) {
    host::OpenOptions options;
    switch (openMode & kAccessBits) {
    case B_WRITE_ONLY:
        options.access = host::Access::write;
        break;
    case B_READ_WRITE:
        options.access = host::Access::read_write;
        break;
    default:
        options.access = host::Access::read;
        break;
    }
    if ((openMode & B_CREATE_FILE) != 0)
        options.missing =
            (openMode & B_FAIL_IF_EXISTS) != 0 ? host::Missing::create_only : host::Missing::create;
    if ((openMode & B_ERASE_FILE) != 0)
        options.truncate = host::Truncate::yes;
    options.follow = host::Follow::yes;
    return options;
}

} // namespace

struct BFile::OpenFile {
    uint32 mode = B_READ_ONLY;
    off_t position = 0;

    bool IsReadable() const { return (mode & kAccessBits) != B_WRITE_ONLY; }
    bool IsWritable() const { return (mode & kAccessBits) != B_READ_ONLY; }
};

BFile::BFile() = default;

BFile::BFile(const entry_ref* ref, uint32 openMode) {
    SetTo(ref, openMode);
}

BFile::BFile(const BEntry* entry, uint32 openMode) {
    SetTo(entry, openMode);
}

BFile::BFile(const char* path, uint32 openMode) {
    SetTo(path, openMode);
}

BFile::BFile(const BDirectory* directory, const char* path, uint32 openMode) {
    SetTo(directory, path, openMode);
}

BFile::BFile(const BFile& other) : BNode(other), mFile(other.mFile) {}

BFile& BFile::operator=(const BFile& other) {
    BNode::operator=(other);
    mFile = other.mFile;
    return *this;
}

BFile::~BFile() = default;

status_t BFile::SetTo(const entry_ref* ref, uint32 openMode) {
    Unset();
    if (ref == nullptr || ref->name == nullptr || (openMode & kAccessBits) == kAccessBits)
        return Adopt(nullptr, entry_ref(), B_BAD_VALUE);
    host::Result<std::unique_ptr<host::Node>> node =
        host::file_system().open(HostRef(*ref), OptionsOf(openMode));
    if (!node)
        return Adopt(nullptr, entry_ref(), StatusOf(node));
    mFile = std::make_shared<OpenFile>();
    mFile->mode = openMode;
    Adopt(*std::move(node), *ref, B_OK);
    return (openMode & B_OPEN_AT_END) != 0 ? GetSize(&mFile->position) : B_OK;
}

status_t BFile::SetTo(const BEntry* entry, uint32 openMode) {
    entry_ref ref;
    status_t status = entry != nullptr ? entry->GetRef(&ref) : B_BAD_VALUE;
    if (status == B_OK)
        return SetTo(&ref, openMode);
    Unset();
    return Adopt(nullptr, entry_ref(), status);
}

status_t BFile::SetTo(const char* path, uint32 openMode) {
    BEntry entry;
    status_t status = entry.SetTo(path);
    if (status == B_OK)
        return SetTo(&entry, openMode);
    Unset();
    return Adopt(nullptr, entry_ref(), status);
}

status_t BFile::SetTo(const BDirectory* directory, const char* path, uint32 openMode) {
    BEntry entry;
    status_t status = path != nullptr ? entry.SetTo(directory, path) : B_BAD_VALUE;
    if (status == B_OK)
        return SetTo(&entry, openMode);
    Unset();
    return Adopt(nullptr, entry_ref(), status);
}

void BFile::Unset() {
    BNode::Unset();
    mFile.reset();
}

bool BFile::IsReadable() const {
    return mFile != nullptr && mFile->IsReadable();
}

bool BFile::IsWritable() const {
    return mFile != nullptr && mFile->IsWritable();
}

ssize_t BFile::Read(void* buffer, size_t size) {
    if (mFile == nullptr)
        return B_NO_INIT;
    ssize_t count = ReadAt(mFile->position, buffer, size);
    if (count > 0)
        mFile->position += count;
    return count;
}

ssize_t BFile::ReadAt(off_t position, void* buffer, size_t size) {
    if (mFile == nullptr)
        return B_NO_INIT;
    if (!mFile->IsReadable())
        return B_NOT_ALLOWED;
    if ((buffer == nullptr && size > 0) || position < 0)
        return B_BAD_VALUE;
    host::Result<std::size_t> count = HostNode()->read_at(position, buffer, size);
    return count ? static_cast<ssize_t>(*count) : StatusOf(count);
}

ssize_t BFile::Write(const void* buffer, size_t size) {
    if (mFile == nullptr)
        return B_NO_INIT;
    if ((mFile->mode & B_OPEN_AT_END) != 0) {
        if (status_t status = GetSize(&mFile->position); status != B_OK)
            return status;
    }
    ssize_t count = WriteAt(mFile->position, buffer, size);
    if (count > 0)
        mFile->position += count;
    return count;
}

ssize_t BFile::WriteAt(off_t position, const void* buffer, size_t size) {
    if (mFile == nullptr)
        return B_NO_INIT;
    if (!mFile->IsWritable())
        return B_NOT_ALLOWED;
    if ((buffer == nullptr && size > 0) || position < 0)
        return B_BAD_VALUE;
    host::Result<std::size_t> count = HostNode()->write_at(position, buffer, size);
    return count ? static_cast<ssize_t>(*count) : StatusOf(count);
}

off_t BFile::Seek(off_t position, uint32 seekMode) {
    if (mFile == nullptr)
        return B_NO_INIT;
    off_t base = 0;
    if (seekMode == SEEK_CUR) {
        base = mFile->position;
    } else if (seekMode == SEEK_END) {
        if (status_t status = GetSize(&base); status != B_OK)
            return status;
    } else if (seekMode != SEEK_SET) {
        return B_BAD_VALUE;
    }
    off_t goal = 0;
    if (__builtin_add_overflow(base, position, &goal) || goal < 0)
        return B_BAD_VALUE;
    mFile->position = goal;
    return goal;
}

off_t BFile::Position() const {
    return mFile != nullptr ? mFile->position : B_NO_INIT;
}

status_t BFile::SetSize(off_t size) {
    if (mFile == nullptr)
        return B_NO_INIT;
    if (!mFile->IsWritable())
        return B_NOT_ALLOWED;
    return size >= 0 ? StatusOf(HostNode()->set_size(size)) : B_BAD_VALUE;
}

status_t BFile::GetSize(off_t* size) const {
    return BNode::GetSize(size);
}
