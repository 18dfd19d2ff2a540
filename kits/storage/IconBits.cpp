#include <IconBits.h>

#include <Bitmap.h>
#include <PixelFormat.h>

#include <string.h>

status_t IconBitsFromBitmap(const BBitmap* bitmap, icon_size size, std::vector<uint8>& bits) {
    if (bitmap == nullptr || !bitmap->IsValid() || !IsIconSize(size))
        return B_BAD_VALUE;
    const int32 width = bitmap->Bounds().IntegerWidth() + 1;
    const int32 height = bitmap->Bounds().IntegerHeight() + 1;
    const auto* rows = static_cast<const uint8*>(bitmap->Bits());
    bits.resize(IconBytes(size));
    std::vector<pixel32> source(static_cast<size_t>(width));
    std::vector<pixel32> row(static_cast<size_t>(size));
    for (int32 y = 0; y < size; y++) {
        const uint8* sourceRow = rows + static_cast<ptrdiff_t>(y * height / size) * bitmap->BytesPerRow();
        load_pixels(bitmap->ColorSpace(), sourceRow, 0, width, source.data());
        for (int32 x = 0; x < size; x++)
            row[static_cast<size_t>(x)] = source[static_cast<size_t>(x * width / size)];
        store_pixels(B_CMAP8, bits.data() + y * size, 0, size, row.data());
    }
    return B_OK;
}

status_t CheckIconBitmap(const BBitmap* bitmap, icon_size size) {
    if (bitmap == nullptr || !bitmap->IsValid() || !IsIconSize(size))
        return B_BAD_VALUE;
    const BRect bounds = bitmap->Bounds();
    bool fits = bounds.IntegerWidth() + 1 == size && bounds.IntegerHeight() + 1 == size;
    return fits ? B_OK : B_BAD_VALUE;
}

void FillIconBitmap(const uint8* bits, icon_size size, BBitmap* bitmap) {
    auto* rows = static_cast<uint8*>(bitmap->Bits());
    const int32 bytesPerRow = bitmap->BytesPerRow();
    if (bitmap->ColorSpace() == B_CMAP8 && bytesPerRow == size) {
        memcpy(rows, bits, IconBytes(size));
        return;
    }
    pixel32 row[B_LARGE_ICON];
    for (int32 y = 0; y < size; y++) {
        load_pixels(B_CMAP8, bits + y * size, 0, size, row);
        store_pixels(bitmap->ColorSpace(), rows + static_cast<ptrdiff_t>(y) * bytesPerRow, 0, size, row);
    }
}
