#include "Painter.h"

#include <algorithm>
#include <cmath>
#include <host/api/raster.h>
#include <string.h>

namespace {

// Larger pictures are not resampled as a whole; see DrawSurface.
constexpr int64 kMaxResampledPixels = int64{1} << 24;

int32 WidthOf(const clipping_rect& rect) {
    return rect.right - rect.left + 1;
}

int32 HeightOf(const clipping_rect& rect) {
    return rect.bottom - rect.top + 1;
}

bool IsSolid(const pattern& dots, uint8 value) {
    return std::all_of(std::begin(dots.data), std::end(dots.data),
                       [value](uint8 row) { return row == value; });
}

bool IsIndexed(color_space space) {
    return space == B_CMAP8 || space == B_GRAY1;
}

// Transparent pixels are left out by every mode that looks at the target; B_OP_ALPHA weighs alpha itself.
bool ModeUsesSourceAlpha(drawing_mode mode) {
    return mode != B_OP_COPY && mode != B_OP_ALPHA;
}

} // namespace

Painter::Painter(const PixelSurface& surface) : mSurface(surface), mClip(surface.LogicalBounds()) {}

void Painter::SetClip(const BRegion& clip) {
    const BRegion bounds(mSurface.LogicalBounds());
    mClip = clip;
    mClip.IntersectWith(&bounds);
}

void Painter::FillRect(const clipping_rect& rect, const Ink& ink) {
    if (!rect.IsValid()) {
        return;
    }
    for (const clipping_rect& part : mClip.Rects()) {
        if (part.top > rect.bottom) {
            break;
        }
        if (const clipping_rect common = intersection(part, rect); common.IsValid()) {
            FillClipped(common, ink);
        }
    }
}

void Painter::FillRegion(const BRegion& region, const Ink& ink) {
    if (region.CountRects() == 1) {
        FillRect(region.Rects().front(), ink);
        return;
    }
    BRegion common = region;
    common.IntersectWith(&mClip);
    for (const clipping_rect& rect : common.Rects()) {
        FillClipped(rect, ink);
    }
}

void Painter::FillClipped(const clipping_rect& rect, const Ink& ink) {
    const clipping_rect surface = {0, 0, mSurface.width - 1, mSurface.height - 1};
    const clipping_rect device = intersection(mSurface.ToDevice(rect), surface);
    if (!device.IsValid()) {
        return;
    }
    const bool allHigh = IsSolid(ink.dots, 0xFF);
    const bool allLow = IsSolid(ink.dots, 0x00);
    if (allLow && mode_skips_clear_bits(ink.blend.mode)) {
        return;
    }
    if ((allHigh && (ink.blend.mode == B_OP_COPY || ink.blend.mode == B_OP_OVER)) ||
        (allLow && ink.blend.mode == B_OP_COPY)) {
        if (ink.blend.mode == B_OP_COPY || ink.blend.high != kTransparentPixel) {
            FillSolid(device, allHigh ? ink.blend.high : ink.blend.low);
        }
        return;
    }
    for (int32 y = rect.top; y <= rect.bottom; ++y) {
        const int32 top = std::max(mSurface.DeviceEdge(y), device.top);
        const int32 bottom = std::min(mSurface.DeviceEdge(y + 1) - 1, device.bottom);
        if (top > bottom) {
            continue;
        }
        BuildPatternRow(rect, y, ink);
        const int32 skipped = device.left - mSurface.DeviceEdge(rect.left);
        for (int32 deviceY = top; deviceY <= bottom; ++deviceY) {
            BlendDeviceRow(device.left, deviceY, WidthOf(device), mSource.data() + skipped,
                           mCoverage.data() + skipped, ink);
        }
    }
}

