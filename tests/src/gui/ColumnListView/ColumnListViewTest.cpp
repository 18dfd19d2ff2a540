// What a column list is made of, where it scrolls, and what mouse and keys do to it.
#include "ListsForTests.h"

#include "gui/ColumnListView/CLVColumnLabelView.h"
#include "kits/interface/ViewStage.h"
#include "widgets/PrefilledBitmap.h"

#include <Font.h>
#include <ScrollBar.h>

#include <cmath>

namespace {

float HeaderHeight() {
    font_height height;
    be_plain_font->GetHeight(&height);
    return std::ceil(height.ascent) + std::ceil(height.descent) + 4;
}

TEST_F(ColumnLists, HeaderAndListShareTheFrameThatTheListWasGiven) {
    Make(false);
    const float header = HeaderHeight();
    // Two bars of 15 pixels lie around it.
    EXPECT_EQ(mContainer->Frame(), BRect(10, 20, 324, 234));
    EXPECT_EQ(mList->HeaderView()->Frame(), BRect(0, 0, 299, header));
    EXPECT_EQ(mList->Frame(), BRect(0, header + 1, 299, 199));
    EXPECT_EQ(mList->Parent(), mContainer.get());
    EXPECT_EQ(mList->HeaderView()->Parent(), mContainer.get());
    EXPECT_EQ(mContainer->GetDataRect(), BRect(0, 0, 0, 0));
    EXPECT_EQ(mList->ExpanderColumn(), -1);
    EXPECT_FALSE(mList->IsHierarchical());
    EXPECT_EQ(mList->RightArrow().Bounds(), BRect(0, 0, 10, 10));
    EXPECT_EQ(mList->DownArrow().ColorSpace(), B_CMAP8);
}

TEST_F(ColumnLists, TheListTakesTheFocusAndItsContainerDoesNot) {
    Make(false);
    EXPECT_NE(mList->Flags() & B_NAVIGABLE, 0U);
    EXPECT_EQ(mContainer->Flags() & B_NAVIGABLE, 0U);
}

TEST_F(ColumnLists, TheHeaderFollowsTheListToTheSideOnly) {
    Make(false);
    AddColumn(0, 500);
    for (int i = 0; i < 30; ++i) {
        Add();
    }
    mList->ScrollTo(BPoint(70, 45));
    EXPECT_EQ(mList->Bounds().LeftTop(), BPoint(70, 45));
    EXPECT_EQ(mList->HeaderView()->Bounds().LeftTop(), BPoint(70, 0));
    mContainer->ScrollBar(B_HORIZONTAL)->SetValue(30);
    EXPECT_EQ(mList->HeaderView()->Bounds().LeftTop(), BPoint(30, 0));
}

TEST_F(ColumnLists, AListInNoWindowNeedsNoLock) {
    Make(true);
    mList->AssertWindowLocked();
    EXPECT_EQ(mList->CountColumns(), 0);
}

// Rows lie above 16 777 216 pixels, where floats know even numbers only.
TEST_F(ColumnLists, FarDownNothingIsMoreThanAPixelOff) {
    Make(false);
    for (int i = 0; i < 21; ++i) {
        mRows.push_back(std::make_unique<NumberedRow>(i, 0, true, 999999.0F));
        mList->AddItem(mRows.back().get());
    }
    for (int i = 21; i < 121; ++i) {
        mRows.push_back(std::make_unique<NumberedRow>(i, 0, true, 20.0F));
        mList->AddItem(mRows.back().get());
    }
    // 21 rows of 1 000 000 pixels and 100 of 21.
    for (int i = 0; i < 100; ++i) {
        const double top = 21000000 + 21.0 * i;
        const BRect frame = mList->ItemFrame(21 + i);
        EXPECT_LE(std::abs(frame.top - top), 1) << i;
        EXPECT_LE(std::abs(frame.bottom - (top + 20)), 1) << i;
        EXPECT_EQ(mList->IndexOf(BPoint(5, static_cast<float>(top + 10))), 21 + i);
        EXPECT_EQ(mList->FullListIndexOf(BPoint(5, static_cast<float>(top + 10))), 21 + i);
    }
    EXPECT_LE(std::abs(mContainer->GetDataRect().bottom - 21002099.0), 1);
    // The last row can be scrolled to, and nothing lies beyond it.
    mList->ScrollTo(BPoint(0, 30000000));
    mList->UpdateColumnSizesDataRectSizeScrollBars(true);
    EXPECT_LE(std::abs(mList->Bounds().bottom - 21002099.0), 2);
}

// A list on a stage that draws it and has a thread of its own.
class ShownColumnList : public ColumnLists {
  protected:
    void Show() {
        if (mList->IsHierarchical()) {
            AddColumn(CLV_COLUMN_EXPANDER);
        }
        AddColumn(0, 200);
        mContainer->MoveTo(0, 0);
        mStage.Add(mContainer.release());
        mStage.Redraw();
    }
    // A super-row with two rows below it, one of which has another below it; and a row.
    void ShowOutline() {
        Make(true);
        Fill({0, 1, 2, 1, 0});
        Row(0)->SetSuperItem(true);
        Row(1)->SetSuperItem(true);
        Show();
    }
    Numbers VisibleNow() {
        Numbers numbers;
        mStage.Locked([&] { numbers = Visible(); });
        return numbers;
    }
    int Selected() {
        int number = -1;
        mStage.Locked([&] { number = NumberOf(mList->ItemAt(mList->CurrentSelection(0))); });
        return number;
    }
    void Select(int number) {
        mStage.Locked([&] { mList->Select(mList->VisibleIndexOf(Row(number))); });
    }
    // In the list's coordinates: the middle of a row's arrow, given its place among the visible rows.
    static BPoint OnArrow(int visible, int level) {
        return {static_cast<float>(12 + 20 * level), static_cast<float>(20 * visible + 10)};
    }

