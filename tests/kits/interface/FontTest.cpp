#include <Font.h>

#include "TextTruncation.h"
#include "Utf8Text.h"

#include <String.h>

#include <gtest/gtest.h>
#include <string.h>

namespace {

TEST(Utf8Text, CountsCharactersAndInvalidBytes) {
    EXPECT_EQ(utf8_count_chars(""), 0U);
    EXPECT_EQ(utf8_count_chars("abc"), 3U);
    EXPECT_EQ(utf8_count_chars("Gr\xC3\xBC\xC3\x9F"), 4U);
    EXPECT_EQ(utf8_count_chars("\xF0\x9F\x8E\xB5"), 1U);
    EXPECT_EQ(utf8_count_chars("\xFF\xFE"), 2U);
    EXPECT_EQ(utf8_count_chars("\xC3"), 1U);
    EXPECT_EQ(utf8_count_chars("\xE2\x82"), 2U);
    EXPECT_EQ(utf8_count_chars("\xC0\x80"), 2U);
    EXPECT_EQ(utf8_count_chars("\xE0\x80\x80"), 3U);
    EXPECT_EQ(utf8_count_chars("\xED\xA0\x80"), 3U);
    EXPECT_EQ(utf8_count_chars("\xF4\x90\x80\x80"), 4U);
}

TEST(TextTruncation, LeavesTextsThatFit) {
    EXPECT_EQ(truncated_text("abc", {10, 10, 10}, 12, B_TRUNCATE_END, 30), "abc");
    EXPECT_EQ(truncated_text("", {}, 12, B_TRUNCATE_END, 0), "");
}

TEST(TextTruncation, PutsAnEllipsisWhereItCuts) {
    const std::vector<float> advances(10, 10);
    EXPECT_EQ(truncated_text("abcdefghij", advances, 10, B_TRUNCATE_END, 59), "abcd\xE2\x80\xA6");
    EXPECT_EQ(truncated_text("abcdefghij", advances, 10, B_TRUNCATE_BEGINNING, 59), "\xE2\x80\xA6ghij");
    EXPECT_EQ(truncated_text("abcdefghij", advances, 10, B_TRUNCATE_MIDDLE, 59), "ab\xE2\x80\xA6ij");
    EXPECT_EQ(truncated_text("abcdefghij", advances, 10, B_TRUNCATE_SMART, 69), "ab\xE2\x80\xA6hij");
}

TEST(TextTruncation, WithoutRoomForTheEllipsisNothingIsLeft) {
    EXPECT_EQ(truncated_text("abc", {10, 10, 10}, 12, B_TRUNCATE_END, 11), "");
    EXPECT_EQ(truncated_text("abc", {10, 10, 10}, 12, B_TRUNCATE_END, 12), "\xE2\x80\xA6");
    EXPECT_EQ(truncated_text("abc", {10, 10, 10}, 12, B_TRUNCATE_END, -1), "");
}

TEST(TextTruncation, NeverCutsACharacterApart) {
    EXPECT_EQ(truncated_text("\xC3\xBC\xC3\xBC\xC3\xBC", {10, 10, 10}, 5, B_TRUNCATE_END, 25),
              "\xC3\xBC\xC3\xBC\xE2\x80\xA6");
    EXPECT_EQ(truncated_text("\xFF\xC3\xBC\xFF", {10, 10, 10}, 5, B_TRUNCATE_BEGINNING, 25),
              "\xE2\x80\xA6\xC3\xBC\xFF");
}

TEST(Font, TheDefaultIsThePlainFontAtTwelvePixels) {
    const BFont font;
    EXPECT_EQ(font, *be_plain_font);
    EXPECT_EQ(font.Size(), 12);
    EXPECT_EQ(font.Face(), B_REGULAR_FACE);
    EXPECT_EQ(BFont(be_bold_font), *be_bold_font);
    EXPECT_EQ(be_bold_font->Face(), B_BOLD_FACE);
    EXPECT_FALSE(*be_bold_font == *be_plain_font);
    font_family family;
    font_style style;
    font.GetFamilyAndStyle(&family, &style);
    EXPECT_GT(strlen(family), 0U);
    EXPECT_GT(strlen(style), 0U);
}

TEST(Font, TheFixedFontHasEqualWidths) {
    EXPECT_TRUE(be_fixed_font->IsFixed());
    EXPECT_FALSE(be_plain_font->IsFixed());
    EXPECT_FLOAT_EQ(be_fixed_font->StringWidth("iii"), be_fixed_font->StringWidth("WWW"));
    EXPECT_LT(be_plain_font->StringWidth("iii"), be_plain_font->StringWidth("WWW"));
    EXPECT_GT(be_bold_font->StringWidth("Hamburg"), be_plain_font->StringWidth("Hamburg"));
}

TEST(Font, MeasuresAPartOfAText) {
    const BFont font;
    EXPECT_FLOAT_EQ(font.StringWidth("Hamburg", 3), font.StringWidth("Ham"));
    EXPECT_FLOAT_EQ(font.StringWidth("Ham", 100), font.StringWidth("Ham"));
    EXPECT_FLOAT_EQ(font.StringWidth("Ham", 0), 0);
    EXPECT_FLOAT_EQ(font.StringWidth(nullptr), 0);
    const char* const texts[] = {"a", "bcd"};
    const int32 lengths[] = {1, 2};
    float widths[2];
    font.GetStringWidths(const_cast<const char**>(texts), lengths, 2, widths);
    EXPECT_FLOAT_EQ(widths[0], font.StringWidth("a"));
    EXPECT_FLOAT_EQ(widths[1], font.StringWidth("bc"));
}

TEST(Font, EscapementsAreInUnitsOfTheSize) {
    const BFont font;
    float escapements[4] = {-1, -1, -1, -1};
    font.GetEscapements("m\xC3\xBC"
                        "i",
                        3, escapements);
    EXPECT_NEAR(escapements[0] * 12, font.StringWidth("m"), 0.51);
    EXPECT_NEAR(escapements[1] * 12, font.StringWidth("\xC3\xBC"), 0.51);
    EXPECT_NEAR(escapements[2] * 12, font.StringWidth("i"), 0.51);
    EXPECT_EQ(escapements[3], -1);
    font.GetEscapements("m", 3, escapements);
    EXPECT_EQ(escapements[2], 0) << "beyond the text";
    escapement_delta delta = {6, 12};
    float stretched[2];
    font.GetEscapements("m ", 2, &delta, stretched);
    EXPECT_NEAR(stretched[0], escapements[0] + 0.5, 0.001);
}

TEST(Font, TruncatedTextsFit) {
    const BFont font;
    const char* const text = "A rather long title of a song that nobody knows";
    for (const uint32 mode : {B_TRUNCATE_END, B_TRUNCATE_BEGINNING, B_TRUNCATE_MIDDLE, B_TRUNCATE_SMART}) {
        BString shortened(text);
        font.TruncateString(&shortened, mode, 100);
        EXPECT_LE(font.StringWidth(shortened.String()), 101);
        EXPECT_GT(font.StringWidth(shortened.String()), 70);
        EXPECT_NE(strstr(shortened.String(), B_UTF8_ELLIPSIS), nullptr);
    }
    const char* texts[] = {text, "ok"};
    char first[100];
    char second[100];
    char* results[] = {first, second};
    font.GetTruncatedStrings(texts, 2, B_TRUNCATE_END, 60, results);
    EXPECT_LT(strlen(first), strlen(text));
    EXPECT_STREQ(second, "ok");
}

TEST(Font, FamiliesAndStylesAreListedAndChosen) {
    ASSERT_GT(count_font_families(), 0);
    font_family family;
    uint32 flags = 99;
    ASSERT_EQ(get_font_family(0, &family, &flags), B_OK);
    EXPECT_LE(flags, 1U);
    EXPECT_EQ(get_font_family(count_font_families(), &family), B_BAD_INDEX);
    EXPECT_EQ(get_font_family(-1, &family), B_BAD_INDEX);
    be_plain_font->GetFamilyAndStyle(&family, nullptr);
    ASSERT_GT(count_font_styles(family), 0);
    font_style style;
    uint16 face = 0;
    ASSERT_EQ(get_font_style(family, 0, &style, &face), B_OK);
    BFont font;
    EXPECT_EQ(font.SetFamilyAndStyle(family, style), B_OK);
    EXPECT_EQ(font.Face(), face);
    const BFont before = font;
    EXPECT_EQ(font.SetFamilyAndStyle("No Such Family", nullptr), B_NAME_NOT_FOUND);
    EXPECT_EQ(font.SetFamilyAndStyle(family, "No Such Style"), B_NAME_NOT_FOUND);
    EXPECT_EQ(font.SetFamilyAndFace("No Such Family", B_BOLD_FACE), B_NAME_NOT_FOUND);
    EXPECT_EQ(font, before);
    BFont other;
    other.SetFamilyAndStyle(font.FamilyAndStyle());
    EXPECT_EQ(other.FamilyAndStyle(), font.FamilyAndStyle());
    other.SetFamilyAndStyle(123456);
    EXPECT_EQ(other.FamilyAndStyle(), font.FamilyAndStyle()) << "an unknown code changes nothing";
}

TEST(Font, HeightsArePositiveAndGrow) {
    font_height small;
    font_height large;
    BFont font;
    font.GetHeight(&small);
    font.SetSize(30);
    font.GetHeight(&large);
    EXPECT_GT(small.ascent, 0);
    EXPECT_GT(small.descent, 0);
    EXPECT_GE(small.leading, 0);
    EXPECT_GT(large.ascent, 2 * small.ascent);
}

} // namespace
