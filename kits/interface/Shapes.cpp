#include "Shapes.h"

#include "RegionBuilder.h"

#include <algorithm>
#include <cmath>
#include <numbers>

namespace {

// A wider pen would fill any screen anyway, and its outlines must stay within the range of coordinates.
constexpr int32 kMaxPenWidth = 4096;

clipping_rect Grown(const clipping_rect& rect, int32 by) {
    return {rect.left - by, rect.top - by, rect.right + by, rect.bottom + by};
}

BRegion Clipped(BRegion region, const clipping_rect& clip) {
    const BRegion limit(clip);
    region.IntersectWith(&limit);
    return region;
}

BRegion Without(BRegion region, const BRegion& other) {
    region.Exclude(&other);
    return region;
}

// Rounds half up, so that a line is the same whichever end it starts from.
int64 RoundedQuotient(int64 dividend, int64 divisor) {
    const int64 doubled = 2 * dividend + divisor;
    const int64 quotient = doubled / (2 * divisor);
    return doubled % (2 * divisor) < 0 ? quotient - 1 : quotient;
}

// The half width of an ellipse's row at `dy` from its middle, or less than 0 outside.
double HalfRow(double dy, double xRadius, double yRadius) {
    const double t = dy / yRadius;
    return t * t > 1.0 ? -1.0 : xRadius * std::sqrt(1.0 - t * t);
}

// Adds the pixels of row y whose middles lie within `half` of the centre.
void AddCentredRun(RegionBuilder& builder, int32 y, double center, double half, const clipping_rect& clip) {
    if (half < 0) {
        return;
    }
    const int32 left = std::max(to_pixel_coordinate(std::ceil(center - half)), clip.left);
    const int32 right = std::min(to_pixel_coordinate(std::floor(center + half)), clip.right);
    builder.AddRun(y, left, right);
}

// The pixels that have all four neighbours inside too.
BRegion Interior(const BRegion& region) {
    BRegion interior = region;
    for (const PixelPoint by : {PixelPoint{1, 0}, PixelPoint{-1, 0}, PixelPoint{0, 1}, PixelPoint{0, -1}}) {
        BRegion moved = region;
        moved.OffsetBy(by.x, by.y);
        interior.IntersectWith(&moved);
    }
    return interior;
}

// A border of pen width around shapes that `fill` makes for a frame.
template <typename Fill>
BRegion Border(const clipping_rect& frame, int32 width, const clipping_rect& clip, Fill fill) {
    if (!frame.IsValid()) {
        return {};
    }
    width = std::clamp(width, 1, kMaxPenWidth);
    if (width == 1) {
        const BRegion filled = fill(frame, Grown(clip, 1));
        return Clipped(Without(filled, Interior(filled)), clip);
    }
    const int32 outside = width / 2;
    const clipping_rect outer = Grown(frame, outside);
    const clipping_rect inner = Grown(outer, -width);
    const BRegion filled = fill(outer, clip);
    return inner.IsValid() ? Without(filled, fill(inner, clip)) : filled;
}

// Whether a direction lies in the arc; angles in degrees, counter-clockwise.
class ArcTest {
  public:
    ArcTest(const clipping_rect& frame, double start, double span)
        : mCenterX((static_cast<double>(frame.left) + frame.right) / 2),
          mCenterY((static_cast<double>(frame.top) + frame.bottom) / 2),
          mXRadius((1.0 + frame.right - frame.left) / 2), mYRadius((1.0 + frame.bottom - frame.top) / 2) {
        mStart = span < 0 ? start + span : start;
        mSpan = std::min(std::abs(span), 360.0);
    }

    bool Contains(int32 x, int32 y) const {
        // In the circle that the ellipse is a stretched picture of, as angles of arcs are meant.
        const double angle =
            std::atan2((mCenterY - y) / mYRadius, (x - mCenterX) / mXRadius) * 180.0 / std::numbers::pi;
        double turned = std::fmod(angle - mStart, 360.0);
        if (turned < 0) {
            turned += 360.0;
        }
        constexpr double kTolerance = 1e-9;
        return turned <= mSpan + kTolerance || turned >= 360.0 - kTolerance;
    }

