#include "MenuTracker.h"

#include "MenuPlacement.h"
#include "MenuStage.h"

#include <Menu.h>
#include <MenuItem.h>

#include <algorithm>
#include <cmath>
#include <utility>

namespace {

constexpr bigtime_t kOpenDelay = 180000;
constexpr bigtime_t kAimDelay = 300000;
constexpr bigtime_t kScrollInterval = 30000;
constexpr float kScrollStep = 8;
constexpr float kWheelStep = 17;
constexpr float kStillDistance = 3;

bool IsFarther(BPoint a, BPoint b, float distance) {
    return std::abs(a.x - b.x) > distance || std::abs(a.y - b.y) > distance;
}

} // namespace

MenuTracker::MenuTracker(BMenu* root, MenuStage& stage) : mRoot(root), mStage(stage) {}

MenuTracker::~MenuTracker() {
    Finish(Outcome::Cancelled, nullptr);
}

void MenuTracker::BeginOnPressedTitle(BRect frame, BMenuItem* title, BPoint where, bigtime_t when) {
    mRoot->LayoutItems();
    mLevels.push_back({mRoot, MenuPane(frame, frame.Height(), MenuPane::Border::None), true, BPoint()});
    mPointer = where;
    mPressedAt = where;
    mButtonDown = true;
    mAwaitsFirstRelease = true;
    mBarOpensMenus = true;
    SwitchTo(0, title, when);
}

void MenuTracker::BeginOnTitleByKey(BRect frame, BMenuItem* title, TitleMenu menu) {
    mRoot->LayoutItems();
    mLevels.push_back({mRoot, MenuPane(frame, frame.Height(), MenuPane::Border::None), true, BPoint()});
    ShowTriggers();
    Select(0, title);
    if (menu == TitleMenu::Opens) {
        ChooseSelected();
    }
}

void MenuTracker::BeginPopUp(BPoint location, BPoint where, Button button, FirstRelease release,
                             bigtime_t /*when*/) {
    // Nothing is shown that the user could leave.
    (void)mRoot->AddDynamicItems([] { return false; });
    mRoot->LayoutItems();
    mPointer = where;
    mPressedAt = where;
    mButtonDown = button == Button::Pressed;
    mAwaitsFirstRelease = mButtonDown;
    mFirstRelease = release;
    mRoot->mUsualLocation = location;
    const MenuPane pane(pop_up_frame(mRoot->ScreenLocation(), MenuPane::OuterSide(mRoot->mContentSize.x),
                                     MenuPane::OuterSide(mRoot->mContentSize.y), mStage.Screen(location)),
                        mRoot->mContentSize.y);
    if (mRoot->CountItems() == 0 || !mStage.Show(mRoot, pane)) {
        mOutcome = Outcome::Cancelled;
        return;
    }
    mLevels.push_back({mRoot, pane, false, mRoot->mContentSize});
    // The pointer is within the menu from the start, as a rule; it selects only once it moves.
}

size_t MenuTracker::LevelAt(BPoint where) const {
    for (size_t level = mLevels.size(); level > 0; --level) {
        if (mLevels[level - 1].pane.Frame().Contains(where)) {
            return level - 1;
        }
    }
    return kNowhere;
}

BMenuItem* MenuTracker::SelectableAt(size_t level, BPoint where) const {
    const Level& here = mLevels[level];
    if (here.pane.ZoneAt(where) != MenuPane::Zone::Items) {
        return nullptr;
    }
    BMenuItem* const item = here.menu->ItemUnder(here.pane.ToMenu(where));
    return item != nullptr && item->IsEnabled() ? item : nullptr;
}

void MenuTracker::PointerMoved(BPoint where, bigtime_t when) {
    // A menu that opens or scrolls under a pointer at rest is no move of the pointer.
    if (mOutcome != Outcome::Tracking || where == mPointer) {
        return;
    }
    const BPoint from = mPointer;
    mPointer = where;
    mMovedSincePress = mMovedSincePress || IsFarther(where, mPressedAt, kStillDistance);
    Hover(from, when);
}

