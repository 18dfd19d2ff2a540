#include "WindowEvents.h"

#include "KeyTranslation.h"
#include "LooperState.h"
#include "MessageDelivery.h"
#include "PopUpHost.h"
#include "TokenTable.h"

#include <Looper.h>

#include <cmath>

namespace {

BPoint ToPoint(host::PointerPosition position) {
    return {static_cast<float>(std::floor(position.x)), static_cast<float>(std::floor(position.y))};
}

template <typename Input>
BMessage PointerMessage(uint32 what, const Input& input) {
    BMessage message(what);
    message.AddInt64("when", input.when);
    message.AddPoint("window_where", ToPoint(input.where));
    message.AddPoint("screen_where", ToPoint(input.on_screen));
    message.AddInt32("modifiers", static_cast<int32>(ModifiersOf(input.modifiers)));
    message.AddInt32("buttons", static_cast<int32>(input.buttons));
    return message;
}

// What says nothing of the pointer, and so does not part two moves.
bool IsOfFrame(uint32 what) {
    return what == kWindowAreaChanged || what == kWindowMarginsChanged || what == kWindowScaleChanged ||
           what == kWindowUpdate;
}

uint32 CodeOf(host::PointerInput::Kind kind) {
    switch (kind) {
    case host::PointerInput::Kind::pressed:
        return B_MOUSE_DOWN;
    case host::PointerInput::Kind::released:
        return B_MOUSE_UP;
    default:
        return B_MOUSE_MOVED;
    }
}

} // namespace

WindowEvents::WindowEvents(const BLooper* window) : mWindow(LooperTable::Instance().Find(window)) {}

void WindowEvents::Post(const BMessage& message) {
    if (mWindow != nullptr) {
        // Fails once the window has gone, when nobody is interested any more.
        (void)MessageDelivery::Post(message, *mWindow, mWindow->token, {});
    }
}

void WindowEvents::PostMove(const BMessage& message) {
    if (mWindow == nullptr) {
        return;
    }
    BMessageQueue& queue = mWindow->queue;
    queue.Lock();
    int32 place = queue.CountMessages() - 1;
    while (place >= 0 && IsOfFrame(queue.FindMessage(place)->what)) {
        --place;
    }
    BMessage* const last = queue.FindMessage(place);
    if (last != nullptr && last->what == B_MOUSE_MOVED && !last->HasBool("be:left") &&
        last->GetInt32("buttons", 0) == message.GetInt32("buttons", 0) &&
        last->GetInt32("be:drag", 0) == message.GetInt32("be:drag", 0)) {
        queue.RemoveMessage(last);
        delete last;
    }
    queue.Unlock();
    Post(message);
}

std::optional<WindowEvents::AreaNews> WindowEvents::TakeArea() {
    GuardLock guard(mMutex);
    if (!mAreaWaits) {
        return std::nullopt;
    }
    mAreaWaits = false;
    return mArea;
}

double WindowEvents::Scale() {
    GuardLock guard(mMutex);
    return mScale;
}

host::FrameMargins WindowEvents::Margins() {
    GuardLock guard(mMutex);
    return mMargins;
}

WindowEvents::Dragged WindowEvents::DragOf(int32 number) {
    GuardLock guard(mMutex);
    return mDragged.number == number ? mDragged : Dragged();
}

void WindowEvents::area_changed(host::Area content, std::uint64_t wishes) {
    bool waited = false;
    {
        GuardLock guard(mMutex);
        waited = mAreaWaits;
        mAreaWaits = true;
        mArea = {content, wishes};
    }
    if (!waited) {
        Post(BMessage(kWindowAreaChanged));
    }
}

void WindowEvents::scale_changed(double scale) {
    {
        GuardLock guard(mMutex);
        mScale = scale;
    }
    Post(BMessage(kWindowScaleChanged));
}

void WindowEvents::margins_changed(host::FrameMargins margins) {
    {
        GuardLock guard(mMutex);
        mMargins = margins;
    }
    Post(BMessage(kWindowMarginsChanged));
}

