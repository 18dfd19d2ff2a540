// BButton: a labelled button that sends its message when it is pressed.
#pragma once

#include <Control.h>

// Pressed by the mouse, by Space and Return when it has the focus, and, as the default button, by Return
// wherever the focus is. Its value is B_CONTROL_ON while it is held down. Thread rule: that of BView.
class BButton : public BControl {
  public:
    BButton(BRect frame, const char* name, const char* label, BMessage* message,
            uint32 resizingMode = B_FOLLOW_LEFT | B_FOLLOW_TOP, uint32 flags = B_WILL_DRAW | B_NAVIGABLE);
    explicit BButton(BMessage* archive);
    ~BButton() override;

    static BArchivable* Instantiate(BMessage* archive);
    // Adds "_default" (bool) where it is the default button.
    status_t Archive(BMessage* archive, bool deep = true) const override;

    void Draw(BRect updateRect) override;
    void AttachedToWindow() override;
    void MouseDown(BPoint where) override;
    void MouseMoved(BPoint where, uint32 code, const BMessage* dragMessage) override;
    void MouseUp(BPoint where) override;
    void KeyDown(const char* bytes, int32 numBytes) override;

    // A window has one default button at most: making one ends the other's time. It is drawn with a thicker
    // frame and stays as large as it was.
    virtual void MakeDefault(bool isDefault);
    bool IsDefault() const { return mDefault; }

    void GetPreferredSize(float* width, float* height) override;

  private:
    bool mDefault = false;
};
