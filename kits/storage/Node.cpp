#include <Node.h>

#include <Entry.h>
#include <HostConversions.h>
#include <String.h>
#include <TypeConstants.h>

#include "host/api/file_system.h"

#include <string.h>

BNode::BNode() = default;

BNode::BNode(const entry_ref* ref) {
    SetTo(ref);
}

BNode::BNode(const BEntry* entry) {
    SetTo(entry);
}

BNode::BNode(const char* path) {
    SetTo(path);
}

BNode::BNode(const BDirectory* directory, const char* path) {
    SetTo(directory, path);
}

BNode::BNode(const BNode& other) : mNode(other.mNode), mRef(other.mRef), mStatus(other.mStatus) {}

BNode& BNode::operator=(const BNode& other) {
    if (this != &other)
        Adopt(other.mNode, other.mRef, other.mStatus);
    return *this;
}

BNode::~BNode() = default;

status_t BNode::InitCheck() const {
    return mStatus;
}

status_t BNode::SetTo(const entry_ref* ref) {
    if (ref == nullptr || ref->name == nullptr)
        return Adopt(nullptr, entry_ref(), B_BAD_VALUE);
    host::OpenOptions options;
    options.access = host::Access::none;
    host::Result<std::unique_ptr<host::Node>> node = host::file_system().open(HostRef(*ref), options);
    if (!node)
        return Adopt(nullptr, entry_ref(), StatusOf(node));
    return Adopt(*std::move(node), *ref, B_OK);
}

status_t BNode::SetTo(const BEntry* entry) {
    entry_ref ref;
    status_t status = entry != nullptr ? entry->GetRef(&ref) : B_BAD_VALUE;
    return status == B_OK ? BNode::SetTo(&ref) : Adopt(nullptr, entry_ref(), status);
}

status_t BNode::SetTo(const char* path) {
    BEntry entry;
    status_t status = entry.SetTo(path);
    return status == B_OK ? BNode::SetTo(&entry) : Adopt(nullptr, entry_ref(), status);
}

status_t BNode::SetTo(const BDirectory* directory, const char* path) {
    BEntry entry;
    status_t status = entry.SetTo(directory, path);
    return status == B_OK ? BNode::SetTo(&entry) : Adopt(nullptr, entry_ref(), status);
}

void BNode::Unset() {
    Adopt(nullptr, entry_ref(), B_NO_INIT);
}

status_t BNode::Adopt(std::shared_ptr<host::Node> node, const entry_ref& ref, status_t status) {
    mNode = std::move(node);
    mRef = ref;
    mStatus = status;
    mAttributeNames.clear();
    mNextAttribute = 0;
    mAttributesListed = false;
    return status;
}

status_t BNode::Lock() {
    if (mNode == nullptr)
        return B_NO_INIT;
    host::Status status = mNode->lock();
    return status.error() == EWOULDBLOCK ? B_BUSY : StatusOf(status);
}

status_t BNode::Unlock() {
    return mNode != nullptr ? StatusOf(mNode->unlock()) : B_NO_INIT;
}

status_t BNode::Sync() {
    return mNode != nullptr ? StatusOf(mNode->sync()) : B_NO_INIT;
}

ssize_t BNode::WriteAttr(const char* name, type_code type, off_t offset, const void* buffer, size_t length) {
    if (mNode == nullptr)
        return B_NO_INIT;
    if (name == nullptr || (buffer == nullptr && length > 0) || offset < 0)
        return B_BAD_VALUE;
    host::Status status = mNode->write_attribute(name, type, offset, buffer, length);
    return status ? static_cast<ssize_t>(length) : StatusOf(status);
}

ssize_t BNode::ReadAttr(const char* name, type_code, off_t offset, void* buffer, size_t length) const {
    if (mNode == nullptr)
        return B_NO_INIT;
    if (name == nullptr || (buffer == nullptr && length > 0) || offset < 0)
        return B_BAD_VALUE;
    host::Result<std::size_t> count = mNode->read_attribute(name, offset, buffer, length);
    return count ? static_cast<ssize_t>(*count) : StatusOf(count);
}

