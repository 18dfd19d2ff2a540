#include "TextLayout.h"

#include "TextSelection.h"
#include "Utf8Text.h"

#include <gtest/gtest.h>
#include <string>

namespace {

typedef TextSelection::Step Step;
typedef TextSelection::Anchor Anchor;

// Every character is ten pixels wide.
TextLayoutRules TenPixels(float wrapWidth = 0, float tabWidth = 40) {
    return {[](std::string_view text) { return std::vector<float>(utf8_count_chars(text), 10.0F); },
            wrapWidth, tabWidth};
}

std::vector<std::string> Lines(const std::string& text, float wrapWidth = 0) {
    TextLayout layout;
    layout.LayOut(text, TenPixels(wrapWidth));
    std::vector<std::string> lines;
    for (int32 i = 0; i < layout.CountLines(); ++i) {
        const auto start = static_cast<size_t>(layout.StartOf(i));
        lines.push_back(text.substr(start, static_cast<size_t>(layout.EndOf(i)) - start));
    }
    return lines;
}

typedef std::vector<std::string> Strings;

TEST(TextLayout, LineFeedsEndLines) {
    EXPECT_EQ(Lines(""), (Strings{""}));
    EXPECT_EQ(Lines("one"), (Strings{"one"}));
    EXPECT_EQ(Lines("one\n"), (Strings{"one", ""}));
    EXPECT_EQ(Lines("\n\none"), (Strings{"", "", "one"}));
}

TEST(TextLayout, WordsThatDoNotFitBeginALine) {
    const struct {
        const char* text;
        float width;
        Strings lines;
    } cases[] = {
        {"one two three", 70, {"one two ", "three"}},
        {"one two three", 60, {"one ", "two ", "three"}},
        {"one two\nthree", 60, {"one ", "two", "three"}},
        {"one     two", 40, {"one     ", "two"}},
        {"extraordinary", 50, {"extra", "ordin", "ary"}},
        {"an extraordinary", 50, {"an ", "extra", "ordin", "ary"}},
        {"abc", 5, {"a", "b", "c"}},
        {"\u00e4\u00f6\u00fc", 20, {"\u00e4\u00f6", "\u00fc"}},
        {"one two", 0, {"one two"}},
    };
    for (const auto& [text, width, lines] : cases) {
        EXPECT_EQ(Lines(text, width), lines) << text << " in " << width;
    }
}

TEST(TextLayout, KnowsWhereCharactersStand) {
    TextLayout layout;
    const std::string text = "a\u20acb\tc\nde";
    layout.LayOut(text, TenPixels());
    const float expected[] = {0, 10, 10, 10, 20, 30, 40, 50, 0, 10, 20};
    for (int32 offset = 0; offset < 11; ++offset) {
        EXPECT_EQ(layout.XAt(offset), expected[offset]) << offset;
    }
    EXPECT_EQ(layout.WidthOf(0), 50);
    EXPECT_EQ(layout.WidestLine(), 50);
    EXPECT_EQ(layout.LineAt(7), 0);
    EXPECT_EQ(layout.LineAt(8), 1);
    EXPECT_EQ(layout.LineAt(100), 1);
    EXPECT_EQ(layout.OffsetAt(0, -5, text), 0);
    EXPECT_EQ(layout.OffsetAt(0, 4, text), 0);
    EXPECT_EQ(layout.OffsetAt(0, 6, text), 1);
    EXPECT_EQ(layout.OffsetAt(0, 14, text), 1);
    EXPECT_EQ(layout.OffsetAt(0, 16, text), 4);
    EXPECT_EQ(layout.OffsetAt(0, 900, text), 7);
    EXPECT_EQ(layout.OffsetAt(1, 900, text), 10);
}

TEST(TextLayout, TheEndOfABrokenLineIsTheNextOnesBeginning) {
    TextLayout layout;
    const std::string text = "one two";
    layout.LayOut(text, TenPixels(40));
    EXPECT_EQ(layout.LineAt(3), 0);
    EXPECT_EQ(layout.LineAt(4), 1);
    EXPECT_EQ(layout.XAt(4), 0);
    EXPECT_EQ(layout.WidthOf(0), 40);
    EXPECT_EQ(layout.OffsetAt(0, 900, text), 3) << "so a click behind it stays on the line";
    EXPECT_FALSE(layout.EndsParagraph(0));
    EXPECT_TRUE(layout.EndsParagraph(1));
}

class Caret : public ::testing::Test {
  protected:
    void Use(const std::string& text, float wrapWidth = 0) {
        mText = text;
        mLayout.LayOut(mText, TenPixels(wrapWidth));
    }
    int32 Move(Step step, Anchor anchor = Anchor::Follows) {
        mSelection.Move(step, anchor, mText, mLayout, 2);
        return mSelection.Caret();
    }

