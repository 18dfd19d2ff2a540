// The part of BMenuItem that measures and draws; and BSeparatorItem, which does little else.
#include <MenuItem.h>

#include "ControlLook.h"
#include "MenuLayout.h"
#include "MenuTriggers.h"

#include <Menu.h>
#include <String.h>

#include <cmath>
#include <cstring>

namespace {

constexpr float kArrowWidth = 12;
constexpr float kMarkWidth = 12;
constexpr float kSeparatorHeight = 4;
constexpr float kSeparatorInset = 2;

BFont FontOf(const BMenu& menu) {
    BFont font;
    menu.GetFont(&font);
    return font;
}

} // namespace

REGISTER_ARCHIVABLE(BSeparatorItem);

void BMenuItem::GetContentSize(float* width, float* height) {
    const BFont font = mMenu == nullptr ? BFont() : FontOf(*mMenu);
    if (width != nullptr) {
        *width = std::ceil(font.StringWidth(mLabel.c_str()));
    }
    if (height != nullptr) {
        *height = ControlLook::LineHeight(font);
    }
}

void BMenuItem::TruncateLabel(float maxWidth, char* newLabel) {
    BString text(mLabel.c_str());
    const BFont font = mMenu == nullptr ? BFont() : FontOf(*mMenu);
    font.TruncateString(&text, B_TRUNCATE_MIDDLE, maxWidth);
    std::memcpy(newLabel, text.String(), static_cast<size_t>(text.Length()) + 1);
}

void BMenuItem::DrawContent() {
    if (mMenu == nullptr) {
        return;
    }
    font_height height;
    mMenu->GetFontHeight(&height);
    mMenu->MovePenBy(0, std::ceil(height.ascent));
    const float limit = mMenu->MaxContentWidth();
    if (limit > 0 && mMenu->StringWidth(mLabel.c_str()) > limit) {
        // As long as the label, an ellipsis more, and the terminator.
        std::string shown(mLabel.size() + 4, '\0');
        TruncateLabel(limit, shown.data());
        mMenu->DrawString(shown.c_str());
    } else {
        mMenu->DrawString(mLabel.c_str());
    }
}

void BMenuItem::Draw() {
    if (mMenu == nullptr) {
        return;
    }
    ControlState state;
    state.enabled = IsEnabled();
    // Hooks of other classes leave the drawing state as they like.
    mMenu->PushState();
    rgb_color ground = mMenu->ViewColor();
    if (mSelected) {
        ground = ControlLook::kSelectedMenuItem;
        ControlLook(mMenu).Fill(mFrame, ground);
    }
    mMenu->SetLowColor(ground);
    mMenu->SetHighColor(ControlLook::TextColor(state));
    mMenu->SetDrawingMode(B_OP_OVER);
    mMenu->MovePenTo(ContentLocation());
    DrawContent();
    mMenu->SetDrawingMode(B_OP_COPY);
    mMenu->SetHighColor(ControlLook::TextColor(state));
    DrawTriggerLine();
    DrawSigns();
    mMenu->PopState();
}

void BMenuItem::Highlight(bool /*on*/) {
    LooksChanged();
}

std::string BMenuItem::ShortcutText() const {
    return mShortcut == 0 ? std::string() : shortcut_text(mShortcut, mModifiers);
}

// The mark to the left of the content; shortcut and arrow to its right, in menus whose items lie in a column.
void BMenuItem::DrawSigns() {
    ControlState state;
    state.enabled = IsEnabled();
    ControlLook look(mMenu);
    if (mMarked && mMenu->mMargins->left >= kMarkWidth) {
        look.CheckMark(BRect(mFrame.left + 1, mFrame.top, mFrame.left + kMarkWidth, mFrame.bottom), state);
    }
    if (mMenu->Layout() != B_ITEMS_IN_COLUMN) {
        return;
    }
    if (mSubmenu != nullptr) {
        look.Arrow(BRect(mFrame.right - kArrowWidth - 1, mFrame.top, mFrame.right - 2, mFrame.bottom),
                   ControlLook::Direction::Right, state);
    }
    if (mShortcut != 0) {
        look.Label(ShortcutText().c_str(),
                   BRect(mMenu->mShortcutLeft, mFrame.top + mMenu->mMargins->top, mFrame.right,
                         mFrame.bottom - mMenu->mMargins->bottom),
                   B_ALIGN_LEFT, state);
    }
}

void BMenuItem::DrawTriggerLine() {
    if (!mMenu->mTriggersShown || mTriggerPosition < 0) {
        return;
    }
    font_height height;
    mMenu->GetFontHeight(&height);
    const BPoint content = ContentLocation();
    const float y = content.y + std::ceil(height.ascent) + 1;
    const float left = content.x + mMenu->StringWidth(mLabel.c_str(), mTriggerPosition);
    const float right = content.x + mMenu->StringWidth(mLabel.c_str(), mTriggerPosition + 1);
    mMenu->StrokeLine(BPoint(std::round(left), y), BPoint(std::round(right) - 1, y));
}

BSeparatorItem::BSeparatorItem() : BMenuItem("", nullptr) {
    BMenuItem::SetEnabled(false);
}

BSeparatorItem::BSeparatorItem(BMessage* archive) : BMenuItem(archive) {
    BMenuItem::SetEnabled(false);
}

BSeparatorItem::~BSeparatorItem() = default;

BArchivable* BSeparatorItem::Instantiate(BMessage* archive) {
    return validate_instantiation(archive, "BSeparatorItem") ? new BSeparatorItem(archive) : nullptr;
}

status_t BSeparatorItem::Archive(BMessage* archive, bool deep) const {
    return BMenuItem::Archive(archive, deep);
}

void BSeparatorItem::SetEnabled(bool /*enabled*/) {}

void BSeparatorItem::GetContentSize(float* width, float* height) {
    if (width != nullptr) {
        *width = 2;
    }
    if (height != nullptr) {
        *height = kSeparatorHeight;
    }
}

void BSeparatorItem::Draw() {
    BMenu* const menu = Menu();
    if (menu == nullptr) {
        return;
    }
    const BRect frame = Frame();
    ControlLook look(menu);
    if (menu->Layout() == B_ITEMS_IN_ROW) {
        const float x = std::floor((frame.left + frame.right) / 2);
        look.Fill(BRect(x, frame.top + kSeparatorInset, x, frame.bottom - kSeparatorInset),
                  ControlLook::kShadow);
        look.Fill(BRect(x + 1, frame.top + kSeparatorInset, x + 1, frame.bottom - kSeparatorInset),
                  ControlLook::kShine);
    } else {
        look.Separator(frame.left + kSeparatorInset, frame.right - kSeparatorInset,
                       std::floor((frame.top + frame.bottom) / 2));
    }
}
