#include "gui/ColumnListView/ColumnLayout.h"

#include "gui/ColumnListView/CLVColumn.h"

#include <List.h>

#include <algorithm>

namespace {

CLVColumn& ColumnIn(const BList& displayOrder, int32 position) {
    return *static_cast<CLVColumn*>(displayOrder.ItemAtFast(position));
}

bool IsExpanderOrPushed(const CLVColumn& column) {
    return column.IsExpander() || column.IsPushedByExpander();
}

} // namespace

float LayOutColumns(const BList& displayOrder) {
    float end = -1;
    bool pushed = false;
    for (int32 i = 0; i < displayOrder.CountItems(); ++i) {
        CLVColumn& column = ColumnIn(displayOrder, i);
        column.SetPushedByExpander(pushed);
        if (!column.IsShown()) {
            continue;
        }
        const float begin = end + 1;
        end = begin + column.Width();
        column.SetColumnSpan(begin, end);
        if (pushed && (column.Flags() & CLV_COLUMN_PUSH_PASS) == 0) {
            pushed = false;
        }
        if (column.IsExpander()) {
            pushed = true;
        }
    }
    return std::max(end, 0.0F);
}

float PushLimit(const BList& displayOrder, float otherwise) {
    for (int32 i = displayOrder.CountItems() - 1; i >= 0; --i) {
        const CLVColumn& column = ColumnIn(displayOrder, i);
        // A column that is not shown lies nowhere.
        if (column.IsShown() && IsExpanderOrPushed(column)) {
            return column.ColumnEnd();
        }
    }
    return otherwise;
}

float ExpanderShiftOf(const CLVColumn& column, uint32 outlineLevel) {
    return IsExpanderOrPushed(column) ? kOutlineIndent * static_cast<float>(outlineLevel) : 0;
}

CellSpan SpanOfCell(const CLVColumn& column, float shift, float pushLimit) {
    CellSpan span{column.ColumnBegin(), column.ColumnEnd()};
    if (shift > 0 && IsExpanderOrPushed(column)) {
        if (!column.IsExpander()) {
            span.left += shift;
        }
        span.right = std::min(span.right + shift, pushLimit);
    }
    return span;
}

float WidthOfCell(const CLVColumn& column, float columnWidth, float shift, float pushLimit) {
    if (!IsExpanderOrPushed(column)) {
        return columnWidth;
    }
    const float room = pushLimit - column.ColumnEnd();
    const float width = column.IsExpander() ? columnWidth + std::min(shift, room)
                                            : columnWidth - std::max(shift - room, 0.0F);
    return std::max(width, 0.0F);
}
