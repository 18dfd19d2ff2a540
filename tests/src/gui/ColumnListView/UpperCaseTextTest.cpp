#include "gui/ColumnListView/UpperCaseText.h"

#include <gtest/gtest.h>
#include <memory>
#include <string.h>

namespace {

std::string Upper(const char* text) {
    const std::unique_ptr<char[]> copy(ToUpperStr(text));
    EXPECT_EQ(strlen(text), strlen(copy.get()));
    return copy.get();
}

int Sign(int value) {
    return (value > 0) - (value < 0);
}

} // namespace

TEST(UpperCaseText, CapitalisesAsciiLettersAndNothingElse) {
    EXPECT_EQ("ABCXYZ", Upper("abcxyz"));
    EXPECT_EQ("AZ[`{}@0 -", Upper("az[`{}@0 -"));
    EXPECT_EQ("ALREADY", Upper("ALREADY"));
    EXPECT_EQ("", Upper(""));
}

TEST(UpperCaseText, LeavesTheBytesOfOtherCharactersAlone) {
    EXPECT_EQ("GR\xC3\xBC\xC3\x9F\x45", Upper("gr\xC3\xBC\xC3\x9F\x65"));
    EXPECT_EQ("\xE4\xF6\xFC\x80\xFF", Upper("\xE4\xF6\xFC\x80\xFF"));
}

TEST(UpperCaseText, OfNullIsNull) {
    EXPECT_EQ(nullptr, ToUpperStr(nullptr));
}

TEST(UpperCaseText, ComparesAsStrcmpDoesTheCopies) {
    struct Case {
        const char* a;
        const char* b;
        int sign;
    };
    const Case cases[] = {
        {"abc", "ABC", 0},
        {"", "", 0},
        {"", "a", -1},
        {"abc", "ab", 1},
        {"b", "A", 1},
        // Between the capitals and the small letters: behind all letters.
        {"_", "a", 1},
        {"[", "z", 1},
        // Bytes count from 0 to 255.
        {"\xC3\xA4", "z", 1},
        {"\xC3\xA4", "\xC3\x84", 1},
        {"a\x01", "A", 1},
    };
    for (const Case& one : cases) {
        EXPECT_EQ(one.sign, Sign(CompareInUpperCase(one.a, one.b))) << one.a << " and " << one.b;
        EXPECT_EQ(-one.sign, Sign(CompareInUpperCase(one.b, one.a))) << one.b << " and " << one.a;
        EXPECT_EQ(one.sign, Sign(strcmp(Upper(one.a).c_str(), Upper(one.b).c_str())));
    }
}
