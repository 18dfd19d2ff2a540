#include "MenuWindow.h"

#include "MenuPaneView.h"
#include "PopUpHost.h"
#include "host/api/display.h"

#include <Menu.h>
#include <Screen.h>

#include <algorithm>
#include <string_view>

namespace {

BPoint LivePointer() {
    const host::PointerPosition pointer = host::live_input().on_screen;
    return {static_cast<float>(pointer.x), static_cast<float>(pointer.y)};
}

} // namespace

MenuWindow::MenuWindow(BMenu* menu, const MenuPane& pane, std::shared_ptr<MenuEvents> events)
    : BWindow(pane.Frame(), menu->Name(), B_NO_BORDER_WINDOW_LOOK, kPopUpWindowFeel,
              B_AVOID_FOCUS | B_NOT_RESIZABLE),
      mMenu(menu), mPaneView(new MenuPaneView(menu, pane)), mEvents(std::move(events)) {
    AddChild(mPaneView);
}

void MenuWindow::PaneChanged(const MenuPane& pane) {
    if (Lock()) {
        if (pane.Frame() != Frame()) {
            MoveTo(pane.Frame().LeftTop());
            ResizeTo(pane.Frame().Width(), pane.Frame().Height());
            mPaneView->Invalidate();
        }
        mPaneView->SetPane(pane);
        Unlock();
    }
}

void MenuWindow::MenuChanged() {
    MenuEvent changed;
    changed.kind = MenuEvent::Kind::LayoutChanged;
    mEvents->Post(std::move(changed));
}

void MenuWindow::GiveMenuBack() {
    if (Lock()) {
        mPaneView->ReleaseMenu();
        Quit();
    }
}

void MenuWindow::DispatchMessage(BMessage* message, BHandler* handler) {
    switch (message->what) {
    case B_MOUSE_MOVED:
        PassPointer(MenuEvent::Kind::Moved, *message);
        break;
    case B_MOUSE_DOWN:
        PassPointer(MenuEvent::Kind::Pressed, *message);
        break;
    case B_MOUSE_UP:
        PassPointer(MenuEvent::Kind::Released, *message);
        break;
    case B_MOUSE_WHEEL_CHANGED:
        mEvents->Post({MenuEvent::Kind::Wheel,
                       mPointer,
                       message->GetFloat("be:wheel_delta_y", 0),
                       {},
                       message->GetInt64("when", system_time())});
        break;
    case kOutsidePopUps:
        PassOutside(*message);
        break;
    case kPopUpsDismissed:
        mEvents->Post({});
        break;
    case B_KEY_DOWN:
        PassKey(*message);
        break;
    case B_MODIFIERS_CHANGED:
        FollowAltKey(*message);
        break;
    default:
        BWindow::DispatchMessage(message, handler);
    }
}

void MenuWindow::PassPointer(MenuEvent::Kind kind, const BMessage& message) {
    if (message.FindPoint("screen_where", &mPointer) == B_OK) {
        mEvents->Post({kind, mPointer, 0, {}, message.GetInt64("when", system_time())});
    }
}

void MenuWindow::PassOutside(const BMessage& message) {
    switch (static_cast<uint32>(message.GetInt32("kind", 0))) {
    case B_MOUSE_MOVED:
        PassPointer(MenuEvent::Kind::Moved, message);
        break;
    case B_MOUSE_DOWN:
        PassPointer(MenuEvent::Kind::Pressed, message);
        break;
    case B_MOUSE_UP:
        PassPointer(MenuEvent::Kind::Released, message);
        break;
    }
}

void MenuWindow::PassKey(const BMessage& message) {
    mAltAlone = false;
    const char* bytes = nullptr;
    // Keys with Control are shortcuts, which mean nothing while a menu is open.
    if ((message.GetInt32("modifiers", 0) & B_COMMAND_KEY) == 0 &&
        message.FindString("bytes", &bytes) == B_OK) {
        mEvents->Post({MenuEvent::Kind::Key, mPointer, 0, bytes, message.GetInt64("when", system_time())});
    }
}

// Alt alone leaves menus, as it leads to them; together with a letter it does not.
void MenuWindow::FollowAltKey(const BMessage& message) {
    const bool held = (message.GetInt32("modifiers", 0) & B_OPTION_KEY) != 0;
    if (!held && mAltAlone) {
        mEvents->Post({});
    }
    mAltAlone = held;
}

MenuWindows::MenuWindows(std::shared_ptr<MenuEvents> events) : mEvents(std::move(events)) {}

MenuWindows::~MenuWindows() {
    while (!mShown.empty()) {
        Hide(mShown.back().first);
    }
}

BRect MenuWindows::Screen(BPoint where) {
    BScreen screen;
    const BRect main = screen.Frame();
    do {
        if (screen.Frame().Contains(where)) {
            return screen.Frame();
        }
    } while (screen.SetToNext() == B_OK);
    return main;
}

bool MenuWindows::Show(BMenu* menu, const MenuPane& pane) {
    if (!host::display_connected() || menu->Host() != nullptr) {
        return false;
    }
    auto* const window = new MenuWindow(menu, pane, mEvents);
    mShown.emplace_back(menu, window);
    window->Show();
    return true;
}

void MenuWindows::PaneChanged(BMenu* menu, const MenuPane& pane) {
    for (const auto& [shown, window] : mShown) {
        if (shown == menu) {
            window->PaneChanged(pane);
        }
    }
}

void MenuWindows::MakingUp(BRect item) {
    mMadeUpItem = item;
    mPointerBefore = LivePointer();
}

bool MenuWindows::UserLeaves() {
    const BPoint pointer = LivePointer();
    const bool wentAway = pointer != mPointerBefore && !mMadeUpItem.Contains(pointer);
    return wentAway || mEvents->Any([this](const MenuEvent& event) {
        switch (event.kind) {
        case MenuEvent::Kind::Dismissed:
            return true;
        case MenuEvent::Kind::Key:
            return event.bytes == std::string_view("\x1b");
        case MenuEvent::Kind::Pressed:
            return !mMadeUpItem.Contains(event.where);
        default:
            return false;
        }
    });
}

void MenuWindows::Hide(BMenu* menu) {
    const auto found =
        std::find_if(mShown.begin(), mShown.end(), [menu](const auto& shown) { return shown.first == menu; });
    if (found != mShown.end()) {
        MenuWindow* const window = found->second;
        mShown.erase(found);
        window->GiveMenuBack();
    }
}
