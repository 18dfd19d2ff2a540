#include <TextControl.h>

#include "ControlLook.h"
#include "TextInput.h"

#include <Window.h>

#include <algorithm>
#include <cmath>

namespace {

constexpr char kLabelAlignmentField[] = "_a_label";
constexpr char kTextAlignmentField[] = "_a_text";
constexpr char kDividerField[] = "_divide";
constexpr char kModificationField[] = "_mod_msg";

// Between the frame and the text.
constexpr float kSideRoom = 2;
constexpr float kHeadRoom = 1;
constexpr float kLabelRoom = 4;
constexpr float kUsualTextWidth = 100;

alignment AlignmentOf(int32 value) {
    return value >= B_ALIGN_LEFT && value <= B_ALIGN_CENTER ? static_cast<alignment>(value) : B_ALIGN_LEFT;
}

} // namespace

REGISTER_ARCHIVABLE(BTextControl);

// The text view is what the focus goes to, so it is the one that can be reached by keys.
BTextControl::BTextControl(BRect frame, const char* name, const char* label, const char* initialText,
                           BMessage* message, uint32 resizingMode, uint32 flags)
    : BControl(frame, name, label, message, resizingMode, (flags & ~B_NAVIGABLE) | B_FRAME_EVENTS) {
    mDivider = label == nullptr ? 0.0F : std::floor(frame.Width() / 2);
    mInput = new TextInput(BRect(0, 0, 10, 10), this);
    AddChild(mInput);
    SetFlags(flags);
    ResizeTo(Bounds().Width(), NeededHeight());
    PlaceInput();
    SetText(initialText);
    ColorInput();
}

BTextControl::BTextControl(BMessage* archive) : BControl(archive) {
    for (int32 i = 0; i < CountChildren() && mInput == nullptr; ++i) {
        mInput = dynamic_cast<TextInput*>(ChildAt(i));
    }
    if (mInput == nullptr) {
        mInput = new TextInput(BRect(0, 0, 10, 10), this);
        AddChild(mInput);
    }
    mInput->SetControl(this);
    if (archive != nullptr) {
        mLabelAlignment = AlignmentOf(archive->GetInt32(kLabelAlignmentField, B_ALIGN_LEFT));
        mInput->SetAlignment(AlignmentOf(archive->GetInt32(kTextAlignmentField, B_ALIGN_LEFT)));
        mDivider = archive->GetFloat(kDividerField, 0);
        BMessage message;
        if (archive->FindMessage(kModificationField, &message) == B_OK) {
            mModificationMessage = std::make_unique<BMessage>(message);
        }
    }
    PlaceInput();
    ColorInput();
}

BTextControl::~BTextControl() {
    // The text view outlives this part of us.
    mInput->SetControl(nullptr);
}

BArchivable* BTextControl::Instantiate(BMessage* archive) {
    return validate_instantiation(archive, "BTextControl") ? new BTextControl(archive) : nullptr;
}

status_t BTextControl::Archive(BMessage* archive, bool deep) const {
    status_t status = BControl::Archive(archive, deep);
    if (status == B_OK) {
        status = archive->AddInt32(kLabelAlignmentField, mLabelAlignment);
    }
    if (status == B_OK) {
        status = archive->AddInt32(kTextAlignmentField, mInput->Alignment());
    }
    if (status == B_OK) {
        status = archive->AddFloat(kDividerField, mDivider);
    }
    if (status == B_OK && mModificationMessage != nullptr) {
        status = archive->AddMessage(kModificationField, mModificationMessage.get());
    }
    return status;
}

void BTextControl::AttachedToWindow() {
    BControl::AttachedToWindow();
    ResizeTo(Bounds().Width(), NeededHeight());
    PlaceInput();
}

float BTextControl::NeededHeight() const {
    BFont font;
    GetFont(&font);
    return ControlLook::LineHeight(font) + 2 * (kHeadRoom + ControlLook::kFieldFrameWidth) - 1;
}

BRect BTextControl::FieldRect() const {
    BRect field = Bounds();
    field.left += mDivider;
    return field;
}

void BTextControl::PlaceInput() {
    const BRect inside =
        FieldRect().InsetByCopy(ControlLook::kFieldFrameWidth + kSideRoom, ControlLook::kFieldFrameWidth);
    mInput->MoveTo(inside.LeftTop());
    mInput->ResizeTo(std::max(0.0F, inside.Width()), std::max(0.0F, inside.Height()));
    mInput->SetTextRect(BRect(0, kHeadRoom, std::max(0.0F, inside.Width()), inside.Height()));
}

