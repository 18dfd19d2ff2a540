// BMessage's calls for each type of field.
#include "MessageCodec.h"
#include "MessageDelivery.h"
#include <Message.h>
#include <Messenger.h>

#include <cstring>
#include <vector>

namespace {

template <typename Value>
std::span<const char> BytesOf(const Value& value) {
    return {reinterpret_cast<const char*>(&value), sizeof(value)};
}

std::span<const char> BytesOfText(const char* text) {
    return {text, std::strlen(text) + 1};
}

// Device, directory and leaf name of an entry_ref, as the form of messages has them.
std::vector<char> FlattenRef(const entry_ref& ref) {
    const uint64 numbers[2] = {static_cast<uint64>(ref.device), static_cast<uint64>(ref.directory)};
    const size_t nameSize = ref.name != nullptr ? std::strlen(ref.name) + 1 : 0;
    std::vector<char> bytes(sizeof(numbers) + nameSize);
    std::memcpy(bytes.data(), numbers, sizeof(numbers));
    if (nameSize > 0)
        std::memcpy(bytes.data() + sizeof(numbers), ref.name, nameSize);
    return bytes;
}

struct FlatMessenger {
    int32 team;
    int32 token;
    uint32 flags;
};

FlatMessenger FlattenMessenger(const BMessenger& messenger) {
    const MessengerAddress address = MessageDelivery::AddressOf(messenger);
    return {address.team, address.token, address.preferred ? 1u : 0u};
}

struct FlatNodeRef {
    uint64 device;
    uint64 node;
};

FlatNodeRef FlattenNodeRef(const node_ref& ref) {
    return {static_cast<uint64>(ref.device), static_cast<uint64>(ref.node)};
}

// The contents of a message that is to be nested; empty when there is none or it lies too deep.
std::vector<char> FlattenNested(const BMessage* message) {
    if (message == nullptr)
        return {};
    const ssize_t size = message->FlattenedSize();
    if (static_cast<size_t>(size) > kMaxMessageSize)
        return {};
    std::vector<char> form(static_cast<size_t>(size));
    if (message->Flatten(form.data(), size) != B_OK)
        return {};
    const std::optional<int32> depth = message_depth(form);
    if (!depth || *depth >= kMaxMessageDepth)
        form.clear();
    return form;
}

status_t FlattenObject(const BFlattenable* object, std::vector<char>* bytes) {
    const ssize_t size = object != nullptr ? object->FlattenedSize() : 0;
    if (size <= 0)
        return B_BAD_VALUE;
    bytes->resize(static_cast<size_t>(size));
    return object->Flatten(bytes->data(), size);
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

// What each of the remaining types shares: the calls without an index, and Has...().
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
INDEX_CALLS(Ref, entry_ref*, const entry_ref*, B_REF_TYPE)
INDEX_CALLS(NodeRef, node_ref*, const node_ref*, B_NODE_REF_TYPE)
INDEX_CALLS(Messenger, BMessenger*, BMessenger, B_MESSENGER_TYPE)
INDEX_CALLS(Message, BMessage*, const BMessage*, B_MESSAGE_TYPE)
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

status_t BMessage::AddRef(const char* name, const entry_ref* ref) {
    return ref != nullptr ? AddItem(name, B_REF_TYPE, FlattenRef(*ref), false) : B_BAD_VALUE;
}

status_t BMessage::FindRef(const char* name, int32 index, entry_ref* ref) const {
    std::span<const char> item;
    const status_t status = ref != nullptr ? FindItem(name, B_REF_TYPE, index, &item) : B_BAD_VALUE;
    if (status != B_OK)
        return status;
    uint64 numbers[2];
    if (item.size() < sizeof(numbers) || (item.size() > sizeof(numbers) && item.back() != '\0'))
        return B_BAD_DATA;
    std::memcpy(numbers, item.data(), sizeof(numbers));
    const char* leaf = item.size() > sizeof(numbers) ? item.data() + sizeof(numbers) : nullptr;
    *ref = entry_ref(static_cast<dev_t>(numbers[0]), static_cast<ino_t>(numbers[1]), leaf);
    return B_OK;
}

status_t BMessage::ReplaceRef(const char* name, int32 index, const entry_ref* ref) {
    return ref != nullptr ? ReplaceItem(name, B_REF_TYPE, index, FlattenRef(*ref)) : B_BAD_VALUE;
}

status_t BMessage::AddNodeRef(const char* name, const node_ref* ref) {
    return ref != nullptr ? AddItem(name, B_NODE_REF_TYPE, BytesOf(FlattenNodeRef(*ref)), true) : B_BAD_VALUE;
}

status_t BMessage::FindNodeRef(const char* name, int32 index, node_ref* ref) const {
    FlatNodeRef flat;
    const status_t status = ref != nullptr ? FindValue(name, B_NODE_REF_TYPE, index, &flat) : B_BAD_VALUE;
    if (status == B_OK)
        *ref = node_ref(static_cast<dev_t>(flat.device), static_cast<ino_t>(flat.node));
    return status;
}

status_t BMessage::ReplaceNodeRef(const char* name, int32 index, const node_ref* ref) {
    return ref != nullptr ? ReplaceItem(name, B_NODE_REF_TYPE, index, BytesOf(FlattenNodeRef(*ref)))
                          : B_BAD_VALUE;
}

status_t BMessage::AddMessenger(const char* name, BMessenger messenger) {
    return AddItem(name, B_MESSENGER_TYPE, BytesOf(FlattenMessenger(messenger)), true);
}

status_t BMessage::FindMessenger(const char* name, int32 index, BMessenger* messenger) const {
    FlatMessenger flat;
    const status_t status =
        messenger != nullptr ? FindValue(name, B_MESSENGER_TYPE, index, &flat) : B_BAD_VALUE;
    if (status == B_OK)
        *messenger = MessageDelivery::MessengerTo({flat.team, flat.token, (flat.flags & 1) != 0});
    return status;
}

status_t BMessage::ReplaceMessenger(const char* name, int32 index, BMessenger messenger) {
    return ReplaceItem(name, B_MESSENGER_TYPE, index, BytesOf(FlattenMessenger(messenger)));
}

status_t BMessage::AddMessage(const char* name, const BMessage* message) {
    return AddItem(name, B_MESSAGE_TYPE, FlattenNested(message), false);
}

status_t BMessage::FindMessage(const char* name, int32 index, BMessage* message) const {
    std::span<const char> item;
    const status_t status = message != nullptr ? FindItem(name, B_MESSAGE_TYPE, index, &item) : B_BAD_VALUE;
    return status == B_OK ? message->Unflatten(item.data(), item.size()) : status;
}

status_t BMessage::ReplaceMessage(const char* name, int32 index, const BMessage* message) {
    return ReplaceItem(name, B_MESSAGE_TYPE, index, FlattenNested(message));
}

status_t BMessage::AddFlat(const char* name, BFlattenable* object, int32 count) {
    return AddFlat(name, const_cast<const BFlattenable*>(object), count);
}

status_t BMessage::AddFlat(const char* name, const BFlattenable* object, int32 count) {
    std::vector<char> bytes;
    const status_t status = FlattenObject(object, &bytes);
    return status == B_OK ? AddData(name, object->TypeCode(), bytes.data(),
                                    static_cast<ssize_t>(bytes.size()), object->IsFixedSize(), count)
                          : status;
}

status_t BMessage::FindFlat(const char* name, BFlattenable* object) const {
    return FindFlat(name, 0, object);
}

status_t BMessage::FindFlat(const char* name, int32 index, BFlattenable* object) const {
    std::span<const char> item;
    const status_t status = object != nullptr ? FindItem(name, B_ANY_TYPE, index, &item) : B_BAD_VALUE;
    if (status != B_OK)
        return status;
    const type_code type = mFields.Find(name)->type;
    if (!object->AllowsTypeCode(type))
        return B_BAD_VALUE;
    return object->Unflatten(type, item.data(), static_cast<ssize_t>(item.size()));
}

status_t BMessage::ReplaceFlat(const char* name, BFlattenable* object) {
    return ReplaceFlat(name, 0, object);
}

status_t BMessage::ReplaceFlat(const char* name, int32 index, BFlattenable* object) {
    std::vector<char> bytes;
    const status_t status = FlattenObject(object, &bytes);
    return status == B_OK ? ReplaceData(name, object->TypeCode(), index, bytes.data(),
                                        static_cast<ssize_t>(bytes.size()))
                          : status;
}

bool BMessage::HasFlat(const char* name, const BFlattenable* object) const {
    return HasFlat(name, 0, object);
}

bool BMessage::HasFlat(const char* name, int32 index, const BFlattenable* object) const {
    std::span<const char> item;
    return object != nullptr && FindItem(name, B_ANY_TYPE, index, &item) == B_OK &&
           object->AllowsTypeCode(mFields.Find(name)->type);
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
