#include "TextCharacters.h"

#include <gtest/gtest.h>
#include <string>
#include <vector>

namespace {

using namespace std::string_literals;

std::vector<size_t> StopsForward(std::string_view text) {
    std::vector<size_t> stops;
    for (size_t offset = 0; offset < text.size();) {
        offset = next_character(text, offset);
        stops.push_back(offset);
    }
    return stops;
}

std::vector<size_t> StopsBackward(std::string_view text) {
    std::vector<size_t> stops;
    for (size_t offset = text.size(); offset > 0;) {
        offset = previous_character(text, offset);
        stops.push_back(offset);
    }
    return stops;
}

TEST(TextCharacters, TheCaretNeverStandsInsideACharacter) {
    const struct {
        const char* what;
        std::string text;
        std::vector<size_t> forward;
    } cases[] = {
        {"nothing", "", {}},
        {"ASCII", "abc", {1, 2, 3}},
        {"two, three and four bytes", "\u00e4\u20ac\U0001F600x", {2, 5, 9, 10}},
        {"a letter with marks", "e\u0301\u0302x", {5, 6}},
        {"a mark alone", "\u0301x", {2, 3}},
        {"joined emoji", "\U0001F468\u200D\U0001F469x", {11, 12}},
        {"skin tone", "\U0001F44D\U0001F3FDx", {8, 9}},
        {"a stray continuation byte", "a\x80z", {1, 2, 3}},
        {"a character cut short", "\xE2\x82", {1, 2}},
        {"invalid before valid", "\xFF\u20ac", {1, 4}},
        {"overlong", "\xC0\xAF", {1, 2}},
    };
    for (const auto& [what, text, forward] : cases) {
        EXPECT_EQ(StopsForward(text), forward) << what;
        std::vector<size_t> backward(forward.rbegin(), forward.rend());
        if (!backward.empty()) {
            backward.erase(backward.begin());
            backward.push_back(0);
        }
        EXPECT_EQ(StopsBackward(text), backward) << what;
    }
}

TEST(TextCharacters, OffsetsAreMovedOutOfCodePoints) {
    const std::string text = "a\u20ac\xFFz";
    const size_t expected[] = {0, 1, 1, 1, 4, 5, 6};
    for (size_t offset = 0; offset < std::size(expected); ++offset) {
        EXPECT_EQ(code_point_boundary(text, offset), expected[offset]) << offset;
    }
    EXPECT_EQ(code_point_boundary(text, 100), 6U);
}

TEST(TextCharacters, WordsAreLettersAndDigitsOfAnyScript) {
    const std::string text = "It's  \u00fcber-cool, 42!";
    EXPECT_EQ(next_word_end(text, 0), 4U);
    EXPECT_EQ(next_word_end(text, 4), 11U);
    EXPECT_EQ(next_word_end(text, 11), 16U);
    EXPECT_EQ(next_word_end(text, 16), 20U);
    EXPECT_EQ(next_word_end(text, 20), 21U);
    EXPECT_EQ(previous_word_start(text, 21), 18U);
    EXPECT_EQ(previous_word_start(text, 18), 12U);
    EXPECT_EQ(previous_word_start(text, 12), 6U);
    EXPECT_EQ(previous_word_start(text, 6), 0U);
    EXPECT_EQ(previous_word_start(text, 0), 0U);
}

TEST(TextCharacters, TheRunAroundAnOffsetIsOfOneKindAndOneLine) {
    const std::string text = "one  two,\n\nend";
    const struct {
        size_t offset;
        size_t from;
        size_t to;
    } cases[] = {{0, 0, 3}, {2, 0, 3}, {3, 3, 5},    {6, 5, 8},
                 {8, 8, 9}, {9, 8, 9}, {10, 10, 10}, {14, 11, 14}};
    for (const auto& [offset, from, to] : cases) {
        const TextRange range = word_around(text, offset);
        EXPECT_EQ(range.from, from) << offset;
        EXPECT_EQ(range.to, to) << offset;
    }
    EXPECT_EQ(word_around("", 0).to, 0U);
}

TEST(TextCharacters, CodePointsAreDecoded) {
    EXPECT_EQ(code_point_at("A", 0), 0x41U);
    EXPECT_EQ(code_point_at("\u00e4", 0), 0xE4U);
    EXPECT_EQ(code_point_at("\u20ac", 0), 0x20ACU);
    EXPECT_EQ(code_point_at("\U0001F600", 0), 0x1F600U);
    EXPECT_EQ(code_point_at("\xFF", 0), 0xFFFDU);
}

} // namespace
