#include "gui/ColumnListView/gallery/GalleryPictures.h"

#include <Bitmap.h>

#include <array>
#include <vector>

namespace {

constexpr int32 kDiscSide = 16;
constexpr uint8 kEdgeIndex = 8;

} // namespace

std::unique_ptr<BBitmap> MakeDisc(uint8 colorIndex) {
    std::array<uint8, kDiscSide* kDiscSide> pixels = {};
    for (int32 y = 0; y < kDiscSide; ++y) {
        for (int32 x = 0; x < kDiscSide; ++x) {
            // Twice the distance from the middle, squared.
            const int32 dx = 2 * x + 1 - kDiscSide;
            const int32 dy = 2 * y + 1 - kDiscSide;
            const int32 square = dx * dx + dy * dy;
            const uint8 inside = square > 13 * 13 ? kEdgeIndex : colorIndex;
            pixels[static_cast<size_t>(y * kDiscSide + x)] =
                square > 15 * 15 ? B_TRANSPARENT_MAGIC_CMAP8 : inside;
        }
    }
    auto bitmap = std::make_unique<BBitmap>(BRect(0, 0, kDiscSide - 1, kDiscSide - 1), B_CMAP8);
    bitmap->SetBits(pixels.data(), static_cast<int32>(pixels.size()), 0, B_CMAP8);
    return bitmap;
}

std::unique_ptr<BBitmap> MakeSwatch(int32 width, int32 height, rgb_color color) {
    const auto bytesFor = [](rgb_color pixel) {
        return std::array<uint8, 4>{pixel.blue, pixel.green, pixel.red, 255};
    };
    std::vector<uint8> pixels;
    for (int32 y = 0; y < height; ++y) {
        for (int32 x = 0; x < width; ++x) {
            const bool edge = x == 0 || y == 0 || x == width - 1 || y == height - 1;
            const std::array<uint8, 4> bytes = bytesFor(edge ? make_color(64, 64, 64) : color);
            pixels.insert(pixels.end(), bytes.begin(), bytes.end());
        }
    }
    auto bitmap = std::make_unique<BBitmap>(
        BRect(0, 0, static_cast<float>(width - 1), static_cast<float>(height - 1)), B_RGB32);
    (void)bitmap->ImportBits(pixels.data(), static_cast<int32>(pixels.size()), 4 * width, 0, B_RGB32);
    return bitmap;
}
