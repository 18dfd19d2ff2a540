// The part of ColumnListView that sorts.
#include "gui/ColumnListView/ColumnListView.h"

#include "gui/ColumnListView/ExchangeSort.h"
#include "gui/ColumnListView/OutlineSort.h"

namespace {

bool IsSortable(const CLVColumn* column) {
    return column != nullptr && (column->Flags() & CLV_COLUMN_SORTABLE) != 0;
}

int CompareRanks(const void* first, const void* second) {
    const auto rank = [](const void* item) {
        const BListItem* const row = *static_cast<BListItem* const*>(item);
        return static_cast<const CLVListItem*>(row)->PlaceInOutline().rank;
    };
    return rank(first) - rank(second);
}

} // namespace

void ColumnListView::SetSortFunction(CLVCompareFuncPtr compare) {
    AssertWindowLocked();
    mSortFunction = compare;
}

void ColumnListView::SetSortKey(int32 column_index) {
    AssertWindowLocked();
    CLVColumn* const column = column_index < 0 ? nullptr : ColumnAt(column_index);
    if (column_index >= 0 && !IsSortable(column)) {
        return;
    }
    if (column == nullptr || column != PrimarySortKey()) {
        InvalidateSortKeyHeaders();
        mSortKeys.MakeEmpty();
        if (column != nullptr) {
            UseAsSortKey(column);
        }
    }
    SortingChanged();
}

void ColumnListView::AddSortKey(int32 column_index) {
    AssertWindowLocked();
    CLVColumn* const column = ColumnAt(column_index);
    if (IsSortable(column) && !mSortKeys.HasItem(column)) {
        UseAsSortKey(column);
        SortingChanged();
    }
}

void ColumnListView::UseAsSortKey(CLVColumn* column) {
    mSortKeys.AddItem(column);
    if (column->SortMode() == CLV_SORT_NONE) {
        SetSortMode(IndexOfColumn(column), CLV_SORT_ASCENDING);
        // The hook for the sorting may have taken it away.
        if (IndexOfColumn(column) < 0) {
            return;
        }
    }
    SortItems();
    InvalidateHeaderOf(column);
}

void ColumnListView::SetSortMode(int32 column_index, CLVSortMode mode) {
    AssertWindowLocked();
    CLVColumn* const column = ColumnAt(column_index);
    if (!IsSortable(column)) {
        return;
    }
    if (column->SortMode() != mode) {
        column->StoreSortMode(mode);
        if (mode == CLV_SORT_NONE) {
            mSortKeys.RemoveItem(column);
        }
        SortItems();
        InvalidateHeaderOf(column);
    }
    // Even when it is as it was.
    SortingChanged();
}

void ColumnListView::ReverseSortMode(int32 column_index) {
    AssertWindowLocked();
    const CLVColumn* const column = ColumnAt(column_index);
    if (!IsSortable(column)) {
        return;
    }
    switch (column->SortMode()) {
    case CLV_SORT_ASCENDING:
        SetSortMode(column_index, CLV_SORT_DESCENDING);
        break;
    case CLV_SORT_DESCENDING:
        // So the third click on a header drops the key, on purpose.
        SetSortMode(column_index, CLV_SORT_NONE);
        break;
    case CLV_SORT_NONE:
        SetSortMode(column_index, CLV_SORT_ASCENDING);
        break;
    }
}

void ColumnListView::SortingChanged() {
    AssertWindowLocked();
}

int32 ColumnListView::Sorting(int32* keys, CLVSortMode* modes) const {
    AssertWindowLocked();
    const int32 count = mSortKeys.CountItems();
    for (int32 i = 0; i < count; ++i) {
        const int32 index = mColumns.IndexOf(mSortKeys.ItemAt(i));
        if (keys != nullptr) {
            keys[i] = index;
        }
        if (modes != nullptr) {
            modes[i] = index < 0 ? CLV_SORT_NONE : ColumnAt(index)->SortMode();
        }
    }
    return count;
}

void ColumnListView::SetSorting(int32 count, int32* keys, CLVSortMode* modes) {
    AssertWindowLocked();
    InvalidateSortKeyHeaders();
    mSortKeys.MakeEmpty();
    for (int32 i = 0; i < count; ++i) {
        if (i == 0) {
            SetSortKey(keys[i]);
        } else {
            AddSortKey(keys[i]);
        }
        SetSortMode(keys[i], modes[i]);
    }
    SortingChanged();
}

bool ColumnListView::IsSortKey(const CLVColumn* column) const {
    AssertWindowLocked();
    return IsInSortKeys(column) && column->SortMode() != CLV_SORT_NONE;
}

bool ColumnListView::IsInSortKeys(const CLVColumn* column) const {
    AssertWindowLocked();
    return mSortKeys.HasItem(column);
}

CLVColumn* ColumnListView::PrimarySortKey() const {
    AssertWindowLocked();
    return static_cast<CLVColumn*>(mSortKeys.FirstItem());
}

void ColumnListView::InvalidateSortKeyHeaders() {
    for (int32 i = 0; i < CountColumns(); ++i) {
        if (IsSortKey(ColumnAt(i))) {
            InvalidateHeaderOf(ColumnAt(i));
        }
    }
}

// Keys that are no columns any more (see RemoveColumns()) may be gone, and order nothing.
RowOrder ColumnListView::OrderBySortKeys() const {
    RowOrder order(mSortFunction);
    for (int32 i = 0; i < mSortKeys.CountItems(); ++i) {
        const int32 index = mColumns.IndexOf(mSortKeys.ItemAt(i));
        if (index >= 0) {
            order.AddKey(index, ColumnAt(index)->SortMode());
        }
    }
    return order;
}

void ColumnListView::SortItems() {
    AssertWindowLocked();
    const RowOrder order = OrderBySortKeys();
    if (!order.OrdersAnything()) {
        return;
    }
    const std::vector<CLVListItem*> rows = AllRows();
    std::vector<CLVListItem*> sorted;
    if (mHierarchical) {
        sorted = OutlineSort(rows, order).Sorted();
    } else {
        sorted = rows;
        MergeSort(sorted, order);
    }
    if (sorted != rows) {
        mFullList.Reorder(sorted);
        BListView::SortItems(CompareRanks);
    }
}
