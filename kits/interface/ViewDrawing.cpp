// The part of BView that draws lines, shapes and bitmaps.
#include <View.h>

#include "DrawingState.h"
#include "LineArray.h"
#include "Shapes.h"
#include "ViewHost.h"

#include <Bitmap.h>
#include <Polygon.h>

#include <algorithm>
#include <cmath>

namespace {

BRect FrameOf(BPoint center, float xRadius, float yRadius) {
    return {center.x - xRadius, center.y - yRadius, center.x + xRadius, center.y + yRadius};
}

std::vector<BPoint> Stretched(const BPoint* points, int32 count, BRect bounds) {
    BPolygon polygon(points, count);
    polygon.MapTo(polygon.Frame(), bounds);
    return polygon.Points();
}

PixelPoint ToPixelPoint(BPoint point) {
    return {to_pixel_coordinate(point.x), to_pixel_coordinate(point.y)};
}

} // namespace

BPoint BView::ToSurface(BPoint drawing) const {
    return ConvertToSurface(mState->ToView(drawing));
}

std::vector<BPoint> BView::ToSurface(const BPoint* points, int32 count) const {
    std::vector<BPoint> converted;
    for (int32 i = 0; i < count; ++i) {
        converted.push_back(ToSurface(points[i]));
    }
    return converted;
}

clipping_rect BView::ToSurfaceRect(BRect drawing) const {
    if (!drawing.IsValid()) {
        return kEmptyClippingRect;
    }
    const PixelPoint leftTop = ToPixelPoint(ToSurface(drawing.LeftTop()));
    const PixelPoint rightBottom = ToPixelPoint(ToSurface(drawing.RightBottom()));
    return {leftTop.x, leftTop.y, rightBottom.x, rightBottom.y};
}

int32 BView::PenWidth() const {
    return std::max(1, to_pixel_coordinate(mState->penSize * mState->CombinedScale()));
}

Ink BView::MakeInk(const pattern& dots) const {
    Ink ink;
    ink.blend.mode = mState->mode;
    ink.blend.alphaSource = mState->alphaSource;
    ink.blend.alphaFunction = mState->alphaFunction;
    ink.blend.high = to_pixel(mState->high);
    ink.blend.low = to_pixel(mState->low);
    ink.dots = dots;
    const PixelPoint origin = ToPixelPoint(ConvertToSurface(B_ORIGIN));
    ink.patternX = origin.x;
    ink.patternY = origin.y;
    return ink;
}

void BView::FillPixels(const BRegion& surfaceRegion, const pattern& dots) {
    if (Painter* const painter = PreparePainter(); painter != nullptr && !surfaceRegion.IsEmpty()) {
        painter->FillRegion(surfaceRegion, MakeInk(dots));
        Changed(*painter, surfaceRegion.FrameInt());
    }
}

void BView::DrawLine(Painter& painter, BPoint surfaceFrom, BPoint surfaceTo, const Ink& ink) {
    const clipping_rect clip = painter.Clip().FrameInt();
    const int32 width = PenWidth();
    const BRegion line = width > 1 ? thick_line_pixels(surfaceFrom, surfaceTo, width, mState->lineCap, clip)
                                   : line_pixels(ToPixelPoint(surfaceFrom), ToPixelPoint(surfaceTo), clip);
    painter.FillRegion(line, ink);
    Changed(painter, line.FrameInt());
}

void BView::StrokeLine(BPoint to, pattern dots) {
    StrokeLine(mState->penLocation, to, dots);
}

void BView::StrokeLine(BPoint from, BPoint to, pattern dots) {
    if (Painter* const painter = PreparePainter(); painter != nullptr) {
        DrawLine(*painter, ToSurface(from), ToSurface(to), MakeInk(dots));
    }
    mState->penLocation = to;
}

void BView::BeginLineArray(int32 count) {
    mLineArray = std::make_unique<LineArray>();
    // A hint only: the array grows where it was too small, and a silly count costs nothing.
    mLineArray->lines.reserve(static_cast<size_t>(std::clamp(count, 0, 4096)));
}

