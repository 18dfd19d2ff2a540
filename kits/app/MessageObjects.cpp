// BMessage's calls for refs, messengers, nested messages and objects that can be flattened.
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

// False when the item is not of that size.
template <typename Value>
bool ReadItem(std::span<const char> item, Value* value) {
    if (item.size() != sizeof(Value))
        return false;
    std::memcpy(value, item.data(), sizeof(Value));
    return true;
}

} // namespace

// What each of these types shares: the calls without an index, and Has...().
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
INDEX_CALLS(Ref, entry_ref*, const entry_ref*, B_REF_TYPE)
INDEX_CALLS(NodeRef, node_ref*, const node_ref*, B_NODE_REF_TYPE)
INDEX_CALLS(Messenger, BMessenger*, BMessenger, B_MESSENGER_TYPE)
INDEX_CALLS(Message, BMessage*, const BMessage*, B_MESSAGE_TYPE)
#undef INDEX_CALLS

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
    std::span<const char> item;
    const status_t status = ref != nullptr ? FindItem(name, B_NODE_REF_TYPE, index, &item) : B_BAD_VALUE;
    if (status != B_OK)
        return status;
    FlatNodeRef flat;
    if (!ReadItem(item, &flat))
        return B_BAD_DATA;
    *ref = node_ref(static_cast<dev_t>(flat.device), static_cast<ino_t>(flat.node));
    return B_OK;
}

status_t BMessage::ReplaceNodeRef(const char* name, int32 index, const node_ref* ref) {
    return ref != nullptr ? ReplaceItem(name, B_NODE_REF_TYPE, index, BytesOf(FlattenNodeRef(*ref)))
                          : B_BAD_VALUE;
}

status_t BMessage::AddMessenger(const char* name, BMessenger messenger) {
    return AddItem(name, B_MESSENGER_TYPE, BytesOf(FlattenMessenger(messenger)), true);
}

status_t BMessage::FindMessenger(const char* name, int32 index, BMessenger* messenger) const {
    std::span<const char> item;
    const status_t status =
        messenger != nullptr ? FindItem(name, B_MESSENGER_TYPE, index, &item) : B_BAD_VALUE;
    if (status != B_OK)
        return status;
    FlatMessenger flat;
    if (!ReadItem(item, &flat))
        return B_BAD_DATA;
    *messenger = MessageDelivery::MessengerTo({flat.team, flat.token, (flat.flags & 1) != 0});
    return B_OK;
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
