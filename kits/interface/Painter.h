// Painter: draws on a pixel surface, inside a clip, exact to the pixel.
#pragma once

#include "Blend.h"
#include "PixelSurface.h"

#include <Region.h>
#include <host/api/fonts.h>

#include <string_view>
#include <vector>

// The colours and the way in which something is drawn.
struct Ink {
    BlendSettings blend;
    pattern dots = B_SOLID_HIGH;
    // The logical pixel at which the pattern's first row and column lie.
    int32 patternX = 0;
    int32 patternY = 0;
};

// All coordinates are logical pixels of the surface. Knows no views, no fonts' names and no windows. One
// thread at a time; painters on different surfaces are independent.
class Painter {
  public:
    explicit Painter(const PixelSurface& surface);

    const PixelSurface& Surface() const { return mSurface; }

    // Nothing is drawn outside the clip; it is cut to the surface. At first it is the whole surface.
    void SetClip(const BRegion& clip);
    const BRegion& Clip() const { return mClip; }

    void FillRect(const clipping_rect& rect, const Ink& ink);
    void FillRegion(const BRegion& region, const Ink& ink);

    // Fills `target` with the part `sourceRect` of another surface, whose scale does not matter. The ends of
    // sourceRect outside the source are cut off, with the part of the target that they would fill. Shrinking
    // averages; growing interpolates, except that indexed and one-bit sources repeat their pixels where each
    // becomes a whole number of device pixels or the surface has no scale.
    void DrawSurface(const PixelSurface& source, const clipping_rect& sourceRect, const clipping_rect& target,
                     const Ink& ink);

    // Text with its baseline starting at logical (x, y). Shapes are antialiased; in B_OP_COPY their edges are
    // mixed with the low colour, in all other modes with what is there.
    void DrawText(const host::FontSpec& font, std::string_view text, double x, double y, const Ink& ink);

    // Whether moving by this distance moves whole device pixels.
    bool CanMoveExactly(int32 dx, int32 dy) const;
    // Gives the pixels of `target` the values that lie at (-dx, -dy) from them, all read before any is
    // written. What lies outside the surface is not read; those pixels keep their values.
    void MovePixels(const BRegion& target, int32 dx, int32 dy);

  private:
    void FillClipped(const clipping_rect& rect, const Ink& ink);
    void FillSolid(const clipping_rect& device, pixel32 color);
    void BuildPatternRow(const clipping_rect& rect, int32 y, const Ink& ink);
    void BlendDeviceRow(int32 x, int32 y, int32 count, const pixel32* source, const uint8* coverage,
                        const Ink& ink);
    void DrawPixels(const std::vector<pixel32>& pixels, const clipping_rect& device,
                    const clipping_rect& visible, const Ink& ink);
    bool KeepsPixelsSharp(const PixelSurface& source, const clipping_rect& from,
                          const clipping_rect& to) const;

    PixelSurface mSurface;
    BRegion mClip;
    // Scratch rows, kept to spare allocations.
    std::vector<pixel32> mSource;
    std::vector<uint8> mCoverage;
    std::vector<pixel32> mTarget;
};
