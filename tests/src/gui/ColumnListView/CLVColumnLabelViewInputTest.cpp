#include "HeaderStage.h"

#include <gtest/gtest.h>

namespace {

constexpr unsigned long kSortable = CLV_COLUMN_SORTABLE;
constexpr int32 kShift = B_SHIFT_KEY;

// Columns A 0 .. 100, B 101 .. 151, C 152 .. 222 and D 223 .. 253, all sortable.
class HeaderGestureTest : public testing::Test {
  protected:
    HeaderGestureTest() : stage(400, 90) {}
    void AddColumns(unsigned long ofA = 0, unsigned long ofB = 0, unsigned long ofC = 0,
                    unsigned long ofD = 0) {
        a = stage.AddColumn("A", 100, kSortable | ofA);
        b = stage.AddColumn("B", 50, kSortable | ofB);
        c = stage.AddColumn("C", 70, kSortable | ofC);
        d = stage.AddColumn("D", 30, kSortable | ofD);
        stage.DrawAll();
        stage.TakeNotes();
    }
    std::string Keys() {
        std::string text;
        stage.Locked([&] {
            int32 keys[8];
            CLVSortMode modes[8];
            const int32 count = stage.list->Sorting(keys, modes);
            for (int32 i = 0; i < count; ++i) {
                text += static_cast<char>('A' + keys[i]);
                text += modes[i] == CLV_SORT_ASCENDING ? '+' : '-';
            }
        });
        return text;
    }

