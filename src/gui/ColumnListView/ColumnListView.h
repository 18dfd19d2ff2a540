// ColumnListView: a list of rows in columns, flat or as an outline.
#pragma once

#include "gui/ColumnListView/CLVColumn.h"
#include "gui/ColumnListView/CLVListItem.h"
#include "gui/ColumnListView/OutlineRows.h"
#include "gui/ColumnListView/RowOrder.h"

#include <List.h>
#include <ListView.h>

#include <memory>
#include <vector>

class BetterScrollView;
class CLVColumnLabelView;
class CLVContainerView;
class PrefilledBitmap;

// Columns have an index, in the order in which they were added, and a place in the display order. In a
// hierarchical list, rows have an index in the full list, every row in outline order, and, where no collapsed
// row hides them, one in the BListView, whose operations (selection, ItemAt(), IndexOf(), CurrentSelection())
// see the visible rows alone. In a flat list all rows are visible and both indices are the same.
//
// A row is visible when its super-row, the nearest before it of a smaller level, is visible and expanded;
// this is looked at when the row is added and when rows above it are expanded or collapsed. Rows that come to
// be hidden are no longer selected.
//
// Rows keep their places in whole numbers, but frames and points are floats, which above 16 777 216 pixels
// (some 800 000 rows of 20) know even numbers only. So down there, up to twice that height, a row's frame may
// lie one pixel off and a click on the border of two rows may mean the other one; nothing adds up.
//
// The columns are the list's, the rows the application's, removed or not. A row is in one list, once. Methods
// that refuse answer false or null and change nothing.
//
// Thread rule: that of BView; each method stops the program with "The looper must be locked." when the list
// is in a window that nobody has locked.
class ColumnListView : public BListView {
  public:
    // The frame is that of header and list together; bars and border lie around it. What is added to a window
    // is the container, which is handed out here and owns the list. `resizing_mode` is the container's.
    ColumnListView(BRect frame, CLVContainerView** container_out, const char* name,
                   uint32 resizing_mode = B_FOLLOW_LEFT | B_FOLLOW_TOP,
                   uint32 flags = B_WILL_DRAW | B_FRAME_EVENTS | B_NAVIGABLE,
                   list_view_type type = B_SINGLE_SELECTION_LIST, bool hierarchical = false,
                   bool horizontal = true, bool vertical = true, bool scroll_view_corner = true,
                   border_style border = B_NO_BORDER, const BFont* label_font = be_plain_font);
    ~ColumnListView() override;

    void AttachedToWindow() override;
    void SetFont(const BFont* font, uint32 mask = B_FONT_ALL) override;
    // What a row has changed of its height by itself counts from here on.
    void Draw(BRect update_rect) override;
    // On the arrow of a super-row it expands or collapses, and does nothing else.
    void MouseDown(BPoint where) override;
    // In an outline with one row selected, the right arrow key expands a super-row and goes on to the first
    // row below it, the left one collapses it and goes on to its super-row. Otherwise they scroll sideways.
    void KeyDown(const char* bytes, int32 numBytes) override;
    void FrameResized(float new_width, float new_height) override;
    using BListView::ScrollTo;
    void ScrollTo(BPoint where) override;

    // At the end; or, hierarchical, before the row at `full_index` of the full list. False for what is no
    // CLVListItem or is in a list already.
    bool AddItem(BListItem* item) override;
    bool AddItem(BListItem* item, int32 full_index) override;
    // One after the other, until one is refused; those before it stay. All must be CLVListItems.
    bool AddList(BList* items) override;
    bool AddList(BList* items, int32 full_index) override;
    // Hierarchical, these remove whole subtrees, by indices of the full list: the run is extended over all
    // rows that follow it and are deeper than the shallowest in it.
    bool RemoveItem(BListItem* item) override;
    BListItem* RemoveItem(int32 full_index) override;
    bool RemoveItems(int32 full_index, int32 count) override;
    // Does not touch the rows, which may be gone already.
    void MakeEmpty() override;

