#include <TextView.h>

#include "ControlLook.h"
#include "TextCharacters.h"

#include <Cursor.h>
#include <Message.h>
#include <ScrollBar.h>
#include <ScrollView.h>
#include <Window.h>

#include <algorithm>
#include <cmath>
#include <string.h>

namespace {

constexpr char kTextField[] = "_text";
constexpr char kTextRectField[] = "_trect";
constexpr char kMaxBytesField[] = "_max";
constexpr char kAlignmentField[] = "_align";
constexpr char kTabField[] = "_tab";
constexpr char kSelectionField[] = "_sel";
constexpr char kNotEditableField[] = "_noed";
constexpr char kNotSelectableField[] = "_nosel";
constexpr char kNoWrapField[] = "_nowrap";

constexpr uint32 kFlags = B_FRAME_EVENTS | B_PULSE_NEEDED | B_INPUT_METHOD_AWARE;

} // namespace

REGISTER_ARCHIVABLE(BTextView);

BTextView::BTextView(BRect frame, const char* name, BRect textRect, uint32 resizingMode, uint32 flags)
    : BView(frame, name, resizingMode, flags | kFlags), mTextRect(textRect) {
    Initialise();
}

BTextView::BTextView(BRect frame, const char* name, BRect textRect, const BFont* initialFont,
                     const rgb_color* initialColor, uint32 resizingMode, uint32 flags)
    : BView(frame, name, resizingMode, flags | kFlags), mTextRect(textRect) {
    Initialise();
    SetFontAndColor(initialFont, B_FONT_ALL, initialColor);
}

BTextView::BTextView(BMessage* archive) : BView(archive) {
    Initialise();
    mTextRect = Bounds();
    if (archive == nullptr) {
        return;
    }
    (void)archive->FindRect(kTextRectField, &mTextRect);
    (void)archive->FindFloat(kTabField, &mTabWidth);
    int32 value = 0;
    if (archive->FindInt32(kAlignmentField, &value) == B_OK && value >= B_ALIGN_LEFT &&
        value <= B_ALIGN_CENTER) {
        mAlignment = static_cast<alignment>(value);
    }
    mEditable = !archive->GetBool(kNotEditableField, false);
    mSelectable = !archive->GetBool(kNotSelectableField, false);
    mWrap = !archive->GetBool(kNoWrapField, false);
    SetText(archive->GetString(kTextField, ""));
    if (archive->FindInt32(kMaxBytesField, &value) == B_OK) {
        SetMaxBytes(value);
    }
    int32 end = 0;
    if (archive->FindInt32(kSelectionField, 0, &value) == B_OK &&
        archive->FindInt32(kSelectionField, 1, &end) == B_OK) {
        Select(value, end);
    }
}

BTextView::~BTextView() = default;

BArchivable* BTextView::Instantiate(BMessage* archive) {
    return validate_instantiation(archive, "BTextView") ? new BTextView(archive) : nullptr;
}

status_t BTextView::Archive(BMessage* archive, bool deep) const {
    status_t status = BView::Archive(archive, deep);
    const auto then = [&](auto add) {
        if (status == B_OK) {
            status = add();
        }
    };
    then([&] { return archive->AddString(kTextField, mText.c_str()); });
    then([&] { return archive->AddRect(kTextRectField, mTextRect); });
    then([&] { return archive->AddInt32(kMaxBytesField, mMaxBytes); });
    then([&] { return archive->AddInt32(kAlignmentField, mAlignment); });
    then([&] { return archive->AddFloat(kTabField, mTabWidth); });
    then([&] { return archive->AddInt32(kSelectionField, mSelection.From()); });
    then([&] { return archive->AddInt32(kSelectionField, mSelection.To()); });
    then([&] { return mEditable ? B_OK : archive->AddBool(kNotEditableField, true); });
    then([&] { return mSelectable ? B_OK : archive->AddBool(kNotSelectableField, true); });
    then([&] { return mWrap ? B_OK : archive->AddBool(kNoWrapField, true); });
    return status;
}

void BTextView::Initialise() {
    SetViewColor(ControlLook::kDocument);
    SetHighColor(ControlLook::kText);
}

void BTextView::AttachedToWindow() {
    BView::AttachedToWindow();
    if (mSelectable || mEditable) {
        SetViewCursor(B_CURSOR_I_BEAM);
    }
    LayOut();
}

void BTextView::DetachedFromWindow() {
    mDrag = Drag();
    BView::DetachedFromWindow();
}

void BTextView::TargetedByScrollView(BScrollView* scrollView) {
    mScrollView = scrollView;
    FixupScrollBars();
}

void BTextView::FrameResized(float newWidth, float newHeight) {
    BView::FrameResized(newWidth, newHeight);
    FixupScrollBars();
}

