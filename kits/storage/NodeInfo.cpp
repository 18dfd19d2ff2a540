#include <NodeInfo.h>

#include <Bitmap.h>
#include <Entry.h>
#include <HostConversions.h>
#include <Node.h>
#include <Path.h>
#include <TypeConstants.h>
#include <TypeIcons.h>

#include "host/api/file_system.h"

#include <string.h>
#include <string>

namespace {

constexpr const char* kTypeAttribute = "Node:Type";
constexpr const char* kPreferredAppAttribute = "Node:PreferredApp";
constexpr const char* kAppHintAttribute = "Node:AppHint";
constexpr const char* kMiniIconAttribute = "Node:MiniIcon";
constexpr const char* kLargeIconAttribute = "Node:LargeIcon";

const char* IconAttribute(icon_size size) {
    return size == B_MINI_ICON ? kMiniIconAttribute : kLargeIconAttribute;
}

// A text attribute, into a buffer of B_MIME_TYPE_LENGTH bytes.
status_t ReadTypeAttribute(const BNode& node, const char* attribute, char* buffer) {
    ssize_t count = node.ReadAttr(attribute, B_MIME_STRING_TYPE, 0, buffer, B_MIME_TYPE_LENGTH - 1);
    if (count < 0)
        return static_cast<status_t>(count);
    buffer[count] = '\0';
    return BMimeType::IsValid(buffer) ? B_OK : B_ENTRY_NOT_FOUND;
}

status_t WriteTextAttribute(BNode& node, const char* attribute, type_code type, const char* text) {
    if (text == nullptr) {
        status_t status = node.RemoveAttr(attribute);
        return status == B_ENTRY_NOT_FOUND ? B_OK : status;
    }
    ssize_t count = node.WriteAttr(attribute, type, 0, text, strlen(text) + 1);
    return count < 0 ? static_cast<status_t>(count) : B_OK;
}

// One byte more than an icon has: a longer value is none.
using IconBuffer = uint8[IconBytes(B_LARGE_ICON) + 1];

status_t ReadIconAttribute(const BNode& node, icon_size size, IconBuffer& bits) {
    ssize_t count =
        node.ReadAttr(IconAttribute(size), size == B_MINI_ICON ? B_MINI_ICON_TYPE : B_LARGE_ICON_TYPE, 0,
                      bits, sizeof(bits));
    if (count < 0)
        return static_cast<status_t>(count);
    return static_cast<size_t>(count) == IconBytes(size) ? B_OK : B_ENTRY_NOT_FOUND;
}

} // namespace

BNodeInfo::BNodeInfo() = default;

BNodeInfo::BNodeInfo(BNode* node) {
    SetTo(node);
}

BNodeInfo::~BNodeInfo() = default;

status_t BNodeInfo::SetTo(BNode* node) {
    mNode = nullptr;
    if (node == nullptr)
        mStatus = B_BAD_VALUE;
    else
        mStatus = node->InitCheck();
    if (mStatus == B_OK)
        mNode = node;
    return mStatus;
}

status_t BNodeInfo::InitCheck() const {
    return mStatus;
}

status_t BNodeInfo::GetType(char* buffer) const {
    if (mStatus != B_OK)
        return B_NO_INIT;
    if (buffer == nullptr)
        return B_BAD_VALUE;
    return ReadTypeAttribute(*mNode, kTypeAttribute, buffer);
}

status_t BNodeInfo::SetType(const char* type) {
    if (mStatus != B_OK)
        return B_NO_INIT;
    if (type != nullptr && !BMimeType::IsValid(type))
        return B_BAD_VALUE;
    return WriteTextAttribute(*mNode, kTypeAttribute, B_MIME_STRING_TYPE, type);
}

status_t BNodeInfo::GetIcon(BBitmap* icon, icon_size size) const {
    if (mStatus != B_OK)
        return B_NO_INIT;
    if (status_t status = CheckIconBitmap(icon, size); status != B_OK)
        return status;
    IconBuffer bits;
    status_t status = ReadIconAttribute(*mNode, size, bits);
    if (status == B_OK)
        FillIconBitmap(bits, size, icon);
    return status;
}

