#include <String.h>

#include <cstring>
#include <gtest/gtest.h>

TEST(StringTest, IsMadeFromTexts) {
    EXPECT_STREQ(BString().String(), "");
    EXPECT_STREQ(BString("abc").String(), "abc");
    EXPECT_STREQ(BString(nullptr).String(), "");
    EXPECT_STREQ(BString("abcdef", 3).String(), "abc");
    EXPECT_STREQ(BString("abc", 9).String(), "abc");
    EXPECT_STREQ(BString("abc", -1).String(), "abc");
    const char unterminated[2] = {'h', 'i'};
    EXPECT_STREQ(BString(unterminated, 2).String(), "hi");
    EXPECT_EQ(BString("abc").Length(), 3);
    EXPECT_TRUE(BString().IsEmpty());
}

TEST(StringTest, IsSetAnew) {
    BString string("old");
    EXPECT_STREQ((string = "new").String(), "new");
    EXPECT_STREQ((string = 'c').String(), "c");
    EXPECT_STREQ(string.SetTo("abcdef", 2).String(), "ab");
    EXPECT_STREQ(string.SetTo('x', 3).String(), "xxx");
    EXPECT_STREQ(string.SetTo('x', -3).String(), "");
    EXPECT_STREQ(string.SetTo(BString("other"), 2).String(), "ot");
    EXPECT_STREQ(string.SetToFormat("%d of %s", 3, "four").String(), "3 of four");
    EXPECT_STREQ(string.SetTo(nullptr).String(), "");
}

TEST(StringTest, ATextOfItsOwnMayBeGivenBack) {
    BString string("abcdef");
    EXPECT_STREQ(string.SetTo(string.String() + 2).String(), "cdef");
    EXPECT_STREQ(string.Append(string.String()).String(), "cdefcdef");
    EXPECT_STREQ(string.Insert(string, 0).String(), "cdefcdefcdefcdef");
    string = "ab";
    EXPECT_STREQ((string += string).String(), "abab");
    EXPECT_STREQ(string.Adopt(string, 1).String(), "a");
}

TEST(StringTest, AdoptingEmptiesTheOther) {
    BString from("taken");
    BString string("old");
    EXPECT_STREQ(string.Adopt(from).String(), "taken");
    EXPECT_STREQ(from.String(), "");
    BString rest("truncated");
    EXPECT_STREQ(string.Adopt(rest, 3).String(), "tru");
}

TEST(StringTest, CopiesParts) {
    const BString string("abcdef");
    BString part;
    EXPECT_STREQ(string.CopyInto(part, 2, 3).String(), "cde");
    EXPECT_STREQ(string.CopyInto(part, 4, 30).String(), "ef");
    EXPECT_STREQ(string.CopyInto(part, 7, 1).String(), "");
    EXPECT_STREQ(string.CopyInto(part, 2, -1).String(), "");
    char field[4] = {'x', 'x', 'x', 'x'};
    string.CopyInto(field, 0, 3);
    EXPECT_EQ(std::memcmp(field, "abcx", 4), 0);
    string.CopyInto(field, 5, 3);
    EXPECT_STREQ(field, "f");
}

TEST(StringTest, AppendsAndPrepends) {
    BString string("m");
    string.Append("nop", 2).Append('q', 2).Prepend("jkl").Prepend(BString("hi"), 1).Prepend('-', 2);
    EXPECT_STREQ(string.String(), "--hjklmnoqq");
    string = "a";
    string += "b";
    string += 'c';
    string.Append(BString("def"), 2);
    string.Append('z', -1);
    string.Append(nullptr);
    EXPECT_STREQ(string.String(), "abcde");
}

TEST(StringTest, InsertsInsideOnly) {
    BString string("ad");
    EXPECT_STREQ(string.Insert("bc", 1).String(), "abcd");
    EXPECT_STREQ(string.Insert("efgh", 1, 2, 4).String(), "abcdfg");
    EXPECT_STREQ(string.Insert('-', 2, 0).String(), "--abcdfg");
    EXPECT_STREQ(string.Insert("x", 9).String(), "--abcdfg");
    EXPECT_STREQ(string.Insert("x", -1).String(), "--abcdfg");
    EXPECT_STREQ(string.Insert("x", 2, 1, 0).String(), "--abcdfg");
    EXPECT_STREQ(string.Insert(BString("xyz"), 1, 1, 2).String(), "--yabcdfg");
    EXPECT_STREQ(string.Insert(BString("xyz"), 4, 1, 2).String(), "--yabcdfg");
}

