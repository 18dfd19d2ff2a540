// BMessage's calls for numbers, texts, pointers and plain bytes.
#include "MessageCodec.h"
#include <Message.h>

#include <cstring>

namespace {

template <typename Value>
std::span<const char> BytesOf(const Value& value) {
    return {reinterpret_cast<const char*>(&value), sizeof(value)};
}

std::span<const char> BytesOfText(const char* text) {
    return {text, std::strlen(text) + 1};
}

} // namespace

status_t BMessage::AddItem(const char* name, type_code type, std::span<const char> item, bool fixedSize,
                           int32 count) {
    if (name == nullptr || type == B_ANY_TYPE)
        return B_BAD_VALUE;
    return mFields.Add(name, type, fixedSize, item, count > 0 ? static_cast<uint32>(count) : 1);
}

status_t BMessage::FindItem(const char* name, type_code type, int32 index,
                            std::span<const char>* item) const {
    if (name == nullptr)
        return B_BAD_VALUE;
    const MessageField* field = mFields.Find(name);
    if (field == nullptr)
        return B_NAME_NOT_FOUND;
    if (type != B_ANY_TYPE && field->type != type)
        return B_BAD_TYPE;
    if (index < 0 || static_cast<uint32>(index) >= field->CountItems())
        return B_BAD_INDEX;
    *item = field->ItemAt(static_cast<uint32>(index));
    return B_OK;
}

status_t BMessage::ReplaceItem(const char* name, type_code type, int32 index, std::span<const char> item) {
    std::span<const char> old;
    const status_t status = FindItem(name, type, index, &old);
    return status == B_OK ? mFields.Find(name)->ReplaceItem(static_cast<uint32>(index), item) : status;
}

template <typename Value>
status_t BMessage::FindValue(const char* name, type_code type, int32 index, Value* value) const {
    if (value == nullptr)
        return B_BAD_VALUE;
    std::span<const char> item;
    const status_t status = FindItem(name, type, index, &item);
    if (status != B_OK)
        return status;
    if (item.size() != sizeof(Value))
        return B_BAD_DATA;
    std::memcpy(value, item.data(), sizeof(Value));
    return B_OK;
}

// A byte other than 0 and 1 would not be a bool.
template <>
status_t BMessage::FindValue<bool>(const char* name, type_code type, int32 index, bool* value) const {
    uint8 byte = 0;
    const status_t status = value != nullptr ? FindValue(name, type, index, &byte) : B_BAD_VALUE;
    if (status == B_OK)
        *value = byte != 0;
    return status;
}

#define VALUE_CALLS(TypeName, Type, code)                                                                    \
    status_t BMessage::Add##TypeName(const char* name, Type value) {                                         \
        return AddItem(name, code, BytesOf(value), true);                                                    \
    }                                                                                                        \
    status_t BMessage::Find##TypeName(const char* name, Type* value) const {                                 \
        return FindValue(name, code, 0, value);                                                              \
    }                                                                                                        \
    status_t BMessage::Find##TypeName(const char* name, int32 index, Type* value) const {                    \
        return FindValue(name, code, index, value);                                                          \
    }                                                                                                        \
    status_t BMessage::Replace##TypeName(const char* name, Type value) {                                     \
        return ReplaceItem(name, code, 0, BytesOf(value));                                                   \
    }                                                                                                        \
    status_t BMessage::Replace##TypeName(const char* name, int32 index, Type value) {                        \
        return ReplaceItem(name, code, index, BytesOf(value));                                               \
    }                                                                                                        \
    bool BMessage::Has##TypeName(const char* name, int32 index) const {                                      \
        return HasData(name, code, index);                                                                   \
    }                                                                                                        \
    Type BMessage::Get##TypeName(const char* name, Type defaultValue) const {                                \
        return Get##TypeName(name, 0, defaultValue);                                                         \
    }                                                                                                        \
    Type BMessage::Get##TypeName(const char* name, int32 index, Type defaultValue) const {                   \
        Type value = defaultValue;                                                                           \
        return Find##TypeName(name, index, &value) == B_OK ? value : defaultValue;                           \
    }
VALUE_CALLS(Bool, bool, B_BOOL_TYPE)
VALUE_CALLS(Int8, int8, B_INT8_TYPE)
VALUE_CALLS(UInt8, uint8, B_UINT8_TYPE)
VALUE_CALLS(Int16, int16, B_INT16_TYPE)
VALUE_CALLS(UInt16, uint16, B_UINT16_TYPE)
VALUE_CALLS(Int32, int32, B_INT32_TYPE)
VALUE_CALLS(UInt32, uint32, B_UINT32_TYPE)
VALUE_CALLS(Int64, int64, B_INT64_TYPE)
VALUE_CALLS(UInt64, uint64, B_UINT64_TYPE)
VALUE_CALLS(Float, float, B_FLOAT_TYPE)
VALUE_CALLS(Double, double, B_DOUBLE_TYPE)
VALUE_CALLS(Point, BPoint, B_POINT_TYPE)
VALUE_CALLS(Rect, BRect, B_RECT_TYPE)
#undef VALUE_CALLS

// What pointers and texts share: the calls without an index, and Has...().
#define INDEX_CALLS(TypeName, FindType, ReplaceType, code)                                                   \
    status_t BMessage::Find##TypeName(const char* name, FindType value) const {                              \
        return Find##TypeName(name, 0, value);                                                               \
    }                                                                                                        \
    status_t BMessage::Replace##TypeName(const char* name, ReplaceType value) {                              \
        return Replace##TypeName(name, 0, value);                                                            \
    }                                                                                                        \
    bool BMessage::Has##TypeName(const char* name, int32 index) const {                                      \
        return HasData(name, code, index);                                                                   \
    }
