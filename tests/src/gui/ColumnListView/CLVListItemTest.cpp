#include "ListOnStage.h"

#include <memory>

namespace {

constexpr BRect kNoRect(-1, -1, -1, -1);
constexpr uint32 kArrowEdge = 0x404040;

struct DrawnCell {
    int32 column;
    BRect frame;
    bool complete;
    bool operator==(const DrawnCell&) const = default;
};

void PrintTo(const DrawnCell& cell, std::ostream* out) {
    *out << cell.column << " at " << cell.frame.left << "," << cell.frame.top << "-" << cell.frame.right
         << "," << cell.frame.bottom << (cell.complete ? " complete" : "");
}

// Notes the cells that it is asked to draw.
class NotingRow : public CLVListItem {
  public:
    explicit NotingRow(uint32 level, bool super = false, bool expanded = true)
        : CLVListItem(level, super, expanded, 19) {}
    void DrawItemColumn(BView* owner, BRect rect, int32 column, bool complete) override {
        cells.push_back({column, rect, complete});
        if (complete) {
            owner->SetHighColor(255, 255, 255);
            owner->FillRect(rect);
        }
    }
    std::vector<DrawnCell> cells;
};

class CLVListItemTest : public ListOnStage {
  protected:
    // Draws the row alone, of which nothing is cleared before.
    void Draw(CLVListItem& row, bool complete = true) {
        mStage.Locked([&] { row.DrawItem(mList, mList->ItemFrame(mList->VisibleIndexOf(&row)), complete); });
    }
    BRect FrameOf(CLVListItem& row, int32 column) {
        BRect frame;
        mStage.Locked([&] { frame = row.ItemColumnFrame(column, mList); });
        return frame;
    }
};

typedef std::vector<DrawnCell> Cells;

} // namespace

TEST_F(CLVListItemTest, IsNeverLowerThanItsMinimum) {
    MakeList(false, {{50, 0}});
    NotingRow row(0);

    mStage.Locked([&] { row.Update(mList, be_plain_font); });
    EXPECT_EQ(19, row.Height());

    BFont large(be_plain_font);
    large.SetSize(60);
    mStage.Locked([&] { row.Update(mList, &large); });
    EXPECT_GT(row.Height(), 50);
}

TEST_F(CLVListItemTest, DrawsTheShownColumnsInDisplayOrderAndWhatIsRightOfThem) {
    MakeList(false, {{50, 0}, {30, CLV_COLUMN_HIDDEN}, {70, 0}});
    NotingRow row(0);
    Add(&row);
    const int32 order[] = {2, 1, 0};
    mStage.Locked([&] { mList->SetDisplayOrder(order); });

    Draw(row);

    const Cells expected = {
        {2, BRect(0, 0, 70, 19), true}, {0, BRect(71, 0, 121, 19), true}, {-1, BRect(122, 0, 299, 19), true}};
    EXPECT_EQ(expected, row.cells);
    EXPECT_EQ(kNoRect, row.ExpanderColumnRect());
    EXPECT_EQ(kNoRect, row.ExpanderButtonRect());
}

TEST_F(CLVListItemTest, DrawsNothingRightOfColumnsThatFillTheList) {
    MakeList(false, {{200, 0}, {98, 0}});
    NotingRow row(0);
    Add(&row);

    Draw(row);

    const Cells expected = {{0, BRect(0, 0, 200, 19), true}, {1, BRect(201, 0, 299, 19), true}};
    EXPECT_EQ(expected, row.cells);
}

TEST_F(CLVListItemTest, WithoutCompleteDrawsWhatMeetsTheClippingRegion) {
    MakeList(false, {{50, 0}, {50, 0}, {50, 0}});
    NotingRow row(0);
    Add(&row);
    mStage.Redraw();
    row.cells.clear();

    mStage.Locked([&] { mList->Invalidate(BRect(60, 4, 61, 5)); });
    mStage.Redraw();

    const Cells expected = {{1, BRect(51, 0, 101, 19), false}};
    EXPECT_EQ(expected, row.cells);
}

