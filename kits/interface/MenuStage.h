// MenuStage: what menus are shown on while somebody chooses from them. Internal to the kit.
#pragma once

#include "MenuPane.h"

class BMenu;

// Called by MenuTracker only, in the thread that runs it.
class MenuStage {
  public:
    virtual ~MenuStage() = default;

    // The part of the screen there that menus may cover.
    virtual BRect Screen(BPoint where) = 0;
    // Puts a closed menu on the screen; its items have been placed. False when it cannot be shown.
    virtual bool Show(BMenu* menu, const MenuPane& pane) = 0;
    // The pane of a shown menu has been scrolled, moved or resized.
    virtual void PaneChanged(BMenu* menu, const MenuPane& pane) = 0;
    virtual void Hide(BMenu* menu) = 0;

    // While a menu below `item` (on the screen) is being made up: whether the user does not want it any more,
    // who has gone away from the item, pressed elsewhere, or left menus altogether.
    virtual void MakingUp(BRect item) = 0;
    virtual bool UserLeaves() = 0;
};
