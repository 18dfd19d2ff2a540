// MenuTracker: turns the pointer's and the keys' doings into opening, selecting and choosing in menus.
#pragma once

#include "MenuPane.h"

#include <OS.h>

#include <string_view>
#include <vector>

class BMenu;
class BMenuItem;
class MenuStage;

// Holds the chain of open menus, from a menu bar or a pop-up menu on. Knows no window and no clock: what
// happens is told to it, with screen coordinates and the times (system_time()) at which it happened; it asks
// to be called again at NextTime(). It is over when State() is no longer Tracking; the open menus are then
// off the stage and nothing is selected.
//
// Thread rule: one thread, which may use the menus. The stage and the menus must outlive it.
class MenuTracker {
  public:
    enum class Outcome { Tracking, Cancelled, Chosen };
    // What the first release of the mouse button means when it is outside of all items: nothing at all, or
    // the end unless the pointer has not moved since the press.
    enum class FirstRelease { Keeps, Ends };

    MenuTracker(BMenu* root, MenuStage& stage);
    ~MenuTracker();
    MenuTracker(const MenuTracker&) = delete;
    MenuTracker& operator=(const MenuTracker&) = delete;

    // One of these begins it. A bar is shown already, in `frame`, and one of its titles has been pressed, or
    // is reached by the keyboard: without opening its menu, or opening it with the first item selected.
    void BeginOnPressedTitle(BRect frame, BMenuItem* title, BPoint where, bigtime_t when);
    enum class TitleMenu { StaysClosed, Opens };
    void BeginOnTitleByKey(BRect frame, BMenuItem* title, TitleMenu menu);
    // The pop-up is put on the stage with its left top corner at `location`. The pointer is at `where`;
    // `pressed` says whether it has been pressed there.
    enum class Button { Up, Pressed };
    void BeginPopUp(BPoint location, BPoint where, Button button, FirstRelease release, bigtime_t when);
    // A release inside this rectangle, as the first one, keeps the menu open, too.
    void SetClickToOpen(BRect onScreen) { mClickToOpen = onScreen; }

    void PointerMoved(BPoint where, bigtime_t when);
    void PointerPressed(BPoint where, bigtime_t when);
    void PointerReleased(BPoint where, bigtime_t when);
    // Positive shows what lies below.
    void WheelTurned(BPoint where, float lines);
    // The bytes of a key that was pressed. False when it means nothing in menus.
    bool KeyPressed(std::string_view bytes);
    void TimePassed(bigtime_t now);
    // Open menus whose items have changed their size get the room that they need now.
    void LayOutAgain();
    // B_INFINITE_TIMEOUT when there is nothing to wait for.
    bigtime_t NextTime() const;
    void Cancel();
    // The item goes away: what stands on it is cancelled, and it is not chosen.
    void ItemLeaves(const BMenuItem* item);

    Outcome State() const { return mOutcome; }
    // What was chosen, or null.
    BMenuItem* Chosen() const { return mChosen; }
    int32 CountOpenMenus() const;
    // Menus on the stage; a bar is none.
    bool IsAnythingShown() const;

  private:
    struct Level {
        BMenu* menu = nullptr;
        MenuPane pane;
        bool isBar = false;
        BPoint contentSize;
    };
    static constexpr size_t kNowhere = static_cast<size_t>(-1);

    size_t Deepest() const { return mLevels.size() - 1; }
    size_t LevelAt(BPoint where) const;
    // Where the pointer can select it: null for separators and disabled items.
    BMenuItem* SelectableAt(size_t level, BPoint where) const;
    void Hover(BPoint from, bigtime_t when);
    void HoverOver(size_t level, BPoint from, bigtime_t when);
    void SwitchTo(size_t level, BMenuItem* item, bigtime_t when);
    void LeaveItems();

    void Select(size_t level, BMenuItem* item);
    bool OpenSelected(size_t level);
    // False when the user has left meanwhile.
    bool MakeUp(BMenu* menu, BRect item);
    void CloseBelow(size_t level);
    void Scroll(size_t level, float distance);
    void Finish(Outcome outcome, BMenuItem* chosen);
    void ForgetTimes();

    bool MoveByKey(char key);
    void Step(int32 direction);
    void StepToEnd(int32 direction);
    void StepAside(int32 direction);
    void StepInMatrix(char key);
    void GoTo(BMenuItem* item);
    void OpenByKey(bool selectLast = false);
    void LeaveLevel();
    void ChooseSelected();
    bool ChooseByTrigger(char letter);
    void ShowTriggers();

    BMenu* const mRoot;
    MenuStage& mStage;
    std::vector<Level> mLevels;
    Outcome mOutcome = Outcome::Tracking;
    BMenuItem* mChosen = nullptr;

    BPoint mPointer;
    BPoint mPressedAt;
    bool mButtonDown = false;
    bool mMovedSincePress = false;
    bool mAwaitsFirstRelease = false;
    FirstRelease mFirstRelease = FirstRelease::Ends;
    BRect mClickToOpen;
    // Once a menu of the bar has been opened, pointing at another title opens that one's.
    bool mBarOpensMenus = false;
    bool mTriggersShown = false;

    // When the submenu of the selected item opens; when an item takes the selection although the pointer made
    // for a submenu when it crossed it; when a menu scrolls on.
    bigtime_t mOpensAt = B_INFINITE_TIMEOUT;
    bigtime_t mSwitchesAt = B_INFINITE_TIMEOUT;
    bigtime_t mScrollsAt = B_INFINITE_TIMEOUT;
};
