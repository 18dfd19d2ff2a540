#include "MenuSession.h"

#include "host/api/display.h"

#include <MenuBar.h>

#include <algorithm>

namespace {

// How often a window that waits for its menu is asked whether it has something to draw.
constexpr bigtime_t kUpdateInterval = 25000;
constexpr bigtime_t kHookInterval = 50000;

} // namespace

MenuSession::MenuSession(BMenu* root)
    : mRoot(root), mEvents(std::make_shared<MenuEvents>()), mWindows(mEvents), mTracker(root, mWindows) {}

bigtime_t MenuSession::NextTime() const {
    return mRoot->mTrackingHook == nullptr ? mTracker.NextTime()
                                           : std::min(mTracker.NextTime(), system_time() + kHookInterval);
}

void MenuSession::Handle(const std::optional<MenuEvent>& event) {
    if (event) {
        switch (event->kind) {
        case MenuEvent::Kind::Moved:
            mTracker.PointerMoved(event->where, event->when);
            break;
        case MenuEvent::Kind::Pressed:
            mTracker.PointerPressed(event->where, event->when);
            break;
        case MenuEvent::Kind::Released:
            mTracker.PointerReleased(event->where, event->when);
            break;
        case MenuEvent::Kind::Wheel:
            mTracker.WheelTurned(event->where, event->lines);
            break;
        case MenuEvent::Kind::Key:
            mTracker.KeyPressed(event->bytes);
            break;
        case MenuEvent::Kind::LayoutChanged:
            mTracker.LayOutAgain();
            break;
        case MenuEvent::Kind::Dismissed:
            mTracker.Cancel();
            break;
        }
    }
    mTracker.TimePassed(system_time());
    if (!IsOver() && mRoot->mTrackingHook != nullptr && mRoot->mTrackingHook(mRoot, mRoot->mTrackingState)) {
        mTracker.Cancel();
    }
}

BMenuItem* MenuSession::RunPopUp(BMenu* menu, const PopUpWish& wish) {
    MenuSession session(menu);
    const host::LiveInput input = host::live_input();
    const BPoint pointer(static_cast<float>(input.on_screen.x), static_cast<float>(input.on_screen.y));
    if (wish.clickToOpen) {
        session.mTracker.SetClickToOpen(*wish.clickToOpen);
    }
    session.mTracker.BeginPopUp(
        wish.location, pointer, input.buttons != 0 ? MenuTracker::Button::Pressed : MenuTracker::Button::Up,
        wish.openAnyway ? MenuTracker::FirstRelease::Keeps : MenuTracker::FirstRelease::Ends, system_time());
    auto* const window = dynamic_cast<BWindow*>(BLooper::LooperForThread(find_thread(nullptr)));
    while (!session.IsOver()) {
        bigtime_t until = session.NextTime();
        if (window != nullptr) {
            until = std::min(until, system_time() + kUpdateInterval);
        }
        session.Handle(session.mEvents->Wait(until));
        if (window != nullptr) {
            window->UpdateIfNeeded();
        }
    }
    return session.mTracker.Chosen();
}

MenuBarSession::MenuBarSession(BMenuBar* bar) : MenuSession(bar), mBar(bar) {}

status_t MenuBarSession::Follow(const std::shared_ptr<MenuBarSession>& session) {
    auto* const kept = new std::shared_ptr<MenuBarSession>(session);
    const thread_id thread = spawn_thread(&MenuBarSession::ThreadEntry, "menu", B_DISPLAY_PRIORITY, kept);
    const status_t status = thread < 0 ? thread : resume_thread(thread);
    if (status != B_OK) {
        if (thread >= 0) {
            kill_thread(thread);
        }
        delete kept;
    }
    return status;
}

int32 MenuBarSession::ThreadEntry(void* data) {
    const std::unique_ptr<std::shared_ptr<MenuBarSession>> session(
        static_cast<std::shared_ptr<MenuBarSession>*>(data));
    (*session)->FollowUntilOver();
    return 0;
}

void MenuBarSession::FollowUntilOver() {
    // Nothing of the session may be looked at before the lock is there, so the first round only looks at it.
    for (bigtime_t until = 0; until >= 0;) {
        const std::optional<MenuEvent> event = Events()->Wait(until);
        BLooper* window = nullptr;
        if (!mBar.LockTarget() || mBar.Target(&window) == nullptr) {
            return;
        }
        until = -1;
        if (!mAbandoned) {
            Handle(event);
            until = IsOver() ? -1 : NextTime();
        }
        if (!mAbandoned && IsOver()) {
            // The choice is carried out in the window's own thread, like all that its program does.
            window->PostMessage(kOver, mBar.Target(nullptr));
        }
        window->Unlock();
    }
}

void MenuBarSession::Abandon() {
    mAbandoned = true;
    Tracker().Cancel();
    Events()->Post({});
}

BMenuItem* BMenu::Track(bool startOpened, BRect* clickToOpen) {
    MenuSession::PopUpWish wish{ScreenLocation(), startOpened, std::nullopt};
    if (clickToOpen != nullptr) {
        wish.clickToOpen = *clickToOpen;
    }
    return MenuSession::RunPopUp(this, wish);
}
