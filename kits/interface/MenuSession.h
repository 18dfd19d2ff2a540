// MenuSession: one use of menus, from opening one to the choice or to leaving.
#pragma once

#include "MenuEvents.h"
#include "MenuTracker.h"
#include "MenuWindow.h"

#include <Messenger.h>

#include <memory>
#include <optional>

class BMenuBar;

// Ties events, windows and a tracker together. Events come from any thread; everything else happens in the
// thread that calls, which must be allowed to use the menus (see Menu.h). Windows of menus are locked one at
// a time and never the other way round: their threads wait for nothing.
class MenuSession {
  public:
    explicit MenuSession(BMenu* root);

    MenuTracker& Tracker() { return mTracker; }
    const std::shared_ptr<MenuEvents>& Events() const { return mEvents; }
    bool IsOver() const { return mTracker.State() != MenuTracker::Outcome::Tracking; }

    // Carries it out, with all that it is time for.
    void Handle(const std::optional<MenuEvent>& event);
    // The system_time() at which Handle() wants to be called, with an event or without.
    bigtime_t NextTime() const;

    struct PopUpWish {
        BPoint location;
        bool openAnyway = false;
        std::optional<BRect> clickToOpen;
    };
    // Opens the menu and returns what was chosen, or null. In a window's thread it has that window draw.
    static BMenuItem* RunPopUp(BMenu* menu, const PopUpWish& wish);

  private:
    BMenu* const mRoot;
    const std::shared_ptr<MenuEvents> mEvents;
    MenuWindows mWindows;
    MenuTracker mTracker;
};

// The use of a menu bar. Its state changes only with the bar's window locked: it is begun in the window's
// thread, goes on in one of its own, and may be ended by either.
class MenuBarSession : public MenuSession {
  public:
    explicit MenuBarSession(BMenuBar* bar);

    // Follows the session in a thread of its own until it is over; then kOver is posted to the bar. B_OK, or
    // a thread's error.
    static status_t Follow(const std::shared_ptr<MenuBarSession>& session);
    // Nothing happens afterwards, and the bar is not told.
    void Abandon();

    static constexpr uint32 kOver = 'MBov';

  private:
    static int32 ThreadEntry(void* session);
    void FollowUntilOver();

    const BMessenger mBar;
    bool mAbandoned = false;
};
