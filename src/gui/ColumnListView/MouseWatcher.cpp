#include "gui/ColumnListView/MouseWatcher.h"

#include <InterfaceDefs.h>
#include <Looper.h>
#include <Message.h>
#include <Messenger.h>
#include <View.h>

#include <cmath>
#include <memory>

namespace {

constexpr bigtime_t kPollInterval = 50000;
constexpr int32 kWatcherPriority = 10;
// Moved further than this is dragged.
constexpr float kDragDistance = 1;

struct MouseState {
    BPoint where;
    uint32 buttons = 0;
};

// False when the view or its window is gone. The lock is held no longer than it takes to look.
bool ReadMouse(const BMessenger& target, MouseState& state) {
    if (!target.LockTarget()) {
        return false;
    }
    BLooper* looper = nullptr;
    auto* const view = dynamic_cast<BView*>(target.Target(&looper));
    if (view != nullptr) {
        view->GetMouse(&state.where, &state.buttons, false);
    }
    looper->Unlock();
    return view != nullptr;
}

void Report(const BMessenger& target, uint32 what, const MouseState& state) {
    BMessage message(what);
    message.AddPoint("where", state.where);
    message.AddInt32("buttons", static_cast<int32>(state.buttons));
    message.AddInt32("modifiers", static_cast<int32>(modifiers()));
    // A target that has gone meanwhile misses nothing.
    (void)target.SendMessage(&message, static_cast<BHandler*>(nullptr), B_INFINITE_TIMEOUT);
}

std::unique_ptr<BMessenger> TakeTarget(void* data) {
    return std::unique_ptr<BMessenger>(static_cast<BMessenger*>(data));
}

int32 WatchMouse(void* data) {
    const std::unique_ptr<BMessenger> target = TakeTarget(data);
    MouseState start;
    for (bool first = true;; first = false) {
        MouseState now;
        if (!ReadMouse(*target, now)) {
            return B_OK;
        }
        if (first) {
            start = now;
        }
        // The start stays what it was on purpose: away from there, the pointer is reported at each look.
        if (now.buttons == 0) {
            Report(*target, MW_MOUSE_UP, now);
            return B_OK;
        }
        if (now.buttons != start.buttons) {
            Report(*target, MW_MOUSE_DOWN, now);
        } else if (now.where != start.where) {
            Report(*target, MW_MOUSE_MOVED, now);
        }
        snooze(kPollInterval);
    }
}

int32 WatchForDragOrPopup(void* data) {
    const std::unique_ptr<BMessenger> target = TakeTarget(data);
    bigtime_t clickSpeed = 0;
    if (get_click_speed(&clickSpeed) != B_OK) {
        return B_OK;
    }
    MouseState start;
    bigtime_t popupTime = 0;
    for (bool first = true;; first = false) {
        const bigtime_t time = system_time();
        MouseState now;
        if (!ReadMouse(*target, now)) {
            return B_OK;
        }
        if (first) {
            start = now;
            popupTime = time + 2 * clickSpeed;
        }
        uint32 what = 0;
        if (now.buttons == 0 || now.buttons != start.buttons) {
            what = MW_CLICK;
        } else if (std::fabs(now.where.x - start.where.x) > kDragDistance ||
                   std::fabs(now.where.y - start.where.y) > kDragDistance) {
            what = MW_DRAG;
        } else if (time >= popupTime) {
            what = MW_POPUP;
        }
        if (what != 0) {
            Report(*target, what, now);
            return B_OK;
        }
        snooze(kPollInterval);
    }
}

thread_id Start(thread_func function, const char* name, BView* view) {
    auto target = std::make_unique<BMessenger>(view);
    const thread_id thread = spawn_thread(function, name, kWatcherPriority, target.get());
    if (thread < 0) {
        return thread;
    }
    const status_t status = resume_thread(thread);
    if (status != B_OK) {
        (void)kill_thread(thread);
        return status;
    }
    // The thread's from here on.
    (void)target.release();
    return thread;
}

} // namespace

thread_id StartMouseWatcher(BView* view) {
    return Start(WatchMouse, "MouseWatcher", view);
}

thread_id StartMouseDragOrPopupWatcher(BView* view) {
    return Start(WatchForDragOrPopup, "MouseDragOrPopupWatcher", view);
}
