#include "host/api/fonts.h"

#include <algorithm>
#include <gtest/gtest.h>
#include <numeric>
#include <thread>

namespace {

constexpr host::TextWindow kWide = {-1000, -1000, 1000, 1000};

// The sum of all coverage bytes.
long ink_of(const host::TextMask& mask) {
    return std::accumulate(mask.coverage.begin(), mask.coverage.end(), 0L);
}

int first_inked_column(const host::TextMask& mask) {
    for (int x = 0; x < mask.width; ++x) {
        for (int y = 0; y < mask.height; ++y) {
            if (mask.coverage[static_cast<std::size_t>(y * mask.width + x)] != 0) {
                return mask.left + x;
            }
        }
    }
    return -100000;
}

int last_inked_column(const host::TextMask& mask) {
    for (int x = mask.width - 1; x >= 0; --x) {
        for (int y = 0; y < mask.height; ++y) {
            if (mask.coverage[static_cast<std::size_t>(y * mask.width + x)] != 0) {
                return mask.left + x;
            }
        }
    }
    return -100000;
}

int first_inked_row(const host::TextMask& mask) {
    for (int y = 0; y < mask.height; ++y) {
        for (int x = 0; x < mask.width; ++x) {
            if (mask.coverage[static_cast<std::size_t>(y * mask.width + x)] != 0) {
                return mask.top + y;
            }
        }
    }
    return -100000;
}

TEST(Fonts, AreThereWithoutADisplay) {
    EXPECT_TRUE(host::fonts_available());
    EXPECT_FALSE(host::font_families().empty());
}

TEST(Fonts, TheDefaultFamiliesStandForInstalledOnes) {
    const std::string sans = host::resolve_family(host::default_sans_family);
    const std::string fixed = host::resolve_family(host::default_fixed_family);
    EXPECT_FALSE(host::font_styles(sans).empty()) << sans;
    EXPECT_FALSE(host::font_styles(fixed).empty()) << fixed;
    EXPECT_TRUE(host::family_is_fixed_width(host::default_fixed_family)) << fixed;
    EXPECT_FALSE(host::family_is_fixed_width(host::default_sans_family)) << sans;
    EXPECT_TRUE(host::font_styles("No Such Family").empty());
}

TEST(Fonts, HeightGrowsWithTheSize) {
    host::FontSpec small;
    host::FontSpec large;
    large.size = 24;
    const host::FontHeight low = host::font_height(small);
    const host::FontHeight high = host::font_height(large);
    EXPECT_GT(low.ascent, 7);
    EXPECT_LT(low.ascent, 16);
    EXPECT_GT(low.descent, 1);
    EXPECT_GT(high.ascent, low.ascent * 1.5F);
    EXPECT_GE(low.leading, 0);
}

TEST(Fonts, WidthsAddUpAndCountTrailingBlanks) {
    const host::FontSpec font;
    EXPECT_EQ(host::text_width(font, ""), 0);
    EXPECT_GT(host::text_width(font, "m"), host::text_width(font, "i"));
    EXPECT_GT(host::text_width(font, "abc "), host::text_width(font, "abc"));
    EXPECT_GT(host::text_width(font, "   "), 0);
}

TEST(Fonts, AdvancesOfAllCodePointsAddUpToTheWidth) {
    const host::FontSpec font;
    for (const std::string_view text : {"Hello",
                                        "Gr\xC3\xBC\xC3\x9F"
                                        "e",
                                        "a\xFF"
                                        "b"}) {
        const std::vector<float> advances = host::text_advances(font, text);
        const float sum = std::accumulate(advances.begin(), advances.end(), 0.0F);
        EXPECT_NEAR(sum, host::text_width(font, text), 0.51F) << text;
    }
    EXPECT_EQ(host::text_advances(font, "Gr\xC3\xBC\xC3\x9F"
                                        "e")
                  .size(),
              5U);
}

TEST(Fonts, EachInvalidByteIsOneReplacementCharacter) {
    const host::FontSpec font;
    const float one = host::text_width(font, "\xEF\xBF\xBD");
    EXPECT_GT(one, 0);
    EXPECT_FLOAT_EQ(host::text_width(font, "\xFF"), one);
    EXPECT_EQ(host::text_advances(font, "\xC3\x28").size(), 2U) << "a start byte without its continuation";
    EXPECT_EQ(host::text_advances(font, "\xED\xA0\x80").size(), 3U) << "half of a surrogate pair";
    EXPECT_EQ(host::text_advances(font, "\xC0\xAF").size(), 2U) << "a slash in two bytes";
    EXPECT_EQ(host::text_advances(font, "\xF0\x9F\x8E").size(), 3U) << "cut short";
    EXPECT_EQ(host::text_advances(font, "\xF0\x9F\x8E\xB5").size(), 1U) << "a note, outside the first plane";
    EXPECT_GT(ink_of(host::render_text(font, "\xFF", 1.0, kWide)), 0);
}

TEST(Fonts, ControlCharactersAreBlanks) {
    const host::FontSpec font;
    EXPECT_FLOAT_EQ(host::text_width(font, "a\nb"), host::text_width(font, "a b"));
    EXPECT_FLOAT_EQ(host::text_width(font, "a\tb"), host::text_width(font, "a b"));
    EXPECT_EQ(ink_of(host::render_text(font, "\n\t\x01", 1.0, kWide)), 0);
}

TEST(Fonts, TextStaysWithinItsWidthAndHeight) {
    const host::FontSpec font;
    const host::TextMask mask = host::render_text(font, "Hamburgefonts", 1.0, kWide);
    const host::FontHeight height = host::font_height(font);
    ASSERT_GT(ink_of(mask), 0);
    EXPECT_GE(first_inked_column(mask), -1);
    EXPECT_LE(static_cast<float>(last_inked_column(mask)), host::text_width(font, "Hamburgefonts") + 1);
    EXPECT_GE(static_cast<float>(first_inked_row(mask)), -height.ascent - 1);
}

TEST(Fonts, TheWindowCutsTheMask) {
    const host::FontSpec font;
    const host::TextMask all = host::render_text(font, "Hamburgefonts", 1.0, kWide);
    const host::TextMask part = host::render_text(font, "Hamburgefonts", 1.0, {10, -20, 30, 10});
    ASSERT_GT(ink_of(part), 0);
    EXPECT_EQ(part.left, 10);
    EXPECT_EQ(part.width, 20);
    for (int y = part.top; y < part.top + part.height; ++y) {
        for (int x = part.left; x < part.left + part.width; ++x) {
            const auto at = [&](const host::TextMask& mask) {
                const int row = y - mask.top;
                return row < 0 || row >= mask.height
                           ? 0
                           : mask.coverage[static_cast<std::size_t>(row * mask.width + x - mask.left)];
            };
            ASSERT_EQ(at(all), at(part)) << x << ", " << y;
        }
    }
    EXPECT_EQ(host::render_text(font, "x", 1.0, {500, 500, 600, 600}).width, 0);
}

TEST(Fonts, AScaledTextIsAsMuchLarger) {
    const host::FontSpec font;
    const host::TextMask once = host::render_text(font, "Hamburgefonts", 1.0, kWide);
    const host::TextMask twice = host::render_text(font, "Hamburgefonts", 2.0, kWide);
    const int narrow = last_inked_column(once) - first_inked_column(once);
    const int wide = last_inked_column(twice) - first_inked_column(twice);
    EXPECT_NEAR(wide, 2 * narrow, 6);
    EXPECT_GT(ink_of(twice), 3 * ink_of(once));
}

TEST(Fonts, BoldIsHeavierAndWithoutAntialiasingThereIsNoGrey) {
    host::FontSpec bold;
    bold.weight = 700;
    EXPECT_GT(ink_of(host::render_text(bold, "Hello", 1.0, kWide)),
              ink_of(host::render_text({}, "Hello", 1.0, kWide)));
    host::FontSpec hard;
    hard.antialiased = false;
    const host::TextMask mask = host::render_text(hard, "Hello", 1.0, kWide);
    EXPECT_TRUE(std::all_of(mask.coverage.begin(), mask.coverage.end(),
                            [](std::uint8_t c) { return c == 0 || c == 255; }));
}

TEST(Fonts, SillySizesAreKeptInBounds) {
    host::FontSpec font;
    for (const float size : {-5.0F, 0.0F, 1.0e9F, std::numeric_limits<float>::quiet_NaN()}) {
        font.size = size;
        EXPECT_GT(host::text_width(font, "x"), 0) << size;
    }
}

TEST(Fonts, SeveralThreadsDrawAtOnce) {
    const host::FontSpec font;
    const host::TextMask expected = host::render_text(font, "Hamburgefonts", 1.0, kWide);
    std::vector<int> wrong(4, 0);
    std::vector<std::thread> threads;
    for (std::size_t t = 0; t < wrong.size(); ++t) {
        threads.emplace_back([&, t] {
            for (int i = 0; i < 50; ++i) {
                wrong[t] +=
                    host::render_text(font, "Hamburgefonts", 1.0, kWide).coverage != expected.coverage;
            }
        });
    }
    for (std::thread& thread : threads) {
        thread.join();
    }
    EXPECT_EQ(wrong, std::vector<int>(4, 0));
}

} // namespace
