#include "indexing/VolumeRowLayout.h"

#include <gtest/gtest.h>

namespace {

TEST(VolumeRowLayout, PartsLieAtTheirPlacesInTheRow) {
    const VolumeRowLayout layout(BRect(0, 0, 435, 20));

    EXPECT_EQ(layout.icon, BRect(20, 2, 35, 17));
    EXPECT_EQ(layout.name, BPoint(43, 15));
    EXPECT_EQ(layout.bar, BRect(132, 4, 203, 16));
    EXPECT_EQ(layout.unsupported, BPoint(132, 13));
    EXPECT_EQ(layout.status, BPoint(208, 13));
}

TEST(VolumeRowLayout, PartsMoveWithTheRow) {
    const VolumeRowLayout layout(BRect(10, 100, 445, 130));

    EXPECT_EQ(layout.icon, BRect(30, 102, 45, 117));
    EXPECT_EQ(layout.name, BPoint(53, 125));
    EXPECT_EQ(layout.bar, BRect(142, 104, 213, 126));
    EXPECT_EQ(layout.unsupported, BPoint(142, 123));
    EXPECT_EQ(layout.status, BPoint(218, 123));
}

TEST(BarFill, DividesTheBarAtTheProgress) {
    const BRect bar(132, 4, 203, 16);

    EXPECT_FALSE(BarFill(bar, 0.0f).filled.IsValid());
    EXPECT_EQ(BarFill(bar, 0.0f).empty, bar);
    EXPECT_EQ(BarFill(bar, 0.05f).filled, BRect(132, 4, 135, 16));
    EXPECT_EQ(BarFill(bar, 0.05f).empty, BRect(136, 4, 203, 16));
    EXPECT_EQ(BarFill(bar, 0.5f).filled, BRect(132, 4, 167, 16));
    EXPECT_EQ(BarFill(bar, 0.5f).empty, BRect(168, 4, 203, 16));
    EXPECT_EQ(BarFill(bar, 1.0f).filled, bar);
    EXPECT_FALSE(BarFill(bar, 1.0f).empty.IsValid());
}

TEST(BarFill, AnUnknownWholeFillsAllOfTheBar) {
    EXPECT_EQ(BarFill(BRect(132, 4, 203, 16), -1.0f).filled, BRect(132, 4, 203, 16));
    EXPECT_FALSE(BarFill(BRect(132, 4, 203, 16), -1.0f).empty.IsValid());
}

} // namespace
