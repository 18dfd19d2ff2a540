// The column list's header, by mouse.
#include "desktop/GalleryOnDesktop.h"

namespace {

class ColumnHeader : public GalleryOnDesktop {};

} // namespace

TEST_F(ColumnHeader, AClickSortsReversesAndStopsSorting) {
    With("flat", [this] {
        KeepPicture("flat-1-opened");
        Click(OnLabel(0));
        EXPECT_EQ("Part up", Sorting());
        EXPECT_EQ("Bell", TextAt(0, 0));
        KeepPicture("flat-2-sorted");
        Click(OnLabel(0));
        EXPECT_EQ("Part down", Sorting());
        EXPECT_NE("Bell", TextAt(0, 0));
        Click(OnLabel(0));
        EXPECT_EQ("", Sorting());
        EXPECT_TRUE(IsDrawnAsAnew());
    });
}

TEST_F(ColumnHeader, TwoQuickClicksAreTwo) {
    With("flat", [this] {
        Move(OnLabel(1));
        TheDesktop().tool({"click", "--repeat", "2", "--delay", "120", "1"});
        EXPECT_TRUE(Comes([this] { return Sorting() == "Maker down"; }));
    });
}

TEST_F(ColumnHeader, AShiftClickAddsAKeyAndReversesIt) {
    With("flat", [this] {
        Click(OnLabel(1));
        ClickWith("shift", OnLabel(0));
        EXPECT_EQ("Maker up, Part up", Sorting());
        KeepPicture("flat-3-two-keys");
        ClickWith("shift", OnLabel(0));
        EXPECT_EQ("Maker up, Part down", Sorting());
        ClickWith("shift", OnLabel(1));
        EXPECT_EQ("Maker down, Part down", Sorting());
        Click(OnLabel(0));
        EXPECT_EQ("Part down", Sorting()) << "a plain click leaves one key";
        EXPECT_TRUE(IsDrawnAsAnew());
    });
}

TEST_F(ColumnHeader, ALabelThatIsDraggedMovesItsColumn) {
    With("flat", [this] {
        // From the fourth place to the second.
        Drag(OnLabel(3), OnLabel(1).x - 20 - OnLabel(3).x, "flat-4-dragging");
        EXPECT_EQ((Numbers{0, 3, 1, 2, 4, 5}), Order());
        EXPECT_EQ("", Sorting()) << "a drag is no click";
        KeepPicture("flat-5-dragged");
        EXPECT_TRUE(IsDrawnAsAnew());
        Drag(OnLabel(0), 300);
        EXPECT_EQ((Numbers{3, 1, 2, 4, 0, 5}), Order());
        EXPECT_TRUE(IsDrawnAsAnew());
    });
}

TEST_F(ColumnHeader, BoundColumnsMoveTogetherAndLockedOnesStay) {
    With("columns", [this] {
        KeepPicture("columns-1-opened");
        Drag(OnLabel(2), 90, "columns-2-dragging-two");
        EXPECT_EQ((Numbers{0, 3, 1, 2, 4, 5, 6, 7}), Order());
        KeepPicture("columns-3-dragged");
        EXPECT_TRUE(IsDrawnAsAnew());
        Drag(OnLabel(5), -120);
        EXPECT_EQ((Numbers{0, 3, 1, 2, 4, 5, 6, 7}), Order()) << "not movable";
        Drag(OnLabel(3), -100);
        EXPECT_EQ((Numbers{0, 3, 1, 2, 4, 5, 6, 7}), Order()) << "the first is locked at the start";
        Drag(OnLabel(6), 120);
        EXPECT_EQ((Numbers{0, 3, 1, 2, 4, 5, 6, 7}), Order()) << "the last is locked at the end";
        EXPECT_TRUE(IsDrawnAsAnew());
    });
}

TEST_F(ColumnHeader, ABorderThatIsDraggedResizesItsColumnDownToItsLeastWidth) {
    With("flat", [this] {
        Drag(OnBorder(0), 63, "flat-6-resizing");
        EXPECT_EQ(193, Width(0));
        EXPECT_TRUE(IsDrawnAsAnew());
        Drag(OnBorder(1), -31);
        EXPECT_EQ(69, Width(1));
        EXPECT_TRUE(IsDrawnAsAnew());
        Drag(OnBorder(1), -200);
        EXPECT_EQ(20, Width(1));
        KeepPicture("flat-7-resized");
        EXPECT_TRUE(IsDrawnAsAnew());
        EXPECT_EQ("", Sorting());
    });
}

TEST_F(ColumnHeader, ABorderThatIsNotResizableStays) {
    With("columns", [this] {
        const float width = Width(6);
        Drag(OnBorder(6), 30);
        EXPECT_EQ(width, Width(6));
        EXPECT_EQ((Numbers{0, 1, 2, 3, 4, 5, 6, 7}), Order());
    });
}

TEST_F(ColumnHeader, ShortenedTextsFollowTheWidth) {
    With("texts", [this] {
        KeepPicture("texts-1-opened");
        Drag(OnBorder(0), 57);
        EXPECT_TRUE(IsDrawnAsAnew());
        KeepPicture("texts-2-wider");
        Drag(OnBorder(0), -130);
        EXPECT_TRUE(IsDrawnAsAnew());
        KeepPicture("texts-3-narrower");
    });
}

TEST_F(ColumnHeader, FollowsTheListSideways) {
    With("columns", [this] {
        const BRect frame = FrameOf(mWindow);
        Read([&] {
            mWindow->ResizeTo(350, frame.Height());
            return 0;
        });
        snooze(500000);
        // The bar's right arrow.
        const BPoint end = Read([this] {
            BScrollBar* const bar = mList->ScrollBar(B_HORIZONTAL);
            return bar->ConvertToScreen(BPoint(bar->Bounds().right - 7, 7));
        });
        for (int i = 0; i < 4; ++i) {
            Click(end);
        }
        EXPECT_GT(ScrolledTo().x, 0);
        EXPECT_EQ(ScrolledTo().x, Read([this] { return mList->HeaderView()->Bounds().left; }));
        KeepPicture("columns-4-sideways");
        EXPECT_TRUE(IsDrawnAsAnew());
    });
}
