// CLVListItem: a row of a ColumnListView.
#pragma once

#include "gui/ColumnListView/OutlinePlace.h"

#include <ListItem.h>

class ColumnListView;

// Knows its level in the outline, draws itself cell by cell, and the arrow that expands or collapses it. It
// belongs to the application, which deletes it once no list shows it; it can be in one list at a time. Thread
// rule: that of BListItem.
class CLVListItem : public BListItem {
  public:
    // `level` 0 is topmost. A super-row may have rows below it and shows an arrow. The row is never lower
    // than `minheight` pixels.
    CLVListItem(uint32 level, bool superitem, bool expanded, float minheight);
    ~CLVListItem() override;

    bool IsSuperItem() const { return mSuperItem; }
    void SetSuperItem(bool superitem) { mSuperItem = superitem; }
    uint32 OutlineLevel() const { return mOutlineLevel; }
    // In a list, the row keeps its place; its super-row is the nearest above it of a smaller level.
    void SetOutlineLevel(uint32 level);

    // The row's cell in the owner's coordinates; invalid (-1, -1, -1, -1) when row or column are not to be
    // seen, or no place is left for the cell.
    BRect ItemColumnFrame(int32 column_index, ColumnListView* owner);
    // How far the cell is moved, or the expander's grows, for the row's level.
    float ExpanderShift(int32 column_index, ColumnListView* owner) const;

    void DrawItem(BView* owner, BRect item_rect, bool complete = false) override;
    void Update(BView* owner, const BFont* font) override;
    // Draws one cell; column_index -1 is what is left to the right of the last. Without `complete` the
    // background has been cleared.
    virtual void DrawItemColumn(BView* owner, BRect column_rect, int32 column_index, bool complete) = 0;
    // For columns with CLV_COLUMN_TELL_ITEMS_WIDTH: its cell has got this width; or this frame, invalid where
    // it is not to be seen. The base class does nothing.
    virtual void ColumnWidthChanged(int32 column_index, float column_width, ColumnListView* owner);
    virtual void FrameChanged(int32 column_index, BRect new_frame, ColumnListView* owner);

    // Where the arrow, and the expander's cell, were last drawn; invalid (-1, -1, -1, -1) when they were not.
    BRect ExpanderButtonRect() const { return mExpanderButtonRect; }
    BRect ExpanderColumnRect() const { return mExpanderColumnRect; }
    // Where the arrow is now: when columns are resized, what was drawn is moved. Invalid for none.
    BRect ArrowFrame(ColumnListView* owner);
    // Draws the expander's cell and the arrow over it at once, where they are now. For the list.
    void RedrawExpander(ColumnListView* owner);

    // For the list's bookkeeping alone.
    OutlinePlace& PlaceInOutline() { return mPlace; }
    const OutlinePlace& PlaceInOutline() const { return mPlace; }

  protected:
    // From the row's top to the baseline of a text in the middle of its height, in the system's plain font,
    // whatever the list's.
    float CenteredBaseline() const;

  private:
    // `end`: where the expander's cell would end if nothing cut it off.
    BRect ArrowIn(BRect cell, float end) const;
    void DrawArrow(ColumnListView* list, BRect cell, float end);

    bool mSuperItem;
    uint32 mOutlineLevel;
    float mMinHeight;
    BRect mExpanderButtonRect = BRect(-1, -1, -1, -1);
    BRect mExpanderColumnRect = BRect(-1, -1, -1, -1);
    OutlinePlace mPlace;
};
