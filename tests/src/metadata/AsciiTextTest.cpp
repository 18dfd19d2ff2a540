#include "metadata/AsciiText.h"

#include <gtest/gtest.h>

namespace {

TEST(AsciiText, OnlyTheTwentySixAsciiLettersAreLetters) {
    int lower = 0;
    int changed = 0;
    for (int byte = 0; byte < 256; ++byte) {
        const char character = static_cast<char>(byte);
        lower += IsAsciiLower(character);
        changed += ToAsciiLower(character) != character;
    }
    EXPECT_EQ(lower, 26);
    EXPECT_EQ(changed, 26);
    EXPECT_TRUE(IsAsciiLower('a'));
    EXPECT_TRUE(IsAsciiLower('z'));
    EXPECT_FALSE(IsAsciiLower('A'));
    EXPECT_EQ(ToAsciiLower('A'), 'a');
    EXPECT_EQ(ToAsciiLower('Z'), 'z');
    EXPECT_EQ(ToAsciiLower('['), '[');
}

TEST(AsciiText, NumbersBeginAfterBlanksAndASign) {
    EXPECT_EQ(ParseAsciiNumber("7"), 7);
    EXPECT_EQ(ParseAsciiNumber("007x"), 7);
    EXPECT_EQ(ParseAsciiNumber(" \t\n\v\f\r42 "), 42);
    EXPECT_EQ(ParseAsciiNumber("+42"), 42);
    EXPECT_EQ(ParseAsciiNumber("-42"), -42);
    EXPECT_EQ(ParseAsciiNumber("+-42"), 0);
    EXPECT_EQ(ParseAsciiNumber("- 42"), 0);
    EXPECT_EQ(ParseAsciiNumber("x42"), 0);
    EXPECT_EQ(ParseAsciiNumber(""), 0);
    EXPECT_EQ(ParseAsciiNumber("\xA0"
                               "7"),
              0);
}

TEST(AsciiText, LargeNumbersKeepTheirLow32Bits) {
    EXPECT_EQ(ParseAsciiNumber("2147483647"), 2147483647);
    EXPECT_EQ(ParseAsciiNumber("2147483648"), -2147483647 - 1);
    EXPECT_EQ(ParseAsciiNumber("4294967297"), 1);
    EXPECT_EQ(ParseAsciiNumber("9223372036854775807"), -1);
    EXPECT_EQ(ParseAsciiNumber("99999999999999999999999"), -1);
    EXPECT_EQ(ParseAsciiNumber("-9223372036854775808"), 0);
    EXPECT_EQ(ParseAsciiNumber("-99999999999999999999999"), 0);
}

} // namespace
