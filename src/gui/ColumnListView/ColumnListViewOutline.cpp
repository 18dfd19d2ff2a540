// The part of ColumnListView that expands and collapses.
#include "gui/ColumnListView/ColumnListView.h"

#include <InterfaceDefs.h>

#include <algorithm>

bool ColumnListView::AddUnder(BListItem* item, BListItem* superitem) {
    AssertWindowLocked();
    const auto* const super = dynamic_cast<const CLVListItem*>(superitem);
    const int32 superIndex = FullListIndexOf(super);
    if (!mHierarchical || !CanAdd(item) || superIndex < 0) {
        return false;
    }
    auto* const row = static_cast<CLVListItem*>(item);
    row->SetOutlineLevel(super->OutlineLevel() + 1);
    return AddItemPrivate(row, mFullList.FindEndBelow(superIndex, super->OutlineLevel()));
}

void ColumnListView::Expand(CLVListItem* item) {
    SetExpanded(item, true);
}

void ColumnListView::Collapse(CLVListItem* item) {
    SetExpanded(item, false);
}

void ColumnListView::SetExpanded(CLVListItem* item, bool expanded) {
    AssertWindowLocked();
    if (item == nullptr) {
        return;
    }
    const bool getsArrow = !item->IsSuperItem();
    const bool changes = item->IsExpanded() != expanded;
    // Any row becomes a super-row by this, on purpose.
    item->SetSuperItem(true);
    item->SetExpanded(expanded);
    if (!mHierarchical || !IsVisible(item)) {
        return;
    }
    if ((getsArrow || changes) && mExpanderColumn >= 0) {
        item->RedrawExpander(this);
    }
    if (changes && expanded) {
        ShowRowsBelow(item);
    } else if (changes) {
        (void)HideRowsBelow(item);
    }
}

void ColumnListView::ShowRowsBelow(const CLVListItem* item) {
    // Some are there already if the application has changed their levels. When they go, the hook for the
    // selection may take rows away, this one among them, and collapse or expand others.
    if (HideRowsBelow(item)) {
        const std::vector<CLVListItem*> rows = AllRows();
        if (std::find(rows.begin(), rows.end(), item) == rows.end() || !IsVisible(item) ||
            !item->IsExpanded()) {
            return;
        }
    }
    const int32 index = mFullList.IndexOf(item);
    const int32 end = mFullList.FindEndBelow(index, item->OutlineLevel());
    const int32 visibleIndex = mFullList.CountVisibleBefore(index) + 1;
    if (mFullList.CountVisibleBefore(end) > visibleIndex) {
        return;
    }
    BList shown;
    for (CLVListItem* const row : mFullList.Show(index + 1, end)) {
        shown.AddItem(static_cast<BListItem*>(row));
    }
    BListView::AddList(&shown, visibleIndex);
    UpdateDataRect(true);
}

// Whether there were any. The selection may have been among them, and its hook is called last.
bool ColumnListView::HideRowsBelow(const CLVListItem* item) {
    const int32 index = mFullList.IndexOf(item);
    const int32 end = mFullList.FindEndBelow(index, item->OutlineLevel());
    const int32 visibleIndex = mFullList.CountVisibleBefore(index) + 1;
    const int32 hidden = mFullList.Hide(index + 1, end);
    if (hidden > 0) {
        BListView::RemoveItems(visibleIndex, hidden);
        UpdateDataRect(true);
    }
    return hidden > 0;
}

void ColumnListView::KeyDown(const char* bytes, int32 numBytes) {
    AssertWindowLocked();
    const char key = numBytes == 1 ? *bytes : '\0';
    const bool used = key == B_RIGHT_ARROW ? GoDownTheOutline() : key == B_LEFT_ARROW && GoUpTheOutline();
    if (!used) {
        BListView::KeyDown(bytes, numBytes);
    }
}

CLVListItem* ColumnListView::OnlySelectedItem() const {
    return mHierarchical && CurrentSelection(1) < 0 ? static_cast<CLVListItem*>(ItemAt(CurrentSelection(0)))
                                                    : nullptr;
}

// False when there is nothing to expand and no way down.
bool ColumnListView::GoDownTheOutline() {
    CLVListItem* const item = OnlySelectedItem();
    if (item == nullptr || !item->IsSuperItem()) {
        return false;
    }
    if (!item->IsExpanded()) {
        Expand(item);
        return true;
    }
    const int32 next = CurrentSelection(0) + 1;
    const auto* const first = static_cast<const CLVListItem*>(ItemAt(next));
    if (first == nullptr || first->OutlineLevel() <= item->OutlineLevel()) {
        return false;
    }
    Select(next);
    ScrollToSelection();
    return true;
}

// False when there is nothing to collapse and no way up.
bool ColumnListView::GoUpTheOutline() {
    CLVListItem* const item = OnlySelectedItem();
    if (item == nullptr) {
        return false;
    }
    if (item->IsSuperItem() && item->IsExpanded()) {
        Collapse(item);
        return true;
    }
    const int32 super = VisibleIndexOf(Superitem(item));
    if (super < 0) {
        return false;
    }
    Select(super);
    ScrollToSelection();
    return true;
}

bool ColumnListView::IsExpanded(int32 full_index) const {
    const CLVListItem* const item = FullListItemAt(full_index);
    return item != nullptr && item->IsExpanded();
}

CLVListItem* ColumnListView::Superitem(const CLVListItem* item) const {
    const int32 index = FullListIndexOf(item);
    return !mHierarchical || index < 0 ? nullptr
                                       : FullListItemAt(mFullList.FindSuper(index, item->OutlineLevel()));
}

int32 ColumnListView::FullListNumberOfSubitems(const CLVListItem* item) const {
    const int32 index = FullListIndexOf(item);
    return !mHierarchical || index < 0 ? 0 : mFullList.FindEndBelow(index, item->OutlineLevel()) - index - 1;
}
