// Selecting and dragging out with the mouse, through the window's messages.
#include "PlayListStage.h"

namespace {

constexpr std::uint32_t kNone = 0;
constexpr std::uint32_t kShift = host::shift_modifier;
constexpr std::uint32_t kControl = host::control_modifier;
constexpr int kBelow = 99;

class PlayListMouse : public PlayListStage {
  protected:
    PlayListMouse() { Fill(8); }

    BPoint Place(int row) { return row == kBelow ? InList(BPoint(60, 250)) : On(row); }
    // The leaf names of what is being dragged; "no drag" when nothing is.
    static Names Dragged() {
        const std::shared_ptr<const OwnDrag> drag = DragSession::Current();
        if (drag == nullptr)
            return {"no drag"};
        EXPECT_EQ(drag->message.what, uint32{B_SIMPLE_DATA});
        Names names;
        entry_ref ref;
        for (int32 i = 0; drag->message.FindRef("refs", i, &ref) == B_OK; ++i)
            names.emplace_back(ref.name);
        return names;
    }
};

TEST_F(PlayListMouse, APressSelectsByWhereItIsAndWhichKeysAreHeld) {
    const struct {
        const char* what;
        Numbers before;
        std::uint32_t keys;
        int row;
        Numbers after;
    } cases[] = {
        {"nothing was selected", {}, kNone, 3, {3}},
        {"another was selected", {1}, kNone, 3, {3}},
        {"several were selected", {1, 2, 5}, kNone, 3, {3}},
        {"on a selected row nothing changes", {1, 3, 5}, kNone, 3, {1, 3, 5}},
        {"Control adds", {1}, kControl, 3, {1, 3}},
        {"Control adds to nothing", {}, kControl, 3, {3}},
        {"Control takes away", {1, 3, 5}, kControl, 3, {1, 5}},
        {"Control takes the only one away", {3}, kControl, 3, {}},
        {"Shift with nothing selected", {}, kShift, 3, {3}},
        {"Shift above the first selected reaches down to it", {4, 6}, kShift, 1, {1, 2, 3, 4, 6}},
        {"Shift below reaches up to the nearest selected", {1, 3}, kShift, 6, {1, 3, 4, 5, 6}},
        {"Shift between reaches up only", {1, 6}, kShift, 4, {1, 2, 3, 4, 6}},
        {"Shift on a selected row changes nothing", {1, 3}, kShift, 3, {1, 3}},
        {"Both on a selected row take away", {1, 3}, kShift | kControl, 3, {1}},
        {"Both on another add that one alone", {1}, kShift | kControl, 4, {1, 4}},
        {"below the last row nothing stays selected", {1, 3}, kNone, kBelow, {}},
    };
    for (const auto& expected : cases) {
        Select(expected.before);
        LiveInput().modifiers_are(expected.keys);
        Click(Place(expected.row));
        EXPECT_EQ(Selection(), expected.after) << expected.what;
    }
    EXPECT_EQ(Dragged(), Names{"no drag"});
}

TEST_F(PlayListMouse, APressOnARowGivesTheListTheKeyboard) {
    Locked([&] {
        mList->MakeFocus(false);
        return 0;
    });
    Click(Place(2));
    EXPECT_TRUE(Locked([&] { return mList->IsFocus(); }));
}

TEST_F(PlayListMouse, TheHeldButtonWorksOnEachRowThatItComesTo) {
    const struct {
        const char* what;
        Numbers before;
        std::uint32_t keys;
        Numbers rows;
        Numbers after;
    } cases[] = {
        {"Control adds each", {}, kControl, {1, 2, 3}, {1, 2, 3}},
        {"Control turns each over", {2}, kControl, {1, 2, 3}, {1, 3}},
        {"Control takes away on the way back", {}, kControl, {1, 2, 1}, {2}},
        {"Shift reaches on", {1}, kShift, {3, 5}, {1, 2, 3, 4, 5}},
        {"Shift from nothing, then down", {}, kShift, {2, 4}, {2, 3, 4}},
        {"a row skipped by a fast pointer stays as it is", {}, kControl, {1, 4}, {1, 4}},
    };
    for (const auto& expected : cases) {
        Select(expected.before);
        LiveInput().modifiers_are(expected.keys);
        Press(On(expected.rows.front()));
        for (size_t i = 1; i < expected.rows.size(); ++i)
            HoldTo(On(expected.rows[i]));
        Release(On(expected.rows.back()));
        EXPECT_EQ(Selection(), expected.after) << expected.what;
    }
    EXPECT_EQ(Dragged(), Names{"no drag"});
}

TEST_F(PlayListMouse, MovingWithinTheRowIsNoDrag) {
    Press(On(2));
    HoldTo(On(2) + BPoint(100, 8));
    Release(On(2) + BPoint(100, 8));
    EXPECT_EQ(Dragged(), Names{"no drag"});
    EXPECT_EQ(Selection(), Numbers{2});
}

TEST_F(PlayListMouse, LeavingTheRowDragsTheSelectedFilesInTheirOrder) {
    const struct {
        const char* what;
        Numbers before;
        int row, to;
        Names dragged;
    } cases[] = {
        {"the one that the press selects", {}, 2, 3, {"2.mp3"}},
        {"instead of the one selected before", {5}, 2, 1, {"2.mp3"}},
        {"all that are selected", {6, 1, 4}, 4, 5, {"1.mp3", "4.mp3", "6.mp3"}},
        {"also to where there are no rows", {1, 7}, 7, kBelow, {"1.mp3", "7.mp3"}},
    };
    for (const auto& expected : cases) {
        DragSession::End();
        Select(expected.before);
        Press(On(expected.row));
        HoldTo(Place(expected.to));
        // The drag has the mouse from now on, and the window's thread is free again.
        Settle();
        EXPECT_EQ(Dragged(), expected.dragged) << expected.what;
        Release(Place(expected.to));
    }
}

TEST_F(PlayListMouse, TheDraggedOutlineHangsAtThePlaceOfThePress) {
    Press(On(2));
    HoldTo(On(3));
    Settle();
    ASSERT_NE(DragSession::Current(), nullptr);
    EXPECT_EQ(DragSession::Current()->offset, BPoint(0, 21)) << "from the press to where the drag began";
    Release(On(3));
}

TEST_F(PlayListMouse, NothingIsDraggedWithKeysHeld) {
    for (const std::uint32_t keys : {kShift, kControl}) {
        Select({});
        LiveInput().modifiers_are(keys);
        Press(On(2));
        HoldTo(On(4));
        Release(On(4));
        EXPECT_EQ(Dragged(), Names{"no drag"});
    }
}

TEST_F(PlayListMouse, ASelectedRowIsDraggedWithShiftHeldToo) {
    Select({2, 5});
    LiveInput().modifiers_are(kShift);
    Press(On(2));
    HoldTo(On(4));
    Settle();
    EXPECT_EQ(Dragged(), (Names{"2.mp3", "5.mp3"}));
    Release(On(4));
    EXPECT_EQ(Selection(), (Numbers{2, 5}));
}

TEST_F(PlayListMouse, FilesThatHaveGoneAreDraggedAllTheSame) {
    std::filesystem::remove(Volume() + "/2.mp3");
    Press(On(2));
    HoldTo(On(3));
    Settle();
    EXPECT_EQ(Dragged(), Names{"2.mp3"});
    Release(On(3));
}

TEST_F(PlayListMouse, AWindowThatIsToCloseDoesNotWaitForTheButton) {
    Press(On(2));
    mWindow->PostMessage(B_QUIT_REQUESTED);
    for (int i = 0; i < 2000 && mApplication->CountLoopers() > 1; ++i)
        snooze(5000);
    EXPECT_EQ(mApplication->CountLoopers(), 1) << "the button is still held";
    mWindow = new ListWindow; // for the end of the test
}

} // namespace
