// BPolygon: a list of points joined by lines, closed by its last one.
#pragma once

#include <Rect.h>

#include <vector>

// A plain value.
class BPolygon {
  public:
    BPolygon() = default;
    BPolygon(const BPoint* points, int32 count);
    explicit BPolygon(const BPolygon* polygon);
    BPolygon(const BPolygon& polygon) = default;
    virtual ~BPolygon();
    BPolygon& operator=(const BPolygon& polygon) = default;

    // The smallest rectangle around the points; not valid while there are none.
    BRect Frame() const;
    void AddPoints(const BPoint* points, int32 count);
    int32 CountPoints() const { return static_cast<int32>(mPoints.size()); }
    // Stretches the polygon so that what lies on `source` comes to lie on `destination`.
    void MapTo(BRect source, BRect destination);
    void PrintToStream() const;

    const std::vector<BPoint>& Points() const { return mPoints; }

  private:
    std::vector<BPoint> mPoints;
};
