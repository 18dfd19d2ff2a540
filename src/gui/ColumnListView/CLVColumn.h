// CLVColumn: one column of a ColumnListView.
#pragma once

#include <Rect.h>
#include <SupportDefs.h>

#include <string>

class BView;
class ColumnListView;

enum CLVSortMode { CLV_SORT_ASCENDING, CLV_SORT_DESCENDING, CLV_SORT_NONE };

enum : unsigned long {
    CLV_COLUMN_SORTABLE = 0x0001,
    // Where columns stand that may be dragged by their header.
    CLV_COLUMN_NOT_MOVABLE = 0x0002,
    CLV_COLUMN_NOT_RESIZABLE = 0x0004,
    // A drag group of such columns alone stays before, or behind, all others.
    CLV_COLUMN_LOCK_AT_START = 0x0008,
    CLV_COLUMN_LOCK_AT_END = 0x0010,
    CLV_COLUMN_HIDDEN = 0x0020,
    // The header shows the cell as one with that of the next shown column.
    CLV_COLUMN_MERGE_WITH_RIGHT = 0x0040,
    // Moves together with the next column in the display order.
    CLV_COLUMN_LOCK_WITH_RIGHT = 0x0080,
    // Holds the arrows that expand and collapse rows.
    CLV_COLUMN_EXPANDER = 0x0100,
    // Pushed by the expander, it pushes the next column too.
    CLV_COLUMN_PUSH_PASS = 0x0200,
    // The header shortens the label to fit.
    CLV_COLUMN_HEADER_TRUNCATE = 0x0400,
    // The rows are told when their cells change in width or place.
    CLV_COLUMN_TELL_ITEMS_WIDTH = 0x0800
};

// Made by the application and handed to a list with AddColumn(), whose it then is: the list deletes it,
// unless RemoveColumn() has given it back. Until then it only stores what it is told; afterwards every change
// shows at once, and needs the list's window locked ("The looper must be locked." otherwise). Widths are in
// pixels.
class CLVColumn {
  public:
    // The label is copied; null for none. A minimum below 4 becomes 4, a width below the minimum becomes the
    // minimum. An expander has no label, is 20 pixels wide, and keeps of these flags only
    // CLV_COLUMN_NOT_MOVABLE, CLV_COLUMN_LOCK_AT_START, CLV_COLUMN_HIDDEN and CLV_COLUMN_LOCK_WITH_RIGHT; it
    // is never resizable and always merged with the column to its right.
    CLVColumn(const char* label, float width, unsigned long flags, float min_width);
    // Leaves its list first.
    virtual ~CLVColumn();
    CLVColumn(const CLVColumn&) = delete;
    CLVColumn& operator=(const CLVColumn&) = delete;

    float Width() const { return mWidth; }
    float MinWidth() const { return mMinWidth; }
    // What lies to its right moves along. A width below the minimum becomes the minimum.
    virtual void SetWidth(float new_width);
    // Shortens the label for a column of this width; answers the part of the header that changes with it,
    // (-1, -1, -1, -1) when none does or the header was never drawn.
    BRect TruncateText(float column_width);
    unsigned long Flags() const { return mFlags; }
    bool IsShown() const { return (mFlags & CLV_COLUMN_HIDDEN) == 0; }
    void SetShown(bool shown);
    CLVSortMode SortMode() const { return mSortMode; }
    // In a list this goes through its SetSortMode().
    void SetSortMode(CLVSortMode mode);

    // The whole label; null when there is none.
    const char* GetLabel() const { return mHasLabel ? mLabel.c_str() : nullptr; }
    // As it was last shortened; null when there is no label.
    const char* TruncatedLabel() const { return mHasLabel ? mTruncatedLabel.c_str() : nullptr; }
    // Null when it is in no list.
    ColumnListView* GetParent() const { return mParent; }
    BView* GetHeaderView() const;

    // `sort_key`: the rows are sorted by it, which underlines the label. `pressed`: the mouse holds it.
    // `font_ascent`: of the header's font, in pixels.
    virtual void DrawColumnHeader(BView* view, BRect header_rect, bool sort_key, bool pressed,
                                  float font_ascent);

    // Where it lies in the list, as long as it is in one and shown; both edges belong to it.
    float ColumnBegin() const { return mColumnBegin; }
    float ColumnEnd() const { return mColumnEnd; }
    bool IsPushedByExpander() const { return mPushedByExpander; }
    bool IsExpander() const { return (mFlags & CLV_COLUMN_EXPANDER) != 0; }
    // Where the header was last drawn, and has been moved since; (-1, -1, -1, -1)
    // when never.
    BRect HeaderFrame() const { return mHeaderFrame; }

    // For the list's layout alone.
    void SetColumnSpan(float begin, float end);
    void SetPushedByExpander(bool pushed) { mPushedByExpander = pushed; }
    // For the list alone: adopts and gives back; stores a sort mode without sorting.
    void SetParent(ColumnListView* parent) { mParent = parent; }
    void StoreSortMode(CLVSortMode mode) { mSortMode = mode; }

  private:
    void ShowWidthChange(float growth);
    void InvalidatePushedCells();

    std::string mLabel;
    std::string mTruncatedLabel;
    bool mHasLabel = false;
    BRect mHeaderFrame = BRect(-1, -1, -1, -1);
    float mWidth;
    float mMinWidth;
    float mColumnBegin = 0;
    float mColumnEnd = 0;
    unsigned long mFlags;
    bool mPushedByExpander = false;
    CLVSortMode mSortMode = CLV_SORT_NONE;
    ColumnListView* mParent = nullptr;
};
