#include "host/api/fonts.h"

#include <algorithm>
#include <cstdlib>
#include <gtest/gtest.h>
#include <numeric>
#include <thread>

namespace {

constexpr host::TextWindow kWide = {-1000, -1000, 1000, 1000};

// The mask of a text of which something is inked; an empty one fails the test that asks for it.
host::TextMask mask_of(const host::FontSpec& font, std::string_view text, double scale = 1.0,
                       host::TextWindow window = kWide) {
    const std::shared_ptr<const host::TextMask> mask = host::render_text(font, text, scale, window);
    EXPECT_NE(mask, nullptr) << text;
    return mask != nullptr ? *mask : host::TextMask{};
}

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

// In a process of its own: the first question of all is the one.
TEST(Fonts, AreAsHighWhenTheyAreFirstAskedForAsEverAfter) {
    GTEST_FLAG_SET(death_test_style, "threadsafe");
    EXPECT_EXIT(
        {
            const host::FontHeight first = host::font_height({});
            const host::FontHeight second = host::font_height({});
            std::_Exit(first.ascent == second.ascent && first.descent == second.descent ? 0 : 1);
        },
        ::testing::ExitedWithCode(0), "");
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

TEST(Fonts, LettersKeepTheirAdvancesFromRightToLeft) {
    const host::FontSpec font;
    // Hebrew letters, which do not join: he, yod, shin.
    const std::string_view letters[] = {"\xD7\x94", "\xD7\x99", "\xD7\xA9"};
    const std::vector<float> advances = host::text_advances(font, "\xD7\x94\xD7\x99\xD7\xA9");
    ASSERT_EQ(advances.size(), 3U);
    for (std::size_t i = 0; i < 3; ++i) {
        EXPECT_GT(advances[i], 0) << i;
        EXPECT_NEAR(advances[i], host::text_width(font, letters[i]), 0.51F) << i;
    }
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
    EXPECT_GT(ink_of(mask_of(font, "\xFF")), 0);
}

TEST(Fonts, ControlCharactersAreBlanks) {
    const host::FontSpec font;
    EXPECT_FLOAT_EQ(host::text_width(font, "a\nb"), host::text_width(font, "a b"));
    EXPECT_FLOAT_EQ(host::text_width(font, "a\tb"), host::text_width(font, "a b"));
    EXPECT_EQ(host::render_text(font, "\n\t\x01", 1.0, kWide), nullptr);
}

TEST(Fonts, TextStaysWithinItsWidthAndHeight) {
    const host::FontSpec font;
    const host::TextMask mask = mask_of(font, "Hamburgefonts");
    const host::FontHeight height = host::font_height(font);
    ASSERT_GT(ink_of(mask), 0);
    EXPECT_GE(first_inked_column(mask), -1);
    EXPECT_LE(static_cast<float>(last_inked_column(mask)), host::text_width(font, "Hamburgefonts") + 1);
    EXPECT_GE(static_cast<float>(first_inked_row(mask)), -height.ascent - 1);
}

// The coverage at a place, wherever the mask's own edges lie.
int coverage_at(const host::TextMask& mask, int x, int y) {
    const bool inside =
        x >= mask.left && x < mask.left + mask.width && y >= mask.top && y < mask.top + mask.height;
    return inside ? mask.coverage[static_cast<std::size_t>((y - mask.top) * mask.width + x - mask.left)] : 0;
}

TEST(Fonts, TheMaskHoldsWhatLiesInTheWindow) {
    const host::FontSpec font;
    // The longer one is too large to be kept, and drawn only as far as the window reaches.
    std::string long_text;
    for (int i = 0; i < 400; ++i) {
        long_text += "Hamburgefonts ";
    }
    for (const std::string& text : {std::string("Hamburgefonts"), long_text}) {
        const host::TextMask wide = mask_of(font, text);
        const host::TextWindow window{10, -20, 30, 10};
        const host::TextMask part = mask_of(font, text, 1.0, window);
        for (int y = window.top; y < window.bottom; ++y) {
            for (int x = window.left; x < window.right; ++x) {
                ASSERT_EQ(coverage_at(wide, x, y), coverage_at(part, x, y)) << x << ", " << y;
            }
        }
    }
    EXPECT_EQ(host::render_text(font, long_text, 1.0, {500, 500, 600, 600}), nullptr);
}

TEST(Fonts, TheMaskHasNoEmptyEdges) {
    const host::TextMask mask = mask_of({}, "  Hamburgefonts  ");
    EXPECT_EQ(first_inked_column(mask), mask.left);
    EXPECT_EQ(last_inked_column(mask), mask.left + mask.width - 1);
    EXPECT_EQ(first_inked_row(mask), mask.top);
}

TEST(Fonts, ATextIsTheSameEachTimeItIsAskedFor) {
    const host::FontSpec plain;
    host::FontSpec bold;
    bold.weight = 700;
    host::FontSpec large;
    large.size = 20;
    // Each of them between the others, so that none is answered with another's pixels.
    struct Asked {
        host::FontSpec font;
        double scale;
        host::TextMask mask;
        float width;
    };
    std::vector<Asked> all;
    for (const host::FontSpec& font : {plain, bold, large}) {
        for (const double scale : {1.0, 1.5}) {
            all.push_back({font, scale, mask_of(font, "Song", scale), host::text_width(font, "Song")});
        }
    }
    for (std::size_t i = 0; i < all.size(); ++i) {
        const host::TextMask again = mask_of(all[i].font, "Song", all[i].scale);
        EXPECT_EQ(again.coverage, all[i].mask.coverage) << i;
        EXPECT_EQ(again.left, all[i].mask.left) << i;
        EXPECT_EQ(again.top, all[i].mask.top) << i;
        EXPECT_EQ(host::text_width(all[i].font, "Song"), all[i].width) << i;
        for (std::size_t other = 0; other < i; ++other) {
            EXPECT_NE(all[other].mask.coverage, all[i].mask.coverage) << i << ", " << other;
        }
    }
}

TEST(Fonts, AdvancesDoNotDependOnWhatWasAskedBefore) {
    const host::FontSpec font;
    const std::vector<float> first = host::text_advances(font, "Tofi");
    EXPECT_GT(ink_of(mask_of(font, "Tofi")), 0);
    EXPECT_GT(host::text_width(font, "Tofi"), 0);
    EXPECT_EQ(host::text_advances(font, "Tofi"), first);
    EXPECT_EQ(first.size(), 4U);
}

TEST(Fonts, AScaledTextIsAsMuchLarger) {
    const host::FontSpec font;
    const host::TextMask once = mask_of(font, "Hamburgefonts");
    const host::TextMask twice = mask_of(font, "Hamburgefonts", 2.0);
    const int narrow = last_inked_column(once) - first_inked_column(once);
    const int wide = last_inked_column(twice) - first_inked_column(twice);
    EXPECT_NEAR(wide, 2 * narrow, 6);
    EXPECT_GT(ink_of(twice), 3 * ink_of(once));
}

TEST(Fonts, BoldIsHeavierAndWithoutAntialiasingThereIsNoGrey) {
    host::FontSpec bold;
    bold.weight = 700;
    EXPECT_GT(ink_of(mask_of(bold, "Hello")), ink_of(mask_of(host::FontSpec{}, "Hello")));
    host::FontSpec hard;
    hard.antialiased = false;
    const host::TextMask mask = mask_of(hard, "Hello");
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
    const host::TextMask expected = mask_of(font, "Hamburgefonts");
    std::vector<int> wrong(4, 0);
    std::vector<std::thread> threads;
    for (std::size_t t = 0; t < wrong.size(); ++t) {
        threads.emplace_back([&, t] {
            for (int i = 0; i < 50; ++i) {
                // Once a text that all threads draw, once one that is drawn for the first time.
                const std::string number = std::to_string(static_cast<int>(t) * 50 + i);
                for (const std::string& text : {std::string("Hamburgefonts"), "Hamburgefonts   " + number}) {
                    const host::TextMask mask = mask_of(font, text);
                    for (int x = expected.left; x < expected.left + expected.width; ++x) {
                        for (int y = expected.top; y < expected.top + expected.height; ++y) {
                            wrong[t] += coverage_at(mask, x, y) != coverage_at(expected, x, y) ? 1 : 0;
                        }
                    }
                }
            }
        });
    }
    for (std::thread& thread : threads) {
        thread.join();
    }
    EXPECT_EQ(wrong, std::vector<int>(4, 0));
}

} // namespace
