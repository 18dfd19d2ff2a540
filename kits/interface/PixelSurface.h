// PixelSurface: where drawing goes.
#pragma once

#include "PixelFormat.h"
#include <Region.h>

// Pixels in memory that somebody else owns and keeps alive. Drawing is given in logical pixels; each of them
// covers `scale` x `scale` device pixels of the memory, rounded so that neighbours never overlap and never
// leave a gap.
struct PixelSurface {
    uint8* bits = nullptr;
    int32 bytesPerRow = 0;
    int32 width = 0; // device pixels
    int32 height = 0;
    color_space space = B_RGB32;
    double scale = 1.0;

    bool IsValid() const { return bits != nullptr && width > 0 && height > 0; }
    uint8* Row(int32 y) const { return bits + static_cast<ptrdiff_t>(y) * bytesPerRow; }
    // The first device pixel, across or down, of a logical pixel.
    int32 DeviceEdge(int32 logical) const;
    // The device pixels of a logical rectangle, not cut to the surface.
    clipping_rect ToDevice(const clipping_rect& logical) const;
    // All logical pixels of which at least a part lies on the surface.
    clipping_rect LogicalBounds() const;
};
