// BListView: a list of rows of which one or several can be selected.
#pragma once

#include <Invoker.h>
#include <List.h>
#include <ListItem.h>
#include <View.h>

#include <memory>

class BMessageRunner;
class BScrollView;
class RowPositions;

enum list_view_type { B_SINGLE_SELECTION_LIST, B_MULTIPLE_SELECTION_LIST };

// Rows lie below each other without a gap; one of height h (rounded up) covers h + 1 pixels, as rectangles
// do. A row reaches from 0 to the right edge of the view. The list never owns its rows and never deletes
// them. Indices run from 0 to CountItems() - 1; a method that is given another index answers null, false or
// -1 and changes nothing.
//
// Rows are selected through the list, not through BListItem::Select(). Each change of the selection calls
// SelectionChanged() and sends the selection message; invoking (a double click, Return, Space) sends the
// invocation message. Both carry, beside what BInvoker adds, "source" (pointer), "be:sender" (messenger) and
// an "index" (int32) for each selected row. A list without a target sends to the window it is added to.
//
// The list keeps the range of a vertical scroll bar up to date; the horizontal one is left to its maker.
//
// Mouse and keys: a click selects; in multiple-selection lists Control toggles and Shift extends from the row
// last selected. Arrows, Page Up and Down, Home and End move the selection, with Shift they extend it, with
// Control they move only the row that Control-Space toggles. Where a drag is not taken up (InitiateDrag()),
// the selection follows the pointer, and past the upper or lower edge the list scrolls, the faster the
// farther. Thread rule: that of BView.
class BListView : public BView, public BInvoker {
  public:
    BListView(BRect frame, const char* name, list_view_type type = B_SINGLE_SELECTION_LIST,
              uint32 resizingMode = B_FOLLOW_LEFT | B_FOLLOW_TOP,
              uint32 flags = B_WILL_DRAW | B_FRAME_EVENTS | B_NAVIGABLE);
    // From what Archive() wrote; missing fields take the values of a new list. The rows in it become the
    // caller's.
    explicit BListView(BMessage* archive);
    // Does not touch the rows, which may be gone already.
    ~BListView() override;

    static BArchivable* Instantiate(BMessage* archive);
    // Adds "_lv_type" (int32), "_msg" and "_2nd_msg" (the invocation and the selection message) where there
    // are any, and deep, the rows' archives "_l_items".
    status_t Archive(BMessage* archive, bool deep = true) const override;

    void AttachedToWindow() override;
    void DetachedFromWindow() override;
    void WindowActivated(bool active) override;
    void TargetedByScrollView(BScrollView* scrollView) override;
    void FrameResized(float newWidth, float newHeight) override;
    void Draw(BRect updateRect) override;
    // B_SELECT_ALL selects all rows of a multiple-selection list.
    void MessageReceived(BMessage* message) override;
    void MakeFocus(bool focus = true) override;
    void MouseDown(BPoint where) override;
    void MouseMoved(BPoint where, uint32 code, const BMessage* dragMessage) override;
    void MouseUp(BPoint where) override;
    void KeyDown(const char* bytes, int32 numBytes) override;
    // Every row learns of it and may change its size; but not of a font that is set while the window is drawn
    // anew, which is one row's own.
    void SetFont(const BFont* font, uint32 mask = B_FONT_ALL) override;
    void ScrollTo(float x, float y) { ScrollTo(BPoint(x, y)); }
    void ScrollTo(BPoint where) override;
    void GetPreferredSize(float* width, float* height) override;

    // A row joins at the end, or before the one at `index`; `index` may be CountItems(). False for null.
    virtual bool AddItem(BListItem* item);
    virtual bool AddItem(BListItem* item, int32 index);
    // The list keeps being the caller's.
    virtual bool AddList(BList* items);
    virtual bool AddList(BList* items, int32 index);
    // What is removed is no longer selected and the caller's to delete.
    virtual bool RemoveItem(BListItem* item);
    virtual BListItem* RemoveItem(int32 index);
    virtual bool RemoveItems(int32 index, int32 count);
    // Does not touch the rows, which may be gone already; SelectionChanged() is not called.
    virtual void MakeEmpty();

    bool SwapItems(int32 a, int32 b);
    // Takes a row out and puts it back so that it ends up at `to`.
    bool MoveItem(int32 from, int32 to);
    // The old row is the caller's to delete.
    bool ReplaceItem(int32 index, BListItem* item);
    // The function is given pointers to two BListItem pointers. Rows that compare equal keep their order;
    // selected rows stay selected.
    void SortItems(int (*compare)(const void* first, const void* second));
    // Calls the function for each row until it answers true.
    void DoForEach(bool (*function)(BListItem* item));
    void DoForEach(bool (*function)(BListItem* item, void* argument), void* argument);

    BListItem* ItemAt(int32 index) const;
    BListItem* FirstItem() const;
    BListItem* LastItem() const;
    int32 IndexOf(BListItem* item) const;
    // The row under a point of the view, whose distance from the left does not matter; -1 below the last.
    int32 IndexOf(BPoint point) const;
    bool HasItem(BListItem* item) const;
    int32 CountItems() const;
    bool IsEmpty() const;
    // Valid until the list changes; null when it is empty.
    const BListItem** Items() const;
    // Invalid (0, 0, -1, -1) for an index out of range.
    BRect ItemFrame(int32 index);
    void InvalidateItem(int32 index);

