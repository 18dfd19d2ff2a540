#include <Polygon.h>

#include <algorithm>

BPolygon::BPolygon(const BPoint* points, int32 count) {
    AddPoints(points, count);
}

BPolygon::BPolygon(const BPolygon* polygon) {
    if (polygon != nullptr) {
        mPoints = polygon->mPoints;
    }
}

BPolygon::~BPolygon() = default;

BRect BPolygon::Frame() const {
    if (mPoints.empty()) {
        return {};
    }
    BRect frame(mPoints.front(), mPoints.front());
    for (const BPoint& point : mPoints) {
        frame.left = std::min(frame.left, point.x);
        frame.top = std::min(frame.top, point.y);
        frame.right = std::max(frame.right, point.x);
        frame.bottom = std::max(frame.bottom, point.y);
    }
    return frame;
}

void BPolygon::AddPoints(const BPoint* points, int32 count) {
    if (points != nullptr && count > 0) {
        mPoints.insert(mPoints.end(), points, points + count);
    }
}

void BPolygon::MapTo(BRect source, BRect destination) {
    const auto map = [](float value, float from, float fromSize, float to, float toSize) {
        return fromSize == 0 ? to : to + (value - from) * toSize / fromSize;
    };
    for (BPoint& point : mPoints) {
        point.Set(map(point.x, source.left, source.Width(), destination.left, destination.Width()),
                  map(point.y, source.top, source.Height(), destination.top, destination.Height()));
    }
}

void BPolygon::PrintToStream() const {
    for (const BPoint& point : mPoints) {
        point.PrintToStream();
    }
}
