// MenuWindow: the window that one open menu is shown in; MenuWindows: the stage made of them.
#pragma once

#include "MenuEvents.h"
#include "MenuStage.h"

#include <Window.h>

#include <memory>
#include <utility>
#include <vector>

class MenuPaneView;

// Draws the menu and passes on what it hears of pointer and keys; decides nothing. The menu is lent: it stays
// whose it was. The calls below lock the window themselves, for any thread.
class MenuWindow : public BWindow {
  public:
    // The menu must belong to no window.
    MenuWindow(BMenu* menu, const MenuPane& pane, std::shared_ptr<MenuEvents> events);

    void PaneChanged(const MenuPane& pane);
    // The menu has measured its items anew: whoever follows it hears of that. In any thread.
    void MenuChanged();
    // Gives the menu back and ends the window.
    void GiveMenuBack();

    void DispatchMessage(BMessage* message, BHandler* handler) override;

  private:
    void PassPointer(MenuEvent::Kind kind, const BMessage& message);
    void PassKey(const BMessage& message);
    void PassOutside(const BMessage& message);
    void FollowAltKey(const BMessage& message);

    BMenu* const mMenu;
    MenuPaneView* const mPaneView; // the window's child
    const std::shared_ptr<MenuEvents> mEvents;
    BPoint mPointer;
    bool mAltAlone = false;
};

// Owned by one use of menus and called in its thread. Without a display it shows nothing.
class MenuWindows : public MenuStage {
  public:
    explicit MenuWindows(std::shared_ptr<MenuEvents> events);
    ~MenuWindows() override;

    BRect Screen(BPoint where) override;
    bool Show(BMenu* menu, const MenuPane& pane) override;
    void PaneChanged(BMenu* menu, const MenuPane& pane) override;
    void Hide(BMenu* menu) override;
    void MakingUp(BRect item) override;
    bool UserLeaves() override;

  private:
    const std::shared_ptr<MenuEvents> mEvents;
    // The windows delete themselves once they have given back their menu.
    std::vector<std::pair<BMenu*, MenuWindow*>> mShown;
    BRect mMadeUpItem;
    BPoint mPointerBefore;
};
