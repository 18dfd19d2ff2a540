#include "gui/ColumnListView/BetterScrollView.h"

#include "gui/ColumnListView/ScrollViewCorner.h"

#include "kits/interface/ViewStage.h"

#include <ScrollBar.h>

#include <gtest/gtest.h>

namespace {

// A target 200 x 100, in a view of 215 x 115 with bars.
class BetterScrollViewTest : public testing::Test {
  protected:
    BetterScrollViewTest() : stage(260, 160) { Make(true, true, true); }
    void Make(bool horizontal, bool vertical, bool corner) {
        target = new BView(BRect(0, 0, 199, 99), "target", B_FOLLOW_NONE, B_WILL_DRAW);
        view = new BetterScrollView("scroller", target, B_FOLLOW_ALL, 0, horizontal, vertical, corner,
                                    B_NO_BORDER);
        stage.Add(view);
    }
    void SetData(BRect rect, bool scrolling = true) {
        stage.Locked([&] { view->SetDataRect(rect, scrolling); });
    }
    void ScrollTo(float x, float y) {
        stage.Locked([&] { target->ScrollTo(x, y); });
    }
    // "0 .. 297, 0.4"
    std::string Bar(orientation posture) {
        const BScrollBar* const bar = view->ScrollBar(posture);
        float min = -1;
        float max = -1;
        bar->GetRange(&min, &max);
        char text[80];
        snprintf(text, sizeof(text), "%g .. %g, %.3g", static_cast<double>(min), static_cast<double>(max),
                 static_cast<double>(bar->Proportion()));
        return text;
    }
    ScrollViewCorner* Corner() {
        for (int32 i = 0; i < view->CountChildren(); ++i) {
            if (auto* const corner = dynamic_cast<ScrollViewCorner*>(view->ChildAt(i)); corner != nullptr) {
                return corner;
            }
        }
        return nullptr;
    }

