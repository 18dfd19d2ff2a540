// BetterScrollView: a scroll view that is told how far its content reaches.
#pragma once

#include <ScrollView.h>

class ScrollViewCorner;

// Its bars follow a data rectangle, in the target's coordinates, instead of the target's own size. Thread
// rule: that of BView.
class BetterScrollView : public BScrollView {
  public:
    // `scroll_view_corner` fills the square between the bars; needs both of them.
    BetterScrollView(const char* name, BView* target, uint32 resizing_mode, uint32 flags, bool horizontal,
                     bool vertical, bool scroll_view_corner, border_style border);

    // With `scrolling_allowed` the target is scrolled back where it would show what lies beyond the data;
    // without, the bars reach as far as what it shows.
    virtual void SetDataRect(BRect data_rect, bool scrolling_allowed = true);
    // (-1, -1, -1, -1) until it is set; till then nothing is scrolled.
    BRect GetDataRect() const { return mDataRect; }
    void FrameResized(float new_width, float new_height) override;

  private:
    void UpdateScrollBars(bool scrolling_allowed);
    void UpdateCorner(bool scrollable);

    BRect mDataRect = BRect(-1, -1, -1, -1);
    // Null when there is none; the view's child.
    ScrollViewCorner* mScrollViewCorner = nullptr;
};
