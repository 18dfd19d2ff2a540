// UpdateRegions: what of a window has to be drawn again, and what has been drawn but not been shown.
#pragma once

#include <Region.h>

#include <vector>

// Bookkeeping alone, in logical pixels of the window's content; draws nothing. One thread at a time.
class UpdateRegions {
  public:
    void Damage(const BRegion& region);
    bool IsDamaged() const { return !mDamage.IsEmpty(); }
    const BRegion& Damaged() const { return mDamage; }
    // Hands the damage over; there is none afterwards.
    BRegion TakeDamage();
    // The pixels of `area` have moved by this distance, as far as they stayed within it. Returns where moved
    // pixels lie now. What came into view, and what damaged pixels were moved to, is damaged.
    BRegion Scrolled(const BRegion& area, int32 dx, int32 dy);

    void Drawn(const clipping_rect& rect);
    bool HasDrawn() const { return !mDrawn.empty(); }
    // A few rectangles, overlapping perhaps, that cover everything drawn since the last call.
    std::vector<clipping_rect> TakeDrawn();

  private:
    BRegion mDamage;
    std::vector<clipping_rect> mDrawn;
};