    // Refused: a column that is in a list already, a second expander, an expander for a flat list.
    virtual bool AddColumn(CLVColumn* column);
    // All of them or none. The BList stays the caller's.
    virtual bool AddColumnList(BList* columns);
    // What is removed is the caller's again.
    virtual bool RemoveColumn(CLVColumn* column);
    // `count` columns in order of addition. Only `first` leaves the sort keys, the others stay there on
    // purpose: who removes several sort keys calls SetSortKey(-1) before.
    virtual bool RemoveColumns(CLVColumn* first, int32 count);
    // `order`: for each place from the left, the index of a column. False at the first index that is out of
    // range or comes twice: the display order then holds what stands before it and is not laid out, on
    // purpose; it is for the caller to pass every column once.
    virtual bool SetDisplayOrder(const int32* order);
    // Called when a column's width has changed, and when columns have changed places. They tell the rows, for
    // columns with CLV_COLUMN_TELL_ITEMS_WIDTH.
    virtual void ColumnWidthChanged(int32 column_index, float new_width);
    virtual void DisplayOrderChanged(const int32* order);
    // Sort keys; ignored for columns without CLV_COLUMN_SORTABLE. SetSortKey() makes the column the only key,
    // -1 leaves none. AddSortKey() adds it as the last. Either turns a mode of none into ascending.
    virtual void SetSortKey(int32 column_index);
    virtual void AddSortKey(int32 column_index);
    // CLV_SORT_NONE drops the key; another mode does not add one.
    virtual void SetSortMode(int32 column_index, CLVSortMode mode);
    // Called after each change of keys or modes; does nothing.
    virtual void SortingChanged();
    // Hierarchical: as the super-row's last row, one level deeper.
    virtual bool AddUnder(BListItem* item, BListItem* superitem);
    // Any row becomes a super-row by these, on purpose.
    virtual void Expand(CLVListItem* item);
    virtual void Collapse(CLVListItem* item);
    // Called by the constructor.
    virtual CLVContainerView* CreateContainer(bool horizontal, bool vertical, bool scroll_view_corner,
                                              border_style border, uint32 resizing_mode, uint32 flags);

    int32 CountColumns() const;
    int32 IndexOfColumn(CLVColumn* column) const;
    CLVColumn* ColumnAt(int32 column_index) const;
    // An array of CountColumns() column indices, the caller's to delete[]. -1 stands for places that a
    // refused SetDisplayOrder() has left without a column.
    int32* DisplayOrder() const;

    // Null for none: then nothing is ever reordered.
    void SetSortFunction(CLVCompareFuncPtr compare);
    // Ascending, descending, none, and again; through SetSortMode().
    void ReverseSortMode(int32 column_index);
    // Rows that compare equal come out in the order that an exchange sort gives them (hierarchical), or keep
    // theirs (flat). A row takes all rows below it along.
    void SortItems();
    // How many keys there are; fills in column index and mode of each, the first key first. Null for what is
    // not wanted. A key that RemoveColumns() has left there is no column any more: -1 and CLV_SORT_NONE.
    int32 Sorting(int32* keys, CLVSortMode* modes) const;
    void SetSorting(int32 count, int32* keys, CLVSortMode* modes);

    CLVListItem* FullListItemAt(int32 full_index) const;
    int32 FullListIndexOf(const CLVListItem* item) const;
    // Of the visible row under the point; -1 when there is none.
    int32 FullListIndexOf(BPoint point) const;
    CLVListItem* FullListFirstItem() const;
    CLVListItem* FullListLastItem() const;
    bool FullListHasItem(const CLVListItem* item) const;
    int32 FullListCountItems() const;
    bool FullListIsEmpty() const;
    // The full-list index of the first, second, .. selected row; -1 when there are fewer.
    int32 FullListCurrentSelection(int32 index = 0) const;
    // Calls the function for each row until it answers true. What it adds or takes away moves the others.
    void FullListDoForEach(bool (*function)(CLVListItem* item));
    void FullListDoForEach(bool (*function)(CLVListItem* item, void* argument), void* argument);
    // Null for a row of the top level, an unknown row, or in a flat list.
    CLVListItem* Superitem(const CLVListItem* item) const;
    // All rows below it, of all levels.
    int32 FullListNumberOfSubitems(const CLVListItem* item) const;
    // False for an index out of range.
    bool IsExpanded(int32 full_index) const;
    bool IsHierarchical() const { return mHierarchical; }
    // No collapsed row hides it. In a flat list, it is in it.
    bool IsVisible(const CLVListItem* item) const;
    // In the BListView, without a walk; -1 when it is not visible.
    int32 VisibleIndexOf(const CLVListItem* item) const;

