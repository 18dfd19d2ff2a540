// The part of MenuTracker that follows the keyboard. Keys act on the menu that was opened last.
#include "MenuTracker.h"

#include "MenuStage.h"
#include "MenuTriggers.h"

#include <Menu.h>
#include <MenuItem.h>

#include <cmath>

bool MenuTracker::KeyPressed(std::string_view bytes) {
    if (mOutcome != Outcome::Tracking || mLevels.empty() || bytes.size() != 1) {
        return false;
    }
    ShowTriggers();
    const char key = bytes.front();
    switch (key) {
    case B_ESCAPE:
        LeaveLevel();
        return true;
    case B_ENTER:
    case B_SPACE:
        ChooseSelected();
        return true;
    case B_HOME:
    case B_PAGE_UP:
        StepToEnd(-1);
        return true;
    case B_END:
    case B_PAGE_DOWN:
        StepToEnd(1);
        return true;
    case B_LEFT_ARROW:
    case B_RIGHT_ARROW:
    case B_UP_ARROW:
    case B_DOWN_ARROW:
        return MoveByKey(key);
    default:
        return ChooseByTrigger(trigger_letter(key));
    }
}

bool MenuTracker::MoveByKey(char key) {
    const menu_layout layout = mLevels.back().menu->Layout();
    const bool isBelowRow = Deepest() > 0 && mLevels[Deepest() - 1].menu->Layout() == B_ITEMS_IN_ROW;
    if (layout == B_ITEMS_IN_MATRIX) {
        StepInMatrix(key);
        return true;
    }
    const bool inRow = layout == B_ITEMS_IN_ROW;
    if (key == (inRow ? B_LEFT_ARROW : B_UP_ARROW)) {
        Step(-1);
    } else if (key == (inRow ? B_RIGHT_ARROW : B_DOWN_ARROW)) {
        Step(1);
    } else if (inRow) {
        OpenByKey(key == B_UP_ARROW);
    } else if (key == B_LEFT_ARROW) {
        if (isBelowRow) {
            StepAside(-1);
        } else if (Deepest() > 0) {
            LeaveLevel();
        }
    } else {
        const BMenuItem* const item = mLevels.back().menu->mSelected;
        if (item != nullptr && item->Submenu() != nullptr) {
            OpenByKey();
        } else if (mLevels.front().menu->Layout() == B_ITEMS_IN_ROW) {
            StepAside(1);
        }
    }
    return true;
}

// Round from one end to the other; what is disabled is passed over.
void MenuTracker::Step(int32 direction) {
    BMenu* const menu = mLevels.back().menu;
    const int32 count = menu->CountItems();
    int32 index = menu->IndexOf(menu->mSelected);
    if (index < 0 && direction < 0) {
        index = count;
    }
    for (int32 i = 0; i < count; ++i) {
        index = (index + direction + count) % count;
        if (menu->ItemAt(index)->IsEnabled()) {
            GoTo(menu->ItemAt(index));
            return;
        }
    }
}

void MenuTracker::StepToEnd(int32 direction) {
    Select(Deepest(), nullptr);
    Step(-direction);
}

// From a menu to the one of the next title.
void MenuTracker::StepAside(int32 direction) {
    CloseBelow(0);
    Step(direction);
    OpenByKey();
}

// To the nearest item that lies in that direction, across counting twice.
void MenuTracker::StepInMatrix(char key) {
    BMenu* const menu = mLevels.back().menu;
    if (menu->mSelected == nullptr) {
        Step(1);
        return;
    }
    const auto middle = [](BRect frame) {
        return BPoint((frame.left + frame.right) / 2, (frame.top + frame.bottom) / 2);
    };
    const BPoint from = middle(menu->mSelected->Frame());
    BMenuItem* nearest = nullptr;
    float least = 0;
    for (int32 i = 0; i < menu->CountItems(); ++i) {
        BMenuItem* const item = menu->ItemAt(i);
        const BPoint way = middle(item->Frame()) - from;
        const bool sideways = key == B_LEFT_ARROW || key == B_RIGHT_ARROW;
        const float sign = key == B_LEFT_ARROW || key == B_UP_ARROW ? -1.0F : 1.0F;
        const float along = sign * (sideways ? way.x : way.y);
        const float across = std::abs(sideways ? way.y : way.x);
        const float distance = along + 2 * across;
        if (item->IsEnabled() && along > across && (nearest == nullptr || distance < least)) {
            nearest = item;
            least = distance;
        }
    }
    if (nearest != nullptr) {
        GoTo(nearest);
    }
}

void MenuTracker::GoTo(BMenuItem* item) {
    ForgetTimes();
    Select(Deepest(), item);
    Level& here = mLevels.back();
    if (here.pane.Reveal(item->Frame())) {
        mStage.PaneChanged(here.menu, here.pane);
    }
}

void MenuTracker::OpenByKey(bool selectLast) {
    if (OpenSelected(Deepest())) {
        mBarOpensMenus = true;
        Step(selectLast ? -1 : 1);
    }
}

void MenuTracker::LeaveLevel() {
    if (Deepest() == 0) {
        Cancel();
        return;
    }
    ForgetTimes();
    CloseBelow(Deepest() - 1);
    mBarOpensMenus = !mLevels.back().isBar;
}

void MenuTracker::ChooseSelected() {
    BMenuItem* const item = mLevels.back().menu->mSelected;
    if (item == nullptr || !item->IsEnabled()) {
        return;
    }
    if (item->Submenu() != nullptr) {
        OpenByKey();
    } else {
        Finish(Outcome::Chosen, item);
    }
}

bool MenuTracker::ChooseByTrigger(char letter) {
    BMenu* const menu = mLevels.back().menu;
    for (int32 i = 0; letter != 0 && i < menu->CountItems(); ++i) {
        BMenuItem* const item = menu->ItemAt(i);
        if (item->mChosenTrigger == letter && item->IsEnabled()) {
            GoTo(item);
            ChooseSelected();
            return true;
        }
    }
    return false;
}

void MenuTracker::ShowTriggers() {
    mTriggersShown = true;
    for (const Level& level : mLevels) {
        level.menu->ShowTriggers(true);
    }
}
