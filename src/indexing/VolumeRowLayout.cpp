#include "indexing/VolumeRowLayout.h"

#include <algorithm>
#include <cmath>

VolumeRowLayout::VolumeRowLayout(BRect row)
    : icon(row.left + 20, row.top + 2, row.left + 35, row.top + 17), name(row.left + 43, row.bottom - 5),
      bar(row.left + 130, row.top, row.left + 205, row.bottom) {
    bar.InsetBy(2, 4);
    unsupported.Set(bar.left, bar.bottom - 3);
    status.Set(bar.right + 5, bar.bottom - 3);
}

BarFill::BarFill(BRect bar, float progress) : filled(bar), empty(bar) {
    const float pixels = bar.Width() + 1;
    const float filledPixels = progress < 0 ? pixels : std::round(pixels * std::min(progress, 1.0f));
    empty.left = bar.left + filledPixels;
    filled.right = empty.left - 1;
}
