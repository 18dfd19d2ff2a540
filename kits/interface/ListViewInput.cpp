// The part of BListView that takes the mouse and the keys.
#include <ListView.h>

#include "InputState.h"
#include "RowPositions.h"

#include <ScrollBar.h>

#include <algorithm>
#include <cmath>

void BListView::MouseDown(BPoint where) {
    if (!IsFocus() && (Flags() & B_NAVIGABLE) != 0) {
        MakeFocus();
    }
    const InputState input = current_input(*this);
    const int32 row = IndexOf(where);
    EndPress();
    if (row < 0) {
        if ((input.modifiers & (B_SHIFT_KEY | B_CONTROL_KEY)) == 0) {
            DeselectAll();
        }
        return;
    }
    if (input.clicks == 2 && IsItemSelected(row)) {
        Invoke();
        return;
    }
    mPress.row = row;
    mPress.where = where;
    mPress.wasSelected = IsItemSelected(row);
    mPress.followedRow = row;
    mPress.modifiers = input.modifiers;
    // A host without a pointer never sends the events, and never a press either.
    (void)SetMouseEventMask(B_POINTER_EVENTS, B_LOCK_WINDOW_FOCUS);
    PressRow(row, input.modifiers);
}

void BListView::PressRow(int32 row, uint32 modifiers) {
    if (mType == B_SINGLE_SELECTION_LIST) {
        Select(row);
    } else if ((modifiers & B_SHIFT_KEY) != 0) {
        SelectFromAnchorTo(row, (modifiers & B_CONTROL_KEY) != 0);
    } else if ((modifiers & B_CONTROL_KEY) != 0) {
        if (IsItemSelected(row)) {
            Deselect(row);
            mAnchor = row;
            SetCursor(row, false);
        } else {
            Select(row, true);
        }
    } else if (IsItemSelected(row)) {
        // All selected rows may be about to be dragged.
        mPress.selectsOnRelease = true;
    } else {
        Select(row);
    }
}

void BListView::KeyDown(const char* bytes, int32 numBytes) {
    const InputState input = current_input(*this);
    const int32 last = CountItems() - 1;
    const int32 from = RowToMoveFrom();
    const auto moveTo = [&](int32 row) {
        if (row >= 0 && row <= last) {
            MoveCursor(row, input.modifiers);
        }
    };
    const auto scrollSideways = [&](float direction) {
        if (BScrollBar* const bar = ScrollBar(B_HORIZONTAL); bar != nullptr) {
            float step = 0;
            bar->GetSteps(&step, nullptr);
            bar->SetValue(bar->Value() + direction * step);
        }
    };
    switch (numBytes == 1 ? *bytes : 0) {
    case B_UP_ARROW:
        moveTo(from < 0 ? NextEnabledRow(last, -1) : NextEnabledRow(from - 1, -1));
        break;
    case B_DOWN_ARROW:
        moveTo(NextEnabledRow(from + 1, 1));
        break;
    case B_HOME:
        moveTo(NextEnabledRow(0, 1));
        break;
    case B_END:
        moveTo(NextEnabledRow(last, -1));
        break;
    case B_PAGE_UP:
        moveTo(RowOnePageFrom(from, -1));
        break;
    case B_PAGE_DOWN:
        moveTo(RowOnePageFrom(from, 1));
        break;
    case B_LEFT_ARROW:
        scrollSideways(-1);
        break;
    case B_RIGHT_ARROW:
        scrollSideways(1);
        break;
    case B_SPACE:
        if (mType == B_MULTIPLE_SELECTION_LIST && (input.modifiers & B_CONTROL_KEY) != 0) {
            if (from >= 0) {
                PressRow(from, B_CONTROL_KEY);
                SetCursor(from, true);
            }
            break;
        }
        [[fallthrough]];
    case B_RETURN:
        if (HasSelection()) {
            Invoke();
        }
        break;
    default:
        BView::KeyDown(bytes, numBytes);
    }
}

int32 BListView::RowToMoveFrom() const {
    return mCursor >= 0 && mCursor < CountItems() ? mCursor : CurrentSelection(0);
}

// The first row from `from` on, in this direction, that can be selected; -1 when there is none.
int32 BListView::NextEnabledRow(int32 from, int32 step) const {
    for (int32 row = from; row >= 0 && row < CountItems(); row += step) {
        if (RowAt(row)->IsEnabled()) {
            return row;
        }
    }
    return -1;
}

int32 BListView::RowOnePageFrom(int32 row, int32 direction) {
    if (IsEmpty()) {
        return -1;
    }
    const BRect frame = ItemFrame(std::max(row, 0));
    const float page = std::max(0.0F, Bounds().Height() - frame.Height());
    const float y = frame.top + static_cast<float>(direction) * page;
    const int32 there = y < 0 ? 0 : IndexOf(BPoint(0, y));
    const int32 wanted = there < 0 ? CountItems() - 1 : there;
    const int32 enabled = NextEnabledRow(wanted, direction);
    return enabled >= 0 ? enabled : NextEnabledRow(wanted, -direction);
}

void BListView::MoveCursor(int32 row, uint32 modifiers) {
    if (mType == B_MULTIPLE_SELECTION_LIST && (modifiers & B_SHIFT_KEY) != 0) {
        SelectFromAnchorTo(row, false);
    } else if (mType == B_MULTIPLE_SELECTION_LIST && (modifiers & B_CONTROL_KEY) != 0) {
        SetCursor(row, true);
    } else {
        Select(row);
    }
    ScrollToRow(row);
}

void BListView::SelectFromAnchorTo(int32 row, bool extend) {
    const int32 selected = CurrentSelection(0);
    const int32 anchor = mAnchor >= 0 && mAnchor < CountItems() ? mAnchor : (selected >= 0 ? selected : row);
    Select(std::min(anchor, row), std::max(anchor, row), extend);
    mAnchor = anchor;
    SetCursor(row, false);
}

void BListView::SetCursor(int32 row, bool shown) {
    if (row == mCursor && shown == mCursorShown) {
        return;
    }
    if (mCursorShown) {
        InvalidateItem(mCursor);
    }
    mCursor = row;
    mCursorShown = shown;
    if (mCursorShown) {
        InvalidateItem(mCursor);
    }
}

void BListView::ScrollToRow(int32 index) {
    const BRect frame = ItemFrame(index);
    const BRect bounds = Bounds();
    if (frame.top < bounds.top || frame.Height() > bounds.Height()) {
        ScrollTo(BPoint(bounds.left, frame.top));
    } else if (frame.bottom > bounds.bottom) {
        ScrollTo(BPoint(bounds.left, frame.bottom - bounds.Height()));
    }
}
