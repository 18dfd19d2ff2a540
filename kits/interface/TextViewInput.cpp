// The part of BTextView that takes the mouse and the keys.
#include <TextView.h>

#include "InputState.h"
#include "TextCharacters.h"

#include <Clipboard.h>

#include <algorithm>
#include <string_view>

void BTextView::MouseDown(BPoint where) {
    if (!mSelectable && !mEditable) {
        return;
    }
    if (!IsFocus()) {
        MakeFocus();
    }
    EndComposition();
    const InputState input = current_input(*this);
    const int32 offset = OffsetAt(where);
    const int32 clicks = (std::max(1, input.clicks) - 1) % 3 + 1;
    mDrag = {true, clicks, offset, offset};
    if (clicks > 1) {
        const TextRange unit = UnitAround(offset, clicks);
        mDrag.from = static_cast<int32>(unit.from);
        mDrag.to = static_cast<int32>(unit.to);
    } else if ((input.modifiers & B_SHIFT_KEY) != 0) {
        // The far end of what is selected stays.
        mDrag.from = mDrag.to = mSelection.Caret() == mSelection.To() ? mSelection.From() : mSelection.To();
    }
    // A host without a pointer never sends the events, and never a press either.
    (void)SetMouseEventMask(B_POINTER_EVENTS, B_LOCK_WINDOW_FOCUS);
    mHistory.EndRun();
    DragTo(where);
}

// The character, word or line at the offset, after so many clicks.
TextRange BTextView::UnitAround(int32 offset, int32 clicks) {
    if (clicks == 1) {
        return {static_cast<size_t>(offset), static_cast<size_t>(offset)};
    }
    if (clicks == 2) {
        int32 from = offset;
        int32 to = offset;
        FindWord(offset, &from, &to);
        return {static_cast<size_t>(from), static_cast<size_t>(to)};
    }
    const int32 line = LineAt(offset);
    const int32 end = line + 1 < CountLines() ? OffsetAt(line + 1) : TextLength();
    return {static_cast<size_t>(OffsetAt(line)), static_cast<size_t>(end)};
}

void BTextView::DragTo(BPoint where) {
    const TextRange unit = UnitAround(OffsetAt(where), mDrag.clicks);
    const auto from = static_cast<int32>(unit.from);
    const auto to = static_cast<int32>(unit.to);
    const TextSelection before = mSelection;
    if (from < mDrag.from) {
        mSelection.Set(mDrag.to, from);
    } else {
        mSelection.Set(mDrag.from, std::max(to, mDrag.to));
    }
    if (before.From() != mSelection.From() || before.To() != mSelection.To() ||
        before.Caret() != mSelection.Caret()) {
        SelectionMoved();
    }
    ScrollToSelection();
}

void BTextView::MouseMoved(BPoint where, uint32 code, const BMessage* dragMessage) {
    BView::MouseMoved(where, code, dragMessage);
    if (mDrag.active) {
        DragTo(where);
    }
}

void BTextView::MouseUp(BPoint where) {
    mDrag.active = false;
    BView::MouseUp(where);
}

void BTextView::KeyDown(const char* bytes, int32 numBytes) {
    const InputState input = current_input(*this);
    const bool isCommand = (input.modifiers & B_COMMAND_KEY) != 0;
    if (numBytes == 1 &&
        (HandleClipboardKeys(*bytes, input.modifiers) || HandleMovement(*bytes, input.modifiers) ||
         HandleErasing(*bytes, input.modifiers))) {
        return;
    }
    const bool shift = (input.modifiers & B_SHIFT_KEY) != 0;
    if (isCommand && (input.plainCharacter == 'y' || (input.plainCharacter == 'z' && shift))) {
        Redo();
        return;
    }
    const std::string_view text(bytes, static_cast<size_t>(std::max(0, numBytes)));
    if (!mEditable || text.empty() || isCommand || !IsAllowed(code_point_at(text, 0))) {
        BView::KeyDown(bytes, numBytes);
        return;
    }
    ReplaceByUser(TextChange::Kind::Typing, mSelection.From(), mSelection.To(), text);
}

void BTextView::Move(Step step, uint32 modifiers) {
    const TextSelection before = mSelection;
    mSelection.Move(step, (modifiers & B_SHIFT_KEY) != 0 ? Anchor::Stays : Anchor::Follows, mText, mLayout,
                    LineCountOfPage());
    mHistory.EndRun();
    if (before.From() != mSelection.From() || before.To() != mSelection.To() ||
        before.Caret() != mSelection.Caret()) {
        SelectionMoved();
    }
    ScrollToSelection();
}

bool BTextView::HandleMovement(char byte, uint32 modifiers) {
    const bool control = (modifiers & B_CONTROL_KEY) != 0;
    if (!mSelectable && !mEditable) {
        return false;
    }
    switch (byte) {
    case B_LEFT_ARROW:
        Move(control ? Step::WordLeft : Step::CharacterLeft, modifiers);
        return true;
    case B_RIGHT_ARROW:
        Move(control ? Step::WordRight : Step::CharacterRight, modifiers);
        return true;
    case B_UP_ARROW:
        Move(Step::LineUp, modifiers);
        return true;
    case B_DOWN_ARROW:
        Move(Step::LineDown, modifiers);
        return true;
    case B_HOME:
        Move(control ? Step::TextStart : Step::LineStart, modifiers);
        return true;
    case B_END:
        Move(control ? Step::TextEnd : Step::LineEnd, modifiers);
        return true;
    case B_PAGE_UP:
        Move(Step::PageUp, modifiers);
        return true;
    case B_PAGE_DOWN:
        Move(Step::PageDown, modifiers);
        return true;
    default:
        return false;
    }
}

bool BTextView::HandleErasing(char byte, uint32 modifiers) {
    if (!mEditable || (byte != B_BACKSPACE && byte != B_DELETE)) {
        return false;
    }
    if (!mSelection.IsEmpty()) {
        ReplaceByUser(TextChange::Kind::Clear, mSelection.From(), mSelection.To(), {});
        return true;
    }
    const bool word = (modifiers & B_CONTROL_KEY) != 0;
    const int32 caret = mSelection.Caret();
    const auto offset = static_cast<size_t>(caret);
    if (byte == B_BACKSPACE) {
        const size_t from = word ? previous_word_start(mText, offset) : previous_character(mText, offset);
        ReplaceByUser(TextChange::Kind::Erasing, static_cast<int32>(from), caret, {});
    } else {
        const size_t to = word ? next_word_end(mText, offset) : next_character(mText, offset);
        ReplaceByUser(TextChange::Kind::Erasing, caret, static_cast<int32>(to), {});
    }
    return true;
}

// The older keys of the clipboard.
bool BTextView::HandleClipboardKeys(char byte, uint32 modifiers) {
    const bool shift = (modifiers & B_SHIFT_KEY) != 0;
    const bool control = (modifiers & B_CONTROL_KEY) != 0;
    if (byte == B_DELETE && shift && !mSelection.IsEmpty()) {
        Cut(be_clipboard);
        return true;
    }
    if (byte == B_INSERT && control) {
        Copy(be_clipboard);
        return true;
    }
    if (byte == B_INSERT && shift) {
        Paste(be_clipboard);
        return true;
    }
    return false;
}
