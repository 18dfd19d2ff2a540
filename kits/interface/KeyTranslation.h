// Keys of the display turned into the platform's codes and messages. Internal to the kit.
#pragma once

#include <Message.h>

#include "host/api/display.h"

// B_SHIFT_KEY and so on, for the display's bits. Control gives B_CONTROL_KEY and B_COMMAND_KEY.
uint32 ModifiersOf(std::uint32_t displayBits);

// B_KEY_DOWN, B_KEY_UP, B_UNMAPPED_KEY_DOWN or _UP, or for a modifier key B_MODIFIERS_CHANGED. Fields: "when"
// int64, "key" int32 (of function keys their own code, else the keyboard's number), "modifiers" int32,
// "be:key_repeat" int32 of repeated keys, and of the mapped ones "bytes" (string), "byte" (an int8 each),
// "raw_char" int32 (the character without modifiers, lower case, or the code as B_DELETE).
BMessage KeyMessage(const host::KeyInput& input);
// A B_KEY_DOWN message for each character of the text.
std::vector<BMessage> TextMessages(const std::string& text);
