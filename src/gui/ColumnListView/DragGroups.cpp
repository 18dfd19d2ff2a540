#include "gui/ColumnListView/DragGroups.h"

#include "gui/ColumnListView/CLVColumn.h"

#include <List.h>

#include <algorithm>

namespace {

constexpr unsigned long kConstraints =
    CLV_COLUMN_NOT_MOVABLE | CLV_COLUMN_LOCK_AT_START | CLV_COLUMN_LOCK_AT_END;

CLVColumn* ColumnIn(const BList& displayOrder, int32 position) {
    return static_cast<CLVColumn*>(displayOrder.ItemAtFast(position));
}

void Join(DragGroup& group, CLVColumn* column, int32 position) {
    group.group_stop_display_index = position;
    if (column->IsShown()) {
        if (!group.shown) {
            group.group_begin = column->ColumnBegin();
        }
        group.group_end = column->ColumnEnd();
        group.last_column_shown = column;
        group.shown = true;
    }
    group.all_lock_before = group.all_lock_before && (column->Flags() & CLV_COLUMN_LOCK_AT_START) != 0;
    group.all_lock_after = group.all_lock_after && (column->Flags() & CLV_COLUMN_LOCK_AT_END) != 0;
    group.flags |= column->Flags() & kConstraints;
}

// What is bound to an end of the header changes places only with its like.
bool MaySwap(const DragGroup& left, const DragGroup& right) {
    const bool leftStays = (left.flags & CLV_COLUMN_LOCK_AT_START) != 0 && !right.all_lock_before;
    const bool rightStays = (right.flags & CLV_COLUMN_LOCK_AT_END) != 0 && !left.all_lock_after;
    return !leftStays && !rightStays;
}

} // namespace

void DragGroups::Rebuild(const BList& displayOrder) {
    mGroups.clear();
    bool joins = false;
    for (int32 i = 0; i < displayOrder.CountItems(); ++i) {
        CLVColumn* const column = ColumnIn(displayOrder, i);
        if (!joins) {
            DragGroup group;
            group.group_start_display_index = i;
            group.all_lock_before = true;
            group.all_lock_after = true;
            mGroups.push_back(group);
        }
        Join(mGroups.back(), column, i);
        joins = (column->Flags() & CLV_COLUMN_LOCK_WITH_RIGHT) != 0;
    }
}

int32 DragGroups::IndexOfGroup(const BList& displayOrder, const CLVColumn* column) const {
    const int32 position = displayOrder.IndexOf(static_cast<const void*>(column));
    for (int32 i = 0; position >= 0 && i < CountGroups(); ++i) {
        if (position <= GroupAt(i).group_stop_display_index) {
            return i;
        }
    }
    return -1;
}

DragLimits DragGroups::LimitsOf(int32 group) const {
    DragLimits limits;
    if (group < 0 || group >= CountGroups()) {
        return limits;
    }
    const DragGroup& dragged = GroupAt(group);
    limits.group = group;
    limits.width = dragged.group_end - dragged.group_begin;
    int32 previous = group - 1;
    while (previous >= 0 && !GroupAt(previous).shown) {
        --previous;
    }
    int32 next = group + 1;
    while (next < CountGroups() && !GroupAt(next).shown) {
        ++next;
    }
    if (previous >= 0 && MaySwap(GroupAt(previous), dragged)) {
        const DragGroup& neighbour = GroupAt(previous);
        limits.previous = previous;
        limits.snap_before = std::min(neighbour.group_begin + limits.width, neighbour.group_end);
    }
    if (next < CountGroups() && MaySwap(dragged, GroupAt(next))) {
        const DragGroup& neighbour = GroupAt(next);
        limits.next = next;
        limits.snap_after = std::max(neighbour.group_end - limits.width, neighbour.group_begin);
    }
    return limits;
}

BList DragGroups::OrderWithGroupAt(const BList& displayOrder, int32 group, int32 new_index) const {
    BList order(displayOrder.CountItems());
    const auto append = [&](const DragGroup& added) {
        for (int32 i = added.group_start_display_index; i <= added.group_stop_display_index; ++i) {
            order.AddItem(ColumnIn(displayOrder, i));
        }
    };
    for (int32 i = 0; i < CountGroups(); ++i) {
        if (i == new_index) {
            append(GroupAt(group));
        }
        if (i != group) {
            append(GroupAt(i));
        }
    }
    if (new_index >= CountGroups()) {
        append(GroupAt(group));
    }
    return order;
}
