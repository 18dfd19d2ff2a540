// The part of BTextView that changes the text.
#include <TextView.h>

#include "TextCharacters.h"
#include "Utf8Text.h"

#include <Clipboard.h>
#include <Message.h>

#include <algorithm>
#include <string.h>

namespace {

constexpr char kTextType[] = "text/plain";

std::string_view TextOf(const BMessage& message) {
    const void* data = nullptr;
    ssize_t size = 0;
    if (message.FindData(kTextType, B_MIME_TYPE, &data, &size) != B_OK || size < 0) {
        return {};
    }
    const std::string_view text(static_cast<const char*>(data), static_cast<size_t>(size));
    // Some programs count a terminator in.
    return text.substr(0, text.find('\0'));
}

size_t LengthOf(const char* text, int32 length) {
    return text == nullptr || length <= 0 ? 0 : strnlen(text, static_cast<size_t>(length));
}

} // namespace

void BTextView::SetText(const char* text) {
    SetText(text, text == nullptr ? 0 : static_cast<int32>(strlen(text)));
}

void BTextView::SetText(const char* text, int32 length) {
    const std::string wanted(text == nullptr ? "" : text, LengthOf(text, length));
    EndComposition();
    mHistory.Clear();
    DeleteText(0, TextLength());
    InsertText(wanted.c_str(), static_cast<int32>(wanted.size()), 0);
    mSelection.Set(0, 0);
    SelectionMoved();
    ScrollToOffset(0);
}

void BTextView::Insert(const char* text) {
    Insert(text, text == nullptr ? 0 : static_cast<int32>(strlen(text)));
}

void BTextView::Insert(const char* text, int32 length) {
    Insert(mSelection.Caret(), text, length);
}

void BTextView::Insert(int32 offset, const char* text, int32 length) {
    mHistory.Clear();
    InsertText(text, length, BoundaryAt(offset));
    SelectionMoved();
}

void BTextView::Delete() {
    Delete(mSelection.From(), mSelection.To());
}

void BTextView::Delete(int32 from, int32 to) {
    mHistory.Clear();
    DeleteText(BoundaryAt(from), BoundaryAt(to));
    SelectionMoved();
}

void BTextView::InsertText(const char* text, int32 length, int32 offset) {
    const std::string_view all(text == nullptr ? "" : text, LengthOf(text, length));
    const auto room = static_cast<size_t>(std::max(0, mMaxBytes - TextLength()));
    const std::string_view inserted = all.substr(0, code_point_boundary(all, room));
    if (inserted.empty()) {
        return;
    }
    mText.insert(static_cast<size_t>(offset), inserted);
    mSelection.TextInserted(offset, static_cast<int32>(inserted.size()));
    LayOut();
}

void BTextView::DeleteText(int32 from, int32 to) {
    if (from >= to) {
        return;
    }
    mText.erase(static_cast<size_t>(from), static_cast<size_t>(to - from));
    mSelection.TextRemoved(from, to);
    LayOut();
}

void BTextView::UserChangedText() {}

bool BTextView::IsAllowed(uint32 codePoint) const {
    const bool isControl = (codePoint < 0x20 && codePoint != '\n' && codePoint != '\t') || codePoint == 0x7F;
    return !isControl && mDisallowed.count(codePoint) == 0;
}

// What of an entered text is let in, `room` bytes at most.
std::string BTextView::Allowed(std::string_view entered, int32 room) const {
    std::string allowed;
    while (!entered.empty()) {
        const size_t length = utf8_char_length(entered);
        const uint32 code = code_point_at(entered, 0);
        std::string_view character = entered.substr(0, length);
        entered.remove_prefix(length);
        if (!IsAllowed(code)) {
            if (code != '\n' || !IsAllowed(' ')) {
                continue;
            }
            character = " ";
        }
        if (allowed.size() + character.size() > static_cast<size_t>(std::max(0, room))) {
            break;
        }
        allowed += character;
    }
    return allowed;
}

void BTextView::ReplaceByUser(TextChange::Kind kind, int32 from, int32 to, std::string_view text) {
    if (!mEditable) {
        return;
    }
    TextChange change;
    change.kind = kind;
    change.offset = from;
    change.removed = mText.substr(static_cast<size_t>(from), static_cast<size_t>(to - from));
    change.inserted = Allowed(text, mMaxBytes - (TextLength() - (to - from)));
    if (change.removed.empty() && change.inserted.empty()) {
        return;
    }
    Apply(from, change.removed, change.inserted);
    if (mUndoes) {
        mHistory.Add(std::move(change));
    }
    UserChangedText();
}

