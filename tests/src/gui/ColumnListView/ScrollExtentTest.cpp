#include "gui/ColumnListView/ScrollExtent.h"

#include <gtest/gtest.h>

namespace {

TEST(ScrollExtent, WhatShowsIsScrolledBackOntoTheContent) {
    const struct {
        const char* name;
        ScrollExtent extent;
        float expected;
    } kCases[] = {
        {"at the start", {0, 99, 0, 300}, 0},
        {"within the content", {120, 219, 0, 300}, 0},
        {"at its end", {201, 300, 0, 300}, 0},
        {"beyond its end", {250, 349, 0, 300}, -49},
        {"before its start", {-20, 79, 0, 300}, 20},
        {"beyond a content that is smaller than what shows", {30, 129, 0, 50}, -30},
        {"of a content that is smaller than what shows", {0, 99, 0, 50}, 0},
        {"beyond a content that starts elsewhere", {0, 99, -80, 40}, -59},
        {"empty content", {10, 109, 0, 0}, -10},
    };
    for (const auto& each : kCases) {
        EXPECT_EQ(ScrollBackOffset(each.extent), each.expected) << each.name;
    }
}

TEST(ScrollExtent, TheBarCoversTheContent) {
    const ScrollBarState state = BarStateOf({120, 219, 0, 396}, true);

    EXPECT_EQ(state.min, 0);
    EXPECT_EQ(state.max, 297);
    EXPECT_EQ(state.proportion, 0.25F);
    EXPECT_TRUE(state.IsScrollable());
}

TEST(ScrollExtent, ContentThatFitsCannotBeScrolled) {
    for (const float dataTo : {0.0F, 50.0F, 99.0F}) {
        for (const bool allowed : {true, false}) {
            const ScrollBarState state = BarStateOf({0, 99, 0, dataTo}, allowed);
            EXPECT_EQ(state.min, 0) << dataTo;
            EXPECT_EQ(state.max, 0) << dataTo;
            EXPECT_EQ(state.proportion, 1) << dataTo;
            EXPECT_FALSE(state.IsScrollable()) << dataTo;
        }
    }
}

TEST(ScrollExtent, WithoutScrollingTheBarReachesAsFarAsWhatShows) {
    // The content has shrunk under a view that shows its old end.
    const ScrollBarState state = BarStateOf({201, 300, 0, 150}, false);

    EXPECT_EQ(state.min, 0);
    EXPECT_EQ(state.max, 201);
    EXPECT_EQ(state.proportion, 99.0F / 300.0F);
}

TEST(ScrollExtent, TheContentNeedNotStartAtZero) {
    const ScrollBarState state = BarStateOf({-50, 49, -100, 200}, true);

    EXPECT_EQ(state.min, -100);
    EXPECT_EQ(state.max, 101);
    EXPECT_EQ(state.proportion, 99.0F / 300.0F);
}

TEST(ScrollExtent, AViewWithoutExtentShowsAllOfNothing) {
    const ScrollBarState state = BarStateOf({0, 0, 0, 0}, true);

    EXPECT_EQ(state.proportion, 1);
    EXPECT_FALSE(state.IsScrollable());
}

} // namespace
