#include "Shapes.h"

#include "Painter.h"
#include "PixelPicture.h"

#include <gtest/gtest.h>
#include <limits>

namespace {

constexpr clipping_rect kClip = {0, 0, 19, 11};

// The region as rows of '#' and '.', from (0, 0).
Rows Show(const BRegion& region, int32 width, int32 height) {
    PixelPicture picture(width, height);
    Painter(picture.Surface()).FillRegion(region, Ink());
    return picture.Show();
}

int64 CountPixels(const BRegion& region) {
    int64 count = 0;
    for (const clipping_rect& rect : region.Rects()) {
        count += static_cast<int64>(rect.right - rect.left + 1) * (rect.bottom - rect.top + 1);
    }
    return count;
}

TEST(Shapes, LinesIncludeBothEndsAndTakeOnePixelAStep) {
    EXPECT_EQ(Show(line_pixels({0, 0}, {5, 2}, kClip), 6, 3), (Rows{"##....", "..##..", "....##"}));
    EXPECT_EQ(Show(line_pixels({0, 0}, {3, 3}, kClip), 4, 4), (Rows{"#...", ".#..", "..#.", "...#"}));
    EXPECT_EQ(Show(line_pixels({0, 2}, {4, 2}, kClip), 5, 3), (Rows{".....", ".....", "#####"}));
    EXPECT_EQ(Show(line_pixels({1, 1}, {1, 1}, kClip), 3, 3), (Rows{"...", ".#.", "..."}));
    EXPECT_EQ(Show(line_pixels({0, 4}, {2, 0}, kClip), 3, 5), (Rows{"..#", "..#", ".#.", ".#.", "#.."}));
}

TEST(Shapes, ALineIsTheSameFromEitherEnd) {
    for (int32 x = 0; x <= 9; ++x) {
        for (int32 y = 0; y <= 9; ++y) {
            EXPECT_EQ(line_pixels({2, 7}, {x, y}, kClip), line_pixels({x, y}, {2, 7}, kClip));
        }
    }
}

TEST(Shapes, ClippingDoesNotBendALine) {
    const clipping_rect wide = {-1000, -1000, 1000, 1000};
    for (const PixelPoint end : {PixelPoint{700, 311}, PixelPoint{-900, 500}, PixelPoint{30, -999}}) {
        BRegion whole = line_pixels({-40, -30}, end, wide);
        const BRegion limit(kClip);
        whole.IntersectWith(&limit);
        EXPECT_EQ(line_pixels({-40, -30}, end, kClip), whole);
    }
}

TEST(Shapes, EndlessLinesCostNoMoreThanTheClip) {
    const int32 far = std::numeric_limits<int32>::max();
    EXPECT_LE(line_pixels({-far, -far}, {far, far}, kClip).CountRects(), 12);
    EXPECT_EQ(CountPixels(line_pixels({-far, 5}, {far, 5}, kClip)), 20);
    EXPECT_EQ(to_pixel_coordinate(1e30), 1 << 30);
    EXPECT_EQ(to_pixel_coordinate(std::numeric_limits<double>::quiet_NaN()), 0);
    EXPECT_EQ(to_pixel_coordinate(-0.5), 0);
    EXPECT_EQ(to_pixel_coordinate(2.5), 3);
}

TEST(Shapes, WideLinesHaveTheirWidth) {
    EXPECT_EQ(Show(thick_line_pixels({1, 2}, {6, 2}, 3, B_BUTT_CAP, kClip), 8, 5),
              (Rows{"........", ".######.", ".######.", ".######.", "........"}));
    EXPECT_EQ(Show(thick_line_pixels({2, 2}, {5, 2}, 3, B_SQUARE_CAP, kClip), 8, 5),
              (Rows{"........", ".######.", ".######.", ".######.", "........"}));
    EXPECT_EQ(thick_line_pixels({1, 2}, {6, 4}, 0, B_BUTT_CAP, kClip), line_pixels({1, 2}, {6, 4}, kClip));
    EXPECT_TRUE(thick_line_pixels({std::numeric_limits<float>::infinity(), 0}, {0, 0}, 3, B_BUTT_CAP, kClip)
                    .IsEmpty());
}

TEST(Shapes, PolygonsHoldTheirBorder) {
    EXPECT_EQ(Show(polygon_pixels({{0, 0}, {4, 0}, {0, 4}}, kClip), 5, 5),
              (Rows{"#####", "####.", "###..", "##...", "#...."}));
    EXPECT_EQ(Show(polygon_pixels({{0, 0}, {4, 4}}, kClip), 5, 5),
              (Rows{"#....", ".#...", "..#..", "...#.", "....#"}));
    EXPECT_TRUE(polygon_pixels({}, kClip).IsEmpty());
    // Two squares, one inside the other, drawn as one: even-odd leaves the inner one open.
    EXPECT_EQ(
        Show(polygon_pixels({{0, 0}, {8, 0}, {8, 8}, {0, 8}, {0, 0}, {3, 3}, {3, 5}, {5, 5}, {5, 3}, {3, 3}},
                            {0, 0, 19, 19}),
             9, 9)[4],
        "####.####");
}

TEST(Shapes, EllipsesTouchTheirFrame) {
    EXPECT_EQ(Show(ellipse_pixels({0, 0, 6, 6}, kClip), 7, 7),
              (Rows{"..###..", ".#####.", "#######", "#######", "#######", ".#####.", "..###.."}));
    EXPECT_EQ(Show(ellipse_border_pixels({0, 0, 6, 6}, 1, kClip), 7, 7),
              (Rows{"..###..", ".#...#.", "#.....#", "#.....#", "#.....#", ".#...#.", "..###.."}));
    EXPECT_EQ(Show(ellipse_pixels({0, 0, 0, 0}, kClip), 1, 1), (Rows{"#"}));
    EXPECT_TRUE(ellipse_pixels({5, 5, 4, 4}, kClip).IsEmpty());
}

TEST(Shapes, BordersAreNotMendedAtTheClip) {
    const BRegion cut = ellipse_border_pixels({0, 0, 18, 10}, 1, {0, 0, 9, 11});
    BRegion whole = ellipse_border_pixels({0, 0, 18, 10}, 1, kClip);
    const BRegion limit(clipping_rect{0, 0, 9, 11});
    whole.IntersectWith(&limit);
    EXPECT_EQ(cut, whole);
}

TEST(Shapes, ArcsTurnCounterClockwiseFromTheRight) {
    EXPECT_EQ(Show(wedge_pixels({0, 0, 6, 6}, 0, 90, kClip), 7, 7),
              (Rows{"...##..", "...###.", "...####", "...####", ".......", ".......", "......."}));
    EXPECT_EQ(wedge_pixels({0, 0, 6, 6}, 90, -90, kClip), wedge_pixels({0, 0, 6, 6}, 0, 90, kClip));
    EXPECT_EQ(wedge_pixels({0, 0, 6, 6}, 17, 360, kClip), ellipse_pixels({0, 0, 6, 6}, kClip));
    EXPECT_EQ(arc_pixels({0, 0, 6, 6}, 0, 720, 1, kClip), ellipse_border_pixels({0, 0, 6, 6}, 1, kClip));
}

TEST(Shapes, RoundRectanglesLoseTheirCorners) {
    EXPECT_EQ(Show(round_rect_pixels({0, 0, 7, 5}, 2, 2, kClip), 8, 6),
              (Rows{".######.", "########", "########", "########", "########", ".######."}));
    EXPECT_EQ(Show(round_rect_border_pixels({0, 0, 7, 5}, 2, 2, 1, kClip), 8, 6),
              (Rows{".######.", "#......#", "#......#", "#......#", "#......#", ".######."}));
    EXPECT_EQ(round_rect_pixels({0, 0, 7, 5}, 0, 0, kClip), BRegion(clipping_rect{0, 0, 7, 5}));
    EXPECT_EQ(round_rect_pixels({0, 0, 7, 7}, 100, 100, kClip), ellipse_pixels({0, 0, 7, 7}, kClip));
}

TEST(Shapes, RectangleBordersHaveTheirWidth) {
    EXPECT_EQ(Show(rect_border_pixels({1, 1, 4, 3}, 1, kClip), 6, 5),
              (Rows{"......", ".####.", ".#..#.", ".####.", "......"}));
    EXPECT_EQ(CountPixels(rect_border_pixels({5, 5, 5, 5}, 1, kClip)), 1);
    EXPECT_EQ(Show(rect_border_pixels({2, 2, 6, 6}, 3, kClip), 9, 9)[4], ".###.###.");
}

TEST(Shapes, CurvesPassTheirEnds) {
    const BPoint control[4] = {{0, 0}, {10, 0}, {10, 10}, {0, 10}};
    const std::vector<BPoint> points = bezier_points(control);
    EXPECT_EQ(points.front(), BPoint(0, 0));
    EXPECT_EQ(points.back(), BPoint(0, 10));
    EXPECT_NEAR(points[points.size() / 2].x, 7.5, 0.3);
}

} // namespace
