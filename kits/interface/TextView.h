// BTextView: shows a text and edits it.
#pragma once

#include <View.h>

#include "TextCharacters.h"
#include "TextHistory.h"
#include "TextLayout.h"
#include "TextSelection.h"

#include <set>
#include <string>

class BClipboard;
class BScrollView;

enum undo_state { B_UNDO_UNAVAILABLE, B_UNDO_TYPING, B_UNDO_CUT, B_UNDO_PASTE, B_UNDO_CLEAR, B_UNDO_DROP };

// One font and one colour for the whole text. It is UTF-8; other bytes are kept as they are and shown as
// replacement characters. Offsets are bytes; one that lies outside the text is brought into it, one inside a
// character to its beginning. Every change lays out the whole text anew: made for fields and notes, not for
// books.
//
// Keys: arrows, Home, End, Page Up and Down (with Control by words, or to the ends of the text) move the
// caret, with Shift they select; a double click selects a word, a triple one a line. Cut, copied, pasted and
// undone is through the messages B_CUT, B_COPY, B_PASTE, B_SELECT_ALL, B_UNDO and B_REDO, which windows send
// for the usual keys; Control-Y and Control-Shift-Z do again what was undone. Text that is dropped is
// inserted. What an input method is working on is shown underlined at the caret and is no part of the text
// yet. Thread rule: that of BView.
class BTextView : public BView {
  public:
    // `textRect`, in the view's coordinates, says where the text begins and how wide wrapped lines are.
    BTextView(BRect frame, const char* name, BRect textRect, uint32 resizingMode,
              uint32 flags = B_WILL_DRAW | B_NAVIGABLE);
    BTextView(BRect frame, const char* name, BRect textRect, const BFont* initialFont,
              const rgb_color* initialColor, uint32 resizingMode, uint32 flags = B_WILL_DRAW | B_NAVIGABLE);
    explicit BTextView(BMessage* archive);
    ~BTextView() override;

    static BArchivable* Instantiate(BMessage* archive);
    // Adds "_text" (string), "_trect" (BRect), "_max", "_align" (int32), "_tab" (float), "_sel" (two int32),
    // and "_noed", "_nosel", "_nowrap" (bool) where they are not the usual.
    status_t Archive(BMessage* archive, bool deep = true) const override;

    void AttachedToWindow() override;
    void DetachedFromWindow() override;
    void WindowActivated(bool active) override;
    void MakeFocus(bool focus = true) override;
    void TargetedByScrollView(BScrollView* scrollView) override;
    void FrameResized(float newWidth, float newHeight) override;
    void Pulse() override;
    void Draw(BRect updateRect) override;
    void MessageReceived(BMessage* message) override;
    void MouseDown(BPoint where) override;
    void MouseMoved(BPoint where, uint32 code, const BMessage* dragMessage) override;
    void MouseUp(BPoint where) override;
    void KeyDown(const char* bytes, int32 numBytes) override;
    void SetFont(const BFont* font, uint32 mask = B_FONT_ALL) override;
    void GetPreferredSize(float* width, float* height) override;

    // The caret goes to the beginning, and what was done cannot be undone. Null is the empty text.
    void SetText(const char* text);
    void SetText(const char* text, int32 length);
    // At the caret, or at `offset`. The caret stays where it is in the text; behind what is inserted at it.
    void Insert(const char* text);
    void Insert(const char* text, int32 length);
    void Insert(int32 offset, const char* text, int32 length);
    // The selection, or what lies between the offsets.
    void Delete();
    void Delete(int32 from, int32 to);
    // Valid until the text changes.
    const char* Text() const { return mText.c_str(); }
    int32 TextLength() const { return static_cast<int32>(mText.size()); }
    // Fills `length` bytes at most, and a terminator behind them.
    void GetText(int32 offset, int32 length, char* buffer) const;
    // 0 outside of the text.
    uint8 ByteAt(int32 offset) const;

    int32 CountLines() const { return mLayout.CountLines(); }
    // The caret's; the first line is 0.
    int32 CurrentLine() const { return mLayout.LineAt(mSelection.Caret()); }
    void GoToLine(int32 line);
    int32 LineAt(int32 offset) const { return mLayout.LineAt(offset); }
    int32 LineAt(BPoint point) const;
    // Where a line begins; the text's length for lines that there are not.
    int32 OffsetAt(int32 line) const;
    int32 OffsetAt(BPoint point) const;
    // The left top corner of a character.
    BPoint PointAt(int32 offset, float* height = nullptr) const;
    float LineWidth(int32 line = 0) const;
    float LineHeight(int32 line = 0) const;
    float TextHeight(int32 startLine, int32 endLine) const;
    void GetTextRegion(int32 startOffset, int32 endOffset, BRegion* region) const;
    virtual void FindWord(int32 offset, int32* from, int32* to);

    // An empty selection is the caret.
    virtual void Select(int32 startOffset, int32 endOffset);
    void SelectAll();
    void GetSelection(int32* start, int32* end) const;
    virtual void ScrollToOffset(int32 offset);
    void ScrollToSelection();

