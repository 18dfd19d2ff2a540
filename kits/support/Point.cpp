#include <Rect.h>

#include <algorithm>
#include <cstdio>

void BPoint::ConstrainTo(BRect rect) {
    x = std::max(rect.left, std::min(x, rect.right));
    y = std::max(rect.top, std::min(y, rect.bottom));
}

void BPoint::PrintToStream() const {
    std::printf("BPoint(x:%.1f, y:%.1f)\n", static_cast<double>(x), static_cast<double>(y));
}
