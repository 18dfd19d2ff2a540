// CLVColumnLabelView: the header of a ColumnListView.
#pragma once

#include "gui/ColumnListView/DragGroups.h"

#include <View.h>

class CLVColumn;
class ColumnListView;

// Shows a cell for each shown column. A click sorts by the column, a shift-click adds a sort key or reverses
// it, a label that is dragged moves its group of columns, a cell's border that is dragged changes its width.
// A border is taken two pixels to its left and right. While a button is held, the view follows it through the
// messages of a mouse watcher. Made by the list. Thread rule: that of BView.
class CLVColumnLabelView : public BView {
  public:
    CLVColumnLabelView(BRect frame, ColumnListView* parent, const BFont* font);

    void Draw(BRect update_rect) override;
    void MouseDown(BPoint where) override;
    void MessageReceived(BMessage* message) override;

    // The columns were laid out anew.
    void UpdateDragGroups();
    // A gesture that is at work ends without effect; called when columns come or go.
    void CancelGesture();
    // Has a column's cell drawn again.
    void InvalidateColumn(const CLVColumn* column);

  private:
    // What a gesture needs to know of the group that it drags.
    void SetSnapMinMax();
    void ShiftDragGroup(int32 new_index);

    CLVColumn* ColumnAt(float x) const;
    // The nearest shown column to the left; null when there is none.
    CLVColumn* ShownColumnBefore(const CLVColumn* column) const;
    void PressLabel(CLVColumn* column, BPoint where);
    void PressResizeHandle(CLVColumn* column, BPoint where);
    void DragLabelTo(BPoint where);
    void ResizeTo(float x);
    void Release(uint32 modifiers);
    void ClickColumn(uint32 modifiers);
    void EndGesture();

    void ShiftWhilePointerIsBeyond(float x);
    void InvalidateShift(float left);
    void InvalidateOutline(float left, float right);
    // Where the outline of the dragged group is drawn for the pointer at x.
    float OutlineLeftFor(float x) const;

    void DrawCells(BRect update_rect);
    void DrawEmptyHeader();
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
    ColumnListView* mParent;
};
