#include <MimeType.h>

#include <Bitmap.h>
#include <CopyText.h>
#include <Entry.h>
#include <IconBits.h>
#include <Message.h>
#include <MimeDatabase.h>
#include <Path.h>
#include <String.h>
#include <TypeIcons.h>

#include <string.h>

namespace {

bool IsTypeCharacter(char c) {
    return c > ' ' && c < 0x7F && strchr("<>@,;:\\\"()[]?=/", c) == nullptr;
}

status_t ReadText(const char* type, MimeRecord::Text field, std::string& text) {
    if (type == nullptr)
        return B_NO_INIT;
    MimeRecord record(type);
    status_t status = MimeDatabase::Read(type, record);
    return status == B_OK ? record.GetText(field, text) : status;
}

status_t ReadShortText(const char* type, MimeRecord::Text field, char* buffer) {
    if (buffer == nullptr)
        return B_BAD_VALUE;
    std::string text;
    status_t status = ReadText(type, field, text);
    if (status == B_OK)
        CopyText(buffer, B_MIME_TYPE_LENGTH, text.c_str());
    return status;
}

status_t WriteText(const char* type, MimeRecord::Text field, const char* text) {
    if (type == nullptr)
        return B_NO_INIT;
    return MimeDatabase::Change(type, [&](MimeRecord& record) { return record.SetText(field, text); });
}

// The same for texts that must fit into the buffer that they are read into.
status_t WriteShortText(const char* type, MimeRecord::Text field, const char* text) {
    if (text != nullptr && strlen(text) >= B_MIME_TYPE_LENGTH)
        return B_BAD_VALUE;
    return WriteText(type, field, text);
}

status_t ReadList(const char* type, MimeRecord::List field, BMessage* list) {
    if (list == nullptr)
        return B_BAD_VALUE;
    if (type == nullptr)
        return B_NO_INIT;
    MimeRecord record(type);
    status_t status = MimeDatabase::Read(type, record);
    return status == B_OK ? record.GetList(field, *list) : status;
}

status_t WriteList(const char* type, MimeRecord::List field, const BMessage* list) {
    if (type == nullptr)
        return B_NO_INIT;
    status_t status =
        MimeDatabase::Change(type, [&](MimeRecord& record) { return record.SetList(field, list); });
    ForgetTypeIcons();
    return status;
}

status_t ReadIcon(const char* type, const char* forType, BBitmap* icon, icon_size size) {
    if (CheckIconBitmap(icon, size) != B_OK)
        return B_BAD_VALUE;
    if (type == nullptr)
        return B_NO_INIT;
    MimeRecord record(type);
    std::vector<uint8> bits;
    status_t status = MimeDatabase::Read(type, record);
    if (status == B_OK)
        status = record.GetIcon(forType, size, bits);
    if (status == B_OK)
        FillIconBitmap(bits.data(), size, icon);
    return status;
}

status_t WriteIcon(const char* type, const char* forType, const BBitmap* icon, icon_size size) {
    if (!IsIconSize(size))
        return B_BAD_VALUE;
    if (type == nullptr)
        return B_NO_INIT;
    std::vector<uint8> bits;
    if (icon != nullptr) {
        if (status_t status = IconBitsFromBitmap(icon, size, bits); status != B_OK)
            return status;
    }
    status_t status = MimeDatabase::Change(type, [&](MimeRecord& record) {
        return record.SetIcon(forType, size, icon != nullptr ? &bits : nullptr);
    });
    ForgetTypeIcons();
    return status;
}

} // namespace

BMimeType::BMimeType() = default;

BMimeType::BMimeType(const char* type) {
    SetTo(type);
}

BMimeType::~BMimeType() = default;

status_t BMimeType::SetTo(const char* type) {
    Unset();
    if (!IsValid(type)) {
        mStatus = B_BAD_VALUE;
        return mStatus;
    }
    mType = type;
    mStatus = B_OK;
    return B_OK;
}

void BMimeType::Unset() {
    mType.clear();
    mStatus = B_NO_INIT;
}

status_t BMimeType::InitCheck() const {
    return mStatus;
}

const char* BMimeType::Type() const {
    return mStatus == B_OK ? mType.c_str() : nullptr;
}

bool BMimeType::IsValid() const {
    return mStatus == B_OK;
}

bool BMimeType::IsValid(const char* type) {
    if (type == nullptr || strlen(type) >= B_MIME_TYPE_LENGTH)
        return false;
    bool partIsEmpty = true;
    int parts = 1;
    for (; *type != '\0'; type++) {
        if (*type == '/') {
            if (partIsEmpty || ++parts > 2)
                return false;
            partIsEmpty = true;
        } else if (IsTypeCharacter(*type)) {
            partIsEmpty = false;
        } else {
            return false;
        }
    }
    return !partIsEmpty;
}

bool BMimeType::IsSupertypeOnly() const {
    return mStatus == B_OK && mType.find('/') == std::string::npos;
}

status_t BMimeType::GetSupertype(BMimeType* superType) const {
    if (superType == nullptr)
        return B_BAD_VALUE;
    superType->Unset();
    size_t slash = mType.find('/');
    if (mStatus != B_OK || slash == std::string::npos)
        return B_BAD_VALUE;
    return superType->SetTo(mType.substr(0, slash).c_str());
}

