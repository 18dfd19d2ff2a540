// A window's frame within its limits, and zooming.
#include "WindowGeometry.h"

#include <gtest/gtest.h>

TEST(WindowGeometry, ResizingStaysWithinTheLimits) {
    WindowGeometry geometry(BRect(10, 20, 109, 69));
    geometry.SetLimits({50, 200, 30, 90});
    geometry.ResizeTo(10, 500);
    EXPECT_EQ(geometry.Frame(), BRect(10, 20, 60, 110));
    geometry.ResizeTo(1000, 0);
    EXPECT_EQ(geometry.Frame(), BRect(10, 20, 210, 50));
}

TEST(WindowGeometry, WhatTheDesktopSaysIsTakenWhateverTheLimits) {
    WindowGeometry geometry(BRect(0, 0, 99, 99));
    geometry.SetLimits({50, 200, 50, 200});
    geometry.Accept(BRect(5, 5, 6, 6));
    EXPECT_EQ(geometry.Frame(), BRect(5, 5, 6, 6));
}

TEST(WindowGeometry, ContradictoryLimitsGiveWayToTheMinimum) {
    WindowGeometry geometry(BRect(0, 0, 99, 99));
    geometry.SetLimits({300, 100, 0, 1000000});
    EXPECT_EQ(geometry.SizeLimits().maxWidth, 300);
    EXPECT_EQ(geometry.SizeLimits().maxHeight, 1000000) << "as it was set";
    geometry.ResizeTo(200, 999999);
    EXPECT_EQ(geometry.Frame(), BRect(0, 0, 300, 32767));
}

TEST(WindowGeometry, ATitleAboveTheScreenIsBroughtIntoReach) {
    const WindowGeometry::Margins margins{1, 20, 1, 5};
    const struct {
        const char* what;
        BRect frame;
        std::vector<BRect> screens;
        BRect wanted;
    } cases[] = {
        {"at the very top", {0, 0, 99, 99}, {{0, 0, 1279, 1023}}, {0, 20, 99, 119}},
        {"too little of it", {30, 7, 129, 99}, {{0, 0, 1279, 1023}}, {30, 20, 129, 112}},
        {"enough of it", {30, 8, 129, 99}, {{0, 0, 1279, 1023}}, {30, 8, 129, 99}},
        {"all of it", {30, 20, 129, 99}, {{0, 0, 1279, 1023}}, {30, 20, 129, 99}},
        {"behind a panel", {30, 40, 129, 99}, {{0, 32, 1279, 1023}}, {30, 40, 129, 99}},
        {"wholly behind it", {30, 32, 129, 99}, {{0, 32, 1279, 1023}}, {30, 52, 129, 119}},
        {"on the screen above",
         {30, 1024, 129, 1099},
         {{0, 1024, 1279, 2047}, {0, 0, 1279, 1023}},
         {30, 1024, 129, 1099}},
        {"left of everything", {-300, 0, -200, 99}, {{0, 0, 1279, 1023}}, {-300, 20, -200, 119}},
        {"below everything", {30, 3000, 129, 3099}, {{0, 0, 1279, 1023}}, {30, 3000, 129, 3099}},
    };
    for (const auto& each : cases) {
        EXPECT_EQ(WindowGeometry::WithTitleInReach(each.frame, margins, each.screens), each.wanted)
            << each.what;
    }
    EXPECT_EQ(WindowGeometry::WithTitleInReach({0, 0, 9, 9}, {1, 1, 1, 1}, {{0, 0, 99, 99}}),
              BRect(0, 0, 9, 9))
        << "no title";
}

TEST(WindowGeometry, FramesLieOnWholePixels) {
    WindowGeometry geometry(BRect(10.4F, 20.6F, 99.5F, 88.2F));
    EXPECT_EQ(geometry.Frame(), BRect(10, 21, 100, 88));
    geometry.MoveTo(BPoint(-3.7F, 4.2F));
    EXPECT_EQ(geometry.Frame(), BRect(-4, 4, 86, 71));
}

TEST(WindowGeometry, ZoomingFillsTheScreenInsideItsMarginsAndBack) {
    WindowGeometry geometry(BRect(100, 100, 299, 199));
    const BRect screen(0, 0, 1279, 1023);
    const WindowGeometry::Margins margins{1, 20, 1, 5};
    const BRect zoomed = geometry.Zoomed(screen, margins);
    EXPECT_EQ(zoomed, BRect(1, 20, 1278, 1018));
    geometry.Accept(zoomed);
    EXPECT_EQ(geometry.Zoomed(screen, margins), BRect(100, 100, 299, 199));
}

TEST(WindowGeometry, AZoomLimitedInWidthGrowsDownwardsOnly) {
    WindowGeometry geometry(BRect(100, 100, 550, 300));
    geometry.SetLimits({450, 1000000, 200, 1000000});
    geometry.SetZoomLimits(450, 1000000);
    const BRect zoomed = geometry.Zoomed(BRect(0, 0, 1279, 1023), {1, 20, 1, 5});
    EXPECT_EQ(zoomed, BRect(100, 20, 550, 1018));
}

TEST(WindowGeometry, AZoomIsNoLargerThanTheSizeLimits) {
    WindowGeometry geometry(BRect(100, 100, 199, 199));
    geometry.SetLimits({0, 400, 0, 300});
    EXPECT_EQ(geometry.Zoomed(BRect(0, 0, 1279, 1023), {}), BRect(100, 100, 500, 400));
}
