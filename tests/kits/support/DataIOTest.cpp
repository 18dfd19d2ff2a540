#include <DataIO.h>

#include <cstring>
#include <gtest/gtest.h>

TEST(DataIOTest, TheBaseClassMovesNothing) {
    BDataIO stream;
    char byte = 'x';
    EXPECT_EQ(stream.Read(&byte, 1), B_UNSUPPORTED);
    EXPECT_EQ(stream.Write(&byte, 1), B_UNSUPPORTED);
    EXPECT_EQ(stream.Flush(), B_OK);
    EXPECT_EQ(stream.ReadExactly(&byte, 1), B_UNSUPPORTED);
}

TEST(MallocIOTest, WhatIsWrittenIsReadBack) {
    BMallocIO stream;
    EXPECT_EQ(stream.Buffer(), nullptr);
    EXPECT_EQ(stream.Write("hello", 5), 5);
    EXPECT_EQ(stream.Write(" world", 6), 6);
    EXPECT_EQ(stream.Position(), 11);
    EXPECT_EQ(stream.Seek(6, SEEK_SET), 6);
    char text[16] = {};
    EXPECT_EQ(stream.Read(text, sizeof(text)), 5);
    EXPECT_STREQ(text, "world");
    EXPECT_EQ(stream.Read(text, sizeof(text)), 0);
    EXPECT_EQ(stream.BufferLength(), 11U);
    EXPECT_EQ(std::memcmp(stream.Buffer(), "hello world", 11), 0);
}

TEST(MallocIOTest, PositionedAccessLeavesThePositionAlone) {
    BMallocIO stream;
    EXPECT_EQ(stream.WriteAt(0, "abcdef", 6), 6);
    EXPECT_EQ(stream.WriteAt(2, "XY", 2), 2);
    char text[4] = {};
    EXPECT_EQ(stream.ReadAt(1, text, 3), 3);
    EXPECT_STREQ(text, "bXY");
    EXPECT_EQ(stream.Position(), 0);
}

TEST(MallocIOTest, AGapIsFilledWithZeros) {
    BMallocIO stream;
    stream.Write("abc", 3);
    stream.SetSize(1);
    EXPECT_EQ(stream.WriteAt(4, "z", 1), 1);
    EXPECT_EQ(stream.BufferLength(), 5U);
    EXPECT_EQ(std::memcmp(stream.Buffer(), "a\0\0\0z", 5), 0);
}

TEST(MallocIOTest, SeekingOutsideIsRefusedOnlyBeforeTheStart) {
    BMallocIO stream;
    stream.Write("abcd", 4);
    EXPECT_EQ(stream.Seek(-2, SEEK_END), 2);
    EXPECT_EQ(stream.Seek(1, SEEK_CUR), 3);
    EXPECT_EQ(stream.Seek(-4, SEEK_CUR), B_BAD_VALUE);
    EXPECT_EQ(stream.Seek(0, 17), B_BAD_VALUE);
    EXPECT_EQ(stream.Seek(INT64_MAX, SEEK_CUR), B_BAD_VALUE);
    EXPECT_EQ(stream.Position(), 3);
    EXPECT_EQ(stream.Seek(100, SEEK_SET), 100);
    char byte;
    EXPECT_EQ(stream.Read(&byte, 1), 0);
}

TEST(MallocIOTest, ImpossibleRequestsLeaveItUnchanged) {
    BMallocIO stream;
    stream.Write("abcd", 4);
    EXPECT_EQ(stream.SetSize(-1), B_BAD_VALUE);
    EXPECT_EQ(stream.SetSize(INT64_MAX), B_NO_MEMORY);
    EXPECT_EQ(stream.WriteAt(-1, "x", 1), B_BAD_VALUE);
    EXPECT_EQ(stream.WriteAt(0, nullptr, 1), B_BAD_VALUE);
    EXPECT_EQ(stream.ReadAt(-1, nullptr, 0), B_BAD_VALUE);
    EXPECT_EQ(stream.BufferLength(), 4U);
    off_t size = 0;
    EXPECT_EQ(stream.GetSize(&size), B_OK);
    EXPECT_EQ(size, 4);
    EXPECT_EQ(stream.GetSize(nullptr), B_BAD_VALUE);
}

TEST(MallocIOTest, ManySmallWritesArriveWhole) {
    BMallocIO stream;
    stream.SetBlockSize(0);
    for (int number = 0; number < 10000; number++) {
        const char byte = static_cast<char>(number % 100);
        ASSERT_EQ(stream.Write(&byte, 1), 1);
    }
    const char* bytes = static_cast<const char*>(stream.Buffer());
    for (int number = 0; number < 10000; number++)
        ASSERT_EQ(bytes[number], number % 100);
}

TEST(MallocIOTest, ReadingExactlySaysHowFarItCame) {
    BMallocIO stream;
    stream.Write("abc", 3);
    char text[8] = {};
    size_t moved = 0;
    EXPECT_EQ(stream.ReadAtExactly(1, text, 2), B_OK);
    EXPECT_STREQ(text, "bc");
    EXPECT_EQ(stream.ReadAtExactly(1, text, 5, &moved), B_PARTIAL_READ);
    EXPECT_EQ(moved, 2U);
    stream.Seek(0, SEEK_SET);
    EXPECT_EQ(stream.ReadExactly(text, 3, &moved), B_OK);
    EXPECT_EQ(moved, 3U);
    EXPECT_EQ(stream.ReadExactly(text, 1, &moved), B_PARTIAL_READ);
    EXPECT_EQ(moved, 0U);
}

TEST(MemoryIOTest, WritingStopsAtTheEndOfTheMemory) {
    char memory[6] = {'x', 'x', 'x', 'x', 'x', 'x'};
    BMemoryIO stream(memory, 5);
    EXPECT_EQ(stream.WriteAt(3, "abc", 3), 2);
    EXPECT_EQ(memory[4], 'b');
    EXPECT_EQ(memory[5], 'x');
    EXPECT_EQ(stream.WriteAt(5, "a", 1), 0);
    size_t moved = 0;
    EXPECT_EQ(stream.WriteAtExactly(4, "ab", 2, &moved), B_PARTIAL_WRITE);
    EXPECT_EQ(moved, 1U);
    EXPECT_EQ(stream.WriteExactly("12345", 5), B_OK);
    EXPECT_EQ(std::memcmp(memory, "12345x", 6), 0);
}

TEST(MemoryIOTest, ItsSizeEndsAtTheMemory) {
    char memory[4] = {'a', 'b', 'c', 'd'};
    BMemoryIO stream(memory, sizeof(memory));
    EXPECT_EQ(stream.SetSize(5), B_ERROR);
    EXPECT_EQ(stream.SetSize(-1), B_BAD_VALUE);
    EXPECT_EQ(stream.SetSize(1), B_OK);
    EXPECT_EQ(stream.Seek(0, SEEK_END), 1);
    EXPECT_EQ(stream.WriteAt(3, "z", 1), 1);
    EXPECT_EQ(std::memcmp(memory, "a\0\0z", 4), 0);
}

TEST(MemoryIOTest, ConstantMemoryIsReadOnly) {
    const char memory[] = "constant";
    BMemoryIO stream(memory, 8);
    char text[9] = {};
    EXPECT_EQ(stream.Read(text, 100), 8);
    EXPECT_STREQ(text, "constant");
    EXPECT_EQ(stream.WriteAt(0, "C", 1), B_NOT_ALLOWED);
    EXPECT_EQ(stream.SetSize(2), B_NOT_ALLOWED);
}
