// The part of ColumnListView that keeps the columns.
#include "gui/ColumnListView/ColumnListView.h"

#include "gui/ColumnListView/CLVColumnLabelView.h"
#include "gui/ColumnListView/ColumnLayout.h"

#include <algorithm>

namespace {

constexpr BRect kNoRect(-1, -1, -1, -1);

CLVColumn* ColumnIn(const BList& columns, int32 index) {
    return static_cast<CLVColumn*>(columns.ItemAt(index));
}

int32 CountExpanders(const BList& columns) {
    int32 count = 0;
    for (int32 i = 0; i < columns.CountItems(); ++i) {
        count += ColumnIn(columns, i)->IsExpander() ? 1 : 0;
    }
    return count;
}

// None in a list, none twice, none null.
bool AreFree(const BList& columns) {
    for (int32 i = 0; i < columns.CountItems(); ++i) {
        const CLVColumn* const column = ColumnIn(columns, i);
        if (column == nullptr || column->GetParent() != nullptr || columns.IndexOf(column) != i) {
            return false;
        }
    }
    return true;
}

} // namespace

bool ColumnListView::AddColumn(CLVColumn* column) {
    AssertWindowLocked();
    BList one(1);
    one.AddItem(column);
    return AddColumns(one);
}

bool ColumnListView::AddColumnList(BList* columns) {
    AssertWindowLocked();
    return columns != nullptr && AddColumns(*columns);
}

bool ColumnListView::AddColumns(const BList& columns) {
    if (!AreFree(columns)) {
        return false;
    }
    const int32 expanders = CountExpanders(columns);
    if (expanders > 0 && (!mHierarchical || expanders + CountExpanders(mColumns) > 1)) {
        return false;
    }
    for (int32 i = 0; i < columns.CountItems(); ++i) {
        ColumnIn(columns, i)->SetParent(this);
    }
    mColumns.AddList(&columns);
    mDisplayOrder.AddList(&columns);
    ColumnsChanged();
    return true;
}

bool ColumnListView::RemoveColumn(CLVColumn* column) {
    AssertWindowLocked();
    const int32 index = IndexOfColumn(column);
    if (index < 0) {
        return false;
    }
    mSortKeys.RemoveItem(column);
    ForgetColumns(index, 1);
    return true;
}

bool ColumnListView::RemoveColumns(CLVColumn* first, int32 count) {
    AssertWindowLocked();
    const int32 index = IndexOfColumn(first);
    if (index < 0 || count < 0 || count > CountColumns() - index) {
        return false;
    }
    if (count == 0) {
        return true;
    }
    // The other columns stay among the sort keys on purpose.
    mSortKeys.RemoveItem(first);
    ForgetColumns(index, count);
    return true;
}

void ColumnListView::ForgetColumns(int32 index, int32 count) {
    for (int32 i = index; i < index + count; ++i) {
        mDisplayOrder.RemoveItem(ColumnAt(i));
        ColumnAt(i)->SetParent(nullptr);
    }
    mColumns.RemoveItems(index, count);
    ColumnsChanged();
}

int32 ColumnListView::CountColumns() const {
    AssertWindowLocked();
    return mColumns.CountItems();
}

int32 ColumnListView::IndexOfColumn(CLVColumn* column) const {
    AssertWindowLocked();
    return mColumns.IndexOf(static_cast<const void*>(column));
}

CLVColumn* ColumnListView::ColumnAt(int32 column_index) const {
    AssertWindowLocked();
    return ColumnIn(mColumns, column_index);
}

bool ColumnListView::SetDisplayOrder(const int32* order) {
    AssertWindowLocked();
    if (order == nullptr) {
        return false;
    }
    // The header must not go on dragging what may not be shown any more.
    mHeaderView->CancelGesture();
    mDisplayOrder.MakeEmpty();
    for (int32 i = 0; i < CountColumns(); ++i) {
        CLVColumn* const column = ColumnAt(order[i]);
        if (column == nullptr || mDisplayOrder.HasItem(column)) {
            // What was accepted so far stays, and nothing is laid out, on purpose.
            mHeaderView->UpdateDragGroups();
            return false;
        }
        mDisplayOrder.AddItem(column);
    }
    ColumnsChanged();
    DisplayOrderChanged(order);
    return true;
}

