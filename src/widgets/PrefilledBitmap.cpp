#include "widgets/PrefilledBitmap.h"

PrefilledBitmap::PrefilledBitmap(BRect bounds, color_space space, const void* data, bool accepts_views,
                                 bool needs_contiguous)
    : BBitmap(bounds, space, accepts_views, needs_contiguous) {
    SetBits(data, CountDataBytes(bounds), 0, space);
}

PrefilledBitmap::~PrefilledBitmap() = default;

int32 PrefilledBitmap::CountDataBytes(BRect bounds) {
    const int32 rowLength = (static_cast<int32>(bounds.right - bounds.left) + 3) / 4 * 4;
    return rowLength * (static_cast<int32>(bounds.bottom - bounds.top) + 1);
}
