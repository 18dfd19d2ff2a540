// BMessage: a code and typed fields that travel between handlers, threads, programs and files.
#pragma once

#include <AppDefs.h>
#include <DataIO.h>
#include <EntryRef.h>
#include <Flattenable.h>
#include <MessageFields.h>
#include <MessengerAddress.h>
#include <OS.h>
#include <Rect.h>
#include <String.h>
#include <TypeConstants.h>

#include <memory>

class BHandler;
class BMessenger;

inline constexpr const char* B_PROPERTY_ENTRY = "property";
inline constexpr const char* B_PROPERTY_NAME_ENTRY = "name";

// Forms of specifiers in scripting messages.
enum : uint32 {
    B_NO_SPECIFIER = 0,
    B_DIRECT_SPECIFIER = 1,
    B_INDEX_SPECIFIER = 2,
    B_REVERSE_INDEX_SPECIFIER = 3,
    B_RANGE_SPECIFIER = 4,
    B_REVERSE_RANGE_SPECIFIER = 5,
    B_NAME_SPECIFIER = 6,
    B_ID_SPECIFIER = 7,
    B_SPECIFIERS_END = 128,
};

// An ordered set of named fields, each with a type and one or more items of it.
//
// Threads: one at a time. Sending copies the message, so the sender keeps its own.
// Ownership: everything added is copied. Pointers that Find...() hands out point into the message and hold
// until it is next changed or goes away; objects passed by pointer are filled with copies.
// Errors of all field calls: B_NAME_NOT_FOUND no such field; B_BAD_TYPE the field has another type;
// B_BAD_INDEX the field has fewer items; B_BAD_VALUE a null or too long name (255 bytes), null or empty data,
// or another size than the field's fixed one; B_BAD_DATA the item's bytes are no such value;
// B_NO_MEMORY the message would grow past 2 GB. A call that fails changes nothing.
class BMessage {
  public:
    BMessage();
    explicit BMessage(uint32 code);
    // Copies `what` and the fields. How the other was delivered is not copied: a copy cannot be replied to.
    BMessage(const BMessage& other);
    // Take the other's contents and its place in delivery, a reply that is owed included. It is left empty.
    BMessage(BMessage&& other) noexcept;
    BMessage& operator=(BMessage&& other) noexcept;
    // A message that was sent with its sender waiting, and has not been replied to, answers B_NO_REPLY as it
    // goes away.
    virtual ~BMessage();
    BMessage& operator=(const BMessage& other);

    uint32 what = 0;

    // For each index from 0 on until B_BAD_INDEX: the fields of that type, or of B_ANY_TYPE all of them.
    // `nameFound` points into the message. B_NAME_NOT_FOUND when there is none at all.
    status_t GetInfo(type_code typeRequested, int32 index, char** nameFound, type_code* typeFound,
                     int32* countFound = nullptr) const;
    status_t GetInfo(const char* name, type_code* typeFound, int32* countFound = nullptr) const;
    status_t GetInfo(const char* name, type_code* typeFound, bool* fixedSize) const;
    int32 CountNames(type_code type) const;
    bool IsEmpty() const;
    // The code is an underscore and three capital letters.
    bool IsSystem() const;
    bool IsReply() const;
    void PrintToStream() const;
    // B_NAME_IN_USE when there is a field of the new name.
    status_t Rename(const char* oldName, const char* newName);

    bool WasDelivered() const;
    // The sender waits for a reply and has had none.
    bool IsSourceWaiting() const;
    bool IsSourceRemote() const;
    // Where a reply goes; not valid when the message was not delivered.
    BMessenger ReturnAddress() const;
    // The message that this one replies to, kept by this one; null when it is no reply.
    const BMessage* Previous() const;
    bool WasDropped() const;
    // In screen coordinates; `offset` receives where in the dragged picture the pointer was.
    BPoint DropPoint(BPoint* offset = nullptr) const;

    // B_BAD_REPLY for a message that was not delivered or has no return address, B_DUPLICATE_REPLY for a
    // second reply to a waiting sender, otherwise as BMessenger::SendMessage().
    status_t SendReply(uint32 command, BHandler* replyTo = nullptr);
    status_t SendReply(BMessage* reply, BHandler* replyTo = nullptr, bigtime_t timeout = B_INFINITE_TIMEOUT);
    status_t SendReply(BMessage* reply, BMessenger replyTo, bigtime_t timeout = B_INFINITE_TIMEOUT);
    status_t SendReply(uint32 command, BMessage* replyToReply);
    status_t SendReply(BMessage* reply, BMessage* replyToReply, bigtime_t sendTimeout = B_INFINITE_TIMEOUT,
                       bigtime_t replyTimeout = B_INFINITE_TIMEOUT);

