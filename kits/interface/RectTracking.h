// RectTracking: the outline that follows the pointer over a window (BView::BeginRectTracking()).
#pragma once

#include "PixelSurface.h"

#include <Rect.h>

#include <vector>

// Knows where the outline is and turns its pixels over; all in logical pixels of one surface. One thread at a
// time.
class RectTracking {
  public:
    // `style` is one of B_TRACK_WHOLE_RECT and B_TRACK_RECT_CORNER.
    void Begin(BRect rect, uint32 style, BPoint pointer);
    void End() { mActive = false; }
    bool IsActive() const { return mActive; }
    // True when the outline has moved.
    bool PointerAt(BPoint pointer);
    BRect Rect() const { return mRect; }
    // The four sides, one pixel wide, as far as they lie within `bounds`, without overlapping.
    std::vector<clipping_rect> Sides(const clipping_rect& bounds) const;
    // Called twice it leaves the surface as it was.
    void InvertOutline(const PixelSurface& surface) const;

  private:
    bool mActive = false;
    bool mMovesWhole = true;
    BRect mStart;
    BRect mRect;
    BPoint mPointerAtStart;
};
