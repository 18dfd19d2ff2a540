#include <MenuItem.h>

#include "LooperHold.h"
#include "MenuLayout.h"

#include <Menu.h>
#include <MenuBar.h>
#include <Window.h>

namespace {

constexpr char kLabelField[] = "_label";
constexpr char kDisabledField[] = "_disable";
constexpr char kMarkedField[] = "_marked";
constexpr char kTriggerField[] = "_user_trig";
constexpr char kShortcutField[] = "_shortcut";
constexpr char kModifiersField[] = "_mods";
constexpr char kMessageField[] = "_msg";
constexpr char kSubmenuField[] = "_submenu";

} // namespace

REGISTER_ARCHIVABLE(BMenuItem);

BMenuItem::BMenuItem(const char* label, BMessage* message, char shortcut, uint32 modifiers)
    : BInvoker(message, BMessenger()), mLabel(label == nullptr ? "" : label), mShortcut(shortcut),
      mModifiers(shortcut == 0 ? 0 : modifiers | B_COMMAND_KEY) {}

BMenuItem::BMenuItem(BMenu* menu, BMessage* message) : BInvoker(message, BMessenger()) {
    SetSubmenu(menu);
}

BMenuItem::BMenuItem(BMessage* archive) : BArchivable(archive) {
    if (archive == nullptr) {
        return;
    }
    mLabel = archive->GetString(kLabelField, "");
    mEnabled = !archive->GetBool(kDisabledField, false);
    mMarked = archive->GetBool(kMarkedField, false);
    mTrigger = static_cast<char>(archive->GetInt32(kTriggerField, 0));
    mShortcut = static_cast<char>(archive->GetInt32(kShortcutField, 0));
    mModifiers = static_cast<uint32>(archive->GetInt32(kModifiersField, 0));
    BMessage message;
    if (archive->FindMessage(kMessageField, &message) == B_OK) {
        SetMessage(new BMessage(message));
    }
    BMessage submenuArchive;
    if (archive->FindMessage(kSubmenuField, &submenuArchive) == B_OK) {
        BArchivable* const object = instantiate_object(&submenuArchive);
        if (auto* const menu = dynamic_cast<BMenu*>(object); menu != nullptr) {
            const std::string label = mLabel;
            SetSubmenu(menu);
            mLabel = label;
        } else {
            delete object;
        }
    }
}

BMenuItem::~BMenuItem() {
    if (mSubmenu != nullptr) {
        mSubmenu->mSuperitem = nullptr;
    }
}

BArchivable* BMenuItem::Instantiate(BMessage* archive) {
    return validate_instantiation(archive, "BMenuItem") ? new BMenuItem(archive) : nullptr;
}

status_t BMenuItem::Archive(BMessage* archive, bool deep) const {
    status_t status = BArchivable::Archive(archive, deep);
    if (status == B_OK) {
        status = archive->AddString(kLabelField, mLabel.c_str());
    }
    if (status == B_OK && !mEnabled) {
        status = archive->AddBool(kDisabledField, true);
    }
    if (status == B_OK && mMarked) {
        status = archive->AddBool(kMarkedField, true);
    }
    if (status == B_OK && mTrigger != 0) {
        status = archive->AddInt32(kTriggerField, mTrigger);
    }
    if (status == B_OK && mShortcut != 0) {
        status = archive->AddInt32(kShortcutField, mShortcut);
    }
    if (status == B_OK && mShortcut != 0) {
        status = archive->AddInt32(kModifiersField, static_cast<int32>(mModifiers));
    }
    if (status == B_OK && Message() != nullptr) {
        status = archive->AddMessage(kMessageField, Message());
    }
    if (status == B_OK && deep && mSubmenu != nullptr) {
        BMessage submenuArchive;
        status = mSubmenu->Archive(&submenuArchive, true);
        if (status == B_OK) {
            status = archive->AddMessage(kSubmenuField, &submenuArchive);
        }
    }
    return status;
}

void BMenuItem::SetSubmenu(BMenu* menu) {
    if (menu == nullptr || menu->mSuperitem != nullptr) {
        return;
    }
    mSubmenu.reset(menu);
    menu->mSuperitem = this;
    const BMenuItem* const marked = menu->IsLabelFromMarked() ? menu->FindMarked() : nullptr;
    const char* const name = marked != nullptr ? marked->Label() : menu->Name();
    mLabel = name == nullptr ? "" : name;
}