void BView::AddLine(BPoint from, BPoint to, rgb_color color) {
    if (mLineArray != nullptr) {
        mLineArray->lines.push_back({from, to, color});
    }
}

void BView::EndLineArray() {
    const std::unique_ptr<LineArray> array = std::move(mLineArray);
    Painter* const painter = array == nullptr ? nullptr : PreparePainter();
    if (painter == nullptr) {
        return;
    }
    Ink ink = MakeInk(B_SOLID_HIGH);
    for (const LineArray::Line& line : array->lines) {
        ink.blend.high = to_pixel(line.color);
        DrawLine(*painter, ToSurface(line.from), ToSurface(line.to), ink);
    }
}

void BView::StrokeRect(BRect rect, pattern dots) {
    if (const Painter* const painter = PreparePainter(); painter != nullptr) {
        FillPixels(rect_border_pixels(ToSurfaceRect(rect), PenWidth(), painter->Clip().FrameInt()), dots);
    }
}

void BView::FillRect(BRect rect, pattern dots) {
    const clipping_rect pixels = ToSurfaceRect(rect);
    if (Painter* const painter = PreparePainter(); painter != nullptr && pixels.IsValid()) {
        painter->FillRect(pixels, MakeInk(dots));
        Changed(*painter, pixels);
    }
}

void BView::FillRegion(BRegion* region, pattern dots) {
    if (region == nullptr) {
        return;
    }
    BRegion onSurface = mState->ToView(*region);
    const PixelPoint origin = ToPixelPoint(ConvertToSurface(B_ORIGIN));
    onSurface.OffsetBy(origin.x, origin.y);
    FillPixels(onSurface, dots);
}

void BView::InvertRect(BRect rect) {
    const clipping_rect pixels = ToSurfaceRect(rect);
    if (Painter* const painter = PreparePainter(); painter != nullptr && pixels.IsValid()) {
        Ink ink = MakeInk(B_SOLID_HIGH);
        ink.blend.mode = B_OP_INVERT;
        painter->FillRect(pixels, ink);
        Changed(*painter, pixels);
    }
}

void BView::StrokeRoundRect(BRect rect, float xRadius, float yRadius, pattern dots) {
    if (const Painter* const painter = PreparePainter(); painter != nullptr) {
        const float scale = mState->CombinedScale();
        FillPixels(round_rect_border_pixels(ToSurfaceRect(rect), xRadius * scale, yRadius * scale, PenWidth(),
                                            painter->Clip().FrameInt()),
                   dots);
    }
}

void BView::FillRoundRect(BRect rect, float xRadius, float yRadius, pattern dots) {
    if (const Painter* const painter = PreparePainter(); painter != nullptr) {
        const float scale = mState->CombinedScale();
        FillPixels(round_rect_pixels(ToSurfaceRect(rect), xRadius * scale, yRadius * scale,
                                     painter->Clip().FrameInt()),
                   dots);
    }
}

void BView::StrokePoints(const std::vector<BPoint>& surfacePoints, bool closed, const pattern& dots) {
    const Painter* const painter = PreparePainter();
    if (painter == nullptr || surfacePoints.empty()) {
        return;
    }
    // One region for all sides, so that no pixel is drawn twice where they meet.
    const clipping_rect clip = painter->Clip().FrameInt();
    const int32 width = PenWidth();
    BRegion all;
    const size_t count = surfacePoints.size();
    const size_t sides = closed && count > 2 ? count : std::max<size_t>(count - 1, 1);
    for (size_t i = 0; i < sides; ++i) {
        // Wide sides meet in round joints.
        const BRegion side = thick_line_pixels(surfacePoints[i], surfacePoints[(i + 1) % count], width,
                                               closed || sides > 1 ? B_ROUND_CAP : mState->lineCap, clip);
        all.Include(&side);
    }
    FillPixels(all, dots);
}

void BView::StrokePolygon(const BPolygon* polygon, bool closed, pattern dots) {
    if (polygon != nullptr) {
        StrokePolygon(polygon->Points().data(), polygon->CountPoints(), closed, dots);
    }
}

