#include <Button.h>

#include "ControlLook.h"

#include <Window.h>

#include <algorithm>
#include <cmath>

namespace {

constexpr char kDefaultField[] = "_default";

constexpr float kLeastWidth = 75;
constexpr float kLabelMargin = 8;
constexpr float kLabelHeadroom = 2;

} // namespace

REGISTER_ARCHIVABLE(BButton);

BButton::BButton(BRect frame, const char* name, const char* label, BMessage* message, uint32 resizingMode,
                 uint32 flags)
    : BControl(frame, name, label, message, resizingMode, flags) {}

BButton::BButton(BMessage* archive) : BControl(archive) {
    bool isDefault = false;
    if (archive != nullptr && archive->FindBool(kDefaultField, &isDefault) == B_OK) {
        mDefault = isDefault;
    }
}

BButton::~BButton() = default;

BArchivable* BButton::Instantiate(BMessage* archive) {
    return validate_instantiation(archive, "BButton") ? new BButton(archive) : nullptr;
}

status_t BButton::Archive(BMessage* archive, bool deep) const {
    const status_t status = BControl::Archive(archive, deep);
    return status == B_OK && mDefault ? archive->AddBool(kDefaultField, true) : status;
}

void BButton::AttachedToWindow() {
    BControl::AttachedToWindow();
    if (mDefault && Window() != nullptr) {
        Window()->SetDefaultButton(this);
    }
}

void BButton::Draw(BRect /*updateRect*/) {
    const ControlState state{.enabled = IsEnabled(),
                             .focused = ShowsFocus(),
                             .pressed = Value() == B_CONTROL_ON,
                             .isDefault = mDefault};
    ControlLook look(this);
    BRect face = look.ButtonFrame(Bounds(), state);
    if (state.enabled && state.pressed) {
        face.OffsetBy(1, 1);
    }
    look.Label(Label(), face.InsetByCopy(2, 0), B_ALIGN_CENTER, state);
}

void BButton::MouseDown(BPoint /*where*/) {
    if (!IsEnabled()) {
        return;
    }
    SetTracking(true);
    SetValue(B_CONTROL_ON);
    // A host without a pointer never sends the events, and never a press either.
    (void)SetMouseEventMask(B_POINTER_EVENTS, B_LOCK_WINDOW_FOCUS);
}

void BButton::MouseMoved(BPoint where, uint32 code, const BMessage* dragMessage) {
    if (IsTracking()) {
        SetValue(Bounds().Contains(where) ? B_CONTROL_ON : B_CONTROL_OFF);
    }
    BControl::MouseMoved(where, code, dragMessage);
}

void BButton::MouseUp(BPoint where) {
    const bool pressed = IsTracking() && IsEnabled() && Bounds().Contains(where);
    if (IsTracking()) {
        SetValue(B_CONTROL_OFF);
    }
    BControl::MouseUp(where);
    if (pressed) {
        Invoke();
    }
}

void BButton::KeyDown(const char* bytes, int32 numBytes) {
    if (numBytes == 1 && (*bytes == B_RETURN || *bytes == B_SPACE)) {
        if (IsEnabled()) {
            Invoke();
        }
        return;
    }
    BControl::KeyDown(bytes, numBytes);
}

void BButton::MakeDefault(bool isDefault) {
    if (isDefault == mDefault) {
        return;
    }
    mDefault = isDefault;
    Invalidate();
    if (BWindow* const window = Window(); window != nullptr) {
        if (isDefault) {
            window->SetDefaultButton(this);
        } else if (window->DefaultButton() == this) {
            window->SetDefaultButton(nullptr);
        }
    }
}

void BButton::GetPreferredSize(float* width, float* height) {
    BFont font;
    GetFont(&font);
    const float labelWidth = Label() == nullptr ? 0.0F : std::ceil(font.StringWidth(Label()));
    const float frame = ControlLook::kButtonFrameWidth;
    *width = std::max(kLeastWidth, labelWidth + 2 * (kLabelMargin + frame) - 1);
    *height = ControlLook::LineHeight(font) + 2 * (kLabelHeadroom + frame) - 1;
}