void Painter::FillSolid(const clipping_rect& device, pixel32 color) {
    const auto count = static_cast<size_t>(WidthOf(device));
    if (mSurface.space == B_RGB32 || mSurface.space == B_RGBA32) {
        auto* const first = reinterpret_cast<pixel32*>(mSurface.Row(device.top)) + device.left;
        std::fill_n(first, count, color);
        // The library copies faster than a loop writes.
        for (int32 y = device.top + 1; y <= device.bottom; ++y) {
            memcpy(reinterpret_cast<pixel32*>(mSurface.Row(y)) + device.left, first, count * sizeof(pixel32));
        }
        return;
    }
    mSource.assign(count, color);
    for (int32 y = device.top; y <= device.bottom; ++y) {
        store_pixels(mSurface.space, mSurface.Row(y), device.left, WidthOf(device), mSource.data());
    }
}

void Painter::BuildPatternRow(const clipping_rect& rect, int32 y, const Ink& ink) {
    mSource.clear();
    mCoverage.clear();
    const uint8 bits = ink.dots.data[(y - ink.patternY) & 7];
    const bool skipsClear = mode_skips_clear_bits(ink.blend.mode);
    const bool skipsHigh = ink.blend.mode == B_OP_OVER && ink.blend.high == kTransparentPixel;
    int32 edge = mSurface.DeviceEdge(rect.left);
    for (int32 x = rect.left; x <= rect.right; ++x) {
        const bool set = (bits & (0x80U >> ((x - ink.patternX) & 7))) != 0;
        const int32 next = mSurface.DeviceEdge(x + 1);
        const auto count = static_cast<size_t>(next - edge);
        mSource.insert(mSource.end(), count, set ? ink.blend.high : ink.blend.low);
        mCoverage.insert(mCoverage.end(), count, (set ? !skipsHigh : !skipsClear) ? 255 : 0);
        edge = next;
    }
}

void Painter::BlendDeviceRow(int32 x, int32 y, int32 count, const pixel32* source, const uint8* coverage,
                             const Ink& ink) {
    uint8* row = mSurface.Row(y);
    if (mSurface.space == B_RGB32 || mSurface.space == B_RGBA32) {
        blend_row(ink.blend, source, coverage, reinterpret_cast<pixel32*>(row) + x, count);
        return;
    }
    mTarget.resize(static_cast<size_t>(count));
    load_pixels(mSurface.space, row, x, count, mTarget.data());
    blend_row(ink.blend, source, coverage, mTarget.data(), count);
    if (coverage == nullptr) {
        store_pixels(mSurface.space, row, x, count, mTarget.data());
    } else {
        store_covered_pixels(mSurface.space, row, x, count, mTarget.data(), coverage);
    }
}

bool Painter::KeepsPixelsSharp(const PixelSurface& source, const clipping_rect& from,
                               const clipping_rect& to) const {
    if (!IsIndexed(source.space) || WidthOf(to) < WidthOf(from) || HeightOf(to) < HeightOf(from)) {
        return false;
    }
    return mSurface.scale == 1.0 || (WidthOf(to) % WidthOf(from) == 0 && HeightOf(to) % HeightOf(from) == 0);
}

