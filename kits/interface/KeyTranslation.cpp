#include "KeyTranslation.h"

#include <InterfaceDefs.h>

namespace {

// The character that a named key makes; 0 for none.
char CodeOf(host::KeyName name) {
    switch (name) {
    case host::KeyName::backspace:
        return B_BACKSPACE;
    case host::KeyName::tab:
        return B_TAB;
    case host::KeyName::enter:
        return B_ENTER;
    case host::KeyName::escape:
        return B_ESCAPE;
    case host::KeyName::left:
        return B_LEFT_ARROW;
    case host::KeyName::right:
        return B_RIGHT_ARROW;
    case host::KeyName::up:
        return B_UP_ARROW;
    case host::KeyName::down:
        return B_DOWN_ARROW;
    case host::KeyName::insert:
        return B_INSERT;
    case host::KeyName::del:
        return B_DELETE;
    case host::KeyName::home:
        return B_HOME;
    case host::KeyName::end:
        return B_END;
    case host::KeyName::page_up:
        return B_PAGE_UP;
    case host::KeyName::page_down:
        return B_PAGE_DOWN;
    case host::KeyName::function:
    case host::KeyName::print:
    case host::KeyName::scroll_lock:
    case host::KeyName::pause:
        return B_FUNCTION_KEY;
    default:
        return 0;
    }
}

int32 KeyNumber(const host::KeyInput& input) {
    switch (input.name) {
    case host::KeyName::function:
        return input.function_number <= 12 ? B_F1_KEY + input.function_number - 1 : 0;
    case host::KeyName::print:
        return B_PRINT_KEY;
    case host::KeyName::scroll_lock:
        return B_SCROLL_KEY;
    case host::KeyName::pause:
        return B_PAUSE_KEY;
    default:
        return static_cast<int32>(input.code);
    }
}

bool IsModifier(host::KeyName name) {
    return name == host::KeyName::shift || name == host::KeyName::control || name == host::KeyName::alt ||
           name == host::KeyName::super || name == host::KeyName::caps_lock;
}

void AddBytes(BMessage& message, const std::string& bytes) {
    message.AddString("bytes", bytes.c_str());
    for (const char byte : bytes) {
        message.AddInt8("byte", static_cast<int8>(byte));
    }
}

// The first character of the text, as a number; of several bytes the first.
int32 RawCharacter(const std::string& text) {
    return text.empty() ? 0 : static_cast<int32>(static_cast<uint8>(text[0]));
}

} // namespace

uint32 ModifiersOf(std::uint32_t displayBits) {
    constexpr struct {
        std::uint32_t displayBit;
        uint32 bits;
    } kMeanings[] = {{host::shift_modifier, B_SHIFT_KEY},
                     {host::control_modifier, B_CONTROL_KEY | B_COMMAND_KEY},
                     {host::alt_modifier, B_OPTION_KEY},
                     {host::super_modifier, B_MENU_KEY},
                     {host::caps_lock_modifier, B_CAPS_LOCK}};
    uint32 bits = 0;
    for (const auto& meaning : kMeanings) {
        bits |= (displayBits & meaning.displayBit) != 0 ? meaning.bits : 0U;
    }
    return bits;
}

BMessage KeyMessage(const host::KeyInput& input) {
    const char code = CodeOf(input.name);
    const std::string bytes = code != 0 ? std::string(1, code) : input.text;
    BMessage message(input.pressed ? B_KEY_DOWN : B_KEY_UP);
    if (IsModifier(input.name)) {
        message.what = B_MODIFIERS_CHANGED;
    } else if (bytes.empty() && input.plain_text.empty()) {
        message.what = input.pressed ? B_UNMAPPED_KEY_DOWN : B_UNMAPPED_KEY_UP;
    }
    message.AddInt64("when", input.when);
    message.AddInt32("key", KeyNumber(input));
    message.AddInt32("modifiers", static_cast<int32>(ModifiersOf(input.modifiers)));
    if (message.what == B_MODIFIERS_CHANGED) {
        message.AddBool("be:option_key", input.name == host::KeyName::alt);
        message.AddBool("be:pressed", input.pressed);
    }
    if (input.repeated) {
        message.AddInt32("be:key_repeat", 1);
    }
    if (message.what == B_KEY_DOWN || message.what == B_KEY_UP) {
        AddBytes(message, bytes);
        message.AddInt32("raw_char", code != 0 ? code : RawCharacter(input.plain_text));
    }
    return message;
}

std::vector<BMessage> TextMessages(const std::string& text) {
    std::vector<BMessage> messages;
    for (size_t at = 0; at < text.size();) {
        size_t end = at + 1;
        while (end < text.size() && (static_cast<uint8>(text[end]) & 0xC0U) == 0x80U) {
            ++end;
        }
        BMessage message(B_KEY_DOWN);
        message.AddInt32("key", 0);
        message.AddInt32("modifiers", 0);
        AddBytes(message, text.substr(at, end - at));
        message.AddInt32("raw_char", RawCharacter(text.substr(at, end - at)));
        messages.push_back(std::move(message));
        at = end;
    }
    return messages;
}
