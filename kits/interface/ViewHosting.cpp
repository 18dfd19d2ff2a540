// The part of BView that deals with what it is attached to.
#include <View.h>

#include "DrawingState.h"
#include "LineArray.h"
#include "Shapes.h"
#include "ViewHost.h"

bool BView::RemoveSelf() {
    if (mParent != nullptr) {
        return mParent->RemoveChild(this);
    }
    if (mHost != nullptr) {
        // The host knows its topmost views; it drops this one while it hears of its removal.
        DetachFromHost();
        return true;
    }
    return false;
}

BWindow* BView::Window() const {
    return mHost == nullptr ? nullptr : mHost->Window();
}

BView* BView::Parent() const {
    return mHost != nullptr && mParent == mHost->RootView() ? nullptr : mParent;
}

void BView::AttachToHost(ViewHost* host) {
    AttachTree(host);
    AnnounceAttached();
    Invalidate();
}

void BView::DetachFromHost() {
    AnnounceDetached();
    DetachTree();
}

void BView::AttachTree(ViewHost* host) {
    mHost = host;
    mVisibleKnown = false;
    mHost->ViewAdded(this);
    for (BView* child : mChildren) {
        child->AttachTree(host);
    }
}

void BView::DetachTree() {
    for (BView* child : mChildren) {
        child->DetachTree();
    }
    mHost->ViewRemoved(this);
    mHost = nullptr;
    mVisibleKnown = false;
    mPainter.reset();
}

// Hooks may add or remove views, so children are walked by index.
void BView::AnnounceAttached() {
    AttachedToWindow();
    for (int32 i = 0; i < CountChildren(); ++i) {
        ChildAt(i)->AnnounceAttached();
    }
    AllAttached();
}

void BView::AnnounceDetached() {
    DetachedFromWindow();
    for (int32 i = 0; i < CountChildren(); ++i) {
        ChildAt(i)->AnnounceDetached();
    }
    AllDetached();
}

void BView::ForgetClipping() {
    mVisibleKnown = false;
    mClipKnown = false;
    for (BView* child : mChildren) {
        child->ForgetClipping();
    }
}

void BView::GeometryChanged() {
    if (mParent != nullptr) {
        mParent->mVisibleKnown = false;
        mParent->mClipKnown = false;
    }
    ForgetClipping();
}

clipping_rect BView::FrameOnSurface() const {
    const BPoint leftTop = ConvertToSurface(mBounds.LeftTop());
    const BPoint rightBottom = ConvertToSurface(mBounds.RightBottom());
    return {to_pixel_coordinate(leftTop.x), to_pixel_coordinate(leftTop.y),
            to_pixel_coordinate(rightBottom.x), to_pixel_coordinate(rightBottom.y)};
}

BRegion BView::VisibleOnSurface(Covered covered) const {
    if (mHost == nullptr || IsHidden()) {
        return {};
    }
    clipping_rect frame = mHost->Surface().LogicalBounds();
    for (const BView* view = this; view != nullptr; view = view->mParent) {
        frame = intersection(frame, view->FrameOnSurface());
    }
    BRegion visible(frame);
    if (covered == Covered::WithoutChildren && (mFlags & B_DRAW_ON_CHILDREN) == 0) {
        for (const BView* child : mChildren) {
            if (child->mHideCount <= 0) {
                visible.Exclude(child->FrameOnSurface());
            }
        }
    }
    return visible;
}

BRegion BView::VisibleRegion(Covered covered) const {
    BRegion visible = VisibleOnSurface(covered);
    const BPoint origin = ConvertToSurface(B_ORIGIN);
    visible.OffsetBy(-to_pixel_coordinate(origin.x), -to_pixel_coordinate(origin.y));
    return visible;
}

Painter* BView::PreparePainter() {
    if (mHost == nullptr) {
        return nullptr;
    }
    const PixelSurface surface = mHost->Surface();
    if (!surface.IsValid()) {
        return nullptr;
    }
    const bool sameSurface = mPainter != nullptr && mPainter->Surface().bits == surface.bits &&
                             mPainter->Surface().width == surface.width &&
                             mPainter->Surface().height == surface.height &&
                             mPainter->Surface().scale == surface.scale;
    if (!sameSurface) {
        mPainter = std::make_unique<Painter>(surface);
        mVisibleKnown = false;
        mClipKnown = false;
    }
    if (!mVisibleKnown) {
        mVisible = VisibleOnSurface(Covered::WithoutChildren);
        mVisibleKnown = true;
        mClipKnown = false;
    }
    if (!mClipKnown) {
        BRegion clip = mVisible;
        if (const BRegion* const limit = mHost->DrawingLimit(); limit != nullptr) {
            clip.IntersectWith(limit);
        }
        if (std::optional<BRegion> own = mState->CombinedClip(); own) {
            const BPoint origin = ConvertToSurface(B_ORIGIN);
            own->OffsetBy(to_pixel_coordinate(origin.x), to_pixel_coordinate(origin.y));
            clip.IntersectWith(&*own);
        }
        mPainter->SetClip(clip);
        mClipKnown = true;
    }
    return mPainter->Clip().IsEmpty() ? nullptr : mPainter.get();
}

void BView::Changed(const Painter& painter, const clipping_rect& surfaceRect) {
    const clipping_rect drawn = intersection(surfaceRect, painter.Clip().FrameInt());
    if (drawn.IsValid()) {
        mHost->SurfaceChanged(drawn);
    }
}

void BView::Sync() const {
    if (mHost != nullptr) {
        mHost->Sync();
    }
}

void BView::Flush() const {
    if (mHost != nullptr) {
        mHost->Flush();
    }
}

void BView::Invalidate() {
    Invalidate(mBounds);
}

void BView::Invalidate(BRect rect) {
    const BRegion region(rect);
    Invalidate(&region);
}

void BView::Invalidate(const BRegion* region) {
    if (mHost == nullptr || region == nullptr || region->IsEmpty() || IsHidden()) {
        return;
    }
    BRegion visible = VisibleRegion(Covered::WithChildren);
    visible.IntersectWith(region);
    if (!visible.IsEmpty()) {
        mHost->Invalidate(this, visible);
    }
}

void BView::GetMouse(BPoint* location, uint32* buttons, bool checkMessageQueue) {
    BPoint point(-1, -1);
    uint32 pressed = 0;
    if (mHost != nullptr) {
        // An idle pointer and a missing one look alike to the caller.
        (void)mHost->GetMouse(this, &point, &pressed, checkMessageQueue);
    }
    if (location != nullptr) {
        *location = ConvertFromSurface(point);
    }
    if (buttons != nullptr) {
        *buttons = pressed;
    }
}

void BView::MakeFocus(bool focus) {
    if (mHost != nullptr) {
        mHost->SetFocus(this, focus);
    }
}

bool BView::IsFocus() const {
    return mHost != nullptr && mHost->IsFocus(this);
}

status_t BView::SetEventMask(uint32 mask, uint32 /*options*/) {
    mEventMask = mask;
    if (mHost != nullptr) {
        mHost->EventMaskChanged(this);
    }
    return B_OK;
}

status_t BView::SetMouseEventMask(uint32 mask, uint32 options) {
    return mHost == nullptr ? B_ERROR : mHost->SetMouseEventMask(this, mask, options);
}
