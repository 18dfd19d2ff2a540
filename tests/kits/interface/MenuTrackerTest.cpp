// What the pointer does with menus. Real menus, on a stage that shows them to nobody.
#include "MenuTracker.h"
#include "MenuStageOnPaper.h"

#include <gtest/gtest.h>

namespace {

using Button = MenuTracker::Button;
using FirstRelease = MenuTracker::FirstRelease;
using Outcome = MenuTracker::Outcome;

constexpr bigtime_t kLong = 1000000;

// Tells which item is selected.
class TellingItem : public BMenuItem {
  public:
    using BMenuItem::BMenuItem;
    using BMenuItem::IsSelected;
};

// The label of the selected item, "" without one.
std::string Selected(const BMenu& menu) {
    for (int32 i = 0; i < menu.CountItems(); ++i) {
        const auto* const item = dynamic_cast<TellingItem*>(menu.ItemAt(i));
        if (item != nullptr && item->IsSelected()) {
            return item->Label();
        }
    }
    return "";
}

// "Open", "Recent" with "song" and "more" below it, a separator, and the disabled "Print".
class MenuTrackerTest : public testing::Test {
  protected:
    MenuTrackerTest() {
        menu.AddItem(new TellingItem("Open", nullptr));
        recent->AddItem(new TellingItem("song", nullptr));
        recent->AddItem(new TellingItem("more", nullptr));
        menu.AddItem(new TellingItem(recent));
        menu.AddSeparatorItem();
        menu.AddItem(new TellingItem("Print", nullptr));
        menu.ItemAt(3)->SetEnabled(false);
    }
    // At (100, 100), with the pointer at (104, 104), as for a press of the secondary button there.
    void PopUp(Button button = Button::Pressed, FirstRelease release = FirstRelease::Ends) {
        tracker.BeginPopUp(BPoint(100, 100), BPoint(104, 104), button, release, 0);
    }
    void MoveOn(BMenu* on, int32 index) { tracker.PointerMoved(stage.On(on, index), now); }
    void PressOn(BMenu* on, int32 index) { tracker.PointerPressed(stage.On(on, index), now); }
    void ReleaseOn(BMenu* on, int32 index) { tracker.PointerReleased(stage.On(on, index), now); }
    void Wait() {
        now += kLong;
        tracker.TimePassed(now);
    }

    BMenu menu{"popup"};
    BMenu* const recent = new BMenu("Recent");
    MenuStageOnPaper stage;
    MenuTracker tracker{&menu, stage};
    bigtime_t now = kLong;
};

} // namespace

TEST_F(MenuTrackerTest, APopUpOpensWhereItWasAskedFor) {
    PopUp();

    EXPECT_EQ("popup", stage.Names());
    EXPECT_EQ(BPoint(100, 100), stage.PaneOf(&menu).Frame().LeftTop());
    EXPECT_EQ(Outcome::Tracking, tracker.State());
    EXPECT_EQ("", Selected(menu));
}

TEST_F(MenuTrackerTest, AnEmptyPopUpIsCancelledAtOnce) {
    BMenu empty("empty");
    MenuTracker onEmpty(&empty, stage);

    onEmpty.BeginPopUp(BPoint(0, 0), BPoint(0, 0), Button::Up, FirstRelease::Ends, 0);

    EXPECT_EQ(Outcome::Cancelled, onEmpty.State());
    EXPECT_EQ("", stage.Names());
}

TEST_F(MenuTrackerTest, DraggingToAnItemAndLettingGoChoosesIt) {
    PopUp();
    MoveOn(&menu, 0);
    EXPECT_EQ("Open", Selected(menu));

    ReleaseOn(&menu, 0);

    EXPECT_EQ(Outcome::Chosen, tracker.State());
    EXPECT_EQ(menu.ItemAt(0), tracker.Chosen());
    EXPECT_EQ("", stage.Names());
    EXPECT_EQ("", Selected(menu));
}

TEST_F(MenuTrackerTest, AClickOnTheSpotOnlyOpensTheMenuAndAnotherChooses) {
    PopUp();
    tracker.PointerReleased(BPoint(104, 104), now);
    EXPECT_EQ(Outcome::Tracking, tracker.State());

    PressOn(&menu, 0);
    ReleaseOn(&menu, 0);

    EXPECT_EQ(menu.ItemAt(0), tracker.Chosen());
}

TEST_F(MenuTrackerTest, LettingGoOutsideAfterADragCancels) {
    PopUp();
    tracker.PointerMoved(BPoint(600, 600), now);

    tracker.PointerReleased(BPoint(600, 600), now);

    EXPECT_EQ(Outcome::Cancelled, tracker.State());
    EXPECT_EQ(nullptr, tracker.Chosen());
    EXPECT_EQ("", stage.Names());
}

