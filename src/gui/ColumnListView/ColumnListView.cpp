// What ColumnListView is made of, where it scrolls, and what the mouse does to it.
#include "gui/ColumnListView/ColumnListView.h"

#include "gui/ColumnListView/ArrowBitmaps.h"
#include "gui/ColumnListView/CLVColumnLabelView.h"
#include "gui/ColumnListView/CLVContainerView.h"
#include "gui/ColumnListView/ColumnLayout.h"
#include "widgets/PrefilledBitmap.h"

#include <Font.h>
#include <Looper.h>
#include <OS.h>

#include <cmath>

namespace {

constexpr BRect kArrowBounds(0, 0, 10, 10);

std::unique_ptr<PrefilledBitmap> Arrow(const uint8* data) {
    return std::make_unique<PrefilledBitmap>(kArrowBounds, B_CMAP8, data, false, false);
}

BRect HeaderFrame(BRect listFrame, const BFont* font) {
    font_height height;
    font->GetHeight(&height);
    listFrame.bottom = listFrame.top + std::ceil(height.ascent) + std::ceil(height.descent) + 1 + 3;
    return listFrame;
}

} // namespace

ColumnListView::ColumnListView(BRect frame, CLVContainerView** container_out, const char* name,
                               uint32 resizing_mode, uint32 flags, list_view_type type, bool hierarchical,
                               bool horizontal, bool vertical, bool scroll_view_corner, border_style border,
                               const BFont* label_font)
    : BListView(frame, name, type, B_FOLLOW_ALL_SIDES, flags), mRightArrow(Arrow(CLVRightArrowData)),
      mDownArrow(Arrow(CLVDownArrowData)), mHierarchical(hierarchical),
      mHeaderView(new CLVColumnLabelView(HeaderFrame(frame, label_font), this, label_font)) {
    EmbedInContainer(horizontal, vertical, scroll_view_corner, border, resizing_mode, flags);
    if (container_out != nullptr) {
        *container_out = mContainer;
    }
    UpdateColumnSizesDataRectSizeScrollBars(true);
    mHeaderView->UpdateDragGroups();
}

ColumnListView::~ColumnListView() {
    for (int32 i = 0; i < mColumns.CountItems(); ++i) {
        CLVColumn* const column = ColumnAt(i);
        // It has no list to leave any more.
        column->SetParent(nullptr);
        delete column;
    }
}

CLVContainerView* ColumnListView::CreateContainer(bool horizontal, bool vertical, bool scroll_view_corner,
                                                  border_style border, uint32 resizing_mode, uint32 flags) {
    AssertWindowLocked();
    return new CLVContainerView(this, resizing_mode, flags, horizontal, vertical, scroll_view_corner, border);
}

void ColumnListView::EmbedInContainer(bool horizontal, bool vertical, bool scroll_view_corner,
                                      border_style border, uint32 resizing_mode, uint32 flags) {
    // The keyboard goes to the list, not to what frames it.
    mContainer = CreateContainer(horizontal, vertical, scroll_view_corner, border, resizing_mode,
                                 flags & ~static_cast<uint32>(B_NAVIGABLE));
    const BRect listFrame = Frame();
    const float headerHeight = mHeaderView->Frame().Height();
    ResizeTo(listFrame.Width(), listFrame.Height() - headerHeight - 1);
    MoveBy(0, headerHeight + 1);
    mHeaderView->MoveTo(listFrame.LeftTop());
    mContainer->AddChild(mHeaderView);
    if (Parent() != mContainer) {
        mContainer->AddChild(this);
    }
}

void ColumnListView::AttachedToWindow() {
    BListView::AttachedToWindow();
    UpdateDataRect(true);
}

void ColumnListView::SetFont(const BFont* font, uint32 mask) {
    AssertWindowLocked();
    BListView::SetFont(font, mask);
    UpdateDataRect(true);
}

// A row may change its height without telling: the list learns of it when it next looks at the row, and it
// looks at all that it draws.
void ColumnListView::Draw(BRect update_rect) {
    BListView::Draw(update_rect);
    if (DataHeight() != mContainer->GetDataRect().Height()) {
        UpdateDataRect(true);
    }
}

void ColumnListView::MouseDown(BPoint where) {
    AssertWindowLocked();
    auto* const item = static_cast<CLVListItem*>(ItemAt(IndexOf(where)));
    if (item == nullptr || !item->ArrowFrame(this).Contains(where)) {
        BListView::MouseDown(where);
    } else if (item->IsExpanded()) {
        Collapse(item);
    } else {
        Expand(item);
    }
}

void ColumnListView::FrameResized(float new_width, float new_height) {
    AssertWindowLocked();
    UpdateColumnSizesDataRectSizeScrollBars(true);
    BListView::FrameResized(new_width, new_height);
}

void ColumnListView::ScrollTo(BPoint where) {
    AssertWindowLocked();
    BListView::ScrollTo(where);
    if (Parent() != nullptr) {
        mHeaderView->ScrollTo(BPoint(where.x, 0));
    }
}

void ColumnListView::UpdateColumnSizesDataRectSizeScrollBars(bool scroll_bars) {
    AssertWindowLocked();
    mDataWidth = LayOutColumns(mDisplayOrder);
    UpdateDataRect(scroll_bars);
}

void ColumnListView::UpdateDataRect(bool scroll_bars) {
    // In the list's destructor, where an application takes its rows out, container and header are gone.
    if (Parent() == nullptr) {
        return;
    }
    mContainer->SetDataRect(BRect(0, 0, mDataWidth, DataHeight()), scroll_bars);
}

float ColumnListView::DataHeight() {
    return IsEmpty() ? 0 : ItemFrame(CountItems() - 1).bottom;
}

void ColumnListView::AssertWindowLocked() const {
    const BLooper* const looper = Looper();
    if (looper != nullptr && !looper->IsLocked()) {
        // It is known by this name and line wherever it stands.
        debugger("gui/ColumnListView/ColumnListView:212: The looper must be locked.");
    }
}
