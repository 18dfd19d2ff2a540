#include "PixelFormat.h"

#include "SystemPalette.h"

#include <bit>
#include <string.h>

namespace {

constexpr pixel32 kOpaque = 0xFF000000U;
constexpr int kHalfAlpha = 128;

static_assert(std::endian::native == std::endian::little, "pixels are laid out for a little-endian machine");

uint16 Load16(const uint8* at) {
    uint16 value;
    memcpy(&value, at, sizeof(value));
    return value;
}

uint32 Load32(const uint8* at) {
    uint32 value;
    memcpy(&value, at, sizeof(value));
    return value;
}

template <typename Integer>
void Store(uint8* at, Integer value) {
    memcpy(at, &value, sizeof(value));
}

uint16 Swapped(uint16 value) {
    return static_cast<uint16>((value << 8) | (value >> 8));
}

constexpr uint32 Widen5(uint32 five) {
    return (five << 3) | (five >> 2);
}

constexpr uint32 Widen6(uint32 six) {
    return (six << 2) | (six >> 4);
}

pixel32 From15(uint16 value) {
    return (Widen5((value >> 10) & 31U) << 16) | (Widen5((value >> 5) & 31U) << 8) | Widen5(value & 31U);
}

pixel32 From16(uint16 value) {
    return kOpaque | (Widen5(value >> 11U) << 16) | (Widen6((value >> 5) & 63U) << 8) | Widen5(value & 31U);
}

uint16 To15(pixel32 pixel) {
    return static_cast<uint16>(((pixel >> 9) & 0x7C00U) | ((pixel >> 6) & 0x03E0U) |
                               ((pixel >> 3) & 0x001FU));
}

uint16 To16(pixel32 pixel) {
    return static_cast<uint16>(((pixel >> 8) & 0xF800U) | ((pixel >> 5) & 0x07E0U) |
                               ((pixel >> 3) & 0x001FU));
}

pixel32 FromAlpha15(uint16 value) {
    return From15(value) | ((value & 0x8000U) != 0 ? kOpaque : 0U);
}

uint16 ToAlpha15(pixel32 pixel) {
    if (pixel_alpha(pixel) < kHalfAlpha) {
        return B_TRANSPARENT_MAGIC_RGBA15;
    }
    return static_cast<uint16>(To15(pixel) | 0x8000U);
}

// The fourth byte of these pixels means nothing, except in the magic value.
pixel32 FromUnusedAlpha(uint32 value) {
    return value == B_TRANSPARENT_MAGIC_RGBA32 ? kTransparentPixel : (value | kOpaque);
}

uint8 Brightness(pixel32 pixel) {
    const uint32 sum = ((pixel >> 16) & 255U) * 77U + ((pixel >> 8) & 255U) * 150U + (pixel & 255U) * 29U;
    return static_cast<uint8>(sum >> 8);
}

pixel32 FromGrey(uint8 level) {
    return kOpaque | (level * 0x010101U);
}

pixel32 FromIndex(uint8 index) {
    return index == B_TRANSPARENT_MAGIC_CMAP8 ? kTransparentPixel : to_pixel(color_for_index(index));
}

// Most rows repeat their colours, and finding an index is the slow part.
class IndexFinder {
  public:
    uint8 Find(pixel32 pixel) {
        if (pixel_alpha(pixel) < kHalfAlpha) {
            return B_TRANSPARENT_MAGIC_CMAP8;
        }
        if (pixel != mLast) {
            mLast = pixel;
            mIndex = index_for_color(to_color(pixel));
        }
        return mIndex;
    }

