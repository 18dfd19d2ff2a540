// The part of ColumnListView that keeps the rows.
#include "gui/ColumnListView/ColumnListView.h"

#include <algorithm>

bool ColumnListView::CanAdd(const BListItem* item) {
    const auto* const row = dynamic_cast<const CLVListItem*>(item);
    return row != nullptr && row->PlaceInOutline().block.expired();
}

// What stands before `full_index` decides.
bool ColumnListView::IsToBeSeen(int32 full_index, uint32 level) const {
    const int32 super = mHierarchical ? mFullList.FindSuper(full_index, level) : -1;
    if (super < 0) {
        return true;
    }
    const CLVListItem* const item = mFullList.RowAt(super);
    return item->IsExpanded() && mFullList.IsVisible(item);
}

bool ColumnListView::AddItem(BListItem* item) {
    return ColumnListView::AddItem(item, mFullList.CountRows());
}

bool ColumnListView::AddItem(BListItem* item, int32 full_index) {
    AssertWindowLocked();
    return CanAdd(item) && AddItemPrivate(static_cast<CLVListItem*>(item), full_index);
}

bool ColumnListView::AddItemPrivate(CLVListItem* item, int32 full_index) {
    if (full_index < 0 || full_index > mFullList.CountRows()) {
        return false;
    }
    const bool visible = IsToBeSeen(full_index, item->OutlineLevel());
    const int32 visibleIndex = mFullList.CountVisibleBefore(full_index);
    mFullList.Insert(full_index, item, visible);
    if (!visible) {
        return true;
    }
    if (!BListView::AddItem(item, visibleIndex)) {
        mFullList.Remove(full_index, 1);
        return false;
    }
    UpdateDataRect(true);
    return true;
}

bool ColumnListView::AddList(BList* items) {
    return ColumnListView::AddList(items, mFullList.CountRows());
}

// As if they were added one by one, but the visible ones, which stand together, in one go.
bool ColumnListView::AddList(BList* items, int32 full_index) {
    AssertWindowLocked();
    if (items == nullptr || full_index < 0 || full_index > mFullList.CountRows()) {
        return false;
    }
    std::vector<CLVListItem*> rows;
    for (int32 i = 0; i < items->CountItems(); ++i) {
        rows.push_back(dynamic_cast<CLVListItem*>(static_cast<BListItem*>(items->ItemAtFast(i))));
        if (rows.back() == nullptr) {
            return false;
        }
    }
    const size_t count = CountAddable(rows);
    const bool all = count == rows.size();
    rows.resize(count);
    const std::vector<OutlineRows::NewRow> added = WithVisibility(rows, full_index);
    BList visible(static_cast<int32>(count));
    for (const OutlineRows::NewRow& row : added) {
        if (row.visible) {
            visible.AddItem(static_cast<BListItem*>(row.row));
        }
    }
    const int32 visibleIndex = mFullList.CountVisibleBefore(full_index);
    mFullList.Insert(full_index, added);
    if (!visible.IsEmpty()) {
        if (!BListView::AddList(&visible, visibleIndex)) {
            mFullList.Remove(full_index, static_cast<int32>(count));
            return false;
        }
        UpdateDataRect(true);
    }
    return all;
}

// How many stand before the first that is in a list already or comes a second time.
size_t ColumnListView::CountAddable(const std::vector<CLVListItem*>& rows) {
    for (size_t i = rows.size(); i-- > 0;) {
        rows[i]->PlaceInOutline().rank = static_cast<int32>(i);
    }
    size_t count = 0;
    while (count < rows.size() && CanAdd(rows[count]) &&
           rows[count]->PlaceInOutline().rank == static_cast<int32>(count)) {
        ++count;
    }
    return count;
}

std::vector<OutlineRows::NewRow> ColumnListView::WithVisibility(const std::vector<CLVListItem*>& rows,
                                                                int32 full_index) const {
    struct Super {
        uint32 level;
        bool showsRowsBelow;
    };
    std::vector<OutlineRows::NewRow> result;
    result.reserve(rows.size());
    // Those of these rows that stand above the next one; and what the rows already there say to those that
    // have none above them.
    std::vector<Super> supers;
    Super before{0, true};
    for (CLVListItem* const row : rows) {
        const uint32 level = row->OutlineLevel();
        while (!supers.empty() && supers.back().level >= level) {
            supers.pop_back();
        }
        if (supers.empty() && level != before.level) {
            before = {level, IsToBeSeen(full_index, level)};
        }
        const bool visible = supers.empty() ? before.showsRowsBelow : supers.back().showsRowsBelow;
        result.push_back({row, visible || !mHierarchical});
        supers.push_back({level, visible && row->IsExpanded()});
    }
    return result;
}

bool ColumnListView::RemoveItem(BListItem* item) {
    AssertWindowLocked();
    const auto* const row = dynamic_cast<const CLVListItem*>(item);
    return RemoveRun(FullListIndexOf(row), 1);
}

