#include "gui/ColumnListView/CLVColumn.h"
#include "gui/ColumnListView/CLVColumnLabelView.h"
#include "gui/ColumnListView/ColumnListView.h"
#include "gui/ColumnListView/MouseWatcher.h"

#include <Looper.h>
#include <Message.h>

#include <algorithm>
#include <cmath>

namespace {

// How far from a border it is still meant, and how far the pointer goes before a press becomes a drag.
constexpr float kBorderReach = 2;
constexpr float kDragDistance = 2;

bool IsFromWatcher(const BMessage& message) {
    return message.what == MW_MOUSE_DOWN || message.what == MW_MOUSE_MOVED || message.what == MW_MOUSE_UP;
}

// The button may be up again before the window gets to hear of it; a click that quick is one, too.
uint32 ButtonsOfPress(BView* view) {
    BPoint where;
    uint32 buttons = 0;
    view->GetMouse(&where, &buttons, true);
    const BLooper* const looper = view->Looper();
    const BMessage* const message = looper == nullptr ? nullptr : looper->CurrentMessage();
    if (buttons == 0 && message != nullptr && message->what == B_MOUSE_DOWN) {
        buttons = static_cast<uint32>(message->GetInt32("buttons", 0));
    }
    return buttons;
}

bool IsRunning(thread_id thread) {
    thread_info info;
    return thread >= 0 && get_thread_info(thread, &info) == B_OK;
}

} // namespace

void CLVColumnLabelView::MouseDown(BPoint where) {
    if (ButtonsOfPress(this) != B_PRIMARY_MOUSE_BUTTON) {
        return;
    }
    if (mColumnClicked != nullptr) {
        CancelGesture();
    }
    CLVColumn* const column = ColumnAt(where.x);
    if (column == nullptr) {
        return;
    }
    if (where.x <= column->ColumnBegin() + kBorderReach) {
        PressResizeHandle(ShownColumnBefore(column), where);
    } else if (where.x >= column->ColumnEnd() - kBorderReach) {
        PressResizeHandle(column, where);
    } else {
        PressLabel(column, where);
    }
    if (mColumnClicked != nullptr && !WatchMouse()) {
        CancelGesture();
    }
}

// A release between two looks of the watcher goes unnoticed, and it follows the next press as well.
bool CLVColumnLabelView::WatchMouse() {
    if (!IsRunning(mWatcher)) {
        mWatcher = StartMouseWatcher(this);
    }
    return mWatcher >= 0;
}

CLVColumn* CLVColumnLabelView::ColumnAt(float x) const {
    for (int32 i = 0; i < mDisplayOrder->CountItems(); ++i) {
        auto* const column = static_cast<CLVColumn*>(mDisplayOrder->ItemAtFast(i));
        if (column->IsShown() && column->ColumnBegin() <= x && x <= column->ColumnEnd()) {
            return column;
        }
    }
    return nullptr;
}

CLVColumn* CLVColumnLabelView::ShownColumnBefore(const CLVColumn* column) const {
    for (int32 i = mDisplayOrder->IndexOf(static_cast<const void*>(column)) - 1; i >= 0; --i) {
        auto* const before = static_cast<CLVColumn*>(mDisplayOrder->ItemAtFast(i));
        if (before->IsShown()) {
            return before;
        }
    }
    return nullptr;
}

void CLVColumnLabelView::PressLabel(CLVColumn* column, BPoint where) {
    mColumnClicked = column;
    mMouseClickPos = where;
    mPreviousMousePos = where;
    SetSnapMinMax();
    if (mColumnClicked == nullptr) {
        return;
    }
    mDragBoxOffset = where.x - mDragGroups.GroupAt(mDragLimits.group).group_begin;
    const BRect bounds = Bounds();
    Invalidate(BRect(column->ColumnBegin() + 1, bounds.top + 1, column->ColumnEnd() - 1, bounds.bottom - 1));
}

void CLVColumnLabelView::PressResizeHandle(CLVColumn* column, BPoint where) {
    if (column == nullptr || (column->Flags() & CLV_COLUMN_NOT_RESIZABLE) != 0) {
        return;
    }
    mColumnClicked = column;
    mColumnResizing = true;
    mMouseClickPos = where;
    mPreviousMousePos = where;
    mResizeOffset = where.x - column->ColumnEnd();
    InvalidateRightBorder(column);
}

void CLVColumnLabelView::MessageReceived(BMessage* message) {
    if (!IsFromWatcher(*message)) {
        BView::MessageReceived(message);
        return;
    }
    if (message->what == MW_MOUSE_UP) {
        mWatcher = -1;
    }
    BPoint where;
    int32 buttons = 0;
    int32 modifierKeys = 0;
    if (mColumnClicked == nullptr || message->FindPoint("where", &where) != B_OK ||
        message->FindInt32("buttons", &buttons) != B_OK ||
        message->FindInt32("modifiers", &modifierKeys) != B_OK) {
        return;
    }
    if (buttons == 0) {
        Release(static_cast<uint32>(modifierKeys));
    } else if (buttons != B_PRIMARY_MOUSE_BUTTON) {
        EndGesture();
    } else if (mColumnResizing) {
        ResizeTo(where.x);
    } else {
        DragLabelTo(where.x);
    }
    mPreviousMousePos = where;
}

