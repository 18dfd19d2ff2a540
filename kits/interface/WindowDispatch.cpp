// The part of BWindow that hands messages to its views and hooks.
#include <Window.h>

#include "PopUpHost.h"
#include "WindowHost.h"

#include <Screen.h>
#include <View.h>

BHandler* BWindow::HandlerFor(BMessage* message, BHandler* target) {
    // What was sent to one of the views goes to that one.
    return target == this || target == mHost->Focus() ? mHost->TargetOf(*message, target) : target;
}

void BWindow::DispatchMessage(BMessage* message, BHandler* handler) {
    // The host is not looked at afterwards where the window has ended: then nothing below is reached.
    mHost->BeginMessage();
    DispatchOwn(message, handler);
    mHost->EndMessage();
}

void BWindow::DispatchOwn(BMessage* message, BHandler* handler) {
    if (message->WasDropped()) {
        // Whatever its code is: it comes from outside.
        handler->MessageReceived(message);
        return;
    }
    auto* const view = dynamic_cast<BView*>(handler);
    switch (message->what) {
    case B_MOUSE_DOWN:
        mHost->MouseDown(*message, handler);
        return;
    case B_MOUSE_UP:
        mHost->MouseUp(*message, handler);
        return;
    case B_MOUSE_MOVED:
        mHost->MouseMoved(*message, handler);
        return;
    case B_KEY_DOWN:
    case B_KEY_UP: {
        if (message->what == B_KEY_DOWN && mHost->HandleKey(*message)) {
            return;
        }
        const char* const bytes = message->GetString("bytes", "");
        const auto count = static_cast<int32>(BString(bytes).Length());
        if (view != nullptr && count > 0) {
            if (message->what == B_KEY_DOWN) {
                view->KeyDown(bytes, count);
            } else {
                view->KeyUp(bytes, count);
            }
            return;
        }
        if (message->what == B_KEY_UP || !mHost->UnusedKey(nullptr, bytes, count)) {
            handler->MessageReceived(message);
        }
        return;
    }
    case B_MODIFIERS_CHANGED:
        mHost->ModifiersChanged(*message);
        (mHost->Focus() != nullptr ? mHost->Focus() : handler)->MessageReceived(message);
        return;
    case B_PULSE:
        mHost->Pulse();
        return;
    case B_INPUT_METHOD_EVENT:
        if (mHost->Focus() != nullptr) {
            mHost->Focus()->MessageReceived(message);
        }
        return;
    default:
        break;
    }
    if (handler != this) {
        handler->MessageReceived(message);
        return;
    }
    switch (message->what) {
    case kWindowUpdate:
        mHost->TakeUpdate();
        break;
    case kWindowAreaChanged:
        TakeFrame();
        break;
    case kWindowMarginsChanged:
        if (mTitleToCheck) {
            mTitleToCheck = false;
            KeepTitleInReach();
        }
        break;
    case kWindowScaleChanged:
        mHost->TakeScale();
        break;
    case kWindowDragEnded:
        mHost->DragEnded();
        break;
    case kWindowStateChanged: {
        const int32 state = message->GetInt32("state", 0);
        mMinimized = state == static_cast<int32>(host::WindowState::minimized);
        if (state == static_cast<int32>(host::WindowState::maximized) && mHost->Geometry().HasZoomLimits()) {
            // The window manager fills the screen; this window zooms no further than its limits.
            mHost->Peer()->maximize(false);
            Zoom();
        }
        break;
    }
    case B_WINDOW_ACTIVATED:
        mActive = message->GetBool("active", false);
        mHost->Activated(mActive);
        break;
    case B_WINDOW_MOVED:
        FrameMoved(message->GetPoint("where", Frame().LeftTop()));
        break;
    case B_WINDOW_RESIZED:
        FrameResized(Frame().Width(), Frame().Height());
        break;
    case B_MINIMIZE:
        Minimize(message->GetBool("minimize", !mMinimized));
        break;
    case B_ZOOM:
        Zoom();
        break;
    case B_SCREEN_CHANGED: {
        const BScreen screen(this);
        ScreenChanged(screen.Frame(), screen.ColorSpace());
        break;
    }
    case B_WINDOW_MOVE_TO:
        MoveTo(message->GetPoint("data", Frame().LeftTop()));
        break;
    case B_WINDOW_MOVE_BY: {
        const BPoint distance = message->GetPoint("data", B_ORIGIN);
        MoveBy(distance.x, distance.y);
        break;
    }
    default:
        BLooper::DispatchMessage(message, handler);
    }
}

void BWindow::MessageReceived(BMessage* message) {
    BLooper::MessageReceived(message);
}

void BWindow::FrameMoved(BPoint /*newPosition*/) {}
void BWindow::FrameResized(float /*newWidth*/, float /*newHeight*/) {}
void BWindow::WorkspacesChanged(uint32 /*oldWorkspaces*/, uint32 /*newWorkspaces*/) {}
void BWindow::WorkspaceActivated(int32 /*workspace*/, bool /*state*/) {}
void BWindow::WindowActivated(bool /*state*/) {}
void BWindow::ScreenChanged(BRect /*screenSize*/, color_space /*depth*/) {}
void BWindow::MenusBeginning() {}
void BWindow::MenusEnded() {}

void BWindow::AddShortcut(uint32 key, uint32 modifiers, BMessage* message) {
    mHost->WindowShortcuts().Add(key, modifiers, std::unique_ptr<BMessage>(message),
                                 Shortcuts::Target::window, nullptr);
}

void BWindow::AddShortcut(uint32 key, uint32 modifiers, BMessage* message, BHandler* target) {
    mHost->WindowShortcuts().Add(key, modifiers, std::unique_ptr<BMessage>(message),
                                 target != nullptr ? Shortcuts::Target::handler : Shortcuts::Target::focus,
                                 target);
}

bool BWindow::HasShortcut(uint32 key, uint32 modifiers) {
    return mHost->WindowShortcuts().Find(key, modifiers) != nullptr;
}

void BWindow::RemoveShortcut(uint32 key, uint32 modifiers) {
    mHost->WindowShortcuts().Remove(key, modifiers);
}

void BWindow::UpdateIfNeeded() {
    mHost->Update();
    mHost->Flush();
}

bool BWindow::NeedsUpdate() const {
    return mHost->NeedsUpdate();
}

void BWindow::BeginViewTransaction() {
    mHost->BeginTransaction();
}

void BWindow::EndViewTransaction() {
    mHost->EndTransaction();
}

bool BWindow::InViewTransaction() const {
    return mHost->InTransaction();
}

void BWindow::Flush() const {
    mHost->Flush();
}

void BWindow::Sync() const {
    mHost->Sync();
}

void BWindow::SetPulseRate(bigtime_t rate) {
    mHost->SetPulseRate(rate);
}

bigtime_t BWindow::PulseRate() const {
    return mHost->PulseRate();
}
