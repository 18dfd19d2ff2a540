#include "gui/ColumnListView/BetterScrollView.h"

#include "gui/ColumnListView/ScrollExtent.h"
#include "gui/ColumnListView/ScrollViewCorner.h"

#include <ScrollBar.h>

#include <algorithm>

namespace {

// What a button scrolls to the side; a click beside the thumb leaves as much of the page before.
constexpr float kHorizontalStep = 15;

constexpr BRect kNotSet(-1, -1, -1, -1);
constexpr rgb_color kCornerOfScrollable = {216, 216, 216, 255};
constexpr rgb_color kCornerOfUnscrollable = {240, 240, 240, 255};

ScrollExtent AcrossOf(BRect shown, BRect data) {
    return {shown.left, shown.right, data.left, data.right};
}

ScrollExtent DownOf(BRect shown, BRect data) {
    return {shown.top, shown.bottom, data.top, data.bottom};
}

// Whether there is anything to scroll.
bool Apply(BScrollBar* bar, const ScrollBarState& state) {
    if (bar == nullptr) {
        return false;
    }
    bar->SetRange(state.min, state.max);
    bar->SetProportion(state.proportion);
    return state.IsScrollable();
}

} // namespace

BetterScrollView::BetterScrollView(const char* name, BView* target, uint32 resizing_mode, uint32 flags,
                                   bool horizontal, bool vertical, bool scroll_view_corner,
                                   border_style border)
    : BScrollView(name, target, resizing_mode, flags, horizontal, vertical, border) {
    if (scroll_view_corner && horizontal && vertical) {
        mScrollViewCorner =
            new ScrollViewCorner(ScrollBar(B_VERTICAL)->Frame().left, ScrollBar(B_HORIZONTAL)->Frame().top);
        AddChild(mScrollViewCorner);
    }
}

void BetterScrollView::SetDataRect(BRect data_rect, bool scrolling_allowed) {
    mDataRect = data_rect;
    UpdateScrollBars(scrolling_allowed);
}

void BetterScrollView::FrameResized(float new_width, float new_height) {
    BScrollView::FrameResized(new_width, new_height);
    UpdateScrollBars(true);
}

void BetterScrollView::UpdateScrollBars(bool scrolling_allowed) {
    BView* const target = Target();
    if (target == nullptr || mDataRect == kNotSet) {
        return;
    }
    BScrollBar* const horizontal = ScrollBar(B_HORIZONTAL);
    BScrollBar* const vertical = ScrollBar(B_VERTICAL);
    BRect shown = target->Bounds();
    if (scrolling_allowed) {
        const float dx = horizontal == nullptr ? 0 : ScrollBackOffset(AcrossOf(shown, mDataRect));
        const float dy = vertical == nullptr ? 0 : ScrollBackOffset(DownOf(shown, mDataRect));
        if (dx != 0 || dy != 0) {
            target->ScrollTo(shown.LeftTop() + BPoint(dx, dy));
            shown = target->Bounds();
        }
    }
    const bool across = Apply(horizontal, BarStateOf(AcrossOf(shown, mDataRect), scrolling_allowed));
    const bool down = Apply(vertical, BarStateOf(DownOf(shown, mDataRect), scrolling_allowed));
    if (horizontal != nullptr) {
        horizontal->SetSteps(kHorizontalStep, std::max(kHorizontalStep, shown.Width() - kHorizontalStep));
    }
    UpdateCorner(across || down);
}

void BetterScrollView::UpdateCorner(bool scrollable) {
    const rgb_color color = scrollable ? kCornerOfScrollable : kCornerOfUnscrollable;
    if (mScrollViewCorner != nullptr && mScrollViewCorner->ViewColor() != color) {
        mScrollViewCorner->SetViewColor(color);
        mScrollViewCorner->Invalidate();
    }
}
