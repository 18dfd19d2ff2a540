#include <ScrollBar.h>
#include <ScrollView.h>

#include "ScrollBarLayout.h"
#include "ViewStage.h"

#include <gtest/gtest.h>

namespace {

typedef ScrollBarLayout::Part Part;

TEST(ScrollBarLayout, LooksLikeAnotherAsLongAsNoPixelDiffers) {
    ScrollBarLayout bar;
    bar.length = 230;
    bar.breadth = 15;
    bar.max = 100000;
    bar.proportion = 0.002F;
    ScrollBarLayout other = bar;
    other.max = 100021;
    other.proportion = 0.0019F;
    EXPECT_TRUE(bar.LooksLike(other));
    other = bar;
    other.value = 50000;
    EXPECT_FALSE(bar.LooksLike(other)) << "the thumb is elsewhere";
    other = bar;
    other.proportion = 0.5F;
    EXPECT_FALSE(bar.LooksLike(other)) << "the thumb is longer";
    other = bar;
    other.max = 0;
    EXPECT_FALSE(bar.LooksLike(other)) << "it cannot scroll";
    other = bar;
    other.length = 231;
    EXPECT_FALSE(bar.LooksLike(other));
}

TEST(ScrollBarLayout, TheThumbTakesItsShareOfTheTrough) {
    ScrollBarLayout layout{
        .length = 130, .breadth = 15, .min = 0, .max = 300, .value = 0, .proportion = 0.25F};
    EXPECT_EQ(layout.TroughStart(), 15);
    EXPECT_EQ(layout.TroughLength(), 100);
    EXPECT_EQ(layout.ThumbLength(), 25);
    EXPECT_EQ(layout.ThumbStart(), 15);
    layout.value = 300;
    EXPECT_EQ(layout.ThumbStart(), 90);
    layout.value = 150;
    EXPECT_EQ(layout.ThumbStart(), 53);
}

TEST(ScrollBarLayout, PartsFollowEachOther) {
    const ScrollBarLayout layout{
        .length = 130, .breadth = 15, .min = 0, .max = 300, .value = 150, .proportion = 0.25F};
    const struct {
        int32 position;
        Part part;
    } cases[] = {{-1, Part::None},         {0, Part::LessButton},    {14, Part::LessButton},
                 {15, Part::TroughBefore}, {52, Part::TroughBefore}, {53, Part::Thumb},
                 {77, Part::Thumb},        {78, Part::TroughBehind}, {114, Part::TroughBehind},
                 {115, Part::MoreButton},  {129, Part::MoreButton},  {130, Part::None}};
    for (const auto& [position, part] : cases) {
        EXPECT_EQ(layout.PartAt(position), part) << position;
    }
}

TEST(ScrollBarLayout, DraggingTheThumbCoversTheWholeRange) {
    const ScrollBarLayout layout{
        .length = 130, .breadth = 15, .min = -100, .max = 200, .value = 0, .proportion = 0.25F};
    EXPECT_EQ(layout.ValueForThumbAt(15), -100);
    EXPECT_EQ(layout.ValueForThumbAt(-50), -100);
    EXPECT_EQ(layout.ValueForThumbAt(90), 200);
    EXPECT_EQ(layout.ValueForThumbAt(900), 200);
    EXPECT_EQ(layout.ValueForThumbAt(53), 52);
}

TEST(ScrollBarLayout, SmallAndIdleBarsHaveNoThumb) {
    const ScrollBarLayout idle{.length = 130, .breadth = 15};
    EXPECT_EQ(idle.ThumbLength(), 0);
    EXPECT_EQ(idle.PartAt(50), Part::None);
    const ScrollBarLayout small{.length = 20, .breadth = 15, .min = 0, .max = 10};
    EXPECT_EQ(small.ButtonLength(), 10);
    EXPECT_EQ(small.ThumbLength(), 0);
    EXPECT_EQ(small.PartAt(9), Part::LessButton);
    EXPECT_EQ(small.PartAt(10), Part::MoreButton);
    const ScrollBarLayout none{};
    EXPECT_EQ(none.PartAt(0), Part::None);
    const ScrollBarLayout millions{
        .length = 130, .breadth = 15, .min = 0, .max = 1.0e7F, .value = 0, .proportion = 1.0e-5F};
    EXPECT_EQ(millions.ThumbLength(), 10) << "large enough to be caught";
}

class Scrolling : public ::testing::Test {
  protected:
    // A target of 100 x 100 on the left, a bar of 15 x 130 on the right.
    void SetUp() override {
        mStage.Add(mTarget);
        mStage.Add(mBar);
        mStage.Locked([&] {
            mBar->SetTarget(mTarget);
            mBar->SetProportion(0.25F);
            mBar->SetSteps(5, 80);
        });
        mStage.Redraw();
    }
    float Top() {
        float top = 0;
        mStage.Locked([&] { top = mTarget->Bounds().top; });
        return top;
    }

