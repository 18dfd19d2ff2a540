#include "gui/ColumnListView/DragGroups.h"

#include "ColumnOrder.h"

#include <gtest/gtest.h>

namespace {

constexpr unsigned long kHidden = CLV_COLUMN_HIDDEN;
constexpr unsigned long kFixed = CLV_COLUMN_NOT_MOVABLE;
constexpr unsigned long kStart = CLV_COLUMN_LOCK_AT_START;
constexpr unsigned long kEnd = CLV_COLUMN_LOCK_AT_END;
constexpr unsigned long kBound = CLV_COLUMN_LOCK_WITH_RIGHT;

DragGroups GroupsOf(const ColumnOrder& columns) {
    DragGroups groups;
    groups.Rebuild(columns.order);
    return groups;
}

// The labels from left to right.
std::string Names(const BList& order) {
    std::string names;
    for (int32 i = 0; i < order.CountItems(); ++i) {
        names += static_cast<const CLVColumn*>(order.ItemAt(i))->GetLabel();
    }
    return names;
}

TEST(DragGroups, EachColumnIsAGroupUnlessItIsBoundToTheNext) {
    ColumnOrder columns{{50}, {30, kBound}, {40}, {20}};
    const DragGroups groups = GroupsOf(columns);

    ASSERT_EQ(groups.CountGroups(), 3);
    EXPECT_EQ(groups.GroupAt(0).group_start_display_index, 0);
    EXPECT_EQ(groups.GroupAt(0).group_stop_display_index, 0);
    EXPECT_EQ(groups.GroupAt(1).group_start_display_index, 1);
    EXPECT_EQ(groups.GroupAt(1).group_stop_display_index, 2);
    EXPECT_EQ(groups.GroupAt(1).group_begin, 51);
    EXPECT_EQ(groups.GroupAt(1).group_end, 122);
    EXPECT_EQ(groups.GroupAt(1).last_column_shown, &columns[2]);
    EXPECT_TRUE(groups.GroupAt(1).shown);
    EXPECT_EQ(groups.GroupAt(2).group_begin, 123);
    EXPECT_EQ(groups.IndexOfGroup(columns.order, &columns[2]), 1);
    EXPECT_EQ(groups.IndexOfGroup(columns.order, &columns[3]), 2);
    const CLVColumn stranger("X", 50, 0, 4);
    EXPECT_EQ(groups.IndexOfGroup(columns.order, &stranger), -1);
}

TEST(DragGroups, HiddenMembersOfARunMoveAlongWithoutASpan) {
    ColumnOrder columns{{50, kBound | kHidden}, {30, kBound}, {40, kHidden}, {20}};
    const DragGroups groups = GroupsOf(columns);

    ASSERT_EQ(groups.CountGroups(), 2);
    EXPECT_EQ(groups.GroupAt(0).group_start_display_index, 0);
    EXPECT_EQ(groups.GroupAt(0).group_stop_display_index, 2);
    EXPECT_EQ(groups.GroupAt(0).group_begin, 0);
    EXPECT_EQ(groups.GroupAt(0).group_end, 30);
    EXPECT_EQ(groups.GroupAt(0).last_column_shown, &columns[1]);
    EXPECT_EQ(Names(groups.OrderWithGroupAt(columns.order, 0, 2)), "DABC");
}

TEST(DragGroups, AGroupWithoutAShownColumnLiesNowhere) {
    ColumnOrder columns{{50, kBound | kHidden}, {30, kHidden}};
    const DragGroup group = GroupsOf(columns).GroupAt(0);

    EXPECT_FALSE(group.shown);
    EXPECT_EQ(group.group_begin, -1);
    EXPECT_EQ(group.group_end, -1);
    EXPECT_EQ(group.last_column_shown, nullptr);
}

TEST(DragGroups, TheLastColumnMayBeBoundToNothing) {
    ColumnOrder columns{{50}, {30, kBound}};

    EXPECT_EQ(GroupsOf(columns).CountGroups(), 2);
}

TEST(DragGroups, AGroupCollectsTheConstraintsOfItsColumns) {
    const unsigned long kOther = CLV_COLUMN_SORTABLE | CLV_COLUMN_MERGE_WITH_RIGHT;
    const struct {
        unsigned long first;
        unsigned long second;
        bool allBefore;
        bool allAfter;
        unsigned long flags;
    } kCases[] = {
        {0, 0, false, false, 0},
        {kStart, kStart, true, false, kStart},
        {kStart, 0, false, false, kStart},
        {0, kStart, false, false, kStart},
        {kEnd, kEnd, false, true, kEnd},
        {kEnd, kFixed, false, false, kEnd | kFixed},
        {kStart | kEnd, kStart | kEnd, true, true, kStart | kEnd},
        {kOther, kOther, false, false, 0},
    };
    for (const auto& each : kCases) {
        const ColumnOrder columns{{50, each.first | kBound}, {50, each.second}};
        const DragGroup group = GroupsOf(columns).GroupAt(0);
        EXPECT_EQ(group.all_lock_before, each.allBefore) << each.first << " " << each.second;
        EXPECT_EQ(group.all_lock_after, each.allAfter) << each.first << " " << each.second;
        EXPECT_EQ(group.flags, each.flags) << each.first << " " << each.second;
    }
}

TEST(DragGroups, NeighboursAreTheNextGroupsThatAreShown) {
    const ColumnOrder columns{{50}, {50, kHidden}, {50}, {50, kHidden}, {50}};
    const DragGroups groups = GroupsOf(columns);

    EXPECT_EQ(groups.LimitsOf(2).previous, 0);
    EXPECT_EQ(groups.LimitsOf(2).next, 4);
    EXPECT_EQ(groups.LimitsOf(0).previous, -1);
    EXPECT_EQ(groups.LimitsOf(4).next, -1);
    EXPECT_EQ(groups.LimitsOf(-1).group, -1);
    EXPECT_EQ(groups.LimitsOf(-1).next, -1);
}

TEST(DragGroups, LocksKeepGroupsAtBothEnds) {
    const struct {
        const char* name;
        unsigned long left;
        unsigned long right;
        bool allowed;
    } kCases[] = {
        {"free", 0, 0, true},
        {"not before those locked at the start", kStart, 0, false},
        {"those at the start among themselves", kStart, kStart, true},
        {"nothing between what is locked at the start", 0, kStart, true},
        {"not behind those locked at the end", 0, kEnd, false},
        {"those at the end among themselves", kEnd, kEnd, true},
        {"back to the end", kEnd, 0, true},
        {"the two ends", kStart, kEnd, false},
        {"not movable is another matter", kFixed, kFixed, true},
    };
    for (const auto& each : kCases) {
        const ColumnOrder columns{{50, each.left}, {50, each.right}};
        const DragGroups groups = GroupsOf(columns);
        EXPECT_EQ(groups.LimitsOf(1).previous, each.allowed ? 0 : -1) << each.name;
        EXPECT_EQ(groups.LimitsOf(0).next, each.allowed ? 1 : -1) << each.name;
        EXPECT_EQ(groups.LimitsOf(1).snap_before >= 0, each.allowed) << each.name;
        EXPECT_EQ(groups.LimitsOf(0).snap_after >= 0, each.allowed) << each.name;
    }
}

TEST(DragGroups, ARunThatIsLockedInPartIsHeldButDoesNotPassLockedGroups) {
    // A stays at the start; B and C are bound, and only B is locked.
    const ColumnOrder columns{{50, kStart}, {50, kStart | kBound}, {50}, {50}};
    const DragGroups groups = GroupsOf(columns);

    EXPECT_EQ(groups.LimitsOf(1).previous, -1);
    EXPECT_EQ(groups.LimitsOf(1).next, -1);
    EXPECT_EQ(groups.LimitsOf(0).next, -1);
}

TEST(DragGroups, GroupsSwapWhereTheDraggedOneWouldComeToLie) {
    // A 0 .. 100, B 101 .. 131, C 132 .. 332.
    const ColumnOrder columns{{100}, {30}, {200}};
    const DragGroups groups = GroupsOf(columns);

    EXPECT_EQ(groups.LimitsOf(1).width, 30);
    EXPECT_EQ(groups.LimitsOf(1).snap_before, 30);
    EXPECT_EQ(groups.LimitsOf(1).snap_after, 302);
}

TEST(DragGroups, ANeighbourNarrowerThanTheDraggedGroupSwapsAtItsEdge) {
    const ColumnOrder columns{{20}, {100}, {30}};
    const DragLimits limits = GroupsOf(columns).LimitsOf(1);

    EXPECT_EQ(limits.snap_before, 20) << "the neighbour's right edge";
    EXPECT_EQ(limits.snap_after, 122) << "the neighbour's left edge";
}

TEST(DragGroups, AGroupMovesAsAWholeToItsNewPlace) {
    const ColumnOrder columns{{50}, {50, kBound}, {50}, {50}, {50}};
    const DragGroups groups = GroupsOf(columns);
    const struct {
        int32 group;
        int32 newIndex;
        const char* expected;
    } kCases[] = {
        {1, 0, "BCADE"}, {1, 1, "ABCDE"}, {1, 3, "ADBCE"}, {1, 4, "ADEBC"}, {0, 2, "BCADE"},
        {0, 4, "BCDEA"}, {3, 0, "EABCD"}, {3, 1, "AEBCD"}, {3, 4, "ABCDE"},
    };
    for (const auto& each : kCases) {
        EXPECT_EQ(Names(groups.OrderWithGroupAt(columns.order, each.group, each.newIndex)), each.expected)
            << "group " << each.group << " to " << each.newIndex;
    }
}

} // namespace
