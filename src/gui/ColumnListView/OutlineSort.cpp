#include "gui/ColumnListView/OutlineSort.h"

#include "gui/ColumnListView/CLVListItem.h"
#include "gui/ColumnListView/ExchangeSort.h"

#include <utility>

OutlineSort::OutlineSort(const std::vector<CLVListItem*>& rows, const RowOrder& order)
    : mRows(rows), mOrder(order), mEndBelow(rows.size()) {
    std::vector<size_t> open;
    for (size_t i = 0; i <= rows.size(); ++i) {
        while (!open.empty() &&
               (i == rows.size() || rows[open.back()]->OutlineLevel() >= rows[i]->OutlineLevel())) {
            mEndBelow[open.back()] = static_cast<int32>(i);
            open.pop_back();
        }
        open.push_back(i);
    }
}

// Goes down by a stack of its own: outlines may be deeper than the thread's is.
std::vector<CLVListItem*> OutlineSort::Sorted() const {
    std::vector<CLVListItem*> sorted;
    sorted.reserve(mRows.size());
    std::vector<Level> levels;
    if (!mRows.empty()) {
        levels.push_back(SortItemsInThisLevel(0, static_cast<int32>(mRows.size())));
    }
    while (!levels.empty()) {
        Level& level = levels.back();
        if (level.next < level.siblings.size()) {
            const int32 row = level.siblings[level.next++];
            const int32 endBelow = mEndBelow[static_cast<size_t>(row)];
            sorted.push_back(mRows[static_cast<size_t>(row)]);
            if (row + 1 < endBelow) {
                levels.push_back(SortItemsInThisLevel(row + 1, endBelow));
            }
        } else if (level.rest < level.end) {
            level = SortItemsInThisLevel(level.rest, level.end);
        } else {
            levels.pop_back();
        }
    }
    return sorted;
}

OutlineSort::Level OutlineSort::SortItemsInThisLevel(int32 full_index, int32 end) const {
    Level level{{}, 0, full_index, end};
    const uint32 outlineLevel = mRows[static_cast<size_t>(full_index)]->OutlineLevel();
    while (level.rest < end && mRows[static_cast<size_t>(level.rest)]->OutlineLevel() == outlineLevel) {
        level.siblings.push_back(level.rest);
        level.rest = mEndBelow[static_cast<size_t>(level.rest)];
    }
    SortListArray(level.siblings);
    return level;
}

void OutlineSort::SortListArray(std::vector<int32>& items) const {
    SortLikeExchange(items, [this](int32 a, int32 b) {
        return mOrder(mRows[static_cast<size_t>(a)], mRows[static_cast<size_t>(b)]);
    });
}
