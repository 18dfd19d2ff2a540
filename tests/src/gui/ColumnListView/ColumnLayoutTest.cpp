#include "gui/ColumnListView/ColumnLayout.h"

#include "ColumnOrder.h"

#include <gtest/gtest.h>

namespace {

TEST(ColumnLayout, ColumnsLieBesideEachOtherFromTheLeftEdge) {
    ColumnOrder columns{{50}, {100}, {20}};

    EXPECT_EQ(columns[0].ColumnBegin(), 0);
    EXPECT_EQ(columns[0].ColumnEnd(), 50);
    EXPECT_EQ(columns[1].ColumnBegin(), 51);
    EXPECT_EQ(columns[1].ColumnEnd(), 151);
    EXPECT_EQ(columns[2].ColumnBegin(), 152);
    EXPECT_EQ(columns[2].ColumnEnd(), 172);
    EXPECT_EQ(columns.dataWidth, 172);
}

TEST(ColumnLayout, HiddenColumnsTakeNoPlace) {
    ColumnOrder columns{{50}, {100, CLV_COLUMN_HIDDEN}, {20}};

    EXPECT_EQ(columns[2].ColumnBegin(), 51);
    EXPECT_EQ(columns.dataWidth, 71);
}

TEST(ColumnLayout, WithoutAShownColumnThereIsNoWidth) {
    EXPECT_EQ(ColumnOrder({}).dataWidth, 0);
    EXPECT_EQ(ColumnOrder({{50, CLV_COLUMN_HIDDEN}}).dataWidth, 0);
}

TEST(ColumnLayout, TheExpanderPushesTheFirstShownColumnBehindItAndWhatPassesThePushOn) {
    const unsigned long kExpander = CLV_COLUMN_EXPANDER;
    const unsigned long kPass = CLV_COLUMN_PUSH_PASS;
    const unsigned long kHidden = CLV_COLUMN_HIDDEN;
    const struct {
        const char* name;
        std::initializer_list<ColumnOrder::Column> columns;
        std::vector<bool> pushed;
    } kCases[] = {
        {"no expander", {{30}, {30, kPass}}, {false, false}},
        {"the first behind it", {{30}, {20, kExpander}, {30}, {30}}, {false, false, true, false}},
        {"passed on", {{20, kExpander}, {30, kPass}, {30}, {30}}, {false, true, true, false}},
        {"to the end", {{20, kExpander}, {30, kPass}, {30, kPass}}, {false, true, true}},
        {"past a hidden one", {{20, kExpander}, {30, kHidden}, {30}, {30}}, {false, true, true, false}},
        {"by none that is hidden", {{20, kExpander | kHidden}, {30}}, {false, false}},
    };
    for (const auto& each : kCases) {
        ColumnOrder columns(each.columns);
        for (size_t i = 0; i < each.pushed.size(); ++i) {
            EXPECT_EQ(columns[i].IsPushedByExpander(), each.pushed[i]) << each.name << ", column " << i;
        }
    }
}

TEST(ColumnLayout, ThePushEndsWithTheLastColumnThatIsTheExpanderOrPushed) {
    EXPECT_EQ(PushLimit(ColumnOrder({{30}, {40}}).order, 300), 300);
    EXPECT_EQ(PushLimit(ColumnOrder({{20, CLV_COLUMN_EXPANDER}}).order, 300), 20);
    EXPECT_EQ(PushLimit(ColumnOrder({{20, CLV_COLUMN_EXPANDER}, {30}, {40}}).order, 300), 51);
    EXPECT_EQ(
        PushLimit(ColumnOrder({{20, CLV_COLUMN_EXPANDER}, {30, CLV_COLUMN_PUSH_PASS}, {40}}).order, 300), 92);
}

TEST(ColumnLayout, AHiddenColumnDoesNotLimitThePush) {
    const unsigned long kPass = CLV_COLUMN_PUSH_PASS;
    EXPECT_EQ(
        PushLimit(ColumnOrder({{20, CLV_COLUMN_EXPANDER}, {30, kPass}, {40, CLV_COLUMN_HIDDEN}}).order, 300),
        51);
    EXPECT_EQ(PushLimit(ColumnOrder({{20, CLV_COLUMN_EXPANDER | CLV_COLUMN_HIDDEN}, {30}}).order, 300), 300);
}

TEST(ColumnLayout, OnlyTheExpanderAndWhatItPushesAreShiftedByTheLevel) {
    ColumnOrder columns{{30}, {20, CLV_COLUMN_EXPANDER}, {30}, {30}};

    EXPECT_EQ(ExpanderShiftOf(columns[0], 2), 0);
    EXPECT_EQ(ExpanderShiftOf(columns[1], 2), 40);
    EXPECT_EQ(ExpanderShiftOf(columns[2], 2), 40);
    EXPECT_EQ(ExpanderShiftOf(columns[2], 0), 0);
    EXPECT_EQ(ExpanderShiftOf(columns[3], 2), 0);
}

TEST(ColumnLayout, TheExpandersCellGrowsAndPushedCellsMoveUpToTheLimit) {
    // The expander 0 .. 20, A 21 .. 71, B 72 .. 122, then a column that is not pushed.
    ColumnOrder columns{{20, CLV_COLUMN_EXPANDER}, {50, CLV_COLUMN_PUSH_PASS}, {50}, {50}};
    const struct {
        size_t column;
        float shift;
        CellSpan expected;
    } kCases[] = {
        {0, 0, {0, 20}},    {0, 40, {0, 60}},  {0, 200, {0, 122}}, {1, 0, {21, 71}},    {1, 40, {61, 111}},
        {1, 60, {81, 122}}, {2, 0, {72, 122}}, {2, 20, {92, 122}}, {2, 60, {132, 122}}, {3, 0, {123, 173}},
    };
    for (const auto& each : kCases) {
        EXPECT_EQ(SpanOfCell(columns[each.column], each.shift, 122), each.expected)
            << "column " << each.column << ", shift " << each.shift;
    }
    EXPECT_FALSE(SpanOfCell(columns[2], 40, 122).IsEmpty());
    EXPECT_TRUE(SpanOfCell(columns[2], 60, 122).IsEmpty()) << "nothing is left of it";
}

TEST(ColumnLayout, ACellsWidthFollowsFromItsColumns) {
    ColumnOrder columns{{20, CLV_COLUMN_EXPANDER}, {50, CLV_COLUMN_PUSH_PASS}, {50}, {50}};
    const struct {
        const char* name;
        size_t column;
        float shift;
        float expected;
    } kCases[] = {
        {"neither expander nor pushed", 3, 40, 50}, {"the expander", 0, 0, 20},
        {"the expander grows", 0, 40, 60},          {"but not past the limit", 0, 200, 122},
        {"pushed, with room", 1, 40, 50},           {"pushed against the limit", 1, 60, 41},
        {"the last one pushed", 2, 20, 30},         {"pushed out", 2, 200, 0},
    };
    for (const auto& each : kCases) {
        EXPECT_EQ(WidthOfCell(columns[each.column], columns[each.column].Width(), each.shift, 122),
                  each.expected)
            << each.name;
    }
}

} // namespace
