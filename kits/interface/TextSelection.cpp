#include "TextSelection.h"

#include "TextCharacters.h"
#include "TextLayout.h"

#include <algorithm>

void TextSelection::Set(int32 anchor, int32 caret) {
    mAnchor = anchor;
    mCaret = caret;
    mColumn = -1;
}

void TextSelection::MoveCaretTo(int32 offset, Anchor anchor) {
    Set(anchor == Anchor::Stays ? mAnchor : offset, offset);
}

void TextSelection::Move(Step step, Anchor anchor, std::string_view text, const TextLayout& layout,
                         int32 linesOfPage) {
    const bool upOrDown =
        step == Step::LineUp || step == Step::LineDown || step == Step::PageUp || step == Step::PageDown;
    if (!upOrDown) {
        mColumn = -1;
    } else if (mColumn < 0) {
        mColumn = layout.XAt(mCaret);
    }
    mCaret = Target(step, anchor, text, layout, linesOfPage);
    if (anchor == Anchor::Follows) {
        mAnchor = mCaret;
    }
}

int32 TextSelection::TargetOnLine(int32 line, std::string_view text, const TextLayout& layout) {
    if (line < 0) {
        return 0;
    }
    return line >= layout.CountLines() ? static_cast<int32>(text.size())
                                       : layout.OffsetAt(line, mColumn, text);
}

int32 TextSelection::Target(Step step, Anchor anchor, std::string_view text, const TextLayout& layout,
                            int32 linesOfPage) {
    const auto caret = static_cast<size_t>(mCaret);
    const bool leavesSelection = anchor == Anchor::Follows && !IsEmpty();
    const int32 line = layout.LineAt(mCaret);
    switch (step) {
    case Step::CharacterLeft:
        return leavesSelection ? From() : static_cast<int32>(previous_character(text, caret));
    case Step::CharacterRight:
        return leavesSelection ? To() : static_cast<int32>(next_character(text, caret));
    case Step::WordLeft:
        return static_cast<int32>(previous_word_start(text, caret));
    case Step::WordRight:
        return static_cast<int32>(next_word_end(text, caret));
    case Step::LineUp:
        return TargetOnLine(line - 1, text, layout);
    case Step::LineDown:
        return TargetOnLine(line + 1, text, layout);
    case Step::PageUp:
        return TargetOnLine(std::max(0, line - linesOfPage), text, layout);
    case Step::PageDown:
        return TargetOnLine(std::min(layout.CountLines() - 1, line + linesOfPage), text, layout);
    case Step::LineStart:
        return layout.StartOf(line);
    case Step::LineEnd:
        return layout.EndsParagraph(line)
                   ? layout.EndOf(line)
                   : static_cast<int32>(previous_character(text, static_cast<size_t>(layout.EndOf(line))));
    case Step::TextStart:
        return 0;
    case Step::TextEnd:
        break;
    }
    return static_cast<int32>(text.size());
}

void TextSelection::TextInserted(int32 offset, int32 length) {
    // What is inserted at the caret comes before it.
    mAnchor += mAnchor >= offset ? length : 0;
    mCaret += mCaret >= offset ? length : 0;
    mColumn = -1;
}

void TextSelection::TextRemoved(int32 from, int32 to) {
    const auto moved = [&](int32 offset) {
        return offset <= from ? offset : std::max(from, offset - (to - from));
    };
    mAnchor = moved(mAnchor);
    mCaret = moved(mCaret);
    mColumn = -1;
}
