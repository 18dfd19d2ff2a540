// InputState: what the mouse or key event that is being handled says beside its position or character.
#pragma once

#include <InterfaceDefs.h>

class BView;

struct InputState {
    uint32 buttons = B_PRIMARY_MOUSE_BUTTON;
    int32 clicks = 1;
    uint32 modifiers = 0;
    uint32 plainCharacter = 0; // what the key means without its modifiers, lower case
};

// From the message that the view's looper is dispatching; the values above for what it does not have. In the
// looper's thread.
InputState current_input(const BView& view);
