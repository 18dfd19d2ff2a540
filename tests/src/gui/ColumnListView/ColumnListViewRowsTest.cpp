// Rows that come and go, flat and as an outline.
#include "ListsForTests.h"

#include <ListItem.h>

namespace {

typedef ColumnLists Rows;

TEST_F(Rows, OfAFlatListAreAllVisible) {
    Make(false);
    Fill({0, 1, 2});
    EXPECT_TRUE(mList->AddItem(New(), 1));
    EXPECT_EQ(Full(), Numbers({0, 3, 1, 2}));
    EXPECT_EQ(Visible(), Numbers({0, 3, 1, 2}));
    EXPECT_EQ(mList->VisibleIndexOf(Row(1)), 2);
    EXPECT_EQ(mList->FullListIndexOf(Row(1)), 2);
    EXPECT_EQ(mList->Superitem(Row(2)), nullptr);
    EXPECT_EQ(mList->FullListNumberOfSubitems(Row(0)), 0);
    EXPECT_TRUE(mList->RemoveItem(Row(0)));
    EXPECT_EQ(Full(), Numbers({3, 1, 2}));
    EXPECT_EQ(mList->RemoveItem(0), Row(3));
    EXPECT_EQ(Visible(), Numbers({1, 2}));
}

TEST_F(Rows, ThatAreNoColumnListRowsAreRefused) {
    BStringItem text("text");
    for (const bool hierarchical : {false, true}) {
        Make(hierarchical);
        NumberedRow* const super = Add();
        EXPECT_FALSE(mList->AddItem(&text));
        EXPECT_FALSE(mList->AddItem(&text, 0));
        EXPECT_FALSE(mList->AddItem(nullptr));
        EXPECT_FALSE(mList->AddUnder(&text, super));
        BList items;
        items.AddItem(New());
        items.AddItem(static_cast<BListItem*>(&text));
        EXPECT_FALSE(mList->AddList(&items));
        EXPECT_FALSE(mList->AddList(nullptr));
        EXPECT_EQ(mList->FullListCountItems(), 1);
        EXPECT_FALSE(mList->RemoveItem(&text));
        mList->MakeEmpty();
    }
}

TEST_F(Rows, AreInOneListOnce) {
    Make(true);
    NumberedRow* const row = Add();
    EXPECT_FALSE(mList->AddItem(row));
    BList twice;
    NumberedRow* const other = New();
    twice.AddItem(other);
    twice.AddItem(New());
    twice.AddItem(other);
    twice.AddItem(New());
    EXPECT_FALSE(mList->AddList(&twice, 0));
    // Those before the one that was refused stay.
    EXPECT_EQ(Full(), Numbers({1, 2, 0}));
    EXPECT_EQ(Visible(), Numbers({1, 2, 0}));
}

TEST_F(Rows, AreRefusedAtIndicesOutOfRange) {
    for (const bool hierarchical : {false, true}) {
        Make(hierarchical);
        Add();
        BList list;
        list.AddItem(New());
        EXPECT_FALSE(mList->AddItem(New(), -1));
        EXPECT_FALSE(mList->AddItem(New(), 2));
        EXPECT_FALSE(mList->AddList(&list, -1));
        EXPECT_FALSE(mList->AddList(&list, 2));
        EXPECT_EQ(mList->RemoveItem(-1), nullptr);
        EXPECT_EQ(mList->RemoveItem(1), nullptr);
        EXPECT_FALSE(mList->RemoveItems(1, 1));
        EXPECT_FALSE(mList->RemoveItems(0, 0));
        EXPECT_FALSE(mList->RemoveItem(New()));
        EXPECT_EQ(mList->FullListItemAt(-1), nullptr);
        EXPECT_EQ(mList->FullListItemAt(1), nullptr);
        EXPECT_FALSE(mList->IsExpanded(-1));
        EXPECT_FALSE(mList->IsExpanded(1));
        EXPECT_EQ(mList->FullListCountItems(), 1);
        EXPECT_EQ(mList->CountItems(), 1);
        mList->MakeEmpty();
    }
}

TEST_F(Rows, BelowACollapsedRowAreHidden) {
    Make(true);
    Add(0);
    Add(1, false);
    Add(2);
    Add(3);
    Add(1);
    EXPECT_EQ(Full(), Numbers({0, 1, 2, 3, 4}));
    EXPECT_EQ(Visible(), Numbers({0, 1, 4}));
    EXPECT_FALSE(mList->IsVisible(Row(3)));
    EXPECT_EQ(mList->VisibleIndexOf(Row(3)), -1);
    EXPECT_EQ(mList->VisibleIndexOf(Row(4)), 2);
    EXPECT_EQ(mList->Superitem(Row(3)), Row(2));
    EXPECT_EQ(mList->Superitem(Row(4)), Row(0));
    EXPECT_EQ(mList->Superitem(Row(0)), nullptr);
    EXPECT_EQ(mList->FullListNumberOfSubitems(Row(0)), 4);
    EXPECT_EQ(mList->FullListNumberOfSubitems(Row(1)), 2);
    EXPECT_EQ(mList->FullListNumberOfSubitems(Row(4)), 0);
    EXPECT_EQ(mList->FullListNumberOfSubitems(New()), 0);
    EXPECT_EQ(mList->Superitem(New()), nullptr);
}

TEST_F(Rows, AreInsertedBehindTheNearestVisibleRow) {
    Make(true);
    Add(0, false);
    Add(1);
    Add(0);
    EXPECT_TRUE(mList->AddItem(New(0), 2));
    EXPECT_TRUE(mList->AddItem(New(1), 1));
    EXPECT_TRUE(mList->AddItem(New(0), 0));
    EXPECT_EQ(Full(), Numbers({5, 0, 4, 1, 3, 2}));
    EXPECT_EQ(Visible(), Numbers({5, 0, 3, 2}));
}

TEST_F(Rows, AddedUnderARowBecomeItsLast) {
    Make(true);
    Fill({0, 1, 2, 0});
    NumberedRow* const under = New(7);
    EXPECT_TRUE(mList->AddUnder(under, Row(0)));
    EXPECT_EQ(under->OutlineLevel(), 1U);
    EXPECT_EQ(Full(), Numbers({0, 1, 2, 4, 3}));
    EXPECT_EQ(Visible(), Numbers({0, 1, 2, 4, 3}));
    EXPECT_TRUE(mList->AddUnder(New(), Row(3)));
    EXPECT_EQ(Full(), Numbers({0, 1, 2, 4, 3, 5}));
}

TEST_F(Rows, AddedUnderNothingOrInAFlatListAreRefusedAndKeepTheirLevel) {
    Make(true);
    Add();
    NumberedRow* const row = New(7);
    EXPECT_FALSE(mList->AddUnder(row, New()));
    EXPECT_FALSE(mList->AddUnder(row, nullptr));
    Make(false);
    NumberedRow* const flat = Add();
    EXPECT_FALSE(mList->AddUnder(row, flat));
    EXPECT_EQ(row->OutlineLevel(), 7U);
    mList->MakeEmpty();
}

TEST_F(Rows, OfAListAreAddedAsIfOneByOne) {
    // Below a collapsed row, a collapsed one of their own, and above what is there.
    Make(true);
    Add(0);
    Add(1, false);
    Add(0);
    BList list;
    for (const auto& [level, expanded] :
         {std::pair{2U, true}, {1U, true}, {2U, false}, {3U, true}, {0U, true}}) {
        list.AddItem(static_cast<BListItem*>(New(level, expanded)));
    }
    EXPECT_TRUE(mList->AddList(&list, 2));
    EXPECT_EQ(Full(), Numbers({0, 1, 3, 4, 5, 6, 7, 2}));
    EXPECT_EQ(Visible(), Numbers({0, 1, 4, 5, 7, 2}));
}

TEST_F(Rows, RemovingASuperRowRemovesHiddenDescendants) {
    Make(true);
    Add(0);
    Add(1, false);
    Add(2);
    Add(0);
    EXPECT_TRUE(mList->RemoveItem(Row(0)));
    EXPECT_EQ(Full(), Numbers({3}));
    EXPECT_EQ(Visible(), Numbers({3}));
    EXPECT_FALSE(mList->FullListHasItem(Row(2)));
    // What was removed can be added again.
    EXPECT_TRUE(mList->AddItem(Row(2)));
}

TEST_F(Rows, RemovedRunsReachOverAllThatIsDeeperThanTheShallowestOfThem) {
    Make(true);
    Fill({0, 1, 2, 1, 2, 0});
    EXPECT_TRUE(mList->RemoveItems(2, 1));
    EXPECT_EQ(Full(), Numbers({0, 1, 3, 4, 5}));
    // From row 1, a run that ends with row 3, whose row 4 goes along.
    EXPECT_TRUE(mList->RemoveItems(1, 2));
    EXPECT_EQ(Full(), Numbers({0, 5}));
    EXPECT_TRUE(mList->RemoveItems(1, 100));
    EXPECT_EQ(Visible(), Numbers({0}));
}

TEST_F(Rows, CollapsingGivesUpTheSelectionOfWhatItHides) {
    Make(true);
    Fill({0, 1, 1, 0});
    mList->Select(1);
    mList->Select(3, 3, true);
    mList->selectionChanges = 0;
    mList->Collapse(Row(0));
    EXPECT_EQ(Visible(), Numbers({0, 3}));
    EXPECT_EQ(mList->CurrentSelection(0), 1);
    EXPECT_EQ(mList->CurrentSelection(1), -1);
    EXPECT_EQ(mList->FullListCurrentSelection(0), 3);
    EXPECT_EQ(mList->FullListCurrentSelection(1), -1);
    EXPECT_EQ(mList->selectionChanges, 1);
    mList->Expand(Row(0));
    EXPECT_FALSE(Row(1)->IsSelected());
    EXPECT_EQ(mList->FullListCurrentSelection(0), 3);
}

TEST_F(Rows, ExpandShowsAllButWhatCollapsedRowsHide) {
    Make(true);
    Add(0, false);
    Add(1, false);
    Add(2);
    Add(1, true);
    Add(2);
    Add(0);
    EXPECT_EQ(Visible(), Numbers({0, 5}));
    mList->Expand(Row(0));
    EXPECT_EQ(Visible(), Numbers({0, 1, 3, 4, 5}));
    EXPECT_TRUE(mList->IsExpanded(0));
    EXPECT_FALSE(mList->IsExpanded(1));
    mList->Collapse(Row(0));
    EXPECT_EQ(Visible(), Numbers({0, 5}));
    // Hidden rows change, too, and show it when their turn comes.
    mList->Expand(Row(1));
    mList->Collapse(Row(3));
    EXPECT_EQ(Visible(), Numbers({0, 5}));
    mList->Expand(Row(0));
    EXPECT_EQ(Visible(), Numbers({0, 1, 2, 3, 5}));
}

TEST_F(Rows, AnyRowBecomesASuperRowWhenItIsExpandedOrCollapsed) {
    Make(true);
    NumberedRow* const expanded = Add(0, true);
    NumberedRow* const collapsed = Add(0, true);
    mList->Expand(expanded);
    mList->Collapse(collapsed);
    EXPECT_TRUE(expanded->IsSuperItem());
    EXPECT_TRUE(expanded->IsExpanded());
    EXPECT_TRUE(collapsed->IsSuperItem());
    EXPECT_FALSE(collapsed->IsExpanded());
    EXPECT_EQ(Visible(), Numbers({0, 1}));
    NumberedRow* const inNoList = New();
    mList->Collapse(inNoList);
    EXPECT_TRUE(inNoList->IsSuperItem());
    mList->Expand(nullptr);
}

TEST_F(Rows, WhoseLevelsChangedInTheListAreShownOnce) {
    Make(true);
    Add(0, false);
    Add(0);
    Row(1)->SetOutlineLevel(1);
    EXPECT_EQ(Visible(), Numbers({0, 1}));
    mList->Expand(Row(0));
    EXPECT_EQ(Visible(), Numbers({0, 1}));
    mList->Collapse(Row(0));
    EXPECT_EQ(Visible(), Numbers({0}));
}

TEST_F(Rows, MakeEmptyForgetsHiddenRowsToo) {
    Make(true);
    Add(0, false);
    Add(1);
    mRows.clear();
    mList->MakeEmpty();
    EXPECT_TRUE(mList->FullListIsEmpty());
    EXPECT_TRUE(mList->IsEmpty());
    EXPECT_EQ(mContainer->GetDataRect().bottom, 0);
    EXPECT_EQ(mList->FullListFirstItem(), nullptr);
    EXPECT_EQ(mList->FullListLastItem(), nullptr);
}

TEST_F(Rows, OfTheFullListAreVisitedUntilTheFunctionAnswersTrue) {
    Make(true);
    Add(0, false);
    Add(1);
    Add(0);
    static Numbers visited;
    visited.clear();
    mList->FullListDoForEach([](CLVListItem* row) {
        visited.push_back(NumberOf(row));
        return false;
    });
    EXPECT_EQ(visited, Numbers({0, 1, 2}));
    Numbers some;
    mList->FullListDoForEach(
        [](CLVListItem* row, void* argument) {
            static_cast<Numbers*>(argument)->push_back(NumberOf(row));
            return NumberOf(row) == 1;
        },
        &some);
    EXPECT_EQ(some, Numbers({0, 1}));
    EXPECT_EQ(mList->FullListFirstItem(), Row(0));
    EXPECT_EQ(mList->FullListLastItem(), Row(2));
    EXPECT_TRUE(mList->FullListHasItem(Row(1)));
}

TEST_F(Rows, UnderAPointAreKnownByTheirPlaceInTheFullList) {
    Make(true);
    Add(0, false);
    Add(1);
    Add(0);
    EXPECT_EQ(mList->FullListIndexOf(BPoint(5, 0)), 0);
    EXPECT_EQ(mList->FullListIndexOf(BPoint(5, 19)), 0);
    EXPECT_EQ(mList->FullListIndexOf(BPoint(5, 20)), 2);
    EXPECT_EQ(mList->FullListIndexOf(BPoint(5, 40)), -1);
}

TEST_F(Rows, OfAnOutlineAreNotSwappedMovedOrReplaced) {
    Make(true);
    Fill({0, 0});
    EXPECT_FALSE(mList->SwapItems(0, 1));
    EXPECT_FALSE(mList->MoveItem(0, 1));
    EXPECT_FALSE(mList->ReplaceItem(0, New()));
    EXPECT_EQ(Visible(), Numbers({0, 1}));
}

TEST_F(Rows, OfAFlatListAreSwappedMovedAndReplaced) {
    Make(false);
    Fill({0, 0, 0, 0});
    EXPECT_TRUE(mList->SwapItems(0, 3));
    EXPECT_EQ(Full(), Numbers({3, 1, 2, 0}));
    EXPECT_TRUE(mList->MoveItem(1, 3));
    EXPECT_EQ(Full(), Numbers({3, 2, 0, 1}));
    EXPECT_FALSE(mList->ReplaceItem(0, Row(1)));
    BStringItem text("text");
    EXPECT_FALSE(mList->ReplaceItem(0, &text));
    EXPECT_FALSE(mList->SwapItems(0, 4));
    EXPECT_TRUE(mList->ReplaceItem(0, New()));
    EXPECT_EQ(Full(), Numbers({4, 2, 0, 1}));
    EXPECT_EQ(Visible(), Numbers({4, 2, 0, 1}));
    EXPECT_FALSE(mList->FullListHasItem(Row(3)));
    EXPECT_EQ(mList->VisibleIndexOf(Row(1)), 3);
}

} // namespace