void MenuTracker::Hover(BPoint from, bigtime_t when) {
    mScrollsAt = B_INFINITE_TIMEOUT;
    mSwitchesAt = B_INFINITE_TIMEOUT;
    const size_t level = LevelAt(mPointer);
    if (level == kNowhere) {
        LeaveItems();
        return;
    }
    switch (mLevels[level].pane.ZoneAt(mPointer)) {
    case MenuPane::Zone::ScrollUp:
    case MenuPane::Zone::ScrollDown:
        CloseBelow(level);
        Select(level, nullptr);
        mScrollsAt = when;
        TimePassed(when);
        break;
    case MenuPane::Zone::Items:
        HoverOver(level, from, when);
        break;
    default:
        break;
    }
}

// Items whose submenu is open stay selected while the pointer is somewhere else.
void MenuTracker::LeaveItems() {
    mOpensAt = B_INFINITE_TIMEOUT;
    if (!mLevels.back().isBar) {
        Select(Deepest(), nullptr);
    }
}

void MenuTracker::HoverOver(size_t level, BPoint from, bigtime_t when) {
    Level& here = mLevels[level];
    if (here.isBar && !mBarOpensMenus) {
        return;
    }
    BMenuItem* const item = SelectableAt(level, mPointer);
    const bool hasOpenMenu = level < Deepest();
    if (item != nullptr && item == here.menu->mSelected) {
        if (hasOpenMenu) {
            CloseBelow(level + 1);
            Select(level + 1, nullptr);
            mOpensAt = B_INFINITE_TIMEOUT;
        }
        return;
    }
    if (here.isBar && item == nullptr) {
        return;
    }
    if (hasOpenMenu && !here.isBar && makes_for_menu(from, mPointer, mLevels[level + 1].pane.Frame())) {
        mSwitchesAt = when + kAimDelay;
        return;
    }
    SwitchTo(level, item, when);
}

void MenuTracker::SwitchTo(size_t level, BMenuItem* item, bigtime_t when) {
    CloseBelow(level);
    ForgetTimes();
    Select(level, item);
    if (item == nullptr || item->Submenu() == nullptr) {
        return;
    }
    if (mLevels[level].isBar) {
        OpenSelected(level);
    } else {
        mOpensAt = when + kOpenDelay;
    }
}

void MenuTracker::PointerPressed(BPoint where, bigtime_t when) {
    if (mOutcome != Outcome::Tracking) {
        return;
    }
    mPointer = where;
    mPressedAt = where;
    mButtonDown = true;
    mMovedSincePress = false;
    mAwaitsFirstRelease = false;
    const size_t level = LevelAt(where);
    if (level == kNowhere) {
        Cancel();
        return;
    }
    BMenuItem* const item = SelectableAt(level, where);
    if (mLevels[level].isBar) {
        // Pressing the title of the open menu closes it, pressing beside the titles, too.
        if (item == nullptr || (item == mRoot->mSelected && Deepest() > level)) {
            Cancel();
            return;
        }
        mBarOpensMenus = true;
        mAwaitsFirstRelease = true;
    }
    if (item == nullptr) {
        return;
    }
    if (item != mLevels[level].menu->mSelected || Deepest() == level) {
        SwitchTo(level, item, when);
        if (item->Submenu() != nullptr) {
            OpenSelected(level);
        }
    }
}

