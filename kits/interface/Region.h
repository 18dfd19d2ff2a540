// BRegion: a set of pixels, kept as rectangles.
#pragma once

#include <Rect.h>

#include <vector>

// Whole pixels; all four edges belong to it, as with BRect.
typedef struct clipping_rect {
    int32 left;
    int32 top;
    int32 right;
    int32 bottom;

    bool operator==(const clipping_rect& other) const {
        return left == other.left && top == other.top && right == other.right && bottom == other.bottom;
    }
    bool IsValid() const { return left <= right && top <= bottom; }
} clipping_rect;

// A plain value. The rectangles are canonical: equal sets have equal lists. They are sorted into bands of
// equal top and bottom from the top down, within a band from the left, never touch sideways, and bands are as
// tall as can be. Fractional rectangles count as the smallest whole one around them; coordinates are kept
// within +-2^30, and rectangles that are not valid or not numbers count as empty.
class BRegion {
  public:
    BRegion() = default;
    BRegion(const BRegion& other) = default;
    BRegion(BRegion&& other) noexcept = default;
    explicit BRegion(const BRect& rect);
    explicit BRegion(const clipping_rect& rect);
    virtual ~BRegion();

    BRegion& operator=(const BRegion& other) = default;
    BRegion& operator=(BRegion&& other) noexcept = default;
    bool operator==(const BRegion& other) const { return mRects == other.mRects; }
    bool operator!=(const BRegion& other) const { return !(*this == other); }

    void Set(BRect rect);
    void Set(clipping_rect rect);

    // The smallest rectangle around everything; not valid (0, 0, -1, -1) for an empty region.
    BRect Frame() const;
    clipping_rect FrameInt() const;

    // A not valid rectangle for an index out of range.
    BRect RectAt(int32 index) const;
    clipping_rect RectAtInt(int32 index) const;
    int32 CountRects() const;
    bool IsEmpty() const { return mRects.empty(); }

    bool Intersects(BRect rect) const;
    bool Intersects(clipping_rect rect) const;
    bool Contains(BPoint point) const;
    bool Contains(int32 x, int32 y) const;

    void PrintToStream() const;

    void OffsetBy(int32 dx, int32 dy);
    void MakeEmpty();

    void Include(BRect rect);
    void Include(clipping_rect rect);
    void Include(const BRegion* other);
    void Exclude(BRect rect);
    void Exclude(clipping_rect rect);
    void Exclude(const BRegion* other);
    void IntersectWith(const BRegion* other);

    // For walking all rectangles in order.
    const std::vector<clipping_rect>& Rects() const { return mRects; }

  private:
    friend class RegionBuilder;
    std::vector<clipping_rect> mRects;
};

// The smallest whole rectangle around it, or a not valid one.
clipping_rect to_clipping_rect(const BRect& rect);
BRect to_rect(const clipping_rect& rect);
clipping_rect intersection(const clipping_rect& a, const clipping_rect& b);

inline constexpr clipping_rect kEmptyClippingRect = {0, 0, -1, -1};
// Coordinates beyond this are pulled in, so that sums of two never overflow.
inline constexpr int32 kMaxRegionCoordinate = 1 << 30;
