// What scroll bars show for a part of some content. Arithmetic alone.
#pragma once

// Along one axis, in the target's coordinates: what is shown, and the content. Sizes are right - left.
struct ScrollExtent {
    float shownFrom = 0;
    float shownTo = 0;
    float dataFrom = 0;
    float dataTo = 0;
};

struct ScrollBarState {
    float min = 0;
    float max = 0;
    float proportion = 1;

    bool IsScrollable() const { return proportion < 1; }
};

// How far the target is to be scrolled so that nothing beyond the content shows; 0 when it is in place.
float ScrollBackOffset(const ScrollExtent& extent);
// `scrolling_allowed`: the content counts as at least as large as what is shown; otherwise what is shown
// counts as content too.
ScrollBarState BarStateOf(const ScrollExtent& extent, bool scrolling_allowed);