void BTextControl::ColorInput() {
    const rgb_color text = ControlLook::TextColor({.enabled = IsEnabled()});
    const rgb_color page = IsEnabled() ? ControlLook::kDocument : ControlLook::kDisabledDocument;
    mInput->SetFontAndColor(nullptr, 0, &text);
    mInput->SetViewColor(page);
    mInput->SetLowColor(page);
}

void BTextControl::Draw(BRect /*updateRect*/) {
    const BRect field = FieldRect();
    const ControlState state{.enabled = IsEnabled(),
                             .focused = mInput->IsFocus() && (Window() == nullptr || Window()->IsActive())};
    ControlLook look(this);
    const BRect inside = look.FieldFrame(field, state);
    look.Fill(inside, IsEnabled() ? ControlLook::kDocument : ControlLook::kDisabledDocument);
    if (mDivider > 0) {
        const BRect label(0, 0, mDivider - 1 - kLabelRoom, Bounds().bottom);
        look.Label(Label(), label, mLabelAlignment, state);
    }
}

void BTextControl::MouseDown(BPoint /*where*/) {
    if (IsEnabled() && !mInput->IsFocus()) {
        mInput->MakeFocus();
    }
}

void BTextControl::MakeFocus(bool focus) {
    mInput->MakeFocus(focus);
}

void BTextControl::FocusChanged() {
    Invalidate();
}

void BTextControl::FrameResized(float newWidth, float newHeight) {
    BControl::FrameResized(newWidth, newHeight);
    PlaceInput();
    Invalidate();
}

void BTextControl::SetEnabled(bool enabled) {
    if (enabled == IsEnabled()) {
        return;
    }
    BControl::SetEnabled(enabled);
    mInput->MakeEditable(enabled);
    mInput->MakeSelectable(enabled);
    mInput->SetFlags(enabled ? mInput->Flags() | B_NAVIGABLE : mInput->Flags() & ~B_NAVIGABLE);
    ColorInput();
    if (!enabled && mInput->IsFocus()) {
        mInput->MakeFocus(false);
    }
}

void BTextControl::SetFont(const BFont* font, uint32 mask) {
    BControl::SetFont(font, mask);
    mInput->SetFont(font, mask);
    ResizeTo(Bounds().Width(), NeededHeight());
    PlaceInput();
    Invalidate();
}

void BTextControl::SetFlags(uint32 flags) {
    const uint32 navigable = flags & B_NAVIGABLE;
    BControl::SetFlags((flags & ~B_NAVIGABLE) | B_FRAME_EVENTS);
    mInput->SetFlags((mInput->Flags() & ~B_NAVIGABLE) | (IsEnabled() ? navigable : 0));
}

void BTextControl::SetText(const char* text) {
    mInput->SetText(text);
    mInput->RememberText();
}

const char* BTextControl::Text() const {
    return mInput->Text();
}

BTextView* BTextControl::TextView() const {
    return mInput;
}

void BTextControl::SetModificationMessage(BMessage* message) {
    if (message != mModificationMessage.get()) {
        mModificationMessage.reset(message);
    }
}

void BTextControl::SetAlignment(alignment label, alignment text) {
    mInput->SetAlignment(text);
    if (label != mLabelAlignment) {
        mLabelAlignment = label;
        Invalidate();
    }
}

void BTextControl::GetAlignment(alignment* label, alignment* text) const {
    if (label != nullptr) {
        *label = mLabelAlignment;
    }
    if (text != nullptr) {
        *text = mInput->Alignment();
    }
}

void BTextControl::SetDivider(float position) {
    position = std::round(std::max(0.0F, position));
    if (position != mDivider) {
        mDivider = position;
        PlaceInput();
        Invalidate();
    }
}

status_t BTextControl::Invoke(BMessage* message) {
    bool notifying = false;
    if (InvokeKind(&notifying) == B_CONTROL_INVOKED) {
        mInput->RememberText();
    }
    return BControl::Invoke(message);
}

void BTextControl::TextModified() {
    InvokeNotify(mModificationMessage.get(), B_CONTROL_MODIFIED);
}

void BTextControl::GetPreferredSize(float* width, float* height) {
    BFont font;
    GetFont(&font);
    const float label = Label() == nullptr ? 0.0F : std::ceil(font.StringWidth(Label())) + kLabelRoom;
    *width = std::max(mDivider, label) + kUsualTextWidth;
    *height = NeededHeight();
}
