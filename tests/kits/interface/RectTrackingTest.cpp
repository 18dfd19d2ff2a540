#include "RectTracking.h"

#include <View.h>

#include <gtest/gtest.h>

namespace {

TEST(RectTracking, TheRectangleOrItsCornerFollowsThePointer) {
    const struct {
        uint32 style;
        BPoint pointer;
        BRect rect;
    } cases[] = {
        {B_TRACK_WHOLE_RECT, {12, 8}, {10, 20, 30, 40}},    {B_TRACK_WHOLE_RECT, {15, 3}, {13, 15, 33, 35}},
        {B_TRACK_WHOLE_RECT, {-90, 8}, {-92, 20, -72, 40}}, {B_TRACK_RECT_CORNER, {50, 60}, {10, 20, 50, 60}},
        {B_TRACK_RECT_CORNER, {10, 20}, {10, 20, 10, 20}},  {B_TRACK_RECT_CORNER, {4, 25}, {4, 20, 10, 25}},
    };
    for (const auto& each : cases) {
        RectTracking tracking;
        EXPECT_FALSE(tracking.PointerAt(BPoint(1, 1)));
        tracking.Begin(BRect(10, 20, 30, 40), each.style, BPoint(12, 8));
        tracking.PointerAt(each.pointer);
        EXPECT_EQ(tracking.Rect(), each.rect);
        EXPECT_FALSE(tracking.PointerAt(each.pointer)) << "it is there already";
        tracking.End();
        EXPECT_FALSE(tracking.IsActive());
    }
}

TEST(RectTracking, TheOutlineIsTurnedOverOnceAndBack) {
    std::vector<uint32> pixels(8 * 6, 0xFF102030U);
    PixelSurface surface;
    surface.bits = reinterpret_cast<uint8*>(pixels.data());
    surface.bytesPerRow = 8 * 4;
    surface.width = 8;
    surface.height = 6;
    RectTracking tracking;
    // Partly outside.
    tracking.Begin(BRect(2, 1, 20, 4), B_TRACK_WHOLE_RECT, B_ORIGIN);
    tracking.InvertOutline(surface);
    std::string picture;
    for (const uint32 pixel : pixels) {
        picture += pixel == 0xFFEFDFCFU ? '#' : (pixel == 0xFF102030U ? '.' : '?');
    }
    EXPECT_EQ(picture, "........"
                       "..######"
                       "..#....."
                       "..#....."
                       "..######"
                       "........");
    tracking.InvertOutline(surface);
    EXPECT_EQ(pixels, std::vector<uint32>(8 * 6, 0xFF102030U));
    tracking.Begin(BRect(3, 3, 3, 3), B_TRACK_WHOLE_RECT, B_ORIGIN);
    tracking.InvertOutline(surface);
    EXPECT_EQ(pixels[3 * 8 + 3], 0xFFEFDFCFU) << "a single pixel, once";
}

} // namespace
