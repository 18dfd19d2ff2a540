// The part of MenuTracker that opens, places, scrolls and closes menus below the first.
#include "MenuTracker.h"

#include "MenuPlacement.h"
#include "MenuStage.h"

#include <Menu.h>
#include <MenuItem.h>

bool MenuTracker::OpenSelected(size_t level) {
    const Level& here = mLevels[level];
    BMenuItem* const item = here.menu->mSelected;
    BMenu* const submenu = item == nullptr ? nullptr : item->Submenu();
    if (submenu == nullptr || !item->IsEnabled() || level != Deepest()) {
        return false;
    }
    const BRect frame = here.pane.ToScreen(item->Frame());
    if (!MakeUp(submenu, frame)) {
        return false;
    }
    submenu->LayoutItems();
    if (submenu->CountItems() == 0) {
        return false;
    }
    const BRect screen = mStage.Screen(frame.LeftTop());
    const float width = MenuPane::OuterSide(submenu->mContentSize.x);
    const float height = MenuPane::OuterSide(submenu->mContentSize.y);
    const bool below = here.menu->Layout() == B_ITEMS_IN_ROW;
    const BPoint usual(below ? frame.left : frame.right + 1,
                       below ? frame.bottom + 1 : frame.top - MenuPane::kBorder);
    submenu->mUsualLocation = usual;
    const BPoint wanted = submenu->ScreenLocation();
    BRect place;
    if (wanted != usual) {
        place = pop_up_frame(wanted, width, height, screen);
    } else if (below) {
        place = frame_below_item(frame, width, height, screen);
    } else {
        place = frame_beside_item(frame, width, height, MenuPane::kBorder, screen);
    }
    const MenuPane pane(place, submenu->mContentSize.y);
    submenu->ShowTriggers(mTriggersShown);
    if (!mStage.Show(submenu, pane)) {
        return false;
    }
    mLevels.push_back({submenu, pane, false, submenu->mContentSize});
    return true;
}

bool MenuTracker::MakeUp(BMenu* menu, BRect item) {
    mStage.MakingUp(item);
    return menu->AddDynamicItems([this] { return mStage.UserLeaves(); });
}

void MenuTracker::LayOutAgain() {
    for (size_t i = 0; mOutcome == Outcome::Tracking && i < mLevels.size(); ++i) {
        Level& level = mLevels[i];
        level.menu->LayoutItems();
        const BPoint size = level.menu->mContentSize;
        if (level.isBar || size == level.contentSize) {
            continue;
        }
        level.contentSize = size;
        const BPoint place = level.pane.Frame().LeftTop();
        const float offset = level.pane.Offset();
        level.pane = MenuPane(pop_up_frame(place, MenuPane::OuterSide(size.x), MenuPane::OuterSide(size.y),
                                           mStage.Screen(place)),
                              size.y);
        level.pane.ScrollBy(offset);
        mStage.PaneChanged(level.menu, level.pane);
    }
}

void MenuTracker::CloseBelow(size_t level) {
    while (Deepest() > level) {
        const Level closing = mLevels.back();
        mLevels.pop_back();
        closing.menu->SelectItem(nullptr);
        mStage.Hide(closing.menu);
    }
}

void MenuTracker::Scroll(size_t level, float distance) {
    Level& here = mLevels[level];
    if (here.pane.ScrollBy(distance)) {
        mStage.PaneChanged(here.menu, here.pane);
    }
}
