// Which columns the header drags together, and where they may go. Draws nothing and needs no window.
#pragma once

#include <SupportDefs.h>

#include <vector>

class BList;
class CLVColumn;

// A run of columns in the display order that are bound by CLV_COLUMN_LOCK_WITH_RIGHT.
struct DragGroup {
    // First and last position in the display order.
    int32 group_start_display_index = 0;
    int32 group_stop_display_index = 0;
    // Left edge of the first, right edge of the last shown column; -1 when none is shown.
    float group_begin = -1;
    float group_end = -1;
    CLVColumn* last_column_shown = nullptr;
    // Every column is locked at the start, or at the end.
    bool all_lock_before = false;
    bool all_lock_after = false;
    // At least one column is shown.
    bool shown = false;
    // Of all columns together: not movable, locked at the start, locked at the end.
    unsigned long flags = 0;
};

// Where a dragged group may be swapped with its shown neighbours; -1 for what is not allowed or not there.
struct DragLimits {
    int32 group = -1;
    int32 previous = -1;
    int32 next = -1;
    // Left of the one, or right of the other, the pointer swaps the groups.
    float snap_before = -1;
    float snap_after = -1;
    // Of the dragged group, right - left.
    float width = 0;
};

class DragGroups {
  public:
    // From the columns as they are laid out.
    void Rebuild(const BList& displayOrder);

    int32 CountGroups() const { return static_cast<int32>(mGroups.size()); }
    const DragGroup& GroupAt(int32 index) const { return mGroups[static_cast<size_t>(index)]; }
    // -1 when the column is in none.
    int32 IndexOfGroup(const BList& displayOrder, const CLVColumn* column) const;

    // `group` is an index, or -1, which allows nothing.
    DragLimits LimitsOf(int32 group) const;
    // The columns (CLVColumn pointers) as they stand once the group has been moved to this place among the
    // groups.
    BList OrderWithGroupAt(const BList& displayOrder, int32 group, int32 new_index) const;

  private:
    std::vector<DragGroup> mGroups;
};
