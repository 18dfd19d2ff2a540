#include <MimeRecord.h>

#include <DataIO.h>
#include <IconBits.h>
#include <TypeConstants.h>

namespace {

constexpr uint32 kRecordCode = 'MIME';
constexpr const char* kTypeField = "type";

const char* FieldName(MimeRecord::Text field) {
    switch (field) {
    case MimeRecord::Text::shortDescription:
        return "short description";
    case MimeRecord::Text::longDescription:
        return "long description";
    case MimeRecord::Text::preferredApp:
        return "preferred application";
    case MimeRecord::Text::appHint:
        return "application path";
    case MimeRecord::Text::snifferRule:
        return "sniffer rule";
    }
    return "";
}

const char* FieldName(MimeRecord::List field) {
    switch (field) {
    case MimeRecord::List::attributeInfo:
        return "attribute info";
    case MimeRecord::List::extensions:
        return "file extensions";
    case MimeRecord::List::supportedTypes:
        return "supported types";
    }
    return "";
}

std::string IconField(std::string_view forType, icon_size size) {
    std::string name = size == B_MINI_ICON ? "mini icon" : "large icon";
    return forType.empty() ? name : name + " for " + FoldedType(forType);
}

type_code IconType(icon_size size) {
    return size == B_MINI_ICON ? B_MINI_ICON_TYPE : B_LARGE_ICON_TYPE;
}

} // namespace

std::string FoldedType(std::string_view type) {
    std::string folded(type);
    for (char& c : folded) {
        if (c >= 'A' && c <= 'Z')
            c = static_cast<char>(c - 'A' + 'a');
    }
    return folded;
}

MimeRecord::MimeRecord(std::string_view type) : mFields(kRecordCode), mType(FoldedType(type)) {
    mFields.AddString(kTypeField, mType.c_str());
}

status_t MimeRecord::Parse(const void* bytes, size_t size) {
    BMessage fields;
    BMemoryIO stream(bytes, size);
    const char* type = nullptr;
    if (fields.Unflatten(&stream) != B_OK || static_cast<size_t>(stream.Position()) != size ||
        fields.what != kRecordCode || fields.FindString(kTypeField, &type) != B_OK || mType != type)
        return B_BAD_DATA;
    mFields = fields;
    return B_OK;
}

status_t MimeRecord::Serialize(std::vector<char>& bytes) const {
    bytes.resize(static_cast<size_t>(mFields.FlattenedSize()));
    return mFields.Flatten(bytes.data(), static_cast<ssize_t>(bytes.size()));
}

status_t MimeRecord::GetText(Text field, std::string& text) const {
    const char* found = nullptr;
    if (mFields.FindString(FieldName(field), &found) != B_OK)
        return B_ENTRY_NOT_FOUND;
    text = found;
    return B_OK;
}

status_t MimeRecord::SetText(Text field, const char* text) {
    mFields.RemoveName(FieldName(field));
    return text != nullptr ? mFields.AddString(FieldName(field), text) : B_OK;
}

status_t MimeRecord::GetList(List field, BMessage& list) const {
    return mFields.FindMessage(FieldName(field), &list) == B_OK ? B_OK : B_ENTRY_NOT_FOUND;
}

status_t MimeRecord::SetList(List field, const BMessage* list) {
    mFields.RemoveName(FieldName(field));
    return list != nullptr ? mFields.AddMessage(FieldName(field), list) : B_OK;
}

status_t MimeRecord::GetIcon(std::string_view forType, icon_size size, std::vector<uint8>& bits) const {
    const void* data = nullptr;
    ssize_t length = 0;
    if (mFields.FindData(IconField(forType, size).c_str(), IconType(size), &data, &length) != B_OK ||
        static_cast<size_t>(length) != IconBytes(size))
        return B_ENTRY_NOT_FOUND;
    const auto* bytes = static_cast<const uint8*>(data);
    bits.assign(bytes, bytes + length);
    return B_OK;
}

status_t MimeRecord::SetIcon(std::string_view forType, icon_size size, const std::vector<uint8>* bits) {
    std::string name = IconField(forType, size);
    mFields.RemoveName(name.c_str());
    if (bits == nullptr)
        return B_OK;
    return mFields.AddData(name.c_str(), IconType(size), bits->data(), static_cast<ssize_t>(bits->size()));
}
