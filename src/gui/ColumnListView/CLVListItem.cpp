#include "gui/ColumnListView/CLVListItem.h"

#include "gui/ColumnListView/CLVColumn.h"
#include "gui/ColumnListView/ColumnLayout.h"
#include "gui/ColumnListView/ColumnListView.h"
#include "gui/ColumnListView/OutlineRows.h"
#include "widgets/PrefilledBitmap.h"

#include <Font.h>

#include <algorithm>
#include <cmath>

namespace {

constexpr BRect kNoRect(-1, -1, -1, -1);

// An arrow is 11 pixels square and ends three pixels before its cell does.
constexpr float kArrowSide = 10;
constexpr float kArrowMargin = 3;

CLVColumn* ColumnOf(const BList& columns, int32 index) {
    return static_cast<CLVColumn*>(columns.ItemAt(index));
}

} // namespace

CLVListItem::CLVListItem(uint32 level, bool superitem, bool expanded, float minheight)
    : BListItem(level, expanded), mSuperItem(superitem), mOutlineLevel(level), mMinHeight(minheight) {}

CLVListItem::~CLVListItem() = default;

void CLVListItem::SetOutlineLevel(uint32 level) {
    mOutlineLevel = level;
    BListItem::SetOutlineLevel(level);
    OutlineRows::LevelChanged(this);
}

BRect CLVListItem::ItemColumnFrame(int32 column_index, ColumnListView* owner) {
    const CLVColumn* const column = ColumnOf(owner->Columns(), column_index);
    const int32 row = owner->VisibleIndexOf(this);
    if (column == nullptr || !column->IsShown() || row < 0) {
        return kNoRect;
    }
    const BRect frame = owner->ItemFrame(row);
    const CellSpan span = SpanOfCell(*column, ExpanderShiftOf(*column, mOutlineLevel),
                                     PushLimit(owner->ColumnsInDisplayOrder(), frame.right));
    return span.IsEmpty() ? kNoRect : BRect(span.left, frame.top, span.right, frame.bottom);
}

float CLVListItem::ExpanderShift(int32 column_index, ColumnListView* owner) const {
    const CLVColumn* const column = ColumnOf(owner->Columns(), column_index);
    return column == nullptr ? 0 : ExpanderShiftOf(*column, mOutlineLevel);
}

void CLVListItem::DrawItem(BView* owner, BRect item_rect, bool complete) {
    auto* const list = dynamic_cast<ColumnListView*>(owner);
    if (list == nullptr) {
        return;
    }
    BRegion region;
    if (complete) {
        region.Set(item_rect);
    } else {
        list->GetClippingRegion(&region);
    }
    const BList& columns = list->ColumnsInDisplayOrder();
    const float pushLimit = PushLimit(columns, item_rect.right);
    float lastEnd = -1;
    for (int32 i = 0; i < columns.CountItems(); ++i) {
        const CLVColumn* const column = ColumnOf(columns, i);
        if (!column->IsShown()) {
            continue;
        }
        lastEnd = column->ColumnEnd();
        const float shift = ExpanderShiftOf(*column, mOutlineLevel);
        const CellSpan span = SpanOfCell(*column, shift, pushLimit);
        const BRect cell(span.left, item_rect.top, span.right, item_rect.bottom);
        if (column->IsExpander()) {
            mExpanderColumnRect = cell;
        }
        if (span.IsEmpty() || !region.Intersects(cell)) {
            continue;
        }
        DrawItemColumn(list, cell, list->Columns().IndexOf(column), complete);
        if (column->IsExpander()) {
            DrawArrow(list, cell, column->ColumnEnd() + shift);
        }
    }
    const BRect rest(lastEnd + 1, item_rect.top, list->Bounds().right, item_rect.bottom);
    if (rest.IsValid() && region.Intersects(rest)) {
        DrawItemColumn(list, rest, -1, complete);
    }
}

BRect CLVListItem::ArrowIn(BRect cell, float end) const {
    const float left = end - kArrowMargin - kArrowSide;
    if (!mSuperItem || left > cell.right) {
        return kNoRect;
    }
    const float top = cell.top + std::ceil((cell.Height() - kArrowSide) / 2);
    return BRect(left, top, std::min(left + kArrowSide, cell.right), top + kArrowSide);
}

BRect CLVListItem::ArrowFrame(ColumnListView* owner) {
    const int32 index = owner->ExpanderColumn();
    const BRect cell = ItemColumnFrame(index, owner);
    return cell == kNoRect
               ? kNoRect
               : ArrowIn(cell, ColumnOf(owner->Columns(), index)->ColumnEnd() + ExpanderShift(index, owner));
}

void CLVListItem::DrawArrow(ColumnListView* list, BRect cell, float end) {
    mExpanderButtonRect = ArrowIn(cell, end);
    if (mExpanderButtonRect == kNoRect) {
        return;
    }
    const BBitmap& arrow = IsExpanded() ? list->DownArrow() : list->RightArrow();
    list->SetDrawingMode(B_OP_OVER);
    list->DrawBitmap(&arrow, BRect(0, 0, mExpanderButtonRect.Width(), kArrowSide), mExpanderButtonRect);
    list->SetDrawingMode(B_OP_COPY);
}

void CLVListItem::RedrawExpander(ColumnListView* owner) {
    const int32 index = owner->ExpanderColumn();
    const BRect cell = ItemColumnFrame(index, owner);
    if (cell == kNoRect) {
        return;
    }
    mExpanderColumnRect = cell;
    DrawItemColumn(owner, cell, index, true);
    DrawArrow(owner, cell, ColumnOf(owner->Columns(), index)->ColumnEnd() + ExpanderShift(index, owner));
}

void CLVListItem::Update(BView* owner, const BFont* font) {
    BListItem::Update(owner, font);
    if (Height() < mMinHeight) {
        SetHeight(mMinHeight);
    }
}

float CLVListItem::CenteredBaseline() const {
    font_height height;
    be_plain_font->GetHeight(&height);
    const float ascent = std::ceil(height.ascent);
    const float descent = std::ceil(height.descent);
    return ascent + (Height() - (ascent + descent)) / 2;
}

void CLVListItem::ColumnWidthChanged(int32 /*column_index*/, float /*column_width*/,
                                     ColumnListView* /*owner*/) {}

void CLVListItem::FrameChanged(int32 /*column_index*/, BRect /*new_frame*/, ColumnListView* /*owner*/) {}
