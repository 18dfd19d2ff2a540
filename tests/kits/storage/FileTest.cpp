#include <Directory.h>
#include <Entry.h>
#include <File.h>

#include "StorageTest.h"

#include <stdio.h>
#include <sys/stat.h>
#include <unistd.h>

namespace {

class File : public test::StorageTest {};

} // namespace

TEST_F(File, AnUnsetFileAnswersNoInit) {
    BFile file;
    char buffer[4];
    off_t size = 0;
    EXPECT_EQ(file.InitCheck(), B_NO_INIT);
    EXPECT_EQ(file.Read(buffer, 4), B_NO_INIT);
    EXPECT_EQ(file.ReadAt(0, buffer, 4), B_NO_INIT);
    EXPECT_EQ(file.Write("x", 1), B_NO_INIT);
    EXPECT_EQ(file.WriteAt(0, "x", 1), B_NO_INIT);
    EXPECT_EQ(file.Seek(0, SEEK_SET), B_NO_INIT);
    EXPECT_EQ(file.Position(), B_NO_INIT);
    EXPECT_EQ(file.SetSize(0), B_NO_INIT);
    EXPECT_EQ(file.GetSize(&size), B_NO_INIT);
    EXPECT_FALSE(file.IsReadable());
    EXPECT_FALSE(file.IsWritable());
}

TEST_F(File, SaysWhyOpeningFailed) {
    MakeDirectory("folder");
    std::string existing = MakeFile("existing");
    EXPECT_EQ(BFile(At("nothing").c_str(), B_READ_ONLY).InitCheck(), B_ENTRY_NOT_FOUND);
    EXPECT_EQ(BFile(At("no/thing").c_str(), B_READ_WRITE | B_CREATE_FILE).InitCheck(), B_ENTRY_NOT_FOUND);
    EXPECT_EQ(BFile(At("folder").c_str(), B_WRITE_ONLY).InitCheck(), B_IS_A_DIRECTORY);
    EXPECT_EQ(BFile(existing.c_str(), B_READ_WRITE | B_CREATE_FILE | B_FAIL_IF_EXISTS).InitCheck(),
              B_FILE_EXISTS);
    EXPECT_EQ(BFile(existing.c_str(), 3).InitCheck(), B_BAD_VALUE);
    EXPECT_EQ(BFile(static_cast<const char*>(nullptr), B_READ_ONLY).InitCheck(), B_BAD_VALUE);
    EXPECT_EQ(BFile(static_cast<const entry_ref*>(nullptr), B_READ_ONLY).InitCheck(), B_BAD_VALUE);
    BEntry unset;
    EXPECT_EQ(BFile(&unset, B_READ_ONLY).InitCheck(), B_NO_INIT);
    BDirectory directory(Directory().c_str());
    EXPECT_EQ(BFile(&directory, nullptr, B_READ_ONLY).InitCheck(), B_BAD_VALUE);
}

TEST_F(File, TheSettingsFilesModeCreatesAndErases) {
    const uint32 mode = 0x601;
    EXPECT_EQ(mode, B_WRITE_ONLY | B_CREATE_FILE | B_ERASE_FILE);
    BFile file(At("settings").c_str(), mode);
    ASSERT_EQ(file.InitCheck(), B_OK);
    EXPECT_EQ(file.Write("first and long", 14), 14);
    file.Unset();
    BFile again(At("settings").c_str(), mode);
    EXPECT_EQ(again.Write("second", 6), 6);
    again.Unset();
    EXPECT_EQ(test::read_file(At("settings")), "second");
}

TEST_F(File, ReadsAndWritesAtItsPosition) {
    BFile file(At("file").c_str(), B_READ_WRITE | B_CREATE_FILE);
    ASSERT_EQ(file.InitCheck(), B_OK);
    EXPECT_EQ(file.Write("0123456789", 10), 10);
    EXPECT_EQ(file.Position(), 10);
    EXPECT_EQ(file.Seek(-4, SEEK_CUR), 6);
    char buffer[16];
    EXPECT_EQ(file.Read(buffer, 2), 2);
    EXPECT_EQ(std::string(buffer, 2), "67");
    EXPECT_EQ(file.Read(buffer, 16), 2);
    EXPECT_EQ(file.Read(buffer, 16), 0);
    EXPECT_EQ(file.Seek(-1, SEEK_END), 9);
    EXPECT_EQ(file.Write("xy", 2), 2);
    EXPECT_EQ(file.Seek(0, SEEK_SET), 0);
    EXPECT_EQ(file.Read(buffer, 16), 11);
    EXPECT_EQ(std::string(buffer, 11), "012345678xy");
}

TEST_F(File, ReadAtAndWriteAtLeaveThePosition) {
    BFile file(At("file").c_str(), B_READ_WRITE | B_CREATE_FILE);
    EXPECT_EQ(file.Write("abc", 3), 3);
    char buffer[4];
    EXPECT_EQ(file.ReadAt(1, buffer, 4), 2);
    EXPECT_EQ(file.WriteAt(5, "z", 1), 1);
    EXPECT_EQ(file.Position(), 3);
    EXPECT_EQ(test::read_file(At("file")), std::string("abc\0\0z", 6));
    EXPECT_EQ(file.ReadAt(-1, buffer, 4), B_BAD_VALUE);
    EXPECT_EQ(file.WriteAt(-1, "z", 1), B_BAD_VALUE);
    EXPECT_EQ(file.Read(nullptr, 1), B_BAD_VALUE);
    EXPECT_EQ(file.Write(nullptr, 1), B_BAD_VALUE);
}

