// TextSelection: the caret of an edited text, what is selected, and how keys move it.
#pragma once

#include <SupportDefs.h>

#include <string_view>

class TextLayout;

// Offsets are bytes of the text. The caret is one end of the selection, the anchor the other. A plain value.
class TextSelection {
  public:
    enum class Step {
        CharacterLeft,
        CharacterRight,
        WordLeft,
        WordRight,
        LineUp,
        LineDown,
        PageUp,
        PageDown,
        LineStart,
        LineEnd,
        TextStart,
        TextEnd
    };
    enum class Anchor { Follows, Stays };

    int32 From() const { return mCaret < mAnchor ? mCaret : mAnchor; }
    int32 To() const { return mCaret < mAnchor ? mAnchor : mCaret; }
    int32 Caret() const { return mCaret; }
    bool IsEmpty() const { return mCaret == mAnchor; }

    void Set(int32 anchor, int32 caret);
    void MoveCaretTo(int32 offset, Anchor anchor);
    // An anchor that stays extends the selection; without, a step to the side first leaves what is selected.
    // Up and down keep to the column where they began.
    void Move(Step step, Anchor anchor, std::string_view text, const TextLayout& layout, int32 linesOfPage);

    // The text has changed there.
    void TextInserted(int32 offset, int32 length);
    void TextRemoved(int32 from, int32 to);

  private:
    int32 Target(Step step, Anchor anchor, std::string_view text, const TextLayout& layout,
                 int32 linesOfPage);
    int32 TargetOnLine(int32 line, std::string_view text, const TextLayout& layout);

    int32 mAnchor = 0;
    int32 mCaret = 0;
    float mColumn = -1; // negative: that of the caret
};
