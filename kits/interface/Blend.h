// The drawing modes, applied to a row of pixels.
#pragma once

#include "PixelFormat.h"

struct BlendSettings {
    drawing_mode mode = B_OP_COPY;
    source_alpha alphaSource = B_PIXEL_ALPHA;
    alpha_function alphaFunction = B_ALPHA_OVERLAY;
    pixel32 high = 0xFF000000U;
    pixel32 low = 0xFFFFFFFFU;
};

// Combines each source pixel with the target pixel and mixes the result in by the coverage (0 leaves the
// target as it is). A null `coverage` stands for 255 everywhere.
void blend_row(const BlendSettings& settings, const pixel32* source, const uint8* coverage, pixel32* target,
               int32 count);

// For text in B_OP_COPY, which does not look at the target: the high colour mixed with the low colour by the
// coverage, where there is any.
void copy_text_row(const BlendSettings& settings, const uint8* coverage, pixel32* target, int32 count);

// Whether the mode leaves the target alone where a pattern's bit is clear or a bitmap's pixel is transparent.
bool mode_skips_clear_bits(drawing_mode mode);
