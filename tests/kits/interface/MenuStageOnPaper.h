// A stage that shows menus nowhere and remembers what it was asked for.
#pragma once

#include "MenuStage.h"

#include <Menu.h>
#include <MenuItem.h>

#include <algorithm>
#include <string>
#include <utility>
#include <vector>

class MenuStageOnPaper : public MenuStage {
  public:
    BRect Screen(BPoint /*where*/) override { return screen; }
    bool Show(BMenu* menu, const MenuPane& pane) override {
        mShown.emplace_back(menu, pane);
        return true;
    }
    void PaneChanged(BMenu* menu, const MenuPane& pane) override { Find(menu)->second = pane; }
    void Hide(BMenu* menu) override { mShown.erase(Find(menu)); }

    void MakingUp(BRect item) override { madeUpItem = item; }
    bool UserLeaves() override { return leavesAfter >= 0 && leavesAfter-- == 0; }

    // The names of the shown menus, as "File Recent".
    std::string Names() const {
        std::string names;
        for (const auto& [menu, pane] : mShown) {
            names += (names.empty() ? "" : " ") + std::string(menu->Name());
        }
        return names;
    }
    const MenuPane& PaneOf(BMenu* menu) { return Find(menu)->second; }
    // A point within the item, on the screen.
    BPoint On(BMenu* menu, int32 index) {
        const BRect frame = PaneOf(menu).ToScreen(menu->ItemAt(index)->Frame());
        return {frame.left + 30, (frame.top + frame.bottom) / 2};
    }

    BRect screen{0, 0, 1023, 767};
    BRect madeUpItem;
    // How many more times the user stays while a menu is made up; negative for always.
    int leavesAfter = -1;

  private:
    std::vector<std::pair<BMenu*, MenuPane>>::iterator Find(BMenu* menu) {
        return std::find_if(mShown.begin(), mShown.end(),
                            [menu](const auto& shown) { return shown.first == menu; });
    }

    std::vector<std::pair<BMenu*, MenuPane>> mShown;
};