bool BTextView::ShowsFocus() const {
    return IsFocus() && (Window() == nullptr || Window()->IsActive());
}

void BTextView::WindowActivated(bool active) {
    BView::WindowActivated(active);
    if (IsFocus()) {
        ShowCaret();
        InvalidateText();
    }
}

void BTextView::MakeFocus(bool focus) {
    const bool before = IsFocus();
    BView::MakeFocus(focus);
    if (IsFocus() == before) {
        return;
    }
    mHistory.EndRun();
    EndComposition();
    ShowCaret();
    InvalidateText();
    if (mScrollView != nullptr) {
        mScrollView->SetBorderHighlighted(IsFocus());
    }
}

void BTextView::SetFont(const BFont* font, uint32 mask) {
    BView::SetFont(font, mask);
    LayOut();
}

void BTextView::SetFontAndColor(const BFont* font, uint32 mask, const rgb_color* color) {
    if (color != nullptr) {
        SetHighColor(*color);
        InvalidateText();
    }
    if (font != nullptr) {
        SetFont(font, mask);
    }
}

void BTextView::GetFontAndColor(BFont* font, rgb_color* color) const {
    if (font != nullptr) {
        GetFont(font);
    }
    if (color != nullptr) {
        *color = HighColor();
    }
}

void BTextView::SetTextRect(BRect rect) {
    if (rect != mTextRect) {
        mTextRect = rect;
        LayOut();
    }
}

void BTextView::SetTabWidth(float width) {
    mTabWidth = width;
    LayOut();
}

void BTextView::SetAlignment(alignment align) {
    if (align != mAlignment) {
        mAlignment = align;
        InvalidateText();
    }
}

void BTextView::SetWordWrap(bool wrap) {
    if (wrap != mWrap) {
        mWrap = wrap;
        LayOut();
    }
}

void BTextView::MakeEditable(bool editable) {
    if (editable != mEditable) {
        mEditable = editable;
        InvalidateText();
    }
}

void BTextView::MakeSelectable(bool selectable) {
    if (selectable != mSelectable) {
        mSelectable = selectable;
        InvalidateText();
    }
}

void BTextView::SetDoesUndo(bool undo) {
    mUndoes = undo;
    mHistory.Clear();
}

void BTextView::HideTyping(bool hidden) {
    if (hidden != mHidden) {
        mHidden = hidden;
        LayOut();
    }
}

void BTextView::SetMaxBytes(int32 max) {
    mMaxBytes = std::max(0, max);
    if (TextLength() > mMaxBytes) {
        DeleteText(BoundaryAt(mMaxBytes), TextLength());
        mHistory.Clear();
    }
}

void BTextView::DisallowChar(uint32 codePoint) {
    mDisallowed.insert(codePoint);
}

void BTextView::AllowChar(uint32 codePoint) {
    mDisallowed.erase(codePoint);
}

void BTextView::GetText(int32 offset, int32 length, char* buffer) const {
    const auto start = static_cast<size_t>(std::clamp(offset, 0, TextLength()));
    const std::string part = mText.substr(start, static_cast<size_t>(std::max(0, length)));
    memcpy(buffer, part.c_str(), part.size() + 1);
}

uint8 BTextView::ByteAt(int32 offset) const {
    return offset < 0 || offset >= TextLength() ? uint8{0}
                                                : static_cast<uint8>(mText[static_cast<size_t>(offset)]);
}

int32 BTextView::BoundaryAt(int32 offset) const {
    return static_cast<int32>(code_point_boundary(mText, static_cast<size_t>(std::max(0, offset))));
}

void BTextView::GoToLine(int32 line) {
    const int32 offset = OffsetAt(std::max(0, line));
    Select(offset, offset);
}

void BTextView::FindWord(int32 offset, int32* from, int32* to) {
    const TextRange word = word_around(mText, static_cast<size_t>(BoundaryAt(offset)));
    if (from != nullptr) {
        *from = static_cast<int32>(word.from);
    }
    if (to != nullptr) {
        *to = static_cast<int32>(word.to);
    }
}

void BTextView::Select(int32 startOffset, int32 endOffset) {
    if (startOffset > endOffset) {
        return;
    }
    const int32 from = BoundaryAt(startOffset);
    const int32 to = BoundaryAt(endOffset);
    if (from != mSelection.From() || to != mSelection.To()) {
        mSelection.Set(from, to);
        mHistory.EndRun();
        SelectionMoved();
    }
}

void BTextView::SelectAll() {
    Select(0, TextLength());
}

void BTextView::GetSelection(int32* start, int32* end) const {
    if (start != nullptr) {
        *start = mSelection.From();
    }
    if (end != nullptr) {
        *end = mSelection.To();
    }
}
