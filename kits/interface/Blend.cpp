#include "Blend.h"

#include <algorithm>

namespace {

constexpr pixel32 kColorMask = 0x00FFFFFFU;
constexpr pixel32 kAlphaMask = 0xFF000000U;

uint32 Red(pixel32 pixel) {
    return (pixel >> 16) & 255U;
}
uint32 Green(pixel32 pixel) {
    return (pixel >> 8) & 255U;
}
uint32 Blue(pixel32 pixel) {
    return pixel & 255U;
}

uint32 DividedBy255(uint32 value) {
    return (value + 127U) / 255U;
}

// Two components at once, in bits 0 to 7 and 16 to 23; each half divides by 255 as DividedBy255() does.
uint32 MixPair(uint32 from, uint32 to, uint32 amount) {
    const uint32 sums = from * (255U - amount) + to * amount + 0x007F007FU;
    return ((sums + 0x00010001U + ((sums >> 8) & 0x00FF00FFU)) >> 8) & 0x00FF00FFU;
}

// `amount` of 255 gives `to`, 0 gives `from`; all four components.
pixel32 Mix(pixel32 from, pixel32 to, uint32 amount) {
    return MixPair(from & 0x00FF00FFU, to & 0x00FF00FFU, amount) |
           (MixPair((from >> 8) & 0x00FF00FFU, (to >> 8) & 0x00FF00FFU, amount) << 8);
}

template <typename Combine>
pixel32 EachColor(pixel32 source, pixel32 target, Combine combine) {
    return kAlphaMask | (combine(Red(source), Red(target)) << 16) |
           (combine(Green(source), Green(target)) << 8) | combine(Blue(source), Blue(target));
}

uint32 Brightness(pixel32 pixel) {
    return Red(pixel) * 77U + Green(pixel) * 150U + Blue(pixel) * 29U;
}

// Over a target that is itself partly transparent.
pixel32 Composite(pixel32 source, pixel32 target, uint32 alpha) {
    const uint32 under = pixel_alpha(target);
    const uint32 kept = DividedBy255(under * (255U - alpha));
    const uint32 sum = alpha + kept;
    if (sum == 0) {
        return 0;
    }
    const auto mixed = [&](uint32 s, uint32 t) {
        return std::min<uint32>((s * alpha + t * kept + sum / 2) / sum, 255U);
    };
    return (sum << 24) | (EachColor(source, target, mixed) & kColorMask);
}

pixel32 AlphaPixel(const BlendSettings& settings, pixel32 source, pixel32 target, uint32 coverage) {
    uint32 alpha =
        settings.alphaSource == B_CONSTANT_ALPHA ? pixel_alpha(settings.high) : pixel_alpha(source);
    alpha = DividedBy255(alpha * coverage);
    if (settings.alphaFunction == B_ALPHA_COMPOSITE) {
        return Composite(source, target, alpha);
    }
    return (target & kAlphaMask) | (Mix(target, source, alpha) & kColorMask);
}

pixel32 Combined(const BlendSettings& settings, pixel32 source, pixel32 target) {
    switch (settings.mode) {
    case B_OP_ERASE:
        return settings.low;
    case B_OP_INVERT:
        return target ^ kColorMask;
    case B_OP_ADD:
        return EachColor(source, target, [](uint32 s, uint32 t) { return std::min(s + t, 255U); });
    case B_OP_SUBTRACT:
        return EachColor(source, target, [](uint32 s, uint32 t) { return t > s ? t - s : 0U; });
    case B_OP_BLEND:
        return EachColor(source, target, [](uint32 s, uint32 t) { return (s + t) / 2; });
    case B_OP_MIN:
        return Brightness(source) < Brightness(target) ? source : target;
    case B_OP_MAX:
        return Brightness(source) > Brightness(target) ? source : target;
    case B_OP_SELECT:
        if ((target & kColorMask) == (settings.high & kColorMask)) {
            return settings.low;
        }
        if ((target & kColorMask) == (settings.low & kColorMask)) {
            return settings.high;
        }
        return target;
    default:
        return source;
    }
}

} // namespace

bool mode_skips_clear_bits(drawing_mode mode) {
    return mode == B_OP_OVER || mode == B_OP_ERASE || mode == B_OP_INVERT || mode == B_OP_SELECT;
}

void blend_row(const BlendSettings& settings, const pixel32* source, const uint8* coverage, pixel32* target,
               int32 count) {
    if (settings.mode == B_OP_COPY && coverage == nullptr) {
        std::copy_n(source, count, target);
        return;
    }
    for (int32 i = 0; i < count; ++i) {
        const uint32 amount = coverage == nullptr ? 255U : coverage[i];
        if (amount == 0) {
            continue;
        }
        if (settings.mode == B_OP_ALPHA) {
            target[i] = AlphaPixel(settings, source[i], target[i], amount);
            continue;
        }
        const pixel32 combined = Combined(settings, source[i], target[i]);
        target[i] = amount == 255U ? combined : Mix(target[i], combined, amount);
    }
}

void copy_text_row(const BlendSettings& settings, const uint8* coverage, pixel32* target, int32 count) {
    for (int32 i = 0; i < count; ++i) {
        if (coverage[i] != 0) {
            target[i] = Mix(settings.low, settings.high, coverage[i]);
        }
    }
}
