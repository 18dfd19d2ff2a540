// What the keyboard does with menus, and what both do with a menu bar.
#include "MenuStageOnPaper.h"
#include "MenuTracker.h"

#include <InterfaceDefs.h>

#include <gtest/gtest.h>

namespace {

using Outcome = MenuTracker::Outcome;
using TitleMenu = MenuTracker::TitleMenu;

const BRect kBarFrame(50, 40, 449, 59);

class TellingItem : public BMenuItem {
  public:
    using BMenuItem::BMenuItem;
    using BMenuItem::IsSelected;
};

std::string Selected(const BMenu& menu) {
    for (int32 i = 0; i < menu.CountItems(); ++i) {
        const auto* const item = dynamic_cast<TellingItem*>(menu.ItemAt(i));
        if (item != nullptr && item->IsSelected()) {
            return item->Label();
        }
    }
    return "";
}

// A bar with "File" (Open, a separator, the disabled Print, Close), "Edit" (Undo, Find with In Name and In
// Artist below it) and the title "About" without a menu.
class MenuBarTrackerTest : public testing::Test {
  protected:
    MenuBarTrackerTest() {
        file->AddItem(new TellingItem("Open", nullptr));
        file->AddSeparatorItem();
        file->AddItem(new TellingItem("Print", nullptr));
        file->ItemAt(2)->SetEnabled(false);
        file->AddItem(new TellingItem("Close", nullptr));
        edit->AddItem(new TellingItem("Undo", nullptr));
        find->AddItem(new TellingItem("In Name", nullptr));
        find->AddItem(new TellingItem("In Artist", nullptr));
        edit->AddItem(new TellingItem(find));
        bar.AddItem(new TellingItem(file));
        bar.AddItem(new TellingItem(edit));
        bar.AddItem(new TellingItem("About", nullptr));
    }
    bool Key(char key) { return tracker.KeyPressed(std::string_view(&key, 1)); }
    void Keys(std::initializer_list<char> keys) {
        for (const char key : keys) {
            Key(key);
        }
    }
    BPoint OnTitle(int32 index) const {
        const BRect frame = bar.ItemAt(index)->Frame().OffsetByCopy(kBarFrame.LeftTop());
        return {(frame.left + frame.right) / 2, (frame.top + frame.bottom) / 2};
    }
    void PressTitle(int32 index) {
        tracker.BeginOnPressedTitle(kBarFrame, bar.ItemAt(index), OnTitle(index), 0);
    }
    void BeginByKey(TitleMenu menu = TitleMenu::StaysClosed) {
        tracker.BeginOnTitleByKey(kBarFrame, bar.ItemAt(0), menu);
    }

    BMenu bar{"bar", B_ITEMS_IN_ROW};
    BMenu* const file = new BMenu("File");
    BMenu* const edit = new BMenu("Edit");
    BMenu* const find = new BMenu("Find");
    MenuStageOnPaper stage;
    MenuTracker tracker{&bar, stage};
};

} // namespace

TEST_F(MenuBarTrackerTest, PressingATitleOpensItsMenuBelowIt) {
    PressTitle(0);

    EXPECT_EQ("File", stage.Names());
    EXPECT_EQ("File", Selected(bar));
    EXPECT_EQ(50, stage.PaneOf(file).Frame().left);
    EXPECT_EQ(40 + bar.ItemAt(0)->Frame().bottom + 1, stage.PaneOf(file).Frame().top);
}

TEST_F(MenuBarTrackerTest, PressDragReleaseChooses) {
    PressTitle(0);
    tracker.PointerMoved(stage.On(file, 3), 1);
    EXPECT_EQ("Close", Selected(*file));

    tracker.PointerReleased(stage.On(file, 3), 2);

    EXPECT_EQ(file->ItemAt(3), tracker.Chosen());
    EXPECT_EQ("", Selected(bar));
}

TEST_F(MenuBarTrackerTest, ClickAndClickChooses) {
    PressTitle(0);
    tracker.PointerReleased(OnTitle(0), 1);
    EXPECT_EQ("File", stage.Names());

    tracker.PointerMoved(stage.On(file, 0), 2);
    tracker.PointerPressed(stage.On(file, 0), 3);
    tracker.PointerReleased(stage.On(file, 0), 4);

    EXPECT_EQ(file->ItemAt(0), tracker.Chosen());
}

TEST_F(MenuBarTrackerTest, PointingAtAnotherTitleOpensThatOnesMenu) {
    PressTitle(0);
    tracker.PointerReleased(OnTitle(0), 1);

    tracker.PointerMoved(OnTitle(1), 2);

    EXPECT_EQ("Edit", stage.Names());
    EXPECT_EQ("Edit", Selected(bar));
}

