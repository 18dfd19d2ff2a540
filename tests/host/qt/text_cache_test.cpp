#include "host/qt/text_cache.h"

#include <gtest/gtest.h>
#include <string>

namespace {

host::FontKey key_of_size(int size) {
    host::FontKey key;
    key.size = size;
    return key;
}

std::shared_ptr<const host::TextMask> mask_of_bytes(std::size_t bytes) {
    auto mask = std::make_shared<host::TextMask>();
    mask->coverage.resize(bytes);
    return mask;
}

TEST(TextCache, AddsWhatIsFoundOutOneByOne) {
    host::TextCache cache(100'000);
    const host::FontKey font = key_of_size(12);
    EXPECT_FALSE(cache.find(font, "Song").width);

    cache.keep(font, "Song", {.width = 30.0F});
    const auto mask = mask_of_bytes(100);
    cache.keep(font, "Song", {.mask = mask, .mask_scale = 1.5});

    const host::KnownText known = cache.find(font, "Song");
    EXPECT_EQ(known.width, 30.0F);
    EXPECT_EQ(known.mask, mask);
    EXPECT_EQ(known.mask_scale, 1.5);
    EXPECT_EQ(known.advances, nullptr);
    EXPECT_FALSE(cache.find(font, "Son").width);
    EXPECT_FALSE(cache.find(key_of_size(13), "Song").width);
}

TEST(TextCache, RemembersThatNothingIsInked) {
    host::TextCache cache(100'000);
    cache.keep(key_of_size(12), "   ", {.mask = nullptr, .mask_scale = 1.0});
    EXPECT_EQ(cache.find(key_of_size(12), "   ").mask_scale, 1.0);
    EXPECT_EQ(cache.find(key_of_size(12), "   ").mask, nullptr);
}

TEST(TextCache, ForgetsWhatNobodyUsesAndKeepsWhatIsUsed) {
    host::TextCache cache(100'000);
    const host::FontKey font = key_of_size(12);
    cache.keep(font, "used", {.width = 1.0F});
    cache.keep(font, "unused", {.width = 2.0F});
    for (int i = 0; i < 2000; ++i) {
        cache.keep(font, std::to_string(i), {.width = 3.0F, .mask = mask_of_bytes(1000), .mask_scale = 1.0});
        EXPECT_EQ(cache.find(font, "used").width, 1.0F) << i;
    }
    EXPECT_FALSE(cache.find(font, "unused").width);
    EXPECT_EQ(cache.find(font, "1999").width, 3.0F);
}

TEST(TextCache, StaysWithinItsBytes) {
    host::TextCache cache(100'000);
    const host::FontKey font = key_of_size(12);
    std::vector<std::weak_ptr<const host::TextMask>> masks;
    for (int i = 0; i < 2000; ++i) {
        const auto mask = mask_of_bytes(1000);
        masks.emplace_back(mask);
        // An entry that is there already must be counted, too, when it grows.
        cache.keep(font, std::to_string(i), {.width = 3.0F});
        cache.keep(font, std::to_string(i), {.mask = mask, .mask_scale = 1.0});
    }
    std::size_t alive = 0;
    for (const auto& mask : masks) {
        alive += mask.expired() ? 0 : 1;
    }
    EXPECT_LE(alive, 200U);
    EXPECT_GE(alive, 50U);
}

TEST(TextCache, DoesNotKeepWhatIsTooLarge) {
    host::TextCache cache(100'000);
    const host::FontKey font = key_of_size(12);
    const std::string at_limit(host::TextCache::longest_text, 'x');
    cache.keep(font, at_limit, {.width = 1.0F});
    cache.keep(font, at_limit + "x", {.width = 2.0F});
    cache.keep(font, "large", {.mask = mask_of_bytes(50'000), .mask_scale = 1.0});
    EXPECT_TRUE(cache.find(font, at_limit).width);
    EXPECT_FALSE(cache.find(font, at_limit + "x").width);
    EXPECT_EQ(cache.find(font, "large").mask_scale, 0);
}

TEST(TextCache, HeightsAreOfTheirFont) {
    host::TextCache cache(100'000);
    cache.keep_height(key_of_size(12), {9, 3, 0});
    ASSERT_TRUE(cache.find_height(key_of_size(12)));
    EXPECT_EQ(cache.find_height(key_of_size(12))->ascent, 9);
    EXPECT_FALSE(cache.find_height(key_of_size(13)));
    for (int size = 100; size < 1000; ++size) {
        cache.keep_height(key_of_size(size), {static_cast<float>(size), 0, 0});
    }
    EXPECT_EQ(cache.find_height(key_of_size(999))->ascent, 999);
    EXPECT_FALSE(cache.find_height(key_of_size(100)));
}

TEST(TextCache, ClearForgetsEverything) {
    host::TextCache cache(100'000);
    cache.keep(key_of_size(12), "Song", {.width = 30.0F});
    cache.keep_height(key_of_size(12), {9, 3, 0});
    cache.clear();
    EXPECT_FALSE(cache.find(key_of_size(12), "Song").width);
    EXPECT_FALSE(cache.find_height(key_of_size(12)));
}

} // namespace
