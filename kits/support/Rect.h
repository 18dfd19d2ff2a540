// BRect: a rectangle of pixels.
#pragma once

#include <Point.h>

// A plain value. All four edges belong to the rectangle: (0, 0, 15, 15) is sixteen pixels wide though its
// Width() is 15. It is valid when left <= right and top <= bottom; the default one, (0, 0, -1, -1), is not
// and holds nothing.
class BRect {
  public:
    constexpr BRect() = default;
    constexpr BRect(float rectLeft, float rectTop, float rectRight, float rectBottom)
        : left(rectLeft), top(rectTop), right(rectRight), bottom(rectBottom) {}
    constexpr BRect(BPoint leftTop, BPoint rightBottom)
        : left(leftTop.x), top(leftTop.y), right(rightBottom.x), bottom(rightBottom.y) {}

    void Set(float newLeft, float newTop, float newRight, float newBottom) {
        left = newLeft;
        top = newTop;
        right = newRight;
        bottom = newBottom;
    }
    // Prints "BRect(l:..., t:..., r:..., b:...)" on standard output.
    void PrintToStream() const;

    constexpr BPoint LeftTop() const { return {left, top}; }
    constexpr BPoint RightBottom() const { return {right, bottom}; }
    constexpr BPoint LeftBottom() const { return {left, bottom}; }
    constexpr BPoint RightTop() const { return {right, top}; }

    // Move one corner; the opposite one stays.
    void SetLeftTop(const BPoint& point);
    void SetRightBottom(const BPoint& point);
    void SetLeftBottom(const BPoint& point);
    void SetRightTop(const BPoint& point);

    // Move the edges inwards (outwards when negative).
    void InsetBy(BPoint delta) { InsetBy(delta.x, delta.y); }
    void InsetBy(float dx, float dy);
    BRect& InsetBySelf(BPoint delta);
    BRect& InsetBySelf(float dx, float dy);
    BRect InsetByCopy(BPoint delta) const;
    BRect InsetByCopy(float dx, float dy) const;

    // Move the whole rectangle.
    void OffsetBy(BPoint delta) { OffsetBy(delta.x, delta.y); }
    void OffsetBy(float dx, float dy);
    BRect& OffsetBySelf(BPoint delta);
    BRect& OffsetBySelf(float dx, float dy);
    BRect OffsetByCopy(BPoint delta) const;
    BRect OffsetByCopy(float dx, float dy) const;

    // Move the left top corner to the point and keep the size.
    void OffsetTo(BPoint point) { OffsetTo(point.x, point.y); }
    void OffsetTo(float newLeft, float newTop);
    BRect& OffsetToSelf(BPoint point);
    BRect& OffsetToSelf(float newLeft, float newTop);
    BRect OffsetToCopy(BPoint point) const;
    BRect OffsetToCopy(float newLeft, float newTop) const;

    constexpr bool operator==(const BRect& other) const {
        return left == other.left && top == other.top && right == other.right && bottom == other.bottom;
    }
    constexpr bool operator!=(const BRect& other) const { return !(*this == other); }

    // The common part (not valid when there is none), and the smallest rectangle around both.
    BRect operator&(const BRect& other) const;
    BRect operator|(const BRect& other) const;

    constexpr bool IsValid() const { return left <= right && top <= bottom; }
    // The distance between the edges, one less than the number of pixels.
    constexpr float Width() const { return right - left; }
    constexpr float Height() const { return bottom - top; }
    // The same, rounded up to whole pixels.
    int32 IntegerWidth() const;
    int32 IntegerHeight() const;

    // Whether the two have a point in common, edges included. False when either is not valid.
    bool Intersects(const BRect& other) const;
    bool Contains(const BPoint& point) const;
    bool Contains(const BRect& other) const;

    float left = 0;
    float top = 0;
    float right = -1;
    float bottom = -1;
};