void BMenuItem::SetLabel(const char* label) {
    const LooperHold hold(mMenu);
    mLabel = label == nullptr ? "" : label;
    SizeChanged();
}

void BMenuItem::SetEnabled(bool enabled) {
    const LooperHold hold(mMenu);
    if (enabled != mEnabled) {
        mEnabled = enabled;
        LooksChanged();
    }
}

void BMenuItem::SetMarked(bool marked) {
    const LooperHold hold(mMenu);
    mMarked = marked;
    LooksChanged();
    if (marked && mMenu != nullptr) {
        mMenu->ItemMarked(this);
    }
}

void BMenuItem::SetTrigger(char trigger) {
    const LooperHold hold(mMenu);
    mTrigger = trigger;
    SizeChanged();
}

void BMenuItem::SetShortcut(char shortcut, uint32 modifiers) {
    const LooperHold hold(mMenu);
    mShortcut = shortcut;
    mModifiers = shortcut == 0 ? 0 : modifiers | B_COMMAND_KEY;
    SizeChanged();
}

const char* BMenuItem::Label() const {
    return mLabel.c_str();
}

bool BMenuItem::IsEnabled() const {
    return mEnabled && (mSubmenu == nullptr || mSubmenu->mEnabled) &&
           (mMenu == nullptr || mMenu->IsEnabled());
}

bool BMenuItem::IsMarked() const {
    return mMarked;
}

char BMenuItem::Trigger() const {
    return mTrigger;
}

char BMenuItem::Shortcut(uint32* modifiers) const {
    if (modifiers != nullptr) {
        *modifiers = mModifiers;
    }
    return mShortcut;
}

BMenu* BMenuItem::Submenu() const {
    return mSubmenu.get();
}

BMenu* BMenuItem::Menu() const {
    return mMenu;
}

BRect BMenuItem::Frame() const {
    if (mMenu != nullptr) {
        mMenu->LayoutItems();
    }
    return mFrame;
}

bool BMenuItem::IsSelected() const {
    return mSelected;
}

BPoint BMenuItem::ContentLocation() const {
    const BRect frame = Frame();
    return mMenu == nullptr ? frame.LeftTop()
                            : BPoint(frame.left + mMenu->mMargins->left, frame.top + mMenu->mMargins->top);
}

status_t BMenuItem::Invoke(BMessage* message) {
    if (!IsEnabled()) {
        return B_NOT_ALLOWED;
    }
    if (mMenu != nullptr && mMenu->IsRadioMode()) {
        SetMarked(true);
    }
    const BMessage* const source = message != nullptr ? message : Message();
    if (source == nullptr) {
        return B_BAD_VALUE;
    }
    BMessage copy(*source);
    // The fields are this call's own, whatever the message brought along; "when" is BInvoker's.
    (void)copy.RemoveName("source");
    (void)copy.RemoveName("index");
    (void)copy.AddPointer("source", this);
    (void)copy.AddInt32("index", mMenu == nullptr ? -1 : mMenu->IndexOf(this));
    return BInvoker::Invoke(&copy);
}

void BMenuItem::SizeChanged() {
    if (mMenu != nullptr) {
        mMenu->InvalidateLayout();
    }
}

void BMenuItem::LooksChanged() {
    if (mMenu != nullptr) {
        mMenu->Invalidate(mFrame);
    }
}

void BMenuItem::Install(BMenuBar* bar) {
    mBar = bar;
    if (!Messenger().IsValid()) {
        mTargetsWindow = SetTarget(bar->Window()) == B_OK;
    }
    if (mSubmenu != nullptr) {
        mSubmenu->Install(bar);
    }
}

void BMenuItem::Uninstall() {
    if (mBar == nullptr) {
        return;
    }
    mBar->ItemLeaves(this);
    if (mTargetsWindow && Target() == mBar->Window()) {
        SetTarget(BMessenger());
    }
    mTargetsWindow = false;
    mBar = nullptr;
    if (mSubmenu != nullptr) {
        mSubmenu->Uninstall();
    }
}

void BMenuItem::Select(bool selected) {
    if (selected != mSelected) {
        mSelected = selected;
        Highlight(selected);
    }
}