void Painter::DrawSurface(const PixelSurface& source, const clipping_rect& sourceRect,
                          const clipping_rect& target, const Ink& ink) {
    const clipping_rect whole = {0, 0, source.width - 1, source.height - 1};
    if (!source.IsValid() || !sourceRect.IsValid() || !target.IsValid() ||
        !intersection(whole, sourceRect).IsValid()) {
        return;
    }
    clipping_rect from = sourceRect;
    clipping_rect device = mSurface.ToDevice(target);
    if (const clipping_rect cut = intersection(whole, sourceRect); !(cut == sourceRect)) {
        const double perX = static_cast<double>(WidthOf(device)) / (1.0 + sourceRect.right - sourceRect.left);
        const double perY =
            static_cast<double>(HeightOf(device)) / (1.0 + sourceRect.bottom - sourceRect.top);
        const auto moved = [](int32 by, double per) { return static_cast<int32>(std::lround(by * per)); };
        device = {device.left + moved(cut.left - from.left, perX),
                  device.top + moved(cut.top - from.top, perY),
                  device.right - moved(from.right - cut.right, perX),
                  device.bottom - moved(from.bottom - cut.bottom, perY)};
        from = cut;
    }
    const clipping_rect surface = {0, 0, mSurface.width - 1, mSurface.height - 1};
    const clipping_rect visible =
        intersection(intersection(device, surface), mSurface.ToDevice(mClip.FrameInt()));
    if (!device.IsValid() || !visible.IsValid()) {
        return;
    }
    const int32 width = WidthOf(from);
    const int32 height = HeightOf(from);
    const bool sameSize = WidthOf(device) == width && HeightOf(device) == height;
    const int64 pixelCount = static_cast<int64>(WidthOf(device)) * HeightOf(device);
    if (!sameSize && pixelCount <= kMaxResampledPixels && !KeepsPixelsSharp(source, from, device)) {
        std::vector<pixel32> loaded(static_cast<size_t>(width) * static_cast<size_t>(height));
        for (int32 y = 0; y < height; ++y) {
            load_pixels(source.space, source.Row(from.top + y), from.left, width,
                        loaded.data() + static_cast<ptrdiff_t>(y) * width);
        }
        std::vector<pixel32> scaled(static_cast<size_t>(pixelCount));
        const auto stride = [](const clipping_rect& rect) { return static_cast<size_t>(WidthOf(rect)); };
        if (host::scale_smoothly({loaded.data(), width, height, stride(from)},
                                 {scaled.data(), WidthOf(device), HeightOf(device), stride(device)})) {
            DrawPixels(scaled, device, visible, ink);
        }
        return;
    }
    // Each visible pixel takes the source pixel under its middle.
    std::vector<pixel32> row(static_cast<size_t>(width));
    std::vector<pixel32> picked(static_cast<size_t>(WidthOf(visible)) *
                                static_cast<size_t>(HeightOf(visible)));
    pixel32* out = picked.data();
    const auto middle = [](int32 position, int32 from_size, int32 to_size) {
        return static_cast<int32>((2 * static_cast<int64>(position) + 1) * from_size /
                                  (2 * static_cast<int64>(to_size)));
    };
    int32 loadedRow = -1;
    for (int32 y = visible.top; y <= visible.bottom; ++y) {
        const int32 sourceY = middle(y - device.top, height, HeightOf(device));
        if (sourceY != loadedRow) {
            load_pixels(source.space, source.Row(from.top + sourceY), from.left, width, row.data());
            loadedRow = sourceY;
        }
        for (int32 x = visible.left; x <= visible.right; ++x) {
            *out++ = row[static_cast<size_t>(middle(x - device.left, width, WidthOf(device)))];
        }
    }
    DrawPixels(picked, visible, visible, ink);
}

void Painter::DrawPixels(const std::vector<pixel32>& pixels, const clipping_rect& device,
                         const clipping_rect& visible, const Ink& ink) {
    const bool usesAlpha = ModeUsesSourceAlpha(ink.blend.mode);
    for (const clipping_rect& part : mClip.Rects()) {
        const clipping_rect drawn = intersection(mSurface.ToDevice(part), visible);
        if (!drawn.IsValid()) {
            continue;
        }
        const int32 count = WidthOf(drawn);
        mCoverage.resize(static_cast<size_t>(count));
        for (int32 y = drawn.top; y <= drawn.bottom; ++y) {
            const pixel32* row = pixels.data() + static_cast<ptrdiff_t>(y - device.top) * WidthOf(device) +
                                 (drawn.left - device.left);
            if (usesAlpha) {
                std::transform(row, row + count, mCoverage.begin(), pixel_alpha);
            }
            BlendDeviceRow(drawn.left, y, count, row, usesAlpha ? mCoverage.data() : nullptr, ink);
        }
    }
}