    // The form is described in docs/messages.md. Flatten() into a buffer of less than FlattenedSize() bytes
    // is B_NO_MEMORY.
    ssize_t FlattenedSize() const;
    status_t Flatten(char* buffer, ssize_t size) const;
    // `size`, which may be null, receives the number of bytes written.
    status_t Flatten(BDataIO* stream, ssize_t* size = nullptr) const;
    // Replace the contents. On failure the message is empty, `what` included. B_NOT_A_MESSAGE, B_BAD_DATA or
    // the stream's error.
    // The first takes the size from the form itself and must only be given buffers that are known to hold all
    // of it. Prefer the second, which never looks past `size` bytes and wants the form to fill them exactly.
    status_t Unflatten(const char* buffer);
    status_t Unflatten(const char* buffer, size_t size);
    // Reads the message's bytes and none after them.
    status_t Unflatten(BDataIO* stream);

    // Scripting: the stack of specifiers, the last added being the current one.
    status_t AddSpecifier(const char* property);
    status_t AddSpecifier(const char* property, int32 index);
    status_t AddSpecifier(const char* property, int32 index, int32 range);
    status_t AddSpecifier(const char* property, const char* name);
    status_t AddSpecifier(const BMessage* specifier);
    status_t SetCurrentSpecifier(int32 index);
    // B_BAD_SCRIPT_SYNTAX when there is no (more) specifier. Null pointers are skipped.
    status_t GetCurrentSpecifier(int32* index, BMessage* specifier = nullptr, int32* form = nullptr,
                                 const char** property = nullptr) const;
    bool HasSpecifiers() const;
    status_t PopSpecifier();

// The same five calls for each plain type: Find...(name, value) is the item at index 0, and the value is left
// alone on failure. Get...() answers a default instead of an error.
#define KIT_MESSAGE_VALUE_CALLS(TypeName, Type)                                                              \
    status_t Add##TypeName(const char* name, Type value);                                                    \
    status_t Find##TypeName(const char* name, Type* value) const;                                            \
    status_t Find##TypeName(const char* name, int32 index, Type* value) const;                               \
    status_t Replace##TypeName(const char* name, Type value);                                                \
    status_t Replace##TypeName(const char* name, int32 index, Type value);                                   \
    bool Has##TypeName(const char* name, int32 index = 0) const;                                             \
    Type Get##TypeName(const char* name, Type defaultValue = Type()) const;                                  \
    Type Get##TypeName(const char* name, int32 index, Type defaultValue) const;
    KIT_MESSAGE_VALUE_CALLS(Bool, bool)
    KIT_MESSAGE_VALUE_CALLS(Int8, int8)
    KIT_MESSAGE_VALUE_CALLS(UInt8, uint8)
    KIT_MESSAGE_VALUE_CALLS(Int16, int16)
    KIT_MESSAGE_VALUE_CALLS(UInt16, uint16)
    KIT_MESSAGE_VALUE_CALLS(Int32, int32)
    KIT_MESSAGE_VALUE_CALLS(UInt32, uint32)
    KIT_MESSAGE_VALUE_CALLS(Int64, int64)
    KIT_MESSAGE_VALUE_CALLS(UInt64, uint64)
    KIT_MESSAGE_VALUE_CALLS(Float, float)
    KIT_MESSAGE_VALUE_CALLS(Double, double)
    KIT_MESSAGE_VALUE_CALLS(Point, BPoint)
    KIT_MESSAGE_VALUE_CALLS(Rect, BRect)
#undef KIT_MESSAGE_VALUE_CALLS

    // Pointers mean something to this process only.
    status_t AddPointer(const char* name, const void* value);
    status_t FindPointer(const char* name, void** value) const;
    status_t FindPointer(const char* name, int32 index, void** value) const;
    status_t ReplacePointer(const char* name, const void* value);
    status_t ReplacePointer(const char* name, int32 index, const void* value);
    bool HasPointer(const char* name, int32 index = 0) const;
    void* GetPointer(const char* name, const void* defaultValue = nullptr) const;
    void* GetPointer(const char* name, int32 index, const void* defaultValue) const;

    // Find...() of a text that was added without its terminator (AddData()) is B_BAD_DATA.
    status_t AddString(const char* name, const char* text);
    status_t AddString(const char* name, const BString& text);
    status_t FindString(const char* name, const char** text) const;
    status_t FindString(const char* name, int32 index, const char** text) const;
    status_t FindString(const char* name, BString* text) const;
    status_t FindString(const char* name, int32 index, BString* text) const;
    status_t ReplaceString(const char* name, const char* text);
    status_t ReplaceString(const char* name, int32 index, const char* text);
    status_t ReplaceString(const char* name, const BString& text);
    status_t ReplaceString(const char* name, int32 index, const BString& text);
    bool HasString(const char* name, int32 index = 0) const;
    const char* GetString(const char* name, const char* defaultValue = nullptr) const;
    const char* GetString(const char* name, int32 index, const char* defaultValue) const;

