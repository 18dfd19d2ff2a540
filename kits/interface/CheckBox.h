// BCheckBox: a labelled box that is on or off.
#pragma once

#include <Control.h>

// A click, Space or Return switches it and invokes. Thread rule: that of BView.
class BCheckBox : public BControl {
  public:
    BCheckBox(BRect frame, const char* name, const char* label, BMessage* message,
              uint32 resizingMode = B_FOLLOW_LEFT | B_FOLLOW_TOP, uint32 flags = B_WILL_DRAW | B_NAVIGABLE);
    explicit BCheckBox(BMessage* archive);
    ~BCheckBox() override;

    static BArchivable* Instantiate(BMessage* archive);

    void Draw(BRect updateRect) override;
    void MouseDown(BPoint where) override;
    void MouseMoved(BPoint where, uint32 code, const BMessage* dragMessage) override;
    void MouseUp(BPoint where) override;
    void GetPreferredSize(float* width, float* height) override;

  protected:
    // What a click sets the value to.
    virtual int32 NextValue() const;
    // Draws the mark into a square that is as high as a line of text.
    virtual void DrawMark(BRect square, bool pressed);

  private:
    BRect MarkSquare() const;

    bool mPressed = false;
};
