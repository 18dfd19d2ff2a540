#include <Region.h>

#include "RegionBuilder.h"

#include <algorithm>
#include <cmath>
#include <stdio.h>

namespace {

int32 Whole(double value) {
    constexpr double kLimit = kMaxRegionCoordinate;
    return static_cast<int32>(std::clamp(value, -kLimit, kLimit));
}

clipping_rect Limited(clipping_rect rect) {
    if (!rect.IsValid()) {
        return kEmptyClippingRect;
    }
    for (int32* edge : {&rect.left, &rect.top, &rect.right, &rect.bottom}) {
        *edge = std::clamp(*edge, -kMaxRegionCoordinate, kMaxRegionCoordinate);
    }
    return rect;
}

std::vector<clipping_rect> ListOf(const clipping_rect& rect) {
    const clipping_rect limited = Limited(rect);
    return limited.IsValid() ? std::vector<clipping_rect>{limited} : std::vector<clipping_rect>();
}

} // namespace

clipping_rect to_clipping_rect(const BRect& rect) {
    // Written so that a NaN on any edge is not valid.
    if (!(rect.left <= rect.right && rect.top <= rect.bottom)) {
        return kEmptyClippingRect;
    }
    return {Whole(std::floor(rect.left)), Whole(std::floor(rect.top)), Whole(std::ceil(rect.right)),
            Whole(std::ceil(rect.bottom))};
}

BRect to_rect(const clipping_rect& rect) {
    return {static_cast<float>(rect.left), static_cast<float>(rect.top), static_cast<float>(rect.right),
            static_cast<float>(rect.bottom)};
}

clipping_rect intersection(const clipping_rect& a, const clipping_rect& b) {
    const clipping_rect common = {std::max(a.left, b.left), std::max(a.top, b.top),
                                  std::min(a.right, b.right), std::min(a.bottom, b.bottom)};
    return common.IsValid() && a.IsValid() && b.IsValid() ? common : kEmptyClippingRect;
}

BRegion::BRegion(const BRect& rect) : mRects(ListOf(to_clipping_rect(rect))) {}

BRegion::BRegion(const clipping_rect& rect) : mRects(ListOf(rect)) {}

BRegion::~BRegion() = default;

void BRegion::Set(BRect rect) {
    Set(to_clipping_rect(rect));
}

void BRegion::Set(clipping_rect rect) {
    mRects = ListOf(rect);
}

BRect BRegion::Frame() const {
    return to_rect(FrameInt());
}

clipping_rect BRegion::FrameInt() const {
    if (mRects.empty()) {
        return kEmptyClippingRect;
    }
    clipping_rect frame = {mRects.front().left, mRects.front().top, mRects.front().right,
                           mRects.back().bottom};
    for (const clipping_rect& rect : mRects) {
        frame.left = std::min(frame.left, rect.left);
        frame.right = std::max(frame.right, rect.right);
    }
    return frame;
}

BRect BRegion::RectAt(int32 index) const {
    return to_rect(RectAtInt(index));
}

clipping_rect BRegion::RectAtInt(int32 index) const {
    if (index < 0 || index >= CountRects()) {
        return kEmptyClippingRect;
    }
    return mRects[static_cast<size_t>(index)];
}

int32 BRegion::CountRects() const {
    return static_cast<int32>(mRects.size());
}

bool BRegion::Intersects(BRect rect) const {
    return Intersects(to_clipping_rect(rect));
}

bool BRegion::Intersects(clipping_rect rect) const {
    return std::any_of(mRects.begin(), mRects.end(),
                       [&](const clipping_rect& own) { return intersection(own, rect).IsValid(); });
}

bool BRegion::Contains(BPoint point) const {
    if (std::isnan(point.x) || std::isnan(point.y)) {
        return false;
    }
    return Contains(Whole(std::floor(point.x)), Whole(std::floor(point.y)));
}

bool BRegion::Contains(int32 x, int32 y) const {
    return std::any_of(mRects.begin(), mRects.end(), [&](const clipping_rect& rect) {
        return x >= rect.left && x <= rect.right && y >= rect.top && y <= rect.bottom;
    });
}

void BRegion::PrintToStream() const {
    to_rect(FrameInt()).PrintToStream();
    for (const clipping_rect& rect : mRects) {
        printf("clipping_rect(l:%d, t:%d, r:%d, b:%d)\n", rect.left, rect.top, rect.right, rect.bottom);
    }
}

void BRegion::OffsetBy(int32 dx, int32 dy) {
    if (dx == 0 && dy == 0) {
        return;
    }
    const auto moved = [](int32 value, int32 by) {
        return static_cast<int32>(
            std::clamp<int64>(static_cast<int64>(value) + by, -kMaxRegionCoordinate, kMaxRegionCoordinate));
    };
    const clipping_rect frame = FrameInt();
    for (clipping_rect& rect : mRects) {
        rect = {moved(rect.left, dx), moved(rect.top, dy), moved(rect.right, dx), moved(rect.bottom, dy)};
    }
    const clipping_rect now = FrameInt();
    if (now.right - now.left != frame.right - frame.left ||
        now.bottom - now.top != frame.bottom - frame.top) {
        // Pushed against the limit of coordinates, where rectangles may have collapsed onto each other.
        std::vector<clipping_rect> pushed;
        pushed.swap(mRects);
        for (const clipping_rect& rect : pushed) {
            Include(rect);
        }
    }
}

void BRegion::MakeEmpty() {
    mRects.clear();
}

void BRegion::Include(BRect rect) {
    Include(to_clipping_rect(rect));
}

void BRegion::Include(clipping_rect rect) {
    mRects = RegionBuilder::Union(mRects, ListOf(rect));
}

void BRegion::Include(const BRegion* other) {
    mRects = RegionBuilder::Union(mRects, other->mRects);
}

void BRegion::Exclude(BRect rect) {
    Exclude(to_clipping_rect(rect));
}

void BRegion::Exclude(clipping_rect rect) {
    mRects = RegionBuilder::Difference(mRects, ListOf(rect));
}

void BRegion::Exclude(const BRegion* other) {
    mRects = RegionBuilder::Difference(mRects, other->mRects);
}

void BRegion::IntersectWith(const BRegion* other) {
    // The common case, a clip that lies within its view: nothing is cut off, nothing need be built.
    if (const clipping_rect frame = FrameInt();
        other->mRects.size() == 1 && intersection(other->mRects.front(), frame) == frame) {
        return;
    }
    mRects = RegionBuilder::Intersection(mRects, other->mRects);
}
