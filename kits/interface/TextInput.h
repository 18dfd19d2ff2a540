// TextInput: the one-line text view inside of a BTextControl.
#pragma once

#include <TextView.h>

class BTextControl;

// Tells the control what the user does: every change, Return, and leaving the field after a change. Tab goes
// on to the next view.
class TextInput : public BTextView {
  public:
    TextInput(BRect frame, BTextControl* control);
    // From the control's archive; SetControl() must follow.
    explicit TextInput(BMessage* archive);
    ~TextInput() override;

    static BArchivable* Instantiate(BMessage* archive);
    void SetControl(BTextControl* control) { mControl = control; }

    void MakeFocus(bool focus = true) override;
    void WindowActivated(bool active) override;
    void KeyDown(const char* bytes, int32 numBytes) override;
    void FrameResized(float newWidth, float newHeight) override;

    // The control has sent this text, or has been given it.
    void RememberText() { mKnownText = Text(); }

  protected:
    void UserChangedText() override;

  private:
    void Initialise();

    BTextControl* mControl = nullptr; // our parent
    std::string mKnownText;
};
