// The pixels of an icon, between bitmaps and the form in which attributes and records hold them.
// Internal to the storage kit.
#pragma once

#include <Mime.h>
#include <SupportDefs.h>

#include <vector>

class BBitmap;

// Icons are stored as B_CMAP8 rows without padding.
inline constexpr size_t IconBytes(icon_size size) {
    return static_cast<size_t>(size) * static_cast<size_t>(size);
}
inline constexpr bool IsIconSize(icon_size size) {
    return size == B_MINI_ICON || size == B_LARGE_ICON;
}

// The stored form of a bitmap, scaled to the icon's size. B_BAD_VALUE for a bitmap that is null or not valid.
[[nodiscard]] status_t IconBitsFromBitmap(const BBitmap* bitmap, icon_size size, std::vector<uint8>& bits);

// B_OK when a bitmap can take an icon: valid and exactly as large. Else B_BAD_VALUE.
[[nodiscard]] status_t CheckIconBitmap(const BBitmap* bitmap, icon_size size);

// Fills a checked bitmap, whatever its colour space, from IconBytes(size) bytes.
void FillIconBitmap(const uint8* bits, icon_size size, BBitmap* bitmap);