INDEX_CALLS(Pointer, void**, const void*, B_POINTER_TYPE)
INDEX_CALLS(String, const char**, const char*, B_STRING_TYPE)
#undef INDEX_CALLS

status_t BMessage::AddPointer(const char* name, const void* value) {
    return AddItem(name, B_POINTER_TYPE, BytesOf(reinterpret_cast<uint64>(value)), true);
}

status_t BMessage::FindPointer(const char* name, int32 index, void** value) const {
    uint64 number = 0;
    const status_t status = value != nullptr ? FindValue(name, B_POINTER_TYPE, index, &number) : B_BAD_VALUE;
    if (status == B_OK)
        *value = reinterpret_cast<void*>(number);
    return status;
}

status_t BMessage::ReplacePointer(const char* name, int32 index, const void* value) {
    return ReplaceItem(name, B_POINTER_TYPE, index, BytesOf(reinterpret_cast<uint64>(value)));
}

void* BMessage::GetPointer(const char* name, const void* defaultValue) const {
    return GetPointer(name, 0, defaultValue);
}

void* BMessage::GetPointer(const char* name, int32 index, const void* defaultValue) const {
    void* value = nullptr;
    return FindPointer(name, index, &value) == B_OK ? value : const_cast<void*>(defaultValue);
}

status_t BMessage::AddString(const char* name, const char* text) {
    return text != nullptr ? AddItem(name, B_STRING_TYPE, BytesOfText(text), false) : B_BAD_VALUE;
}

status_t BMessage::AddString(const char* name, const BString& text) {
    return AddString(name, text.String());
}

status_t BMessage::FindString(const char* name, int32 index, const char** text) const {
    if (text == nullptr)
        return B_BAD_VALUE;
    std::span<const char> item;
    const status_t status = FindItem(name, B_STRING_TYPE, index, &item);
    if (status != B_OK)
        return status;
    if (item.back() != '\0')
        return B_BAD_DATA;
    *text = item.data();
    return B_OK;
}

status_t BMessage::FindString(const char* name, BString* text) const {
    return FindString(name, 0, text);
}

status_t BMessage::FindString(const char* name, int32 index, BString* text) const {
    const char* found = nullptr;
    const status_t status = text != nullptr ? FindString(name, index, &found) : B_BAD_VALUE;
    if (status == B_OK)
        text->SetTo(found);
    return status;
}

status_t BMessage::ReplaceString(const char* name, int32 index, const char* text) {
    return text != nullptr ? ReplaceItem(name, B_STRING_TYPE, index, BytesOfText(text)) : B_BAD_VALUE;
}

status_t BMessage::ReplaceString(const char* name, const BString& text) {
    return ReplaceString(name, 0, text.String());
}

status_t BMessage::ReplaceString(const char* name, int32 index, const BString& text) {
    return ReplaceString(name, index, text.String());
}

const char* BMessage::GetString(const char* name, const char* defaultValue) const {
    return GetString(name, 0, defaultValue);
}

const char* BMessage::GetString(const char* name, int32 index, const char* defaultValue) const {
    const char* text = nullptr;
    return FindString(name, index, &text) == B_OK ? text : defaultValue;
}

status_t BMessage::AddData(const char* name, type_code type, const void* data, ssize_t size, bool isFixedSize,
                           int32 count) {
    if (data == nullptr || size <= 0)
        return B_BAD_VALUE;
    const std::span<const char> item(static_cast<const char*>(data), static_cast<size_t>(size));
    if (type == B_MESSAGE_TYPE && message_depth(item).value_or(kMaxMessageDepth) >= kMaxMessageDepth)
        return B_BAD_DATA;
    return AddItem(name, type, item, isFixedSize, count);
}

status_t BMessage::FindData(const char* name, type_code type, const void** data, ssize_t* size) const {
    return FindData(name, type, 0, data, size);
}

status_t BMessage::FindData(const char* name, type_code type, int32 index, const void** data,
                            ssize_t* size) const {
    std::span<const char> item;
    const status_t status = data != nullptr ? FindItem(name, type, index, &item) : B_BAD_VALUE;
    if (status != B_OK)
        return status;
    *data = item.data();
    if (size != nullptr)
        *size = static_cast<ssize_t>(item.size());
    return B_OK;
}

status_t BMessage::ReplaceData(const char* name, type_code type, const void* data, ssize_t size) {
    return ReplaceData(name, type, 0, data, size);
}

status_t BMessage::ReplaceData(const char* name, type_code type, int32 index, const void* data,
                               ssize_t size) {
    if (data == nullptr || size <= 0 || type == B_ANY_TYPE)
        return B_BAD_VALUE;
    const std::span<const char> item(static_cast<const char*>(data), static_cast<size_t>(size));
    if (type == B_MESSAGE_TYPE && message_depth(item).value_or(kMaxMessageDepth) >= kMaxMessageDepth)
        return B_BAD_DATA;
    return ReplaceItem(name, type, index, item);
}

bool BMessage::HasData(const char* name, type_code type, int32 index) const {
    std::span<const char> item;
    return FindItem(name, type, index, &item) == B_OK;
}