TEST(StringTest, RemovesParts) {
    BString string("one two one two");
    EXPECT_STREQ(BString(string).RemoveFirst("one ").String(), "two one two");
    EXPECT_STREQ(BString(string).RemoveLast(" two").String(), "one two one");
    EXPECT_STREQ(BString(string).RemoveAll("one").String(), " two  two");
    EXPECT_STREQ(BString(string).RemoveSet("eo ").String(), "ntwntw");
    EXPECT_STREQ(BString(string).Remove(3, 8).String(), "one two");
    EXPECT_STREQ(BString(string).Remove(3, 800).String(), "one");
    EXPECT_STREQ(BString(string).Remove(30, 8).String(), "one two one two");
    EXPECT_STREQ(BString(string).Truncate(3).String(), "one");
    EXPECT_STREQ(BString(string).Truncate(300).String(), "one two one two");
    EXPECT_STREQ(BString(string).Truncate(-1).String(), "");
    BString moved;
    string.MoveInto(moved, 4, 4);
    EXPECT_STREQ(moved.String(), "two ");
    EXPECT_STREQ(string.String(), "one one two");
    char field[4];
    string.MoveInto(field, 0, 4);
    EXPECT_EQ(std::memcmp(field, "one ", 4), 0);
    EXPECT_STREQ(string.String(), "one two");
}

TEST(StringTest, SingleBytes) {
    BString string("abc");
    EXPECT_EQ(string.ByteAt(1), 'b');
    EXPECT_EQ(string.ByteAt(3), '\0');
    EXPECT_EQ(string.ByteAt(-1), '\0');
    string[1] = 'X';
    EXPECT_STREQ(string.String(), "aXc");
    EXPECT_EQ(string[2], 'c');
}

TEST(StringTest, CharactersAreCountedNotBytes) {
    const BString string("a\xC3\xA4\xE2\x82\xAC\xF0\x9F\x8E\xB5z");
    EXPECT_EQ(string.Length(), 11);
    EXPECT_EQ(string.CountChars(), 5);
    EXPECT_EQ(string.CountBytes(1, 2), 5);
    EXPECT_EQ(string.CountBytes(4, 10), 1);
    EXPECT_EQ(string.CountBytes(5, 1), 0);
}

TEST(StringTest, TheBufferCanBeWrittenByHand) {
    BString string("ab");
    char* buffer = string.LockBuffer(8);
    EXPECT_STREQ(buffer, "ab");
    std::memcpy(buffer + 2, "cdef", 5);
    string.UnlockBuffer();
    EXPECT_STREQ(string.String(), "abcdef");
    EXPECT_EQ(string.Length(), 6);
    string.LockBuffer(0)[0] = 'X';
    EXPECT_STREQ(string.UnlockBuffer(3).String(), "Xbc");
}

TEST(StringTest, ChangesTheCaseOfLetters) {
    EXPECT_STREQ(BString("aBC-\xC3\x84").ToLower().String(), "abc-\xC3\x84");
    EXPECT_STREQ(BString("abC-\xC3\xA4").ToUpper().String(), "ABC-\xC3\xA4");
    EXPECT_STREQ(BString("heLLO world").Capitalize().String(), "Hello world");
    EXPECT_STREQ(BString("heLLO new-world 2nd").CapitalizeEachWord().String(), "Hello New-World 2Nd");
}

TEST(StringTest, EscapesAndTakesEscapesAway) {
    BString string("a\"b\\c");
    EXPECT_STREQ(string.CharacterEscape("\"\\", '\\').String(), "a\\\"b\\\\c");
    EXPECT_STREQ(string.CharacterDeescape('\\').String(), "a\"b\\c");
    EXPECT_STREQ(string.CharacterEscape("x y", " ", '%').String(), "x% y");
    EXPECT_STREQ(string.CharacterDeescape("ends%", '%').String(), "ends%");
}

TEST(StringTest, TrimsWhiteSpaceAtBothEnds) {
    EXPECT_STREQ(BString(" \t a b \n").Trim().String(), "a b");
    EXPECT_STREQ(BString(" \t\n").Trim().String(), "");
    EXPECT_STREQ(BString("").Trim().String(), "");
}

TEST(StringTest, ValuesAreAppendedAsText) {
    BString string;
    string << "n=" << int32{-5} << ' ' << uint32{4000000000U} << ' ' << int64{-5000000000} << ' '
           << uint64{18446744073709551615U} << ' ' << 1.5F << ' ' << -2.346 << ' ' << BString("x") << ' '
           << true;
    EXPECT_STREQ(string.String(), "n=-5 4000000000 -5000000000 18446744073709551615 1.50 -2.35 x true");
    BString longest;
    longest << 1.7976931348623157e308;
    EXPECT_EQ(longest.Length(), 312);
}

TEST(StringTest, StringsAreJoined) {
    EXPECT_STREQ((BString("a") + BString("b")).String(), "ab");
    EXPECT_STREQ((BString("a") + "b").String(), "ab");
    EXPECT_STREQ(("a" + BString("b")).String(), "ab");
}
