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
    EXPECT_EQ(geometry.SizeLimits().maxHeight, 32767);
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
