#include <MenuBar.h>

#include "MenuLayout.h"
#include "MenuSession.h"
#include "MenuTriggers.h"

#include <MenuItem.h>
#include <MessageFilter.h>
#include <Window.h>

#include <algorithm>
#include <utility>

namespace {

constexpr char kBorderField[] = "_border";

constexpr MenuMargins kTitleMargins = {8, 2, 8, 2};

// The item of that shortcut in the menu or below it, or null.
BMenuItem* FindByShortcut(const BMenu& menu, uint32 key, uint32 wantedModifiers) {
    for (int32 i = 0; i < menu.CountItems(); ++i) {
        BMenuItem* const item = menu.ItemAt(i);
        uint32 modifiers = 0;
        const char shortcut = trigger_letter(item->Shortcut(&modifiers));
        constexpr uint32 kOthers = B_SHIFT_KEY | B_OPTION_KEY;
        if (shortcut != 0 &&
            static_cast<uint8>(shortcut) == static_cast<uint8>(trigger_letter(static_cast<char>(key))) &&
            (modifiers & kOthers) == (wantedModifiers & kOthers)) {
            return item;
        }
        if (item->Submenu() != nullptr) {
            if (BMenuItem* const found = FindByShortcut(*item->Submenu(), key, wantedModifiers);
                found != nullptr) {
                return found;
            }
        }
    }
    return nullptr;
}

} // namespace

// While the bar is in use but no menu is open, keys still come to the window, and so do presses of the mouse.
class BMenuBar::InputFilter : public BMessageFilter {
  public:
    explicit InputFilter(BMenuBar& bar) : BMessageFilter(B_ANY_DELIVERY, B_ANY_SOURCE), mBar(bar) {}

    filter_result Filter(BMessage* message, BHandler** /*target*/) override {
        if (mBar.mSession == nullptr) {
            return B_DISPATCH_MESSAGE;
        }
        switch (message->what) {
        case B_KEY_DOWN:
            return TakesKey(*message) ? B_SKIP_MESSAGE : B_DISPATCH_MESSAGE;
        case B_MOUSE_DOWN: {
            BPoint where;
            const bool onBar = message->FindPoint("screen_where", &where) == B_OK &&
                               mBar.Bounds().Contains(mBar.ConvertFromScreen(where));
            if (!onBar) {
                mBar.mSession->Events()->Post({});
            }
            return B_DISPATCH_MESSAGE;
        }
        default:
            return B_DISPATCH_MESSAGE;
        }
    }

  private:
    bool TakesKey(const BMessage& message) {
        const char* const bytes = message.GetString("bytes", "");
        const int32 modifiers = message.GetInt32("modifiers", 0);
        if ((modifiers & B_COMMAND_KEY) != 0) {
            // A shortcut: the bar's use ends, and the window carries it out.
            mBar.mSession->Events()->Post({});
            return false;
        }
        if ((modifiers & B_OPTION_KEY) != 0 || *bytes == B_FUNCTION_KEY) {
            return false;
        }
        mBar.mSession->Events()->Post(
            {MenuEvent::Kind::Key, B_ORIGIN, 0, bytes, message.GetInt64("when", system_time())});
        return true;
    }

    BMenuBar& mBar;
};

REGISTER_ARCHIVABLE(BMenuBar);

BMenuBar::BMenuBar(BRect frame, const char* name, uint32 resizingMode, menu_layout layout, bool resizeToFit)
    : BMenu(frame, name, resizingMode, B_WILL_DRAW | B_FRAME_EVENTS | B_FULL_UPDATE_ON_RESIZE, layout,
            resizeToFit) {
    *mMargins = kTitleMargins;
}

BMenuBar::BMenuBar(BMessage* archive) : BMenu(archive) {
    *mMargins = kTitleMargins;
    if (archive != nullptr) {
        mBorder = static_cast<menu_bar_border>(std::clamp<int32>(
            archive->GetInt32(kBorderField, B_BORDER_FRAME), B_BORDER_FRAME, B_BORDER_EACH_ITEM));
    }
}

BMenuBar::~BMenuBar() {
    // While the bar still is one: views that are taken out later hear of it as plain menus.
    RemoveSelf();
}

BArchivable* BMenuBar::Instantiate(BMessage* archive) {
    return validate_instantiation(archive, "BMenuBar") ? new BMenuBar(archive) : nullptr;
}

status_t BMenuBar::Archive(BMessage* archive, bool deep) const {
    const status_t status = BMenu::Archive(archive, deep);
    return status == B_OK && mBorder != B_BORDER_FRAME ? archive->AddInt32(kBorderField, mBorder) : status;
}

void BMenuBar::AttachedToWindow() {
    BWindow* const window = Window();
    if (window != nullptr) {
        Install(this);
        mFilter = std::make_unique<InputFilter>(*this);
        window->AddCommonFilter(mFilter.get());
        if (window->KeyMenuBar() == nullptr) {
            window->SetKeyMenuBar(this);
        }
    }
    BMenu::AttachedToWindow();
    if (mResizeToFit) {
        ResizeToPreferred();
    }
}

void BMenuBar::DetachedFromWindow() {
    AbandonSession();
    if (BWindow* const window = Window(); window != nullptr) {
        // A window that is going away has let go of it already.
        if (window->Host() != nullptr && window->KeyMenuBar() == this) {
            window->SetKeyMenuBar(nullptr);
        }
        window->RemoveCommonFilter(mFilter.get());
        mFilter.reset();
        Uninstall();
    }
    BMenu::DetachedFromWindow();
}

