#include "gui/ColumnListView/HeaderCells.h"

#include "gui/ColumnListView/CLVColumn.h"

#include <List.h>

namespace {

CLVColumn* ColumnIn(const BList& displayOrder, int32 position) {
    return static_cast<CLVColumn*>(displayOrder.ItemAtFast(position));
}

bool MergesWithRight(const BList& displayOrder, int32 position) {
    while ((ColumnIn(displayOrder, position)->Flags() & CLV_COLUMN_MERGE_WITH_RIGHT) != 0) {
        ++position;
        if (position == displayOrder.CountItems()) {
            return false;
        }
        if (ColumnIn(displayOrder, position)->IsShown()) {
            return true;
        }
    }
    return false;
}

} // namespace

std::vector<HeaderCell> HeaderCellsOf(const BList& displayOrder, BRect bounds) {
    std::vector<HeaderCell> cells;
    for (int32 i = 0; i < displayOrder.CountItems(); ++i) {
        CLVColumn* const column = ColumnIn(displayOrder, i);
        if (!column->IsShown()) {
            continue;
        }
        HeaderCell cell;
        cell.column = column;
        cell.frame = BRect(column->ColumnBegin(), bounds.top, column->ColumnEnd(), bounds.bottom);
        cell.merged = MergesWithRight(displayOrder, i);
        cell.merged_with_left = !cells.empty() && cells.back().merged;
        cells.push_back(cell);
    }
    return cells;
}

std::vector<HeaderLine> LinesOf(const HeaderCell& cell, bool resizing) {
    const BRect& frame = cell.frame;
    const float mergedEnd = cell.merged ? frame.right : frame.right - 1;
    // The border that is dragged stands out from the cells that it joins.
    const float topEnd = resizing ? frame.right - 1 : mergedEnd;
    std::vector<HeaderLine> lines;
    lines.push_back({frame.LeftTop(), BPoint(topEnd, frame.top), kHeaderLight});
    if (!cell.merged_with_left) {
        lines.push_back({BPoint(frame.left, frame.top + 1), frame.LeftBottom(), kHeaderLight});
    }
    const float bottomStart = cell.merged_with_left ? frame.left : frame.left + 1;
    lines.push_back({BPoint(bottomStart, frame.bottom), BPoint(mergedEnd, frame.bottom), kHeaderShadow});
    if (resizing || !cell.merged) {
        lines.push_back({frame.RightTop(), frame.RightBottom(), resizing ? kHeaderBlue : kHeaderShadow});
    }
    return lines;
}

std::vector<HeaderLine> LinesBehind(const HeaderCell* last, BRect bounds) {
    const float left = last == nullptr ? 0 : last->frame.right + 1;
    std::vector<HeaderLine> lines;
    if (left > bounds.right) {
        return lines;
    }
    lines.push_back({BPoint(left, bounds.top), bounds.RightTop(), kHeaderLight});
    lines.push_back({BPoint(left, bounds.top + 1), BPoint(left, bounds.bottom), kHeaderLight});
    const float bottomStart = last != nullptr && last->merged ? left : left + 1;
    if (bottomStart <= bounds.right) {
        lines.push_back({BPoint(bottomStart, bounds.bottom), bounds.RightBottom(), kHeaderShadow});
    }
    return lines;
}
