// PrefilledBitmap: a bitmap made from pixel data that the program brings along.
#pragma once

#include <Bitmap.h>

// Rows of the data are padded to four bytes, one byte for each pixel, as `space` says. The width counted is
// right - left, one less than the bitmap's pixels, and is meant so: of bounds whose pixels a row are one more
// than a multiple of four, the data is taken as if the last pixel of each row were missing. The data stays
// the caller's and is copied.
class PrefilledBitmap : public BBitmap {
  public:
    PrefilledBitmap(BRect bounds, color_space space, const void* data, bool accepts_views,
                    bool needs_contiguous);
    ~PrefilledBitmap() override;

    // How many bytes of data the bitmap is made from.
    static int32 CountDataBytes(BRect bounds);
};