void Painter::DrawText(const host::FontSpec& font, std::string_view text, double x, double y,
                       const Ink& ink) {
    constexpr double kLimit = 1 << 20;
    if (mClip.IsEmpty() || text.empty() || !(std::abs(x) < kLimit) || !(std::abs(y) < kLimit)) {
        return;
    }
    // The baseline, and the first glyph, on whole device pixels keep the text crisp.
    const auto originX = static_cast<int32>(std::lround(x * mSurface.scale));
    const auto originY = static_cast<int32>(std::lround(y * mSurface.scale));
    const clipping_rect surface = {0, 0, mSurface.width - 1, mSurface.height - 1};
    const clipping_rect visible = intersection(mSurface.ToDevice(mClip.FrameInt()), surface);
    if (!visible.IsValid()) {
        return;
    }
    const std::shared_ptr<const host::TextMask> drawnText =
        host::render_text(font, text, mSurface.scale,
                          {visible.left - originX, visible.top - originY, visible.right + 1 - originX,
                           visible.bottom + 1 - originY});
    if (drawnText == nullptr) {
        return;
    }
    const host::TextMask& mask = *drawnText;
    const clipping_rect box = {originX + mask.left, originY + mask.top, originX + mask.left + mask.width - 1,
                               originY + mask.top + mask.height - 1};
    const bool copies = ink.blend.mode == B_OP_COPY;
    mSource.assign(static_cast<size_t>(mask.width), ink.blend.high);
    for (const clipping_rect& part : mClip.Rects()) {
        const clipping_rect drawn = intersection(mSurface.ToDevice(part), intersection(box, visible));
        if (!drawn.IsValid()) {
            continue;
        }
        const int32 count = WidthOf(drawn);
        for (int32 row = drawn.top; row <= drawn.bottom; ++row) {
            const uint8* coverage = mask.coverage.data() +
                                    static_cast<ptrdiff_t>(row - box.top) * mask.width +
                                    (drawn.left - box.left);
            if (!copies) {
                BlendDeviceRow(drawn.left, row, count, mSource.data(), coverage, ink);
                continue;
            }
            if (mSurface.space == B_RGB32 || mSurface.space == B_RGBA32) {
                copy_text_row(ink.blend, coverage, reinterpret_cast<pixel32*>(mSurface.Row(row)) + drawn.left,
                              count);
                continue;
            }
            mTarget.resize(static_cast<size_t>(count));
            load_pixels(mSurface.space, mSurface.Row(row), drawn.left, count, mTarget.data());
            copy_text_row(ink.blend, coverage, mTarget.data(), count);
            store_covered_pixels(mSurface.space, mSurface.Row(row), drawn.left, count, mTarget.data(),
                                 coverage);
        }
    }
}

bool Painter::CanMoveExactly(int32 dx, int32 dy) const {
    const auto whole = [this](int32 distance) {
        const double device = distance * mSurface.scale;
        return device == std::floor(device);
    };
    return whole(dx) && whole(dy);
}

void Painter::MovePixels(const BRegion& target, int32 dx, int32 dy) {
    const auto deviceX = static_cast<int32>(std::lround(dx * mSurface.scale));
    const auto deviceY = static_cast<int32>(std::lround(dy * mSurface.scale));
    const clipping_rect surface = {0, 0, mSurface.width - 1, mSurface.height - 1};
    const clipping_rect readable = {deviceX, deviceY, surface.right + deviceX, surface.bottom + deviceY};
    BRegion clipped = target;
    clipped.IntersectWith(&mClip);
    std::vector<clipping_rect> pieces;
    size_t total = 0;
    for (const clipping_rect& rect : clipped.Rects()) {
        const clipping_rect piece = intersection(intersection(mSurface.ToDevice(rect), surface), readable);
        if (piece.IsValid()) {
            pieces.push_back(piece);
            total += static_cast<size_t>(WidthOf(piece)) * static_cast<size_t>(HeightOf(piece));
        }
    }
    std::vector<pixel32> kept(total);
    const auto eachRow = [&](auto move) {
        pixel32* at = kept.data();
        for (const clipping_rect& piece : pieces) {
            for (int32 y = piece.top; y <= piece.bottom; ++y, at += WidthOf(piece)) {
                move(piece, y, at);
            }
        }
    };
    eachRow([&](const clipping_rect& piece, int32 y, pixel32* at) {
        load_pixels(mSurface.space, mSurface.Row(y - deviceY), piece.left - deviceX, WidthOf(piece), at);
    });
    eachRow([&](const clipping_rect& piece, int32 y, const pixel32* at) {
        store_pixels(mSurface.space, mSurface.Row(y), piece.left, WidthOf(piece), at);
    });
}