    ViewStage mStage{320, 240};
};

TEST_F(ShownColumnList, APressOnTheArrowCollapsesAndExpandsAndDoesNothingElse) {
    ShowOutline();
    mStage.Click(mList, OnArrow(0, 0));
    EXPECT_EQ(VisibleNow(), Numbers({0, 4}));
    mStage.Redraw();
    mStage.Click(mList, OnArrow(0, 0));
    EXPECT_EQ(VisibleNow(), Numbers({0, 1, 2, 3, 4}));
    mStage.Redraw();
    mStage.Click(mList, OnArrow(1, 1));
    EXPECT_EQ(VisibleNow(), Numbers({0, 1, 3, 4}));
    EXPECT_EQ(Selected(), -1);
}

TEST_F(ShownColumnList, APressBesideTheArrowOrOnARowWithoutOneSelects) {
    ShowOutline();
    mStage.Click(mList, BPoint(100, 10));
    EXPECT_EQ(Selected(), 0);
    mStage.Click(mList, OnArrow(4, 0));
    EXPECT_EQ(Selected(), 4);
    EXPECT_EQ(VisibleNow(), Numbers({0, 1, 2, 3, 4}));
}

TEST_F(ShownColumnList, WithoutAnExpanderColumnThereIsNoArrowToPress) {
    ShowOutline();
    mStage.Locked([&] { mList->ColumnAt(0)->SetShown(false); });
    mStage.Click(mList, OnArrow(0, 0));
    EXPECT_EQ(VisibleNow(), Numbers({0, 1, 2, 3, 4}));
    EXPECT_EQ(Selected(), 0);
}

TEST_F(ShownColumnList, TheArrowTurnsAtOnceAndOnlyWhatMovesIsInvalidated) {
    ShowOutline();
    const float top = HeaderHeight() + 1;
    const auto arrowOfRow1 = [&] {
        std::vector<uint32> pixels;
        for (int32 y = 25; y <= 35; ++y) {
            for (int32 x = 27; x <= 37; ++x) {
                pixels.push_back(mStage.At(x, static_cast<int32>(top) + y));
            }
        }
        return pixels;
    };
    const std::vector<uint32> down = arrowOfRow1();
    Row(0)->drawnColumns.clear();
    Row(1)->drawnColumns.clear();
    mStage.Locked([&] { mList->Collapse(Row(1)); });
    EXPECT_NE(arrowOfRow1(), down);
    EXPECT_EQ(Row(1)->drawnColumns, std::vector<int32>({0}));
    EXPECT_TRUE(Row(0)->drawnColumns.empty());
    // Rows 0 and 1 stay as they are.
    EXPECT_FALSE(mStage.Damage().Intersects(BRect(0, top, 299, top + 39)));
    EXPECT_TRUE(mStage.Damage().Intersects(BRect(0, top + 40, 299, top + 59)));
    mStage.Locked([&] { mList->Expand(Row(1)); });
    EXPECT_EQ(arrowOfRow1(), down);
}

TEST_F(ShownColumnList, RightExpandsAndGoesDownLeftCollapsesAndGoesUp) {
    ShowOutline();
    Select(1);
    mStage.Key(mList, B_RIGHT_ARROW);
    EXPECT_EQ(Selected(), 2);
    // There is nothing to expand or below.
    mStage.Key(mList, B_RIGHT_ARROW);
    EXPECT_EQ(Selected(), 2);
    mStage.Key(mList, B_LEFT_ARROW);
    EXPECT_EQ(Selected(), 1);
    mStage.Key(mList, B_LEFT_ARROW);
    EXPECT_EQ(VisibleNow(), Numbers({0, 1, 3, 4}));
    mStage.Key(mList, B_LEFT_ARROW);
    EXPECT_EQ(Selected(), 0);
    mStage.Key(mList, B_LEFT_ARROW);
    EXPECT_EQ(VisibleNow(), Numbers({0, 4}));
    mStage.Key(mList, B_LEFT_ARROW);
    EXPECT_EQ(Selected(), 0);
    mStage.Key(mList, B_RIGHT_ARROW);
    EXPECT_EQ(VisibleNow(), Numbers({0, 1, 3, 4}));
    mStage.Key(mList, B_DOWN_ARROW);
    EXPECT_EQ(Selected(), 1);
}

TEST_F(ShownColumnList, KeysScrollSidewaysWhereThereIsNothingToExpand) {
    Make(true);
    Fill({0, 0});
    AddColumn(0, 1000);
    Show();
    Select(0);
    mStage.Key(mList, B_RIGHT_ARROW);
    float left = 0;
    mStage.Locked([&] { left = mList->Bounds().left; });
    EXPECT_GT(left, 0);
    mStage.Key(mList, B_LEFT_ARROW);
    mStage.Locked([&] { left = mList->Bounds().left; });
    EXPECT_EQ(left, 0);
}

TEST_F(ShownColumnList, RowsGetTheirHeightWhenTheListIsShown) {
    Make(false);
    Fill({0, 0});
    Row(0)->SetHeight(0);
    Row(1)->SetHeight(0);
    CLVContainerView* const container = mContainer.get();
    Show();
    mStage.Locked([&] { EXPECT_EQ(container->GetDataRect().bottom, 39); });
}

TEST_F(ShownColumnList, AListThatGrowsIsLaidOutAnew) {
    Make(false);
    for (int i = 0; i < 30; ++i) {
        Add();
    }
    CLVContainerView* const container = mContainer.get();
    Show();
    mStage.Locked([&] {
        mList->ScrollTo(BPoint(0, 400));
        container->ResizeBy(0, 100);
        mList->FrameResized(mList->Bounds().Width(), mList->Bounds().Height());
        // Nothing beyond the last row shows.
        EXPECT_LE(mList->Bounds().bottom, 599);
    });
}

TEST_F(ShownColumnList, WithoutTheLockTheProgramStops) {
    GTEST_FLAG_SET(death_test_style, "threadsafe");
    ShowOutline();
    const char* const text = "gui/ColumnListView/ColumnListView:212: The looper must be locked\\.";
    EXPECT_DEATH(mList->AssertWindowLocked(), text);
    EXPECT_DEATH((void)mList->CountColumns(), text);
    EXPECT_DEATH(mList->Expand(Row(0)), text);
    EXPECT_DEATH(mList->SortItems(), text);
    EXPECT_DEATH(mList->AddItem(New()), text);
}

} // namespace
