#include "MenuLayout.h"

#include <gtest/gtest.h>

namespace {

constexpr MenuMargins kMargins = {14, 2, 20, 1};

TEST(MenuLayout, ItemsOfAColumnLieBelowEachOtherAndAreAllAsWideAsTheWidest) {
    const MenuLayout layout = lay_out_column({{30, 14}, {50, 18}, {10, 14}}, kMargins);

    ASSERT_EQ(3U, layout.frames.size());
    EXPECT_EQ(BRect(0, 0, 84, 17), layout.frames[0]);
    EXPECT_EQ(BRect(0, 18, 84, 39), layout.frames[1]);
    EXPECT_EQ(BRect(0, 40, 84, 57), layout.frames[2]);
    EXPECT_EQ(BRect(0, 0, 84, 57), layout.bounds);
}

TEST(MenuLayout, ShortcutsStandInAColumnOfTheirOwnBehindTheWidestContent) {
    const MenuLayout layout = lay_out_column({{30, 14, 40}, {50, 14}, {10, 14, 35}}, kMargins);

    EXPECT_EQ(14 + 50 + 18, layout.shortcutLeft);
    EXPECT_EQ(14 + 50 + 18 + 40 + 20, layout.bounds.right);
}

TEST(MenuLayout, AColumnIsAtLeastAsWideAsAskedAndShortcutsKeepToItsRight) {
    const MenuLayout layout = lay_out_column({{30, 14, 40}}, kMargins, 300);

    EXPECT_EQ(BRect(0, 0, 300, 17), layout.frames[0]);
    EXPECT_EQ(300 - 20 - 40, layout.shortcutLeft);
}

TEST(MenuLayout, FractionsOfPixelsAreRoundedUp) {
    const MenuLayout layout = lay_out_column({{30.2F, 13.5F}}, kMargins);

    EXPECT_EQ(BRect(0, 0, 65, 17), layout.bounds);
}

TEST(MenuLayout, ItemsOfARowLieSideBySideAndAreAllAsHighAsTheHighest) {
    const MenuLayout layout = lay_out_row({{30, 14}, {50, 18}}, {8, 2, 8, 2});

    ASSERT_EQ(2U, layout.frames.size());
    EXPECT_EQ(BRect(0, 0, 46, 22), layout.frames[0]);
    EXPECT_EQ(BRect(47, 0, 113, 22), layout.frames[1]);
    EXPECT_EQ(BRect(0, 0, 113, 22), layout.bounds);
}

TEST(MenuLayout, AMatrixKeepsItsFramesAndGrowsAroundThem) {
    const MenuLayout layout = lay_out_matrix({BRect(0, 0, 19, 19), BRect(30, 10, 149, 29)}, 100, 60);

    EXPECT_EQ(BRect(30, 10, 149, 29), layout.frames[1]);
    EXPECT_EQ(BRect(0, 0, 149, 60), layout.bounds);
}

TEST(MenuLayout, AMenuWithoutItemsStillHasASize) {
    EXPECT_EQ(BRect(0, 0, 15, 15), lay_out_column({}, kMargins).bounds);
    EXPECT_EQ(BRect(0, 0, 15, 15), lay_out_row({}, kMargins).bounds);
}

} // namespace