  private:
    pixel32 mLast = kOpaque;
    uint8 mIndex = 0;
};

// One loop for all spaces of whole bytes a pixel.
template <typename Read>
void LoadEach(const uint8* row, int32 x, int32 count, int32 size, pixel32* pixels, Read read) {
    const uint8* at = row + static_cast<ptrdiff_t>(x) * size;
    for (int32 i = 0; i < count; ++i, at += size) {
        pixels[i] = read(at);
    }
}

template <typename Write>
void StoreEach(uint8* row, int32 x, int32 count, int32 size, const pixel32* pixels, const uint8* coverage,
               Write write) {
    uint8* at = row + static_cast<ptrdiff_t>(x) * size;
    for (int32 i = 0; i < count; ++i, at += size) {
        if (coverage == nullptr || coverage[i] != 0) {
            write(at, pixels[i]);
        }
    }
}

void StoreBit(uint8* row, int32 x, bool set) {
    const auto bit = static_cast<uint8>(0x80U >> (x & 7));
    uint8& byte = row[x >> 3];
    byte = static_cast<uint8>(set ? byte | bit : byte & ~bit);
}

void StoreRow(color_space space, uint8* row, int32 x, int32 count, const pixel32* pixels,
              const uint8* coverage) {
    const auto each = [&](int32 size, auto write) {
        StoreEach(row, x, count, size, pixels, coverage, write);
    };
    switch (space) {
    case B_RGB32:
    case B_RGBA32:
        each(4, [](uint8* at, pixel32 pixel) { Store<uint32>(at, pixel); });
        break;
    case B_RGB32_BIG:
    case B_RGBA32_BIG:
        each(4, [](uint8* at, pixel32 pixel) { Store<uint32>(at, __builtin_bswap32(pixel)); });
        break;
    case B_RGB24:
        each(3, [](uint8* at, pixel32 pixel) {
            at[0] = static_cast<uint8>(pixel);
            at[1] = static_cast<uint8>(pixel >> 8);
            at[2] = static_cast<uint8>(pixel >> 16);
        });
        break;
    case B_RGB24_BIG:
        each(3, [](uint8* at, pixel32 pixel) {
            at[0] = static_cast<uint8>(pixel >> 16);
            at[1] = static_cast<uint8>(pixel >> 8);
            at[2] = static_cast<uint8>(pixel);
        });
        break;
    case B_RGB16:
        each(2, [](uint8* at, pixel32 pixel) { Store<uint16>(at, To16(pixel)); });
        break;
    case B_RGB16_BIG:
        each(2, [](uint8* at, pixel32 pixel) { Store<uint16>(at, Swapped(To16(pixel))); });
        break;
    case B_RGB15:
        each(2, [](uint8* at, pixel32 pixel) { Store<uint16>(at, To15(pixel)); });
        break;
    case B_RGB15_BIG:
        each(2, [](uint8* at, pixel32 pixel) { Store<uint16>(at, Swapped(To15(pixel))); });
        break;
    case B_RGBA15:
        each(2, [](uint8* at, pixel32 pixel) { Store<uint16>(at, ToAlpha15(pixel)); });
        break;
    case B_RGBA15_BIG:
        each(2, [](uint8* at, pixel32 pixel) { Store<uint16>(at, Swapped(ToAlpha15(pixel))); });
        break;
    case B_CMAP8: {
        IndexFinder finder;
        each(1, [&](uint8* at, pixel32 pixel) { *at = finder.Find(pixel); });
        break;
    }
    case B_GRAY8:
        each(1, [](uint8* at, pixel32 pixel) { *at = Brightness(pixel); });
        break;
    case B_GRAY1:
        for (int32 i = 0; i < count; ++i) {
            if (coverage == nullptr || coverage[i] != 0) {
                StoreBit(row, x + i, Brightness(pixels[i]) < 128);
            }
        }
        break;
    default:
        break;
    }
}

} // namespace

int32 bits_per_pixel(color_space space) {
    switch (space) {
    case B_RGB32:
    case B_RGBA32:
    case B_RGB32_BIG:
    case B_RGBA32_BIG:
        return 32;
    case B_RGB24:
    case B_RGB24_BIG:
        return 24;
    case B_RGB16:
    case B_RGB16_BIG:
    case B_RGB15:
    case B_RGB15_BIG:
    case B_RGBA15:
    case B_RGBA15_BIG:
        return 16;
    case B_CMAP8:
    case B_GRAY8:
        return 8;
    case B_GRAY1:
        return 1;
    default:
        return 0;
    }
}

bool is_supported_space(color_space space) {
    return bits_per_pixel(space) != 0;
}

