// The part of BWindow that deals with its frame and with screen coordinates.
#include <Window.h>

#include "WindowHost.h"

#include <Screen.h>

#include <algorithm>
#include <cmath>

void BWindow::SetFrame(BRect frame) {
    const BRect before = mHost->Geometry().Frame();
    mHost->Geometry().MoveTo(frame.LeftTop());
    mHost->Geometry().ResizeTo(frame.Width(), frame.Height());
    if (mHost->Geometry().Frame() == before) {
        return;
    }
    mHost->FrameWanted();
    // The hooks are called when the window's thread comes to it.
    PostMessage(kWindowAreaChanged);
}

void BWindow::MoveBy(float dh, float dv) {
    SetFrame(Frame().OffsetByCopy(dh, dv));
}

void BWindow::MoveTo(BPoint leftTop) {
    SetFrame(Frame().OffsetToCopy(leftTop));
}

void BWindow::MoveTo(float x, float y) {
    MoveTo(BPoint(x, y));
}

void BWindow::ResizeBy(float dh, float dv) {
    ResizeTo(Frame().Width() + dh, Frame().Height() + dv);
}

void BWindow::ResizeTo(float width, float height) {
    BRect frame = Frame();
    frame.right = frame.left + width;
    frame.bottom = frame.top + height;
    SetFrame(frame);
}

void BWindow::CenterIn(const BRect& rect) {
    const BRect frame = Frame();
    MoveTo(std::round(rect.left + (rect.Width() - frame.Width()) / 2),
           std::round(rect.top + (rect.Height() - frame.Height()) / 2));
}

void BWindow::CenterOnScreen() {
    if (const BRect screen = BScreen(this).UsableFrame(); screen.IsValid()) {
        CenterIn(screen);
    }
}

void BWindow::MoveOnScreen() {
    const BRect screen = BScreen(this).UsableFrame();
    if (!screen.IsValid()) {
        return;
    }
    const WindowGeometry::Margins margins = mHost->Margins();
    const BRect frame = Frame();
    const float left = std::min(frame.left, screen.right - margins.right - frame.Width());
    const float top = std::min(frame.top, screen.bottom - margins.bottom - frame.Height());
    MoveTo(std::max(left, screen.left + margins.left), std::max(top, screen.top + margins.top));
}

void BWindow::KeepTitleInReach() {
    const BRect own = BScreen(this).UsableFrame();
    if (!own.IsValid() || mHost->Traits().IsPopUp()) {
        return;
    }
    std::vector<BRect> usable = {own};
    BScreen screen;
    do {
        usable.push_back(screen.UsableFrame());
    } while (screen.SetToNext() == B_OK);
    SetFrame(WindowGeometry::WithTitleInReach(Frame(), mHost->Margins(), usable));
}

BRect BWindow::Bounds() const {
    return mHost->Geometry().Bounds();
}

BRect BWindow::Frame() const {
    return mHost->Geometry().Frame();
}

BRect BWindow::DecoratorFrame() const {
    const WindowGeometry::Margins margins = mHost->Margins();
    BRect frame = Frame();
    frame.left -= margins.left;
    frame.top -= margins.top;
    frame.right += margins.right;
    frame.bottom += margins.bottom;
    return frame;
}

// The desktop has moved or resized the window, or its own code has.
void BWindow::TakeFrame() {
    (void)mHost->TakeFrame();
    TellFrame();
}

void BWindow::TellFrame() {
    const BRect frame = Frame();
    const BRect told = mToldFrame;
    mToldFrame = frame;
    if (frame.LeftTop() != told.LeftTop()) {
        BMessage moved(B_WINDOW_MOVED);
        moved.AddInt64("when", system_time());
        moved.AddPoint("where", frame.LeftTop());
        DispatchMessage(&moved, this);
    }
    if (frame.Width() != told.Width() || frame.Height() != told.Height()) {
        BMessage resized(B_WINDOW_RESIZED);
        resized.AddInt64("when", system_time());
        resized.AddInt32("width", static_cast<int32>(frame.Width()));
        resized.AddInt32("height", static_cast<int32>(frame.Height()));
        DispatchMessage(&resized, this);
        // Shown together with the new size.
        mHost->Update();
    }
}

void BWindow::SetSizeLimits(float minWidth, float maxWidth, float minHeight, float maxHeight) {
    mHost->Geometry().SetLimits({minWidth, maxWidth, minHeight, maxHeight});
    mHost->TraitsChanged();
    SetFrame(Frame());
}

void BWindow::GetSizeLimits(float* minWidth, float* maxWidth, float* minHeight, float* maxHeight) {
    const WindowGeometry::Limits& limits = mHost->Geometry().SizeLimits();
    const auto give = [](float* to, float value) {
        if (to != nullptr) {
            *to = value;
        }
    };
    give(minWidth, limits.minWidth);
    give(maxWidth, limits.maxWidth);
    give(minHeight, limits.minHeight);
    give(maxHeight, limits.maxHeight);
}

void BWindow::SetZoomLimits(float maxWidth, float maxHeight) {
    mHost->Geometry().SetZoomLimits(maxWidth, maxHeight);
}

void BWindow::Minimize(bool minimize) {
    if (minimize != mMinimized && !IsModal()) {
        mMinimized = minimize;
        mHost->Peer()->minimize(minimize);
    }
}

void BWindow::Zoom() {
    const BRect screen = BScreen(this).UsableFrame();
    if (!screen.IsValid()) {
        return;
    }
    const BRect frame = mHost->Geometry().Zoomed(screen, mHost->Margins());
    Zoom(frame.LeftTop(), frame.Width(), frame.Height());
}

void BWindow::Zoom(BPoint leftTop, float width, float height) {
    SetFrame(BRect(leftTop.x, leftTop.y, leftTop.x + width, leftTop.y + height));
}

void BWindow::ConvertToScreen(BPoint* point) const {
    *point = ConvertToScreen(*point);
}

BPoint BWindow::ConvertToScreen(BPoint point) const {
    return point + Frame().LeftTop();
}

void BWindow::ConvertFromScreen(BPoint* point) const {
    *point = ConvertFromScreen(*point);
}

BPoint BWindow::ConvertFromScreen(BPoint point) const {
    return point - Frame().LeftTop();
}

void BWindow::ConvertToScreen(BRect* rect) const {
    *rect = ConvertToScreen(*rect);
}

BRect BWindow::ConvertToScreen(BRect rect) const {
    return rect.OffsetByCopy(Frame().LeftTop());
}

void BWindow::ConvertFromScreen(BRect* rect) const {
    *rect = ConvertFromScreen(*rect);
}

BRect BWindow::ConvertFromScreen(BRect rect) const {
    return rect.OffsetByCopy(-Frame().LeftTop());
}
