// BTextControl: a labelled field for one line of text.
#pragma once

#include <Control.h>

#include <memory>

class BTextView;
class TextInput;

// The label lies left of the divider, the field right of it. The control is as high as the font needs,
// whatever its frame says. Return invokes, and so does leaving the field after its text has changed since;
// each change that the user makes sends the modification message. The focus is the text view's. Thread rule:
// that of BView.
class BTextControl : public BControl {
  public:
    // With a label the divider is in the middle, without one at the left edge.
    BTextControl(BRect frame, const char* name, const char* label, const char* initialText, BMessage* message,
                 uint32 resizingMode = B_FOLLOW_LEFT | B_FOLLOW_TOP,
                 uint32 flags = B_WILL_DRAW | B_NAVIGABLE);
    // From what Archive() wrote deep: the text view is among the children.
    explicit BTextControl(BMessage* archive);
    ~BTextControl() override;

    static BArchivable* Instantiate(BMessage* archive);
    // Adds "_a_label", "_a_text" (int32, the alignments), "_divide" (float), and "_mod_msg" (message) where
    // there is one.
    status_t Archive(BMessage* archive, bool deep = true) const override;

    void AttachedToWindow() override;
    void Draw(BRect updateRect) override;
    void MouseDown(BPoint where) override;
    void MakeFocus(bool focus = true) override;
    void FrameResized(float newWidth, float newHeight) override;
    void SetEnabled(bool enabled) override;
    void SetFont(const BFont* font, uint32 mask = B_FONT_ALL) override;
    void SetFlags(uint32 flags) override;
    void GetPreferredSize(float* width, float* height) override;

    // Sends nothing.
    virtual void SetText(const char* text);
    const char* Text() const;
    BTextView* TextView() const;
    // Takes the message over.
    virtual void SetModificationMessage(BMessage* message);
    BMessage* ModificationMessage() const { return mModificationMessage.get(); }
    virtual void SetAlignment(alignment label, alignment text);
    void GetAlignment(alignment* label, alignment* text) const;
    // From the left edge to the field; 0 leaves it all the room.
    virtual void SetDivider(float position);
    float Divider() const { return mDivider; }
    status_t Invoke(BMessage* message = nullptr) override;

    // For the kit's own use, from the text view: its text, or whether keys go to it, has changed.
    void TextModified();
    void FocusChanged();

  private:
    BRect FieldRect() const;
    void PlaceInput();
    void ColorInput();
    float NeededHeight() const;

    TextInput* mInput = nullptr; // our child
    std::unique_ptr<BMessage> mModificationMessage;
    alignment mLabelAlignment = B_ALIGN_LEFT;
    float mDivider = 0;
};
