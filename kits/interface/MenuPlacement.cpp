#include "MenuPlacement.h"

#include <algorithm>

namespace {

struct Span {
    float start;
    float length;
};

// Moved into the span that there is, cut where it is longer.
Span Fitted(Span wanted, float low, float high) {
    const float length = std::min(wanted.length, high - low);
    return {std::clamp(wanted.start, low, high - length), length};
}

BRect OnScreen(float left, float top, float width, float height, BRect screen) {
    const Span vertical = Fitted({top, height}, screen.top, screen.bottom);
    // A menu that is too wide keeps its width: it cannot be scrolled sideways.
    const float fittedLeft = std::max(std::min(left, screen.right - width), screen.left);
    return {fittedLeft, vertical.start, fittedLeft + width, vertical.start + vertical.length};
}

// Twice the area of the triangle, positive when its corners run clockwise on the screen.
float Turn(BPoint a, BPoint b, BPoint c) {
    return (b.x - a.x) * (c.y - a.y) - (b.y - a.y) * (c.x - a.x);
}

} // namespace

BRect pop_up_frame(BPoint where, float width, float height, BRect screen) {
    return OnScreen(where.x, where.y, width, height, screen);
}

BRect frame_below_item(BRect item, float width, float height, BRect screen) {
    const float below = item.bottom + 1;
    const float above = item.top - 1 - height;
    const bool fitsBelow = below + height <= screen.bottom;
    const bool fitsAbove = above >= screen.top;
    return OnScreen(item.left, fitsBelow || !fitsAbove ? below : above, width, height, screen);
}

BRect frame_beside_item(BRect item, float width, float height, float firstItemOffset, BRect screen) {
    const float right = item.right + 1;
    const float left = item.left - 1 - width;
    const bool fitsRight = right + width <= screen.right;
    const bool fitsLeft = left >= screen.left;
    return OnScreen(fitsRight || !fitsLeft ? right : left, item.top - firstItemOffset, width, height, screen);
}

bool makes_for_menu(BPoint from, BPoint to, BRect menu) {
    // The new point lies in the triangle of the old point and the near edge of the menu, a few pixels taller
    // than the edge so that a hand that is not quite steady is forgiven.
    constexpr float kSlack = 4;
    const bool toTheRight = from.x < menu.left;
    if (!toTheRight && from.x <= menu.right) {
        return false;
    }
    const float edge = toTheRight ? menu.left : menu.right;
    if ((toTheRight && to.x <= from.x) || (!toTheRight && to.x >= from.x)) {
        return false;
    }
    const BPoint top(edge, menu.top - kSlack);
    const BPoint bottom(edge, menu.bottom + kSlack);
    const float first = Turn(from, top, to);
    const float second = Turn(from, bottom, to);
    return toTheRight ? first >= 0 && second <= 0 : first <= 0 && second >= 0;
}