BListItem* ColumnListView::RemoveItem(int32 full_index) {
    AssertWindowLocked();
    CLVListItem* const item = FullListItemAt(full_index);
    return RemoveRun(full_index, 1) ? item : nullptr;
}

bool ColumnListView::RemoveItems(int32 full_index, int32 count) {
    AssertWindowLocked();
    return RemoveRun(full_index, count);
}

bool ColumnListView::RemoveRun(int32 full_index, int32 count) {
    if (full_index < 0 || full_index >= mFullList.CountRows() || count <= 0) {
        return false;
    }
    count = std::min(count, mFullList.CountRows() - full_index);
    int32 end = full_index + count;
    if (mHierarchical) {
        end = mFullList.FindEndBelow(end - 1, mFullList.SmallestLevel(full_index, count));
    }
    const int32 firstVisible = mFullList.CountVisibleBefore(full_index);
    const int32 countVisible = mFullList.CountVisibleBefore(end) - firstVisible;
    // The BListView comes last: it tells that the selection has changed.
    mFullList.Remove(full_index, end - full_index);
    if (countVisible > 0) {
        BListView::RemoveItems(firstVisible, countVisible);
        UpdateDataRect(true);
    }
    return true;
}

void ColumnListView::MakeEmpty() {
    AssertWindowLocked();
    mFullList.Clear();
    BListView::MakeEmpty();
    UpdateDataRect(true);
}

bool ColumnListView::DoMiscellaneous(MiscCode code, MiscData* data) {
    AssertWindowLocked();
    if (mHierarchical) {
        return false;
    }
    if (code == B_REPLACE_OP) {
        const int32 index = data->replace.index;
        if (index < 0 || index >= mFullList.CountRows() || !CanAdd(data->replace.item)) {
            return false;
        }
        mFullList.Remove(index, 1);
        mFullList.Insert(index, static_cast<CLVListItem*>(data->replace.item), true);
        // It comes last: it tells that the selection has changed.
        (void)BListView::DoMiscellaneous(code, data);
        UpdateDataRect(true);
        return true;
    }
    if (!BListView::DoMiscellaneous(code, data)) {
        return false;
    }
    const auto [first, last] = std::minmax(data->swap.a, data->swap.b);
    std::vector<OutlineRows::NewRow> rows;
    for (int32 i = first; i <= last; ++i) {
        rows.push_back({static_cast<CLVListItem*>(ItemAt(i)), true});
    }
    mFullList.Remove(first, last - first + 1);
    mFullList.Insert(first, rows);
    UpdateDataRect(true);
    return true;
}

std::vector<CLVListItem*> ColumnListView::AllRows() const {
    return mFullList.Rows(0, mFullList.CountRows());
}

CLVListItem* ColumnListView::FullListItemAt(int32 full_index) const {
    AssertWindowLocked();
    return full_index < 0 || full_index >= mFullList.CountRows() ? nullptr : mFullList.RowAt(full_index);
}

int32 ColumnListView::FullListIndexOf(const CLVListItem* item) const {
    AssertWindowLocked();
    return mFullList.IndexOf(item);
}

int32 ColumnListView::FullListIndexOf(BPoint point) const {
    AssertWindowLocked();
    const int32 visible = IndexOf(point);
    return visible < 0 ? -1 : mFullList.IndexOfVisible(visible);
}

CLVListItem* ColumnListView::FullListFirstItem() const {
    return FullListItemAt(0);
}

CLVListItem* ColumnListView::FullListLastItem() const {
    return FullListItemAt(mFullList.CountRows() - 1);
}

bool ColumnListView::FullListHasItem(const CLVListItem* item) const {
    AssertWindowLocked();
    return mFullList.Has(item);
}

int32 ColumnListView::FullListCountItems() const {
    AssertWindowLocked();
    return mFullList.CountRows();
}

bool ColumnListView::FullListIsEmpty() const {
    return FullListCountItems() == 0;
}

int32 ColumnListView::FullListCurrentSelection(int32 index) const {
    AssertWindowLocked();
    const int32 visible = CurrentSelection(index);
    return visible < 0 ? -1 : mFullList.IndexOfVisible(visible);
}

void ColumnListView::FullListDoForEach(bool (*function)(CLVListItem* item)) {
    AssertWindowLocked();
    for (int32 i = 0; i < mFullList.CountRows(); ++i) {
        if (function(mFullList.RowAt(i))) {
            return;
        }
    }
}

void ColumnListView::FullListDoForEach(bool (*function)(CLVListItem* item, void* argument), void* argument) {
    AssertWindowLocked();
    for (int32 i = 0; i < mFullList.CountRows(); ++i) {
        if (function(mFullList.RowAt(i), argument)) {
            return;
        }
    }
}

bool ColumnListView::IsVisible(const CLVListItem* item) const {
    AssertWindowLocked();
    return mFullList.IsVisible(item);
}

int32 ColumnListView::VisibleIndexOf(const CLVListItem* item) const {
    AssertWindowLocked();
    return mFullList.IsVisible(item) ? mFullList.CountVisibleBefore(mFullList.IndexOf(item)) : -1;
}
