// The part of BListView that follows the mouse while its button is held.
#include <ListView.h>

#include "InputState.h"
#include "ListAutoscroll.h"
#include "RowPositions.h"

#include <Looper.h>
#include <Message.h>
#include <MessageRunner.h>
#include <ScrollBar.h>

#include <algorithm>
#include <cmath>

namespace {

// How far the mouse moves with its button held before that is a drag.
constexpr float kDragDistance = 4;

// Positive below what shows, negative above it.
float Beyond(BPoint pointer, BRect bounds) {
    return pointer.y < 0 ? pointer.y : std::max(0.0F, pointer.y - bounds.Height());
}

} // namespace

void BListView::EndPress() {
    mAutoscroller.reset();
    mPress = Press();
}

void BListView::MouseMoved(BPoint where, uint32 code, const BMessage* dragMessage) {
    BView::MouseMoved(where, code, dragMessage);
    if (mPress.row < 0) {
        return;
    }
    if (current_input(*this).buttons == 0) {
        // Let go where nobody has told of it.
        EndPress();
        return;
    }
    if (!mPress.follows) {
        const BPoint way = where - mPress.where;
        const bool moved = std::abs(way.x) >= kDragDistance || std::abs(way.y) >= kDragDistance;
        if (mPress.dragWasOffered || !moved) {
            return;
        }
        mPress.dragWasOffered = true;
        if (InitiateDrag(mPress.where, mPress.row, mPress.wasSelected)) {
            EndPress();
            return;
        }
        // What Control has just deselected is not selected again on the way.
        mPress.follows = (mPress.modifiers & B_CONTROL_KEY) == 0 || !mPress.wasSelected;
    }
    mPress.pointer = where - Bounds().LeftTop();
    FollowPointer();
    StartOrStopAutoscroll();
}

void BListView::MouseUp(BPoint where) {
    const Press press = mPress;
    EndPress();
    if (press.selectsOnRelease && IndexOf(where) == press.row) {
        Select(press.row);
    }
    BView::MouseUp(where);
}

bool BListView::InitiateDrag(BPoint /*where*/, int32 /*index*/, bool /*wasSelected*/) {
    return false;
}

void BListView::FollowPointer() {
    if (!mPress.follows || mPress.row < 0) {
        return;
    }
    const BRect bounds = Bounds();
    const float y = bounds.top + std::clamp(mPress.pointer.y, 0.0F, bounds.Height());
    const int32 under = IndexOf(BPoint(0, std::max(0.0F, y)));
    const int32 row = under < 0 ? CountItems() - 1 : under;
    if (row != mPress.followedRow) {
        mPress.followedRow = row;
        mPress.selectsOnRelease = false;
        SelectFollowed(row);
    }
}

void BListView::SelectFollowed(int32 row) {
    if (mType == B_SINGLE_SELECTION_LIST) {
        if (RowAt(row)->IsEnabled()) {
            Select(row);
        }
        return;
    }
    if ((mPress.modifiers & B_SHIFT_KEY) == 0) {
        mAnchor = mPress.row;
    }
    SelectFromAnchorTo(row, (mPress.modifiers & B_CONTROL_KEY) != 0);
}

// Where the next step leads; where the list is already when there is nothing left.
float BListView::AutoscrollTarget() const {
    const BRect bounds = Bounds();
    const float step = autoscroll_step(Beyond(mPress.pointer, bounds), bounds.Height());
    float least = 0;
    float most = std::max(0.0F, static_cast<float>(mPositions->TotalHeight() - 1) - bounds.Height());
    if (const BScrollBar* const bar = ScrollBar(B_VERTICAL); bar != nullptr) {
        bar->GetRange(&least, &most);
    }
    // A list that has been scrolled beyond its ends is not pulled back.
    return step < 0 ? std::min(bounds.top, std::max(bounds.top + step, least))
                    : std::max(bounds.top, std::min(bounds.top + step, most));
}

void BListView::StartOrStopAutoscroll() {
    if (!mPress.follows || mPress.row < 0 || AutoscrollTarget() == Bounds().top) {
        mAutoscroller.reset();
    } else if (mAutoscroller == nullptr && Looper() != nullptr) {
        const BMessage step(kListAutoscroll);
        mAutoscroller = std::make_unique<BMessageRunner>(BMessenger(this), &step, kListAutoscrollInterval);
    }
}

void BListView::Autoscroll() {
    // The last step may have been on its way when the button came up.
    if (mAutoscroller == nullptr) {
        return;
    }
    ScrollTo(BPoint(Bounds().left, AutoscrollTarget()));
    FollowPointer();
    StartOrStopAutoscroll();
}
