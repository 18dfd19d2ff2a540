// GalleryList: a column list that owns its rows and tells what happens to it.
#pragma once

#include "gui/ColumnListView/CLVEasyItem.h"
#include "gui/ColumnListView/ColumnListView.h"

#include <functional>
#include <initializer_list>
#include <memory>
#include <string>
#include <vector>

// Thread rule: that of ColumnListView.
class GalleryList : public ColumnListView {
  public:
    // `frame` and `container_out` as ColumnListView has them.
    GalleryList(BRect frame, CLVContainerView** container_out, bool hierarchical);
    ~GalleryList() override;

    // Called when keys, places, widths, rows or what is expanded have changed. It must not change the list.
    void SetChangeHandler(std::function<void()> handler) { mChanged = std::move(handler); }

    // A column at the right end.
    CLVColumn* MakeColumn(const char* label, float width, unsigned long flags, float minWidth = 20);
    // A row at the end, its texts from the first column that is no expander on; "" leaves a cell empty.
    CLVEasyItem* AppendRow(uint32 level, bool super, std::initializer_list<std::string> texts,
                           bool expanded = true);
    // For rows that have cells of other kinds too.
    CLVEasyItem* MakeRow(uint32 level, bool super, bool expanded);

    // Hierarchical, with all that is below them.
    void DeleteSelectedRows();
    void ExpandAll();
    void CollapseAll();
    int32 CountRows() const;
    // One line: rows, selected rows, keys.
    std::string Summary() const;

    void SortingChanged() override;
    void DisplayOrderChanged(const int32* order) override;
    void ColumnWidthChanged(int32 column_index, float new_width) override;
    void Expand(CLVListItem* item) override;
    void Collapse(CLVListItem* item) override;
    void SelectionChanged() override;

  private:
    void Changed();
    int32 FirstTextColumn() const;

    std::vector<std::unique_ptr<CLVEasyItem>> mRows;
    std::function<void()> mChanged;
};
