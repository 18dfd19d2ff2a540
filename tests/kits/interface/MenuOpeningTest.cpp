// What a menu does when it opens and while it is open: items that are found then, items that grow, marks.
#include "MenuStageOnPaper.h"
#include "MenuTracker.h"

#include <PopUpMenu.h>

#include <gtest/gtest.h>

namespace {

using Outcome = MenuTracker::Outcome;

// Finds so many items, one a call, and writes the calls down.
class FoundMenu : public BMenu {
  public:
    explicit FoundMenu(int32 itemsToFind) : BMenu("Found"), mItemsToFind(itemsToFind) {}
    bool AddDynamicItem(add_state state) override {
        calls += state == B_INITIAL_ADD ? 'i' : (state == B_PROCESSING ? 'p' : 'a');
        if (state == B_INITIAL_ADD || state == B_ABORT) {
            RemoveItems(0, CountItems(), true);
            return state == B_INITIAL_ADD;
        }
        AddItem(new BMenuItem("found", nullptr));
        return CountItems() < mItemsToFind;
    }
    std::string calls;

  private:
    int32 mItemsToFind;
};

class MenuOpeningTest : public testing::Test {
  protected:
    MenuOpeningTest() {
        menu.AddItem(new BMenuItem("Open", nullptr));
        menu.AddItem(found);
        tracker.BeginPopUp(BPoint(100, 100), BPoint(10, 10), MenuTracker::Button::Up,
                           MenuTracker::FirstRelease::Ends, 0);
    }
    void PressOn(BMenu* on, int32 index) { tracker.PointerPressed(stage.On(on, index), 1000000); }

    BMenu menu{"popup"};
    FoundMenu* const found = new FoundMenu(3);
    MenuStageOnPaper stage;
    MenuTracker tracker{&menu, stage};
};

} // namespace

TEST_F(MenuOpeningTest, ItemsAreAddedUntilThereAreNoMore) {
    PressOn(&menu, 1);

    EXPECT_EQ("ippp", found->calls);
    EXPECT_EQ("popup Found", stage.Names());
    EXPECT_EQ(stage.PaneOf(&menu).ToScreen(menu.ItemAt(1)->Frame()), stage.madeUpItem);
}

TEST_F(MenuOpeningTest, AMenuThatTheUserLeavesMeanwhileIsAbortedAndDoesNotOpen) {
    stage.leavesAfter = 2;

    PressOn(&menu, 1);

    EXPECT_EQ("ippa", found->calls);
    EXPECT_EQ("popup", stage.Names());
    EXPECT_EQ(Outcome::Tracking, tracker.State());
    EXPECT_EQ(0, found->CountItems());
}

TEST_F(MenuOpeningTest, AnOpenMenuGrowsWithItsLabels) {
    PressOn(&menu, 1);
    const BRect before = stage.PaneOf(found).Frame();
    const BRect rootBefore = stage.PaneOf(&menu).Frame();

    found->ItemAt(1)->SetLabel("found, and so much more than before that it would be cut");
    tracker.LayOutAgain();

    const MenuPane& pane = stage.PaneOf(found);
    EXPECT_EQ(before.LeftTop(), pane.Frame().LeftTop());
    EXPECT_EQ(MenuPane::OuterSide(found->ItemAt(1)->Frame().Width()), pane.Frame().Width());
    EXPECT_GT(pane.Frame().Width(), before.Width() + 100);
    EXPECT_EQ(rootBefore, stage.PaneOf(&menu).Frame());
}

TEST_F(MenuOpeningTest, AMenuThatGrowsStaysOnTheScreen) {
    PressOn(&menu, 1);
    stage.screen = BRect(0, 0, 259, 199);

    for (int32 i = 0; i < 20; ++i) {
        found->AddItem(new BMenuItem("a line that is rather long for this screen", nullptr));
    }
    tracker.LayOutAgain();

    const MenuPane& pane = stage.PaneOf(found);
    EXPECT_EQ(199, pane.Frame().bottom);
    EXPECT_EQ(0, pane.Frame().top);
    EXPECT_TRUE(pane.Scrolls());
}

TEST(MenuRadioMode, OneItemIsMarkedAtMost) {
    BMenu menu("radio");
    for (const char* label : {"a", "b", "c"}) {
        menu.AddItem(new BMenuItem(label, nullptr));
    }
    menu.ItemAt(1)->SetMarked(true);
    menu.ItemAt(2)->SetMarked(true);

    menu.SetRadioMode(true);
    EXPECT_EQ(menu.ItemAt(1), menu.FindMarked());
    EXPECT_FALSE(menu.ItemAt(2)->IsMarked());

    menu.ItemAt(0)->SetMarked(true);
    EXPECT_FALSE(menu.ItemAt(1)->IsMarked());
    menu.ItemAt(0)->SetMarked(false);
    EXPECT_EQ(nullptr, menu.FindMarked());

    auto* const added = new BMenuItem("d", nullptr);
    added->SetMarked(true);
    menu.ItemAt(2)->SetMarked(true);
    menu.AddItem(added);
    EXPECT_EQ(added, menu.FindMarked());
    EXPECT_FALSE(menu.ItemAt(2)->IsMarked());
}
