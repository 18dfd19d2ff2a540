#include "ScrollBarLayout.h"

#include <algorithm>
#include <cmath>

namespace {

constexpr int32 kLeastThumb = 10;

} // namespace

int32 ScrollBarLayout::ButtonLength() const {
    return std::max(0, std::min(breadth, length / 2));
}

int32 ScrollBarLayout::TroughLength() const {
    return std::max(0, length - 2 * ButtonLength());
}

int32 ScrollBarLayout::ThumbLength() const {
    const int32 trough = TroughLength();
    if (!CanScroll() || trough <= kLeastThumb) {
        return 0;
    }
    const float share = std::clamp(proportion, 0.0F, 1.0F);
    // A bar that can scroll leaves its thumb a pixel to move, whatever the proportion says.
    return std::clamp(static_cast<int32>(std::lround(share * static_cast<float>(trough))), kLeastThumb,
                      trough - 1);
}

int32 ScrollBarLayout::ThumbStart() const {
    const int32 way = TroughLength() - ThumbLength();
    if (!CanScroll()) {
        return TroughStart();
    }
    const double part = (static_cast<double>(value) - min) / (static_cast<double>(max) - min);
    return TroughStart() + static_cast<int32>(std::lround(std::clamp(part, 0.0, 1.0) * way));
}

float ScrollBarLayout::ValueForThumbAt(int32 start) const {
    const int32 way = TroughLength() - ThumbLength();
    if (!CanScroll() || way <= 0) {
        return min;
    }
    const double part = static_cast<double>(std::clamp(start - TroughStart(), 0, way)) / way;
    return std::round(static_cast<float>(min + part * (static_cast<double>(max) - min)));
}

ScrollBarLayout::Part ScrollBarLayout::PartAt(int32 position) const {
    if (position < 0 || position >= length) {
        return Part::None;
    }
    if (position < TroughStart()) {
        return Part::LessButton;
    }
    if (position >= TroughStart() + TroughLength()) {
        return Part::MoreButton;
    }
    if (ThumbLength() == 0) {
        return Part::None;
    }
    if (position < ThumbStart()) {
        return Part::TroughBefore;
    }
    return position < ThumbStart() + ThumbLength() ? Part::Thumb : Part::TroughBehind;
}

bool ScrollBarLayout::LooksLike(const ScrollBarLayout& other) const {
    return length == other.length && breadth == other.breadth && CanScroll() == other.CanScroll() &&
           ThumbStart() == other.ThumbStart() && ThumbLength() == other.ThumbLength();
}