TEST_F(MenuTrackerTest, WhereTheFirstReleaseKeepsTheMenuItStaysOpenOutsideToo) {
    PopUp(Button::Pressed, FirstRelease::Keeps);
    tracker.PointerMoved(BPoint(600, 600), now);

    tracker.PointerReleased(BPoint(600, 600), now);

    EXPECT_EQ(Outcome::Tracking, tracker.State());
}

TEST_F(MenuTrackerTest, TheFirstReleaseInsideTheRectangleToClickKeepsTheMenu) {
    PopUp();
    tracker.SetClickToOpen(BRect(590, 590, 610, 610));
    tracker.PointerMoved(BPoint(600, 600), now);

    tracker.PointerReleased(BPoint(600, 600), now);
    EXPECT_EQ(Outcome::Tracking, tracker.State());

    tracker.PointerPressed(BPoint(600, 600), now);
    EXPECT_EQ(Outcome::Cancelled, tracker.State());
}

TEST_F(MenuTrackerTest, APressOutsideCancels) {
    PopUp(Button::Up);

    tracker.PointerPressed(BPoint(600, 600), now);

    EXPECT_EQ(Outcome::Cancelled, tracker.State());
}

TEST_F(MenuTrackerTest, DisabledItemsAndSeparatorsAreNeitherSelectedNorChosen) {
    PopUp(Button::Up);
    MoveOn(&menu, 3);
    EXPECT_EQ("", Selected(menu));

    PressOn(&menu, 3);
    ReleaseOn(&menu, 3);
    PressOn(&menu, 2);
    ReleaseOn(&menu, 2);

    EXPECT_EQ(Outcome::Tracking, tracker.State());
    EXPECT_EQ("popup", stage.Names());
}

TEST_F(MenuTrackerTest, ASubmenuOpensAfterAMomentBesideItsItem) {
    PopUp(Button::Up);
    MoveOn(&menu, 1);
    EXPECT_EQ("popup", stage.Names());
    EXPECT_LT(tracker.NextTime(), now + kLong);

    Wait();

    EXPECT_EQ("popup Recent", stage.Names());
    const BRect item = stage.PaneOf(&menu).ToScreen(menu.ItemAt(1)->Frame());
    EXPECT_EQ(item.right + 1, stage.PaneOf(recent).Frame().left);
    EXPECT_EQ(item.top, stage.PaneOf(recent).ToScreen(recent->ItemAt(0)->Frame()).top);
    EXPECT_EQ(B_INFINITE_TIMEOUT, tracker.NextTime());
}

TEST_F(MenuTrackerTest, APressOnItsItemOpensASubmenuAtOnceAndItStays) {
    PopUp(Button::Up);

    PressOn(&menu, 1);
    EXPECT_EQ("popup Recent", stage.Names());
    ReleaseOn(&menu, 1);

    EXPECT_EQ("popup Recent", stage.Names());
    EXPECT_EQ(Outcome::Tracking, tracker.State());
}

TEST_F(MenuTrackerTest, ItemsOfSubmenusAreChosenLikeOthers) {
    PopUp();
    MoveOn(&menu, 1);
    Wait();
    MoveOn(recent, 1);
    EXPECT_EQ("Recent", Selected(menu));
    EXPECT_EQ("more", Selected(*recent));

    ReleaseOn(recent, 1);

    EXPECT_EQ(recent->ItemAt(1), tracker.Chosen());
    EXPECT_EQ("", stage.Names());
}

TEST_F(MenuTrackerTest, PointingAtAnotherItemClosesTheSubmenu) {
    PopUp(Button::Up);
    MoveOn(&menu, 1);
    Wait();

    tracker.PointerMoved(stage.On(&menu, 0) - BPoint(10, 0), now);

    EXPECT_EQ("popup", stage.Names());
    EXPECT_EQ("Open", Selected(menu));
}

TEST_F(MenuTrackerTest, OnTheWayToASubmenuOtherItemsAreCrossedUnlessThePointerRestsThere) {
    BMenu* const tall = new BMenu("Tall");
    for (int i = 0; i < 20; ++i) {
        tall->AddItem(new TellingItem("entry", nullptr));
    }
    menu.AddItem(new TellingItem(tall), 0);
    PopUp(Button::Up);
    MoveOn(&menu, 0);
    Wait();
    ASSERT_EQ("popup Tall", stage.Names());

    const BPoint crossing = stage.On(&menu, 1) + BPoint(25, -7);
    tracker.PointerMoved(crossing, now);
    EXPECT_EQ("popup Tall", stage.Names());
    EXPECT_EQ("Tall", Selected(menu));

    Wait();
    EXPECT_EQ("popup", stage.Names());
    EXPECT_EQ("Open", Selected(menu));
}