void BTextView::Apply(int32 offset, const std::string& removed, const std::string& inserted) {
    DeleteText(offset, offset + static_cast<int32>(removed.size()));
    const int32 withoutRemoved = TextLength();
    InsertText(inserted.c_str(), static_cast<int32>(inserted.size()), offset);
    // A class that overrides InsertText() may have refused some of it.
    const int32 grown = TextLength() - withoutRemoved;
    mSelection.Set(offset + grown, offset + grown);
    SelectionMoved();
    ScrollToSelection();
}

void BTextView::Undo(BClipboard* /*clipboard*/) {
    if (!mEditable) {
        return;
    }
    if (const std::optional<TextChange> change = mHistory.Undo(); change) {
        Apply(change->offset, change->inserted, change->removed);
        UserChangedText();
    }
}

void BTextView::Redo() {
    if (!mEditable) {
        return;
    }
    if (const std::optional<TextChange> change = mHistory.Redo(); change) {
        Apply(change->offset, change->removed, change->inserted);
        UserChangedText();
    }
}

undo_state BTextView::UndoState(bool* isRedo) const {
    if (isRedo != nullptr) {
        *isRedo = false;
    }
    const TextChange* const change = mHistory.NextToUndo();
    if (change == nullptr) {
        return B_UNDO_UNAVAILABLE;
    }
    switch (change->kind) {
    case TextChange::Kind::Cut:
        return B_UNDO_CUT;
    case TextChange::Kind::Paste:
        return B_UNDO_PASTE;
    case TextChange::Kind::Clear:
        return B_UNDO_CLEAR;
    case TextChange::Kind::Drop:
        return B_UNDO_DROP;
    case TextChange::Kind::Typing:
    case TextChange::Kind::Erasing:
        break;
    }
    return B_UNDO_TYPING;
}

void BTextView::CopyTo(BClipboard* clipboard) const {
    if (clipboard == nullptr || mSelection.IsEmpty() || mHidden || !clipboard->Lock()) {
        return;
    }
    const auto from = static_cast<size_t>(mSelection.From());
    const auto length = static_cast<size_t>(mSelection.To()) - from;
    if (clipboard->Clear() == B_OK && clipboard->Data()->AddData(kTextType, B_MIME_TYPE, mText.data() + from,
                                                                 static_cast<ssize_t>(length)) == B_OK) {
        // Where the desktop refuses it the old contents stay, and nobody can be told more.
        (void)clipboard->Commit();
    }
    clipboard->Unlock();
}

void BTextView::Copy(BClipboard* clipboard) {
    CopyTo(clipboard);
}

void BTextView::Cut(BClipboard* clipboard) {
    if (mEditable && !mHidden && !mSelection.IsEmpty()) {
        CopyTo(clipboard);
        ReplaceByUser(TextChange::Kind::Cut, mSelection.From(), mSelection.To(), {});
    }
}

void BTextView::Clear() {
    ReplaceByUser(TextChange::Kind::Clear, mSelection.From(), mSelection.To(), {});
}

void BTextView::Paste(BClipboard* clipboard) {
    if (clipboard == nullptr || !mEditable || !clipboard->Lock()) {
        return;
    }
    const std::string text(TextOf(*clipboard->Data()));
    clipboard->Unlock();
    if (!text.empty()) {
        ReplaceByUser(TextChange::Kind::Paste, mSelection.From(), mSelection.To(), text);
    }
}

bool BTextView::AcceptsPaste(BClipboard* clipboard) {
    if (clipboard == nullptr || !mEditable || !clipboard->Lock()) {
        return false;
    }
    const bool has = clipboard->Data()->HasData(kTextType, B_MIME_TYPE);
    clipboard->Unlock();
    return has;
}

bool BTextView::AcceptsDrop(const BMessage* message) {
    return mEditable && message != nullptr && message->HasData(kTextType, B_MIME_TYPE);
}

void BTextView::MessageReceived(BMessage* message) {
    if (message->WasDropped()) {
        if (AcceptsDrop(message)) {
            const int32 offset = OffsetAt(ConvertFromScreen(message->DropPoint()));
            ReplaceByUser(TextChange::Kind::Drop, offset, offset, TextOf(*message));
            return;
        }
        BView::MessageReceived(message);
        return;
    }
    switch (message->what) {
    case B_INPUT_METHOD_EVENT:
        if (message->GetInt32("be:opcode", -1) == B_INPUT_METHOD_CHANGED) {
            SetComposition(message->GetString("be:string", ""), message->GetInt32("be:selection", 0));
        }
        break;
    case B_CUT:
        Cut(be_clipboard);
        break;
    case B_COPY:
        Copy(be_clipboard);
        break;
    case B_PASTE:
        Paste(be_clipboard);
        break;
    case B_SELECT_ALL:
        SelectAll();
        break;
    case B_UNDO:
        Undo(be_clipboard);
        break;
    case B_REDO:
        Redo();
        break;
    default:
        BView::MessageReceived(message);
    }
}