void BMenuBar::Show() {
    BView::Show();
}

void BMenuBar::Hide() {
    AbandonSession();
    BView::Hide();
}

void BMenuBar::MessageReceived(BMessage* message) {
    if (message->what == MenuBarSession::kOver) {
        SessionOver();
    } else {
        BMenu::MessageReceived(message);
    }
}

void BMenuBar::MouseDown(BPoint where) {
    const BPoint onScreen = ConvertToScreen(where);
    if (mSession != nullptr) {
        mSession->Events()->Post({MenuEvent::Kind::Pressed, onScreen, 0, {}, system_time()});
        return;
    }
    LayoutItems();
    BMenuItem* const title = ItemUnder(where);
    if (title != nullptr && title->IsEnabled()) {
        StartByMouse(title, onScreen);
    }
}

// Until the first menu is on the screen, the pointer still belongs to the window.
void BMenuBar::MouseUp(BPoint where) {
    if (mSession != nullptr) {
        mSession->Events()->Post({MenuEvent::Kind::Released, ConvertToScreen(where), 0, {}, system_time()});
    }
}

void BMenuBar::MouseMoved(BPoint where, uint32 /*code*/, const BMessage* /*dragMessage*/) {
    if (mSession != nullptr) {
        mSession->Events()->Post({MenuEvent::Kind::Moved, ConvertToScreen(where), 0, {}, system_time()});
    }
}

void BMenuBar::WindowActivated(bool active) {
    if (!active && mSession != nullptr) {
        mSession->Events()->Post({});
    }
    BMenu::WindowActivated(active);
}

BMenuItem* BMenuBar::FirstTitle() const {
    for (int32 i = 0; i < CountItems(); ++i) {
        if (ItemAt(i)->IsEnabled()) {
            return ItemAt(i);
        }
    }
    return nullptr;
}

void BMenuBar::OpenByKey() {
    if (mSession != nullptr) {
        mSession->Events()->Post({});
    } else if (BMenuItem* const title = FirstTitle(); title != nullptr && !IsHidden()) {
        StartByKey(title, false);
    }
}

bool BMenuBar::OpenByCharacter(const char* bytes, int32 count) {
    if (count != 1 || IsHidden()) {
        return false;
    }
    LayoutItems();
    const char letter = trigger_letter(*bytes);
    for (int32 i = 0; i < CountItems(); ++i) {
        BMenuItem* const title = ItemAt(i);
        if (letter == 0 || title->mChosenTrigger != letter || !title->IsEnabled()) {
            continue;
        }
        if (mSession != nullptr) {
            mSession->Events()->Post({MenuEvent::Kind::Key, B_ORIGIN, 0, bytes, system_time()});
        } else {
            StartByKey(title, true);
        }
        return true;
    }
    return false;
}

bool BMenuBar::InvokeShortcut(uint32 key, uint32 modifiers) {
    if (FindByShortcut(*this, key, modifiers) == nullptr) {
        return false;
    }
    // The program enables its items as it would before the menu is shown.
    Window()->MenusBeginning();
    if (BMenuItem* const item = FindByShortcut(*this, key, modifiers); item != nullptr) {
        item->Invoke();
    }
    Window()->MenusEnded();
    return true;
}

std::shared_ptr<MenuBarSession> BMenuBar::NewSession() {
    Window()->MenusBeginning();
    return std::make_shared<MenuBarSession>(this);
}

void BMenuBar::StartByMouse(BMenuItem* title, BPoint where) {
    // So that moves and the release come here from anywhere until a menu is open.
    (void)SetMouseEventMask(B_POINTER_EVENTS, 0);
    const std::shared_ptr<MenuBarSession> session = NewSession();
    session->Tracker().BeginOnPressedTitle(ConvertToScreen(Bounds()), title, where, system_time());
    FollowSession(session);
}

void BMenuBar::StartByKey(BMenuItem* title, bool open) {
    const std::shared_ptr<MenuBarSession> session = NewSession();
    session->Tracker().BeginOnTitleByKey(ConvertToScreen(Bounds()), title,
                                         open ? MenuTracker::TitleMenu::Opens
                                              : MenuTracker::TitleMenu::StaysClosed);
    FollowSession(session);
}

void BMenuBar::FollowSession(const std::shared_ptr<MenuBarSession>& session) {
    if (MenuBarSession::Follow(session) == B_OK) {
        mSession = session;
    } else {
        session->Abandon();
        Window()->MenusEnded();
    }
}

void BMenuBar::SessionOver() {
    if (mSession == nullptr || !mSession->IsOver()) {
        return;
    }
    const std::shared_ptr<MenuBarSession> session = mSession;
    // The hook may change the menus; an item that it removes is chosen no longer.
    Window()->MenusEnded();
    mSession = nullptr;
    if (BMenuItem* const chosen = session->Tracker().Chosen(); chosen != nullptr) {
        chosen->Invoke();
    }
}

void BMenuBar::AbandonSession() {
    if (const std::shared_ptr<MenuBarSession> session = std::exchange(mSession, nullptr);
        session != nullptr) {
        session->Abandon();
        Window()->MenusEnded();
    }
}

void BMenuBar::ItemLeaves(BMenuItem* item) {
    if (mSession != nullptr) {
        mSession->Tracker().ItemLeaves(item);
        if (mSession->IsOver()) {
            // Its thread waits for something to happen.
            mSession->Events()->Post({});
        }
    }
}
