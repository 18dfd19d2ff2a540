// ScrollBarLayout: where the parts of a scroll bar lie.
#pragma once

#include <SupportDefs.h>

// Positions are whole pixels along the bar, 0 its first one. From the start: a button, the trough in which
// the thumb moves, a button. A plain value that draws nothing.
struct ScrollBarLayout {
    enum class Part { None, LessButton, TroughBefore, Thumb, TroughBehind, MoreButton };

    int32 length = 0;  // of the bar
    int32 breadth = 0; // across it; the buttons are square while there is room
    float min = 0;
    float max = 0;
    float value = 0;
    // The share of the whole that can be seen; 1 and more fill the trough.
    float proportion = 1;

    bool CanScroll() const { return max > min; }
    int32 ButtonLength() const;
    int32 TroughStart() const { return ButtonLength(); }
    int32 TroughLength() const;
    // 0 when there is nothing to scroll, or no room.
    int32 ThumbLength() const;
    int32 ThumbStart() const;
    // The whole value at which the thumb would begin there.
    float ValueForThumbAt(int32 start) const;
    Part PartAt(int32 position) const;
    // No part of it is drawn otherwise.
    bool LooksLike(const ScrollBarLayout& other) const;
};
