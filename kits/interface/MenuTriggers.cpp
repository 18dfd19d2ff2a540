#include "MenuTriggers.h"

#include <InterfaceDefs.h>

#include <algorithm>

namespace {

bool IsCapital(char character) {
    return character >= 'A' && character <= 'Z';
}

bool IsLetterOrDigit(char character) {
    return IsCapital(character) || (character >= 'a' && character <= 'z') ||
           (character >= '0' && character <= '9');
}

// The first byte of the label that may be picked and whose letter is free; -1 when there is none.
int32 FirstFree(const std::string& label, const std::string& taken, bool (*mayBePicked)(char)) {
    for (size_t i = 0; i < label.size(); ++i) {
        if (mayBePicked(label[i]) && taken.find(trigger_letter(label[i])) == std::string::npos) {
            return static_cast<int32>(i);
        }
    }
    return -1;
}

int32 PositionOf(const std::string& label, char letter) {
    const auto found = std::find_if(label.begin(), label.end(),
                                    [letter](char character) { return trigger_letter(character) == letter; });
    return found == label.end() ? -1 : static_cast<int32>(found - label.begin());
}

std::string KeyName(char key) {
    switch (key) {
    case B_ENTER:
        return "Enter";
    case B_SPACE:
        return "Space";
    case B_TAB:
        return "Tab";
    case B_ESCAPE:
        return "Esc";
    case B_BACKSPACE:
        return "Backspace";
    case B_DELETE:
        return "Del";
    case B_INSERT:
        return "Ins";
    case B_HOME:
        return "Home";
    case B_END:
        return "End";
    case B_PAGE_UP:
        return "Page Up";
    case B_PAGE_DOWN:
        return "Page Down";
    case B_LEFT_ARROW:
        return "Left";
    case B_RIGHT_ARROW:
        return "Right";
    case B_UP_ARROW:
        return "Up";
    case B_DOWN_ARROW:
        return "Down";
    default:
        return std::string(1, key >= 'a' && key <= 'z' ? static_cast<char>(key - 'a' + 'A') : key);
    }
}

} // namespace

std::vector<MenuTrigger> choose_triggers(const std::vector<MenuTriggerWish>& wishes) {
    std::vector<MenuTrigger> triggers(wishes.size());
    std::string taken;
    for (size_t i = 0; i < wishes.size(); ++i) {
        if (wishes[i].wished != 0) {
            const char letter = trigger_letter(wishes[i].wished);
            triggers[i] = {letter, PositionOf(wishes[i].label, letter)};
            taken += letter;
        }
    }
    for (size_t i = 0; i < wishes.size(); ++i) {
        if (wishes[i].wished != 0) {
            continue;
        }
        const std::string& label = wishes[i].label;
        int32 position = FirstFree(label, taken, &IsCapital);
        if (position < 0) {
            position = FirstFree(label, taken, &IsLetterOrDigit);
        }
        if (position >= 0) {
            triggers[i] = {trigger_letter(label[static_cast<size_t>(position)]), position};
            taken += triggers[i].letter;
        }
    }
    return triggers;
}

char trigger_letter(char character) {
    return IsCapital(character) ? static_cast<char>(character - 'A' + 'a') : character;
}

std::string shortcut_text(char shortcut, uint32 modifiers) {
    std::string text;
    if ((modifiers & (B_COMMAND_KEY | B_CONTROL_KEY)) != 0) {
        text += "Ctrl+";
    }
    if ((modifiers & B_OPTION_KEY) != 0) {
        text += "Alt+";
    }
    if ((modifiers & B_SHIFT_KEY) != 0) {
        text += "Shift+";
    }
    if ((modifiers & B_MENU_KEY) != 0) {
        text += "Super+";
    }
    return text + KeyName(shortcut);
}
