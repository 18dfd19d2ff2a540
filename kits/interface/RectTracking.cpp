#include "RectTracking.h"

#include <View.h>

#include <algorithm>
#include <cmath>

void RectTracking::Begin(BRect rect, uint32 style, BPoint pointer) {
    mActive = true;
    mMovesWhole = style != B_TRACK_RECT_CORNER;
    mStart = rect;
    mRect = rect;
    mPointerAtStart = pointer;
}

bool RectTracking::PointerAt(BPoint pointer) {
    if (!mActive) {
        return false;
    }
    const BRect before = mRect;
    if (mMovesWhole) {
        mRect = mStart.OffsetByCopy(pointer - mPointerAtStart);
    } else {
        // Beyond the fixed corner the rectangle opens to the other side.
        mRect = BRect(std::min(mStart.left, pointer.x), std::min(mStart.top, pointer.y),
                      std::max(mStart.left, pointer.x), std::max(mStart.top, pointer.y));
    }
    return mRect != before;
}

std::vector<clipping_rect> RectTracking::Sides(const clipping_rect& bounds) const {
    const auto whole = [](float value) { return static_cast<int32>(std::lround(value)); };
    const int32 left = whole(mRect.left);
    const int32 top = whole(mRect.top);
    const int32 right = whole(mRect.right);
    const int32 bottom = whole(mRect.bottom);
    const clipping_rect all[] = {{left, top, right, top},
                                 {left, bottom, right, bottom},
                                 {left, top + 1, left, bottom - 1},
                                 {right, top + 1, right, bottom - 1}};
    std::vector<clipping_rect> sides;
    for (size_t i = 0; i < std::size(all); ++i) {
        const clipping_rect side{std::max(all[i].left, bounds.left), std::max(all[i].top, bounds.top),
                                 std::min(all[i].right, bounds.right),
                                 std::min(all[i].bottom, bounds.bottom)};
        const bool repeats = (i == 1 && top == bottom) || (i == 3 && left == right);
        if (side.left <= side.right && side.top <= side.bottom && !repeats) {
            sides.push_back(side);
        }
    }
    return sides;
}

void RectTracking::InvertOutline(const PixelSurface& surface) const {
    for (const clipping_rect& side : Sides(surface.LogicalBounds())) {
        const clipping_rect device = surface.ToDevice(side);
        for (int32 y = device.top; y <= device.bottom; ++y) {
            auto* const row = reinterpret_cast<uint32*>(surface.Row(y));
            for (int32 x = device.left; x <= device.right; ++x) {
                row[x] ^= 0x00FFFFFFU;
            }
        }
    }
}