status_t BNodeInfo::SetIcon(const BBitmap* icon, icon_size size) {
    if (mStatus != B_OK)
        return B_NO_INIT;
    if (!IsIconSize(size))
        return B_BAD_VALUE;
    if (icon == nullptr) {
        status_t status = mNode->RemoveAttr(IconAttribute(size));
        return status == B_ENTRY_NOT_FOUND ? B_OK : status;
    }
    std::vector<uint8> bits;
    if (status_t status = IconBitsFromBitmap(icon, size, bits); status != B_OK)
        return status;
    type_code type = size == B_MINI_ICON ? B_MINI_ICON_TYPE : B_LARGE_ICON_TYPE;
    ssize_t count = mNode->WriteAttr(IconAttribute(size), type, 0, bits.data(), bits.size());
    return count < 0 ? static_cast<status_t>(count) : B_OK;
}

status_t BNodeInfo::GetPreferredApp(char* signature, app_verb) const {
    if (mStatus != B_OK)
        return B_NO_INIT;
    if (signature == nullptr)
        return B_BAD_VALUE;
    return ReadTypeAttribute(*mNode, kPreferredAppAttribute, signature);
}

status_t BNodeInfo::SetPreferredApp(const char* signature, app_verb) {
    if (mStatus != B_OK)
        return B_NO_INIT;
    if (signature != nullptr && !BMimeType::IsValid(signature))
        return B_BAD_VALUE;
    return WriteTextAttribute(*mNode, kPreferredAppAttribute, B_MIME_STRING_TYPE, signature);
}

status_t BNodeInfo::GetAppHint(entry_ref* ref) const {
    if (mStatus != B_OK)
        return B_NO_INIT;
    if (ref == nullptr)
        return B_BAD_VALUE;
    char path[B_PATH_NAME_LENGTH + 1];
    ssize_t count = mNode->ReadAttr(kAppHintAttribute, B_STRING_TYPE, 0, path, B_PATH_NAME_LENGTH);
    if (count < 0)
        return static_cast<status_t>(count);
    path[count] = '\0';
    return get_ref_for_path(path, ref);
}

status_t BNodeInfo::SetAppHint(const entry_ref* ref) {
    if (mStatus != B_OK)
        return B_NO_INIT;
    if (ref == nullptr)
        return WriteTextAttribute(*mNode, kAppHintAttribute, B_STRING_TYPE, nullptr);
    BPath path(ref);
    return path.InitCheck() == B_OK
               ? WriteTextAttribute(*mNode, kAppHintAttribute, B_STRING_TYPE, path.Path())
               : path.InitCheck();
}

status_t BNodeInfo::GetTrackerIcon(BBitmap* icon, icon_size size) const {
    if (mStatus != B_OK)
        return B_NO_INIT;
    if (status_t status = CheckIconBitmap(icon, size); status != B_OK)
        return status;
    IconBuffer bits;
    if (ReadIconAttribute(*mNode, size, bits) == B_OK) {
        FillIconBitmap(bits, size, icon);
        return B_OK;
    }
    char type[B_MIME_TYPE_LENGTH];
    if (ReadTypeAttribute(*mNode, kTypeAttribute, type) == B_OK)
        return GetTypeIcon(type, icon, size);
    host::Result<host::NodeKind> kind = mNode->HostNode()->kind();
    if (!kind)
        return StatusOf(kind);
    if (*kind == host::NodeKind::directory) {
        node_ref directory;
        status_t status = mNode->GetNodeRef(&directory);
        return status == B_OK ? GetTypeIcon(TypeOfDirectory(directory), icon, size) : status;
    }
    if (*kind == host::NodeKind::symbolic_link)
        return GetTypeIcon(kSymLinkType, icon, size);
    std::string guess = TypeOfName(mNode->mRef.name);
    if (!guess.empty())
        return GetTypeIcon(guess, icon, size);
    BMimeType sniffed;
    if (*kind == host::NodeKind::file && BMimeType::GuessMimeType(&mNode->mRef, &sniffed) == B_OK)
        return GetTypeIcon(sniffed.Type(), icon, size);
    return GetTypeIcon(B_FILE_MIME_TYPE, icon, size);
}

status_t BNodeInfo::GetTrackerIcon(const entry_ref* ref, BBitmap* icon, icon_size size) {
    BNode node(ref);
    if (node.InitCheck() != B_OK)
        return node.InitCheck();
    BNodeInfo info(&node);
    return info.GetTrackerIcon(icon, size);
}
