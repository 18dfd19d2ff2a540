#include "Painter.h"

#include "PixelPicture.h"

#include <gtest/gtest.h>

namespace {

constexpr pixel32 kRed = 0xFFFF0000;
constexpr pixel32 kGreen = 0xFF00FF00;
constexpr pixel32 kBlue = 0xFF0000FF;
constexpr pixel32 kBlack = 0xFF000000;
constexpr pixel32 kWhite = 0xFFFFFFFF;

Ink InkOf(drawing_mode mode, pixel32 high = kBlack, pixel32 low = kRed, const pattern& dots = B_SOLID_HIGH) {
    Ink ink;
    ink.blend.mode = mode;
    ink.blend.high = high;
    ink.blend.low = low;
    ink.dots = dots;
    return ink;
}

// One pixel of `target` after a fill.
pixel32 Filled(pixel32 target, const Ink& ink, color_space space = B_RGB32) {
    PixelPicture picture(1, 1, space);
    store_pixels(space, picture.Surface().Row(0), 0, 1, &target);
    Painter(picture.Surface()).FillRect({0, 0, 0, 0}, ink);
    return picture.At(0, 0);
}

constexpr pattern kStripes = {{0xC7, 0x8F, 0x1F, 0x3E, 0x7C, 0xF8, 0xF1, 0xE3}};

TEST(Painter, FillsExactlyTheRectangle) {
    PixelPicture picture(6, 4);
    Painter(picture.Surface()).FillRect({1, 1, 3, 2}, InkOf(B_OP_COPY));
    EXPECT_EQ(picture.Show(), (Rows{"......", ".###..", ".###..", "......"}));
}

TEST(Painter, NothingLeavesTheSurface) {
    PixelPicture picture(4, 2);
    Painter painter(picture.Surface());
    painter.FillRect({-100, -100, 100, 100}, InkOf(B_OP_COPY));
    EXPECT_EQ(picture.Show(), (Rows{"####", "####"}));
    painter.FillRect({7, 0, 9, 1}, InkOf(B_OP_COPY, kRed));
    painter.FillRect({3, 0, 2, 1}, InkOf(B_OP_COPY, kRed));
    EXPECT_EQ(picture.Show(), (Rows{"####", "####"}));
}

TEST(Painter, TheClipHasTheShapeOfARegion) {
    PixelPicture picture(6, 3);
    Painter painter(picture.Surface());
    BRegion clip(BRect(1, 0, 4, 2));
    clip.Exclude(BRect(2, 1, 3, 1));
    painter.SetClip(clip);
    painter.FillRect({0, 0, 5, 2}, InkOf(B_OP_COPY));
    EXPECT_EQ(picture.Show(), (Rows{".####.", ".#..#.", ".####."}));
    painter.FillRegion(BRegion(BRect(0, 1, 5, 1)), InkOf(B_OP_COPY, kBlue));
    EXPECT_EQ(picture.Show(), (Rows{".####.", ".b..b.", ".####."}));
}

TEST(Painter, PatternsAreAlignedToTheirOriginWhereverTheFillStarts) {
    PixelPicture picture(8, 4);
    Painter painter(picture.Surface());
    painter.FillRect({0, 0, 7, 3}, InkOf(B_OP_COPY, kBlack, kWhite, kStripes));
    EXPECT_EQ(picture.Show(), (Rows{"##...###", "#...####", "...#####", "..#####."}));
    PixelPicture pieces(8, 4);
    Painter other(pieces.Surface());
    other.FillRect({3, 1, 6, 3}, InkOf(B_OP_COPY, kBlack, kWhite, kStripes));
    EXPECT_EQ(pieces.Show(), (Rows{"........", "....###.", "...####.", "...####."}));
    other.FillRect({0, 0, 7, 0}, InkOf(B_OP_COPY, kBlack, kWhite, kStripes));
    other.FillRect({0, 1, 2, 3}, InkOf(B_OP_COPY, kBlack, kWhite, kStripes));
    other.FillRect({7, 1, 7, 3}, InkOf(B_OP_COPY, kBlack, kWhite, kStripes));
    EXPECT_EQ(pieces.Show(), picture.Show());
}

TEST(Painter, PatternOriginsMayBeNegativeAndOdd) {
    Ink ink = InkOf(B_OP_COPY, kBlack, kWhite, kStripes);
    ink.patternX = -3;
    ink.patternY = -9;
    PixelPicture picture(8, 2);
    Painter(picture.Surface()).FillRect({0, 0, 7, 1}, ink);
    // Row 9 is row 1, shifted three to the left: 10001111 -> 01111100.
    EXPECT_EQ(picture.Show(), (Rows{".#####..", "#####..."}));
}

TEST(Painter, ClearBitsDrawTheLowColourInCopyAndNothingInOver) {
    PixelPicture picture(4, 2);
    Painter painter(picture.Surface());
    painter.FillRect({0, 0, 3, 0}, InkOf(B_OP_COPY, kBlack, kRed, B_MIXED_COLORS));
    painter.FillRect({0, 1, 3, 1}, InkOf(B_OP_OVER, kBlack, kRed, B_MIXED_COLORS));
    EXPECT_EQ(picture.Show(), (Rows{"#r#r", ".#.#"}));
    painter.FillRect({0, 0, 3, 1}, InkOf(B_OP_COPY, kBlack, kGreen, B_SOLID_LOW));
    EXPECT_EQ(picture.Show(), (Rows{"gggg", "gggg"}));
    painter.FillRect({0, 0, 3, 1}, InkOf(B_OP_OVER, kBlack, kRed, B_SOLID_LOW));
    EXPECT_EQ(picture.Show(), (Rows{"gggg", "gggg"}));
}

TEST(Painter, EachModeCombinesAsItSays) {
    EXPECT_EQ(Filled(0xFF102030, InkOf(B_OP_COPY, 0xFF405060)), 0xFF405060U);
    EXPECT_EQ(Filled(0xFF102030, InkOf(B_OP_OVER, 0xFF405060)), 0xFF405060U);
    EXPECT_EQ(Filled(0xFF102030, InkOf(B_OP_OVER, kTransparentPixel)), 0xFF102030U);
    EXPECT_EQ(Filled(0xFF102030, InkOf(B_OP_ERASE, 0xFF405060, 0xFF0A0B0C)), 0xFF0A0B0CU);
    EXPECT_EQ(Filled(0xFF102030, InkOf(B_OP_INVERT)), 0xFFEFDFCFU);
    EXPECT_EQ(Filled(0xFF1020F0, InkOf(B_OP_ADD, 0xFF405060)), 0xFF5070FFU);
    EXPECT_EQ(Filled(0xFF1060F0, InkOf(B_OP_SUBTRACT, 0xFF405060)), 0xFF001090U);
    EXPECT_EQ(Filled(0xFF102030, InkOf(B_OP_BLEND, 0xFF405060)), 0xFF283848U);
    EXPECT_EQ(Filled(0xFF102030, InkOf(B_OP_MIN, 0xFF405060)), 0xFF102030U);
    EXPECT_EQ(Filled(0xFF102030, InkOf(B_OP_MAX, 0xFF405060)), 0xFF405060U);
}

TEST(Painter, SelectSwapsTheTwoColoursAndLeavesOthers) {
    PixelPicture picture(3, 1);
    Painter painter(picture.Surface());
    painter.FillRect({0, 0, 0, 0}, InkOf(B_OP_COPY, kBlack));
    painter.FillRect({1, 0, 1, 0}, InkOf(B_OP_COPY, kRed));
    painter.FillRect({0, 0, 2, 0}, InkOf(B_OP_SELECT, kBlack, kRed));
    EXPECT_EQ(picture.Show(), (Rows{"r#."}));
}

TEST(Painter, AlphaMixesByThePixelOrByOneAlphaForAll) {
    EXPECT_EQ(Filled(kWhite, InkOf(B_OP_ALPHA, 0x80000000)) & 0xFF, 127U);
    EXPECT_EQ(Filled(kWhite, InkOf(B_OP_ALPHA, 0xFF000000)) & 0xFFFFFF, 0U);
    EXPECT_EQ(Filled(kWhite, InkOf(B_OP_ALPHA, 0x00000000)) & 0xFFFFFF, 0xFFFFFFU);
    Ink low = InkOf(B_OP_ALPHA, 0x40000000, 0xFF000000, B_SOLID_LOW);
    EXPECT_EQ(Filled(kWhite, low) & 0xFF, 0U);
    low.blend.alphaSource = B_CONSTANT_ALPHA;
    EXPECT_EQ(Filled(kWhite, low) & 0xFF, 191U);
    Ink composite = InkOf(B_OP_ALPHA, 0x80FF0000);
    EXPECT_EQ(Filled(0x00000000, composite, B_RGBA32), 0x00800000U);
    composite.blend.alphaFunction = B_ALPHA_COMPOSITE;
    EXPECT_EQ(Filled(0x00000000, composite, B_RGBA32), 0x80FF0000U);
}

TEST(Painter, DrawsInEveryColourSpace) {
    for (const color_space space : {B_RGB16, B_RGB15, B_CMAP8, B_RGB24, B_RGBA32, B_RGB32_BIG}) {
        PixelPicture picture(5, 2, space);
        Painter painter(picture.Surface());
        painter.FillRect({1, 0, 3, 0}, InkOf(B_OP_COPY, kRed));
        painter.FillRect({1, 1, 4, 1}, InkOf(B_OP_OVER, kBlue, kBlack, B_MIXED_COLORS));
        EXPECT_EQ(picture.Show(), (Rows{".rrr.", ".b.b."})) << space;
        painter.FillRect({0, 0, 4, 0}, InkOf(B_OP_INVERT));
        EXPECT_EQ(picture.Show()[0].front(), '#') << space;
    }
    PixelPicture grey(9, 1, B_GRAY1);
    Painter(grey.Surface()).FillRect({6, 0, 7, 0}, InkOf(B_OP_COPY, kBlack));
    EXPECT_EQ(grey.Show(), (Rows{"......##."}));
}

TEST(Painter, LogicalPixelsOfAScaledSurfaceTileIt) {
    for (const double scale : {1.25, 1.5, 2.0}) {
        PixelPicture picture(20, 20);
        picture.Surface().scale = scale;
        Painter painter(picture.Surface());
        // Every other logical pixel, then the rest: all are drawn once.
        painter.FillRect({0, 0, 19, 19}, InkOf(B_OP_INVERT, kBlack, kWhite, B_MIXED_COLORS));
        EXPECT_NE(picture.Show(), Rows(20, std::string(20, '#')));
        constexpr pattern kOthers = {{0x55, 0xAA, 0x55, 0xAA, 0x55, 0xAA, 0x55, 0xAA}};
        painter.FillRect({0, 0, 19, 19}, InkOf(B_OP_INVERT, kBlack, kWhite, kOthers));
        EXPECT_EQ(picture.Show(), Rows(20, std::string(20, '#'))) << scale;
    }
    PixelPicture twice(6, 4);
    twice.Surface().scale = 2;
    Painter(twice.Surface()).FillRect({1, 0, 1, 1}, InkOf(B_OP_COPY));
    EXPECT_EQ(twice.Show(), (Rows{"..##..", "..##..", "..##..", "..##.."}));
}

TEST(Painter, PatternsOnScaledSurfacesStartWhereTheClipCutsThem) {
    PixelPicture whole(16, 16);
    whole.Surface().scale = 1.5;
    Painter(whole.Surface()).FillRect({0, 0, 9, 9}, InkOf(B_OP_COPY, kBlack, kRed, kStripes));
    PixelPicture parts(16, 16);
    parts.Surface().scale = 1.5;
    Painter painter(parts.Surface());
    for (const clipping_rect& part :
         {clipping_rect{0, 0, 4, 9}, clipping_rect{5, 0, 9, 3}, clipping_rect{5, 4, 9, 9}}) {
        painter.SetClip(BRegion(part));
        painter.FillRect({0, 0, 9, 9}, InkOf(B_OP_COPY, kBlack, kRed, kStripes));
    }
    EXPECT_EQ(parts.Show(), whole.Show());
}

// A source of four pixels: red, green / blue, black.
PixelPicture FourColours(color_space space = B_RGB32) {
    PixelPicture picture(2, 2, space);
    Painter painter(picture.Surface());
    painter.FillRect({0, 0, 0, 0}, InkOf(B_OP_COPY, kRed));
    painter.FillRect({1, 0, 1, 0}, InkOf(B_OP_COPY, kGreen));
    painter.FillRect({0, 1, 0, 1}, InkOf(B_OP_COPY, kBlue));
    painter.FillRect({1, 1, 1, 1}, InkOf(B_OP_COPY, kBlack));
    return picture;
}

TEST(Painter, PicturesOfTheSameSizeAreCopiedPixelByPixel) {
    PixelPicture source = FourColours();
    PixelPicture picture(4, 3);
    Painter painter(picture.Surface());
    painter.DrawSurface(source.Surface(), {0, 0, 1, 1}, {1, 1, 2, 2}, InkOf(B_OP_COPY));
    EXPECT_EQ(picture.Show(), (Rows{"....", ".rg.", ".b#."}));
    painter.DrawSurface(source.Surface(), {0, 0, 1, 1}, {3, -1, 4, 0}, InkOf(B_OP_COPY));
    EXPECT_EQ(picture.Show(), (Rows{"...b", ".rg.", ".b#."}));
}

TEST(Painter, PartsOutsideOfTheSourceLeaveTheirPlaceInTheTarget) {
    PixelPicture source = FourColours();
    PixelPicture picture(4, 4);
    Painter(picture.Surface()).DrawSurface(source.Surface(), {-1, -1, 2, 2}, {0, 0, 3, 3}, InkOf(B_OP_COPY));
    EXPECT_EQ(picture.Show(), (Rows{"....", ".rg.", ".b#.", "...."}));
    Painter(picture.Surface()).DrawSurface(source.Surface(), {5, 5, 6, 6}, {0, 0, 3, 3}, InkOf(B_OP_COPY));
    EXPECT_EQ(picture.Show()[0], "....");
}

TEST(Painter, IndexedPicturesGrowByRepeatingPixels) {
    PixelPicture source = FourColours(B_CMAP8);
    PixelPicture picture(5, 4);
    Painter(picture.Surface()).DrawSurface(source.Surface(), {0, 0, 1, 1}, {0, 0, 3, 3}, InkOf(B_OP_COPY));
    EXPECT_EQ(picture.Show(), (Rows{"rrgg.", "rrgg.", "bb##.", "bb##."}));
    PixelPicture odd(3, 2);
    Painter(odd.Surface()).DrawSurface(source.Surface(), {0, 0, 1, 1}, {0, 0, 2, 1}, InkOf(B_OP_COPY));
    EXPECT_EQ(odd.Show()[0].front(), 'r');
    EXPECT_EQ(odd.Show()[0].back(), 'g');
}

TEST(Painter, ShrinkingAveragesColours) {
    PixelPicture source(8, 8);
    Painter(source.Surface()).FillRect({0, 0, 7, 7}, InkOf(B_OP_COPY, kBlack, kWhite, B_MIXED_COLORS));
    PixelPicture picture(2, 2);
    Painter(picture.Surface()).DrawSurface(source.Surface(), {0, 0, 7, 7}, {0, 0, 1, 1}, InkOf(B_OP_COPY));
    for (int32 i = 0; i < 4; ++i) {
        EXPECT_NEAR(static_cast<int>(picture.At(i % 2, i / 2) & 0xFF), 128, 4);
    }
}

TEST(Painter, TransparentPixelsAreLeftOutByAllModesButCopy) {
    PixelPicture source(3, 1, B_CMAP8);
    const pixel32 pixels[3] = {kRed, kTransparentPixel, kBlack};
    store_pixels(B_CMAP8, source.Surface().Row(0), 0, 3, pixels);
    PixelPicture over(3, 1);
    Painter(over.Surface()).DrawSurface(source.Surface(), {0, 0, 2, 0}, {0, 0, 2, 0}, InkOf(B_OP_OVER));
    EXPECT_EQ(over.Show(), (Rows{"r.#"}));
    PixelPicture erase(3, 1);
    Painter(erase.Surface())
        .DrawSurface(source.Surface(), {0, 0, 2, 0}, {0, 0, 2, 0}, InkOf(B_OP_ERASE, kBlack, kBlue));
    EXPECT_EQ(erase.Show(), (Rows{"b.b"}));
    PixelPicture copy(3, 1);
    Painter(copy.Surface()).DrawSurface(source.Surface(), {0, 0, 2, 0}, {0, 0, 2, 0}, InkOf(B_OP_COPY));
    EXPECT_EQ(copy.At(1, 0), kTransparentPixel);
    PixelPicture wide(6, 1);
    Painter(wide.Surface()).DrawSurface(source.Surface(), {0, 0, 2, 0}, {0, 0, 5, 0}, InkOf(B_OP_OVER));
    EXPECT_EQ(wide.Show(), (Rows{"rr..##"}));
}

TEST(Painter, HugeTargetsOnlyCostWhatIsVisible) {
    PixelPicture source = FourColours();
    PixelPicture picture(4, 4);
    Painter(picture.Surface())
        .DrawSurface(source.Surface(), {0, 0, 1, 1}, {-1000000, -1000000, 1000001, 1000001},
                     InkOf(B_OP_COPY));
    EXPECT_EQ(picture.Show(), (Rows{"rggg", "b###", "b###", "b###"}));
}

TEST(Painter, MovedPixelsMayOverlapTheirOldPlace) {
    PixelPicture picture(5, 3);
    Painter painter(picture.Surface());
    painter.FillRect({0, 0, 0, 0}, InkOf(B_OP_COPY, kRed));
    painter.FillRect({1, 0, 1, 0}, InkOf(B_OP_COPY, kGreen));
    painter.FillRect({2, 0, 2, 1}, InkOf(B_OP_COPY, kBlue));
    painter.MovePixels(BRegion(BRect(1, 0, 4, 2)), 1, 0);
    EXPECT_EQ(picture.Show(), (Rows{"rrgb.", "...b.", "....."}));
    painter.MovePixels(BRegion(BRect(0, 1, 4, 2)), 0, 1);
    EXPECT_EQ(picture.Show(), (Rows{"rrgb.", "rrgb.", "...b."}));
    painter.MovePixels(BRegion(BRect(0, 0, 3, 2)), -1, 0);
    EXPECT_EQ(picture.Show(), (Rows{"rgb..", "rgb..", "..b.."}));
}

TEST(Painter, PixelsThatWouldComeFromOutsideStay) {
    PixelPicture picture(3, 1);
    Painter painter(picture.Surface());
    painter.FillRect({0, 0, 0, 0}, InkOf(B_OP_COPY, kRed));
    painter.MovePixels(BRegion(BRect(-5, -5, 9, 9)), 2, 0);
    EXPECT_EQ(picture.Show(), (Rows{"r.r"}));
    painter.MovePixels(BRegion(BRect(-5, -5, 9, 9)), 100, 7);
    EXPECT_EQ(picture.Show(), (Rows{"r.r"}));
}

TEST(Painter, OnlyWholeDevicePixelsMoveExactly) {
    PixelPicture picture(4, 4);
    EXPECT_TRUE(Painter(picture.Surface()).CanMoveExactly(3, -1));
    picture.Surface().scale = 1.25;
    EXPECT_FALSE(Painter(picture.Surface()).CanMoveExactly(3, 0));
    EXPECT_TRUE(Painter(picture.Surface()).CanMoveExactly(4, -8));
}

TEST(Painter, TextInCopyModeMixesWithTheLowColour) {
    PixelPicture picture(60, 20);
    Painter painter(picture.Surface());
    painter.FillRect({0, 0, 59, 19}, InkOf(B_OP_COPY, kGreen));
    painter.DrawText({}, "HOS", 4, 15, InkOf(B_OP_COPY, kRed, kBlack));
    int red = 0;
    int mixed = 0;
    for (int32 y = 0; y < 20; ++y) {
        for (int32 x = 0; x < 60; ++x) {
            const pixel32 pixel = picture.At(x, y);
            if (pixel == kGreen) {
                continue;
            }
            EXPECT_EQ(pixel & 0x00FFFF, 0U) << "no green shines through";
            red += pixel == kRed;
            mixed += pixel != kRed;
        }
    }
    EXPECT_GT(red, 5);
    EXPECT_GT(mixed, 5);
}

TEST(Painter, TextInOverModeMixesWithWhatIsThere) {
    PixelPicture picture(60, 20);
    Painter painter(picture.Surface());
    painter.FillRect({0, 0, 59, 19}, InkOf(B_OP_COPY, kGreen));
    painter.DrawText({}, "OSO", 4, 15, InkOf(B_OP_OVER, kRed, kBlack));
    int between = 0;
    for (int32 y = 0; y < 20; ++y) {
        for (int32 x = 0; x < 60; ++x) {
            const pixel32 pixel = picture.At(x, y);
            between += ((pixel >> 8) & 0xFF) > 0 && ((pixel >> 16) & 0xFF) > 0;
        }
    }
    EXPECT_GT(between, 5);
}

TEST(Painter, TextIsClipped) {
    PixelPicture whole(60, 20);
    Painter(whole.Surface()).DrawText({}, "Hamburg", 2, 15, InkOf(B_OP_OVER));
    PixelPicture part(60, 20);
    Painter painter(part.Surface());
    BRegion clip(BRect(10, 8, 30, 11));
    clip.Include(BRect(20, 13, 40, 13));
    painter.SetClip(clip);
    painter.DrawText({}, "Hamburg", 2, 15, InkOf(B_OP_OVER));
    for (int32 y = 0; y < 20; ++y) {
        for (int32 x = 0; x < 60; ++x) {
            ASSERT_EQ(part.At(x, y), clip.Contains(x, y) ? whole.At(x, y) : kWhite) << x << ", " << y;
        }
    }
    painter.DrawText({}, "Hamburg", 1e30, 0, InkOf(B_OP_OVER));
}

} // namespace
