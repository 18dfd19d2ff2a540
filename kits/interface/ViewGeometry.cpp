// Where a view lies, how it follows its parent, and what its coordinates are elsewhere.
#include <View.h>

#include "ViewHost.h"

#include <ScrollBar.h>

#include <cmath>

BRect BView::Frame() const {
    return mBounds.OffsetToCopy(mPosition);
}

void BView::MoveBy(float dh, float dv) {
    MoveTo(mPosition.x + dh, mPosition.y + dv);
}

void BView::MoveTo(float x, float y) {
    MoveTo(BPoint(x, y));
}

void BView::MoveTo(BPoint where) {
    if (where == mPosition) {
        return;
    }
    const BRect before = Frame();
    mPosition = where;
    GeometryChanged();
    if (mParent != nullptr) {
        mParent->Invalidate(before);
    }
    Invalidate();
    if (mHost != nullptr && (mFlags & B_FRAME_EVENTS) != 0) {
        FrameMoved(where);
    }
}

void BView::ResizeBy(float dh, float dv) {
    ResizeTo(mBounds.Width() + dh, mBounds.Height() + dv);
}

void BView::ResizeTo(float width, float height) {
    const float dh = width - mBounds.Width();
    const float dv = height - mBounds.Height();
    if (dh == 0 && dv == 0) {
        return;
    }
    const BRect before = Frame();
    const BRect oldBounds = mBounds;
    mBounds.right = mBounds.left + width;
    mBounds.bottom = mBounds.top + height;
    GeometryChanged();
    for (size_t i = 0; i < mChildren.size(); ++i) {
        mChildren[i]->ParentResized(dh, dv);
    }
    if (mHost != nullptr) {
        if (mParent != nullptr && (dh < 0 || dv < 0)) {
            mParent->Invalidate(before);
        }
        if ((mFlags & B_FULL_UPDATE_ON_RESIZE) != 0) {
            Invalidate();
        } else {
            BRegion uncovered(mBounds);
            uncovered.Exclude(oldBounds);
            Invalidate(&uncovered);
        }
        if ((mFlags & B_FRAME_EVENTS) != 0) {
            FrameResized(width, height);
        }
    }
}

void BView::ParentResized(float dh, float dv) {
    // One edge's way, when its parent grows by `delta`.
    const auto moved = [](uint32 rule, float delta) {
        if (rule == _VIEW_RIGHT_ || rule == _VIEW_BOTTOM_) {
            return delta;
        }
        return rule == _VIEW_CENTER_ ? delta / 2 : 0.0F;
    };
    const float left = moved((mResizingMode >> 8) & 15U, dh);
    const float right = moved(mResizingMode & 15U, dh);
    const float top = moved((mResizingMode >> 12) & 15U, dv);
    const float bottom = moved((mResizingMode >> 4) & 15U, dv);
    MoveBy(std::floor(left), std::floor(top));
    ResizeBy(right - left, bottom - top);
}

void BView::GetPreferredSize(float* width, float* height) {
    *width = mBounds.Width();
    *height = mBounds.Height();
}

void BView::ResizeToPreferred() {
    float width = 0;
    float height = 0;
    GetPreferredSize(&width, &height);
    ResizeTo(width, height);
}

void BView::ScrollBy(float dh, float dv) {
    ScrollTo(BPoint(mBounds.left + dh, mBounds.top + dv));
}

void BView::ScrollTo(BPoint where) {
    // Pixels move as a whole, so positions do too.
    where.Set(std::round(where.x), std::round(where.y));
    if (where == mBounds.LeftTop()) {
        return;
    }
    const BPoint delta = mBounds.LeftTop() - where;
    mBounds.OffsetTo(where);
    GeometryChanged();
    if (mHost != nullptr) {
        const BRegion visible = VisibleRegion(Covered::WithChildren);
        mHost->ContentsScrolled(this, visible, static_cast<int32>(delta.x), static_cast<int32>(delta.y));
    }
    if (mHorizontalScrollBar != nullptr) {
        mHorizontalScrollBar->TargetScrolledTo(where.x);
    }
    if (mVerticalScrollBar != nullptr) {
        mVerticalScrollBar->TargetScrolledTo(where.y);
    }
}

BScrollBar* BView::ScrollBar(orientation posture) const {
    return posture == B_HORIZONTAL ? mHorizontalScrollBar : mVerticalScrollBar;
}

BPoint BView::ConvertToParent(BPoint point) const {
    return point - mBounds.LeftTop() + mPosition;
}

BRect BView::ConvertToParent(BRect rect) const {
    return rect.OffsetByCopy(mPosition - mBounds.LeftTop());
}

BPoint BView::ConvertFromParent(BPoint point) const {
    return point - mPosition + mBounds.LeftTop();
}

BRect BView::ConvertFromParent(BRect rect) const {
    return rect.OffsetByCopy(mBounds.LeftTop() - mPosition);
}

BPoint BView::ConvertToSurface(BPoint point) const {
    for (const BView* view = this; view != nullptr; view = view->mParent) {
        point = view->ConvertToParent(point);
    }
    return point;
}

BPoint BView::ConvertFromSurface(BPoint point) const {
    return point - ConvertToSurface(B_ORIGIN);
}

BPoint BView::ConvertToScreen(BPoint point) const {
    return ConvertToSurface(point) + (mHost == nullptr ? B_ORIGIN : mHost->ScreenOrigin());
}

BRect BView::ConvertToScreen(BRect rect) const {
    return rect.OffsetByCopy(ConvertToScreen(B_ORIGIN));
}

BPoint BView::ConvertFromScreen(BPoint point) const {
    return point - ConvertToScreen(B_ORIGIN);
}

BRect BView::ConvertFromScreen(BRect rect) const {
    return rect.OffsetByCopy(-ConvertToScreen(B_ORIGIN));
}
