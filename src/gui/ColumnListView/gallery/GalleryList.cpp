#include "gui/ColumnListView/gallery/GalleryList.h"

#include "gui/ColumnListView/CLVContainerView.h"

#include <algorithm>

GalleryList::GalleryList(BRect frame, CLVContainerView** container_out, bool hierarchical)
    : ColumnListView(frame, container_out, "list", B_FOLLOW_ALL_SIDES,
                     B_WILL_DRAW | B_FRAME_EVENTS | B_NAVIGABLE, B_MULTIPLE_SELECTION_LIST, hierarchical,
                     true, true, true, B_FANCY_BORDER) {
    SetSortFunction(CLVEasyItem::CompareItems);
}

GalleryList::~GalleryList() {
    mChanged = nullptr;
    MakeEmpty();
}

CLVColumn* GalleryList::MakeColumn(const char* label, float width, unsigned long flags, float minWidth) {
    auto column = std::make_unique<CLVColumn>(label, width, flags, minWidth);
    return AddColumn(column.get()) ? column.release() : nullptr;
}

CLVEasyItem* GalleryList::MakeRow(uint32 level, bool super, bool expanded) {
    mRows.push_back(std::make_unique<CLVEasyItem>(level, super, expanded, 17.0F));
    return mRows.back().get();
}

int32 GalleryList::FirstTextColumn() const {
    return CountColumns() > 0 && ColumnAt(0)->IsExpander() ? 1 : 0;
}

CLVEasyItem* GalleryList::AppendRow(uint32 level, bool super, std::initializer_list<std::string> texts,
                                    bool expanded) {
    CLVEasyItem* const row = MakeRow(level, super, expanded);
    int32 column = FirstTextColumn();
    for (const std::string& text : texts) {
        row->SetColumnContent(column++, text.c_str());
    }
    AddItem(row);
    Changed();
    return row;
}

void GalleryList::DeleteSelectedRows() {
    std::vector<const CLVListItem*> gone;
    for (int32 selected = CurrentSelection(); selected >= 0; selected = CurrentSelection()) {
        auto* const row = static_cast<CLVListItem*>(ItemAt(selected));
        const int32 below = IsHierarchical() ? FullListNumberOfSubitems(row) : 0;
        const int32 first = IsHierarchical() ? FullListIndexOf(row) : selected;
        for (int32 i = first; i <= first + below; ++i) {
            gone.push_back(IsHierarchical() ? FullListItemAt(i) : static_cast<CLVListItem*>(ItemAt(i)));
        }
        RemoveItem(row);
    }
    std::sort(gone.begin(), gone.end());
    std::erase_if(mRows, [&](const std::unique_ptr<CLVEasyItem>& row) {
        return std::binary_search(gone.begin(), gone.end(), row.get());
    });
    Changed();
}

void GalleryList::ExpandAll() {
    for (int32 i = 0; i < FullListCountItems(); ++i) {
        if (FullListItemAt(i)->IsSuperItem()) {
            Expand(FullListItemAt(i));
        }
    }
}

void GalleryList::CollapseAll() {
    for (int32 i = FullListCountItems() - 1; i >= 0; --i) {
        if (FullListItemAt(i)->IsSuperItem()) {
            Collapse(FullListItemAt(i));
        }
    }
}

int32 GalleryList::CountRows() const {
    return IsHierarchical() ? FullListCountItems() : CountItems();
}

std::string GalleryList::Summary() const {
    std::string text = std::to_string(CountRows()) + " rows";
    if (IsHierarchical()) {
        text += ", " + std::to_string(CountItems()) + " to be seen";
    }
    int32 selected = 0;
    while (CurrentSelection(selected) >= 0) {
        ++selected;
    }
    text += ", " + std::to_string(selected) + " selected";
    std::vector<int32> keys(static_cast<size_t>(CountColumns()));
    std::vector<CLVSortMode> modes(keys.size());
    const int32 count = Sorting(keys.data(), modes.data());
    for (int32 i = 0; i < count; ++i) {
        const auto at = static_cast<size_t>(i);
        const char* const label = ColumnAt(keys[at])->GetLabel();
        text += i == 0 ? "; sorted by " : ", then ";
        text += label == nullptr ? "?" : label;
        text += modes[at] == CLV_SORT_DESCENDING ? " (descending)" : "";
    }
    return text;
}

void GalleryList::Changed() {
    if (mChanged) {
        mChanged();
    }
}

void GalleryList::SortingChanged() {
    Changed();
}

void GalleryList::DisplayOrderChanged(const int32* order) {
    ColumnListView::DisplayOrderChanged(order);
    Changed();
}

void GalleryList::ColumnWidthChanged(int32 column_index, float new_width) {
    ColumnListView::ColumnWidthChanged(column_index, new_width);
    Changed();
}

void GalleryList::Expand(CLVListItem* item) {
    ColumnListView::Expand(item);
    Changed();
}

void GalleryList::Collapse(CLVListItem* item) {
    ColumnListView::Collapse(item);
    Changed();
}

void GalleryList::SelectionChanged() {
    Changed();
}
