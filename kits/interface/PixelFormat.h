// Rows of pixels of every colour space, read and written through one common form.
#pragma once

#include <GraphicsDefs.h>

// A pixel in the common form: 0xAARRGGBB, colours not multiplied by alpha. A transparent pixel of a space
// with a magic value or an alpha bit has alpha 0; pixels of spaces without transparency have alpha 255.
typedef uint32 pixel32;

inline constexpr pixel32 kTransparentPixel = B_TRANSPARENT_MAGIC_RGBA32;

inline constexpr pixel32 to_pixel(rgb_color color) {
    return (static_cast<pixel32>(color.alpha) << 24) | (static_cast<pixel32>(color.red) << 16) |
           (static_cast<pixel32>(color.green) << 8) | static_cast<pixel32>(color.blue);
}

inline constexpr rgb_color to_color(pixel32 pixel) {
    return {static_cast<uint8>(pixel >> 16), static_cast<uint8>(pixel >> 8), static_cast<uint8>(pixel),
            static_cast<uint8>(pixel >> 24)};
}

inline constexpr uint8 pixel_alpha(pixel32 pixel) {
    return static_cast<uint8>(pixel >> 24);
}

// Whether bitmaps of the space can be made and drawn.
bool is_supported_space(color_space space);

int32 bits_per_pixel(color_space space);

// The bytes of a row without padding; 64 bits wide so that no width overflows.
int64 row_size(color_space space, int64 width);
// The same, padded to a multiple of four.
int64 padded_row_size(color_space space, int64 width);

// Reads pixels x .. x + count - 1 of the row.
void load_pixels(color_space space, const uint8* row, int32 x, int32 count, pixel32* pixels);

// Writes them. What the space cannot hold becomes the nearest that it can: B_CMAP8 the nearest colour of the
// palette (transparent below half alpha), grey spaces the brightness.
void store_pixels(color_space space, uint8* row, int32 x, int32 count, const pixel32* pixels);

// The same, but leaves the pixels alone whose coverage byte is 0.
void store_covered_pixels(color_space space, uint8* row, int32 x, int32 count, const pixel32* pixels,
                          const uint8* coverage);