    status_t AddRef(const char* name, const entry_ref* ref);
    status_t FindRef(const char* name, entry_ref* ref) const;
    status_t FindRef(const char* name, int32 index, entry_ref* ref) const;
    status_t ReplaceRef(const char* name, const entry_ref* ref);
    status_t ReplaceRef(const char* name, int32 index, const entry_ref* ref);
    bool HasRef(const char* name, int32 index = 0) const;

    status_t AddNodeRef(const char* name, const node_ref* ref);
    status_t FindNodeRef(const char* name, node_ref* ref) const;
    status_t FindNodeRef(const char* name, int32 index, node_ref* ref) const;
    status_t ReplaceNodeRef(const char* name, const node_ref* ref);
    status_t ReplaceNodeRef(const char* name, int32 index, const node_ref* ref);
    bool HasNodeRef(const char* name, int32 index = 0) const;

    status_t AddMessenger(const char* name, BMessenger messenger);
    status_t FindMessenger(const char* name, BMessenger* messenger) const;
    status_t FindMessenger(const char* name, int32 index, BMessenger* messenger) const;
    status_t ReplaceMessenger(const char* name, BMessenger messenger);
    status_t ReplaceMessenger(const char* name, int32 index, BMessenger messenger);
    bool HasMessenger(const char* name, int32 index = 0) const;

    // A copy of the other message's contents. B_BAD_VALUE when they would lie more than 64 messages deep.
    status_t AddMessage(const char* name, const BMessage* message);
    status_t FindMessage(const char* name, BMessage* message) const;
    status_t FindMessage(const char* name, int32 index, BMessage* message) const;
    status_t ReplaceMessage(const char* name, const BMessage* message);
    status_t ReplaceMessage(const char* name, int32 index, const BMessage* message);
    bool HasMessage(const char* name, int32 index = 0) const;

    // `count` is a guess at how many items will be added, to make room for.
    status_t AddFlat(const char* name, BFlattenable* object, int32 count = 1);
    status_t AddFlat(const char* name, const BFlattenable* object, int32 count = 1);
    // B_BAD_VALUE when the object does not take the field's type, otherwise what its Unflatten() answers.
    status_t FindFlat(const char* name, BFlattenable* object) const;
    status_t FindFlat(const char* name, int32 index, BFlattenable* object) const;
    status_t ReplaceFlat(const char* name, BFlattenable* object);
    status_t ReplaceFlat(const char* name, int32 index, BFlattenable* object);
    bool HasFlat(const char* name, const BFlattenable* object) const;
    bool HasFlat(const char* name, int32 index, const BFlattenable* object) const;

    // Any bytes under any type (B_MESSAGE_TYPE: a flattened message only, else B_BAD_DATA). The first item
    // decides whether all items of the field have one size. The bytes found are aligned for every plain type.
    status_t AddData(const char* name, type_code type, const void* data, ssize_t size,
                     bool isFixedSize = true, int32 count = 1);
    status_t FindData(const char* name, type_code type, const void** data, ssize_t* size) const;
    status_t FindData(const char* name, type_code type, int32 index, const void** data, ssize_t* size) const;
    status_t ReplaceData(const char* name, type_code type, const void* data, ssize_t size);
    status_t ReplaceData(const char* name, type_code type, int32 index, const void* data, ssize_t size);
    bool HasData(const char* name, type_code type, int32 index = 0) const;

    status_t RemoveData(const char* name, int32 index = 0);
    status_t RemoveName(const char* name);
    // Takes all fields away; `what` stays.
    status_t MakeEmpty();
    // Adds the other's items behind this one's. B_BAD_TYPE when a field has another type here.
    status_t Append(const BMessage& other);

  private:
    friend class MessageDelivery;

    // How the message reached its handler, as MessageDelivery wrote it.
    struct Delivery {
        bool delivered = false;
        bool sourceWaiting = false;
        bool replied = false;
        bool isReply = false;
        bool dropped = false;
        MessengerAddress target;
        MessengerAddress replyTo;
        BPoint dropPoint;
        BPoint dropOffset;
        std::shared_ptr<const BMessage> previous;
    };

    void AnswerThatThereIsNone();
    void Take(BMessage& other);
    status_t AddItem(const char* name, type_code type, std::span<const char> item, bool fixedSize,
                     int32 count = 1);
    status_t FindItem(const char* name, type_code type, int32 index, std::span<const char>* item) const;
    status_t ReplaceItem(const char* name, type_code type, int32 index, std::span<const char> item);
    template <typename Value>
    status_t FindValue(const char* name, type_code type, int32 index, Value* value) const;
    void PrintToStream(int indent, int levelsLeft) const;

    MessageFields mFields;
    int32 mCurrentSpecifier = -1;
    Delivery mDelivery;
};