TEST_F(CLVListItemTest, AtLevelTwoTheExpandersCellIsFortyPixelsWiderAndPushesTheNextCellAsFar) {
    MakeList(true, {{20, CLV_COLUMN_EXPANDER}, {100, 0}, {60, 0}});
    NotingRow top(0);
    NotingRow middle(1);
    NotingRow row(2);
    Add(&top);
    Add(&middle);
    Add(&row);

    Draw(row);

    // The pushed cell is cut where its column ends.
    const Cells expected = {{0, BRect(0, 40, 60, 59), true},
                            {1, BRect(61, 40, 121, 59), true},
                            {2, BRect(122, 40, 182, 59), true},
                            {-1, BRect(183, 40, 299, 59), true}};
    EXPECT_EQ(expected, row.cells);
    EXPECT_EQ(BRect(0, 40, 60, 59), row.ExpanderColumnRect());
    EXPECT_EQ(kNoRect, row.ExpanderButtonRect()) << "no super-row, no arrow";
    EXPECT_EQ(40, row.ExpanderShift(0, mList));
    EXPECT_EQ(40, row.ExpanderShift(1, mList));
    EXPECT_EQ(0, row.ExpanderShift(2, mList));
    EXPECT_EQ(0, row.ExpanderShift(7, mList));
}

TEST_F(CLVListItemTest, APushThatIsPassedOnMovesTheCellsBehindToo) {
    MakeList(true, {{20, CLV_COLUMN_EXPANDER}, {50, CLV_COLUMN_PUSH_PASS}, {60, 0}, {40, 0}});
    NotingRow top(0);
    NotingRow row(1);
    Add(&top);
    Add(&row);

    Draw(row);

    const Cells expected = {{0, BRect(0, 20, 40, 39), true},
                            {1, BRect(41, 20, 91, 39), true},
                            {2, BRect(92, 20, 132, 39), true},
                            {3, BRect(133, 20, 173, 39), true},
                            {-1, BRect(174, 20, 299, 39), true}};
    EXPECT_EQ(expected, row.cells);
}

TEST_F(CLVListItemTest, ACellThatIsPushedBehindItsLimitIsNotDrawn) {
    MakeList(true, {{20, CLV_COLUMN_EXPANDER}, {10, 0}, {60, 0}});
    NotingRow top(0);
    NotingRow row(1);
    Add(&top);
    Add(&row);

    Draw(row);

    const Cells expected = {{0, BRect(0, 20, 31, 39), true},
                            {2, BRect(32, 20, 92, 39), true},
                            {-1, BRect(93, 20, 299, 39), true}};
    EXPECT_EQ(expected, row.cells);
    EXPECT_EQ(kNoRect, FrameOf(row, 1));
}

TEST_F(CLVListItemTest, FramesOfItsCellsAreWhereTheyAreDrawn) {
    MakeList(true, {{20, CLV_COLUMN_EXPANDER}, {100, 0}, {60, 0}, {30, CLV_COLUMN_HIDDEN}});
    NotingRow top(0, true, false);
    NotingRow row(1);
    Add(&top);
    Add(&row);

    EXPECT_EQ(kNoRect, FrameOf(row, 0)) << "its super-row is collapsed";
    mStage.Locked([&] { mList->Expand(&top); });
    EXPECT_EQ(BRect(0, 20, 40, 39), FrameOf(row, 0));
    EXPECT_EQ(BRect(41, 20, 121, 39), FrameOf(row, 1));
    EXPECT_EQ(BRect(122, 20, 182, 39), FrameOf(row, 2));
    EXPECT_EQ(kNoRect, FrameOf(row, 3)) << "hidden";
    EXPECT_EQ(kNoRect, FrameOf(row, 4)) << "there is none";
    EXPECT_EQ(kNoRect, FrameOf(row, -1));
}

TEST_F(CLVListItemTest, TheArrowOfASuperRowSitsThirteenPixelsLeftOfItsCellsEnd) {
    MakeList(true, {{20, CLV_COLUMN_EXPANDER}, {100, 0}});
    NotingRow top(0, true);
    NotingRow row(1, true);
    Add(&top);
    Add(&row);

    mStage.Redraw();

    EXPECT_EQ(BRect(7, 5, 17, 15), top.ExpanderButtonRect());
    EXPECT_EQ(BRect(27, 25, 37, 35), row.ExpanderButtonRect());
    // Pointing down: its upper line, its tip.
    EXPECT_EQ(11, CountOf(kArrowEdge, BRect(7, 8, 17, 8)));
    EXPECT_EQ(kArrowEdge, At(12, 13));
    EXPECT_EQ(0, CountOther(0xFFFFFF, BRect(0, 14, 20, 19)));
}

