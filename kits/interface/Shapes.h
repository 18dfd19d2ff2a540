// The pixels of lines and curves, as regions. Draws nothing.
//
// Every function is given a clip: pixels outside it are left out and cost nothing, however large the shape
// is. Coordinates are whole pixels where they are int32; BPoint coordinates are pixel centres.
#pragma once

#include <InterfaceDefs.h>
#include <Region.h>

#include <vector>

struct PixelPoint {
    int32 x = 0;
    int32 y = 0;
};

// The pixel that a coordinate falls into, kept within +-2^30; 0 for what is not a number.
int32 to_pixel_coordinate(double value);

// Both ends included; the same pixels in either direction.
BRegion line_pixels(PixelPoint from, PixelPoint to, const clipping_rect& clip);

// A line of `width` pixels with the given ends; from 1 down it is line_pixels().
BRegion thick_line_pixels(BPoint from, BPoint to, double width, cap_mode cap, const clipping_rect& clip);

// The inside by the even-odd rule, with its border. Fewer than three points give a line, a dot or nothing.
BRegion polygon_pixels(const std::vector<BPoint>& points, const clipping_rect& clip);

// The ellipse that touches the edges of the rectangle from inside.
BRegion ellipse_pixels(const clipping_rect& frame, const clipping_rect& clip);
BRegion ellipse_border_pixels(const clipping_rect& frame, int32 width, const clipping_rect& clip);

// From `startAngle` on, `span` degrees counter-clockwise; 0 points to the right.
BRegion arc_pixels(const clipping_rect& frame, double startAngle, double span, int32 width,
                   const clipping_rect& clip);
BRegion wedge_pixels(const clipping_rect& frame, double startAngle, double span, const clipping_rect& clip);

BRegion round_rect_pixels(const clipping_rect& frame, double xRadius, double yRadius,
                          const clipping_rect& clip);
BRegion round_rect_border_pixels(const clipping_rect& frame, double xRadius, double yRadius, int32 width,
                                 const clipping_rect& clip);

BRegion rect_border_pixels(const clipping_rect& frame, int32 width, const clipping_rect& clip);

// A cubic curve as a polyline fine enough for whole pixels; from control point 0 to 3.
std::vector<BPoint> bezier_points(const BPoint controlPoints[4]);
