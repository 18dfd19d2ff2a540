#include <String.h>

#include <gtest/gtest.h>

TEST(StringSearchTest, ComparesBytesAsUnsignedNumbers) {
    EXPECT_TRUE(BString("a") < BString("b"));
    EXPECT_TRUE(BString("a") < "ab");
    EXPECT_TRUE(BString("z") < "\xC3\xA4");
    EXPECT_TRUE(BString("a") == "a");
    EXPECT_TRUE(BString("a") != "A");
    EXPECT_TRUE(BString("") == nullptr);
    EXPECT_TRUE("b" > BString("a"));
    EXPECT_TRUE("a" <= BString("a"));
    EXPECT_TRUE("a" == BString("a"));
    EXPECT_GT(BString("b").Compare("a"), 0);
    EXPECT_EQ(BString("abX").Compare("abY", 2), 0);
    EXPECT_LT(BString("abX").Compare("abY", 3), 0);
    EXPECT_EQ(BString("abX").Compare(BString("cd"), 0), 0);
    const BString first("a");
    const BString second("b");
    EXPECT_LT(Compare(&first, &second), 0);
    EXPECT_EQ(ICompare(first, BString("A")), 0);
}

TEST(StringSearchTest, CaseBlindComparingFoldsAsciiLettersAlone) {
    EXPECT_EQ(BString("HeLLo").ICompare("hEllO"), 0);
    EXPECT_EQ(BString("abX").ICompare(BString("ABy"), 2), 0);
    EXPECT_NE(BString("\xC3\xA4").ICompare("\xC3\x84"), 0);
    EXPECT_LT(BString("a").ICompare("B"), 0);
    EXPECT_NE(BString("@").ICompare("`"), 0);
}

TEST(StringSearchTest, FindsTheFirst) {
    const BString string("abcabc");
    struct Case {
        const char* text;
        int32 from;
        int32 found;
    };
    const Case cases[] = {{"bc", 0, 1}, {"bc", 2, 4}, {"bc", 5, -1}, {"x", 0, -1},      {"", 3, 3},
                          {"", 6, 6},   {"a", 7, -1}, {"a", -1, -1}, {"abcabcd", 0, -1}};
    for (const Case& testCase : cases) {
        EXPECT_EQ(string.FindFirst(testCase.text, testCase.from), testCase.found) << testCase.text;
        EXPECT_EQ(string.FindFirst(BString(testCase.text), testCase.from), testCase.found) << testCase.text;
    }
    EXPECT_EQ(string.FindFirst("ca"), 2);
    EXPECT_EQ(string.FindFirst('c'), 2);
    EXPECT_EQ(string.FindFirst('c', 3), 5);
    EXPECT_EQ(string.FindFirst(static_cast<const char*>(nullptr)), B_BAD_VALUE);
}

TEST(StringSearchTest, FindsTheLast) {
    const BString string("abcabc");
    struct Case {
        const char* text;
        int32 before;
        int32 found;
    };
    const Case cases[] = {{"bc", 6, 4},    {"bc", 5, 1}, {"bc", 2, -1},
                          {"abc", 100, 3}, {"", 6, 6},   {"a", -1, -1}};
    for (const Case& testCase : cases)
        EXPECT_EQ(string.FindLast(testCase.text, testCase.before), testCase.found) << testCase.text;
    EXPECT_EQ(string.FindLast("a"), 3);
    EXPECT_EQ(string.FindLast(BString("d")), B_ERROR);
    EXPECT_EQ(string.FindLast('b'), 4);
    EXPECT_EQ(string.FindLast('b', 4), 4);
    EXPECT_EQ(string.FindLast('b', 3), 1);
    EXPECT_EQ(string.FindLast('b', 6), B_ERROR);
    EXPECT_EQ(string.FindLast(static_cast<const char*>(nullptr)), B_BAD_VALUE);
}

