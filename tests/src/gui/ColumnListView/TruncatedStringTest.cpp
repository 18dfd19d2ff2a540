#include "gui/ColumnListView/TruncatedString.h"

#include "support/random_seed.h"

#include <Font.h>

#include <gtest/gtest.h>

#include <memory>
#include <random>
#include <string.h>
#include <string>
#include <vector>

namespace {

float WidthOf(const std::string& text) {
    return be_plain_font->StringWidth(text.c_str());
}

// Into a buffer of just the size that is asked for, so that a byte too many is seen.
std::string Truncated(const std::string& full, float width) {
    const auto out = std::make_unique<char[]>(full.size() + 3);
    GetTruncatedString(full.c_str(), out.get(), width);
    return out.get();
}

// Byte after byte is dropped and the whole measured again: what the quick way must come to as well.
std::string TruncatedStepByStep(const std::string& full, float width) {
    std::vector<char> out(full.size() + 3);
    memcpy(out.data(), full.c_str(), full.size() + 1);
    const auto at = [&](int i) -> char& { return out[static_cast<size_t>(i)]; };
    for (int i = static_cast<int>(full.size()) - 1; i >= -2 && WidthOf(out.data()) > width; --i) {
        while (i > 0 && at(i - 1) == ' ') {
            --i;
        }
        if (i > 0 || (i == 0 && at(0) == ' ')) {
            at(i) = '.';
        }
        if (i > -1) {
            at(i + 1) = '.';
        }
        if (i > -2) {
            at(i + 2) = '.';
        }
        at(i + 3) = '\0';
    }
    return out.data();
}

TEST(TruncatedString, WhatFitsStaysAsItIs) {
    EXPECT_EQ(Truncated("Hello world", WidthOf("Hello world")), "Hello world");
    EXPECT_EQ(Truncated("Hello world", 10000), "Hello world");
}

TEST(TruncatedString, AsMuchAsFitsStandsBeforeTheEllipsis) {
    ASSERT_LT(WidthOf("Hello w..."), WidthOf("Hello wo..."));
    EXPECT_EQ(Truncated("Hello world", WidthOf("Hello w...")), "Hello w...");
    EXPECT_EQ(Truncated("Hello world", WidthOf("Hello wo...") - 0.5F), "Hello w...");
    EXPECT_EQ(Truncated("Hello world", WidthOf("H...")), "H...");
}

TEST(TruncatedString, BlanksBeforeTheEllipsisAreDropped) {
    EXPECT_EQ(Truncated("Hello world", WidthOf("Hello ...")), "Hello...");
    EXPECT_EQ(Truncated("Hello world", WidthOf("Hello...")), "Hello...");
    EXPECT_EQ(Truncated("Hello   world", WidthOf("Hello  ...")), "Hello...");
}

TEST(TruncatedString, TheEllipsisGivesWayToTheFirstByte) {
    const struct {
        float width;
        const char* expected;
    } kCases[] = {
        {WidthOf("Ab..."), "Ab..."},
        {WidthOf("A..."), "A..."},
        {WidthOf("A.."), "A.."},
        {WidthOf("A."), "A."},
        {WidthOf("A"), "A"},
        {1, "A"},
        {0, "A"},
        {-11, "A"},
    };
    for (const auto& each : kCases) {
        EXPECT_EQ(Truncated("AbWWW", each.width), each.expected) << each.width;
    }
    EXPECT_EQ(Truncated("Abc", 1), "A");
}

TEST(TruncatedString, AnEmptyTextStaysEmpty) {
    EXPECT_EQ(Truncated("", 100), "");
    EXPECT_EQ(Truncated("", 0), "");
    EXPECT_EQ(Truncated("", -11), "") << "a column narrower than its label's margin";
}

TEST(TruncatedString, ALeadingBlankBecomesADot) {
    EXPECT_EQ(Truncated(" abc", WidthOf("...")), "...");
    EXPECT_EQ(Truncated(" abc", WidthOf("..")), "..");
    EXPECT_EQ(Truncated("    ", 0), ".");
}

TEST(TruncatedString, ACharacterOfSeveralBytesMayBeCutInHalf) {
    EXPECT_EQ(Truncated("\xE2\x82\xAC", 0), "\xE2");
    EXPECT_EQ(Truncated("\xC3\xA4x", 0), "\xC3");
}

TEST(TruncatedString, LongTextsComeToTheSameAsStepByStep) {
    const char* const kPieces[] = {"a",    "W",  "i",  " ", "  ",   ".",        "T",
                                   "fi",   "AV", "é",  "€", "\xC3", "\x80\x80", "\xF0\x9F\x8E",
                                   "song", "-",  "你", "ش", "ü",    "m",        "e\xCC\x81"};
    std::mt19937_64 random(RandomSeed());
    for (int round = 0; round < 150; ++round) {
        std::string full;
        const bool ascii = round % 2 == 0;
        for (auto pieces = random() % 40; pieces > 0; --pieces) {
            full += kPieces[random() % (ascii ? 9 : std::size(kPieces))];
        }
        const float width = static_cast<float>(random() % 200) - 15;
        EXPECT_EQ(Truncated(full, width), TruncatedStepByStep(full, width)) << full << " in " << width;
    }
}

} // namespace
