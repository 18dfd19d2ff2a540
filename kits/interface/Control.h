// BControl: a view with a label and a value that sends a message when the user changes it.
#pragma once

#include <Invoker.h>
#include <View.h>

#include <string>

enum { B_CONTROL_OFF = 0, B_CONTROL_ON = 1 };

// The base of buttons, fields and the like; draws nothing itself. A control without a target sends to the
// window it is added to, and takes its parent's view colour. Thread rule: that of BView.
class BControl : public BView, public BInvoker {
  public:
    // Takes the message over; a copy of the label is kept, null is no label.
    BControl(BRect frame, const char* name, const char* label, BMessage* message, uint32 resizingMode,
             uint32 flags);
    // From what Archive() wrote; missing fields take the values of a new control.
    explicit BControl(BMessage* archive);
    ~BControl() override;

    static BArchivable* Instantiate(BMessage* archive);
    // Adds "_label" (string) and "_msg" (message) where there are any, "_val" (int32), and "_disable" (bool)
    // where it is disabled.
    status_t Archive(BMessage* archive, bool deep = true) const override;

    void AttachedToWindow() override;
    void DetachedFromWindow() override;
    void WindowActivated(bool active) override;
    // Understands the scripting of the properties "Enabled" (bool), "Label" (string) and "Value" (int32).
    void MessageReceived(BMessage* message) override;
    void MakeFocus(bool focus = true) override;
    // Space and Return switch the value between B_CONTROL_OFF and B_CONTROL_ON and invoke.
    void KeyDown(const char* bytes, int32 numBytes) override;
    void MouseUp(BPoint where) override;

    virtual void SetLabel(const char* label);
    // Null when there is none.
    const char* Label() const { return mHasLabel ? mLabel.c_str() : nullptr; }
    // Redraws, sends nothing.
    virtual void SetValue(int32 value);
    int32 Value() const { return mValue; }
    // A disabled control cannot have the focus: it is without B_NAVIGABLE as long.
    virtual void SetEnabled(bool enabled);
    bool IsEnabled() const { return mEnabled; }

    // Sends a copy of `message`, or of the control's own, with "source" (pointer), "be:value" (int32) and
    // "be:sender" (messenger) beside what BInvoker adds, and tells those who watch the control.
    status_t Invoke(BMessage* message = nullptr) override;

    BHandler* ResolveSpecifier(BMessage* message, int32 index, BMessage* specifier, int32 form,
                               const char* property) override;
    status_t GetSupportedSuites(BMessage* data) override;

  protected:
    // While MakeFocus() is at work: Draw() may then draw the focus mark alone.
    bool IsFocusChanging() const { return mFocusChanging; }
    // Whether the mouse button that went down on the control is still held.
    bool IsTracking() const { return mTracking; }
    void SetTracking(bool tracking) { mTracking = tracking; }
    // The new value without redrawing.
    void SetValueNoUpdate(int32 value) { mValue = value; }
    // Whether keys go to it: the focus, in the active window.
    bool ShowsFocus() const;

  private:
    void AnswerScript(BMessage* message);

    std::string mLabel;
    int32 mValue = B_CONTROL_OFF;
    bool mHasLabel = false;
    bool mEnabled = true;
    bool mNavigableWhenEnabled = false; // known while it is disabled
    bool mFocusChanging = false;
    bool mTracking = false;
};