    // `extend` keeps what is selected already; in a single-selection list it means nothing. A range's ends
    // are brought into the list, and a single-selection list selects its first row.
    void Select(int32 index, bool extend = false);
    void Select(int32 from, int32 to, bool extend = false);
    void Deselect(int32 index);
    void DeselectAll();
    void DeselectExcept(int32 exceptFrom, int32 exceptTo);
    bool IsItemSelected(int32 index) const;
    // The index of the first, second, .. selected row, -1 when there are fewer.
    int32 CurrentSelection(int32 index = 0) const;
    // Brings the first selected row into view.
    void ScrollToSelection();
    virtual void SelectionChanged();

    virtual void SetListType(list_view_type type);
    list_view_type ListType() const { return mType; }
    // Take the message over.
    virtual void SetSelectionMessage(BMessage* message);
    virtual void SetInvocationMessage(BMessage* message);
    BMessage* SelectionMessage() const { return mSelectionMessage.get(); }
    BMessage* InvocationMessage() const { return Message(); }
    // 0 when there is none.
    uint32 SelectionCommand() const;
    uint32 InvocationCommand() const { return Command(); }
    status_t Invoke(BMessage* message = nullptr) override;

    // Called when the mouse is dragged from a row with its button held. A subclass that starts a drag answers
    // true. `wasSelected`: before the button went down.
    virtual bool InitiateDrag(BPoint where, int32 index, bool wasSelected);

  protected:
    enum MiscCode { B_NO_OP, B_REPLACE_OP, B_MOVE_OP, B_SWAP_OP };
    union MiscData {
        struct Replace {
            int32 index;
            BListItem* item;
        } replace;
        struct Move {
            int32 from;
            int32 to;
        } move;
        struct Swap {
            int32 a;
            int32 b;
        } swap;
    };
    // What SwapItems(), MoveItem() and ReplaceItem() go through.
    virtual bool DoMiscellaneous(MiscCode code, MiscData* data);
    virtual void DrawItem(BListItem* item, BRect frame, bool complete = false);

  private:
    // A mouse button that went down on a row and has not come up.
    struct Press {
        int32 row = -1;
        BPoint where;
        bool wasSelected = false;
        bool dragWasOffered = false;
        // The row becomes the only selected one when the button comes up without a drag.
        bool selectsOnRelease = false;
        // The selection follows the pointer, which was last over (or nearest to) this row.
        bool follows = false;
        int32 followedRow = -1;
        uint32 modifiers = 0;
        // From the left top corner of what shows, which the pointer does not leave when the list scrolls.
        BPoint pointer;
    };

    void InsertRows(int32 index, const BList& rows);
    bool RemoveRows(int32 index, int32 count);
    void UpdateAllRows();
    void TakeHeightFromRow(int32 index);
    void RebuildPositions();
    void InvalidateFrom(int32 index);
    void FixupScrollBar();
    BListItem* RowAt(int32 index) const;

    bool HasSelection() const { return mFirstSelected <= mLastSelected; }
    bool SetSelected(int32 from, int32 to, bool selected);
    bool DeselectOutside(int32 from, int32 to);
    void WidenSelectionBounds(int32 from, int32 to);
    void TightenSelectionBounds();
    void ForgetSelectionCount() const { mCountedOrdinal = -1; }
    void SelectionHasChanged();

    void PressRow(int32 row, uint32 modifiers);
    void EndPress();
    void FollowPointer();
    void SelectFollowed(int32 row);
    // Scrolls on as long as the pointer is past an edge and there is anything left there.
    void StartOrStopAutoscroll();
    void Autoscroll();
    float AutoscrollTarget() const;
    void SelectFromAnchorTo(int32 row, bool extend);
    void MoveCursor(int32 row, uint32 modifiers);
    void SetCursor(int32 row, bool shown);
    int32 RowToMoveFrom() const;
    int32 NextEnabledRow(int32 from, int32 step) const;
    int32 RowOnePageFrom(int32 row, int32 direction);
    void ScrollToRow(int32 index);

    list_view_type mType = B_SINGLE_SELECTION_LIST;
    BList mItems;
    std::unique_ptr<RowPositions> mPositions;
    std::unique_ptr<BMessage> mSelectionMessage;
    BScrollView* mScrollView = nullptr;
    // All selected rows lie between these; last < first when there are none.
    int32 mFirstSelected = 0;
    int32 mLastSelected = -1;
    // Where range selections start, and where keys move from; -1 for none.
    int32 mAnchor = -1;
    int32 mCursor = -1;
    bool mCursorShown = false;
    Press mPress;
    std::unique_ptr<BMessageRunner> mAutoscroller;
    // The row that CurrentSelection() found last, so that walking through the selection is linear.
    mutable int32 mCountedOrdinal = -1;
    mutable int32 mCountedRow = -1;
    // Where IndexOf() found its last row; the next one mostly lies near it.
    mutable int32 mLastFound = 0;
};