    HeaderStage stage;
    CLVColumn* a = nullptr;
    CLVColumn* b = nullptr;
    CLVColumn* c = nullptr;
    CLVColumn* d = nullptr;
};

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

TEST_F(HeaderGestureTest, ADragBeginsBeyondTwoPixels) {
    AddColumns();

    stage.Drag(120, 118);
    EXPECT_EQ(Keys(), "B+") << "still a click";
    stage.Drag(120, 122);
    EXPECT_EQ(Keys(), "B-");
    stage.Drag(120, 117);
    EXPECT_EQ(Keys(), "B-") << "a drag, which sorts nothing";
    EXPECT_EQ(stage.Labels(), "ABCD");
}

TEST_F(HeaderGestureTest, AReleaseThatIsSeenFirstIsAClickWhereverThePointerIs) {
    AddColumns();

    stage.Press(120);
    stage.Release(20);

    EXPECT_EQ(Keys(), "B+");
    EXPECT_EQ(stage.Labels(), "ABCD");
}

TEST_F(HeaderGestureTest, ALabelIsDraggedBeforeThePreviousColumn) {
    AddColumns();

    // B is 50 wide: it swaps with A left of 0 + 50.
    stage.Press(120);
    stage.MoveTo(50);
    EXPECT_EQ(stage.Labels(), "ABCD");
    stage.MoveTo(49);
    EXPECT_EQ(stage.Labels(), "BACD");
    EXPECT_EQ(a->ColumnBegin(), 51);
    stage.Release(49);
    EXPECT_EQ(stage.TakeNotes(), (Notes{"order 1 0 2 3"}));
    EXPECT_EQ(stage.Picture(), stage.PictureDrawnAnew());
}

TEST_F(HeaderGestureTest, ALabelIsDraggedBehindTheNextColumn) {
    AddColumns();

    // B is 50 wide: it swaps with C right of 222 - 50.
    stage.Press(120);
    stage.MoveTo(172);
    EXPECT_EQ(stage.Labels(), "ABCD");
    stage.MoveTo(173);
    EXPECT_EQ(stage.Labels(), "ACBD");
    stage.Release(173);
    EXPECT_EQ(stage.TakeNotes(), (Notes{"order 0 2 1 3"}));
    EXPECT_EQ(stage.Picture(), stage.PictureDrawnAnew());
}

TEST_F(HeaderGestureTest, ANeighbourNarrowerThanTheDraggedColumnIsPassedAtItsEdge) {
    AddColumns();

    // D 223 .. 253 is narrower than C.
    stage.Press(200);
    stage.MoveTo(223);
    EXPECT_EQ(stage.Labels(), "ABCD");
    stage.MoveTo(224);
    EXPECT_EQ(stage.Labels(), "ABDC");
    stage.MoveTo(215);
    EXPECT_EQ(stage.Labels(), "ABDC") << "back only where D would come to lie";
    stage.MoveTo(181);
    EXPECT_EQ(stage.Labels(), "ABCD");
    stage.Release(181);
}

TEST_F(HeaderGestureTest, OneMoveMayPassSeveralColumns) {
    AddColumns();

    stage.Press(240);
    stage.MoveTo(10);
    EXPECT_EQ(stage.Labels(), "DABC");
    stage.MoveTo(390);
    EXPECT_EQ(stage.Labels(), "ABCD");
    stage.Release(390);
    EXPECT_EQ(stage.TakeNotes(), (Notes{"order 0 1 3 2", "order 0 3 1 2", "order 3 0 1 2", "order 0 3 1 2",
                                        "order 0 1 3 2", "order 0 1 2 3"}));
}

TEST_F(HeaderGestureTest, BoundColumnsMoveTogether) {
    AddColumns(0, CLV_COLUMN_LOCK_WITH_RIGHT);

    stage.Drag(200, 20);
    EXPECT_EQ(stage.Labels(), "BCAD");
    stage.Drag(200, 0);
    EXPECT_EQ(stage.Labels(), "ABCD") << "swapped as one group";
}

TEST_F(HeaderGestureTest, HiddenColumnsAreDraggedAlongWithTheirGroup) {
    AddColumns(0, CLV_COLUMN_LOCK_WITH_RIGHT | CLV_COLUMN_HIDDEN);

    // C begins at 101 and takes B along.
    stage.Drag(140, 5);

    EXPECT_EQ(stage.Labels(), "BCAD");
}

TEST_F(HeaderGestureTest, AGroupWithAColumnThatIsNotMovableStays) {
    AddColumns(0, CLV_COLUMN_LOCK_WITH_RIGHT, CLV_COLUMN_NOT_MOVABLE);
    const auto idle = stage.Picture();

    stage.Press(120);
    stage.MoveTo(123);
    EXPECT_EQ(stage.Picture(), idle) << "the label is black again";
    stage.MoveTo(10);
    stage.Release(10);

    EXPECT_EQ(stage.Labels(), "ABCD");
    EXPECT_EQ(Keys(), "");
    stage.Click(120);
    EXPECT_EQ(Keys(), "B+") << "but it is clicked";
}

TEST_F(HeaderGestureTest, NothingIsDraggedPastWhatIsLockedAtAnEnd) {
    AddColumns(CLV_COLUMN_LOCK_AT_START, 0, 0, CLV_COLUMN_LOCK_AT_END);

    stage.Drag(120, 5);
    EXPECT_EQ(stage.Labels(), "ABCD");
    stage.Drag(180, 390);
    EXPECT_EQ(stage.Labels(), "ABCD");
    stage.Drag(50, 390);
    EXPECT_EQ(stage.Labels(), "ABCD") << "nor is that dragged away";
    stage.Drag(240, 5);
    EXPECT_EQ(stage.Labels(), "ABCD");
    stage.Drag(120, 172);
    stage.Drag(120, 210);
    EXPECT_EQ(stage.Labels(), "ACBD") << "between them, there is room";
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

// From here on with the watchers' own messages.

class WatchedHeaderTest : public HeaderGestureTest {
  protected:
    // False when the condition does not come true within some seconds.
    bool Becomes(const std::function<bool()>& condition) {
        for (int i = 0; i < 1000; ++i) {
            if (condition()) {
                return true;
            }
            snooze(10000);
        }
        return false;
    }
    bool RowWithoutBlue() {
        stage.Redraw();
        bool without = false;
        stage.Locked([&] { without = stage.CountOf(0x0000E5, BRect(0, 1, 399, 1)) == 0; });
        return without;
    }
};

TEST_F(WatchedHeaderTest, APressThatIsReleasedAtOnceIsAClick) {
    AddColumns();
    stage.SetPointer(120, 0);

    stage.MouseDown(stage.header, BPoint(120, 5));

    EXPECT_TRUE(Becomes([&] { return Keys() == "B+"; }));
}

TEST_F(WatchedHeaderTest, ADragIsFollowedToItsEnd) {
    AddColumns();
    stage.Press(120);
    stage.WaitForWatcher();
    stage.SetPointer(20, 1);
    EXPECT_TRUE(Becomes([&] { return stage.Labels() == "BACD"; }));

    stage.SetPointer(20, 0);
    // Its outline goes with the release.
    EXPECT_TRUE(Becomes([&] { return RowWithoutBlue(); }));
    EXPECT_EQ(Keys(), "");
}

TEST_F(WatchedHeaderTest, AColumnIsResizedToItsEnd) {
    AddColumns();
    stage.Press(100);
    stage.WaitForWatcher();
    stage.SetPointer(130, 1);
    EXPECT_TRUE(Becomes([&] { return a->Width() == 130; }));
    stage.SetPointer(130, 0);
    EXPECT_TRUE(Becomes([&] { return RowWithoutBlue(); }));
}

TEST_F(WatchedHeaderTest, APressAfterAReleaseThatNobodySawIsFollowedToo) {
    AddColumns();
    stage.Press(120);
    stage.WaitForWatcher();
    // Up and down again before the watcher looks once more.
    stage.Press(50);
    stage.SetPointer(50, 0);

    EXPECT_TRUE(Becomes([&] { return Keys() == "A+"; }));
}

TEST_F(WatchedHeaderTest, TheListMayGoWhileItsHeaderIsHeld) {
    for (int i = 0; i < 3; ++i) {
        HeaderStage own(200, 90);
        own.AddColumn("A", 100);
        own.Press(50);
        own.WaitForWatcher();
        own.SetPointer(60 + static_cast<float>(i), 1);
    }
}

} // namespace