void CLVColumnLabelView::DragLabelTo(float x) {
    if (!mColumnDragging && std::fabs(x - mMouseClickPos.x) > kDragDistance) {
        if ((mDragGroups.GroupAt(mDragLimits.group).flags & CLV_COLUMN_NOT_MOVABLE) != 0) {
            EndGesture();
            return;
        }
        mColumnDragging = true;
    }
    if (!mColumnDragging || x == mPreviousMousePos.x) {
        return;
    }
    ShiftWhilePointerIsBeyond(x);
    if (!mColumnDragging) {
        return;
    }
    InvalidateLastOutline();
    const float left = OutlineLeftFor(x);
    InvalidateOutline(left, left + mDragLimits.width);
}

void CLVColumnLabelView::ShiftWhilePointerIsBeyond(float x) {
    // The hook for a changed order may end the drag.
    while (mColumnDragging) {
        if (mDragLimits.previous >= 0 && x < mDragLimits.snap_before) {
            ShiftDragGroup(mDragLimits.previous, mDragGroups.GroupAt(mDragLimits.previous).group_begin);
        } else if (mDragLimits.next >= 0 && x > mDragLimits.snap_after) {
            ShiftDragGroup(mDragLimits.next + 1, mDragGroups.GroupAt(mDragLimits.group).group_begin);
        } else {
            return;
        }
    }
}

void CLVColumnLabelView::SetSnapMinMax() {
    mDragLimits = mDragGroups.LimitsOf(mDragGroups.IndexOfGroup(*mDisplayOrder, mColumnClicked));
    if (mDragLimits.group < 0 || !mColumnClicked->IsShown()) {
        CancelGesture();
    }
}

void CLVColumnLabelView::ShiftDragGroup(int32 new_index, float left) {
    mParent->ReplaceDisplayOrder(mDragGroups.OrderWithGroupAt(*mDisplayOrder, mDragLimits.group, new_index));
    for (BView* const view : {static_cast<BView*>(this), static_cast<BView*>(mParent)}) {
        const BRect bounds = view->Bounds();
        view->Invalidate(BRect(left, bounds.top, bounds.right, bounds.bottom));
    }
}

void CLVColumnLabelView::InvalidateOutline(float left, float right) {
    const BRect bounds = Bounds();
    BRegion outline(BRect(left, bounds.top, right, bounds.bottom));
    outline.Exclude(BRect(left + 1, bounds.top + 1, right - 1, bounds.bottom - 1));
    Invalidate(&outline);
}

void CLVColumnLabelView::InvalidateLastOutline() {
    if (mPrevDragOutlineRight >= 0) {
        InvalidateOutline(mPrevDragOutlineLeft, mPrevDragOutlineRight);
    }
}

void CLVColumnLabelView::InvalidateRightBorder(const CLVColumn* column) {
    const BRect bounds = Bounds();
    Invalidate(BRect(column->ColumnEnd(), bounds.top, column->ColumnEnd(), bounds.bottom));
}

void CLVColumnLabelView::ResizeTo(float x) {
    const float width =
        std::max(x - mResizeOffset - mColumnClicked->ColumnBegin(), mColumnClicked->MinWidth());
    if (x != mPreviousMousePos.x && width != mColumnClicked->Width()) {
        mColumnClicked->SetWidth(width);
    }
}

void CLVColumnLabelView::Release(uint32 modifierKeys) {
    CLVColumn* const column = mColumnClicked;
    const bool click = !mColumnDragging && !mColumnResizing;
    // First: what the click sets off may take columns away, this one among them.
    EndGesture();
    if (click) {
        ClickColumn(column, modifierKeys);
    }
}

void CLVColumnLabelView::ClickColumn(CLVColumn* column, uint32 modifierKeys) {
    const int32 index = mParent->IndexOfColumn(column);
    if ((column->Flags() & CLV_COLUMN_SORTABLE) == 0) {
        return;
    }
    const bool adds = (modifierKeys & B_SHIFT_KEY) != 0;
    if (adds ? mParent->IsInSortKeys(column) : mParent->PrimarySortKey() == column) {
        mParent->ReverseSortMode(index);
    } else if (adds) {
        mParent->AddSortKey(index);
    } else {
        mParent->SetSortKey(index);
    }
}

void CLVColumnLabelView::EndGesture() {
    if (mColumnResizing) {
        InvalidateRightBorder(mColumnClicked);
    }
    InvalidateLastOutline();
    InvalidateColumn(mColumnClicked);
    ForgetGesture();
}

void CLVColumnLabelView::CancelGesture() {
    if (mColumnClicked != nullptr) {
        ForgetGesture();
        Invalidate();
    }
}

void CLVColumnLabelView::ForgetGesture() {
    mColumnClicked = nullptr;
    mColumnDragging = false;
    mColumnResizing = false;
    mPrevDragOutlineLeft = -1;
    mPrevDragOutlineRight = -1;
    mDragLimits = DragLimits();
}