void BView::StrokePolygon(const BPoint* points, int32 count, bool closed, pattern dots) {
    StrokePoints(ToSurface(points, count), closed, dots);
}

void BView::StrokePolygon(const BPoint* points, int32 count, BRect bounds, bool closed, pattern dots) {
    const std::vector<BPoint> stretched = Stretched(points, count, bounds);
    StrokePolygon(stretched.data(), static_cast<int32>(stretched.size()), closed, dots);
}

void BView::FillPolygon(const BPolygon* polygon, pattern dots) {
    if (polygon != nullptr) {
        FillPolygon(polygon->Points().data(), polygon->CountPoints(), dots);
    }
}

void BView::FillPolygon(const BPoint* points, int32 count, pattern dots) {
    if (const Painter* const painter = PreparePainter(); painter != nullptr) {
        FillPixels(polygon_pixels(ToSurface(points, count), painter->Clip().FrameInt()), dots);
    }
}

void BView::FillPolygon(const BPoint* points, int32 count, BRect bounds, pattern dots) {
    const std::vector<BPoint> stretched = Stretched(points, count, bounds);
    FillPolygon(stretched.data(), static_cast<int32>(stretched.size()), dots);
}

void BView::StrokeTriangle(BPoint a, BPoint b, BPoint c, pattern dots) {
    const BPoint points[3] = {a, b, c};
    StrokePolygon(points, 3, true, dots);
}

void BView::StrokeTriangle(BPoint a, BPoint b, BPoint c, BRect bounds, pattern dots) {
    const BPoint points[3] = {a, b, c};
    StrokePolygon(points, 3, bounds, true, dots);
}

void BView::FillTriangle(BPoint a, BPoint b, BPoint c, pattern dots) {
    const BPoint points[3] = {a, b, c};
    FillPolygon(points, 3, dots);
}

void BView::FillTriangle(BPoint a, BPoint b, BPoint c, BRect bounds, pattern dots) {
    const BPoint points[3] = {a, b, c};
    FillPolygon(points, 3, bounds, dots);
}

void BView::StrokeEllipse(BPoint center, float xRadius, float yRadius, pattern dots) {
    StrokeEllipse(FrameOf(center, xRadius, yRadius), dots);
}

void BView::StrokeEllipse(BRect rect, pattern dots) {
    if (const Painter* const painter = PreparePainter(); painter != nullptr) {
        FillPixels(ellipse_border_pixels(ToSurfaceRect(rect), PenWidth(), painter->Clip().FrameInt()), dots);
    }
}

void BView::FillEllipse(BPoint center, float xRadius, float yRadius, pattern dots) {
    FillEllipse(FrameOf(center, xRadius, yRadius), dots);
}

void BView::FillEllipse(BRect rect, pattern dots) {
    if (const Painter* const painter = PreparePainter(); painter != nullptr) {
        FillPixels(ellipse_pixels(ToSurfaceRect(rect), painter->Clip().FrameInt()), dots);
    }
}

void BView::StrokeArc(BPoint center, float xRadius, float yRadius, float startAngle, float arcAngle,
                      pattern dots) {
    StrokeArc(FrameOf(center, xRadius, yRadius), startAngle, arcAngle, dots);
}

void BView::StrokeArc(BRect rect, float startAngle, float arcAngle, pattern dots) {
    if (const Painter* const painter = PreparePainter(); painter != nullptr) {
        FillPixels(
            arc_pixels(ToSurfaceRect(rect), startAngle, arcAngle, PenWidth(), painter->Clip().FrameInt()),
            dots);
    }
}

void BView::FillArc(BPoint center, float xRadius, float yRadius, float startAngle, float arcAngle,
                    pattern dots) {
    FillArc(FrameOf(center, xRadius, yRadius), startAngle, arcAngle, dots);
}

void BView::FillArc(BRect rect, float startAngle, float arcAngle, pattern dots) {
    if (const Painter* const painter = PreparePainter(); painter != nullptr) {
        FillPixels(wedge_pixels(ToSurfaceRect(rect), startAngle, arcAngle, painter->Clip().FrameInt()), dots);
    }
}

