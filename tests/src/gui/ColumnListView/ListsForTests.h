// A column list that no window shows.
#pragma once

#include "RowsForTests.h"

#include "gui/ColumnListView/CLVColumn.h"
#include "gui/ColumnListView/CLVContainerView.h"
#include "gui/ColumnListView/ColumnListView.h"

#include <functional>
#include <gtest/gtest.h>
#include <memory>
#include <utility>
#include <vector>

// Writes down which of its hooks were called.
class TestColumnList : public ColumnListView {
  public:
    TestColumnList(CLVContainerView** container, bool hierarchical,
                   list_view_type type = B_MULTIPLE_SELECTION_LIST)
        : ColumnListView(BRect(10, 20, 309, 219), container, "list", B_FOLLOW_ALL_SIDES,
                         B_WILL_DRAW | B_FRAME_EVENTS | B_NAVIGABLE, type, hierarchical) {}
    void SortingChanged() override {
        ++sortingChanges;
        CallOnce(onSortingChanged);
    }
    void SelectionChanged() override {
        ++selectionChanges;
        CallOnce(onSelectionChanged);
    }
    void DisplayOrderChanged(const int32* order) override {
        toldOrders.emplace_back(order, order + CountColumns());
        ColumnListView::DisplayOrderChanged(order);
    }
    void SetSortMode(int32 column, CLVSortMode mode) override {
        setModes.push_back(mode);
        ColumnListView::SetSortMode(column, mode);
    }

    int sortingChanges = 0;
    int selectionChanges = 0;
    std::vector<std::vector<int32>> toldOrders;
    std::vector<CLVSortMode> setModes;
    // Called by the hooks, the next time alone.
    std::function<void()> onSortingChanged;
    std::function<void()> onSelectionChanged;

  private:
    static void CallOnce(std::function<void()>& function) {
        const std::function<void()> called = std::exchange(function, nullptr);
        if (called) {
            called();
        }
    }
};

class ColumnLists : public ::testing::Test {
  protected:
    typedef std::vector<int> Numbers;

    ~ColumnLists() override { mContainer.reset(); }

    // Before anything else.
    TestColumnList& Make(bool hierarchical) {
        CLVContainerView* container = nullptr;
        mList = new TestColumnList(&container, hierarchical);
        mContainer.reset(container);
        return *mList;
    }
    CLVColumn* AddColumn(unsigned long flags = 0, float width = 50) {
        auto* const column = new CLVColumn("label", width, flags, 10);
        EXPECT_TRUE(mList->AddColumn(column));
        return column;
    }
    NumberedRow* New(uint32 level = 0, bool expanded = true, std::vector<int> keys = {}) {
        mRows.push_back(std::make_unique<NumberedRow>(static_cast<int>(mRows.size()), level, expanded));
        mRows.back()->keys = std::move(keys);
        return mRows.back().get();
    }
    NumberedRow* Add(uint32 level = 0, bool expanded = true, std::vector<int> keys = {}) {
        NumberedRow* const row = New(level, expanded, std::move(keys));
        EXPECT_TRUE(mList->AddItem(row));
        return row;
    }
    // Appended, all expanded.
    void Fill(const std::vector<uint32>& levels) {
        for (const uint32 level : levels) {
            Add(level);
        }
    }
    Numbers Full() const {
        Numbers numbers;
        for (int32 i = 0; i < mList->FullListCountItems(); ++i) {
            numbers.push_back(NumberOf(mList->FullListItemAt(i)));
        }
        return numbers;
    }
    Numbers Visible() const {
        Numbers numbers;
        for (int32 i = 0; i < mList->CountItems(); ++i) {
            numbers.push_back(NumberOf(mList->ItemAt(i)));
        }
        return numbers;
    }
    NumberedRow* Row(int number) const { return mRows[static_cast<size_t>(number)].get(); }

    static int CompareKeys(const CLVListItem* a, const CLVListItem* b, long column) {
        const auto key = [column](const CLVListItem* row) {
            const auto& keys = static_cast<const NumberedRow*>(row)->keys;
            return static_cast<size_t>(column) < keys.size() ? keys[static_cast<size_t>(column)] : 0;
        };
        return key(a) - key(b);
    }

    std::vector<std::unique_ptr<NumberedRow>> mRows;
    TestColumnList* mList = nullptr; // the container's
    std::unique_ptr<CLVContainerView> mContainer;
};
