#include "PixelSurface.h"

#include <algorithm>
#include <cmath>

int32 PixelSurface::DeviceEdge(int32 logical) const {
    if (scale == 1.0) {
        return logical;
    }
    constexpr double kLimit = kMaxRegionCoordinate;
    return static_cast<int32>(std::clamp(std::floor(logical * scale + 0.5), -kLimit, kLimit));
}

clipping_rect PixelSurface::ToDevice(const clipping_rect& logical) const {
    return {DeviceEdge(logical.left), DeviceEdge(logical.top), DeviceEdge(logical.right + 1) - 1,
            DeviceEdge(logical.bottom + 1) - 1};
}

clipping_rect PixelSurface::LogicalBounds() const {
    if (!IsValid()) {
        return kEmptyClippingRect;
    }
    const auto last = [this](int32 devicePixels) {
        return static_cast<int32>(std::ceil(devicePixels / scale)) - 1;
    };
    return {0, 0, last(width), last(height)};
}