TEST_F(MenuTrackerTest, LeavingForTheOutsideSelectsNothingButKeepsOpenMenusAndTheirItems) {
    PopUp(Button::Up);
    MoveOn(&menu, 1);
    Wait();
    MoveOn(recent, 0);

    tracker.PointerMoved(BPoint(600, 600), now);

    EXPECT_EQ("popup Recent", stage.Names());
    EXPECT_EQ("Recent", Selected(menu));
    EXPECT_EQ("", Selected(*recent));
}

TEST_F(MenuTrackerTest, APointerAtRestSelectsNothingThatOpensUnderIt) {
    PopUp(Button::Up);

    tracker.PointerMoved(BPoint(104, 104), now);

    EXPECT_EQ("", Selected(menu));
}

TEST_F(MenuTrackerTest, ADisabledSubmenuDoesNotOpen) {
    recent->SetEnabled(false);
    PopUp(Button::Up);

    PressOn(&menu, 1);
    Wait();

    EXPECT_EQ("popup", stage.Names());
}

TEST_F(MenuTrackerTest, AMenuHigherThanTheScreenScrollsWhileThePointerIsOnItsArrow) {
    for (int i = 0; i < 100; ++i) {
        menu.AddItem(new TellingItem("entry", nullptr));
    }
    PopUp(Button::Up);
    const BRect strip = stage.PaneOf(&menu).DownStrip();
    ASSERT_TRUE(strip.IsValid());

    tracker.PointerMoved(BPoint(strip.left + 5, strip.top + 5), now);
    const float first = stage.PaneOf(&menu).Offset();
    Wait();
    const float second = stage.PaneOf(&menu).Offset();
    EXPECT_GT(first, 0);
    EXPECT_GT(second, first);

    tracker.PointerMoved(BPoint(strip.left + 5, strip.top - 20), now);
    Wait();
    EXPECT_EQ(second, stage.PaneOf(&menu).Offset());
    EXPECT_EQ("entry", Selected(menu));
}

TEST_F(MenuTrackerTest, TheWheelScrollsAMenuHigherThanTheScreen) {
    for (int i = 0; i < 100; ++i) {
        menu.AddItem(new TellingItem("entry", nullptr));
    }
    PopUp(Button::Up);

    tracker.WheelTurned(BPoint(110, 300), 3);
    EXPECT_EQ(51, stage.PaneOf(&menu).Offset());
    tracker.WheelTurned(BPoint(110, 300), -9);
    EXPECT_EQ(0, stage.PaneOf(&menu).Offset());
    EXPECT_EQ("entry", Selected(menu));
}

TEST_F(MenuTrackerTest, CancellingPutsEverythingAway) {
    PopUp(Button::Up);
    MoveOn(&menu, 1);
    Wait();

    tracker.Cancel();

    EXPECT_EQ(Outcome::Cancelled, tracker.State());
    EXPECT_EQ("", stage.Names());
    EXPECT_EQ("", Selected(menu));
    EXPECT_EQ(0, tracker.CountOpenMenus());
}

TEST_F(MenuTrackerTest, WhatHappensAfterTheEndIsIgnored) {
    PopUp(Button::Up);
    const BPoint first = stage.On(&menu, 0);
    tracker.Cancel();

    tracker.PointerPressed(first, now);
    tracker.PointerReleased(first, now);
    tracker.TimePassed(now + kLong);

    EXPECT_EQ(Outcome::Cancelled, tracker.State());
    EXPECT_FALSE(tracker.KeyPressed("x"));
}

namespace {

// A menu that finds its items when it opens.
class FoundMenu : public BMenu {
  public:
    FoundMenu() : BMenu("Found") {}
    bool AddDynamicItem(add_state state) override {
        if (state == B_INITIAL_ADD) {
            RemoveItems(0, CountItems(), true);
        }
        AddItem(new BMenuItem(std::to_string(CountItems()).c_str(), nullptr));
        return CountItems() < 3;
    }
};

// A menu that says itself where it opens.
class PlacedMenu : public BMenu {
  public:
    PlacedMenu() : BMenu("Placed") { AddItem(new BMenuItem("item", nullptr)); }

  protected:
    BPoint ScreenLocation() override { return {500, 400}; }
};

} // namespace

TEST_F(MenuTrackerTest, AMenuMayFindItsItemsWhenItOpens) {
    auto* const found = new FoundMenu;
    menu.AddItem(found);
    PopUp(Button::Up);

    PressOn(&menu, 4);
    EXPECT_EQ("popup Found", stage.Names());
    EXPECT_EQ(3, found->CountItems());
    PressOn(&menu, 0);
    PressOn(&menu, 4);

    EXPECT_EQ(3, found->CountItems());
}

TEST_F(MenuTrackerTest, ASubmenuMaySayWhereItOpens) {
    auto* const placed = new PlacedMenu;
    menu.AddItem(placed);
    PopUp(Button::Up);

    PressOn(&menu, 4);

    EXPECT_EQ(BPoint(500, 400), stage.PaneOf(placed).Frame().LeftTop());
}
