#include "InputState.h"

#include <Looper.h>
#include <Message.h>
#include <View.h>

InputState current_input(const BView& view) {
    InputState input;
    BLooper* const looper = view.Looper();
    const BMessage* const message = looper == nullptr ? nullptr : looper->CurrentMessage();
    if (message == nullptr) {
        return input;
    }
    int32 value = 0;
    if (message->FindInt32("buttons", &value) == B_OK) {
        input.buttons = static_cast<uint32>(value);
    }
    if (message->FindInt32("clicks", &value) == B_OK) {
        input.clicks = value;
    }
    if (message->FindInt32("modifiers", &value) == B_OK) {
        input.modifiers = static_cast<uint32>(value);
    }
    if (message->FindInt32("raw_char", &value) == B_OK) {
        input.plainCharacter = static_cast<uint32>(value);
    }
    return input;
}
