#include <Volume.h>

#include <Bitmap.h>
#include <CopyText.h>
#include <Directory.h>
#include <HostConversions.h>
#include <TypeIcons.h>

#include "host/api/file_system.h"
#include "host/api/volumes.h"

namespace {

constexpr dev_t kNotSet = static_cast<dev_t>(-1);

// An answer about a volume that is there, else `otherwise`.
template <typename Answer>
Answer Ask(dev_t device, Answer host::VolumeInfo::*field, Answer otherwise) {
    host::Result<host::VolumeInfo> info = host::volumes().info(device);
    return info ? (*info).*field : otherwise;
}

} // namespace

BVolume::BVolume() : mDevice(kNotSet) {}

BVolume::BVolume(dev_t device) : mDevice(kNotSet) {
    SetTo(device);
}

BVolume::BVolume(const BVolume& other) = default;
BVolume& BVolume::operator=(const BVolume& other) = default;
BVolume::~BVolume() = default;

status_t BVolume::InitCheck() const {
    return mStatus;
}

status_t BVolume::SetTo(dev_t device) {
    bool exists = host::volumes().info(device).ok();
    mDevice = exists ? device : kNotSet;
    mStatus = exists ? B_OK : B_BAD_VALUE;
    return mStatus;
}

void BVolume::Unset() {
    mDevice = kNotSet;
    mStatus = B_NO_INIT;
}

dev_t BVolume::Device() const {
    return mDevice;
}

status_t BVolume::GetRootDirectory(BDirectory* directory) const {
    if (directory == nullptr)
        return B_BAD_VALUE;
    if (mStatus != B_OK)
        return B_NO_INIT;
    host::Result<host::NodeId> root = host::file_system().root_of(mDevice);
    if (!root)
        return B_BAD_VALUE;
    node_ref node(root->device, root->inode);
    return directory->SetTo(&node);
}

off_t BVolume::Capacity() const {
    if (mStatus != B_OK)
        return B_NO_INIT;
    return Ask<std::int64_t>(mDevice, &host::VolumeInfo::capacity, B_BAD_VALUE);
}

off_t BVolume::FreeBytes() const {
    if (mStatus != B_OK)
        return B_NO_INIT;
    return Ask<std::int64_t>(mDevice, &host::VolumeInfo::free_bytes, B_BAD_VALUE);
}

off_t BVolume::BlockSize() const {
    if (mStatus != B_OK)
        return B_NO_INIT;
    return Ask<std::int64_t>(mDevice, &host::VolumeInfo::block_size, B_BAD_VALUE);
}

status_t BVolume::GetName(char* name) const {
    if (name == nullptr)
        return B_BAD_VALUE;
    if (mStatus != B_OK)
        return B_NO_INIT;
    host::Result<host::VolumeInfo> info = host::volumes().info(mDevice);
    if (!info)
        return B_BAD_VALUE;
    CopyText(name, B_FILE_NAME_LENGTH, info->name.c_str());
    return B_OK;
}

status_t BVolume::SetName(const char* name) {
    if (name == nullptr)
        return B_BAD_VALUE;
    return mStatus == B_OK ? B_NOT_ALLOWED : B_NO_INIT;
}

status_t BVolume::GetIcon(BBitmap* icon, icon_size size) const {
    if (icon == nullptr)
        return B_BAD_VALUE;
    return mStatus == B_OK ? GetTypeIcon(kVolumeType, icon, size) : B_NO_INIT;
}

bool BVolume::IsRemovable() const {
    return mStatus == B_OK && Ask(mDevice, &host::VolumeInfo::removable, false);
}

bool BVolume::IsReadOnly() const {
    return mStatus == B_OK && Ask(mDevice, &host::VolumeInfo::read_only, false);
}

bool BVolume::IsPersistent() const {
    return mStatus == B_OK && Ask(mDevice, &host::VolumeInfo::persistent, false);
}

bool BVolume::IsShared() const {
    return mStatus == B_OK && Ask(mDevice, &host::VolumeInfo::shared, false);
}

// A file's type is an attribute.
bool BVolume::KnowsMime() const {
    return KnowsAttr();
}

bool BVolume::KnowsAttr() const {
    return mStatus == B_OK && Ask(mDevice, &host::VolumeInfo::knows_attributes, false);
}

bool BVolume::KnowsQuery() const {
    return mStatus == B_OK && Ask(mDevice, &host::VolumeInfo::knows_queries, false);
}

bool BVolume::operator==(const BVolume& other) const {
    return mDevice == other.mDevice && (mStatus == B_OK) == (other.mStatus == B_OK);
}
