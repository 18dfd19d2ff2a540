#include <RadioButton.h>

#include "ControlLook.h"

REGISTER_ARCHIVABLE(BRadioButton);

BRadioButton::BRadioButton(BRect frame, const char* name, const char* label, BMessage* message,
                           uint32 resizingMode, uint32 flags)
    : BCheckBox(frame, name, label, message, resizingMode, flags) {}

BRadioButton::BRadioButton(BMessage* archive) : BCheckBox(archive) {}

BRadioButton::~BRadioButton() = default;

BArchivable* BRadioButton::Instantiate(BMessage* archive) {
    return validate_instantiation(archive, "BRadioButton") ? new BRadioButton(archive) : nullptr;
}

void BRadioButton::SetValue(int32 value) {
    BCheckBox::SetValue(value);
    if (value == B_CONTROL_OFF || Parent() == nullptr) {
        return;
    }
    for (int32 i = 0; i < Parent()->CountChildren(); ++i) {
        auto* const other = dynamic_cast<BRadioButton*>(Parent()->ChildAt(i));
        if (other != nullptr && other != this && other->Value() != B_CONTROL_OFF) {
            other->SetValue(B_CONTROL_OFF);
        }
    }
}

void BRadioButton::KeyDown(const char* bytes, int32 numBytes) {
    if (numBytes == 1 && (*bytes == B_RETURN || *bytes == B_SPACE)) {
        if (IsEnabled()) {
            SetValue(B_CONTROL_ON);
            Invoke();
        }
        return;
    }
    BCheckBox::KeyDown(bytes, numBytes);
}

int32 BRadioButton::NextValue() const {
    return B_CONTROL_ON;
}

void BRadioButton::DrawMark(BRect square, bool pressed) {
    const ControlState state{.enabled = IsEnabled(), .pressed = pressed};
    ControlLook(this).RoundMark(square, Value() != B_CONTROL_OFF, state);
}
