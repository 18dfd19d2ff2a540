// CLVColumnLabelView: the header of a ColumnListView.
#pragma once

#include "gui/ColumnListView/DragGroups.h"

#include <OS.h>
#include <View.h>

class CLVColumn;
class ColumnListView;
struct HeaderCell;

// Shows a cell for each shown column. A click sorts by the column, a shift-click adds a sort key or reverses
// it, a label that is dragged moves its group of columns, a cell's border that is dragged changes its width.
// A border is taken two pixels to its left and right. While a button is held, the view follows it through the
// messages of a mouse watcher. Made by the list. Thread rule: that of BView.
class CLVColumnLabelView : public BView {
  public:
    // The parent must live as long as the header.
    CLVColumnLabelView(BRect frame, ColumnListView* parent, const BFont* font);

    void Draw(BRect update_rect) override;
    void MouseDown(BPoint where) override;
    void MessageReceived(BMessage* message) override;

    // The columns were laid out anew. A gesture goes on where its column now is, or ends with it.
    void UpdateDragGroups();
    // A gesture that is at work ends without effect; called when columns come or go.
    void CancelGesture();
    // Has a column's cell drawn again.
    void InvalidateColumn(const CLVColumn* column);

  private:
    // What a gesture needs to know of the group that it drags; ends it where there is none to drag.
    void SetSnapMinMax();
    // `left`: of the two groups that change places.
    void ShiftDragGroup(int32 new_index, float left);

    CLVColumn* ColumnAt(float x) const;
    // The nearest shown column to the left; null when there is none.
    CLVColumn* ShownColumnBefore(const CLVColumn* column) const;
    void PressLabel(CLVColumn* column, BPoint where);
    void PressResizeHandle(CLVColumn* column, BPoint where);
    bool WatchMouse();
    void DragLabelTo(float x);
    void ResizeTo(float x);
    void Release(uint32 modifierKeys);
    void ClickColumn(CLVColumn* column, uint32 modifierKeys);
    void EndGesture();
    void ForgetGesture();

    void ShiftWhilePointerIsBeyond(float x);
    void InvalidateOutline(float left, float right);
    void InvalidateLastOutline();
    void InvalidateRightBorder(const CLVColumn* column);
    // Where the outline of the dragged group is drawn for the pointer at x.
    float OutlineLeftFor(float x) const;

    void DrawCell(const HeaderCell& cell);
    void DrawDragOutline();

    float mFontAscent;
    const BList* mDisplayOrder; // the list's own
    CLVColumn* mColumnClicked = nullptr;
    BPoint mPreviousMousePos;
    BPoint mMouseClickPos;
    bool mColumnDragging = false;
    bool mColumnResizing = false;
    DragGroups mDragGroups;
    DragLimits mDragLimits;
    // From the dragged group's left edge, or the resized column's right one, to the pointer when it went
    // down.
    float mDragBoxOffset = 0;
    float mResizeOffset = 0;
    // Where the outline was last drawn; -1 when it was not.
    float mPrevDragOutlineLeft = -1;
    float mPrevDragOutlineRight = -1;
    // Follows the mouse; -1 when none does, though one that has yet to end is not counted.
    thread_id mWatcher = -1;
    ColumnListView* mParent;
};
