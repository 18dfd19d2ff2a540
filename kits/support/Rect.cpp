#include <Rect.h>

#include <algorithm>
#include <cmath>
#include <cstdio>

void BRect::PrintToStream() const {
    std::printf("BRect(l:%.1f, t:%.1f, r:%.1f, b:%.1f)\n", static_cast<double>(left),
                static_cast<double>(top), static_cast<double>(right), static_cast<double>(bottom));
}

void BRect::SetLeftTop(const BPoint& point) {
    left = point.x;
    top = point.y;
}

void BRect::SetRightBottom(const BPoint& point) {
    right = point.x;
    bottom = point.y;
}

void BRect::SetLeftBottom(const BPoint& point) {
    left = point.x;
    bottom = point.y;
}

void BRect::SetRightTop(const BPoint& point) {
    right = point.x;
    top = point.y;
}

void BRect::InsetBy(float dx, float dy) {
    left += dx;
    top += dy;
    right -= dx;
    bottom -= dy;
}

BRect& BRect::InsetBySelf(BPoint delta) {
    return InsetBySelf(delta.x, delta.y);
}

BRect& BRect::InsetBySelf(float dx, float dy) {
    InsetBy(dx, dy);
    return *this;
}

BRect BRect::InsetByCopy(BPoint delta) const {
    return InsetByCopy(delta.x, delta.y);
}

BRect BRect::InsetByCopy(float dx, float dy) const {
    BRect copy(*this);
    copy.InsetBy(dx, dy);
    return copy;
}

void BRect::OffsetBy(float dx, float dy) {
    left += dx;
    top += dy;
    right += dx;
    bottom += dy;
}

BRect& BRect::OffsetBySelf(BPoint delta) {
    return OffsetBySelf(delta.x, delta.y);
}

BRect& BRect::OffsetBySelf(float dx, float dy) {
    OffsetBy(dx, dy);
    return *this;
}

BRect BRect::OffsetByCopy(BPoint delta) const {
    return OffsetByCopy(delta.x, delta.y);
}

BRect BRect::OffsetByCopy(float dx, float dy) const {
    BRect copy(*this);
    copy.OffsetBy(dx, dy);
    return copy;
}

void BRect::OffsetTo(float newLeft, float newTop) {
    right = right - left + newLeft;
    bottom = bottom - top + newTop;
    left = newLeft;
    top = newTop;
}

BRect& BRect::OffsetToSelf(BPoint point) {
    return OffsetToSelf(point.x, point.y);
}

BRect& BRect::OffsetToSelf(float newLeft, float newTop) {
    OffsetTo(newLeft, newTop);
    return *this;
}

BRect BRect::OffsetToCopy(BPoint point) const {
    return OffsetToCopy(point.x, point.y);
}

BRect BRect::OffsetToCopy(float newLeft, float newTop) const {
    BRect copy(*this);
    copy.OffsetTo(newLeft, newTop);
    return copy;
}

BRect BRect::operator&(const BRect& other) const {
    return {std::max(left, other.left), std::max(top, other.top), std::min(right, other.right),
            std::min(bottom, other.bottom)};
}

BRect BRect::operator|(const BRect& other) const {
    return {std::min(left, other.left), std::min(top, other.top), std::max(right, other.right),
            std::max(bottom, other.bottom)};
}

int32 BRect::IntegerWidth() const {
    return static_cast<int32>(std::ceil(right - left));
}

int32 BRect::IntegerHeight() const {
    return static_cast<int32>(std::ceil(bottom - top));
}

bool BRect::Intersects(const BRect& other) const {
    return IsValid() && other.IsValid() && (*this & other).IsValid();
}

bool BRect::Contains(const BPoint& point) const {
    return point.x >= left && point.x <= right && point.y >= top && point.y <= bottom;
}

bool BRect::Contains(const BRect& other) const {
    return other.left >= left && other.right <= right && other.top >= top && other.bottom <= bottom;
}
