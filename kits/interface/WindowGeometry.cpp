#include "WindowGeometry.h"

#include <algorithm>
#include <cmath>

namespace {

constexpr float kLargest = 32767;

BRect Whole(const BRect& rect) {
    const auto whole = [](float value) {
        return std::isfinite(value) ? std::clamp(std::round(value), -kLargest, kLargest) : 0.0F;
    };
    const float left = whole(rect.left);
    const float top = whole(rect.top);
    return {left, top, std::max(left, whole(rect.right)), std::max(top, whole(rect.bottom))};
}

} // namespace

WindowGeometry::WindowGeometry(BRect frame) : mFrame(Whole(frame)) {}

void WindowGeometry::MoveTo(BPoint leftTop) {
    mFrame = Whole(mFrame.OffsetToCopy(BPoint(std::round(leftTop.x), std::round(leftTop.y))));
}

void WindowGeometry::ResizeTo(float width, float height) {
    width = std::clamp(std::round(width), std::min(mLimits.minWidth, kLargest),
                       std::min(mLimits.maxWidth, kLargest));
    height = std::clamp(std::round(height), std::min(mLimits.minHeight, kLargest),
                        std::min(mLimits.maxHeight, kLargest));
    mFrame.right = mFrame.left + width;
    mFrame.bottom = mFrame.top + height;
}

void WindowGeometry::Accept(BRect frame) {
    mFrame = Whole(frame);
}

void WindowGeometry::SetLimits(const Limits& limits) {
    const auto whole = [](float value) { return std::max(0.0F, std::round(value)); };
    mLimits.minWidth = whole(limits.minWidth);
    mLimits.minHeight = whole(limits.minHeight);
    mLimits.maxWidth = std::max(mLimits.minWidth, whole(limits.maxWidth));
    mLimits.maxHeight = std::max(mLimits.minHeight, whole(limits.maxHeight));
}

void WindowGeometry::SetZoomLimits(float maxWidth, float maxHeight) {
    mZoomWidth = std::clamp(std::round(maxWidth), 1.0F, kLargest);
    mZoomHeight = std::clamp(std::round(maxHeight), 1.0F, kLargest);
}

BRect WindowGeometry::WithTitleInReach(BRect frame, const Margins& margins,
                                       const std::vector<BRect>& usable) {
    // As much of the title's height as a pointer can take hold of.
    constexpr float kHold = 8;
    // What is thinner is a border without a title.
    if (margins.top < kHold || usable.empty()) {
        return frame;
    }
    const BRect title(frame.left, frame.top - margins.top, frame.right, frame.top - 1);
    for (const BRect& screen : usable) {
        const BRect shown = title & screen;
        if (shown.IsValid() && shown.Height() + 1 >= kHold) {
            return frame;
        }
    }
    // One that lies beside or below all screens is not the title's matter.
    const bool isAbove = title.top < usable.front().top && frame.bottom >= usable.front().top;
    return isAbove ? frame.OffsetToCopy(frame.left, usable.front().top + margins.top) : frame;
}

BRect WindowGeometry::Zoomed(const BRect& usable, const Margins& margins) {
    if (mBeforeZoom && mFrame == mZoomedTo) {
        const BRect before = *mBeforeZoom;
        mBeforeZoom.reset();
        return before;
    }
    const BRect room(usable.left + margins.left, usable.top + margins.top, usable.right - margins.right,
                     usable.bottom - margins.bottom);
    const float widest = HasZoomLimits() ? std::min(mZoomWidth, mLimits.maxWidth) : mLimits.maxWidth;
    const float tallest = HasZoomLimits() ? std::min(mZoomHeight, mLimits.maxHeight) : mLimits.maxHeight;
    const float width = std::max(std::min(room.Width(), widest), mLimits.minWidth);
    const float height = std::max(std::min(room.Height(), tallest), mLimits.minHeight);
    const float left = std::max(std::min(mFrame.left, room.right - width), room.left);
    const float top = std::max(std::min(mFrame.top, room.bottom - height), room.top);
    mBeforeZoom = mFrame;
    mZoomedTo = BRect(left, top, left + width, top + height);
    return mZoomedTo;
}