int64 row_size(color_space space, int64 width) {
    return (width * bits_per_pixel(space) + 7) / 8;
}

int64 padded_row_size(color_space space, int64 width) {
    return (row_size(space, width) + 3) / 4 * 4;
}

void load_pixels(color_space space, const uint8* row, int32 x, int32 count, pixel32* pixels) {
    const auto each = [&](int32 size, auto read) { LoadEach(row, x, count, size, pixels, read); };
    switch (space) {
    case B_RGB32:
        each(4, [](const uint8* at) { return FromUnusedAlpha(Load32(at)); });
        break;
    case B_RGBA32:
        each(4, [](const uint8* at) { return Load32(at); });
        break;
    case B_RGB32_BIG:
        each(4, [](const uint8* at) { return FromUnusedAlpha(__builtin_bswap32(Load32(at))); });
        break;
    case B_RGBA32_BIG:
        each(4, [](const uint8* at) { return __builtin_bswap32(Load32(at)); });
        break;
    case B_RGB24:
        each(3, [](const uint8* at) {
            return kOpaque | (static_cast<pixel32>(at[2]) << 16) | (static_cast<pixel32>(at[1]) << 8) | at[0];
        });
        break;
    case B_RGB24_BIG:
        each(3, [](const uint8* at) {
            return kOpaque | (static_cast<pixel32>(at[0]) << 16) | (static_cast<pixel32>(at[1]) << 8) | at[2];
        });
        break;
    case B_RGB16:
        each(2, [](const uint8* at) { return From16(Load16(at)); });
        break;
    case B_RGB16_BIG:
        each(2, [](const uint8* at) { return From16(Swapped(Load16(at))); });
        break;
    case B_RGB15:
        each(2, [](const uint8* at) { return kOpaque | From15(Load16(at)); });
        break;
    case B_RGB15_BIG:
        each(2, [](const uint8* at) { return kOpaque | From15(Swapped(Load16(at))); });
        break;
    case B_RGBA15:
        each(2, [](const uint8* at) { return FromAlpha15(Load16(at)); });
        break;
    case B_RGBA15_BIG:
        each(2, [](const uint8* at) { return FromAlpha15(Swapped(Load16(at))); });
        break;
    case B_CMAP8:
        each(1, [](const uint8* at) { return FromIndex(*at); });
        break;
    case B_GRAY8:
        each(1, [](const uint8* at) { return FromGrey(*at); });
        break;
    case B_GRAY1:
        for (int32 i = 0; i < count; ++i) {
            const int32 at = x + i;
            pixels[i] = FromGrey((row[at >> 3] & (0x80U >> (at & 7))) != 0 ? 0 : 255);
        }
        break;
    default:
        break;
    }
}

void store_pixels(color_space space, uint8* row, int32 x, int32 count, const pixel32* pixels) {
    StoreRow(space, row, x, count, pixels, nullptr);
}

void store_covered_pixels(color_space space, uint8* row, int32 x, int32 count, const pixel32* pixels,
                          const uint8* coverage) {
    StoreRow(space, row, x, count, pixels, coverage);
}

bool bitmaps_support_space(color_space space, uint32* supportFlags) {
    const bool supported = is_supported_space(space);
    if (supportFlags != nullptr) {
        *supportFlags = supported ? B_VIEWS_SUPPORT_DRAW_BITMAP | B_BITMAPS_SUPPORT_ATTACHED_VIEWS : 0;
    }
    return supported;
}

status_t get_pixel_size_for(color_space space, size_t* pixelChunk, size_t* rowAlignment,
                            size_t* pixelsPerChunk) {
    const int32 bits = bits_per_pixel(space);
    if (bits == 0) {
        return B_BAD_VALUE;
    }
    if (pixelChunk != nullptr) {
        *pixelChunk = bits == 1 ? 1 : static_cast<size_t>(bits / 8);
    }
    if (rowAlignment != nullptr) {
        *rowAlignment = 4;
    }
    if (pixelsPerChunk != nullptr) {
        *pixelsPerChunk = bits == 1 ? 8 : 1;
    }
    return B_OK;
}
