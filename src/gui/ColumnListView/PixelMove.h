// What is done to a view's pixels when a column in it gets another width. Draws nothing and needs no window.
#pragma once

#include <Rect.h>

struct PixelMove {
    // Both of one size, within the view; invalid when nothing can be moved.
    BRect source = BRect(0, 0, -1, -1);
    BRect target = BRect(0, 0, -1, -1);
    // To be drawn anew; invalid when there is nothing.
    BRect exposed = BRect(0, 0, -1, -1);
    BRect rightEdge = BRect(0, 0, -1, -1);
};

// `bounds` is what the view shows, `oldEnd` the column's right edge before, which belongs to it. What lies
// right of it moves by `growth` pixels, except for the view's last column of pixels: a frame that a list
// draws around a row ends there. Parts of pixels cannot be moved.
PixelMove PixelMoveFor(BRect bounds, float oldEnd, float growth);