TEST_F(MenuBarTrackerTest, DraggingAlongTheBarAndLettingGoKeepsThatMenuOpen) {
    PressTitle(0);
    tracker.PointerMoved(OnTitle(1), 1);

    tracker.PointerReleased(OnTitle(1), 2);

    EXPECT_EQ("Edit", stage.Names());
    EXPECT_EQ(Outcome::Tracking, tracker.State());
}

TEST_F(MenuBarTrackerTest, PressingTheTitleOfTheOpenMenuClosesIt) {
    PressTitle(0);
    tracker.PointerReleased(OnTitle(0), 1);

    tracker.PointerPressed(OnTitle(0), 2);

    EXPECT_EQ(Outcome::Cancelled, tracker.State());
    EXPECT_EQ("", stage.Names());
}

TEST_F(MenuBarTrackerTest, PressingBesideTheTitlesCloses) {
    PressTitle(0);
    tracker.PointerReleased(OnTitle(0), 1);

    tracker.PointerPressed(BPoint(440, 50), 2);

    EXPECT_EQ(Outcome::Cancelled, tracker.State());
}

TEST_F(MenuBarTrackerTest, ATitleWithoutAMenuIsChosenByAClick) {
    PressTitle(2);
    EXPECT_EQ("About", Selected(bar));

    tracker.PointerReleased(OnTitle(2), 1);

    EXPECT_EQ(bar.ItemAt(2), tracker.Chosen());
}

TEST_F(MenuBarTrackerTest, AltAloneSelectsATitleAndPointingOpensNothing) {
    BeginByKey();
    EXPECT_EQ("File", Selected(bar));

    tracker.PointerMoved(OnTitle(1), 1);

    EXPECT_EQ("", stage.Names());
    EXPECT_EQ("File", Selected(bar));
    EXPECT_FALSE(tracker.IsAnythingShown());
}

TEST_F(MenuBarTrackerTest, ArrowsWalkTheTitlesRoundAndRound) {
    BeginByKey();

    Key(B_RIGHT_ARROW);
    EXPECT_EQ("Edit", Selected(bar));
    Keys({B_RIGHT_ARROW, B_RIGHT_ARROW});
    EXPECT_EQ("File", Selected(bar));
    Key(B_LEFT_ARROW);
    EXPECT_EQ("About", Selected(bar));
    EXPECT_EQ("", stage.Names());
}

TEST_F(MenuBarTrackerTest, DownOpensAMenuAtItsFirstItemAndUpAtItsLast) {
    BeginByKey();

    Key(B_DOWN_ARROW);
    EXPECT_EQ("File", stage.Names());
    EXPECT_EQ("Open", Selected(*file));

    Key(B_ESCAPE);
    Key(B_UP_ARROW);
    EXPECT_EQ("Close", Selected(*file));
}

TEST_F(MenuBarTrackerTest, WalkingPassesOverSeparatorsAndDisabledItems) {
    BeginByKey(TitleMenu::Opens);

    Key(B_DOWN_ARROW);
    EXPECT_EQ("Close", Selected(*file));
    Key(B_DOWN_ARROW);
    EXPECT_EQ("Open", Selected(*file));
    Key(B_END);
    EXPECT_EQ("Close", Selected(*file));
    Key(B_HOME);
    EXPECT_EQ("Open", Selected(*file));
}

TEST_F(MenuBarTrackerTest, EnterChooses) {
    BeginByKey(TitleMenu::Opens);

    Keys({B_DOWN_ARROW, B_ENTER});

    EXPECT_EQ(Outcome::Chosen, tracker.State());
    EXPECT_EQ(file->ItemAt(3), tracker.Chosen());
}

TEST_F(MenuBarTrackerTest, RightGoesIntoASubmenuAndLeftOutOfIt) {
    BeginByKey();
    Keys({B_RIGHT_ARROW, B_DOWN_ARROW, B_DOWN_ARROW});
    EXPECT_EQ("Find", Selected(*edit));

    Key(B_RIGHT_ARROW);
    EXPECT_EQ("Edit Find", stage.Names());
    EXPECT_EQ("In Name", Selected(*find));

    Key(B_LEFT_ARROW);
    EXPECT_EQ("Edit", stage.Names());
    EXPECT_EQ("Find", Selected(*edit));
}

