#include "HeaderGestures.h"
#include "NoNewThreads.h"

#include <gtest/gtest.h>

#include <functional>

namespace {

typedef HeaderGestureTest HeaderDragTest;

TEST_F(HeaderDragTest, ADragBeginsBeyondTwoPixels) {
    AddColumns();

    stage.Drag(120, 118);
    EXPECT_EQ(Keys(), "B+") << "still a click";
    stage.Drag(120, 122);
    EXPECT_EQ(Keys(), "B-");
    stage.Drag(120, 117);
    EXPECT_EQ(Keys(), "B-") << "a drag, which sorts nothing";
    EXPECT_EQ(stage.Labels(), "ABCD");
}

TEST_F(HeaderDragTest, AReleaseThatIsSeenFirstIsAClickWhereverThePointerIs) {
    AddColumns();

    stage.Press(120);
    stage.Release(20);

    EXPECT_EQ(Keys(), "B+");
    EXPECT_EQ(stage.Labels(), "ABCD");
}

TEST_F(HeaderDragTest, ALabelIsDraggedBeforeThePreviousColumn) {
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

TEST_F(HeaderDragTest, ALabelIsDraggedBehindTheNextColumn) {
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

TEST_F(HeaderDragTest, ANeighbourNarrowerThanTheDraggedColumnIsPassedAtItsEdge) {
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

TEST_F(HeaderDragTest, OneMoveMayPassSeveralColumns) {
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

TEST_F(HeaderDragTest, BoundColumnsMoveTogether) {
    AddColumns(0, CLV_COLUMN_LOCK_WITH_RIGHT);

    stage.Drag(200, 20);
    EXPECT_EQ(stage.Labels(), "BCAD");
    stage.Drag(200, 0);
    EXPECT_EQ(stage.Labels(), "ABCD") << "swapped as one group";
}

TEST_F(HeaderDragTest, HiddenColumnsAreDraggedAlongWithTheirGroup) {
    AddColumns(0, CLV_COLUMN_LOCK_WITH_RIGHT | CLV_COLUMN_HIDDEN);

    // C begins at 101 and takes B along.
    stage.Drag(140, 5);

    EXPECT_EQ(stage.Labels(), "BCAD");
}

TEST_F(HeaderDragTest, AGroupWithAColumnThatIsNotMovableStays) {
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

TEST_F(HeaderDragTest, NothingIsDraggedPastWhatIsLockedAtAnEnd) {
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

// With the watchers' own messages.
class WatchedHeaderTest : public HeaderGestureTest {
  protected:
    // False when the condition does not come true within some seconds.
    bool Becomes(const std::function<bool()>& condition) {
        for (int i = 0; i < 1000; ++i) {
            bool isTrue = false;
            stage.Locked([&] { isTrue = condition(); });
            if (isTrue) {
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

TEST_F(WatchedHeaderTest, APressThatNoWatcherCanFollowIsForgotten) {
    AddColumns();
    const auto idle = stage.Picture();
    for (const float x : {120.0F, 100.0F}) {
        {
            const NoNewThreads none;
            stage.Press(x);
        }
        EXPECT_EQ(stage.Picture(), idle);
        stage.MoveTo(10);
        stage.Release(10);
    }
    EXPECT_EQ(stage.Labels(), "ABCD");
    EXPECT_EQ(a->Width(), 100);
    EXPECT_EQ(Keys(), "");

    stage.Click(120);
    EXPECT_EQ(Keys(), "B+");
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
