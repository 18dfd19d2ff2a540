#include "widgets/HintedMenuItem.h"

HintedMenuItem::HintedMenuItem(const char* label, BMessage* message, int32 hint, char shortcut,
                               uint32 modifiers)
    : BMenuItem(label, message, shortcut, modifiers), mHint(hint) {}

HintedMenuItem::~HintedMenuItem() = default;