    std::string mText;
    TextLayout mLayout;
    TextSelection mSelection;
};

TEST_F(Caret, MovesByCharactersWordsAndLines) {
    Use("ab cd\nefghij\n\nxy");
    const struct {
        Step step;
        int32 caret;
    } steps[] = {
        {Step::CharacterLeft, 0},  {Step::CharacterRight, 1}, {Step::WordRight, 2}, {Step::WordRight, 5},
        {Step::CharacterRight, 6}, {Step::LineEnd, 12},       {Step::LineDown, 13}, {Step::LineDown, 16},
        {Step::LineUp, 13},        {Step::LineUp, 12},        {Step::LineUp, 5},    {Step::LineStart, 0},
        {Step::LineUp, 0},         {Step::TextEnd, 16},       {Step::LineDown, 16}, {Step::WordLeft, 14},
        {Step::PageUp, 6},         {Step::PageUp, 0},         {Step::PageDown, 13}, {Step::PageDown, 14},
        {Step::TextStart, 0},      {Step::WordLeft, 0},
    };
    for (size_t i = 0; i < std::size(steps); ++i) {
        EXPECT_EQ(Move(steps[i].step), steps[i].caret) << i;
        EXPECT_TRUE(mSelection.IsEmpty());
    }
}

TEST_F(Caret, UpAndDownKeepTheirColumn) {
    Use("long line\na\nlong line");
    mSelection.Set(5, 5);
    EXPECT_EQ(Move(Step::LineDown), 11);
    EXPECT_EQ(Move(Step::LineDown), 17);
    EXPECT_EQ(Move(Step::LineUp), 11);
    EXPECT_EQ(Move(Step::CharacterLeft), 10);
    EXPECT_EQ(Move(Step::LineDown), 12) << "a step to the side begins a new column";
}

TEST_F(Caret, ExtendsAndLeavesTheSelection) {
    Use("abcdef");
    mSelection.Set(2, 2);
    Move(Step::CharacterRight, Anchor::Stays);
    Move(Step::CharacterRight, Anchor::Stays);
    EXPECT_EQ(mSelection.From(), 2);
    EXPECT_EQ(mSelection.To(), 4);
    EXPECT_EQ(Move(Step::CharacterLeft), 2) << "the left end";
    EXPECT_TRUE(mSelection.IsEmpty());
    mSelection.Set(4, 2);
    EXPECT_EQ(mSelection.From(), 2);
    EXPECT_EQ(Move(Step::CharacterRight), 4) << "the right end";
    mSelection.Set(4, 2);
    EXPECT_EQ(Move(Step::TextStart, Anchor::Stays), 0);
    EXPECT_EQ(mSelection.To(), 4);
}

TEST_F(Caret, EndStaysOnABrokenLine) {
    Use("one two", 40);
    EXPECT_EQ(Move(Step::LineEnd), 3);
    EXPECT_EQ(Move(Step::LineDown), 7);
    EXPECT_EQ(Move(Step::LineStart), 4);
}

TEST_F(Caret, FollowsChangesOfTheText) {
    mSelection.Set(2, 6);
    mSelection.TextInserted(6, 3);
    EXPECT_EQ(mSelection.To(), 9);
    mSelection.TextInserted(0, 1);
    EXPECT_EQ(mSelection.From(), 3);
    mSelection.TextRemoved(1, 5);
    EXPECT_EQ(mSelection.From(), 1);
    EXPECT_EQ(mSelection.To(), 6);
    mSelection.TextRemoved(4, 100);
    EXPECT_EQ(mSelection.To(), 4);
}

} // namespace