    ViewStage stage;
    BView* target = nullptr;
    BetterScrollView* view = nullptr;
};

TEST_F(BetterScrollViewTest, TheBarsFollowTheDataRectangle) {
    SetData(BRect(0, 0, 398, 198));

    EXPECT_EQ(Bar(B_HORIZONTAL), "0 .. 199, 0.5");
    EXPECT_EQ(Bar(B_VERTICAL), "0 .. 99, 0.5");
    EXPECT_EQ(view->GetDataRect(), BRect(0, 0, 398, 198));
}

TEST_F(BetterScrollViewTest, TheDataRectangleIsNotSetAtFirst) {
    EXPECT_EQ(view->GetDataRect(), BRect(-1, -1, -1, -1));
    ScrollTo(10, 10);
    stage.Locked([&] { view->FrameResized(214, 114); });
    EXPECT_EQ(target->Bounds().LeftTop(), BPoint(10, 10)) << "and nothing is scrolled to it";
}

TEST_F(BetterScrollViewTest, ADataRectangleNarrowerThanTheViewLeavesNothingToScroll) {
    SetData(BRect(0, 0, 120, 300));

    EXPECT_EQ(Bar(B_HORIZONTAL), "0 .. 0, 1");
    EXPECT_EQ(Bar(B_VERTICAL), "0 .. 201, 0.33");
}

TEST_F(BetterScrollViewTest, AnEmptyDataRectangleLeavesNothingToScroll) {
    SetData(BRect(0, 0, 0, 0));

    EXPECT_EQ(Bar(B_HORIZONTAL), "0 .. 0, 1");
    EXPECT_EQ(Bar(B_VERTICAL), "0 .. 0, 1");
}

TEST_F(BetterScrollViewTest, ShrinkingTheDataAtItsEndScrollsBack) {
    SetData(BRect(0, 0, 399, 399));
    ScrollTo(200, 300);

    SetData(BRect(0, 0, 249, 149));

    EXPECT_EQ(target->Bounds(), BRect(50, 50, 249, 149)) << "no empty space shows past the data";
    EXPECT_EQ(Bar(B_HORIZONTAL), "0 .. 50, 0.799");

    SetData(BRect(0, 0, 20, 20));
    EXPECT_EQ(target->Bounds().LeftTop(), BPoint(0, 0));
}

TEST_F(BetterScrollViewTest, WhatIsScrolledStaysWhereItIsWithinTheData) {
    SetData(BRect(0, 0, 399, 399));
    ScrollTo(120, 180);

    SetData(BRect(0, 0, 350, 500));

    EXPECT_EQ(target->Bounds().LeftTop(), BPoint(120, 180));
    EXPECT_EQ(view->ScrollBar(B_VERTICAL)->Value(), 180);
}

TEST_F(BetterScrollViewTest, WithoutScrollingTheBarsReachAsFarAsWhatShows) {
    SetData(BRect(0, 0, 399, 399));
    ScrollTo(200, 300);

    SetData(BRect(0, 0, 249, 149), false);

    EXPECT_EQ(target->Bounds().LeftTop(), BPoint(200, 300));
    EXPECT_EQ(Bar(B_HORIZONTAL), "0 .. 200, 0.499");
    EXPECT_EQ(Bar(B_VERTICAL), "0 .. 300, 0.248");
}

TEST_F(BetterScrollViewTest, ALargerViewShowsMoreOfTheData) {
    SetData(BRect(0, 0, 299, 199));
    ScrollTo(100, 100);

    stage.Locked([&] { view->ResizeBy(30, 20); });

    EXPECT_EQ(target->Bounds(), BRect(70, 80, 299, 199));
    EXPECT_EQ(Bar(B_HORIZONTAL), "0 .. 70, 0.766");
}

TEST_F(BetterScrollViewTest, OnlyTheBarsThatAreThereCount) {
    Make(false, true, true);
    SetData(BRect(0, 0, 50, 399));
    ScrollTo(30, 0);

    SetData(BRect(0, 0, 60, 399));

    EXPECT_EQ(target->Bounds().left, 30) << "no bar, so nothing is scrolled back";
    EXPECT_EQ(view->ScrollBar(B_HORIZONTAL), nullptr);
    EXPECT_EQ(Corner(), nullptr) << "there is none between fewer than two bars";
}

TEST_F(BetterScrollViewTest, AClickBesideTheThumbScrollsAPage) {
    SetData(BRect(0, 0, 999, 99));

    float step = 0;
    float page = 0;
    view->ScrollBar(B_HORIZONTAL)->GetSteps(&step, &page);

    EXPECT_EQ(step, 15);
    EXPECT_EQ(page, 184);
}

TEST_F(BetterScrollViewTest, TheCornerLiesBetweenTheBarsAndShowsWhetherThereIsAnythingToScroll) {
    ASSERT_NE(Corner(), nullptr);
    EXPECT_EQ(Corner()->Frame(), BRect(200, 100, 214, 114));
    EXPECT_EQ(Corner()->ViewColor(), (rgb_color{127, 127, 127, 255}));

    SetData(BRect(0, 0, 50, 50));
    EXPECT_EQ(Corner()->ViewColor(), (rgb_color{240, 240, 240, 255}));
    SetData(BRect(0, 0, 500, 50));
    EXPECT_EQ(Corner()->ViewColor(), (rgb_color{216, 216, 216, 255}));
    SetData(BRect(0, 0, 50, 500));
    EXPECT_EQ(Corner()->ViewColor(), (rgb_color{216, 216, 216, 255}));
}

TEST_F(BetterScrollViewTest, TheCornerIsDrawnAnewWhenItsColourChanges) {
    SetData(BRect(0, 0, 50, 50));
    stage.Redraw();
    stage.Damage().MakeEmpty();

    SetData(BRect(0, 0, 60, 60));
    EXPECT_FALSE(stage.Damage().Contains(BPoint(205, 105)));
    SetData(BRect(0, 0, 600, 60));
    EXPECT_TRUE(stage.Damage().Contains(BPoint(205, 105)));
}

TEST_F(BetterScrollViewTest, NoCornerUnlessItIsAskedFor) {
    Make(true, true, false);

    EXPECT_EQ(Corner(), nullptr);
}

TEST(ScrollViewCorner, ItHasALineAtItsRightAndBottom) {
    ViewStage stage(30, 30);
    auto* const corner = new ScrollViewCorner(5, 5);
    stage.Add(corner);
    stage.Locked([&] { corner->Invalidate(); });
    stage.Redraw();

    EXPECT_EQ(corner->Bounds(), BRect(0, 0, 14, 14));
    EXPECT_EQ(corner->ResizingMode(), static_cast<uint32>(B_FOLLOW_RIGHT | B_FOLLOW_BOTTOM));
    EXPECT_EQ(stage.CountOf(0x989898, BRect(5, 19, 19, 19)), 15);
    EXPECT_EQ(stage.CountOf(0x989898, BRect(19, 5, 19, 18)), 14);
    EXPECT_EQ(stage.CountOf(0x7F7F7F, BRect(5, 5, 18, 18)), 14 * 14);
}

} // namespace