TEST_F(CLVListItemTest, TheArrowOfACollapsedRowPointsRightAndOneThatIsExpandedTurnsAtOnce) {
    MakeList(true, {{20, CLV_COLUMN_EXPANDER}, {100, 0}});
    NotingRow top(0, true, false);
    Add(&top);
    mStage.Redraw();
    EXPECT_EQ(11, CountOf(kArrowEdge, BRect(10, 5, 10, 15)));
    EXPECT_EQ(kArrowEdge, At(15, 10));

    // Nothing is drawn here by an update.
    mStage.Locked([&] { mList->Expand(&top); });

    EXPECT_EQ(11, CountOf(kArrowEdge, BRect(7, 8, 17, 8)));
    EXPECT_EQ(0xFFFFFFU, At(10, 15));
    EXPECT_EQ(B_OP_COPY, mList->DrawingMode());
}

TEST_F(CLVListItemTest, ARowThatBecomesASuperRowByExpandingShowsItsArrowAtOnce) {
    MakeList(true, {{20, CLV_COLUMN_EXPANDER}, {100, 0}});
    NotingRow row(0);
    Add(&row);
    mStage.Redraw();
    EXPECT_EQ(kNoRect, row.ExpanderButtonRect());

    mStage.Locked([&] { mList->Collapse(&row); });

    EXPECT_EQ(BRect(7, 5, 17, 15), row.ExpanderButtonRect());
    EXPECT_EQ(11, CountOf(kArrowEdge, BRect(10, 5, 10, 15)));
}

TEST_F(CLVListItemTest, AnArrowThatDoesNotFitIsCutFromTheRight) {
    // The push limit is 34; the arrow would end at 37.
    MakeList(true, {{20, CLV_COLUMN_EXPANDER}, {13, 0}});
    NotingRow top(0, true);
    NotingRow row(1, true);
    Add(&top);
    Add(&row);

    mStage.Redraw();

    EXPECT_EQ(BRect(27, 25, 34, 35), row.ExpanderButtonRect());
    EXPECT_EQ(8, CountOf(kArrowEdge, BRect(27, 28, 37, 28)));
}

TEST_F(CLVListItemTest, WhereTheCellEndsLeftOfItThereIsNoArrow) {
    MakeList(true, {{20, CLV_COLUMN_EXPANDER}, {4, 0}});
    NotingRow top(0, true);
    NotingRow row(1, true);
    Add(&top);
    Add(&row);

    mStage.Redraw();

    EXPECT_EQ(BRect(0, 20, 25, 39), row.ExpanderColumnRect());
    EXPECT_EQ(kNoRect, row.ExpanderButtonRect());
    EXPECT_EQ(0, CountOther(0xFFFFFF, BRect(0, 20, 60, 39)));
}

TEST_F(CLVListItemTest, AHiddenExpanderShowsNoArrows) {
    MakeList(true, {{20, CLV_COLUMN_EXPANDER | CLV_COLUMN_HIDDEN}, {50, 0}});
    NotingRow row(0, true);
    Add(&row);

    mStage.Redraw();
    mStage.Locked([&] { mList->Collapse(&row); });

    EXPECT_EQ(kNoRect, row.ExpanderButtonRect());
    EXPECT_FALSE(row.IsExpanded());
    EXPECT_EQ(0, CountOther(0xFFFFFF, BRect(0, 0, 299, 19)));
}

TEST_F(CLVListItemTest, RemembersLevelAndSuperRow) {
    NotingRow row(3, true, false);
    EXPECT_EQ(3U, row.OutlineLevel());
    EXPECT_TRUE(row.IsSuperItem());
    EXPECT_FALSE(row.IsExpanded());
    row.SetOutlineLevel(1);
    row.SetSuperItem(false);
    EXPECT_EQ(1U, row.OutlineLevel());
    EXPECT_EQ(1U, static_cast<BListItem&>(row).OutlineLevel());
    EXPECT_FALSE(row.IsSuperItem());
}

TEST(RowsOfAList, MayBeTakenOutByTheListsOwnDestructor) {
    class OwningList : public ColumnListView {
      public:
        OwningList(CLVContainerView** container) : ColumnListView(BRect(0, 0, 99, 79), container, "list") {}
        ~OwningList() override { MakeEmpty(); }
        std::vector<std::unique_ptr<NotingRow>> rows;
    };
    CLVContainerView* container = nullptr;
    auto* const list = new OwningList(&container);
    list->AddColumn(new CLVColumn("Label", 200, 0, 20));
    for (int i = 0; i < 20; ++i) {
        list->rows.push_back(std::make_unique<NotingRow>(0));
        list->AddItem(list->rows.back().get());
    }
    list->ScrollTo(BPoint(30, 40));

    delete container;
}
