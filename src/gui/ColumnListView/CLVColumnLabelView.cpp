#include "gui/ColumnListView/CLVColumnLabelView.h"

#include "gui/ColumnListView/CLVColumn.h"
#include "gui/ColumnListView/ColumnListView.h"
#include "gui/ColumnListView/HeaderCells.h"

#include <Font.h>

#include <algorithm>
#include <cmath>

namespace {

constexpr rgb_color kBackground = {216, 216, 216, 255};

void DrawLines(BView* view, const std::vector<HeaderLine>& lines) {
    view->BeginLineArray(static_cast<int32>(lines.size()));
    for (const HeaderLine& line : lines) {
        view->AddLine(line.from, line.to, line.color);
    }
    view->EndLineArray();
}

} // namespace

CLVColumnLabelView::CLVColumnLabelView(BRect frame, ColumnListView* parent, const BFont* font)
    : BView(frame, nullptr, B_FOLLOW_LEFT_RIGHT | B_FOLLOW_TOP, B_WILL_DRAW),
      mDisplayOrder(&parent->ColumnsInDisplayOrder()), mParent(parent) {
    SetFont(font);
    SetViewColor(kBackground);
    SetLowColor(kBackground);
    SetHighColor(0, 0, 0);
    font_height height;
    font->GetHeight(&height);
    mFontAscent = std::ceil(height.ascent);
}

void CLVColumnLabelView::UpdateDragGroups() {
    mDragGroups.Rebuild(*mDisplayOrder);
    if (mColumnClicked != nullptr) {
        SetSnapMinMax();
    }
}

void CLVColumnLabelView::InvalidateColumn(const CLVColumn* column) {
    const BRect bounds = Bounds();
    Invalidate(BRect(column->ColumnBegin(), bounds.top, column->ColumnEnd(), bounds.bottom));
}

void CLVColumnLabelView::Draw(BRect update_rect) {
    const BRect bounds = Bounds();
    const std::vector<HeaderCell> cells = HeaderCellsOf(*mDisplayOrder, bounds);
    for (const HeaderCell& cell : cells) {
        if (cell.frame.Intersects(update_rect)) {
            DrawCell(cell);
        }
    }
    DrawLines(this, LinesBehind(cells.empty() ? nullptr : &cells.back(), bounds));
    if (mColumnDragging) {
        DrawDragOutline();
    }
}

void CLVColumnLabelView::DrawCell(const HeaderCell& cell) {
    CLVColumn* const column = cell.column;
    const bool clicked = column == mColumnClicked;
    DrawLines(this, LinesOf(cell, clicked && mColumnResizing));
    const BRect inner = cell.frame.InsetByCopy(1, 1);
    BRegion clip(inner);
    ConstrainClippingRegion(&clip);
    column->DrawColumnHeader(this, inner, mParent->IsSortKey(column), clicked && !mColumnResizing,
                             mFontAscent);
    ConstrainClippingRegion(nullptr);
}

void CLVColumnLabelView::DrawDragOutline() {
    const float top = Bounds().top;
    const float bottom = Bounds().bottom;
    const float left = OutlineLeftFor(mPreviousMousePos.x);
    const float right = left + mDragLimits.width;
    DrawLines(this, {{BPoint(left, top), BPoint(right, top), kHeaderBlue},
                     {BPoint(left, bottom), BPoint(right, bottom), kHeaderBlue},
                     {BPoint(left, top + 1), BPoint(left, bottom - 1), kHeaderBlue},
                     {BPoint(right, top + 1), BPoint(right, bottom - 1), kHeaderBlue}});
    mPrevDragOutlineLeft = left;
    mPrevDragOutlineRight = right;
}

float CLVColumnLabelView::OutlineLeftFor(float x) const {
    const DragGroup& dragged = mDragGroups.GroupAt(mDragLimits.group);
    float left = x - mDragBoxOffset;
    if (mDragLimits.previous < 0) {
        left = std::max(left, dragged.group_begin);
    }
    if (mDragLimits.next < 0) {
        left = std::min(left, dragged.group_begin);
    }
    return left;
}