    ViewStage mStage{150, 140};
    BView* const mTarget = new BView(BRect(0, 0, 99, 99), "target", B_FOLLOW_NONE, B_WILL_DRAW);
    BScrollBar* const mBar = new BScrollBar(BRect(110, 0, 124, 129), "bar", nullptr, 0, 300, B_VERTICAL);
};

TEST_F(Scrolling, ValueAndTargetFollowEachOther) {
    mStage.Locked([&] {
        mBar->SetValue(40);
        EXPECT_EQ(mTarget->Bounds().top, 40);
        mTarget->ScrollTo(0, 77);
        EXPECT_EQ(mBar->Value(), 77);
        mBar->SetValue(1000);
        EXPECT_EQ(mBar->Value(), 300);
        mBar->SetRange(0, 50);
        EXPECT_EQ(mBar->Value(), 50);
        EXPECT_EQ(mTarget->Bounds().top, 50);
        mTarget->ScrollTo(0, 90);
        EXPECT_EQ(mTarget->Bounds().top, 90) << "a view may be scrolled further than the bar reaches";
        EXPECT_EQ(mBar->Value(), 50);
    });
}

TEST_F(Scrolling, ButtonsTroughAndThumbScroll) {
    mStage.Click(mBar, BPoint(7, 125));
    EXPECT_EQ(Top(), 5);
    mStage.Click(mBar, BPoint(7, 5));
    EXPECT_EQ(Top(), 0);
    mStage.Click(mBar, BPoint(7, 100));
    EXPECT_EQ(Top(), 80);
    mStage.Click(mBar, BPoint(7, 18));
    EXPECT_EQ(Top(), 0);
    mStage.MouseDown(mBar, BPoint(7, 20));
    mStage.MouseMoved(mBar, BPoint(90, 95));
    EXPECT_EQ(Top(), 300);
    mStage.MouseMoved(mBar, BPoint(7, 20));
    EXPECT_EQ(Top(), 0);
    mStage.MouseUp(mBar, BPoint(7, 20));
    mStage.MouseMoved(mBar, BPoint(7, 95));
    EXPECT_EQ(Top(), 0) << "the button is up";
}

TEST_F(Scrolling, AHeldButtonRepeatsWhileTheLooperGoesOn) {
    mStage.MouseDown(mBar, BPoint(7, 125));
    const bigtime_t start = system_time();
    while (Top() < 20 && system_time() - start < 10000000) {
        snooze(10000);
    }
    EXPECT_GE(Top(), 20);
    mStage.MouseMoved(mBar, BPoint(50, 50));
    mStage.MouseUp(mBar, BPoint(7, 125));
    const float stopped = Top();
    snooze(200000);
    EXPECT_EQ(Top(), stopped);
}

TEST_F(Scrolling, TheWheelScrollsBarAndTarget) {
    BMessage wheel(B_MOUSE_WHEEL_CHANGED);
    wheel.AddFloat("be:wheel_delta_y", 2);
    wheel.AddFloat("be:wheel_delta_x", 1);
    BMessenger(mTarget).SendMessage(&wheel);
    mStage.Locked([] {});
    BMessage probe(B_MOUSE_UP);
    mStage.Send(mTarget, probe);
    EXPECT_EQ(Top(), 30);
    BMessenger(mBar).SendMessage(&wheel);
    mStage.Send(mTarget, probe);
    EXPECT_EQ(Top(), 60);
}

TEST_F(Scrolling, ABarIsDrawnWithButtonsAndThumb) {
    EXPECT_EQ(mStage.At(110, 0), 0x989898U);
    EXPECT_EQ(mStage.At(112, 12), 0xD8D8D8U);
    EXPECT_GT(mStage.CountOf(0x000000, BRect(111, 1, 123, 13)), 5) << "an arrow";
    EXPECT_EQ(mStage.At(112, 20), 0xD8D8D8U) << "the thumb";
    EXPECT_EQ(mStage.At(112, 60), 0xB8B8B8U) << "the trough";
    mStage.Locked([&] { mBar->SetRange(0, 0); });
    mStage.Redraw();
    EXPECT_EQ(mStage.At(112, 20), 0xD8D8D8U);
    EXPECT_EQ(mStage.At(112, 60), 0xD8D8D8U) << "one that cannot scroll has no trough";
    EXPECT_EQ(mStage.CountOf(0x000000, BRect(111, 1, 123, 13)), 0) << "and grey arrows";
}

TEST(ScrollBar, BarAndTargetForgetEachOther) {
    auto bar = std::make_unique<BScrollBar>(BRect(0, 0, 14, 99), "bar", nullptr, 0, 100, B_VERTICAL);
    {
        BView target(BRect(0, 0, 9, 9), "target", 0, 0);
        bar->SetTarget(&target);
        EXPECT_EQ(target.ScrollBar(B_VERTICAL), bar.get());
        EXPECT_EQ(target.ScrollBar(B_HORIZONTAL), nullptr);
    }
    EXPECT_EQ(bar->Target(), nullptr);
    bar->SetValue(50);
    EXPECT_EQ(bar->Value(), 50);
    BView other(BRect(0, 0, 9, 9), "other", 0, 0);
    bar->SetTarget(&other);
    EXPECT_EQ(other.Bounds().top, 0) << "the bar takes the view's position";
    EXPECT_EQ(bar->Value(), 0);
    bar.reset();
    EXPECT_EQ(other.ScrollBar(B_VERTICAL), nullptr);
}

TEST(ScrollBar, ArchivesAndComesBack) {
    BScrollBar bar(BRect(0, 0, 99, 14), "bar", nullptr, -5, 100, B_HORIZONTAL);
    bar.SetValue(33);
    bar.SetSteps(2, 20);
    bar.SetProportion(0.5F);
    BMessage archive;
    ASSERT_EQ(bar.Archive(&archive), B_OK);
    BScrollBar back(&archive);
    float min = 0;
    float max = 0;
    float small = 0;
    float large = 0;
    back.GetRange(&min, &max);
    back.GetSteps(&small, &large);
    EXPECT_EQ(back.Orientation(), B_HORIZONTAL);
    EXPECT_EQ(min, -5);
    EXPECT_EQ(max, 100);
    EXPECT_EQ(small, 2);
    EXPECT_EQ(large, 20);
    EXPECT_EQ(back.Value(), 33);
    EXPECT_EQ(back.Proportion(), 0.5F);
}

TEST(ScrollView, LiesAroundItsTarget) {
    const struct {
        border_style border;
        bool horizontal;
        bool vertical;
        BRect frame;
        BPoint target;
    } cases[] = {
        {B_NO_BORDER, false, false, BRect(10, 20, 109, 119), BPoint(0, 0)},
        {B_NO_BORDER, true, true, BRect(10, 20, 124, 134), BPoint(0, 0)},
        {B_PLAIN_BORDER, false, true, BRect(9, 19, 125, 120), BPoint(1, 1)},
        {B_FANCY_BORDER, true, false, BRect(8, 18, 111, 136), BPoint(2, 2)},
    };
    for (const auto& wanted : cases) {
        auto* const target = new BView(BRect(10, 20, 109, 119), "target", B_FOLLOW_NONE, B_WILL_DRAW);
        const BScrollView view("scroll", target, B_FOLLOW_ALL, 0, wanted.horizontal, wanted.vertical,
                               wanted.border);
        EXPECT_EQ(view.Frame(), wanted.frame);
        EXPECT_EQ(target->Frame(), BRect(0, 0, 99, 99).OffsetByCopy(wanted.target));
        EXPECT_EQ(target->ResizingMode(), B_FOLLOW_ALL);
        EXPECT_EQ(view.ScrollBar(B_HORIZONTAL) != nullptr, wanted.horizontal);
        EXPECT_EQ(view.ScrollBar(B_VERTICAL) != nullptr, wanted.vertical);
        if (wanted.vertical) {
            const BRect bar = view.ScrollBar(B_VERTICAL)->Frame();
            EXPECT_EQ(bar.Width(), B_V_SCROLL_BAR_WIDTH);
            EXPECT_EQ(bar.left, target->Frame().right + 1);
            EXPECT_EQ(view.ScrollBar(B_VERTICAL)->Target(), target);
        }
    }
}

TEST(ScrollView, AFancyBorderShowsTheFocus) {
    ViewStage stage(60, 60);
    auto* const target = new BView(BRect(10, 10, 49, 49), "target", B_FOLLOW_NONE, B_WILL_DRAW);
    auto* const view = new BScrollView("scroll", target);
    stage.Add(view);
    stage.Redraw();
    EXPECT_EQ(stage.At(8, 8), 0x989898U);
    EXPECT_EQ(stage.At(9, 9), 0x606060U);
    stage.Locked([&] { EXPECT_EQ(view->SetBorderHighlighted(true), B_OK); });
    stage.Redraw();
    EXPECT_EQ(stage.At(9, 9), 0x0000E5U);
    EXPECT_EQ(stage.At(10, 10), 0xFFFFFFU);
    stage.Locked([&] {
        view->SetBorder(B_PLAIN_BORDER);
        EXPECT_EQ(view->SetBorderHighlighted(true), B_ERROR);
    });
}

TEST(ScrollView, BarsAndTargetGrowWithIt) {
    ViewStage stage(200, 200);
    auto* const target = new BView(BRect(0, 0, 49, 49), "target", B_FOLLOW_NONE, B_WILL_DRAW);
    auto* const view = new BScrollView("scroll", target, B_FOLLOW_ALL, 0, true, true, B_PLAIN_BORDER);
    stage.Add(view);
    stage.Locked([&] { view->ResizeBy(30, 20); });
    EXPECT_EQ(target->Frame(), BRect(1, 1, 80, 70));
    EXPECT_EQ(view->ScrollBar(B_VERTICAL)->Frame(), BRect(81, 1, 95, 70));
    EXPECT_EQ(view->ScrollBar(B_HORIZONTAL)->Frame(), BRect(1, 71, 80, 85));
}

TEST(ScrollView, ArchivesAndComesBack) {
    auto* const target = new BView(BRect(0, 0, 49, 49), "the target", B_FOLLOW_NONE, B_WILL_DRAW);
    const BScrollView view("scroll", target, B_FOLLOW_ALL, 0, true, true, B_PLAIN_BORDER);
    BMessage archive;
    ASSERT_EQ(view.Archive(&archive), B_OK);
    const BScrollView back(&archive);
    ASSERT_NE(back.Target(), nullptr);
    EXPECT_STREQ(back.Target()->Name(), "the target");
    EXPECT_EQ(back.Border(), B_PLAIN_BORDER);
    ASSERT_NE(back.ScrollBar(B_VERTICAL), nullptr);
    EXPECT_EQ(back.ScrollBar(B_VERTICAL)->Target(), back.Target());
    EXPECT_EQ(back.ScrollBar(B_HORIZONTAL)->Orientation(), B_HORIZONTAL);
}

TEST(ScrollView, AnotherTargetTakesThePlaceOfTheOld) {
    auto* const target = new BView(BRect(0, 0, 49, 49), "target", B_FOLLOW_NONE, B_WILL_DRAW);
    BScrollView view("scroll", target, B_FOLLOW_ALL, 0, false, true);
    auto* const other = new BView(BRect(0, 0, 9, 9), "other", B_FOLLOW_NONE, B_WILL_DRAW);
    view.SetTarget(other);
    EXPECT_EQ(target->Parent(), nullptr);
    EXPECT_EQ(target->ScrollBar(B_VERTICAL), nullptr);
    EXPECT_EQ(other->Frame(), BRect(2, 2, 51, 51));
    EXPECT_EQ(other->ScrollBar(B_VERTICAL), view.ScrollBar(B_VERTICAL));
    delete target;
    delete other;
    EXPECT_EQ(view.Target(), nullptr);
    EXPECT_EQ(view.ScrollBar(B_VERTICAL)->Target(), nullptr);
}

} // namespace
