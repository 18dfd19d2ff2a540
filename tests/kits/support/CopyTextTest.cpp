#include <CopyText.h>

#include <cstring>
#include <gtest/gtest.h>

TEST(CopyTextTest, ATextThatFitsIsCopiedAndTerminated) {
    char field[6] = {'x', 'x', 'x', 'x', 'x', 'x'};
    EXPECT_TRUE(CopyText(field, "abc"));
    EXPECT_STREQ(field, "abc");
    EXPECT_TRUE(CopyText(field, "abcde"));
    EXPECT_STREQ(field, "abcde");
}

TEST(CopyTextTest, ALongTextIsCutAndTerminatedInsideTheField) {
    char memory[8] = {'x', 'x', 'x', 'x', 'x', 'x', 'x', 'x'};
    EXPECT_FALSE(CopyText(memory, 4, "abcdef"));
    EXPECT_STREQ(memory, "abc");
    EXPECT_EQ(memory[4], 'x');
}

TEST(CopyTextTest, NullIsEmpty) {
    char field[3] = {'x', 'x', 'x'};
    EXPECT_TRUE(CopyText(field, nullptr));
    EXPECT_STREQ(field, "");
    EXPECT_TRUE(CopyText(field, 3, nullptr, 7));
    EXPECT_STREQ(field, "");
}

TEST(CopyTextTest, AFieldWithoutRoomIsLeftAlone) {
    char field = 'x';
    EXPECT_FALSE(CopyText(&field, 0, "a"));
    EXPECT_TRUE(CopyText(&field, 0, ""));
    EXPECT_TRUE(CopyText(&field, 0, nullptr));
    EXPECT_EQ(field, 'x');
    EXPECT_FALSE(CopyText(&field, 1, "a"));
    EXPECT_EQ(field, '\0');
}

TEST(CopyTextTest, ReadsNoFurtherThanTheGivenLength) {
    const char text[3] = {'a', 'b', 'c'};
    char field[8];
    EXPECT_TRUE(CopyText(field, sizeof(field), text, 3));
    EXPECT_STREQ(field, "abc");
    EXPECT_TRUE(CopyText(field, sizeof(field), "ab\0cd", 5));
    EXPECT_STREQ(field, "ab");
}
