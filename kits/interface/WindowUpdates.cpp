// The part of WindowHost that draws what is damaged and shows what was drawn.
#include "WindowHost.h"

#include "Painter.h"
#include "Shapes.h"

#include <View.h>

#include <utility>

namespace {

BRegion OnSurface(const BView& view, const BRegion& region) {
    BRegion moved = region;
    const BPoint origin = view.ConvertToSurface(B_ORIGIN);
    moved.OffsetBy(to_pixel_coordinate(origin.x), to_pixel_coordinate(origin.y));
    return moved;
}

} // namespace

void WindowHost::SurfaceChanged(const clipping_rect& logical) {
    mUpdates.Drawn(logical);
    if (mMessageDepth == 0 && !mUpdating) {
        // Somebody who has locked the window draws: it is shown when the window's thread comes to it.
        ScheduleUpdate();
    }
}

void WindowHost::Invalidate(BView* view, const BRegion& region) {
    mUpdates.Damage(OnSurface(*view, region));
    ScheduleUpdate();
}

void WindowHost::ScheduleUpdate() {
    if (!mUpdatePosted && mShown) {
        mUpdatePosted = true;
        mWindow.PostMessage(kWindowUpdate);
    }
}

void WindowHost::TakeUpdate() {
    mUpdatePosted = false;
    Update();
    Flush();
}

void WindowHost::ContentsScrolled(BView* view, const BRegion& region, int32 dx, int32 dy) {
    Painter painter(Surface());
    if (mUpdating || !mShown || !painter.Surface().IsValid() || !painter.CanMoveExactly(dx, dy)) {
        Invalidate(view, region);
        return;
    }
    const BRegion area = OnSurface(*view, region);
    const BRegion moved = mUpdates.Scrolled(area, dx, dy);
    painter.SetClip(area);
    painter.MovePixels(moved, dx, dy);
    if (!moved.IsEmpty()) {
        SurfaceChanged(moved.FrameInt());
    }
    if (mUpdates.IsDamaged()) {
        ScheduleUpdate();
    }
}

void WindowHost::Update() {
    if (mUpdating || mTransactions > 0 || !mShown || mRoot == nullptr || !mUpdates.IsDamaged()) {
        return;
    }
    mLimit = mUpdates.TakeDamage();
    mUpdating = true;
    // Drawing is limited to the damage from here on.
    mRoot->ForgetClipping();
    DrawTree(*mRoot, mLimit);
    mUpdating = false;
    mRoot->ForgetClipping();
    mLimit.MakeEmpty();
}

void WindowHost::DrawTree(BView& view, const BRegion& damage) {
    BRegion own = view.VisibleRegion(BView::Covered::WithChildren);
    own = OnSurface(view, own);
    own.IntersectWith(&damage);
    if (own.IsEmpty()) {
        return;
    }
    const BPoint origin = view.ConvertToSurface(B_ORIGIN);
    const BRect updateRect = own.Frame().OffsetByCopy(-origin);
    BRegion uncovered = OnSurface(view, view.VisibleRegion(BView::Covered::WithoutChildren));
    uncovered.IntersectWith(&damage);
    if (!uncovered.IsEmpty()) {
        ClearBackground(uncovered, view.ViewColor());
        if ((view.Flags() & B_WILL_DRAW) != 0) {
            view.Draw(updateRect);
        }
    }
    for (int32 i = 0; i < view.CountChildren(); ++i) {
        DrawTree(*view.ChildAt(i), damage);
    }
    if ((view.Flags() & B_DRAW_ON_CHILDREN) != 0) {
        view.DrawAfterChildren(updateRect);
    }
}

void WindowHost::ClearBackground(const BRegion& surfaceRegion, rgb_color color) {
    if (color == B_TRANSPARENT_COLOR) {
        return;
    }
    Painter painter(Surface());
    if (!painter.Surface().IsValid()) {
        return;
    }
    painter.SetClip(surfaceRegion);
    Ink ink;
    ink.blend.mode = B_OP_COPY;
    ink.blend.high = to_pixel(color);
    painter.FillRegion(surfaceRegion, ink);
    mUpdates.Drawn(surfaceRegion.FrameInt());
}

void WindowHost::Flush() {
    if (mTransactions > 0 || !mShown || !mUpdates.HasDrawn()) {
        return;
    }
    const PixelSurface surface = Surface();
    std::vector<host::DeviceRect> changed;
    for (const clipping_rect& rect : mUpdates.TakeDrawn()) {
        const clipping_rect device = surface.ToDevice(rect);
        changed.push_back({device.left, device.top, device.right + 1, device.bottom + 1});
    }
    // The outline lies over the picture and never is a part of it.
    if (mOutline.IsActive()) {
        mOutline.InvertOutline(surface);
    }
    mPeer->present(mPixels.data(), static_cast<size_t>(mPixelSize.width), mPixelSize, changed);
    if (mOutline.IsActive()) {
        mOutline.InvertOutline(surface);
    }
}

void WindowHost::Sync() {
    Flush();
    if (mShown) {
        mPeer->wait_for_present();
    }
}

void WindowHost::EndTransaction() {
    if (mTransactions > 0 && --mTransactions == 0) {
        ScheduleUpdate();
    }
}

void WindowHost::EndMessage() {
    if (--mMessageDepth == 0) {
        Flush();
    }
}
