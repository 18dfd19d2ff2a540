// Columns that come, go, change places and widths, and what the rows hear of it.
#include "ListsForTests.h"

#include "gui/ColumnListView/CLVColumnLabelView.h"

#include <utility>

namespace {

class Columns : public ColumnLists {
  protected:
    typedef std::vector<std::pair<int32, float>> Widths;
    typedef std::vector<std::pair<int32, BRect>> Frames;
    typedef std::vector<int32> Order;

    static CLVColumn* NewColumn(unsigned long flags = 0, float width = 50) {
        return new CLVColumn("label", width, flags, 10);
    }
    Order Displayed() const {
        const std::unique_ptr<int32[]> order(mList->DisplayOrder());
        return {order.get(), order.get() + mList->CountColumns()};
    }
    // An expander, then columns of 50 pixels: one that is pushed and passes it on, one that is pushed, and
    // one that is not. All want to tell the rows.
    void MakeWithExpander() {
        Make(true);
        AddColumn(CLV_COLUMN_EXPANDER);
        AddColumn(CLV_COLUMN_TELL_ITEMS_WIDTH | CLV_COLUMN_PUSH_PASS);
        AddColumn(CLV_COLUMN_TELL_ITEMS_WIDTH);
        AddColumn(CLV_COLUMN_TELL_ITEMS_WIDTH);
    }
    static constexpr BRect kNoRect = BRect(-1, -1, -1, -1);
};

TEST_F(Columns, LieBesideEachOtherInTheirOrder) {
    Make(false);
    CLVColumn* const first = AddColumn(0, 50);
    CLVColumn* const hidden = AddColumn(CLV_COLUMN_HIDDEN, 70);
    CLVColumn* const last = AddColumn(0, 30);
    EXPECT_EQ(mList->CountColumns(), 3);
    EXPECT_EQ(mList->ColumnAt(2), last);
    EXPECT_EQ(mList->ColumnAt(3), nullptr);
    EXPECT_EQ(mList->ColumnAt(-1), nullptr);
    EXPECT_EQ(mList->IndexOfColumn(hidden), 1);
    EXPECT_EQ(mList->IndexOfColumn(nullptr), -1);
    EXPECT_EQ(first->GetParent(), mList);
    EXPECT_EQ(first->ColumnBegin(), 0);
    EXPECT_EQ(first->ColumnEnd(), 50);
    EXPECT_EQ(last->ColumnBegin(), 51);
    EXPECT_EQ(last->ColumnEnd(), 81);
    EXPECT_EQ(mContainer->GetDataRect(), BRect(0, 0, 81, 0));
}

TEST_F(Columns, OfAnotherListAreRefused) {
    Make(false);
    CLVColumn* const column = AddColumn();
    EXPECT_FALSE(mList->AddColumn(column));
    EXPECT_FALSE(mList->AddColumn(nullptr));
    EXPECT_EQ(mList->CountColumns(), 1);
}

TEST_F(Columns, AnExpanderIsRefusedByAFlatListAndASecondOneByAnyOther) {
    Make(false);
    const std::unique_ptr<CLVColumn> expander(NewColumn(CLV_COLUMN_EXPANDER));
    EXPECT_FALSE(mList->AddColumn(expander.get()));
    EXPECT_EQ(mList->CountColumns(), 0);
    Make(true);
    AddColumn();
    AddColumn(CLV_COLUMN_EXPANDER | CLV_COLUMN_HIDDEN);
    EXPECT_FALSE(mList->AddColumn(expander.get()));
    EXPECT_EQ(mList->CountColumns(), 2);
    EXPECT_EQ(expander->GetParent(), nullptr);
    EXPECT_EQ(mList->ExpanderColumn(), -1);
    mList->ColumnAt(1)->SetShown(true);
    EXPECT_EQ(mList->ExpanderColumn(), 1);
}

TEST_F(Columns, OfAListAreAddedAllOrNone) {
    for (const bool hierarchical : {false, true}) {
        Make(hierarchical);
        CLVColumn* const own = AddColumn();
        const std::unique_ptr<CLVColumn> free(NewColumn());
        const std::unique_ptr<CLVColumn> expander(NewColumn(CLV_COLUMN_EXPANDER));
        const std::unique_ptr<CLVColumn> second(NewColumn(CLV_COLUMN_EXPANDER));
        const struct {
            const char* name;
            std::vector<CLVColumn*> columns;
            bool refusedByOutline;
        } cases[] = {
            {"one is in a list", {free.get(), own}, true},
            {"one comes twice", {free.get(), free.get()}, true},
            {"null", {free.get(), nullptr}, true},
            {"two expanders", {expander.get(), free.get(), second.get()}, true},
            {"an expander", {free.get(), expander.get()}, false},
        };
        for (const auto& [name, columns, refusedByOutline] : cases) {
            BList list;
            for (CLVColumn* const column : columns) {
                list.AddItem(column);
            }
            const bool added = hierarchical && !refusedByOutline;
            EXPECT_EQ(mList->AddColumnList(&list), added) << name;
            EXPECT_EQ(mList->CountColumns(), added ? 3 : 1) << name;
            EXPECT_EQ(free->GetParent(), added ? mList : nullptr) << name;
        }
        EXPECT_FALSE(mList->AddColumnList(nullptr));
        EXPECT_EQ(mList->ExpanderColumn(), hierarchical ? 2 : -1);
        if (hierarchical) {
            EXPECT_TRUE(mList->RemoveColumns(free.get(), 2));
        }
    }
}

TEST_F(Columns, ThatAreRemovedAreTheCallersAgain) {
    Make(true);
    CLVColumn* const first = AddColumn();
    CLVColumn* const expander = AddColumn(CLV_COLUMN_EXPANDER);
    EXPECT_EQ(mList->ExpanderColumn(), 1);
    EXPECT_TRUE(mList->RemoveColumn(first));
    EXPECT_EQ(first->GetParent(), nullptr);
    // It has another index now.
    EXPECT_EQ(mList->ExpanderColumn(), 0);
    EXPECT_FALSE(mList->RemoveColumn(first));
    delete first;
    // A column that is deleted leaves its list.
    delete expander;
    EXPECT_EQ(mList->CountColumns(), 0);
    EXPECT_EQ(mList->ExpanderColumn(), -1);
    EXPECT_EQ(mContainer->GetDataRect(), BRect(0, 0, 0, 0));
}

TEST_F(Columns, RunsThatPassTheEndAreNotRemoved) {
    Make(false);
    AddColumn();
    CLVColumn* const second = AddColumn();
    const std::unique_ptr<CLVColumn> other(NewColumn());
    EXPECT_FALSE(mList->RemoveColumns(second, 2));
    EXPECT_FALSE(mList->RemoveColumns(second, -1));
    EXPECT_FALSE(mList->RemoveColumns(other.get(), 1));
    EXPECT_FALSE(mList->RemoveColumns(nullptr, 1));
    EXPECT_TRUE(mList->RemoveColumns(second, 0));
    EXPECT_EQ(mList->CountColumns(), 2);
    EXPECT_TRUE(mList->RemoveColumns(second, 1));
    delete second;
    EXPECT_EQ(Displayed(), Order({0}));
}

TEST_F(Columns, AreShownInTheDisplayOrder) {
    Make(false);
    AddColumn(0, 10);
    AddColumn(0, 20);
    AddColumn(0, 30);
    const int32 order[] = {2, 0, 1};
    EXPECT_TRUE(mList->SetDisplayOrder(order));
    EXPECT_EQ(Displayed(), Order({2, 0, 1}));
    EXPECT_EQ(mList->ColumnAt(1)->ColumnBegin(), 42);
    EXPECT_EQ(mList->toldOrders, std::vector<Order>({{2, 0, 1}}));
    // A column that is added later comes last.
    AddColumn();
    EXPECT_EQ(Displayed(), Order({2, 0, 1, 3}));
}

TEST_F(Columns, ADisplayOrderStopsHalfWayAtAnIndexThatIsOutOfRangeOrComesTwice) {
    for (const int32 wrong : {1, 3, -1}) {
        Make(false);
        AddColumn(0, 10);
        AddColumn(0, 20);
        AddColumn(0, 30);
        const int32 order[] = {1, wrong, 0};
        EXPECT_FALSE(mList->SetDisplayOrder(order));
        EXPECT_EQ(Displayed(), Order({1, -1, -1}));
        // Nothing was laid out, and nobody told.
        EXPECT_EQ(mList->ColumnAt(1)->ColumnBegin(), 11);
        EXPECT_TRUE(mList->toldOrders.empty());
        const int32 right[] = {2, 1, 0};
        EXPECT_TRUE(mList->SetDisplayOrder(right));
        EXPECT_EQ(Displayed(), Order({2, 1, 0}));
    }
    EXPECT_FALSE(mList->SetDisplayOrder(nullptr));
    EXPECT_EQ(Displayed(), Order({2, 1, 0}));
}

TEST_F(Columns, TheHeadersOrderIsLaidOutAndTold) {
    Make(false);
    AddColumn(0, 10);
    AddColumn(0, 20);
    BList order;
    order.AddItem(mList->ColumnAt(1));
    order.AddItem(mList->ColumnAt(0));
    mList->ReplaceDisplayOrder(order);
    EXPECT_EQ(mList->ColumnAt(0)->ColumnBegin(), 21);
    EXPECT_EQ(mList->toldOrders, std::vector<Order>({{1, 0}}));
}

TEST_F(Columns, RowsAreToldTheWidthsOfTheirCells) {
    MakeWithExpander();
    // Expander 0..20, pushed 21..71 and 72..122, and 123..173.
    Add(0, false);
    Add(1);
    Add(4);
    mList->ColumnAt(3)->SetWidth(60);
    mList->ColumnAt(1)->SetWidth(40);
    // Now 21..61 and 62..112: that is the limit.
    mList->ColumnAt(2)->SetWidth(40);
    // 62..102.
    const Widths told[] = {
        {{3, 60}, {1, 40}, {2, 40}},
        {{3, 60}, {1, 40}, {2, 20}},
        // 80 pixels: of the first pushed cell (61 + 80) 29 pixels pass the limit 112, of the second all.
        {{3, 60}, {1, 11}, {2, 0}},
    };
    for (int row = 0; row < 3; ++row) {
        EXPECT_EQ(Row(row)->toldWidths, told[row]) << row;
    }
}

TEST_F(Columns, RowsAreNotToldOfColumnsThatDoNotWantIt) {
    Make(false);
    CLVColumn* const column = AddColumn();
    Add();
    column->SetWidth(99);
    const int32 order[] = {0};
    EXPECT_TRUE(mList->SetDisplayOrder(order));
    EXPECT_TRUE(Row(0)->toldWidths.empty());
    EXPECT_TRUE(Row(0)->toldFrames.empty());
}

TEST_F(Columns, RowsAreToldTheFramesOfTheirCellsInANewOrder) {
    MakeWithExpander();
    mList->ColumnAt(3)->SetShown(false);
    Add(0, true);
    Add(1, false);
    Add(2);
    Add(5);
    const int32 order[] = {3, 0, 2, 1};
    EXPECT_TRUE(mList->SetDisplayOrder(order));
    // The expander lies at 0..20, column 2 at 21..71 and ends the push, column 1 at 72..122.
    EXPECT_EQ(Row(0)->toldFrames,
              Frames({{1, BRect(72, 0, 122, 19)}, {2, BRect(21, 0, 71, 19)}, {3, kNoRect}}));
    EXPECT_EQ(Row(1)->toldFrames,
              Frames({{1, BRect(72, 20, 122, 39)}, {2, BRect(41, 20, 71, 39)}, {3, kNoRect}}));
    // Below the collapsed row.
    EXPECT_EQ(Row(2)->toldFrames, Frames({{1, kNoRect}, {2, kNoRect}, {3, kNoRect}}));
}

TEST_F(Columns, ACellThatIsPushedBeyondTheLimitHasNoFrame) {
    MakeWithExpander();
    Add(0, true);
    Add(6);
    const int32 order[] = {0, 2, 1, 3};
    EXPECT_TRUE(mList->SetDisplayOrder(order));
    // Column 2 at 21..71 is the only one pushed, by 120 pixels.
    EXPECT_EQ(Row(1)->toldFrames,
              Frames({{1, BRect(72, 20, 122, 39)}, {2, kNoRect}, {3, BRect(123, 20, 173, 39)}}));
}

TEST_F(Columns, TheDataIsAsHighAsTheVisibleRows) {
    Make(true);
    AddColumn();
    EXPECT_EQ(mContainer->GetDataRect().bottom, 0);
    Add(0, false);
    EXPECT_EQ(mContainer->GetDataRect(), BRect(0, 0, 50, 19));
    Add(1);
    EXPECT_EQ(mContainer->GetDataRect().bottom, 19);
    mList->Expand(Row(0));
    EXPECT_EQ(mContainer->GetDataRect().bottom, 39);
    mList->Collapse(Row(0));
    EXPECT_EQ(mContainer->GetDataRect().bottom, 19);
    BList list;
    list.AddItem(static_cast<BListItem*>(New()));
    list.AddItem(static_cast<BListItem*>(New()));
    EXPECT_TRUE(mList->AddList(&list));
    EXPECT_EQ(mContainer->GetDataRect().bottom, 59);
    EXPECT_TRUE(mList->RemoveItems(0, 3));
    EXPECT_EQ(mContainer->GetDataRect().bottom, 19);
    EXPECT_TRUE(mList->RemoveItem(Row(3)));
    EXPECT_EQ(mContainer->GetDataRect().bottom, 0);
}

} // namespace
