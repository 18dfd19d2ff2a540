// Colours, patterns, colour spaces and drawing modes.
#pragma once

#include <SupportDefs.h>

// Eight rows of eight pixels, the most significant bit leftmost: set bits are drawn in the high colour, clear
// ones in the low colour. Patterns are aligned to the view's coordinate system, so neighbouring fills join.
typedef struct pattern {
    uint8 data[8];
} pattern;

inline bool operator==(const pattern& a, const pattern& b) {
    for (int i = 0; i < 8; ++i) {
        if (a.data[i] != b.data[i]) {
            return false;
        }
    }
    return true;
}
inline bool operator!=(const pattern& a, const pattern& b) {
    return !(a == b);
}

inline constexpr pattern B_SOLID_HIGH = {{0xFF, 0xFF, 0xFF, 0xFF, 0xFF, 0xFF, 0xFF, 0xFF}};
inline constexpr pattern B_MIXED_COLORS = {{0xAA, 0x55, 0xAA, 0x55, 0xAA, 0x55, 0xAA, 0x55}};
inline constexpr pattern B_SOLID_LOW = {{0x00, 0x00, 0x00, 0x00, 0x00, 0x00, 0x00, 0x00}};

typedef struct rgb_color {
    uint8 red;
    uint8 green;
    uint8 blue;
    uint8 alpha;

    rgb_color& set_to(uint8 r, uint8 g, uint8 b, uint8 a = 255) {
        red = r;
        green = g;
        blue = b;
        alpha = a;
        return *this;
    }
    bool operator==(const rgb_color& other) const {
        return red == other.red && green == other.green && blue == other.blue && alpha == other.alpha;
    }
    bool operator!=(const rgb_color& other) const { return !(*this == other); }
} rgb_color;

inline constexpr rgb_color make_color(uint8 red, uint8 green, uint8 blue, uint8 alpha = 255) {
    return {red, green, blue, alpha};
}

// The pixel values that stand for "nothing here" in each kind of bitmap.
inline constexpr rgb_color B_TRANSPARENT_COLOR = {0x77, 0x74, 0x77, 0x00};
inline constexpr rgb_color B_TRANSPARENT_32_BIT = B_TRANSPARENT_COLOR;
inline constexpr uint8 B_TRANSPARENT_MAGIC_CMAP8 = 0xFF;
inline constexpr uint8 B_TRANSPARENT_8_BIT = B_TRANSPARENT_MAGIC_CMAP8;
inline constexpr uint16 B_TRANSPARENT_MAGIC_RGBA15 = 0x39CE;
inline constexpr uint16 B_TRANSPARENT_MAGIC_RGBA15_BIG = 0xCE39;
inline constexpr uint32 B_TRANSPARENT_MAGIC_RGBA32 = 0x00777477;
inline constexpr uint32 B_TRANSPARENT_MAGIC_RGBA32_BIG = 0x77747700;

// The colours of 8-bit pixels; see system_colors().
typedef struct color_map {
    int32 id;
    rgb_color color_list[256];
    uint8 inversion_map[256]; // the index of each colour's inverse
    uint8 index_map[32768];   // the nearest index of a colour of five bits each, red highest
} color_map;

typedef struct screen_id {
    int32 id;
} screen_id;
inline constexpr screen_id B_MAIN_SCREEN_ID = {0};

// Multi-byte pixels are little-endian unless the name says BIG.
enum color_space {
    B_NO_COLOR_SPACE = 0x0000,

    B_RGB32 = 0x0008,  // blue, green, red, unused
    B_RGBA32 = 0x2008, // blue, green, red, alpha
    B_RGB24 = 0x0003,  // blue, green, red
    B_RGB16 = 0x0005,  // five bits red, six green, five blue
    B_RGB15 = 0x0010,  // one bit unused, five bits each
    B_RGBA15 = 0x2010, // one bit alpha, five bits each
    B_CMAP8 = 0x0004,  // index of system_colors()
    B_GRAY8 = 0x0002,  // 0 black .. 255 white
    B_GRAY1 = 0x0001,  // one bit a pixel, most significant first: 0 white, 1 black

    B_RGB32_BIG = 0x1008,
    B_RGBA32_BIG = 0x3008,
    B_RGB24_BIG = 0x1003,
    B_RGB16_BIG = 0x1005,
    B_RGB15_BIG = 0x1010,
    B_RGBA15_BIG = 0x3010,

    B_RGB32_LITTLE = B_RGB32,
    B_RGBA32_LITTLE = B_RGBA32,
    B_RGB24_LITTLE = B_RGB24,
    B_RGB16_LITTLE = B_RGB16,
    B_RGB15_LITTLE = B_RGB15,
    B_RGBA15_LITTLE = B_RGBA15,

