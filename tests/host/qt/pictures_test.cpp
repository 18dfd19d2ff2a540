#include "host/api/image_decoder.h"
#include "host/api/raster.h"

#include <algorithm>
#include <cstring>
#include <gtest/gtest.h>
#include <string>
#include <thread>

namespace {

constexpr std::uint32_t kRed = 0xFFFF0000;
constexpr std::uint32_t kBlue = 0xFF0000FF;
constexpr std::uint32_t kWhite = 0xFFFFFFFF;
constexpr std::uint32_t kBlack = 0xFF000000;

std::span<const std::byte> bytes_of(const std::string& text) {
    return std::as_bytes(std::span(text.data(), text.size()));
}

std::vector<std::byte> png_of(int width, int height, bool alpha, std::vector<std::uint32_t> pixels) {
    return host::encode_image("png", width, height, alpha, pixels).data;
}

void put_u32_be(std::vector<std::byte>& data, std::size_t at, std::uint32_t value) {
    for (std::size_t i = 0; i < 4; ++i) {
        data[at + i] = static_cast<std::byte>(value >> (24 - 8 * i));
    }
}

// The checksum that PNG chunks end with.
std::uint32_t crc_of(const std::byte* data, std::size_t size) {
    std::uint32_t crc = 0xFFFFFFFFU;
    for (std::size_t i = 0; i < size; ++i) {
        crc ^= static_cast<std::uint32_t>(data[i]);
        for (int bit = 0; bit < 8; ++bit) {
            crc = (crc >> 1) ^ ((crc & 1U) != 0 ? 0xEDB88320U : 0U);
        }
    }
    return ~crc;
}

TEST(ImageDecoder, ReadsBackWhatWasWritten) {
    const std::vector<std::uint32_t> pixels = {kRed, kBlue, 0x80112233, 0x00000000, kWhite, kBlack};
    const host::DecodedImage image = host::decode_image(png_of(3, 2, true, pixels));
    ASSERT_EQ(image.status, host::ImageStatus::ok);
    EXPECT_EQ(image.format, "png");
    EXPECT_EQ(image.width, 3);
    EXPECT_EQ(image.height, 2);
    EXPECT_TRUE(image.has_alpha);
    EXPECT_EQ(image.pixels, pixels);
}

TEST(ImageDecoder, OpaquePicturesHaveFullAlpha) {
    const host::EncodedImage file =
        host::encode_image("bmp", 2, 1, false, std::vector<std::uint32_t>{0x00FF0000, kBlue});
    ASSERT_EQ(file.status, host::ImageStatus::ok);
    const host::DecodedImage image = host::decode_image(file.data);
    ASSERT_EQ(image.status, host::ImageStatus::ok);
    EXPECT_FALSE(image.has_alpha);
    EXPECT_EQ(image.pixels, (std::vector<std::uint32_t>{kRed, kBlue}));
}

TEST(ImageDecoder, TellsUnknownDataFromDamagedPictures) {
    EXPECT_EQ(host::decode_image({}).status, host::ImageStatus::unknown_format);
    const std::string text = "this is no picture, however long it may be";
    EXPECT_EQ(host::decode_image(bytes_of(text)).status, host::ImageStatus::unknown_format);
    std::vector<std::byte> cut = png_of(64, 64, false, std::vector<std::uint32_t>(64 * 64, kRed));
    cut.resize(60);
    EXPECT_EQ(host::decode_image(cut).status, host::ImageStatus::damaged);
    EXPECT_EQ(host::identify_image(cut), "png");
    EXPECT_EQ(host::identify_image(bytes_of(text)), "");
}

TEST(ImageDecoder, RefusesASizeBeforeTakingMemoryForIt) {
    std::vector<std::byte> file = png_of(4, 4, false, std::vector<std::uint32_t>(16, kRed));
    // Width and height are the first fields of the header chunk, whose checksum follows it.
    put_u32_be(file, 16, 20000);
    put_u32_be(file, 20, 20000);
    put_u32_be(file, 29, crc_of(file.data() + 12, 17));
    EXPECT_EQ(host::decode_image(file).status, host::ImageStatus::too_large);
}

TEST(ImageDecoder, TurnsPicturesUprightAsTheirOrientationSays) {
    const std::vector<std::uint32_t> pixels = [] {
        std::vector<std::uint32_t> all(32 * 16, kBlue);
        for (std::size_t y = 0; y < 16; ++y) {
            std::fill_n(all.begin() + static_cast<std::ptrdiff_t>(y * 32), 16, kRed);
        }
        return all;
    }();
    std::vector<std::byte> file = host::encode_image("jpeg", 32, 16, false, pixels).data;
    ASSERT_GT(file.size(), 20U);
    // An EXIF segment with the one entry "orientation: 6", turn a quarter clockwise.
    const unsigned char exif[] = {0xFF, 0xE1, 0x00, 0x22, 'E', 'x', 'i', 'f', 0,    0,    'M', 'M',
                                  0,    42,   0,    0,    0,   8,   0,   1,   0x01, 0x12, 0,   3,
                                  0,    0,    0,    1,    0,   6,   0,   0,   0,    0,    0,   0};
    const auto* begin = reinterpret_cast<const std::byte*>(exif);
    file.insert(file.begin() + 2, begin, begin + sizeof(exif));
    const host::DecodedImage image = host::decode_image(file);
    ASSERT_EQ(image.status, host::ImageStatus::ok);
    EXPECT_EQ(image.width, 16);
    EXPECT_EQ(image.height, 32);
    EXPECT_GT(image.pixels[5 * 16 + 8] >> 16 & 255U, 200U) << "the left half, red, is now above";
    EXPECT_GT(image.pixels[27 * 16 + 8] & 255U, 200U) << "and the right half, blue, below";
}

TEST(ImageDecoder, KnowsItsFormats) {
    const std::vector<host::ImageFormat> formats = host::image_formats();
    const auto png =
        std::find_if(formats.begin(), formats.end(), [](const auto& f) { return f.name == "png"; });
    ASSERT_NE(png, formats.end());
    EXPECT_EQ(png->mime_type, "image/png");
    EXPECT_TRUE(png->can_read);
    EXPECT_TRUE(png->can_write);
    EXPECT_EQ(host::encode_image("no-such", 1, 1, false, std::vector<std::uint32_t>{kRed}).status,
              host::ImageStatus::unknown_format);
    EXPECT_EQ(host::encode_image("png", 2, 2, false, std::vector<std::uint32_t>{kRed}).status,
              host::ImageStatus::damaged);
}

TEST(ImageDecoder, WorksInSeveralThreads) {
    const std::vector<std::byte> file = png_of(50, 50, false, std::vector<std::uint32_t>(2500, kRed));
    std::vector<int> good(4, 0);
    std::vector<std::thread> threads;
    for (std::size_t t = 0; t < good.size(); ++t) {
        threads.emplace_back([&, t] {
            for (int i = 0; i < 20; ++i) {
                good[t] += host::decode_image(file).pixels == std::vector<std::uint32_t>(2500, kRed);
            }
        });
    }
    for (std::thread& thread : threads) {
        thread.join();
    }
    EXPECT_EQ(good, std::vector<int>(4, 20));
}

TEST(ScaleSmoothly, AveragesWhereItShrinks) {
    const std::vector<std::uint32_t> board = {kBlack, kWhite, kBlack, kWhite, kWhite, kBlack, kWhite, kBlack,
                                              kBlack, kWhite, kBlack, kWhite, kWhite, kBlack, kWhite, kBlack};
    std::vector<std::uint32_t> small(4, 0);
    ASSERT_TRUE(host::scale_smoothly({board.data(), 4, 4, 4}, {small.data(), 2, 2, 2}));
    for (const std::uint32_t pixel : small) {
        EXPECT_NEAR(static_cast<int>(pixel & 255U), 128, 4);
        EXPECT_EQ(pixel >> 24, 255U);
    }
}

TEST(ScaleSmoothly, KeepsAPlainColourAndTheRowsBetween) {
    const std::vector<std::uint32_t> plain(30 * 20, 0xFF336699);
    std::vector<std::uint32_t> target(10 * 8, 0xDEADBEEF);
    ASSERT_TRUE(host::scale_smoothly({plain.data(), 30, 20, 30}, {target.data(), 7, 8, 10}));
    for (std::size_t y = 0; y < 8; ++y) {
        for (std::size_t x = 0; x < 10; ++x) {
            EXPECT_EQ(target[y * 10 + x], x < 7 ? 0xFF336699 : 0xDEADBEEF);
        }
    }
}

TEST(ScaleSmoothly, TransparentPixelsDoNotBleed) {
    // White but transparent beside red: the edge must be red fading out, not pink.
    const std::vector<std::uint32_t> source = {0x00FFFFFF, kRed, 0x00FFFFFF, kRed};
    std::uint32_t mixed = 0;
    ASSERT_TRUE(host::scale_smoothly({source.data(), 2, 2, 2}, {&mixed, 1, 1, 1}));
    EXPECT_NEAR(static_cast<int>(mixed >> 24), 128, 2);
    EXPECT_EQ(mixed & 0xFFU, 0U);
    EXPECT_GE((mixed >> 16) & 0xFFU, 253U);
}

TEST(ScaleSmoothly, RefusesEmptySides) {
    std::uint32_t pixel = 7;
    EXPECT_FALSE(host::scale_smoothly({&pixel, 0, 1, 1}, {&pixel, 1, 1, 1}));
    EXPECT_FALSE(host::scale_smoothly({&pixel, 1, 1, 1}, {&pixel, 1, 0, 1}));
    EXPECT_FALSE(host::scale_smoothly({nullptr, 1, 1, 1}, {&pixel, 1, 1, 1}));
    EXPECT_EQ(pixel, 7U);
}

} // namespace
