#include "DrawingState.h"

#include "Shapes.h"

DrawingState DrawingState::Pushed() const {
    DrawingState next = *this;
    next.baseOrigin = ToView(B_ORIGIN);
    next.baseScale = CombinedScale();
    next.origin = B_ORIGIN;
    next.scale = 1.0F;
    next.baseClip = CombinedClip();
    next.clip.reset();
    return next;
}

BPoint DrawingState::ToView(BPoint drawing) const {
    const float combined = CombinedScale();
    return {baseOrigin.x + origin.x * baseScale + drawing.x * combined,
            baseOrigin.y + origin.y * baseScale + drawing.y * combined};
}

BRect DrawingState::ToView(const BRect& drawing) const {
    return {ToView(drawing.LeftTop()), ToView(drawing.RightBottom())};
}

BPoint DrawingState::FromView(BPoint view) const {
    const BPoint start = ToView(B_ORIGIN);
    const float combined = CombinedScale();
    return combined == 0 ? B_ORIGIN : BPoint((view.x - start.x) / combined, (view.y - start.y) / combined);
}

BRegion DrawingState::ToView(const BRegion& drawing) const {
    const BPoint start = ToView(B_ORIGIN);
    BRegion region;
    if (CombinedScale() == 1.0F) {
        region = drawing;
        region.OffsetBy(to_pixel_coordinate(start.x), to_pixel_coordinate(start.y));
        return region;
    }
    for (const clipping_rect& rect : drawing.Rects()) {
        region.Include(ToView(to_rect(rect)));
    }
    return region;
}

std::optional<BRegion> DrawingState::CombinedClip() const {
    if (!clip) {
        return baseClip;
    }
    BRegion combined = *clip;
    if (baseClip) {
        combined.IntersectWith(&*baseClip);
    }
    return combined;
}
