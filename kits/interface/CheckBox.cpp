#include <CheckBox.h>

#include "ControlLook.h"

#include <algorithm>
#include <cmath>

namespace {

constexpr float kMarkSize = 13; // pixels
constexpr float kLabelLeft = kMarkSize + 5;

} // namespace

REGISTER_ARCHIVABLE(BCheckBox);

BCheckBox::BCheckBox(BRect frame, const char* name, const char* label, BMessage* message, uint32 resizingMode,
                     uint32 flags)
    : BControl(frame, name, label, message, resizingMode, flags) {}

BCheckBox::BCheckBox(BMessage* archive) : BControl(archive) {}

BCheckBox::~BCheckBox() = default;

BArchivable* BCheckBox::Instantiate(BMessage* archive) {
    return validate_instantiation(archive, "BCheckBox") ? new BCheckBox(archive) : nullptr;
}

BRect BCheckBox::MarkSquare() const {
    const float top = std::floor((Bounds().top + Bounds().bottom + 1 - kMarkSize) / 2);
    return {Bounds().left + 1, top, Bounds().left + kMarkSize, top + kMarkSize - 1};
}

void BCheckBox::Draw(BRect /*updateRect*/) {
    DrawMark(MarkSquare(), mPressed);
    const ControlState state{.enabled = IsEnabled(), .focused = ShowsFocus()};
    BFont font;
    GetFont(&font);
    BRect label = Bounds();
    label.left += kLabelLeft;
    label.right -= 2;
    ControlLook look(this);
    look.Label(Label(), label, B_ALIGN_LEFT, state);
    if (state.focused) {
        const float y = ControlLook::Baseline(font, label) + 2;
        const float width = Label() == nullptr ? 0.0F : std::ceil(font.StringWidth(Label()));
        look.Fill(BRect(label.left, y, std::min(label.left + width, label.right), y), ControlLook::kFocus);
    }
}

void BCheckBox::DrawMark(BRect square, bool pressed) {
    const ControlState state{.enabled = IsEnabled(), .pressed = pressed};
    ControlLook look(this);
    const BRect inside = look.FieldFrame(square, state);
    const rgb_color page = IsEnabled() ? ControlLook::kDocument : ControlLook::kDisabledDocument;
    look.Fill(inside, pressed ? ControlLook::kPressedPanel : page);
    if (Value() != B_CONTROL_OFF) {
        look.CheckMark(inside, state);
    }
}

int32 BCheckBox::NextValue() const {
    return Value() == B_CONTROL_OFF ? B_CONTROL_ON : B_CONTROL_OFF;
}

void BCheckBox::MouseDown(BPoint /*where*/) {
    if (!IsEnabled()) {
        return;
    }
    SetTracking(true);
    mPressed = true;
    Invalidate();
    // A host without a pointer never sends the events, and never a press either.
    (void)SetMouseEventMask(B_POINTER_EVENTS, B_LOCK_WINDOW_FOCUS);
}

void BCheckBox::MouseMoved(BPoint where, uint32 code, const BMessage* dragMessage) {
    if (IsTracking() && Bounds().Contains(where) != mPressed) {
        mPressed = !mPressed;
        Invalidate();
    }
    BControl::MouseMoved(where, code, dragMessage);
}

void BCheckBox::MouseUp(BPoint where) {
    const bool switches = IsTracking() && IsEnabled() && Bounds().Contains(where);
    if (mPressed) {
        mPressed = false;
        Invalidate();
    }
    BControl::MouseUp(where);
    if (switches) {
        SetValue(NextValue());
        Invoke();
    }
}

void BCheckBox::GetPreferredSize(float* width, float* height) {
    BFont font;
    GetFont(&font);
    const float label = Label() == nullptr ? 0.0F : std::ceil(font.StringWidth(Label()));
    *width = kLabelLeft + label + 2;
    *height = std::max(kMarkSize, ControlLook::LineHeight(font)) + 3;
}