    BRegion Filtered(const BRegion& region) const {
        RegionBuilder builder;
        for (const clipping_rect& rect : region.Rects()) {
            for (int32 y = rect.top; y <= rect.bottom; ++y) {
                for (int32 x = rect.left; x <= rect.right; ++x) {
                    if (Contains(x, y)) {
                        builder.AddRun(y, x, x);
                    }
                }
            }
        }
        return builder.Build();
    }

  private:
    double mCenterX;
    double mCenterY;
    double mXRadius;
    double mYRadius;
    double mStart = 0;
    double mSpan = 0;
};

// So that twice a product of two distances stays within 64 bits.
PixelPoint LimitedForProducts(PixelPoint point) {
    constexpr int32 kLimit = 1 << 29;
    return {std::clamp(point.x, -kLimit, kLimit), std::clamp(point.y, -kLimit, kLimit)};
}

bool IsFinite(BPoint point) {
    return std::isfinite(point.x) && std::isfinite(point.y);
}

} // namespace

int32 to_pixel_coordinate(double value) {
    if (std::isnan(value)) {
        return 0;
    }
    constexpr double kLimit = kMaxRegionCoordinate;
    return static_cast<int32>(std::clamp(std::floor(value + 0.5), -kLimit, kLimit));
}

BRegion line_pixels(PixelPoint from, PixelPoint to, const clipping_rect& clip) {
    from = LimitedForProducts(from);
    to = LimitedForProducts(to);
    const int64 dx = static_cast<int64>(to.x) - from.x;
    const int64 dy = static_cast<int64>(to.y) - from.y;
    const int64 longest = std::max(std::abs(dx), std::abs(dy));
    if (longest == 0 || dx == 0 || dy == 0) {
        return Clipped(BRegion(clipping_rect{std::min(from.x, to.x), std::min(from.y, to.y),
                                             std::max(from.x, to.x), std::max(from.y, to.y)}),
                       clip);
    }
    RegionBuilder builder;
    if (std::abs(dx) >= std::abs(dy)) {
        if (dx < 0) {
            std::swap(from, to);
        }
        const int64 rise = static_cast<int64>(to.y) - from.y;
        const int32 first = std::max(from.x, clip.left);
        const int32 last = std::min(to.x, clip.right);
        for (int32 x = first; x <= last; ++x) {
            const auto y = static_cast<int32>(
                from.y + RoundedQuotient(rise * (static_cast<int64>(x) - from.x), longest));
            if (y >= clip.top && y <= clip.bottom) {
                builder.AddRun(y, x, x);
            }
        }
    } else {
        if (dy < 0) {
            std::swap(from, to);
        }
        const int64 run = static_cast<int64>(to.x) - from.x;
        const int32 first = std::max(from.y, clip.top);
        const int32 last = std::min(to.y, clip.bottom);
        for (int32 y = first; y <= last; ++y) {
            const auto x =
                static_cast<int32>(from.x + RoundedQuotient(run * (static_cast<int64>(y) - from.y), longest));
            if (x >= clip.left && x <= clip.right) {
                builder.AddRun(y, x, x);
            }
        }
    }
    return builder.Build();
}

