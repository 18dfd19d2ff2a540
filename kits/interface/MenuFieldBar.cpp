#include "MenuFieldBar.h"

#include "ControlLook.h"

#include <MenuField.h>
#include <Window.h>

namespace {

constexpr float kArrowWidth = 14;
constexpr float kTextInset = 7;

} // namespace

MenuFieldBar::MenuFieldBar(BRect frame, BMenuField* field)
    : BMenuBar(frame, "_mc_mb_", B_FOLLOW_NONE, B_ITEMS_IN_ROW, false), mField(field) {
    SetItemMargins(0, 0, 0, 0);
    SetViewColor(ControlLook::kPanel);
    SetLowColor(ControlLook::kPanel);
}

void MenuFieldBar::AttachedToWindow() {
    BMenuBar* const before = Window() != nullptr ? Window()->KeyMenuBar() : nullptr;
    BMenuBar::AttachedToWindow();
    if (Window() != nullptr && before == nullptr) {
        Window()->SetKeyMenuBar(nullptr);
    }
}

void MenuFieldBar::MouseDown(BPoint where) {
    if (mField->IsEnabled() && !mField->IsFocus() && (mField->Flags() & B_NAVIGABLE) != 0) {
        mField->MakeFocus();
    }
    BMenuBar::MouseDown(where);
}

MenuFieldItem::MenuFieldItem(BMenu* menu, BMenuField* field) : BMenuItem(menu), mField(field) {}

void MenuFieldItem::GetContentSize(float* width, float* height) {
    const BRect bounds = Menu() != nullptr ? Menu()->Bounds() : BRect(0, 0, 0, 0);
    *width = bounds.Width();
    *height = bounds.Height();
}

void MenuFieldItem::Draw() {
    BMenu* const bar = Menu();
    if (bar == nullptr) {
        return;
    }
    const ControlState state{
        .enabled = mField->IsEnabled(), .focused = mField->ShowsFocus(), .pressed = IsSelected()};
    const BRect bounds = bar->Bounds();
    ControlLook look(bar);
    look.ButtonFrame(bounds, state);
    BRect text = bounds.InsetByCopy(kTextInset, 0);
    if (mField->mMarkerShown) {
        text.right -= kArrowWidth;
        look.Arrow(BRect(text.right + 2, bounds.top, bounds.right - ControlLook::kButtonFrameWidth - 2,
                         bounds.bottom),
                   ControlLook::Direction::Down, state);
    }
    look.Label(Label(), text, B_ALIGN_LEFT, state);
}
