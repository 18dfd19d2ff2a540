// Any bytes as a flattened message: refused and the message left empty, or read and written back the same.
#include <Message.h>
#include <Messenger.h>

#include <cstring>
#include <vector>

namespace {

// A broken promise ends the process, which is what the fuzzer looks for.
void Require(bool condition) {
    if (!condition)
        __builtin_trap();
}

// Every item through every call that could take it apart, nested messages too.
void ReadEverything(const BMessage& message) {
    char* name = nullptr;
    type_code type = 0;
    int32 count = 0;
    for (int32 field = 0; message.GetInfo(B_ANY_TYPE, field, &name, &type, &count) == B_OK; field++) {
        Require(count > 0);
        for (int32 index = 0; index < count; index++) {
            const void* data = nullptr;
            ssize_t size = 0;
            Require(message.FindData(name, type, index, &data, &size) == B_OK && size > 0);
            std::vector<char> copy(static_cast<size_t>(size));
            std::memcpy(copy.data(), data, copy.size());

            const char* text = nullptr;
            if (message.FindString(name, index, &text) == B_OK)
                Require(std::strlen(text) < static_cast<size_t>(size));
            bool flag = false;
            (void)message.FindBool(name, index, &flag);
            int64 number = 0;
            (void)message.FindInt64(name, index, &number);
            BRect rect;
            (void)message.FindRect(name, index, &rect);
            entry_ref ref;
            (void)message.FindRef(name, index, &ref);
            BMessenger messenger;
            (void)message.FindMessenger(name, index, &messenger);
            BMessage nested;
            if (type == B_MESSAGE_TYPE) {
                Require(message.FindMessage(name, index, &nested) == B_OK);
                ReadEverything(nested);
            }
        }
    }
    int32 form = 0;
    BMessage specifier;
    (void)message.GetCurrentSpecifier(nullptr, &specifier, &form);
}

} // namespace

extern "C" int LLVMFuzzerTestOneInput(const uint8_t* bytes, size_t size) {
    const char* const form = reinterpret_cast<const char*>(bytes);
    BMessage message('old_');
    message.AddInt32("old", 1);
    const status_t status = message.Unflatten(form, size);

    // The stream form reads the same messages, and exactly their bytes.
    BMemoryIO stream(static_cast<const void*>(bytes), size);
    BMessage streamed;
    const status_t streamStatus = streamed.Unflatten(&stream);
    if (status != B_OK) {
        Require(message.IsEmpty() && message.what == 0);
        Require(streamStatus == B_OK ? stream.Position() < static_cast<off_t>(size) : streamed.IsEmpty());
        return 0;
    }
    Require(streamStatus == B_OK && stream.Position() == static_cast<off_t>(size));

    std::vector<char> again(size);
    Require(message.FlattenedSize() == static_cast<ssize_t>(size));
    Require(message.Flatten(again.data(), static_cast<ssize_t>(size)) == B_OK);
    Require(std::memcmp(again.data(), bytes, size) == 0);
    ReadEverything(message);
    return 0;
}
