#include "HeaderGestures.h"

#include <gtest/gtest.h>

namespace {

TEST_F(HeaderGestureTest, AClickMakesTheColumnTheOnlyKeyThenReversesIt) {
    AddColumns();

    stage.Click(120);
    EXPECT_EQ(Keys(), "B+");
    stage.Click(120);
    EXPECT_EQ(Keys(), "B-");
    stage.Click(120);
    EXPECT_EQ(Keys(), "") << "the third click drops the key";
    stage.Click(50);
    EXPECT_EQ(Keys(), "A+");
}

TEST_F(HeaderGestureTest, AShiftClickAddsAKeyOrReversesIt) {
    AddColumns();

    stage.Click(120, kShift);
    stage.Click(50, kShift);
    EXPECT_EQ(Keys(), "B+A+");
    stage.Click(120, kShift);
    EXPECT_EQ(Keys(), "B-A+") << "the primary key";
    stage.Click(50, kShift);
    EXPECT_EQ(Keys(), "B-A-") << "a secondary key";
}

TEST_F(HeaderGestureTest, APlainClickOnASecondaryKeyMakesItTheOnlyOne) {
    AddColumns();
    stage.Click(120, kShift);
    stage.Click(50, kShift);

    stage.Click(50);

    EXPECT_EQ(Keys(), "A+");
}

TEST_F(HeaderGestureTest, OtherModifiersMeanNothing) {
    AddColumns();

    stage.Click(120, B_CONTROL_KEY | B_OPTION_KEY);

    EXPECT_EQ(Keys(), "B+");
}

TEST_F(HeaderGestureTest, ClicksSortThroughTheListsHooks) {
    AddColumns();

    stage.Click(120);
    stage.Click(120);
    stage.Click(50, kShift);
    stage.Click(50, kShift);

    EXPECT_EQ(stage.TakeNotes(),
              (Notes{"key 1", "mode 1 0", "mode 1 1", "add key 0", "mode 0 0", "mode 0 1"}));
}

TEST_F(HeaderGestureTest, AClickOnAColumnThatIsNotSortableDoesNothing) {
    stage.AddColumn("A", 100);
    stage.TakeNotes();

    stage.Click(50);
    stage.Click(50, kShift);

    EXPECT_EQ(stage.TakeNotes(), Notes());
}

TEST_F(HeaderGestureTest, BordersAreTakenTwoPixelsToTheirLeftAndRight) {
    const struct {
        float x;
        const char* expected;
    } kCases[] = {
        {98, "width 0 105"},
        {100, "width 0 105"},
        {101, "width 0 105"},
        {103, "width 0 105"},
        {97, "order 1 0 2 3"},
        {104, ""},
        {149, "width 1 55"},
        {154, "width 1 55"},
        {154.5F, ""},
        {253, "width 3 35"},
        {254, ""},
        {0, ""},
        {2, ""},
    };
    for (const auto& each : kCases) {
        HeaderStage own(400, 90);
        for (const float width : {100.0F, 50.0F, 70.0F, 30.0F}) {
            own.AddColumn("X", width);
        }
        own.TakeNotes();
        own.Press(each.x);
        own.MoveTo(each.x + 5);
        own.Release(each.x + 5);
        const Notes expected = *each.expected == '\0' ? Notes() : Notes{each.expected};
        EXPECT_EQ(own.TakeNotes(), expected) << each.x;
    }
}

TEST_F(HeaderGestureTest, APressOnTheFirstColumnsLeftEdgeDoesNothing) {
    AddColumns();

    stage.Click(0);
    stage.Click(2);
    EXPECT_EQ(Keys(), "");
    stage.Click(3);
    EXPECT_EQ(Keys(), "A+");
}

TEST_F(HeaderGestureTest, ABorderBesideHiddenColumnsBelongsToTheShownOne) {
    AddColumns(0, CLV_COLUMN_HIDDEN);

    // C begins at 101.
    stage.Drag(102, 112);

    EXPECT_EQ(a->Width(), 110);
}

TEST_F(HeaderGestureTest, AColumnFollowsThePointerByItsBorder) {
    AddColumns();

    stage.Press(99);
    stage.MoveTo(119);
    EXPECT_EQ(a->Width(), 120);
    EXPECT_EQ(b->ColumnBegin(), 121);
    stage.MoveTo(104);
    EXPECT_EQ(a->Width(), 105);
    stage.Release(104);
    EXPECT_EQ(stage.TakeNotes(), (Notes{"width 0 120", "width 0 105"}));
    EXPECT_EQ(Keys(), "") << "it was no click";
    EXPECT_EQ(stage.Picture(), stage.PictureDrawnAnew());
}

TEST_F(HeaderGestureTest, ResizingStopsAtTheMinimumWidth) {
    AddColumns();

    stage.Press(100);
    stage.MoveTo(-50);
    EXPECT_EQ(a->Width(), 10);
    stage.MoveTo(5);
    EXPECT_EQ(a->Width(), 10);
    stage.Release(5);
    EXPECT_EQ(stage.TakeNotes(), (Notes{"width 0 10"}));
}

TEST_F(HeaderGestureTest, AColumnThatIsNotResizableHasNoHandle) {
    AddColumns(CLV_COLUMN_NOT_RESIZABLE);

    stage.Drag(100, 120);
    stage.Drag(102, 122);

    EXPECT_EQ(a->Width(), 100);
    EXPECT_EQ(stage.TakeNotes(), Notes());
}

TEST_F(HeaderGestureTest, OnlyThePrimaryButtonAloneStartsAGesture) {
    AddColumns();

    for (const uint32 buttons : {2U, 3U, 4U, 5U}) {
        stage.SetPointer(120, buttons);
        stage.MouseDown(stage.header, BPoint(120, 5));
        stage.Release(120);
    }

    EXPECT_EQ(Keys(), "");
}

TEST_F(HeaderGestureTest, AnotherButtonEndsTheGesture) {
    AddColumns();
    const auto idle = stage.Picture();

    stage.Press(120);
    stage.MoveTo(110);
    stage.Watch(MW_MOUSE_DOWN, 110, 3);
    EXPECT_EQ(stage.Picture(), idle);
    stage.MoveTo(10);
    stage.Release(10);

    EXPECT_EQ(stage.Labels(), "ABCD");
    EXPECT_EQ(Keys(), "");
}

TEST_F(HeaderGestureTest, TheWatchersMessagesMeanNothingWithoutAGesture) {
    AddColumns();

    stage.MoveTo(10);
    stage.Release(120);

    EXPECT_EQ(stage.TakeNotes(), Notes());
    EXPECT_EQ(stage.Picture(), stage.PictureDrawnAnew());
}

TEST_F(HeaderGestureTest, AMessageWithoutItsFieldsIsIgnored) {
    AddColumns();
    stage.Press(120);

    BMessage empty(MW_MOUSE_UP);
    stage.Locked([&] { stage.header->MessageReceived(&empty); });
    EXPECT_EQ(Keys(), "");
    stage.Release(120);
    EXPECT_EQ(Keys(), "B+");
}

TEST_F(HeaderGestureTest, AColumnThatComesOrGoesEndsTheGesture) {
    AddColumns();

    stage.Press(120);
    stage.MoveTo(110);
    stage.AddColumn("E", 40);
    stage.MoveTo(10);
    stage.Release(10);
    EXPECT_EQ(stage.Labels(), "ABCDE");

    stage.Press(120);
    stage.MoveTo(110);
    stage.Locked([&] { delete b; });
    stage.MoveTo(10);
    stage.Release(10);
    EXPECT_EQ(stage.Labels(), "ACDE");
    EXPECT_EQ(stage.Picture(), stage.PictureDrawnAnew());
}

TEST_F(HeaderGestureTest, ThePressedColumnMayBeHiddenMeanwhile) {
    AddColumns();

    stage.Press(120);
    stage.MoveTo(110);
    stage.Locked([&] { b->SetShown(false); });
    stage.MoveTo(10);
    stage.Release(10);

    EXPECT_EQ(stage.Labels(), "ABCD");
    EXPECT_EQ(stage.Picture(), stage.PictureDrawnAnew());
}

TEST_F(HeaderGestureTest, AnotherColumnMayBeHiddenUnderADrag) {
    AddColumns();

    stage.Press(200);
    stage.MoveTo(190);
    stage.Locked([&] { b->SetShown(false); });
    // C is 101 .. 171 now and swaps with A left of 70.
    stage.MoveTo(69);
    EXPECT_EQ(stage.Labels(), "CABD");
    stage.Release(69);
    EXPECT_EQ(stage.Picture(), stage.PictureDrawnAnew());
}

TEST_F(HeaderGestureTest, TheHookForANewOrderMayTakeColumnsAway) {
    AddColumns();
    stage.list->onOrderChanged = [&] { delete d; };

    stage.Press(240);
    stage.MoveTo(5);
    stage.list->onOrderChanged = nullptr;
    stage.Release(5);

    EXPECT_EQ(stage.Labels(), "ABC");
}

TEST_F(HeaderGestureTest, AScrolledHeaderKnowsItsColumns) {
    AddColumns();
    stage.Locked([&] { stage.list->ScrollTo(BPoint(40, 0)); });

    EXPECT_EQ(stage.header->Bounds().left, 40);
    stage.Click(120);
    EXPECT_EQ(Keys(), "B+");
}

TEST_F(HeaderGestureTest, ASecondPressForgetsTheFirst) {
    AddColumns();

    stage.Press(120);
    stage.Press(50);
    stage.Release(50);

    EXPECT_EQ(Keys(), "A+") << "and nothing of B";
    EXPECT_EQ(stage.Picture(), stage.PictureDrawnAnew());
}

} // namespace
