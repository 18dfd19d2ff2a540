// Sort keys, and the order that they make.
#include "ListsForTests.h"

#include "gui/ColumnListView/OutlineSort.h"

#include <algorithm>

namespace {

class Sorting : public ColumnLists {
  protected:
    typedef std::vector<int32> Keys;
    typedef std::vector<CLVSortMode> Modes;

    // Columns 0 to 2 are sortable, 3 is not.
    void MakeSortable(bool hierarchical) {
        Make(hierarchical);
        for (const unsigned long flags : {1UL, 1UL, 1UL, 0UL}) {
            AddColumn(flags);
        }
        mList->SetSortFunction(CompareKeys);
    }
    void ExpectKeys(const Keys& keys, const Modes& modes) const {
        Keys actual(static_cast<size_t>(mList->Sorting(nullptr, nullptr)));
        Modes actualModes(actual.size());
        EXPECT_EQ(mList->Sorting(actual.data(), actualModes.data()), static_cast<int32>(keys.size()));
        EXPECT_EQ(actual, keys);
        EXPECT_EQ(actualModes, modes);
    }
    void AddWithKeys(const std::vector<std::vector<int>>& keys) {
        for (const auto& key : keys) {
            Add(0, true, key);
        }
    }
};

TEST_F(Sorting, SetSortKeyMakesTheColumnTheOnlyKeyAndAscending) {
    MakeSortable(false);
    AddWithKeys({{3, 1}, {1, 2}, {2, 3}});
    mList->SetSortKey(0);
    ExpectKeys({0}, {CLV_SORT_ASCENDING});
    EXPECT_EQ(Visible(), Numbers({1, 2, 0}));
    mList->AddSortKey(2);
    mList->SetSortKey(1);
    ExpectKeys({1}, {CLV_SORT_ASCENDING});
    EXPECT_EQ(Visible(), Numbers({0, 1, 2}));
    // Modes stay with the columns.
    mList->SetSortMode(0, CLV_SORT_DESCENDING);
    mList->SetSortKey(0);
    ExpectKeys({0}, {CLV_SORT_DESCENDING});
    EXPECT_EQ(Visible(), Numbers({0, 2, 1}));
}

TEST_F(Sorting, SetSortKeyOfThePrimaryKeyKeepsTheOthers) {
    MakeSortable(false);
    mList->SetSortKey(0);
    mList->AddSortKey(1);
    mList->sortingChanges = 0;
    mList->SetSortKey(0);
    ExpectKeys({0, 1}, {CLV_SORT_ASCENDING, CLV_SORT_ASCENDING});
    EXPECT_EQ(mList->sortingChanges, 1);
}

TEST_F(Sorting, SetSortKeyBelowZeroLeavesNoKey) {
    MakeSortable(false);
    AddWithKeys({{2}, {1}});
    mList->SetSortKey(0);
    mList->sortingChanges = 0;
    mList->SetSortKey(-1);
    ExpectKeys({}, {});
    EXPECT_EQ(mList->sortingChanges, 1);
    EXPECT_EQ(Visible(), Numbers({1, 0}));
}

TEST_F(Sorting, ColumnsThatAreNotSortableOrNotThereAreIgnored) {
    MakeSortable(false);
    for (const int32 column : {3, 4}) {
        mList->SetSortKey(column);
        mList->AddSortKey(column);
        mList->SetSortMode(column, CLV_SORT_DESCENDING);
        mList->ReverseSortMode(column);
    }
    mList->AddSortKey(-1);
    ExpectKeys({}, {});
    EXPECT_EQ(mList->ColumnAt(3)->SortMode(), CLV_SORT_NONE);
    EXPECT_EQ(mList->sortingChanges, 0);
}

TEST_F(Sorting, AddSortKeyOfAKeyDoesNothing) {
    MakeSortable(false);
    mList->SetSortKey(0);
    mList->sortingChanges = 0;
    mList->AddSortKey(0);
    ExpectKeys({0}, {CLV_SORT_ASCENDING});
    EXPECT_EQ(mList->sortingChanges, 0);
}

TEST_F(Sorting, LaterKeysDecideAmongEqualRows) {
    MakeSortable(false);
    AddWithKeys({{1, 5, 1}, {1, 7, 1}, {0, 1, 1}, {1, 7, 0}});
    mList->SetSortKey(0);
    mList->AddSortKey(1);
    mList->AddSortKey(2);
    EXPECT_EQ(Visible(), Numbers({2, 0, 3, 1}));
    mList->SetSortMode(1, CLV_SORT_DESCENDING);
    EXPECT_EQ(Visible(), Numbers({2, 3, 1, 0}));
    // Dropped, and the last key decides.
    mList->SetSortMode(1, CLV_SORT_NONE);
    ExpectKeys({0, 2}, {CLV_SORT_ASCENDING, CLV_SORT_ASCENDING});
    EXPECT_EQ(NumberOf(mList->ItemAt(1)), 3);
}

TEST_F(Sorting, SetSortModeTellsEvenWhenTheModeIsAsItWas) {
    MakeSortable(false);
    mList->SetSortMode(0, CLV_SORT_NONE);
    EXPECT_EQ(mList->sortingChanges, 1);
    // And adds no key.
    mList->SetSortMode(0, CLV_SORT_DESCENDING);
    EXPECT_EQ(mList->sortingChanges, 2);
    ExpectKeys({}, {});
}

TEST_F(Sorting, ReverseSortModeGoesThroughNoneAndDropsTheKeyForGood) {
    MakeSortable(false);
    AddWithKeys({{1}, {2}});
    mList->SetSortKey(0);
    mList->setModes.clear();
    mList->ReverseSortMode(0);
    ExpectKeys({0}, {CLV_SORT_DESCENDING});
    EXPECT_EQ(Visible(), Numbers({1, 0}));
    mList->ReverseSortMode(0);
    ExpectKeys({}, {});
    mList->ReverseSortMode(0);
    EXPECT_EQ(mList->ColumnAt(0)->SortMode(), CLV_SORT_ASCENDING);
    ExpectKeys({}, {});
    EXPECT_EQ(Visible(), Numbers({1, 0}));
    // Through the hook.
    EXPECT_EQ(mList->setModes, Modes({CLV_SORT_DESCENDING, CLV_SORT_NONE, CLV_SORT_ASCENDING}));
}

TEST_F(Sorting, AColumnsOwnSortModeGoesThroughTheList) {
    MakeSortable(false);
    AddWithKeys({{1}, {2}});
    mList->SetSortKey(0);
    mList->ColumnAt(0)->SetSortMode(CLV_SORT_DESCENDING);
    EXPECT_EQ(Visible(), Numbers({1, 0}));
}

TEST_F(Sorting, SetSortingReplacesKeysAndModes) {
    MakeSortable(false);
    AddWithKeys({{1, 1}, {1, 2}, {2, 0}});
    mList->SetSortKey(2);
    int32 keys[] = {0, 1};
    CLVSortMode modes[] = {CLV_SORT_DESCENDING, CLV_SORT_DESCENDING};
    mList->SetSorting(2, keys, modes);
    ExpectKeys({0, 1}, {CLV_SORT_DESCENDING, CLV_SORT_DESCENDING});
    EXPECT_EQ(Visible(), Numbers({2, 1, 0}));
    mList->SetSorting(0, nullptr, nullptr);
    ExpectKeys({}, {});
}

TEST_F(Sorting, RemovingSeveralSortKeyColumnsLeavesAllButTheFirstAmongTheKeys) {
    MakeSortable(false);
    AddWithKeys({{1, 2}, {2, 1}});
    mList->SetSortKey(0);
    mList->AddSortKey(1);
    const std::unique_ptr<CLVColumn> first(mList->ColumnAt(0));
    std::unique_ptr<CLVColumn> second(mList->ColumnAt(1));
    EXPECT_TRUE(mList->RemoveColumns(first.get(), 2));
    EXPECT_FALSE(mList->IsInSortKeys(first.get()));
    EXPECT_TRUE(mList->IsInSortKeys(second.get()));
    ExpectKeys({-1}, {CLV_SORT_NONE});
    // It orders nothing, though it may be gone.
    second.reset();
    mList->SortItems();
    EXPECT_EQ(Visible(), Numbers({0, 1}));
    mList->SetSortKey(0);
    ExpectKeys({0}, {CLV_SORT_ASCENDING});
}

TEST_F(Sorting, RemovingASortKeyColumnDropsTheKey) {
    MakeSortable(false);
    mList->SetSortKey(0);
    mList->AddSortKey(1);
    const std::unique_ptr<CLVColumn> column(mList->ColumnAt(0));
    EXPECT_TRUE(mList->RemoveColumn(column.get()));
    ExpectKeys({0}, {CLV_SORT_ASCENDING});
}

TEST_F(Sorting, WithoutASortFunctionNothingIsReordered) {
    for (const bool hierarchical : {false, true}) {
        MakeSortable(hierarchical);
        mList->SetSortFunction(nullptr);
        mRows.clear();
        AddWithKeys({{3}, {1}, {2}});
        mList->SetSortKey(0);
        mList->SortItems();
        EXPECT_EQ(Visible(), Numbers({0, 1, 2}));
        mList->MakeEmpty();
    }
}

TEST_F(Sorting, AnEmptyListIsSorted) {
    MakeSortable(true);
    mList->SetSortKey(0);
    mList->SortItems();
    EXPECT_TRUE(mList->IsEmpty());
}

TEST_F(Sorting, EqualRowsOfAFlatListKeepTheirOrderAndThoseOfAnOutlineAreExchanged) {
    for (const bool hierarchical : {false, true}) {
        MakeSortable(hierarchical);
        mRows.clear();
        AddWithKeys({{2}, {2}, {1}});
        mList->SetSortKey(0);
        EXPECT_EQ(Visible(), hierarchical ? Numbers({2, 1, 0}) : Numbers({2, 0, 1}));
        EXPECT_EQ(Full(), Visible());
        mList->MakeEmpty();
    }
}

TEST_F(Sorting, SelectedRowsStaySelected) {
    MakeSortable(true);
    AddWithKeys({{3}, {1}, {2}});
    mList->Select(0);
    mList->SetSortKey(0);
    EXPECT_EQ(mList->CurrentSelection(0), 2);
    EXPECT_EQ(mList->CurrentSelection(1), -1);
    EXPECT_TRUE(Row(0)->IsSelected());
}

TEST_F(Sorting, RowsTakeAllRowsBelowAlongVisibleOrNot) {
    MakeSortable(true);
    Add(0, true, {2});
    Add(1, false, {9});
    Add(2, true, {8});
    Add(2, true, {7});
    Add(1, true, {1});
    Add(0, true, {1});
    Add(1, true, {5});
    mList->SetSortKey(0);
    EXPECT_EQ(Full(), Numbers({5, 6, 0, 4, 1, 3, 2}));
    EXPECT_EQ(Visible(), Numbers({5, 6, 0, 4, 1}));
    mList->Expand(Row(1));
    EXPECT_EQ(Visible(), Numbers({5, 6, 0, 4, 1, 3, 2}));
    mList->SetSortMode(0, CLV_SORT_DESCENDING);
    EXPECT_EQ(Full(), Numbers({0, 1, 2, 3, 4, 5, 6}));
}

TEST_F(Sorting, NoRowIsLostWhereLevelsDoNotFitTogether) {
    struct Given {
        uint32 level;
        int key;
    };
    const struct {
        const char* name;
        std::vector<Given> rows;
        Numbers sorted;
    } cases[] = {
        {"a deeper row comes first", {{1, 2}, {1, 1}, {0, 2}, {0, 1}}, {1, 0, 3, 2}},
        {"a level is left out", {{0, 2}, {2, 2}, {2, 1}, {1, 1}, {0, 1}}, {4, 0, 2, 1, 3}},
        {"deeper rows at the end", {{0, 1}, {0, 0}, {5, 2}, {5, 1}}, {1, 3, 2, 0}},
        {"ever less deep", {{3, 1}, {2, 2}, {1, 3}, {0, 4}}, {0, 1, 2, 3}},
    };
    for (const auto& [name, rows, sorted] : cases) {
        MakeSortable(true);
        mRows.clear();
        for (const Given& row : rows) {
            Add(row.level, true, {row.key});
        }
        mList->SetSortKey(0);
        EXPECT_EQ(Full(), sorted) << name;
        EXPECT_EQ(Visible(), sorted) << name;
        mList->MakeEmpty();
    }
}

TEST_F(Sorting, AChainOfAHundredThousandLevelsIsSorted) {
    std::vector<CLVListItem*> rows;
    for (uint32 level = 0; level < 100000; ++level) {
        rows.push_back(New(level));
    }
    RowOrder order(CompareKeys);
    order.AddKey(0, CLV_SORT_ASCENDING);
    EXPECT_EQ(OutlineSort(rows, order).Sorted(), rows);
}

TEST_F(Sorting, TheLargestDifferencesAreReversedToo) {
    MakeSortable(false);
    AddWithKeys({{0}, {1}});
    mList->SetSortFunction([](const CLVListItem* a, const CLVListItem* b, long) {
        return CompareKeys(a, b, 0) < 0 ? -2147483647 - 1 : 2147483647;
    });
    mList->SetSortMode(0, CLV_SORT_DESCENDING);
    mList->SetSortKey(0);
    EXPECT_EQ(Visible(), Numbers({1, 0}));
}

} // namespace