BRegion thick_line_pixels(BPoint from, BPoint to, double width, cap_mode cap, const clipping_rect& clip) {
    if (!IsFinite(from) || !IsFinite(to)) {
        return {};
    }
    if (!(width > 1.0)) {
        return line_pixels({to_pixel_coordinate(from.x), to_pixel_coordinate(from.y)},
                           {to_pixel_coordinate(to.x), to_pixel_coordinate(to.y)}, clip);
    }
    width = std::min<double>(width, kMaxPenWidth);
    // The outline runs through the middles of the outermost pixels, which it includes.
    const double half = (width - 1.0) / 2;
    const double length = std::hypot(static_cast<double>(to.x) - from.x, static_cast<double>(to.y) - from.y);
    double alongX = half;
    double alongY = 0;
    if (length > 0) {
        alongX = (static_cast<double>(to.x) - from.x) / length * half;
        alongY = (static_cast<double>(to.y) - from.y) / length * half;
    }
    const double reach = cap == B_SQUARE_CAP || length == 0 ? 1.0 : 0.0;
    const auto corner = [&](BPoint end, double side, double forward) {
        return BPoint(static_cast<float>(end.x - alongY * side + alongX * forward * reach),
                      static_cast<float>(end.y + alongX * side + alongY * forward * reach));
    };
    BRegion line = polygon_pixels(
        {corner(from, 1, -1), corner(to, 1, 1), corner(to, -1, 1), corner(from, -1, -1)}, clip);
    if (cap == B_ROUND_CAP) {
        for (const BPoint end : {from, to}) {
            const BRegion dot =
                ellipse_pixels({to_pixel_coordinate(end.x - half), to_pixel_coordinate(end.y - half),
                                to_pixel_coordinate(end.x + half), to_pixel_coordinate(end.y + half)},
                               clip);
            line.Include(&dot);
        }
    }
    return line;
}

BRegion polygon_pixels(const std::vector<BPoint>& points, const clipping_rect& clip) {
    if (points.empty() || !clip.IsValid() || !std::all_of(points.begin(), points.end(), IsFinite)) {
        return {};
    }
    const auto pixel = [](BPoint point) {
        return PixelPoint{to_pixel_coordinate(point.x), to_pixel_coordinate(point.y)};
    };
    BRegion region;
    double top = points.front().y;
    double bottom = top;
    for (size_t i = 0; i < points.size(); ++i) {
        const BRegion edge = line_pixels(pixel(points[i]), pixel(points[(i + 1) % points.size()]), clip);
        region.Include(&edge);
        top = std::min<double>(top, points[i].y);
        bottom = std::max<double>(bottom, points[i].y);
    }
    RegionBuilder builder;
    std::vector<double> crossings;
    const int32 first = std::max(to_pixel_coordinate(std::ceil(top)), clip.top);
    const int32 last = std::min(to_pixel_coordinate(std::floor(bottom)), clip.bottom);
    for (int32 y = first; y <= last; ++y) {
        crossings.clear();
        for (size_t i = 0; i < points.size(); ++i) {
            const BPoint a = points[i];
            const BPoint b = points[(i + 1) % points.size()];
            // Half-open, so that a corner shared by two edges counts once.
            if ((a.y <= static_cast<float>(y)) != (b.y <= static_cast<float>(y))) {
                const double t = (static_cast<double>(y) - a.y) / (static_cast<double>(b.y) - a.y);
                crossings.push_back(a.x + t * (static_cast<double>(b.x) - a.x));
            }
        }
        std::sort(crossings.begin(), crossings.end());
        for (size_t i = 0; i + 1 < crossings.size(); i += 2) {
            builder.AddRun(y, std::max(to_pixel_coordinate(std::ceil(crossings[i])), clip.left),
                           std::min(to_pixel_coordinate(std::floor(crossings[i + 1])), clip.right));
        }
    }
    const BRegion inside = builder.Build();
    region.Include(&inside);
    return region;
}

BRegion ellipse_pixels(const clipping_rect& frame, const clipping_rect& clip) {
    if (!frame.IsValid() || !clip.IsValid()) {
        return {};
    }
    const double centerX = (static_cast<double>(frame.left) + frame.right) / 2;
    const double centerY = (static_cast<double>(frame.top) + frame.bottom) / 2;
    const double xRadius = (1.0 + frame.right - frame.left) / 2;
    const double yRadius = (1.0 + frame.bottom - frame.top) / 2;
    RegionBuilder builder;
    for (int32 y = std::max(frame.top, clip.top); y <= std::min(frame.bottom, clip.bottom); ++y) {
        AddCentredRun(builder, y, centerX, HalfRow(y - centerY, xRadius, yRadius), clip);
    }
    return builder.Build();
}

BRegion ellipse_border_pixels(const clipping_rect& frame, int32 width, const clipping_rect& clip) {
    return Border(frame, width, clip, ellipse_pixels);
}