void WindowEvents::activated(bool active) {
    BMessage message(B_WINDOW_ACTIVATED);
    message.AddBool("active", active);
    Post(message);
}

void WindowEvents::state_changed(host::WindowState state) {
    BMessage message(kWindowStateChanged);
    message.AddInt32("state", static_cast<int32>(state));
    Post(message);
}

void WindowEvents::close_requested() {
    Post(BMessage(B_QUIT_REQUESTED));
}

void WindowEvents::pointer(const host::PointerInput& input) {
    const uint32 code = CodeOf(input.kind);
    BMessage message = PointerMessage(input.outside_popups ? kOutsidePopUps : code, input);
    if (input.kind == host::PointerInput::Kind::pressed) {
        message.AddInt32("clicks", input.clicks);
    }
    if (input.outside_popups) {
        message.AddInt32("kind", static_cast<int32>(code));
        Post(message);
        return;
    }
    if (input.kind == host::PointerInput::Kind::left) {
        message.AddBool("be:left", true);
    }
    if (code == B_MOUSE_MOVED) {
        PostMove(message);
    } else {
        Post(message);
    }
}

void WindowEvents::wheel(const host::WheelInput& input) {
    BMessage message(B_MOUSE_WHEEL_CHANGED);
    message.AddInt64("when", input.when);
    message.AddPoint("window_where", ToPoint(input.where));
    message.AddInt32("modifiers", static_cast<int32>(ModifiersOf(input.modifiers)));
    message.AddFloat("be:wheel_delta_x", static_cast<float>(input.across));
    message.AddFloat("be:wheel_delta_y", static_cast<float>(input.down));
    Post(message);
}

void WindowEvents::key(const host::KeyInput& input) {
    Post(KeyMessage(input));
}

void WindowEvents::text_committed(const std::string& text) {
    for (const BMessage& message : TextMessages(text)) {
        Post(message);
    }
}

void WindowEvents::text_composed(const std::string& text, int caret) {
    BMessage message(B_INPUT_METHOD_EVENT);
    message.AddInt32("be:opcode", B_INPUT_METHOD_CHANGED);
    message.AddString("be:string", text.c_str());
    message.AddInt32("be:selection", caret);
    Post(message);
}

void WindowEvents::drag(const host::DragInput& input) {
    const std::shared_ptr<const OwnDrag> own = input.own ? DragSession::Current() : nullptr;
    int32 number = 0;
    {
        GuardLock guard(mMutex);
        if (input.kind != host::DragInput::Kind::left) {
            if (mDragged.own != own || mDragged.foreign != input.data) {
                mDragged = {mDragged.number + 1, own, input.data};
            }
        }
        number = mDragged.number;
    }
    const bool dropped = input.kind == host::DragInput::Kind::dropped;
    BMessage message = PointerMessage(dropped ? B_MOUSE_UP : B_MOUSE_MOVED, input);
    message.AddInt32("be:drag", number);
    if (input.kind == host::DragInput::Kind::left) {
        message.AddBool("be:left", true);
    }
    if (!dropped) {
        PostMove(message);
        return;
    }
    // The view under the pointer hears of the drag's last place before the button is let go there.
    message.what = B_MOUSE_MOVED;
    PostMove(message);
    message.what = B_MOUSE_UP;
    Post(message);
    message.what = _MESSAGE_DROPPED_;
    Post(message);
}

void WindowEvents::drag_ended(bool /*accepted*/) {
    DragSession::End();
    Post(BMessage(kWindowDragEnded));
}

void WindowEvents::popups_dismissed() {
    Post(BMessage(kPopUpsDismissed));
}

void WindowEvents::screens_changed() {
    Post(BMessage(B_SCREEN_CHANGED));
}

void WindowEvents::pulse() {
    if (!mPulseWaits.exchange(true)) {
        Post(BMessage(B_PULSE));
    }
}