bool BMimeType::Contains(const BMimeType* type) const {
    if (type == nullptr || mStatus != B_OK || type->mStatus != B_OK)
        return false;
    if (*this == *type)
        return true;
    BMimeType superType;
    return type->GetSupertype(&superType) == B_OK && *this == superType;
}

bool BMimeType::operator==(const BMimeType& other) const {
    if (mStatus != B_OK || other.mStatus != B_OK)
        return mStatus != B_OK && other.mStatus != B_OK;
    return FoldedType(mType) == FoldedType(other.mType);
}

bool BMimeType::operator==(const char* type) const {
    BMimeType other(type);
    return *this == other;
}

bool BMimeType::IsInstalled() const {
    if (mStatus != B_OK)
        return false;
    MimeRecord record(mType);
    return MimeDatabase::Read(mType, record) == B_OK;
}

status_t BMimeType::Install() {
    if (mStatus != B_OK)
        return B_NO_INIT;
    if (IsInstalled())
        return B_OK;
    return MimeDatabase::Change(mType, [](MimeRecord&) { return status_t(B_OK); });
}

status_t BMimeType::Delete() {
    if (mStatus != B_OK)
        return B_NO_INIT;
    status_t status = MimeDatabase::Remove(mType);
    ForgetTypeIcons();
    return status;
}

status_t BMimeType::GetIcon(BBitmap* icon, icon_size size) const {
    return ReadIcon(Type(), "", icon, size);
}

status_t BMimeType::SetIcon(const BBitmap* icon, icon_size size) {
    return WriteIcon(Type(), "", icon, size);
}

status_t BMimeType::GetIconForType(const char* type, BBitmap* icon, icon_size size) const {
    return type == nullptr || IsValid(type) ? ReadIcon(Type(), type != nullptr ? type : "", icon, size)
                                            : B_BAD_VALUE;
}

status_t BMimeType::SetIconForType(const char* type, const BBitmap* icon, icon_size size) {
    return type == nullptr || IsValid(type) ? WriteIcon(Type(), type != nullptr ? type : "", icon, size)
                                            : B_BAD_VALUE;
}

status_t BMimeType::GetPreferredApp(char* signature, app_verb) const {
    return ReadShortText(Type(), MimeRecord::Text::preferredApp, signature);
}

status_t BMimeType::SetPreferredApp(const char* signature, app_verb) {
    if (signature != nullptr && !IsValid(signature))
        return B_BAD_VALUE;
    return WriteShortText(Type(), MimeRecord::Text::preferredApp, signature);
}

status_t BMimeType::GetAppHint(entry_ref* ref) const {
    if (ref == nullptr)
        return B_BAD_VALUE;
    std::string path;
    status_t status = ReadText(Type(), MimeRecord::Text::appHint, path);
    return status == B_OK ? get_ref_for_path(path.c_str(), ref) : status;
}

status_t BMimeType::SetAppHint(const entry_ref* ref) {
    if (ref == nullptr)
        return WriteText(Type(), MimeRecord::Text::appHint, nullptr);
    BPath path(ref);
    return path.InitCheck() == B_OK ? WriteText(Type(), MimeRecord::Text::appHint, path.Path())
                                    : path.InitCheck();
}

status_t BMimeType::GetAttrInfo(BMessage* info) const {
    return ReadList(Type(), MimeRecord::List::attributeInfo, info);
}

status_t BMimeType::SetAttrInfo(const BMessage* info) {
    return WriteList(Type(), MimeRecord::List::attributeInfo, info);
}

status_t BMimeType::GetFileExtensions(BMessage* extensions) const {
    return ReadList(Type(), MimeRecord::List::extensions, extensions);
}

status_t BMimeType::SetFileExtensions(const BMessage* extensions) {
    return WriteList(Type(), MimeRecord::List::extensions, extensions);
}

status_t BMimeType::GetShortDescription(char* description) const {
    return ReadShortText(Type(), MimeRecord::Text::shortDescription, description);
}

status_t BMimeType::SetShortDescription(const char* description) {
    return WriteShortText(Type(), MimeRecord::Text::shortDescription, description);
}

status_t BMimeType::GetLongDescription(char* description) const {
    return ReadShortText(Type(), MimeRecord::Text::longDescription, description);
}

status_t BMimeType::SetLongDescription(const char* description) {
    return WriteShortText(Type(), MimeRecord::Text::longDescription, description);
}

status_t BMimeType::GetSnifferRule(BString* rule) const {
    if (rule == nullptr)
        return B_BAD_VALUE;
    std::string text;
    status_t status = ReadText(Type(), MimeRecord::Text::snifferRule, text);
    if (status == B_OK)
        rule->SetTo(text.c_str());
    return status;
}

status_t BMimeType::SetSnifferRule(const char* rule) {
    return WriteText(Type(), MimeRecord::Text::snifferRule, rule);
}

status_t BMimeType::GetSupportedTypes(BMessage* types) const {
    return ReadList(Type(), MimeRecord::List::supportedTypes, types);
}

status_t BMimeType::SetSupportedTypes(const BMessage* types) {
    return WriteList(Type(), MimeRecord::List::supportedTypes, types);
}
