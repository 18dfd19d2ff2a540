#include "RowPositions.h"

#include "support/random_seed.h"

#include <gtest/gtest.h>
#include <random>

namespace {

TEST(RowPositions, AreEmptyAtFirst) {
    const RowPositions positions;
    EXPECT_EQ(positions.CountRows(), 0);
    EXPECT_EQ(positions.TotalHeight(), 0);
    EXPECT_EQ(positions.RowAt(0), -1);
    EXPECT_EQ(positions.RowAt(-1), -1);
}

TEST(RowPositions, StackRowsOfDifferentHeights) {
    RowPositions positions;
    positions.Insert(0, {10, 20, 5});
    EXPECT_EQ(positions.CountRows(), 3);
    EXPECT_EQ(positions.TotalHeight(), 35);
    EXPECT_EQ(positions.TopOf(0), 0);
    EXPECT_EQ(positions.TopOf(1), 10);
    EXPECT_EQ(positions.TopOf(2), 30);
    EXPECT_EQ(positions.HeightOf(1), 20);
    struct {
        int64 y;
        int32 row;
    } const cases[] = {{-1, -1}, {0, 0}, {9, 0}, {10, 1}, {29, 1}, {30, 2}, {34, 2}, {35, -1}};
    for (const auto& [y, row] : cases) {
        EXPECT_EQ(positions.RowAt(y), row) << y;
    }
}

TEST(RowPositions, RowsMoveWhenOthersComeGoOrGrow) {
    RowPositions positions;
    positions.Insert(0, {10, 20});
    positions.Insert(1, {7, 8});
    EXPECT_EQ(positions.TopOf(1), 10);
    EXPECT_EQ(positions.TopOf(2), 17);
    EXPECT_EQ(positions.TopOf(3), 25);
    positions.SetHeight(1, 1);
    EXPECT_EQ(positions.TopOf(3), 19);
    positions.Remove(0, 2);
    EXPECT_EQ(positions.CountRows(), 2);
    EXPECT_EQ(positions.HeightOf(0), 8);
    EXPECT_EQ(positions.TopOf(1), 8);
    EXPECT_EQ(positions.TotalHeight(), 28);
    positions.Clear();
    EXPECT_EQ(positions.CountRows(), 0);
    EXPECT_EQ(positions.TotalHeight(), 0);
}

TEST(RowPositions, RowsWithoutHeightCoverNothing) {
    RowPositions positions;
    positions.Insert(0, {0, 4, 0, 0, 4});
    EXPECT_EQ(positions.RowAt(0), 1);
    EXPECT_EQ(positions.RowAt(4), 4);
}

TEST(RowPositions, HundredThousandRowsAreFoundExactly) {
    RowPositions positions;
    for (int i = 0; i < 100000; ++i) {
        positions.Insert(i, {i % 2 == 0 ? 16 : 33});
    }
    EXPECT_EQ(positions.TotalHeight(), 2450000);
    EXPECT_EQ(positions.TopOf(99999), 2449967);
    EXPECT_EQ(positions.RowAt(2449967), 99999);
    EXPECT_EQ(positions.RowAt(2449966), 99998);
    EXPECT_EQ(positions.TopOf(50001), 1225016);
}

// The same changes, done to a plain array.
TEST(RowPositions, AgreeWithAPlainArrayAfterRandomChanges) {
    const auto seed = RandomSeed();
    std::mt19937 random(seed);
    const auto below = [&](int32 limit) {
        return std::uniform_int_distribution<int32>(0, limit - 1)(random);
    };
    RowPositions positions;
    std::vector<int32> plain;
    for (int step = 0; step < 400; ++step) {
        const auto count = static_cast<int32>(plain.size());
        switch (below(4)) {
        case 0:
        case 1: {
            std::vector<int32> heights(static_cast<size_t>(1 + below(step % 20 == 0 ? 3000 : 20)));
            for (int32& height : heights) {
                height = below(40);
            }
            const int32 at = below(count + 1);
            positions.Insert(at, heights);
            plain.insert(plain.begin() + at, heights.begin(), heights.end());
            break;
        }
        case 2:
            if (count > 0) {
                const int32 at = below(count);
                const int32 removed = std::min(count - at, 1 + below(step % 10 == 0 ? 2500 : 50));
                positions.Remove(at, removed);
                plain.erase(plain.begin() + at, plain.begin() + at + removed);
            }
            break;
        default:
            if (count > 0) {
                const int32 at = below(count);
                plain[static_cast<size_t>(at)] = below(40);
                positions.SetHeight(at, plain[static_cast<size_t>(at)]);
            }
        }
        int64 total = 0;
        for (const int32 height : plain) {
            total += height;
        }
        ASSERT_EQ(positions.CountRows(), static_cast<int32>(plain.size())) << step;
        ASSERT_EQ(positions.TotalHeight(), total) << step;
    }
    int64 top = 0;
    for (size_t row = 0; row < plain.size(); ++row) {
        const auto index = static_cast<int32>(row);
        ASSERT_EQ(positions.TopOf(index), top) << row;
        ASSERT_EQ(positions.HeightOf(index), plain[row]) << row;
        if (plain[row] > 0) {
            ASSERT_EQ(positions.RowAt(top), index) << row;
            ASSERT_EQ(positions.RowAt(top + plain[row] - 1), index) << row;
        }
        top += plain[row];
    }
}

} // namespace