TEST(StringSearchTest, FindsWithoutRegardToCase) {
    const BString string("abCABc");
    EXPECT_EQ(string.IFindFirst("BC"), 1);
    EXPECT_EQ(string.IFindFirst("bc", 2), 4);
    EXPECT_EQ(string.IFindFirst("bc", 5), B_ERROR);
    EXPECT_EQ(string.IFindLast("Ab"), 3);
    EXPECT_EQ(string.IFindLast("AB", 4), 0);
    EXPECT_EQ(string.IFindLast(BString("x")), B_ERROR);
    EXPECT_EQ(string.IFindFirst(static_cast<const char*>(nullptr)), B_BAD_VALUE);
    EXPECT_EQ(string.IFindFirst("abcabcabc"), B_ERROR);
}

TEST(StringSearchTest, BeginningsAndEnds) {
    const BString string("song.mp3");
    EXPECT_TRUE(string.StartsWith("song"));
    EXPECT_FALSE(string.StartsWith("Song"));
    EXPECT_TRUE(string.IStartsWith("SONG"));
    EXPECT_TRUE(string.IStartsWith(BString("SoNg")));
    EXPECT_FALSE(string.IStartsWith("song.mp34"));
    EXPECT_TRUE(string.EndsWith(".mp3"));
    EXPECT_FALSE(string.EndsWith(".MP3"));
    EXPECT_TRUE(string.IEndsWith(".MP3"));
    EXPECT_FALSE(string.IEndsWith("a song.mp3"));
    EXPECT_TRUE(string.EndsWith(""));
    EXPECT_FALSE(string.EndsWith(static_cast<const char*>(nullptr)));
}

TEST(StringSearchTest, ReplacesBytes) {
    EXPECT_STREQ(BString("aaaa").ReplaceFirst('a', 'b').String(), "baaa");
    EXPECT_STREQ(BString("aaaa").ReplaceLast('a', 'b').String(), "aaab");
    EXPECT_STREQ(BString("aaaa").ReplaceAll('a', 'b').String(), "bbbb");
    EXPECT_STREQ(BString("aaaa").ReplaceAll('a', 'b', 2).String(), "aabb");
    EXPECT_STREQ(BString("aaaa").Replace('a', 'b', 2, 1).String(), "abba");
    EXPECT_STREQ(BString("aAxA").IReplaceAll('a', 'b').String(), "bbxb");
    EXPECT_STREQ(BString("aAxA").IReplaceLast('a', 'b').String(), "aAxb");
    EXPECT_STREQ(BString("aAxA").IReplaceFirst('A', 'b').String(), "bAxA");
    EXPECT_STREQ(BString("abc").ReplaceLast('x', 'y').String(), "abc");
}

TEST(StringSearchTest, ReplacesTexts) {
    EXPECT_STREQ(BString("one one one").ReplaceFirst("one", "two").String(), "two one one");
    EXPECT_STREQ(BString("one one one").ReplaceLast("one", "two").String(), "one one two");
    EXPECT_STREQ(BString("one one one").ReplaceAll("one", "oneone").String(), "oneone oneone oneone");
    EXPECT_STREQ(BString("one one one").ReplaceAll("one", "", 1).String(), "one  ");
    EXPECT_STREQ(BString("one one one").Replace("one", "1", 2).String(), "1 1 one");
    EXPECT_STREQ(BString("One oNe").IReplaceAll("ONE", "1").String(), "1 1");
    EXPECT_STREQ(BString("One oNe").IReplaceLast("one", "1").String(), "One 1");
    EXPECT_STREQ(BString("aaa").ReplaceAll("aa", "b").String(), "ba");
    EXPECT_STREQ(BString("abc").ReplaceAll("", "x").String(), "abc");
    EXPECT_STREQ(BString("abc").ReplaceAll(nullptr, "x").String(), "abc");
    EXPECT_STREQ(BString("abc").ReplaceAll("b", nullptr).String(), "ac");
    EXPECT_STREQ(BString("abc").ReplaceAll("b", "x", 4).String(), "abc");
}

TEST(StringSearchTest, ReplacesSetsOfBytes) {
    EXPECT_STREQ(BString("a/b:c").ReplaceSet("/:", '-').String(), "a-b-c");
    EXPECT_STREQ(BString("a/:/b:c:").ReplaceSet("/:", "--").String(), "a--b--c--");
    EXPECT_STREQ(BString("abc").ReplaceSet(nullptr, "x").String(), "abc");
}