BRegion arc_pixels(const clipping_rect& frame, double startAngle, double span, int32 width,
                   const clipping_rect& clip) {
    if (!frame.IsValid() || !std::isfinite(startAngle) || !std::isfinite(span)) {
        return {};
    }
    return ArcTest(frame, startAngle, span).Filtered(ellipse_border_pixels(frame, width, clip));
}

BRegion wedge_pixels(const clipping_rect& frame, double startAngle, double span, const clipping_rect& clip) {
    if (!frame.IsValid() || !std::isfinite(startAngle) || !std::isfinite(span)) {
        return {};
    }
    return ArcTest(frame, startAngle, span).Filtered(ellipse_pixels(frame, clip));
}

BRegion round_rect_pixels(const clipping_rect& frame, double xRadius, double yRadius,
                          const clipping_rect& clip) {
    if (!frame.IsValid() || !clip.IsValid()) {
        return {};
    }
    xRadius = std::clamp(std::isnan(xRadius) ? 0.0 : xRadius, 0.0, (1.0 + frame.right - frame.left) / 2);
    yRadius = std::clamp(std::isnan(yRadius) ? 0.0 : yRadius, 0.0, (1.0 + frame.bottom - frame.top) / 2);
    const double centerX = (static_cast<double>(frame.left) + frame.right) / 2;
    const double fullHalf = (1.0 + frame.right - frame.left) / 2;
    RegionBuilder builder;
    for (int32 y = std::max(frame.top, clip.top); y <= std::min(frame.bottom, clip.bottom); ++y) {
        // How far the row's middle reaches into the rounded part above or below.
        const double into = std::max(frame.top - 0.5 + yRadius - y, y - (frame.bottom + 0.5 - yRadius));
        double half = fullHalf;
        if (into > 0 && yRadius > 0) {
            half = fullHalf - xRadius + std::max(HalfRow(into, xRadius, yRadius), 0.0);
        }
        AddCentredRun(builder, y, centerX, half, clip);
    }
    return Clipped(builder.Build(), frame);
}

BRegion round_rect_border_pixels(const clipping_rect& frame, double xRadius, double yRadius, int32 width,
                                 const clipping_rect& clip) {
    return Border(frame, width, clip, [&](const clipping_rect& box, const clipping_rect& limit) {
        // The corners of the inner and outer border have the same middle.
        const double wider = static_cast<double>(frame.left) - box.left;
        return round_rect_pixels(box, xRadius > 0 ? std::max(xRadius + wider, 0.0) : 0,
                                 yRadius > 0 ? std::max(yRadius + wider, 0.0) : 0, limit);
    });
}

BRegion rect_border_pixels(const clipping_rect& frame, int32 width, const clipping_rect& clip) {
    return Border(frame, width, clip, [](const clipping_rect& box, const clipping_rect& limit) {
        return BRegion(intersection(box, limit));
    });
}

std::vector<BPoint> bezier_points(const BPoint controlPoints[4]) {
    double length = 0;
    for (int i = 0; i < 3; ++i) {
        if (!IsFinite(controlPoints[i]) || !IsFinite(controlPoints[i + 1])) {
            return {};
        }
        length += std::hypot(controlPoints[i + 1].x - controlPoints[i].x,
                             controlPoints[i + 1].y - controlPoints[i].y);
    }
    const int steps = static_cast<int>(std::clamp(length / 3.0, 4.0, 512.0));
    std::vector<BPoint> points;
    for (int i = 0; i <= steps; ++i) {
        const double t = static_cast<double>(i) / steps;
        const double u = 1.0 - t;
        const double weights[4] = {u * u * u, 3 * u * u * t, 3 * u * t * t, t * t * t};
        double x = 0;
        double y = 0;
        for (int k = 0; k < 4; ++k) {
            x += weights[k] * controlPoints[k].x;
            y += weights[k] * controlPoints[k].y;
        }
        points.emplace_back(static_cast<float>(x), static_cast<float>(y));
    }
    return points;
}
