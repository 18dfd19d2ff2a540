#include "MenuPlacement.h"

#include <gtest/gtest.h>

namespace {

const BRect kScreen(0, 0, 1023, 767);

TEST(MenuPlacement, APopUpLiesWhereItIsWanted) {
    EXPECT_EQ(BRect(100, 200, 180, 260), pop_up_frame(BPoint(100, 200), 80, 60, kScreen));
}

TEST(MenuPlacement, APopUpIsMovedOntoTheScreen) {
    EXPECT_EQ(BRect(943, 707, 1023, 767), pop_up_frame(BPoint(1000, 740), 80, 60, kScreen));
    EXPECT_EQ(BRect(0, 0, 80, 60), pop_up_frame(BPoint(-30, -4), 80, 60, kScreen));
}

TEST(MenuPlacement, APopUpHigherThanTheScreenGetsTheScreensHeight) {
    EXPECT_EQ(BRect(100, 0, 180, 767), pop_up_frame(BPoint(100, 200), 80, 5000, kScreen));
}

TEST(MenuPlacement, AMenuWiderThanTheScreenShowsItsLeftPart) {
    EXPECT_EQ(BRect(0, 10, 2000, 70), pop_up_frame(BPoint(50, 10), 2000, 60, kScreen));
}

TEST(MenuPlacement, ScreensThatDoNotBeginAtZeroAreKeptToo) {
    EXPECT_EQ(BRect(1024, 100, 1104, 160),
              pop_up_frame(BPoint(1000, 100), 80, 60, BRect(1024, 0, 2047, 767)));
}

TEST(MenuPlacement, ABarsMenuOpensBelowItsTitle) {
    EXPECT_EQ(BRect(40, 21, 140, 121), frame_below_item(BRect(40, 0, 80, 20), 100, 100, kScreen));
}

TEST(MenuPlacement, ABarsMenuOpensAboveItsTitleAtTheScreensBottom) {
    EXPECT_EQ(BRect(40, 599, 140, 699), frame_below_item(BRect(40, 700, 80, 720), 100, 100, kScreen));
}

TEST(MenuPlacement, ABarsMenuThatFitsNeitherBelowNorAboveIsMovedOverItsTitle) {
    EXPECT_EQ(BRect(40, 67, 140, 767), frame_below_item(BRect(40, 400, 80, 420), 100, 700, kScreen));
}

TEST(MenuPlacement, ASubmenuOpensToTheRightWithItsFirstItemBesideItsTitle) {
    EXPECT_EQ(BRect(201, 98, 301, 198), frame_beside_item(BRect(100, 100, 200, 116), 100, 100, 2, kScreen));
}

TEST(MenuPlacement, ASubmenuOpensToTheLeftAtTheScreensRightEdge) {
    EXPECT_EQ(BRect(799, 98, 899, 198), frame_beside_item(BRect(900, 100, 1000, 116), 100, 100, 2, kScreen));
}

TEST(MenuPlacement, ASubmenuIsMovedUpAtTheScreensBottom) {
    EXPECT_EQ(BRect(201, 667, 301, 767), frame_beside_item(BRect(100, 740, 200, 756), 100, 100, 2, kScreen));
}

TEST(MenuPlacement, APointerOnItsWayToASubmenuMakesForIt) {
    const BRect menu(200, 100, 300, 300);

    EXPECT_TRUE(makes_for_menu(BPoint(100, 108), BPoint(104, 112), menu));
    EXPECT_TRUE(makes_for_menu(BPoint(100, 108), BPoint(104, 108), menu));
    // Straight down, back, and up past the menu's corner are other ways.
    EXPECT_FALSE(makes_for_menu(BPoint(100, 108), BPoint(100, 112), menu));
    EXPECT_FALSE(makes_for_menu(BPoint(100, 108), BPoint(96, 110), menu));
    EXPECT_FALSE(makes_for_menu(BPoint(100, 108), BPoint(104, 100), menu));
}

TEST(MenuPlacement, APointerMakesForASubmenuToTheLeftToo) {
    const BRect menu(200, 100, 300, 300);

    EXPECT_TRUE(makes_for_menu(BPoint(400, 108), BPoint(396, 112), menu));
    EXPECT_FALSE(makes_for_menu(BPoint(400, 108), BPoint(404, 112), menu));
    EXPECT_FALSE(makes_for_menu(BPoint(400, 108), BPoint(396, 100), menu));
}

TEST(MenuPlacement, APointerWithinTheSubmenusColumnsMakesForNothing) {
    EXPECT_FALSE(makes_for_menu(BPoint(250, 90), BPoint(252, 95), BRect(200, 100, 300, 300)));
}

} // namespace
