#include "UpdateRegions.h"

#include <algorithm>
#include <utility>

namespace {

// With more pieces, keeping them apart costs more than drawing what lies between them.
constexpr int32 kMaxDamagePieces = 128;
constexpr size_t kMaxDrawnRects = 24;

bool Covers(const clipping_rect& outer, const clipping_rect& inner) {
    return outer.left <= inner.left && outer.top <= inner.top && outer.right >= inner.right &&
           outer.bottom >= inner.bottom;
}

clipping_rect Around(const clipping_rect& a, const clipping_rect& b) {
    return {std::min(a.left, b.left), std::min(a.top, b.top), std::max(a.right, b.right),
            std::max(a.bottom, b.bottom)};
}

} // namespace

void UpdateRegions::Damage(const BRegion& region) {
    mDamage.Include(&region);
    if (mDamage.CountRects() > kMaxDamagePieces) {
        mDamage = BRegion(mDamage.FrameInt());
    }
}

BRegion UpdateRegions::TakeDamage() {
    return std::exchange(mDamage, BRegion());
}

BRegion UpdateRegions::Scrolled(const BRegion& area, int32 dx, int32 dy) {
    BRegion moved = area;
    moved.OffsetBy(dx, dy);
    moved.IntersectWith(&area);
    BRegion stale = mDamage;
    stale.IntersectWith(&area);
    stale.OffsetBy(dx, dy);
    stale.IntersectWith(&area);
    BRegion uncovered = area;
    uncovered.Exclude(&moved);
    mDamage.Exclude(&area);
    Damage(stale);
    Damage(uncovered);
    return moved;
}

void UpdateRegions::Drawn(const clipping_rect& rect) {
    if (!rect.IsValid()) {
        return;
    }
    for (const clipping_rect& known : mDrawn) {
        if (Covers(known, rect)) {
            return;
        }
    }
    if (!mDrawn.empty() && Covers(rect, mDrawn.back())) {
        mDrawn.back() = rect;
        return;
    }
    mDrawn.push_back(rect);
    if (mDrawn.size() > kMaxDrawnRects) {
        clipping_rect all = mDrawn.front();
        for (const clipping_rect& known : mDrawn) {
            all = Around(all, known);
        }
        mDrawn.assign(1, all);
    }
}

std::vector<clipping_rect> UpdateRegions::TakeDrawn() {
    return std::exchange(mDrawn, {});
}
