// OutlineSort: sorts the rows of an outline, level by level.
#pragma once

#include "gui/ColumnListView/RowOrder.h"

#include <SupportDefs.h>

#include <vector>

class CLVListItem;

// Siblings, rows of the same level that follow each other with nothing but deeper rows between them, are
// sorted as an exchange sort does it, and each takes all rows below it along, super-row or not. Where levels
// do not fit together, as a first row of level 1 that is followed by one of level 0, each run of siblings is
// sorted in its place. The rows stay the caller's.
class OutlineSort {
  public:
    OutlineSort(const std::vector<CLVListItem*>& rows, const RowOrder& order);

    std::vector<CLVListItem*> Sorted() const;

  private:
    // Sorted siblings, of which those before `next` are done with; what lies from `rest` to before `end` is
    // still to come.
    struct Level {
        std::vector<int32> siblings;
        size_t next;
        int32 rest;
        int32 end;
    };

    Level SortItemsInThisLevel(int32 full_index, int32 end) const;
    void SortListArray(std::vector<int32>& items) const;

    const std::vector<CLVListItem*>& mRows;
    const RowOrder& mOrder;
    // For each row, the first behind it that is not deeper.
    std::vector<int32> mEndBelow;
};
