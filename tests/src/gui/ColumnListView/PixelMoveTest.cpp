#include "gui/ColumnListView/PixelMove.h"

#include "support/random_seed.h"

#include <gtest/gtest.h>

#include <algorithm>
#include <random>

namespace {

constexpr BRect kView(0, 0, 199, 9);
constexpr BRect kNothing(0, 0, -1, -1);

TEST(PixelMove, GrowingMovesWhatLiesRightAndExposesTheNewPart) {
    const PixelMove move = PixelMoveFor(kView, 50, 10);

    EXPECT_EQ(move.source, BRect(51, 0, 188, 9));
    EXPECT_EQ(move.target, BRect(61, 0, 198, 9));
    EXPECT_EQ(move.exposed, BRect(51, 0, 60, 9));
    EXPECT_EQ(move.rightEdge, BRect(199, 0, 199, 9));
}

TEST(PixelMove, ShrinkingUncoversTheRightEdge) {
    const PixelMove move = PixelMoveFor(kView, 50, -10);

    EXPECT_EQ(move.source, BRect(51, 0, 198, 9));
    EXPECT_EQ(move.target, BRect(41, 0, 188, 9));
    EXPECT_EQ(move.exposed, BRect(189, 0, 199, 9));
    EXPECT_EQ(move.rightEdge, kNothing);
}

TEST(PixelMove, WhatIsScrolledOutToTheLeftCannotBeCopied) {
    const PixelMove move = PixelMoveFor(BRect(100, 0, 299, 9), 50, 10);

    EXPECT_EQ(move.source, BRect(100, 0, 288, 9));
    EXPECT_EQ(move.target, BRect(110, 0, 298, 9));
    EXPECT_EQ(move.exposed, BRect(100, 0, 109, 9));
}

TEST(PixelMove, WhereNothingCanBeCopiedEverythingIsDrawn) {
    EXPECT_EQ(PixelMoveFor(kView, 50, 500).target, kNothing);
    EXPECT_EQ(PixelMoveFor(kView, 50, 500).exposed, BRect(51, 0, 199, 9));
    EXPECT_EQ(PixelMoveFor(kView, 50.5F, 10).target, kNothing) << "half a pixel cannot be moved";
    EXPECT_EQ(PixelMoveFor(kView, 50.5F, 10).exposed, BRect(51, 0, 199, 9));
    EXPECT_EQ(PixelMoveFor(kView, 50, -9.5F).exposed, BRect(41, 0, 199, 9));
    EXPECT_FALSE(PixelMoveFor(kView, 300, 10).exposed.IsValid()) << "the column lies beyond what shows";
    EXPECT_FALSE(PixelMoveFor(kView, 300, 10).target.IsValid());
}

TEST(PixelMove, EachPixelIsEitherMovedOrDrawnAnew) {
    std::mt19937_64 random(RandomSeed());
    const auto among = [&](int from, int to) {
        return from + static_cast<int>(random() % static_cast<uint64>(to - from + 1));
    };
    for (int round = 0; round < 2000; ++round) {
        const int left = among(0, 60);
        const int right = left + among(0, 80);
        const int oldEnd = among(0, 150);
        const int growth = among(-oldEnd, 100);
        const PixelMove move = PixelMoveFor(BRect(static_cast<float>(left), 0, static_cast<float>(right), 0),
                                            static_cast<float>(oldEnd), static_cast<float>(growth));
        const auto holds = [](const BRect& rect, int x) {
            return rect.IsValid() && rect.Contains(BPoint(static_cast<float>(x), 0));
        };
        for (int x = left; x <= right; ++x) {
            const bool stays = x <= std::min(oldEnd, oldEnd + growth);
            const bool drawn = holds(move.exposed, x) || holds(move.rightEdge, x);
            const bool moved = holds(move.target, x);
            if (moved) {
                EXPECT_GT(x, oldEnd + growth);
                EXPECT_TRUE(holds(move.source, x - growth));
                EXPECT_GT(x - growth, oldEnd);
                EXPECT_GE(x - growth, left);
                EXPECT_LT(x - growth, right);
            }
            EXPECT_TRUE(moved || drawn || stays || growth == 0)
                << "pixel " << x << " of " << left << " .. " << right << ", " << oldEnd << " + " << growth;
            EXPECT_FALSE(moved && drawn);
        }
    }
}

} // namespace
