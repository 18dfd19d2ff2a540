// How a window's frame lies in the settings: the floats "winX", "winY", "winWidth" and "winHeight".
#pragma once

#include <Rect.h>

class BMessage;

// Adds the four fields. Does nothing for a null message.
void AddWindowFrame(BMessage* settings, BRect frame);

// The frame that the settings name: 400 by 150 at (0, 0), but for the fields that are there. A frame that
// does not lie on the screen as a whole is replaced by (0, 0, 400, 150).
BRect WindowFrameOf(const BMessage& settings, BRect screen);