    void AssertWindowLocked() const;
    CLVContainerView* Container() const { return mContainer; }

    // For the columns, rows and header of this list.
    const BList& Columns() const { return mColumns; }
    const BList& ColumnsInDisplayOrder() const { return mDisplayOrder; }
    // Of one column that is a sort key with a mode other than none, or not.
    bool IsSortKey(const CLVColumn* column) const;
    // It is among the keys, whatever its mode.
    bool IsInSortKeys(const CLVColumn* column) const;
    CLVColumn* PrimarySortKey() const;
    CLVColumnLabelView* HeaderView() const { return mHeaderView; }
    const PrefilledBitmap& RightArrow() const { return *mRightArrow; }
    const PrefilledBitmap& DownArrow() const { return *mDownArrow; }
    // -1 when there is none that is shown.
    int32 ExpanderColumn() const { return mExpanderColumn; }
    void SetExpanderColumn(int32 column_index) { mExpanderColumn = column_index; }
    // Lays the columns out, and the data rectangle with them; `scroll_bars`: what shows may be scrolled back.
    void UpdateColumnSizesDataRectSizeScrollBars(bool scroll_bars);
    // The display order was changed by the header: lays out, and tells the rows.
    void ReplaceDisplayOrder(const BList& order);

  protected:
    // A hierarchical list's rows are not swapped, moved or replaced one by one.
    bool DoMiscellaneous(MiscCode code, MiscData* data) override;

  private:
    void EmbedInContainer(bool horizontal, bool vertical, bool scroll_view_corner, border_style border,
                          uint32 resizing_mode, uint32 flags);
    void ColumnsChanged();
    bool AddColumns(const BList& columns);
    void ForgetColumns(int32 index, int32 count);
    void UpdateDataRect(bool scroll_bars);
    float DataHeight();
    void InvalidateShifted(const CLVColumn& column, float limit);
    void InvalidateHeaderOf(const CLVColumn* column);

    static bool CanAdd(const BListItem* item);
    static size_t CountAddable(const std::vector<CLVListItem*>& rows);
    bool IsToBeSeen(int32 full_index, uint32 level) const;
    std::vector<OutlineRows::NewRow> WithVisibility(const std::vector<CLVListItem*>& rows,
                                                    int32 full_index) const;
    bool AddItemPrivate(CLVListItem* item, int32 full_index);
    bool RemoveRun(int32 full_index, int32 count);
    std::vector<CLVListItem*> AllRows() const;

    void SetExpanded(CLVListItem* item, bool expanded);
    void ShowRowsBelow(const CLVListItem* item);
    bool HideRowsBelow(const CLVListItem* item);
    CLVListItem* OnlySelectedItem() const;
    bool GoDownTheOutline();
    bool GoUpTheOutline();

    void UseAsSortKey(CLVColumn* column);
    void InvalidateSortKeyHeaders();
    RowOrder OrderBySortKeys() const;

    BList mColumns;        // CLVColumn
    BList mDisplayOrder;   // CLVColumn
    BList mSortKeys;       // CLVColumn, the primary key first
    OutlineRows mFullList; // of a flat list, what is in the BListView
    std::unique_ptr<PrefilledBitmap> mRightArrow;
    std::unique_ptr<PrefilledBitmap> mDownArrow;
    bool mHierarchical;
    // Both belong to the container.
    CLVColumnLabelView* mHeaderView = nullptr;
    CLVContainerView* mContainer = nullptr;
    int32 mExpanderColumn = -1;
    CLVCompareFuncPtr mSortFunction = nullptr;
    float mDataWidth = 0;
};
