// The letters that choose the items of a menu, and the texts that show their shortcuts. Draws nothing.
#pragma once

#include <SupportDefs.h>

#include <string>
#include <vector>

struct MenuTriggerWish {
    std::string label;
    // Set by the program, or 0.
    char wished = 0;
};

struct MenuTrigger {
    // In lower case; 0 for an item that got none.
    char letter = 0;
    // The byte of the label to be underlined; -1 when the letter is not in it.
    int32 position = -1;
};

// One for each wish. What was wished is granted as it is, also twice. The others get a letter or digit of
// their label that no item has yet: the first capital, else the first letter or digit of any kind. Only
// letters and digits of ASCII are picked. Case makes no difference between triggers.
std::vector<MenuTrigger> choose_triggers(const std::vector<MenuTriggerWish>& wishes);

// The letter in lower case, as triggers are compared.
char trigger_letter(char character);

// "Ctrl+Shift+F": B_COMMAND_KEY and B_CONTROL_KEY are both the Control key.
std::string shortcut_text(char shortcut, uint32 modifiers);