int32* ColumnListView::DisplayOrder() const {
    AssertWindowLocked();
    auto* const order = new int32[static_cast<size_t>(CountColumns())];
    for (int32 i = 0; i < CountColumns(); ++i) {
        order[i] = IndexOfColumn(ColumnIn(mDisplayOrder, i));
    }
    return order;
}

void ColumnListView::ReplaceDisplayOrder(const BList& order) {
    AssertWindowLocked();
    mDisplayOrder = order;
    UpdateColumnSizesDataRectSizeScrollBars(true);
    mHeaderView->UpdateDragGroups();
    const std::unique_ptr<int32[]> indices(DisplayOrder());
    DisplayOrderChanged(indices.get());
}

void ColumnListView::ColumnsChanged() {
    AssertWindowLocked();
    mHeaderView->CancelGesture();
    // Indices may have moved.
    mExpanderColumn = -1;
    for (int32 i = 0; i < CountColumns(); ++i) {
        if (ColumnAt(i)->IsExpander() && ColumnAt(i)->IsShown()) {
            mExpanderColumn = i;
        }
    }
    UpdateColumnSizesDataRectSizeScrollBars(true);
    mHeaderView->UpdateDragGroups();
    mHeaderView->Invalidate();
    Invalidate();
}

void ColumnListView::ColumnWidthChanged(int32 column_index, float new_width) {
    AssertWindowLocked();
    const CLVColumn* const column = ColumnAt(column_index);
    if (column == nullptr || (column->Flags() & CLV_COLUMN_TELL_ITEMS_WIDTH) == 0) {
        return;
    }
    const float limit = PushLimit(mDisplayOrder, kNoPushLimit);
    for (CLVListItem* const item : AllRows()) {
        const float shift = ExpanderShiftOf(*column, item->OutlineLevel());
        item->ColumnWidthChanged(column_index, WidthOfCell(*column, new_width, shift, limit), this);
    }
    InvalidateShifted(*column, limit);
}

// Right of the column, where the cells of rows reach that are shifted.
void ColumnListView::InvalidateShifted(const CLVColumn& column, float limit) {
    const BRect bounds = Bounds();
    for (int32 i = std::max(0, IndexOf(bounds.LeftTop())); column.IsShown() && i < CountItems(); ++i) {
        const BRect frame = ItemFrame(i);
        if (frame.top > bounds.bottom) {
            break;
        }
        const float end = column.ColumnEnd();
        const float shift =
            ExpanderShiftOf(column, static_cast<const CLVListItem*>(ItemAt(i))->OutlineLevel());
        const BRect strip(end, frame.top, std::min(end + shift, limit), frame.bottom);
        if (shift > 0 && strip.IsValid()) {
            Invalidate(strip);
        }
    }
}

void ColumnListView::DisplayOrderChanged(const int32* /*order*/) {
    AssertWindowLocked();
    const float limit = PushLimit(mDisplayOrder, kNoPushLimit);
    for (int32 i = 0; i < CountColumns(); ++i) {
        const CLVColumn& column = *ColumnAt(i);
        if ((column.Flags() & CLV_COLUMN_TELL_ITEMS_WIDTH) == 0) {
            continue;
        }
        int32 visible = 0;
        for (CLVListItem* const item : AllRows()) {
            // Visible rows stand in the same order.
            const bool isVisible = ItemAt(visible) == item;
            BRect cell = kNoRect;
            if (isVisible && column.IsShown()) {
                const CellSpan span =
                    SpanOfCell(column, ExpanderShiftOf(column, item->OutlineLevel()), limit);
                const BRect frame = ItemFrame(visible);
                cell = span.IsEmpty() ? kNoRect : BRect(span.left, frame.top, span.right, frame.bottom);
            }
            visible += isVisible ? 1 : 0;
            item->FrameChanged(i, cell, this);
        }
    }
}

void ColumnListView::InvalidateHeaderOf(const CLVColumn* column) {
    if (column->IsShown()) {
        mHeaderView->InvalidateColumn(column);
    }
}
