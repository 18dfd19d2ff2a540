#include "gui/ColumnListView/ArrowBitmaps.h"

#include "widgets/PrefilledBitmap.h"

#include <gtest/gtest.h>
#include <string>
#include <vector>

namespace {

typedef std::vector<std::string> Picture;

// Edge '#', inside 'o', what is transparent '.'.
Picture Show(const uint8* data) {
    const PrefilledBitmap bitmap(BRect(0, 0, 10, 10), B_CMAP8, data, false, false);
    EXPECT_EQ(132, bitmap.BitsLength());
    Picture rows;
    for (int32 y = 0; y < 11; ++y) {
        std::string row;
        for (int32 x = 0; x < 11; ++x) {
            const uint8 pixel = static_cast<const uint8*>(bitmap.Bits())[y * bitmap.BytesPerRow() + x];
            row += pixel == 0xFF ? '.' : pixel == 8 ? '#' : 'o';
        }
        rows.push_back(row);
    }
    return rows;
}

} // namespace

TEST(ArrowBitmaps, ThatOfACollapsedRowPointsToTheRight) {
    const Picture expected = {
        "...#.......", //
        "...##......", //
        "...#o#.....", //
        "...#oo#....", //
        "...#ooo#...", //
        "...#oooo#..", //
        "...#ooo#...", //
        "...#oo#....", //
        "...#o#.....", //
        "...##......", //
        "...#.......",
    };
    EXPECT_EQ(expected, Show(CLVRightArrowData));
}

TEST(ArrowBitmaps, ThatOfAnExpandedRowPointsDown) {
    const Picture expected = {
        "...........", //
        "...........", //
        "...........", //
        "###########", //
        ".#ooooooo#.", //
        "..#ooooo#..", //
        "...#ooo#...", //
        "....#o#....", //
        ".....#.....", //
        "...........", //
        "...........",
    };
    EXPECT_EQ(expected, Show(CLVDownArrowData));
}
