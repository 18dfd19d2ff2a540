#include "TextInput.h"

#include <Message.h>
#include <TextControl.h>

REGISTER_ARCHIVABLE(TextInput);

TextInput::TextInput(BRect frame, BTextControl* control)
    : BTextView(frame, "_input_", frame.OffsetToCopy(B_ORIGIN), B_FOLLOW_ALL, B_WILL_DRAW | B_NAVIGABLE),
      mControl(control) {
    Initialise();
}

TextInput::TextInput(BMessage* archive) : BTextView(archive) {
    Initialise();
    RememberText();
}

TextInput::~TextInput() = default;

BArchivable* TextInput::Instantiate(BMessage* archive) {
    return validate_instantiation(archive, "TextInput") ? new TextInput(archive) : nullptr;
}

void TextInput::Initialise() {
    SetWordWrap(false);
    DisallowChar('\n');
    DisallowChar('\t');
}

void TextInput::FrameResized(float newWidth, float newHeight) {
    BTextView::FrameResized(newWidth, newHeight);
    SetTextRect(BRect(0, TextRect().top, newWidth, TextRect().bottom));
    ScrollToSelection();
}

void TextInput::MakeFocus(bool focus) {
    const bool before = IsFocus();
    BTextView::MakeFocus(focus);
    if (IsFocus() == before || mControl == nullptr) {
        return;
    }
    if (IsFocus()) {
        RememberText();
        SelectAll();
    } else if (mKnownText != Text()) {
        mControl->Invoke();
    }
    mControl->FocusChanged();
}

void TextInput::WindowActivated(bool active) {
    BTextView::WindowActivated(active);
    if (mControl != nullptr) {
        mControl->FocusChanged();
    }
}

void TextInput::KeyDown(const char* bytes, int32 numBytes) {
    const char byte = numBytes == 1 ? *bytes : '\0';
    if (byte == B_RETURN && mControl != nullptr) {
        if (IsEditable()) {
            mControl->Invoke();
            SelectAll();
        }
        return;
    }
    if (byte == B_TAB || byte == B_ESCAPE) {
        BView::KeyDown(bytes, numBytes);
        return;
    }
    BTextView::KeyDown(bytes, numBytes);
}

void TextInput::UserChangedText() {
    if (mControl != nullptr) {
        mControl->TextModified();
    }
}
