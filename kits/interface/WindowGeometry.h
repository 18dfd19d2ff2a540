// WindowGeometry: a window's frame, its limits, and what zooming makes of it.
#pragma once

#include <Rect.h>

#include <optional>
#include <vector>

// Arithmetic alone. Frames are those of the content, on whole pixels. One thread at a time.
class WindowGeometry {
  public:
    explicit WindowGeometry(BRect frame);

    const BRect& Frame() const { return mFrame; }
    BRect Bounds() const { return mFrame.OffsetToCopy(B_ORIGIN); }
    void MoveTo(BPoint leftTop);
    // Within the limits.
    void ResizeTo(float width, float height);
    // As the desktop has made it, whatever the limits are.
    void Accept(BRect frame);

    // As they were set; no frame is larger than 32767, whatever the limits say.
    struct Limits {
        float minWidth = 0;
        float maxWidth = 32767;
        float minHeight = 0;
        float maxHeight = 32767;
    };
    // Limits that contradict each other give way to the minima. Does not change the frame.
    void SetLimits(const Limits& limits);
    const Limits& SizeLimits() const { return mLimits; }
    void SetZoomLimits(float maxWidth, float maxHeight);
    bool HasZoomLimits() const { return mZoomWidth > 0; }
    float ZoomWidth() const { return mZoomWidth; }
    float ZoomHeight() const { return mZoomHeight; }

    // What lies around the content, in pixels.
    struct Margins {
        float left = 0;
        float top = 0;
        float right = 0;
        float bottom = 0;
        bool operator==(const Margins&) const = default;
    };
    // Where a frame has to go so that its title, which lies above it, can be got hold of on one of the
    // screens (their `usable` parts; the first one is the frame's own): as little lower as that takes.
    // Unchanged while enough of the title shows, so that frames that were saved stay as they are.
    static BRect WithTitleInReach(BRect frame, const Margins& margins, const std::vector<BRect>& usable);
    // The frame that a zoom leads to: the largest within the limits and, with its margins, on the `usable`
    // part of the screen, moved no further than needed. From there, back to the frame before.
    BRect Zoomed(const BRect& usable, const Margins& margins);

  private:
    BRect mFrame;
    Limits mLimits;
    float mZoomWidth = 0;
    float mZoomHeight = 0;
    std::optional<BRect> mBeforeZoom;
    BRect mZoomedTo;
};
