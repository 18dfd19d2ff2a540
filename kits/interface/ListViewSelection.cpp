// The part of BListView that keeps the selection.
#include <ListView.h>

#include "RowPositions.h"

#include <algorithm>

void BListView::Select(int32 index, bool extend) {
    if (index >= 0 && index < CountItems()) {
        Select(index, index, extend);
    }
}

void BListView::Select(int32 from, int32 to, bool extend) {
    from = std::max(from, 0);
    to = std::min(to, CountItems() - 1);
    if (from > to) {
        return;
    }
    if (mType == B_SINGLE_SELECTION_LIST) {
        to = from;
        extend = false;
    }
    const bool deselected = !extend && DeselectOutside(from, to);
    const bool selected = SetSelected(from, to, true);
    mAnchor = from;
    SetCursor(to, false);
    if (deselected || selected) {
        SelectionHasChanged();
    }
}

void BListView::Deselect(int32 index) {
    if (index >= 0 && index < CountItems() && SetSelected(index, index, false)) {
        SelectionHasChanged();
    }
}

void BListView::DeselectAll() {
    if (HasSelection() && SetSelected(mFirstSelected, mLastSelected, false)) {
        SelectionHasChanged();
    }
}

void BListView::DeselectExcept(int32 exceptFrom, int32 exceptTo) {
    if (exceptFrom <= exceptTo && DeselectOutside(exceptFrom, exceptTo)) {
        SelectionHasChanged();
    }
}

bool BListView::IsItemSelected(int32 index) const {
    const BListItem* const item = ItemAt(index);
    return item != nullptr && item->IsSelected();
}

int32 BListView::CurrentSelection(int32 index) const {
    if (index < 0) {
        return -1;
    }
    int32 ordinal = 0;
    int32 row = mFirstSelected;
    if (mCountedOrdinal >= 0 && index >= mCountedOrdinal) {
        ordinal = mCountedOrdinal;
        row = mCountedRow;
    }
    for (; row <= mLastSelected; ++row) {
        if (!RowAt(row)->IsSelected()) {
            continue;
        }
        if (ordinal == index) {
            mCountedOrdinal = ordinal;
            mCountedRow = row;
            return row;
        }
        ++ordinal;
    }
    return -1;
}

void BListView::ScrollToSelection() {
    const int32 row = CurrentSelection(0);
    if (row >= 0) {
        ScrollToRow(row);
    }
}

void BListView::SelectionChanged() {}

void BListView::SelectionHasChanged() {
    ForgetSelectionCount();
    SelectionChanged();
    if (mSelectionMessage != nullptr || IsWatched()) {
        InvokeNotify(mSelectionMessage.get(), B_CONTROL_MODIFIED);
    }
}

// Whether anything changed; a disabled row cannot be selected.
bool BListView::SetSelected(int32 from, int32 to, bool selected) {
    int32 firstChanged = -1;
    int32 lastChanged = -1;
    for (int32 row = from; row <= to; ++row) {
        BListItem* const item = RowAt(row);
        if (item->IsSelected() == selected || (selected && !item->IsEnabled())) {
            continue;
        }
        if (selected) {
            item->Select();
        } else {
            item->Deselect();
        }
        firstChanged = firstChanged < 0 ? row : firstChanged;
        lastChanged = row;
    }
    if (firstChanged < 0) {
        return false;
    }
    // Rows between the two may be drawn in vain, but no more than can be seen.
    Invalidate(ItemFrame(firstChanged) | ItemFrame(lastChanged));
    ForgetSelectionCount();
    if (selected) {
        WidenSelectionBounds(firstChanged, lastChanged);
    } else {
        TightenSelectionBounds();
    }
    return true;
}

bool BListView::DeselectOutside(int32 from, int32 to) {
    const int32 first = mFirstSelected;
    const int32 last = mLastSelected;
    const bool above = SetSelected(first, std::min(last, from - 1), false);
    const bool below = SetSelected(std::max(first, to + 1), last, false);
    return above || below;
}

void BListView::WidenSelectionBounds(int32 from, int32 to) {
    if (HasSelection()) {
        from = std::min(from, mFirstSelected);
        to = std::max(to, mLastSelected);
    }
    mFirstSelected = from;
    mLastSelected = to;
}

void BListView::TightenSelectionBounds() {
    while (HasSelection() && !RowAt(mFirstSelected)->IsSelected()) {
        ++mFirstSelected;
    }
    while (HasSelection() && !RowAt(mLastSelected)->IsSelected()) {
        --mLastSelected;
    }
}