status_t BNode::RemoveAttr(const char* name) {
    if (mNode == nullptr)
        return B_NO_INIT;
    return name != nullptr ? StatusOf(mNode->remove_attribute(name)) : B_BAD_VALUE;
}

status_t BNode::RenameAttr(const char* from, const char* to) {
    if (mNode == nullptr)
        return B_NO_INIT;
    if (from == nullptr || to == nullptr)
        return B_BAD_VALUE;
    return StatusOf(mNode->rename_attribute(from, to));
}

status_t BNode::GetAttrInfo(const char* name, attr_info* info) const {
    if (mNode == nullptr)
        return B_NO_INIT;
    if (name == nullptr || info == nullptr)
        return B_BAD_VALUE;
    host::Result<host::AttributeInfo> found = mNode->attribute_info(name);
    if (!found)
        return StatusOf(found);
    info->type = found->type;
    info->size = found->size;
    return B_OK;
}

status_t BNode::GetNextAttrName(char* buffer) {
    if (mNode == nullptr)
        return B_NO_INIT;
    if (buffer == nullptr)
        return B_BAD_VALUE;
    if (!mAttributesListed) {
        host::Result<std::vector<std::string>> names = mNode->attribute_names();
        if (!names)
            return StatusOf(names);
        mAttributeNames = *std::move(names);
        mNextAttribute = 0;
        mAttributesListed = true;
    }
    // No attribute with a longer name can be written, but another program may have made one.
    while (mNextAttribute < mAttributeNames.size() &&
           mAttributeNames[mNextAttribute].size() >= B_ATTR_NAME_LENGTH)
        mNextAttribute++;
    if (mNextAttribute == mAttributeNames.size())
        return B_ENTRY_NOT_FOUND;
    const std::string& name = mAttributeNames[mNextAttribute++];
    memcpy(buffer, name.c_str(), name.size() + 1);
    return B_OK;
}

status_t BNode::RewindAttrs() {
    if (mNode == nullptr)
        return B_NO_INIT;
    mAttributesListed = false;
    return B_OK;
}

status_t BNode::WriteAttrString(const char* name, const BString* text) {
    if (text == nullptr)
        return B_BAD_VALUE;
    ssize_t written =
        WriteAttr(name, B_STRING_TYPE, 0, text->String(), static_cast<size_t>(text->Length()) + 1);
    return written < 0 ? static_cast<status_t>(written) : B_OK;
}

status_t BNode::ReadAttrString(const char* name, BString* text) const {
    if (text == nullptr)
        return B_BAD_VALUE;
    attr_info info;
    if (status_t status = GetAttrInfo(name, &info); status != B_OK)
        return status;
    std::string value(static_cast<size_t>(info.size), '\0');
    ssize_t count = ReadAttr(name, B_STRING_TYPE, 0, value.data(), value.size());
    if (count < 0)
        return static_cast<status_t>(count);
    value.resize(static_cast<size_t>(count));
    // Stops at the first zero byte.
    text->SetTo(value.c_str());
    return B_OK;
}

bool BNode::operator==(const BNode& other) const {
    if (mNode == nullptr || other.mNode == nullptr)
        return mNode == nullptr && other.mNode == nullptr;
    node_ref mine;
    node_ref others;
    return GetNodeRef(&mine) == B_OK && other.GetNodeRef(&others) == B_OK && mine == others;
}

status_t BNode::ReadStat(host::NodeStat* stat) const {
    if (mNode == nullptr)
        return B_NO_INIT;
    host::Result<host::NodeStat> found = mNode->stat();
    if (found)
        *stat = *found;
    return StatusOf(found);
}

status_t BNode::WriteStat(const struct stat& stat, uint32 what) {
    return mNode != nullptr ? ChangeStat(*mNode, stat, what) : B_NO_INIT;
}
