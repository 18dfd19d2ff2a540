// BMessage's stack of specifiers.
#include <Message.h>

namespace {

constexpr const char* kSpecifiers = "specifiers";

} // namespace

status_t BMessage::AddSpecifier(const char* property) {
    if (property == nullptr)
        return B_BAD_VALUE;
    BMessage specifier(B_DIRECT_SPECIFIER);
    const status_t status = specifier.AddString(B_PROPERTY_ENTRY, property);
    return status == B_OK ? AddSpecifier(&specifier) : status;
}

status_t BMessage::AddSpecifier(const char* property, int32 index) {
    BMessage specifier(B_INDEX_SPECIFIER);
    status_t status = specifier.AddString(B_PROPERTY_ENTRY, property);
    if (status == B_OK)
        status = specifier.AddInt32("index", index);
    return status == B_OK ? AddSpecifier(&specifier) : status;
}

status_t BMessage::AddSpecifier(const char* property, int32 index, int32 range) {
    if (range < 0)
        return B_BAD_VALUE;
    BMessage specifier(B_RANGE_SPECIFIER);
    status_t status = specifier.AddString(B_PROPERTY_ENTRY, property);
    if (status == B_OK)
        status = specifier.AddInt32("index", index);
    if (status == B_OK)
        status = specifier.AddInt32("range", range);
    return status == B_OK ? AddSpecifier(&specifier) : status;
}

status_t BMessage::AddSpecifier(const char* property, const char* name) {
    BMessage specifier(B_NAME_SPECIFIER);
    status_t status = specifier.AddString(B_PROPERTY_ENTRY, property);
    if (status == B_OK)
        status = specifier.AddString(B_PROPERTY_NAME_ENTRY, name);
    return status == B_OK ? AddSpecifier(&specifier) : status;
}

status_t BMessage::AddSpecifier(const BMessage* specifier) {
    const status_t status = AddMessage(kSpecifiers, specifier);
    int32 count = 0;
    if (status == B_OK && GetInfo(kSpecifiers, nullptr, &count) == B_OK)
        mCurrentSpecifier = count - 1;
    return status;
}

status_t BMessage::SetCurrentSpecifier(int32 index) {
    int32 count = 0;
    const status_t status = GetInfo(kSpecifiers, nullptr, &count);
    if (status != B_OK)
        return status;
    if (index < 0 || index >= count)
        return B_BAD_INDEX;
    mCurrentSpecifier = index;
    return B_OK;
}

status_t BMessage::GetCurrentSpecifier(int32* index, BMessage* specifier, int32* form,
                                       const char** property) const {
    if (index != nullptr)
        *index = mCurrentSpecifier;
    BMessage local;
    BMessage* found = specifier != nullptr ? specifier : &local;
    if (mCurrentSpecifier < 0 || FindMessage(kSpecifiers, mCurrentSpecifier, found) != B_OK)
        return B_BAD_SCRIPT_SYNTAX;
    if (form != nullptr)
        *form = static_cast<int32>(found->what);
    if (property == nullptr)
        return B_OK;
    // The name lies in the specifier, so it needs one that the caller keeps.
    if (specifier == nullptr)
        return B_BAD_VALUE;
    return specifier->FindString(B_PROPERTY_ENTRY, property) == B_OK ? B_OK : B_BAD_SCRIPT_SYNTAX;
}

bool BMessage::HasSpecifiers() const {
    return HasMessage(kSpecifiers);
}

status_t BMessage::PopSpecifier() {
    if (mCurrentSpecifier < 0)
        return B_BAD_VALUE;
    mCurrentSpecifier--;
    return B_OK;
}
