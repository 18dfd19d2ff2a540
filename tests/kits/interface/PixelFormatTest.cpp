#include "PixelFormat.h"
#include "SystemPalette.h"

#include <InterfaceDefs.h>

#include <gtest/gtest.h>
#include <set>

namespace {

constexpr color_space kAllSpaces[] = {B_RGB32,      B_RGBA32,    B_RGB24,     B_RGB16,     B_RGB15,
                                      B_RGBA15,     B_CMAP8,     B_GRAY8,     B_GRAY1,     B_RGB32_BIG,
                                      B_RGBA32_BIG, B_RGB24_BIG, B_RGB16_BIG, B_RGB15_BIG, B_RGBA15_BIG};

std::vector<uint8> Stored(color_space space, pixel32 pixel) {
    std::vector<uint8> row(static_cast<size_t>(padded_row_size(space, 1)), 0);
    store_pixels(space, row.data(), 0, 1, &pixel);
    row.resize(static_cast<size_t>(row_size(space, 1)));
    return row;
}

pixel32 RoundTrip(color_space space, pixel32 pixel) {
    std::vector<uint8> row(16, 0);
    store_pixels(space, row.data(), 1, 1, &pixel);
    pixel32 back = 0;
    load_pixels(space, row.data(), 1, 1, &back);
    return back;
}

TEST(PixelFormat, RowsArePaddedToFourBytes) {
    EXPECT_EQ(padded_row_size(B_RGB16, 65), 132);
    EXPECT_EQ(padded_row_size(B_CMAP8, 11), 12);
    EXPECT_EQ(padded_row_size(B_CMAP8, 16), 16);
    EXPECT_EQ(padded_row_size(B_GRAY1, 33), 8);
    EXPECT_EQ(padded_row_size(B_RGB24, 3), 12);
    EXPECT_EQ(padded_row_size(B_RGB32, 3), 12);
    EXPECT_EQ(row_size(B_GRAY1, 9), 2);
}

TEST(PixelFormat, BytesLieAsTheSpaceSays) {
    EXPECT_EQ(Stored(B_RGB32, 0xFF112233), (std::vector<uint8>{0x33, 0x22, 0x11, 0xFF}));
    EXPECT_EQ(Stored(B_RGB32_BIG, 0xFF112233), (std::vector<uint8>{0xFF, 0x11, 0x22, 0x33}));
    EXPECT_EQ(Stored(B_RGB24, 0xFF112233), (std::vector<uint8>{0x33, 0x22, 0x11}));
    EXPECT_EQ(Stored(B_RGB24_BIG, 0xFF112233), (std::vector<uint8>{0x11, 0x22, 0x33}));
    EXPECT_EQ(Stored(B_RGB16, 0xFFFF0000), (std::vector<uint8>{0x00, 0xF8}));
    EXPECT_EQ(Stored(B_RGB16, 0xFF00FF00), (std::vector<uint8>{0xE0, 0x07}));
    EXPECT_EQ(Stored(B_RGB16_BIG, 0xFFFF0000), (std::vector<uint8>{0xF8, 0x00}));
    EXPECT_EQ(Stored(B_RGB15, 0xFFFF0000), (std::vector<uint8>{0x00, 0x7C}));
    EXPECT_EQ(Stored(B_RGBA15, 0xFFFF0000), (std::vector<uint8>{0x00, 0xFC}));
    EXPECT_EQ(Stored(B_RGBA15, kTransparentPixel), (std::vector<uint8>{0xCE, 0x39}));
    EXPECT_EQ(Stored(B_GRAY8, 0xFFFFFFFF), (std::vector<uint8>{0xFF}));
    EXPECT_EQ(Stored(B_GRAY1, 0xFF000000), (std::vector<uint8>{0x80})) << "set bits are black";
    EXPECT_EQ(Stored(B_CMAP8, kTransparentPixel), (std::vector<uint8>{0xFF}));
}

TEST(PixelFormat, BlackAndWhiteSurviveEverySpace) {
    for (const color_space space : kAllSpaces) {
        EXPECT_EQ(RoundTrip(space, 0xFF000000), 0xFF000000U) << space;
        EXPECT_EQ(RoundTrip(space, 0xFFFFFFFF), 0xFFFFFFFFU) << space;
    }
}

TEST(PixelFormat, WhatASpaceHasOnceReadItKeeps) {
    for (const color_space space : kAllSpaces) {
        for (pixel32 pixel = 0xFF000000; pixel >= 0xFF000000; pixel += 0x00010305 * 7) {
            const pixel32 once = RoundTrip(space, pixel);
            ASSERT_EQ(RoundTrip(space, once), once) << space << " " << pixel;
        }
    }
}

TEST(PixelFormat, SixteenBitsKeepTheUpperBits) {
    for (pixel32 pixel = 0xFF000000; pixel >= 0xFF000000; pixel += 0x00010305) {
        const pixel32 back = RoundTrip(B_RGB16, pixel);
        ASSERT_EQ(back & 0xF8FCF8, pixel & 0xF8FCF8);
    }
}

TEST(PixelFormat, OnlyTheMagicValueOfRgb32IsTransparent) {
    const uint32 words[2] = {0x00777477, 0x00123456};
    pixel32 pixels[2];
    load_pixels(B_RGB32, reinterpret_cast<const uint8*>(words), 0, 2, pixels);
    EXPECT_EQ(pixels[0], 0x00777477U);
    EXPECT_EQ(pixels[1], 0xFF123456U);
    load_pixels(B_RGBA32, reinterpret_cast<const uint8*>(words), 0, 2, pixels);
    EXPECT_EQ(pixels[1], 0x00123456U);
}

TEST(PixelFormat, CoverageKeepsPixelsOut) {
    for (const color_space space : kAllSpaces) {
        std::vector<uint8> row(64, 0);
        const std::vector<pixel32> white(10, 0xFFFFFFFF);
        const std::vector<pixel32> black(10, 0xFF000000);
        const std::vector<uint8> coverage = {0, 1, 255, 0, 0, 9, 9, 9, 9, 0};
        store_pixels(space, row.data(), 0, 10, white.data());
        store_covered_pixels(space, row.data(), 0, 10, black.data(), coverage.data());
        std::vector<pixel32> back(10);
        load_pixels(space, row.data(), 0, 10, back.data());
        for (size_t i = 0; i < back.size(); ++i) {
            ASSERT_EQ(back[i], coverage[i] == 0 ? 0xFFFFFFFF : 0xFF000000) << space << " " << i;
        }
    }
}

TEST(PixelFormat, UnknownSpacesAreSaidToBeSo) {
    EXPECT_FALSE(is_supported_space(B_NO_COLOR_SPACE));
    EXPECT_FALSE(is_supported_space(B_YCbCr422));
    EXPECT_FALSE(is_supported_space(static_cast<color_space>(0x7777)));
    size_t chunk = 0;
    size_t alignment = 0;
    size_t perChunk = 0;
    EXPECT_EQ(get_pixel_size_for(B_RGB16, &chunk, &alignment, &perChunk), B_OK);
    EXPECT_EQ(chunk, 2U);
    EXPECT_EQ(alignment, 4U);
    EXPECT_EQ(perChunk, 1U);
    EXPECT_EQ(get_pixel_size_for(B_GRAY1, nullptr, nullptr, &perChunk), B_OK);
    EXPECT_EQ(perChunk, 8U);
    EXPECT_EQ(get_pixel_size_for(B_YUV9, nullptr, nullptr, nullptr), B_BAD_VALUE);
}

TEST(SystemPalette, HasItsAnchors) {
    EXPECT_EQ(color_for_index(0), make_color(0, 0, 0));
    EXPECT_EQ(color_for_index(1), make_color(8, 8, 8));
    EXPECT_EQ(color_for_index(27), make_color(216, 216, 216));
    EXPECT_EQ(color_for_index(31), make_color(248, 248, 248));
    EXPECT_EQ(color_for_index(63), make_color(255, 255, 255));
    EXPECT_EQ(color_for_index(B_TRANSPARENT_MAGIC_CMAP8), B_TRANSPARENT_COLOR);
}

TEST(SystemPalette, HasNoColourTwiceAndTheWholeCube) {
    std::set<uint32> colors;
    for (int i = 0; i < 255; ++i) {
        colors.insert(to_pixel(color_for_index(static_cast<uint8>(i))));
    }
    EXPECT_EQ(colors.size(), 255U);
    for (int red = 0; red <= 255; red += 51) {
        for (int green = 0; green <= 255; green += 51) {
            for (int blue = 0; blue <= 255; blue += 51) {
                EXPECT_EQ(colors.count(to_pixel(make_color(static_cast<uint8>(red), static_cast<uint8>(green),
                                                           static_cast<uint8>(blue)))),
                          1U);
            }
        }
    }
}

TEST(SystemPalette, EveryColourFindsItselfAndOthersTheirNearest) {
    for (int i = 0; i < 255; ++i) {
        EXPECT_EQ(index_for_color(color_for_index(static_cast<uint8>(i))), i);
    }
    for (uint32 step = 0; step < 0x1000000; step += 0x1357) {
        const rgb_color color = to_color(step);
        const auto distance = [&](int index) {
            const rgb_color other = color_for_index(static_cast<uint8>(index));
            const int red = color.red - other.red;
            const int green = color.green - other.green;
            const int blue = color.blue - other.blue;
            return red * red + green * green + blue * blue;
        };
        int best = 0;
        for (int i = 1; i < 255; ++i) {
            best = distance(i) < distance(best) ? i : best;
        }
        ASSERT_EQ(index_for_color(color), best) << step;
    }
}

TEST(SystemPalette, TheTableOfAllAgrees) {
    const color_map* const map = system_colors();
    EXPECT_EQ(map->color_list[63], make_color(255, 255, 255));
    EXPECT_EQ(map->index_map[0], 0);
    EXPECT_EQ(map->index_map[32767], 63);
    EXPECT_EQ(map->inversion_map[0], 63);
    EXPECT_EQ(map->inversion_map[63], 0);
    EXPECT_EQ(map->inversion_map[255], 255);
}

} // namespace
