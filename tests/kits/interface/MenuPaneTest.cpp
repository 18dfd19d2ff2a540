#include "MenuPane.h"

#include <gtest/gtest.h>

namespace {

using Zone = MenuPane::Zone;

TEST(MenuPane, AMenuThatFitsShowsAllItsItemsWithinTheBorder) {
    const MenuPane pane(BRect(100, 50, 204, 154), 100);

    EXPECT_FALSE(pane.Scrolls());
    EXPECT_EQ(BRect(102, 52, 202, 152), pane.ItemArea());
    EXPECT_FALSE(pane.UpStrip().IsValid());
    EXPECT_EQ(0, pane.GreatestOffset());
    EXPECT_EQ(104, MenuPane::OuterSide(100));
}

TEST(MenuPane, PointsBecomeThoseOfTheMenuAndBack) {
    const MenuPane pane(BRect(100, 50, 204, 154), 100);

    EXPECT_EQ(BPoint(0, 0), pane.ToMenu(BPoint(102, 52)));
    EXPECT_EQ(BRect(102, 69, 202, 85), pane.ToScreen(BRect(0, 17, 100, 33)));
}

TEST(MenuPane, ABarHasNoBorder) {
    const MenuPane pane(BRect(10, 10, 309, 30), 20, MenuPane::Border::None);

    EXPECT_EQ(BRect(10, 10, 309, 30), pane.ItemArea());
    EXPECT_EQ(Zone::Items, pane.ZoneAt(BPoint(10, 10)));
}

TEST(MenuPane, AMenuHigherThanItsPlaceHasStripsAboveAndBelowItsItems) {
    const MenuPane pane(BRect(0, 0, 104, 103), 300);

    EXPECT_TRUE(pane.Scrolls());
    EXPECT_EQ(BRect(2, 2, 102, 14), pane.UpStrip());
    EXPECT_EQ(BRect(2, 15, 102, 88), pane.ItemArea());
    EXPECT_EQ(BRect(2, 89, 102, 101), pane.DownStrip());
    EXPECT_EQ(300 - 73, pane.GreatestOffset());
}

TEST(MenuPane, EveryPointBelongsToOneZone) {
    const MenuPane pane(BRect(0, 0, 104, 103), 300);

    EXPECT_EQ(Zone::Outside, pane.ZoneAt(BPoint(105, 50)));
    EXPECT_EQ(Zone::Border, pane.ZoneAt(BPoint(1, 50)));
    EXPECT_EQ(Zone::ScrollUp, pane.ZoneAt(BPoint(50, 14)));
    EXPECT_EQ(Zone::Items, pane.ZoneAt(BPoint(50, 15)));
    EXPECT_EQ(Zone::ScrollDown, pane.ZoneAt(BPoint(50, 89)));
}

TEST(MenuPane, ScrollingEndsAtBothEnds) {
    MenuPane pane(BRect(0, 0, 104, 103), 300);

    EXPECT_FALSE(pane.ScrollBy(-10));
    EXPECT_TRUE(pane.ScrollBy(1000));
    EXPECT_EQ(227, pane.Offset());
    EXPECT_FALSE(pane.ScrollBy(1));
    EXPECT_EQ(BPoint(0, 227), pane.ToMenu(BPoint(2, 15)));
}

TEST(MenuPane, RevealingScrollsAsLittleAsItTakes) {
    MenuPane pane(BRect(0, 0, 104, 103), 300);

    EXPECT_FALSE(pane.Reveal(BRect(0, 0, 100, 16)));
    EXPECT_TRUE(pane.Reveal(BRect(0, 85, 100, 101)));
    EXPECT_EQ(101 - 73, pane.Offset());
    EXPECT_TRUE(pane.Reveal(BRect(0, 17, 100, 33)));
    EXPECT_EQ(17, pane.Offset());
}

TEST(MenuPane, AMenuThatFitsDoesNotScroll) {
    MenuPane pane(BRect(0, 0, 104, 104), 100);

    EXPECT_FALSE(pane.ScrollBy(10));
    EXPECT_EQ(0, pane.Offset());
}

} // namespace