TEST_F(MenuBarTrackerTest, RightAndLeftGoToTheMenuOfTheNextTitleWhereThereIsNoSubmenu) {
    BeginByKey(TitleMenu::Opens);

    Key(B_RIGHT_ARROW);
    EXPECT_EQ("Edit", stage.Names());
    EXPECT_EQ("Undo", Selected(*edit));
    Key(B_LEFT_ARROW);
    EXPECT_EQ("File", stage.Names());
    Key(B_LEFT_ARROW);
    EXPECT_EQ("About", Selected(bar));
    EXPECT_EQ("", stage.Names());
}

TEST_F(MenuBarTrackerTest, EscapeLeavesOneLevelAtATime) {
    BeginByKey();
    Keys({B_RIGHT_ARROW, B_DOWN_ARROW, B_DOWN_ARROW, B_RIGHT_ARROW});

    Key(B_ESCAPE);
    EXPECT_EQ("Edit", stage.Names());
    Key(B_ESCAPE);
    EXPECT_EQ("", stage.Names());
    EXPECT_EQ("Edit", Selected(bar));
    EXPECT_EQ(Outcome::Tracking, tracker.State());
    Key(B_ESCAPE);
    EXPECT_EQ(Outcome::Cancelled, tracker.State());
    EXPECT_EQ("", Selected(bar));
}

TEST_F(MenuBarTrackerTest, TriggersOpenMenusAndChooseItems) {
    BeginByKey();

    EXPECT_TRUE(Key('e'));
    EXPECT_EQ("Edit", stage.Names());
    EXPECT_TRUE(Key('F'));
    EXPECT_EQ("Edit Find", stage.Names());
    EXPECT_TRUE(Key('i'));

    EXPECT_EQ(find->ItemAt(0), tracker.Chosen());
}

TEST_F(MenuBarTrackerTest, ADisabledItemHasNoTrigger) {
    BeginByKey(TitleMenu::Opens);

    EXPECT_FALSE(Key('p'));

    EXPECT_EQ(Outcome::Tracking, tracker.State());
}

TEST_F(MenuBarTrackerTest, MenusWithTriggersOffAnswerToNoLetter) {
    file->SetTriggersEnabled(false);
    BeginByKey(TitleMenu::Opens);

    EXPECT_FALSE(Key('o'));
}

TEST_F(MenuBarTrackerTest, KeysThatMeanNothingChangeNothing) {
    BeginByKey(TitleMenu::Opens);

    EXPECT_FALSE(Key('z'));
    EXPECT_FALSE(tracker.KeyPressed("\xC3\xA4"));
    EXPECT_FALSE(tracker.KeyPressed(""));

    EXPECT_EQ("Open", Selected(*file));
}

TEST_F(MenuBarTrackerTest, KeysGoOnFromWhereThePointerHasLedThem) {
    PressTitle(0);
    tracker.PointerReleased(OnTitle(0), 1);
    tracker.PointerMoved(stage.On(file, 3), 2);

    Key(B_UP_ARROW);

    EXPECT_EQ("Open", Selected(*file));
}

TEST_F(MenuBarTrackerTest, WalkingToAnItemThatIsScrolledAwayShowsIt) {
    for (int i = 0; i < 100; ++i) {
        file->AddItem(new TellingItem("entry", nullptr));
    }
    BeginByKey(TitleMenu::Opens);

    Key(B_UP_ARROW);

    const MenuPane& pane = stage.PaneOf(file);
    EXPECT_EQ(pane.GreatestOffset(), pane.Offset());
    EXPECT_TRUE(pane.ItemArea().Contains(pane.ToScreen(file->ItemAt(103)->Frame())));
}

TEST(MenuMatrixTracker, ArrowsGoToTheNeighbour) {
    BMenu colours("Colours", 100, 100);
    for (int i = 0; i < 9; ++i) {
        const float left = static_cast<float>(i % 3) * 30;
        const float top = static_cast<float>(i / 3) * 30;
        colours.AddItem(new TellingItem(std::to_string(i).c_str(), nullptr),
                        BRect(left, top, left + 19, top + 19));
    }
    MenuStageOnPaper stage;
    MenuTracker tracker(&colours, stage);
    tracker.BeginPopUp(BPoint(0, 0), BPoint(500, 500), MenuTracker::Button::Up,
                       MenuTracker::FirstRelease::Ends, 0);
    const auto press = [&tracker](char key) { tracker.KeyPressed(std::string_view(&key, 1)); };

    press(B_DOWN_ARROW);
    EXPECT_EQ("0", Selected(colours));
    press(B_RIGHT_ARROW);
    press(B_DOWN_ARROW);
    EXPECT_EQ("4", Selected(colours));
    press(B_DOWN_ARROW);
    press(B_DOWN_ARROW);
    press(B_LEFT_ARROW);
    EXPECT_EQ("6", Selected(colours));
}