void BView::StrokeBezier(BPoint* controlPoints, pattern dots) {
    const std::vector<BPoint> points = bezier_points(controlPoints);
    StrokePolygon(points.data(), static_cast<int32>(points.size()), false, dots);
}

void BView::FillBezier(BPoint* controlPoints, pattern dots) {
    const std::vector<BPoint> points = bezier_points(controlPoints);
    FillPolygon(points.data(), static_cast<int32>(points.size()), dots);
}

void BView::CopyBits(BRect source, BRect target) {
    const clipping_rect from = ToSurfaceRect(source);
    const clipping_rect to = ToSurfaceRect(target);
    Painter* const painter = PreparePainter();
    if (painter == nullptr || !from.IsValid() || !to.IsValid()) {
        return;
    }
    const int32 dx = to.left - from.left;
    const int32 dy = to.top - from.top;
    const bool sameSize =
        to.right - to.left == from.right - from.left && to.bottom - to.top == from.bottom - from.top;
    if (!sameSize) {
        painter->DrawSurface(painter->Surface(), painter->Surface().ToDevice(from), to,
                             MakeInk(B_SOLID_HIGH));
        Changed(*painter, to);
        return;
    }
    BRegion wanted(to);
    wanted.IntersectWith(&painter->Clip());
    BRegion copied(from);
    copied.IntersectWith(&painter->Clip());
    copied.OffsetBy(dx, dy);
    copied.IntersectWith(&wanted);
    if (!painter->CanMoveExactly(dx, dy)) {
        copied.MakeEmpty();
    }
    painter->MovePixels(copied, dx, dy);
    Changed(*painter, copied.FrameInt());
    BRegion missing = wanted;
    missing.Exclude(&copied);
    if (!missing.IsEmpty()) {
        const PixelPoint origin = ToPixelPoint(ConvertToSurface(B_ORIGIN));
        missing.OffsetBy(-origin.x, -origin.y);
        Invalidate(&missing);
    }
}

void BView::DrawBitmapAsync(const BBitmap* bitmap, BRect bitmapRect, BRect viewRect) {
    Painter* const painter = PreparePainter();
    const clipping_rect target = ToSurfaceRect(viewRect);
    if (painter == nullptr || bitmap == nullptr || !bitmap->IsValid() || !bitmapRect.IsValid() ||
        !target.IsValid()) {
        return;
    }
    const BRect source = bitmapRect.OffsetByCopy(-bitmap->Bounds().LeftTop());
    const clipping_rect pixels = {to_pixel_coordinate(source.left), to_pixel_coordinate(source.top),
                                  to_pixel_coordinate(source.right), to_pixel_coordinate(source.bottom)};
    painter->DrawSurface(bitmap->Surface(), pixels, target, MakeInk(B_SOLID_HIGH));
    Changed(*painter, target);
}

void BView::DrawBitmapAsync(const BBitmap* bitmap, BRect viewRect) {
    if (bitmap != nullptr) {
        DrawBitmapAsync(bitmap, bitmap->Bounds(), viewRect);
    }
}

void BView::DrawBitmapAsync(const BBitmap* bitmap, BPoint where) {
    if (bitmap != nullptr) {
        DrawBitmapAsync(bitmap, bitmap->Bounds(), bitmap->Bounds().OffsetToCopy(where));
    }
}

void BView::DrawBitmapAsync(const BBitmap* bitmap) {
    DrawBitmapAsync(bitmap, mState->penLocation);
}

void BView::DrawBitmap(const BBitmap* bitmap, BRect bitmapRect, BRect viewRect) {
    DrawBitmapAsync(bitmap, bitmapRect, viewRect);
}

void BView::DrawBitmap(const BBitmap* bitmap, BRect viewRect) {
    DrawBitmapAsync(bitmap, viewRect);
}

void BView::DrawBitmap(const BBitmap* bitmap, BPoint where) {
    DrawBitmapAsync(bitmap, where);
}

void BView::DrawBitmap(const BBitmap* bitmap) {
    DrawBitmapAsync(bitmap);
}