TEST_F(File, SeekingRefusesNegativePositions) {
    BFile file(At("file").c_str(), B_READ_WRITE | B_CREATE_FILE);
    EXPECT_EQ(file.Write("abc", 3), 3);
    EXPECT_EQ(file.Seek(-4, SEEK_CUR), B_BAD_VALUE);
    EXPECT_EQ(file.Seek(-1, SEEK_SET), B_BAD_VALUE);
    EXPECT_EQ(file.Seek(-4, SEEK_END), B_BAD_VALUE);
    EXPECT_EQ(file.Seek(0, 17), B_BAD_VALUE);
    EXPECT_EQ(file.Seek(INT64_MAX, SEEK_CUR), B_BAD_VALUE);
    EXPECT_EQ(file.Position(), 3);
    EXPECT_EQ(file.Seek(100, SEEK_SET), 100);
    char buffer[1];
    EXPECT_EQ(file.Read(buffer, 1), 0);
}

TEST_F(File, OpenedForOneItRefusesTheOther) {
    std::string path = MakeFile("file", "abc");
    char buffer[4];
    BFile reading(path.c_str(), B_READ_ONLY);
    EXPECT_TRUE(reading.IsReadable());
    EXPECT_FALSE(reading.IsWritable());
    EXPECT_EQ(reading.Write("x", 1), B_NOT_ALLOWED);
    EXPECT_EQ(reading.SetSize(0), B_NOT_ALLOWED);
    EXPECT_EQ(reading.Read(buffer, 4), 3);
    BFile writing(path.c_str(), B_WRITE_ONLY);
    EXPECT_FALSE(writing.IsReadable());
    EXPECT_TRUE(writing.IsWritable());
    EXPECT_EQ(writing.Read(buffer, 4), B_NOT_ALLOWED);
    EXPECT_EQ(writing.Write("x", 1), 1);
}

TEST_F(File, OpenedAtTheEndEveryWriteAppends) {
    std::string path = MakeFile("file", "abc");
    BFile file(path.c_str(), B_READ_WRITE | B_OPEN_AT_END);
    EXPECT_EQ(file.Position(), 3);
    EXPECT_EQ(file.Seek(0, SEEK_SET), 0);
    EXPECT_EQ(file.Write("d", 1), 1);
    EXPECT_EQ(file.Position(), 4);
    EXPECT_EQ(test::read_file(path), "abcd");
}

TEST_F(File, SizeGrowsWithZerosAndShrinks) {
    std::string path = MakeFile("file", "abc");
    BFile file(path.c_str(), B_READ_WRITE);
    EXPECT_EQ(file.SetSize(5), B_OK);
    EXPECT_EQ(test::read_file(path), std::string("abc\0\0", 5));
    EXPECT_EQ(file.SetSize(1), B_OK);
    off_t size = 0;
    EXPECT_EQ(file.GetSize(&size), B_OK);
    EXPECT_EQ(size, 1);
    EXPECT_EQ(file.SetSize(-1), B_BAD_VALUE);
    EXPECT_EQ(file.GetSize(nullptr), B_BAD_VALUE);
}

TEST_F(File, CopiesShareThePosition) {
    std::string path = MakeFile("file", "0123456789");
    BFile file(path.c_str(), B_READ_ONLY);
    BFile copy(file);
    BFile assigned;
    assigned = file;
    char buffer[4];
    EXPECT_EQ(file.Read(buffer, 3), 3);
    EXPECT_EQ(copy.Read(buffer, 2), 2);
    EXPECT_EQ(std::string(buffer, 2), "34");
    file.Unset();
    EXPECT_EQ(assigned.Position(), 5);
    EXPECT_EQ(assigned.Read(buffer, 1), 1);
    EXPECT_EQ(buffer[0], '5');
}

TEST_F(File, ACopyOfAnUnsetFileIsUnset) {
    BFile unset;
    BFile copy(unset);
    EXPECT_EQ(copy.InitCheck(), B_NO_INIT);
    BFile failed(At("nothing").c_str(), B_READ_ONLY);
    EXPECT_EQ(BFile(failed).InitCheck(), B_ENTRY_NOT_FOUND);
}

TEST_F(File, OpeningALinkOpensItsFile) {
    MakeFile("file", "abc");
    BFile file(MakeLink("link", "file").c_str(), B_READ_ONLY);
    char buffer[4];
    EXPECT_EQ(file.Read(buffer, 4), 3);
    EXPECT_EQ(BFile(MakeLink("dangling", "nothing").c_str(), B_READ_ONLY).InitCheck(), B_ENTRY_NOT_FOUND);
}

TEST_F(File, IsANodeWithAttributes) {
    BFile file(MakeFile("file", "abc").c_str(), B_READ_WRITE);
    EXPECT_EQ(file.WriteAttr("a", 'CSTR', 0, "x", 2), 2);
    char buffer[4];
    EXPECT_EQ(file.ReadAttr("a", 'CSTR', 0, buffer, 4), 2);
    EXPECT_EQ(file.Position(), 0);
}

TEST_F(File, FilesOutsideOfAllVolumesWorkAsWell) {
    BFile file((Home() + "/file").c_str(), 0x601);
    ASSERT_EQ(file.InitCheck(), B_OK);
    EXPECT_EQ(file.Write("abc", 3), 3);
    EXPECT_EQ(test::read_file(Home() + "/file"), "abc");
}

TEST_F(File, AFileThatMayNotBeReadIsDenied) {
    if (geteuid() == 0)
        GTEST_SKIP() << "root may read everything";
    std::string path = MakeFile("file");
    ASSERT_EQ(chmod(path.c_str(), 0), 0);
    EXPECT_EQ(BFile(path.c_str(), B_READ_ONLY).InitCheck(), B_PERMISSION_DENIED);
}
