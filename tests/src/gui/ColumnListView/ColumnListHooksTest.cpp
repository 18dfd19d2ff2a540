// What the hooks of a list may do to it while it calls them.
#include "ListsForTests.h"

#include "kits/interface/ViewStage.h"

#include <algorithm>
#include <string>

namespace {

class ListHooks : public ColumnLists {
  protected:
    // A super-row with two rows below it, one of which has another below it; and two rows.
    void MakeOutline() {
        Make(true);
        mRows.clear();
        Fill({0, 1, 2, 1, 0, 0});
    }
    void RemoveAndDeleteAll() {
        for (const auto& row : mRows) {
            mList->RemoveItem(row.get());
        }
        mRows.clear();
    }
    // That both lists and the data rectangle tell the same.
    void ExpectToBeWhole() {
        Numbers visible;
        for (int32 i = 0; i < mList->FullListCountItems(); ++i) {
            const CLVListItem* const row = mList->FullListItemAt(i);
            if (mList->IsVisible(row)) {
                EXPECT_EQ(mList->VisibleIndexOf(row), static_cast<int32>(visible.size()));
                visible.push_back(NumberOf(row));
            }
        }
        EXPECT_EQ(Visible(), visible);
        const float height = visible.empty() ? 0 : 20 * static_cast<float>(visible.size()) - 1;
        EXPECT_EQ(mContainer->GetDataRect().bottom, height);
    }
};

struct Step {
    const char* what;
    std::function<void()> run;
};

TEST_F(ListHooks, TheSelectionsMayChangeTheRowsWhateverChangedTheSelection) {
    const auto select = [&](int number) { mList->Select(mList->VisibleIndexOf(Row(number))); };
    const Step kActions[] = {
        {"collapsing", [&] { mList->Collapse(Row(0)); }},
        {"removing a row", [&] { mList->RemoveItem(Row(2)); }},
        {"removing its super-row", [&] { mList->RemoveItem(Row(1)); }},
        {"removing a run", [&] { mList->RemoveItems(1, 4); }},
        {"selecting", [&] { mList->Select(0); }},
        {"deselecting", [&] { mList->DeselectAll(); }},
        {"expanding above rows that are there already",
         [&] {
             mList->Collapse(Row(4));
             Row(5)->SetOutlineLevel(1);
             const auto hook = std::exchange(mList->onSelectionChanged, nullptr);
             select(5);
             mList->onSelectionChanged = hook;
             mList->Expand(Row(4));
         }},
    };
    const Step kHooks[] = {
        {"empties the list", [&] { mList->MakeEmpty(); }},
        {"deletes all rows", [&] { RemoveAndDeleteAll(); }},
        {"expands the first row", [&] { mList->Expand(Row(0)); }},
        {"collapses the first row", [&] { mList->Collapse(Row(0)); }},
        {"collapses the last row but one", [&] { mList->Collapse(Row(4)); }},
        {"collapses and expands the last row but one",
         [&] {
             mList->Collapse(Row(4));
             mList->Expand(Row(4));
         }},
        {"adds a row", [&] { mList->AddItem(New(0), 0); }},
    };
    for (const Step& action : kActions) {
        for (const Step& hook : kHooks) {
            SCOPED_TRACE(std::string(action.what) + ", the hook " + hook.what);
            MakeOutline();
            select(2);
            mList->onSelectionChanged = hook.run;
            action.run();
            EXPECT_EQ(mList->onSelectionChanged, nullptr) << "it was not called";
            ExpectToBeWhole();
            mList->AddItem(New(0), 0);
            ExpectToBeWhole();
        }
    }
}

TEST_F(ListHooks, RowsThatTheSelectionsExpandsAgainAreShownOnce) {
    MakeOutline();
    mList->Select(2);
    mList->onSelectionChanged = [&] { mList->Expand(Row(0)); };

    mList->Collapse(Row(0));

    EXPECT_EQ(Visible(), Numbers({0, 1, 2, 3, 4, 5}));
    EXPECT_TRUE(Row(0)->IsExpanded());
}

TEST_F(ListHooks, TheSelectionsMayEmptyTheListWhenARowIsReplaced) {
    Make(false);
    Fill({0, 0});
    mList->Select(1);
    mList->onSelectionChanged = [&] { mList->MakeEmpty(); };

    EXPECT_TRUE(mList->ReplaceItem(1, New()));

    EXPECT_EQ(Visible(), Numbers());
    EXPECT_EQ(Full(), Numbers());
    EXPECT_FALSE(mList->ReplaceItem(0, New())) << "there is none";
}

TEST_F(ListHooks, TheSelectionsMayEmptyTheListUnderThePointerAndTheKeys) {
    for (const bool hierarchical : {false, true}) {
        Make(hierarchical);
        mRows.clear();
        AddColumn();
        Fill({0, 0, 0, 0});
        mContainer->MoveTo(0, 0);
        ViewStage stage(320, 240);
        stage.Add(mContainer.release());
        const auto emptiesNextTime = [&] {
            stage.Locked([&] {
                if (mList->IsEmpty()) {
                    // They would come with their selection.
                    Row(0)->Deselect();
                    Row(1)->Deselect();
                    mList->AddItem(Row(0));
                    mList->AddItem(Row(1));
                }
                mList->onSelectionChanged = [&] { mList->MakeEmpty(); };
            });
        };
        const auto isEmpty = [&] {
            bool empty = false;
            stage.Redraw();
            stage.Locked([&] { empty = mList->IsEmpty() && mList->CurrentSelection() == -1; });
            return empty;
        };
        emptiesNextTime();
        stage.Click(mList, BPoint(20, 10));
        EXPECT_TRUE(isEmpty());
        emptiesNextTime();
        stage.Click(mList, BPoint(20, 30), B_CONTROL_KEY);
        EXPECT_TRUE(isEmpty());
        emptiesNextTime();
        stage.Click(mList, BPoint(20, 30), B_SHIFT_KEY);
        EXPECT_TRUE(isEmpty());
        for (const char key : {B_DOWN_ARROW, B_END, B_PAGE_DOWN}) {
            emptiesNextTime();
            stage.Key(mList, key);
            EXPECT_TRUE(isEmpty());
        }
    }
}

TEST_F(ListHooks, TheSortingsMayTakeTheKeysColumnAway) {
    CLVColumn* column = nullptr;
    int32 key = 1;
    CLVSortMode mode = CLV_SORT_DESCENDING;
    const Step kActions[] = {
        {"SetSortKey", [&] { mList->SetSortKey(1); }},
        {"AddSortKey", [&] { mList->AddSortKey(1); }},
        {"SetSortMode", [&] { mList->SetSortMode(1, CLV_SORT_ASCENDING); }},
        {"ReverseSortMode", [&] { mList->ReverseSortMode(1); }},
        {"SetSorting", [&] { mList->SetSorting(1, &key, &mode); }},
        {"the column's SetSortMode", [&] { column->SetSortMode(CLV_SORT_ASCENDING); }},
    };
    for (const bool hierarchical : {false, true}) {
        for (const Step& action : kActions) {
            SCOPED_TRACE(action.what);
            Make(hierarchical);
            mRows.clear();
            AddColumn(CLV_COLUMN_SORTABLE);
            column = AddColumn(CLV_COLUMN_SORTABLE);
            Add(0, true, {2, 1});
            Add(0, true, {1, 2});
            mList->SetSortFunction(CompareKeys);
            mList->SetSortKey(0);
            mList->onSortingChanged = [&] { delete column; };

            action.run();

            EXPECT_EQ(mList->CountColumns(), 1);
            EXPECT_LE(mList->Sorting(nullptr, nullptr), 1);
            mList->SetSortKey(0);
            EXPECT_EQ(Visible(), Numbers({1, 0}));
        }
    }
}

TEST_F(ListHooks, TheSortingsMayEmptyTheListOrSetOtherKeys) {
    Make(false);
    AddColumn(CLV_COLUMN_SORTABLE);
    AddColumn(CLV_COLUMN_SORTABLE);
    Add(0, true, {1, 2});
    Add(0, true, {2, 1});
    mList->SetSortFunction(CompareKeys);
    mList->onSortingChanged = [&] { mList->SetSortKey(1); };
    mList->SetSortKey(0);
    EXPECT_EQ(mList->PrimarySortKey(), mList->ColumnAt(1));
    EXPECT_EQ(Visible(), Numbers({1, 0}));

    mList->onSortingChanged = [&] { mList->MakeEmpty(); };
    mList->ReverseSortMode(1);
    EXPECT_EQ(Visible(), Numbers());
    EXPECT_EQ(Full(), Numbers());
}

TEST_F(ListHooks, AFunctionForEachRowMayTakeRowsAway) {
    MakeOutline();
    std::function<void()> removeAll = [&] { RemoveAndDeleteAll(); };
    mList->FullListDoForEach(
        [](CLVListItem* /*row*/, void* function) {
            (*static_cast<std::function<void()>*>(function))();
            return false;
        },
        &removeAll);
    EXPECT_EQ(Full(), Numbers());
}

TEST_F(ListHooks, RowsMayBeDeletedOnceTheyHaveLeft) {
    for (const bool hierarchical : {false, true}) {
        Make(hierarchical);
        mRows.clear();
        AddColumn(CLV_COLUMN_SORTABLE);
        mList->SetSortFunction(CompareKeys);
        Fill({0, 0, 0, 0, 0, 0});
        mList->Select(1, 4);
        mList->IndexOf(Row(2));
        mList->RemoveItems(1, 4);
        mRows.erase(mRows.begin() + 1, mRows.begin() + 5);
        EXPECT_EQ(mList->CurrentSelection(), -1);
        mList->SetSortKey(0);
        mList->Select(1);
        mList->RemoveItem(1);
        mRows.pop_back();
        mList->MakeEmpty();
        mRows.clear();
        Fill({0, 0});
        EXPECT_EQ(Visible(), Numbers({0, 1}));
        ExpectToBeWhole();
    }
}

} // namespace
