#include "ListAutoscroll.h"
#include "ListStage.h"

#include <OS.h>

namespace {

TEST(ListAutoscroll, GoesFasterFartherAwayButNeverPastAPage) {
    const struct {
        float beyond;
        float page;
        float step;
    } cases[] = {
        {0, 59, 0},    {1, 59, 3},   {3, 59, 4},     {11, 59, 8},     {101, 59, 53},
        {400, 59, 59}, {-1, 59, -3}, {-21, 59, -13}, {-999, 59, -59}, {50, 0, 1},
    };
    for (const auto& each : cases) {
        EXPECT_EQ(autoscroll_step(each.beyond, each.page), each.step) << each.beyond;
    }
}

class DraggedLists : public Lists {
  protected:
    // Until the list shows this y at its top, for ten seconds at most.
    bool ScrollsTo(float top) {
        const bigtime_t end = system_time() + 10000000;
        while (Top() != top && system_time() < end) {
            snooze(5000);
        }
        return Top() == top;
    }
    BPoint Shown(float y) { return {50, Top() + y}; }
    // As a step that was on its way.
    void LateStep() {
        BMessage step(kListAutoscroll);
        mStage.Send(mList, step);
    }
};

TEST_F(DraggedLists, TheSelectionFollowsTheMouse) {
    Fill(6, B_SINGLE_SELECTION_LIST);
    mStage.MouseDown(mList, On(1));
    mStage.MouseMoved(mList, On(3));
    EXPECT_EQ(Selection(), (Numbers{3}));
    mRows[2]->SetEnabled(false);
    mStage.MouseMoved(mList, On(2));
    EXPECT_EQ(Selection(), (Numbers{3})) << "a disabled row is passed over";
    mStage.MouseMoved(mList, On(0));
    EXPECT_EQ(Selection(), (Numbers{0}));
    mStage.MouseUp(mList, On(0));
    mStage.MouseMoved(mList, On(4));
    EXPECT_EQ(Selection(), (Numbers{0})) << "the button is up";
}

TEST_F(DraggedLists, InAMultipleSelectionListItGrowsAndShrinks) {
    Fill(6);
    const struct {
        const char* what;
        Numbers before;
        int pressed;
        uint32 modifiers;
        int over;
        int backOver;
        Numbers grown;
        Numbers shrunk;
    } cases[] = {
        {"plain", {}, 1, 0, 4, 2, {1, 2, 3, 4}, {1, 2}},
        {"upwards", {}, 4, 0, 2, 3, {2, 3, 4}, {3, 4}},
        {"on a selected row", {1, 2}, 2, 0, 4, 2, {2, 3, 4}, {2}},
        {"Shift", {1, 1}, 2, B_SHIFT_KEY, 4, 3, {1, 2, 3, 4}, {1, 2, 3}},
        {"Control keeps the others", {0, 0}, 2, B_CONTROL_KEY, 3, 3, {0, 2, 3}, {0, 2, 3}},
        {"Control that deselects", {1, 3}, 2, B_CONTROL_KEY, 4, 4, {1, 3}, {1, 3}},
    };
    for (const auto& each : cases) {
        mStage.Locked([&] {
            mList->DeselectAll();
            if (!each.before.empty()) {
                mList->Select(each.before[0], each.before[1]);
            }
        });
        mStage.MouseDown(mList, On(each.pressed), each.modifiers);
        mStage.MouseMoved(mList, On(each.over));
        EXPECT_EQ(Selection(), each.grown) << each.what;
        mStage.MouseMoved(mList, On(each.backOver));
        EXPECT_EQ(Selection(), each.shrunk) << each.what;
        mStage.MouseUp(mList, On(each.backOver));
        EXPECT_EQ(Selection(), each.shrunk) << each.what;
    }
}

TEST_F(DraggedLists, BelowTheListItScrollsToTheEnd) {
    Fill(20, B_SINGLE_SELECTION_LIST);
    mStage.MouseDown(mList, On(1));
    mStage.MouseMoved(mList, Shown(90));
    EXPECT_EQ(Selection(), (Numbers{5})) << "the last one that shows, at once";
    EXPECT_TRUE(ScrollsTo(140));
    EXPECT_EQ(Selection(), (Numbers{19}));
    mStage.MouseMoved(mList, Shown(-40));
    EXPECT_TRUE(ScrollsTo(0));
    EXPECT_EQ(Selection(), (Numbers{0}));
    mStage.MouseUp(mList, Shown(-40));
}

TEST_F(DraggedLists, ScrollingExtendsAMultipleSelection) {
    Fill(20);
    mStage.MouseDown(mList, On(2));
    mStage.MouseMoved(mList, Shown(300));
    EXPECT_TRUE(ScrollsTo(140));
    EXPECT_EQ(Selection(), (Numbers{2, 3, 4, 5, 6, 7, 8, 9, 10, 11, 12, 13, 14, 15, 16, 17, 18, 19}));
    mStage.MouseMoved(mList, Shown(5));
    EXPECT_EQ(Selection(), (Numbers{2, 3, 4, 5, 6, 7, 8, 9, 10, 11, 12, 13, 14}));
    mStage.MouseUp(mList, Shown(5));
}

TEST_F(DraggedLists, ItStopsWhenTheButtonComesUpOrThePointerComesBack) {
    Fill(500, B_SINGLE_SELECTION_LIST);
    mStage.MouseDown(mList, On(1));
    mStage.MouseMoved(mList, Shown(61));
    mStage.MouseMoved(mList, Shown(30));
    const float back = Top();
    LateStep();
    EXPECT_EQ(Top(), back);
    mStage.MouseMoved(mList, Shown(61));
    LateStep();
    EXPECT_GT(Top(), back);
    mStage.MouseUp(mList, Shown(61));
    const float released = Top();
    LateStep();
    EXPECT_EQ(Top(), released);
}

TEST_F(DraggedLists, NothingScrollsWhileRowsAreDragged) {
    Fill(20);
    mList->dragsBegin = true;
    mStage.MouseDown(mList, On(1));
    mStage.MouseMoved(mList, Shown(90));
    LateStep();
    EXPECT_EQ(Top(), 0);
    EXPECT_EQ(Selection(), (Numbers{1}));
    mStage.MouseUp(mList, Shown(90));
}

TEST_F(DraggedLists, RowsMayGoWhileItScrolls) {
    Fill(20);
    mStage.MouseDown(mList, On(1));
    mStage.MouseMoved(mList, Shown(90));
    mStage.Locked([&] { mList->MakeEmpty(); });
    LateStep();
    EXPECT_EQ(Top(), 0);
    EXPECT_EQ(Selection(), (Numbers{}));
}

} // namespace
