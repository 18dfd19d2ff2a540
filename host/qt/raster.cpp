#include "host/api/raster.h"

#include <QImage>

#include <cstring>

namespace host {

namespace {

constexpr int max_side = 32767;

bool usable(const std::uint32_t* pixels, int width, int height, std::size_t stride) {
    return pixels != nullptr && width > 0 && height > 0 && width <= max_side && height <= max_side &&
           stride >= static_cast<std::size_t>(width) && stride <= 0x10000000U;
}

bool is_opaque(const PixelView& view) {
    for (int y = 0; y < view.height; ++y) {
        const std::uint32_t* row = view.pixels + static_cast<std::size_t>(y) * view.stride;
        std::uint32_t all = 0xFF000000U;
        for (int x = 0; x < view.width; ++x) {
            all &= row[x];
        }
        if ((all & 0xFF000000U) != 0xFF000000U) {
            return false;
        }
    }
    return true;
}

} // namespace

bool scale_smoothly(PixelView source, MutablePixelView target) {
    if (!usable(source.pixels, source.width, source.height, source.stride) ||
        !usable(target.pixels, target.width, target.height, target.stride)) {
        return false;
    }
    const bool opaque = is_opaque(source);
    const QImage borrowed(reinterpret_cast<const uchar*>(source.pixels), source.width, source.height,
                          static_cast<qsizetype>(source.stride * sizeof(std::uint32_t)),
                          opaque ? QImage::Format_RGB32 : QImage::Format_ARGB32);
    // Averages are only right on colours that are multiplied by their alpha.
    const QImage scalable = opaque ? borrowed : borrowed.convertToFormat(QImage::Format_ARGB32_Premultiplied);
    QImage scaled =
        scalable.scaled(target.width, target.height, Qt::IgnoreAspectRatio, Qt::SmoothTransformation);
    scaled = std::move(scaled).convertToFormat(QImage::Format_ARGB32);
    if (scaled.width() != target.width || scaled.height() != target.height) {
        return false;
    }
    for (int y = 0; y < target.height; ++y) {
        std::memcpy(target.pixels + static_cast<std::size_t>(y) * target.stride, scaled.constScanLine(y),
                    static_cast<std::size_t>(target.width) * sizeof(std::uint32_t));
    }
    return true;
}

} // namespace host