void MenuTracker::PointerReleased(BPoint where, bigtime_t when) {
    if (mOutcome != Outcome::Tracking) {
        return;
    }
    PointerMoved(where, when);
    if (mOutcome != Outcome::Tracking || !mButtonDown) {
        return;
    }
    mButtonDown = false;
    const bool first = std::exchange(mAwaitsFirstRelease, false);
    const size_t level = LevelAt(where);
    // A press and release on one spot only opens the menu; but a title without one is chosen so.
    if (first && !mMovedSincePress && (level == kNowhere || !mLevels[level].isBar)) {
        return;
    }
    if (level == kNowhere) {
        const bool keeps = first && (mFirstRelease == FirstRelease::Keeps || mClickToOpen.Contains(where));
        if (!keeps) {
            Cancel();
        }
        return;
    }
    BMenuItem* const item = SelectableAt(level, where);
    if (item == nullptr) {
        return;
    }
    Select(level, item);
    if (item->Submenu() == nullptr) {
        Finish(Outcome::Chosen, item);
    } else if (Deepest() == level) {
        OpenSelected(level);
    }
}

void MenuTracker::WheelTurned(BPoint where, float lines) {
    if (mOutcome != Outcome::Tracking) {
        return;
    }
    if (const size_t level = LevelAt(where); level != kNowhere && mLevels[level].pane.Scrolls()) {
        CloseBelow(level);
        Scroll(level, lines * kWheelStep);
        Select(level, SelectableAt(level, where));
    }
}

void MenuTracker::TimePassed(bigtime_t now) {
    if (mOutcome != Outcome::Tracking) {
        return;
    }
    if (now >= mSwitchesAt) {
        Hover(mPointer, now);
    }
    if (now >= mOpensAt) {
        mOpensAt = B_INFINITE_TIMEOUT;
        OpenSelected(Deepest());
    }
    if (now >= mScrollsAt) {
        const size_t level = LevelAt(mPointer);
        const MenuPane::Zone zone =
            level == kNowhere ? MenuPane::Zone::Outside : mLevels[level].pane.ZoneAt(mPointer);
        const bool up = zone == MenuPane::Zone::ScrollUp;
        mScrollsAt = B_INFINITE_TIMEOUT;
        if (up || zone == MenuPane::Zone::ScrollDown) {
            Scroll(level, up ? -kScrollStep : kScrollStep);
            mScrollsAt = now + kScrollInterval;
        }
    }
}

bigtime_t MenuTracker::NextTime() const {
    return std::min({mOpensAt, mSwitchesAt, mScrollsAt});
}

void MenuTracker::Cancel() {
    Finish(Outcome::Cancelled, nullptr);
}

void MenuTracker::ItemLeaves(const BMenuItem* item) {
    if (mChosen == item) {
        mChosen = nullptr;
        mOutcome = Outcome::Cancelled;
    }
    const bool isOpen = std::any_of(mLevels.begin(), mLevels.end(),
                                    [item](const Level& level) { return level.menu->Superitem() == item; });
    if (isOpen) {
        Cancel();
    }
}

int32 MenuTracker::CountOpenMenus() const {
    return static_cast<int32>(mLevels.size());
}

bool MenuTracker::IsAnythingShown() const {
    return !mLevels.empty() && !mLevels.back().isBar;
}

void MenuTracker::Select(size_t level, BMenuItem* item) {
    mLevels[level].menu->SelectItem(item);
}

void MenuTracker::ForgetTimes() {
    mOpensAt = B_INFINITE_TIMEOUT;
    mSwitchesAt = B_INFINITE_TIMEOUT;
    mScrollsAt = B_INFINITE_TIMEOUT;
}

void MenuTracker::Finish(Outcome outcome, BMenuItem* chosen) {
    if (mOutcome != Outcome::Tracking) {
        return;
    }
    mOutcome = outcome;
    mChosen = chosen;
    ForgetTimes();
    if (mLevels.empty()) {
        return;
    }
    CloseBelow(0);
    mRoot->SelectItem(nullptr);
    if (mTriggersShown) {
        menu_info info;
        mRoot->ShowTriggers(get_menu_info(&info) == B_OK && info.triggers_always_shown);
    }
    if (!mLevels.front().isBar) {
        mStage.Hide(mRoot);
    }
    mLevels.clear();
}
