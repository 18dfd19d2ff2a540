// The part of WindowHost that deals with the focus and with keys.
#include "WindowHost.h"

#include "FocusOrder.h"
#include "PopUpHost.h"

#include <Application.h>
#include <View.h>

#include <algorithm>

namespace {

// The commands that every window's focus understands by these keys.
uint32 CommandOf(uint32 key) {
    switch (key) {
    case 'X':
        return B_CUT;
    case 'C':
        return B_COPY;
    case 'V':
        return B_PASTE;
    case 'A':
        return B_SELECT_ALL;
    case 'Z':
        return B_UNDO;
    default:
        return 0;
    }
}

} // namespace

void WindowHost::SetFocus(BView* view, bool focus) {
    if (focus == (mFocus == view)) {
        return;
    }
    if (focus && mFocus != nullptr) {
        // The hook, so that the old one can show it.
        mFocus->MakeFocus(false);
    }
    mFocus = focus ? view : nullptr;
    mWindow.SetPreferredHandler(mFocus);
    mCaret = BRect();
    RefreshTextInput();
}

void WindowHost::RefreshTextInput() {
    const bool wanted = mFocus != nullptr && (mFocus->Flags() & B_INPUT_METHOD_AWARE) != 0;
    host::Area caret;
    if (wanted && mCaret.IsValid()) {
        const BPoint place = mFocus->ConvertToSurface(mCaret.LeftTop());
        caret = {static_cast<int>(place.x), static_cast<int>(place.y), static_cast<int>(mCaret.Width()) + 1,
                 static_cast<int>(mCaret.Height()) + 1};
    }
    mPeer->set_text_input(wanted, caret);
}

void WindowHost::SetTextCaret(BView* view, BRect caret) {
    if (view == mFocus && caret != mCaret) {
        mCaret = caret;
        RefreshTextInput();
    }
}

void WindowHost::SetKeyMenuBar(BMenuBar* bar, BView* view, KeyMenuTarget* target) {
    mKeyMenuBar = bar;
    mKeyMenuView = view;
    mKeyMenuTarget = target;
}

bool WindowHost::MoveFocus(bool groups, bool backward) {
    if (mRoot == nullptr) {
        return false;
    }
    const FocusDirection direction = backward ? FocusDirection::backward : FocusDirection::forward;
    BView* const next =
        groups ? NextFocusGroup(*mRoot, mFocus, direction) : NextFocus(*mRoot, mFocus, direction);
    if (next == nullptr) {
        return false;
    }
    if (next != mFocus) {
        next->MakeFocus(true);
    }
    return true;
}

bool WindowHost::UnusedKey(BView* /*view*/, const char* bytes, int32 numBytes) {
    if (numBytes != 1 || bytes[0] != B_TAB || mTraits.IsPopUp()) {
        return false;
    }
    const BMessage* const message = mWindow.CurrentMessage();
    const bool backward = message != nullptr && (message->GetInt32("modifiers", 0) & B_SHIFT_KEY) != 0;
    return MoveFocus(false, backward);
}

bool WindowHost::HandleKey(const BMessage& message) {
    mAltAlone = false;
    if (mTraits.IsPopUp()) {
        return false;
    }
    const auto modifiers = static_cast<uint32>(message.GetInt32("modifiers", 0));
    const auto key = static_cast<uint32>(message.GetInt32("raw_char", 0));
    if ((modifiers & B_COMMAND_KEY) != 0) {
        if (key == B_TAB) {
            return MoveFocus(true, (modifiers & B_SHIFT_KEY) != 0);
        }
        return key != 0 && InvokeShortcut(Shortcuts::PlainKey(key), Shortcuts::PlainModifiers(modifiers));
    }
    if (mKeyMenuTarget == nullptr) {
        return false;
    }
    if (key == B_FUNCTION_KEY && message.GetInt32("key", 0) == B_F10_KEY) {
        mKeyMenuTarget->OpenByKey();
        return true;
    }
    if ((modifiers & B_OPTION_KEY) != 0) {
        const char* const bytes = message.GetString("bytes", "");
        const BString text(bytes);
        return text.Length() > 0 && mKeyMenuTarget->OpenByCharacter(bytes, text.Length());
    }
    return false;
}

bool WindowHost::InvokeShortcut(uint32 key, uint32 modifiers) {
    const Shortcuts::Shortcut* const shortcut = mShortcuts.Find(key, modifiers);
    if (shortcut != nullptr) {
        if (shortcut->message != nullptr) {
            BHandler* target = &mWindow;
            if (shortcut->target == Shortcuts::Target::focus && mFocus != nullptr) {
                target = mFocus;
            } else if (shortcut->target == Shortcuts::Target::handler) {
                // May have left the window since.
                target = mWindow.IndexOf(shortcut->handler) >= 0 ? shortcut->handler : nullptr;
            }
            if (target != nullptr) {
                mWindow.PostMessage(shortcut->message.get(), target);
            }
        }
        return true;
    }
    return (mKeyMenuTarget != nullptr && mKeyMenuTarget->InvokeShortcut(key, modifiers)) ||
           InvokeUsualShortcut(key, modifiers);
}

bool WindowHost::InvokeUsualShortcut(uint32 key, uint32 modifiers) {
    if (modifiers != B_COMMAND_KEY) {
        return false;
    }
    if (key == 'W') {
        if ((mTraits.flags & B_NOT_CLOSABLE) == 0) {
            mWindow.PostMessage(B_QUIT_REQUESTED);
        }
        return true;
    }
    if (key == 'Q') {
        if (be_app != nullptr) {
            be_app->PostMessage(B_QUIT_REQUESTED);
        }
        return true;
    }
    if (const uint32 command = CommandOf(key); command != 0 && mFocus != nullptr) {
        mWindow.PostMessage(command, mFocus);
        return true;
    }
    return false;
}

void WindowHost::ModifiersChanged(const BMessage& message) {
    if (!message.GetBool("be:option_key", false)) {
        mAltAlone = false;
        return;
    }
    if (message.GetBool("be:pressed", false)) {
        mAltAlone = message.GetInt32("modifiers", 0) == B_OPTION_KEY;
        return;
    }
    if (mAltAlone && mKeyMenuTarget != nullptr && !mTraits.IsPopUp()) {
        mAltAlone = false;
        mKeyMenuTarget->OpenByKey();
    }
}

namespace {

// Hooks may take views away, so children are walked by index.
void TellActivation(BView& view, bool active) {
    for (int32 i = 0; i < view.CountChildren(); ++i) {
        BView* const child = view.ChildAt(i);
        child->WindowActivated(active);
        if (view.ChildAt(i) == child) {
            TellActivation(*child, active);
        }
    }
}

} // namespace

void WindowHost::Activated(bool active) {
    mActive = active;
    mAltAlone = false;
    mWindow.WindowActivated(active);
    if (mRoot != nullptr) {
        TellActivation(*mRoot, active);
    }
}
