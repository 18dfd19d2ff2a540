// CLVEasyItem: a row whose cells hold a text or a bitmap each.
#pragma once

#include "gui/ColumnListView/CLVListItem.h"

#include <memory>
#include <vector>

class BBitmap;

// Cells without content are empty. Thread rule: that of BListItem.
class CLVEasyItem : public CLVListItem {
  public:
    CLVEasyItem(uint32 level, bool superitem, bool expanded, float minheight);
    ~CLVEasyItem() override;

    // The text is copied; null or "" empties the cell. `truncate` has it shortened with an ellipsis to the
    // cell's width; otherwise it is cut off there. Shows when the row is next drawn.
    virtual void SetColumnContent(int column_index, const char* text, bool truncate = true);
    // Null empties the cell. The picture is drawn `horizontal_offset` pixels (rounded) right of the cell's
    // left edge. With `copy` the row keeps a copy of its own; otherwise the picture must outlive its place
    // here.
    virtual void SetColumnContent(int column_index, const BBitmap* bitmap, float horizontal_offset = 2.0F,
                                  bool copy = true);
    // The whole text, null when the cell holds none; the same for a picture. The row's, until the cell's
    // content changes.
    const char* GetColumnContentText(int column_index) const;
    const BBitmap* GetColumnContentBitmap(int column_index) const;

    void Update(BView* owner, const BFont* font) override;
    void DrawItemColumn(BView* owner, BRect column_rect, int32 column_index, bool complete) override;
    void ColumnWidthChanged(int32 column_index, float column_width, ColumnListView* owner) override;
    void FrameChanged(int32 column_index, BRect new_frame, ColumnListView* owner) override;

    // For ColumnListView::SetSortFunction(): by the texts of the column, without regard to the case of ASCII
    // letters; 0 where one of the cells holds no text.
    static int CompareItems(const CLVListItem* a, const CLVListItem* b, long column_index);

  private:
    struct Cell;

    // Shortens the cell's text for this width; answers the part of `frame`, where the cell is, that changes
    // with it, invalid (-1, -1, -1, -1) when none does or it was never drawn.
    static BRect TruncateText(Cell& cell, BRect frame, float column_width);
    // Null for a negative index; makes room for others.
    Cell* CellFor(int column_index);
    // Null where nothing was ever set.
    Cell* FindCell(int column_index);
    const Cell* FindCell(int column_index) const;
    void DrawText(BView* owner, BRect rect, Cell& cell) const;
    void MoveCells(Cell& resized, float column_width);

    std::vector<Cell> mCells;
    float mTextOffset = 0;
};
