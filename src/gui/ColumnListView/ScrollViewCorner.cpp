#include "gui/ColumnListView/ScrollViewCorner.h"

#include <ScrollBar.h>

namespace {

constexpr float kSide = B_V_SCROLL_BAR_WIDTH;

} // namespace

ScrollViewCorner::ScrollViewCorner(float left, float top)
    : BView(BRect(left, top, left + kSide, top + B_H_SCROLL_BAR_HEIGHT), nullptr,
            B_FOLLOW_RIGHT | B_FOLLOW_BOTTOM, B_WILL_DRAW) {
    SetHighColor(152, 152, 152);
    SetViewColor(127, 127, 127);
}

void ScrollViewCorner::Draw(BRect update_rect) {
    if (update_rect.bottom >= kSide) {
        StrokeLine(BPoint(0, kSide), BPoint(kSide, kSide));
    }
    if (update_rect.right >= kSide) {
        StrokeLine(BPoint(kSide, 0), BPoint(kSide, kSide - 1));
    }
}
