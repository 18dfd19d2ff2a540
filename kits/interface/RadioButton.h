// BRadioButton: one of several buttons of which one is on.
#pragma once

#include <CheckBox.h>

// Belongs with all radio buttons that have the same parent: switching one on switches the others off, by
// SetValue() as by the user. Thread rule: that of BView.
class BRadioButton : public BCheckBox {
  public:
    BRadioButton(BRect frame, const char* name, const char* label, BMessage* message,
                 uint32 resizingMode = B_FOLLOW_LEFT | B_FOLLOW_TOP,
                 uint32 flags = B_WILL_DRAW | B_NAVIGABLE);
    explicit BRadioButton(BMessage* archive);
    ~BRadioButton() override;

    static BArchivable* Instantiate(BMessage* archive);

    void KeyDown(const char* bytes, int32 numBytes) override;
    void SetValue(int32 value) override;

  protected:
    int32 NextValue() const override;
    void DrawMark(BRect square, bool pressed) override;
};
