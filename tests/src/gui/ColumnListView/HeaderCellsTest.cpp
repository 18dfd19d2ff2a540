#include "gui/ColumnListView/HeaderCells.h"

#include "ColumnOrder.h"

#include <gtest/gtest.h>

namespace {

constexpr unsigned long kHidden = CLV_COLUMN_HIDDEN;
constexpr unsigned long kMerge = CLV_COLUMN_MERGE_WITH_RIGHT;

// One line as text: "w 0,0 49,0".
std::vector<std::string> Show(const std::vector<HeaderLine>& lines) {
    std::vector<std::string> shown;
    const auto place = [](BPoint point) {
        return " " + std::to_string(static_cast<int>(point.x)) + "," +
               std::to_string(static_cast<int>(point.y));
    };
    for (const HeaderLine& line : lines) {
        const char* const color = line.color == kHeaderLight    ? "light"
                                  : line.color == kHeaderShadow ? "shadow"
                                  : line.color == kHeaderBlue   ? "blue"
                                                                : "other";
        shown.push_back(color + place(line.from) + place(line.to));
    }
    return shown;
}

typedef std::vector<std::string> Lines;

TEST(HeaderCells, ShownColumnsHaveCellsAsHighAsTheHeader) {
    ColumnOrder columns{{50}, {30, kHidden}, {20}};
    const auto cells = HeaderCellsOf(columns.order, BRect(7, 0, 200, 15));

    ASSERT_EQ(cells.size(), 2U);
    EXPECT_EQ(cells[0].column, &columns[0]);
    EXPECT_EQ(cells[0].frame, BRect(0, 0, 50, 15));
    EXPECT_EQ(cells[1].column, &columns[2]);
    EXPECT_EQ(cells[1].frame, BRect(51, 0, 71, 15));
}

TEST(HeaderCells, CellsMergeWithTheNextShownOne) {
    const struct {
        const char* name;
        std::initializer_list<ColumnOrder::Column> columns;
        std::vector<bool> merged;
    } kCases[] = {
        {"none", {{50}, {50}}, {false, false}},
        {"the first", {{50, kMerge}, {50}}, {true, false}},
        {"all but the last, which has no next", {{50, kMerge}, {50, kMerge}}, {true, false}},
        {"past a hidden one that merges too", {{50, kMerge}, {50, kMerge | kHidden}, {50}}, {true, false}},
        {"not past another hidden one", {{50, kMerge}, {50, kHidden}, {50}}, {false, false}},
        {"with nothing shown behind", {{50, kMerge}, {50, kMerge | kHidden}}, {false}},
        {"hidden itself", {{50, kMerge | kHidden}, {50}}, {false}},
    };
    for (const auto& each : kCases) {
        const ColumnOrder columns(each.columns);
        const auto cells = HeaderCellsOf(columns.order, BRect(0, 0, 200, 15));
        ASSERT_EQ(cells.size(), each.merged.size()) << each.name;
        for (size_t i = 0; i < cells.size(); ++i) {
            EXPECT_EQ(cells[i].merged, each.merged[i]) << each.name << ", cell " << i;
            EXPECT_EQ(cells[i].merged_with_left, i > 0 && each.merged[i - 1]) << each.name << ", cell " << i;
        }
    }
}

TEST(HeaderCells, ACellIsLitFromTheLeftTop) {
    HeaderCell cell;
    cell.frame = BRect(51, 0, 100, 15);

    EXPECT_EQ(Show(LinesOf(cell, false)),
              (Lines{"light 51,0 99,0", "light 51,1 51,15", "shadow 52,15 99,15", "shadow 100,0 100,15"}));
}

TEST(HeaderCells, MergedCellsShareTheirLines) {
    HeaderCell left;
    left.frame = BRect(0, 0, 20, 15);
    left.merged = true;
    HeaderCell middle;
    middle.frame = BRect(21, 0, 40, 15);
    middle.merged = true;
    middle.merged_with_left = true;
    HeaderCell right;
    right.frame = BRect(41, 0, 60, 15);
    right.merged_with_left = true;

    EXPECT_EQ(Show(LinesOf(left, false)), (Lines{"light 0,0 20,0", "light 0,1 0,15", "shadow 1,15 20,15"}));
    EXPECT_EQ(Show(LinesOf(middle, false)), (Lines{"light 21,0 40,0", "shadow 21,15 40,15"}));
    EXPECT_EQ(Show(LinesOf(right, false)),
              (Lines{"light 41,0 59,0", "shadow 41,15 59,15", "shadow 60,0 60,15"}));
}

TEST(HeaderCells, TheBorderThatIsDraggedIsBlueEvenBetweenMergedCells) {
    HeaderCell cell;
    cell.frame = BRect(0, 0, 20, 15);
    EXPECT_EQ(Show(LinesOf(cell, true)),
              (Lines{"light 0,0 19,0", "light 0,1 0,15", "shadow 1,15 19,15", "blue 20,0 20,15"}));

    cell.merged = true;
    EXPECT_EQ(Show(LinesOf(cell, true)),
              (Lines{"light 0,0 19,0", "light 0,1 0,15", "shadow 1,15 20,15", "blue 20,0 20,15"}));
}

TEST(HeaderCells, WhatIsLeftOfTheHeaderIsACellWithoutEnd) {
    HeaderCell last;
    last.frame = BRect(51, 0, 100, 15);

    EXPECT_EQ(Show(LinesBehind(&last, BRect(0, 0, 200, 15))),
              (Lines{"light 101,0 200,0", "light 101,1 101,15", "shadow 102,15 200,15"}));
    EXPECT_EQ(Show(LinesBehind(nullptr, BRect(0, 0, 200, 15))),
              (Lines{"light 0,0 200,0", "light 0,1 0,15", "shadow 1,15 200,15"}));
    last.merged = true;
    EXPECT_EQ(Show(LinesBehind(&last, BRect(0, 0, 200, 15))),
              (Lines{"light 101,0 200,0", "light 101,1 101,15", "shadow 101,15 200,15"}));
}

TEST(HeaderCells, NothingIsDrawnWhereNoSpaceIsLeft) {
    HeaderCell last;
    last.frame = BRect(51, 0, 100, 15);

    EXPECT_EQ(Show(LinesBehind(&last, BRect(0, 0, 100, 15))), Lines());
    EXPECT_EQ(Show(LinesBehind(&last, BRect(0, 0, 101, 15))),
              (Lines{"light 101,0 101,0", "light 101,1 101,15"}));
}

} // namespace