    // Text is exchanged as "text/plain". What cannot be edited is not cut, cleared or pasted into; a hidden
    // text is not copied.
    virtual void Cut(BClipboard* clipboard);
    virtual void Copy(BClipboard* clipboard);
    virtual void Paste(BClipboard* clipboard);
    void Clear();
    virtual bool AcceptsPaste(BClipboard* clipboard);
    virtual bool AcceptsDrop(const BMessage* message);
    // Takes back the latest change of the user's, or run of changes, again and again; Redo() the other way.
    virtual void Undo(BClipboard* clipboard);
    virtual void Redo();
    // What Undo() would take back; `isRedo` is always false.
    undo_state UndoState(bool* isRedo) const;

    void SetFontAndColor(const BFont* font, uint32 mask = B_FONT_ALL, const rgb_color* color = nullptr);
    void GetFontAndColor(BFont* font, rgb_color* color) const;
    void SetTextRect(BRect rect);
    BRect TextRect() const { return mTextRect; }
    void SetTabWidth(float width);
    float TabWidth() const { return mTabWidth; }
    void SetAlignment(alignment align);
    alignment Alignment() const { return mAlignment; }
    void SetWordWrap(bool wrap);
    bool DoesWordWrap() const { return mWrap; }
    void MakeEditable(bool editable = true);
    bool IsEditable() const { return mEditable; }
    void MakeSelectable(bool selectable = true);
    bool IsSelectable() const { return mSelectable; }
    void SetDoesUndo(bool undo);
    bool DoesUndo() const { return mUndoes; }
    // Shows a bullet for each character.
    void HideTyping(bool hidden);
    bool IsTypingHidden() const { return mHidden; }
    // A text that is too long is cut; what users enter ends where there is no more room.
    void SetMaxBytes(int32 max);
    int32 MaxBytes() const { return mMaxBytes; }
    // Code points that users cannot type, paste or drop. Other control characters than tabs and line feeds
    // never are; a disallowed line feed becomes a blank where it is pasted.
    void DisallowChar(uint32 codePoint);
    void AllowChar(uint32 codePoint);

  protected:
    // All changes of the text go through these; they do not select, scroll, or remember for Undo().
    virtual void InsertText(const char* text, int32 length, int32 offset);
    virtual void DeleteText(int32 from, int32 to);
    // After changes that the user has made, undoing included.
    virtual void UserChangedText();
    // The bounds without the margin that ScrollToOffset() leaves around the caret.
    bool ShowsFocus() const;

  private:
    struct Drag {
        bool active = false;
        int32 clicks = 1;
        // Whether keys go to it: the focus, in the active window.
        int32 from = 0;
        int32 to = 0;
    };
    typedef TextSelection::Anchor Anchor;
    typedef TextSelection::Step Step;

    void Initialise();
    void LayOut();
    std::vector<float> Advances(std::string_view text) const;
    std::string Shown(std::string_view text) const;
    float IndentOf(int32 line) const;
    int32 BoundaryAt(int32 offset) const;
    int32 LineCountOfPage() const;
    BRect CaretRect() const;
    void DrawLine(int32 line, float baseline);
    void DrawSelection(int32 line, BRect lineRect);
    void InvalidateText();
    void ShowCaret();
    void SelectionMoved();
    void FixupScrollBars();
    void CopyTo(BClipboard* clipboard) const;

    // What an input method is working on.
    void SetComposition(std::string text, int32 caret);
    void EndComposition() { SetComposition({}, 0); }
    float CompositionWidth(size_t bytes) const;
    // Draws the line that the composition is on.
    void DrawLineWithComposition(int32 line, float baseline);
    void DrawPiece(int32 from, int32 end, float left, float baseline);

    bool HandleMovement(char byte, uint32 modifiers);
    bool HandleErasing(char byte, uint32 modifiers);
    bool HandleClipboardKeys(char byte, uint32 modifiers);
    void Move(Step step, uint32 modifiers);
    std::string Allowed(std::string_view entered, int32 room) const;
    bool IsAllowed(uint32 codePoint) const;
    void ReplaceByUser(TextChange::Kind kind, int32 from, int32 to, std::string_view text);
    void Apply(int32 offset, const std::string& removed, const std::string& inserted);
    TextRange UnitAround(int32 offset, int32 clicks);
    void DragTo(BPoint where);

    std::string mText;
    TextLayout mLayout;
    TextSelection mSelection;
    TextHistory mHistory;
    BRect mTextRect;
    BScrollView* mScrollView = nullptr;
    std::set<uint32> mDisallowed;
    Drag mDrag;
    int32 mMaxBytes = INT32_MAX;
    float mTabWidth = 28;
    alignment mAlignment = B_ALIGN_LEFT;
    bool mWrap = true;
    bool mEditable = true;
    bool mSelectable = true;
    bool mUndoes = true;
    bool mHidden = false;
    std::string mComposition;
    size_t mCompositionCaret = 0; // bytes from its beginning
    bool mCaretShown = true;
    bigtime_t mCaretMoved = 0; // when it was last shown for sure
};
