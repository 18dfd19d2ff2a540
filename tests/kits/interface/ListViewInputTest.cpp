#include "ListStage.h"

namespace {

TEST_F(Lists, TheMouseSelectsAsItsKeysSay) {
    Fill(6);
    const struct {
        int row;
        uint32 modifiers;
        Numbers selected;
    } steps[] = {
        {1, 0, {1}},
        {3, B_CONTROL_KEY, {1, 3}},
        {5, B_SHIFT_KEY, {3, 4, 5}},
        {1, B_SHIFT_KEY, {1, 2, 3}},
        {2, B_CONTROL_KEY, {1, 3}},
        {4, B_SHIFT_KEY | B_CONTROL_KEY, {1, 2, 3, 4}},
        {4, 0, {4}},
        {0, 0, {0}},
    };
    for (size_t i = 0; i < std::size(steps); ++i) {
        mStage.Click(mList, On(steps[i].row), steps[i].modifiers);
        EXPECT_EQ(Selection(), steps[i].selected) << i;
    }
}

TEST_F(Lists, ASingleSelectionListHasOneSelectedRow) {
    Fill(6, B_SINGLE_SELECTION_LIST);
    mStage.Click(mList, On(1));
    mStage.Click(mList, On(3), B_CONTROL_KEY);
    mStage.Click(mList, On(4), B_SHIFT_KEY);
    EXPECT_EQ(Selection(), (Numbers{4}));
    mStage.Locked([&] { mList->Select(1, 3, true); });
    EXPECT_EQ(Selection(), (Numbers{1}));
}

TEST_F(Lists, AClickBelowTheRowsDeselects) {
    Fill(3);
    mStage.Click(mList, On(1));
    mStage.Click(mList, On(4), B_CONTROL_KEY);
    EXPECT_EQ(Selection(), (Numbers{1}));
    mStage.Click(mList, On(4));
    EXPECT_EQ(Selection(), (Numbers{}));
}

TEST_F(Lists, ADoubleClickInvokes) {
    Fill(3);
    mStage.Click(mList, On(2));
    EXPECT_EQ(mCatcher.Count(), 1U) << "the selection message";
    mStage.Click(mList, On(2), 0, 2);
    const std::vector<BMessage> sent = mCatcher.Take();
    ASSERT_EQ(sent.size(), 1U);
    EXPECT_EQ(sent[0].what, 'invo');
    int32 index = -1;
    EXPECT_EQ(sent[0].FindInt32("index", &index), B_OK);
    EXPECT_EQ(index, 2);
    mStage.Click(mList, On(5), 0, 2);
    EXPECT_EQ(mCatcher.Take().size(), 1U) << "below the rows: they are deselected";
}

TEST_F(Lists, KeysMoveTheSelection) {
    Fill(20);
    const struct {
        char key;
        uint32 modifiers;
        Numbers selected;
    } steps[] = {
        {B_DOWN_ARROW, 0, {0}},
        {B_DOWN_ARROW, 0, {1}},
        {B_UP_ARROW, 0, {0}},
        {B_UP_ARROW, 0, {0}},
        {B_PAGE_DOWN, 0, {5}},
        {B_PAGE_DOWN, 0, {10}},
        {B_PAGE_UP, 0, {5}},
        {B_END, 0, {19}},
        {B_DOWN_ARROW, 0, {19}},
        {B_PAGE_DOWN, 0, {19}},
        {B_HOME, 0, {0}},
        {B_DOWN_ARROW, B_SHIFT_KEY, {0, 1}},
        {B_DOWN_ARROW, B_SHIFT_KEY, {0, 1, 2}},
        {B_UP_ARROW, B_SHIFT_KEY, {0, 1}},
        {B_DOWN_ARROW, B_CONTROL_KEY, {0, 1}},
        {B_DOWN_ARROW, B_CONTROL_KEY, {0, 1}},
        {B_SPACE, B_CONTROL_KEY, {0, 1, 3}},
        {B_SPACE, B_CONTROL_KEY, {0, 1}},
        {B_DOWN_ARROW, 0, {4}},
    };
    for (size_t i = 0; i < std::size(steps); ++i) {
        mStage.Key(mList, steps[i].key, steps[i].modifiers);
        EXPECT_EQ(Selection(), steps[i].selected) << i;
    }
}

TEST_F(Lists, ReturnAndSpaceInvoke) {
    Fill(3);
    mStage.Key(mList, B_RETURN);
    EXPECT_EQ(mCatcher.Count(), 0U) << "nothing is selected";
    mStage.Key(mList, B_DOWN_ARROW);
    (void)mCatcher.Take();
    mStage.Key(mList, B_RETURN);
    mStage.Key(mList, B_SPACE);
    const std::vector<BMessage> sent = mCatcher.Take();
    ASSERT_EQ(sent.size(), 2U);
    EXPECT_EQ(sent[1].what, 'invo');
}

TEST_F(Lists, KeysPassDisabledRowsOver) {
    Fill(4);
    mRows[1]->SetEnabled(false);
    mRows[3]->SetEnabled(false);
    mStage.Key(mList, B_DOWN_ARROW);
    mStage.Key(mList, B_DOWN_ARROW);
    EXPECT_EQ(Selection(), (Numbers{2}));
    mStage.Key(mList, B_DOWN_ARROW);
    EXPECT_EQ(Selection(), (Numbers{2}));
    mStage.Key(mList, B_END);
    EXPECT_EQ(Selection(), (Numbers{2}));
    mStage.Locked([&] { mList->Select(0, 3); });
    EXPECT_EQ(Selection(), (Numbers{0, 2}));
    mStage.Click(mList, On(1));
    EXPECT_EQ(Selection(), (Numbers{}));
}

TEST_F(Lists, KeysScrollTheRowIntoView) {
    Fill(20);
    mStage.Key(mList, B_END);
    EXPECT_EQ(Top(), 140);
    mStage.Key(mList, B_UP_ARROW);
    EXPECT_EQ(Top(), 140) << "it can be seen";
    mStage.Key(mList, B_HOME);
    EXPECT_EQ(Top(), 0);
    mStage.Locked([&] {
        mList->Select(10);
        mList->ScrollToSelection();
    });
    EXPECT_EQ(Top(), 50);
}

TEST_F(Lists, ADragIsOfferedOnceAfterSomeWay) {
    Fill(5);
    mStage.Locked([&] { mList->Select(1, 2); });
    mStage.MouseDown(mList, On(2));
    mStage.MouseMoved(mList, On(2) + BPoint(2, 1));
    EXPECT_EQ(mList->drags, 0);
    mStage.MouseMoved(mList, On(2) + BPoint(5, 0));
    mStage.MouseMoved(mList, On(2) + BPoint(9, 0));
    EXPECT_EQ(mList->drags, 1);
    EXPECT_EQ(mList->dragged, 2);
    EXPECT_EQ(mList->draggedFrom, On(2));
    EXPECT_TRUE(mList->draggedSelected);
    EXPECT_EQ(Selection(), (Numbers{1, 2})) << "all of them are dragged";
    mStage.MouseUp(mList, On(2));
    EXPECT_EQ(Selection(), (Numbers{2})) << "there was no drag";
    mList->dragsBegin = true;
    mStage.Locked([&] { mList->Select(1, 2); });
    mStage.MouseDown(mList, On(1));
    mStage.MouseMoved(mList, On(3));
    mStage.MouseUp(mList, On(1));
    EXPECT_EQ(Selection(), (Numbers{1, 2}));
    mStage.MouseMoved(mList, On(4));
    EXPECT_EQ(mList->drags, 2) << "the button is up";
}

TEST_F(Lists, TheFocusShowsInTheScrollViewsBorder) {
    Fill(4);
    EXPECT_EQ(mStage.At(1, 1), 0x606060U);
    mStage.Click(mList, On(1));
    mStage.Redraw();
    EXPECT_EQ(mStage.At(1, 1), 0x0000E5U);
    mStage.Key(mList, B_DOWN_ARROW, B_CONTROL_KEY);
    mStage.Redraw();
    EXPECT_EQ(mStage.At(2, 22), 0x0000E5U) << "the row that the keys are on";
    mStage.Locked([&] { mList->MakeFocus(false); });
    mStage.Redraw();
    EXPECT_EQ(mStage.At(1, 1), 0x606060U);
    EXPECT_EQ(mStage.At(2, 22), 0xFFFFFFU);
}

} // namespace