    // Video and print spaces have their names and values; bitmaps of them cannot be made.
    B_YCbCr422 = 0x4000,
    B_YCbCr411 = 0x4001,
    B_YCbCr444 = 0x4003,
    B_YCbCr420 = 0x4004,
    B_YUV422 = 0x4020,
    B_YUV411 = 0x4021,
    B_YUV444 = 0x4023,
    B_YUV420 = 0x4024,
    B_YUV9 = 0x402C,
    B_YUV12 = 0x402D,
    B_UVL24 = 0x4030,
    B_UVL32 = 0x4031,
    B_UVLA32 = 0x6031,
    B_LAB24 = 0x4032,
    B_LAB32 = 0x4033,
    B_LABA32 = 0x6033,
    B_HSI24 = 0x4040,
    B_HSI32 = 0x4041,
    B_HSIA32 = 0x6041,
    B_HSV24 = 0x4042,
    B_HSV32 = 0x4043,
    B_HSVA32 = 0x6043,
    B_HLS24 = 0x4044,
    B_HLS32 = 0x4045,
    B_HLSA32 = 0x6045,
    B_CMY24 = 0xC001,
    B_CMY32 = 0xC002,
    B_CMYA32 = 0xE002,
    B_CMYK32 = 0xC003,

    B_COLOR_8_BIT = B_CMAP8,
    B_GRAYSCALE_8_BIT = B_GRAY8,
    B_MONOCHROME_1_BIT = B_GRAY1,
    B_RGB_16_BIT = B_RGB15,
    B_RGB_32_BIT = B_RGB32,
    B_BIG_RGB_32_BIT = B_RGB32_BIG
};

// How drawn pixels meet those that are there. The source is the high or the low colour where the pattern says
// so, or a bitmap's pixel; transparent pixels of a bitmap are left out by all modes but B_OP_COPY.
enum drawing_mode {
    B_OP_COPY,     // the source replaces what is there
    B_OP_OVER,     // the same, but the pattern's clear bits and transparent pixels leave it
    B_OP_ERASE,    // the low colour where the source would be drawn
    B_OP_INVERT,   // what is there, inverted where the source would be drawn
    B_OP_ADD,      // components are added, up to 255
    B_OP_SUBTRACT, // the source's components are taken away, down to 0
    B_OP_BLEND,    // the middle of both
    B_OP_MIN,      // the darker of both
    B_OP_MAX,      // the brighter of both
    B_OP_SELECT,   // high and low colour change places where the source would be drawn; the rest stays
    B_OP_ALPHA     // mixed by alpha, see BView::SetBlendingMode()
};

enum source_alpha {
    B_PIXEL_ALPHA = 0, // each source pixel's own alpha
    B_CONSTANT_ALPHA   // the high colour's alpha for all
};

enum alpha_function {
    B_ALPHA_OVERLAY = 0, // the target keeps its own alpha
    B_ALPHA_COMPOSITE    // the target's alpha grows with what is drawn
};

enum {
    B_8_BIT_640x480 = 0x00000001,
    B_8_BIT_800x600 = 0x00000002,
    B_8_BIT_1024x768 = 0x00000004,
    B_8_BIT_1280x1024 = 0x00000008,
    B_8_BIT_1600x1200 = 0x00000010,
    B_16_BIT_640x480 = 0x00000020,
    B_16_BIT_800x600 = 0x00000040,
    B_16_BIT_1024x768 = 0x00000080,
    B_16_BIT_1280x1024 = 0x00000100,
    B_16_BIT_1600x1200 = 0x00000200,
    B_32_BIT_640x480 = 0x00000400,
    B_32_BIT_800x600 = 0x00000800,
    B_32_BIT_1024x768 = 0x00001000,
    B_32_BIT_1280x1024 = 0x00002000,
    B_32_BIT_1600x1200 = 0x00004000
};

// Whether bitmaps of the space can be made here; `supportFlags`, when given, receives
// B_VIEWS_SUPPORT_DRAW_BITMAP and B_BITMAPS_SUPPORT_ATTACHED_VIEWS as far as they hold.
bool bitmaps_support_space(color_space space, uint32* supportFlags);

enum { B_VIEWS_SUPPORT_DRAW_BITMAP = 0x1, B_BITMAPS_SUPPORT_ATTACHED_VIEWS = 0x2 };

// The size of `pixelChunk` bytes that hold `pixelsPerChunk` pixels, and what rows are padded to.
// B_BAD_VALUE for a space that is not supported here.
[[nodiscard]] status_t get_pixel_size_for(color_space space, size_t* pixelChunk, size_t* rowAlignment,
                                          size_t* pixelsPerChunk);
