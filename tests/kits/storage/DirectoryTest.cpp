#include <Directory.h>
#include <Entry.h>
#include <File.h>
#include <Path.h>
#include <SymLink.h>

#include "StorageTest.h"

#include <algorithm>
#include <string.h>
#include <sys/stat.h>
#include <vector>

namespace fs = std::filesystem;

namespace {

class DirectoryOf : public test::StorageTest {
  protected:
    static std::vector<std::string> NamesIn(BDirectory& directory) {
        std::vector<std::string> leaves;
        entry_ref ref;
        while (directory.GetNextRef(&ref) == B_OK)
            leaves.emplace_back(ref.name);
        std::sort(leaves.begin(), leaves.end());
        return leaves;
    }
};

using Names = std::vector<std::string>;

} // namespace

TEST_F(DirectoryOf, AnUnsetDirectoryAnswersNoInit) {
    BDirectory directory;
    BEntry entry;
    entry_ref ref;
    struct stat stat;
    struct dirent record;
    EXPECT_EQ(directory.InitCheck(), B_NO_INIT);
    EXPECT_EQ(directory.GetEntry(&entry), B_NO_INIT);
    EXPECT_FALSE(directory.IsRootDirectory());
    EXPECT_FALSE(directory.Contains("x"));
    EXPECT_EQ(directory.GetStatFor("x", &stat), B_NO_INIT);
    EXPECT_EQ(directory.GetNextEntry(&entry), B_NO_INIT);
    EXPECT_EQ(directory.GetNextRef(&ref), B_NO_INIT);
    EXPECT_EQ(directory.GetNextDirents(&record, sizeof(record)), B_NO_INIT);
    EXPECT_EQ(directory.Rewind(), B_NO_INIT);
    EXPECT_EQ(directory.CountEntries(), B_NO_INIT);
}

TEST_F(DirectoryOf, SaysWhyOpeningFailed) {
    std::string file = MakeFile("file");
    EXPECT_EQ(BDirectory(At("nothing").c_str()).InitCheck(), B_ENTRY_NOT_FOUND);
    EXPECT_EQ(BDirectory(file.c_str()).InitCheck(), B_NOT_A_DIRECTORY);
    EXPECT_EQ(BDirectory(static_cast<const char*>(nullptr)).InitCheck(), B_BAD_VALUE);
    EXPECT_EQ(BDirectory(static_cast<const entry_ref*>(nullptr)).InitCheck(), B_BAD_VALUE);
    EXPECT_EQ(BDirectory(static_cast<const node_ref*>(nullptr)).InitCheck(), B_BAD_VALUE);
    EXPECT_EQ(BDirectory(static_cast<const BEntry*>(nullptr)).InitCheck(), B_BAD_VALUE);
    BEntry unset;
    EXPECT_EQ(BDirectory(&unset).InitCheck(), B_NO_INIT);
    node_ref nowhere(12345, 67890);
    EXPECT_NE(BDirectory(&nowhere).InitCheck(), B_OK);
}

TEST_F(DirectoryOf, IsOpenedInEveryWay) {
    std::string path = MakeDirectory("folder");
    MakeFile("folder/file");
    BEntry entry(path.c_str());
    entry_ref ref;
    node_ref node;
    entry.GetRef(&ref);
    entry.GetNodeRef(&node);
    BDirectory parent(Directory().c_str());
    BDirectory all[] = {BDirectory(&ref), BDirectory(&node), BDirectory(&entry), BDirectory(path.c_str()),
                        BDirectory(&parent, "folder")};
    for (BDirectory& directory : all) {
        EXPECT_EQ(directory.InitCheck(), B_OK);
        EXPECT_EQ(NamesIn(directory), (Names{"file"}));
        BEntry self;
        EXPECT_EQ(directory.GetEntry(&self), B_OK);
        EXPECT_EQ(self, entry);
    }
    BDirectory linked(MakeLink("link", "folder").c_str());
    EXPECT_TRUE(linked == all[0]);
}

TEST_F(DirectoryOf, ListsEveryNameOnce) {
    const Names names = {"a", "b", "new\nline", "\xFF", std::string(255, 'z')};
    for (const std::string& name : names)
        MakeFile(name);
    MakeDirectory("folder");
    MakeLink("link", "nowhere");
    Names expected = names;
    expected.emplace_back("folder");
    expected.emplace_back("link");
    std::sort(expected.begin(), expected.end());

    BDirectory directory(Directory().c_str());
    EXPECT_EQ(NamesIn(directory), expected);
    entry_ref ref;
    EXPECT_EQ(directory.GetNextRef(&ref), B_ENTRY_NOT_FOUND);
    EXPECT_EQ(directory.CountEntries(), 7);
    EXPECT_EQ(directory.Rewind(), B_OK);
    EXPECT_EQ(NamesIn(directory), expected);
}

TEST_F(DirectoryOf, CountingLeavesThePlace) {
    MakeFile("a");
    MakeFile("b");
    BDirectory directory(Directory().c_str());
    entry_ref first;
    entry_ref second;
    ASSERT_EQ(directory.GetNextRef(&first), B_OK);
    EXPECT_EQ(directory.CountEntries(), 2);
    ASSERT_EQ(directory.GetNextRef(&second), B_OK);
    EXPECT_NE(first, second);
}

TEST_F(DirectoryOf, GivesEntriesFollowedOrNot) {
    MakeDirectory("folder");
    MakeFile("target");
    MakeLink("folder/link", At("target"));
    BDirectory directory(At("folder").c_str());
    BEntry entry;
    ASSERT_EQ(directory.GetNextEntry(&entry), B_OK);
    EXPECT_TRUE(entry.IsSymLink());
    EXPECT_EQ(directory.GetNextEntry(&entry), B_ENTRY_NOT_FOUND);
    EXPECT_EQ(entry.InitCheck(), B_NO_INIT);
    directory.Rewind();
    ASSERT_EQ(directory.GetNextEntry(&entry, true), B_OK);
    EXPECT_TRUE(entry.IsFile());
}

TEST_F(DirectoryOf, FillsDirectoryRecords) {
    MakeFile("one");
    MakeFile("a longer name than the other");
    BDirectory directory(Directory().c_str());
    alignas(struct dirent) char buffer[1024];
    auto* first = reinterpret_cast<struct dirent*>(buffer);
    ASSERT_EQ(directory.GetNextDirents(first, sizeof(buffer)), 2);
    auto* second = reinterpret_cast<struct dirent*>(buffer + first->d_reclen);
    Names names = {first->d_name, second->d_name};
    std::sort(names.begin(), names.end());
    EXPECT_EQ(names, (Names{"a longer name than the other", "one"}));
    struct stat stat;
    ASSERT_EQ(::stat(At(first->d_name).c_str(), &stat), 0);
    EXPECT_EQ(first->d_ino, stat.st_ino);
    EXPECT_EQ(directory.GetNextDirents(first, sizeof(buffer)), 0);
}

TEST_F(DirectoryOf, ARecordThatDoesNotFitComesNextTime) {
    MakeFile(std::string(200, 'a'));
    MakeFile(std::string(200, 'b'));
    BDirectory directory(Directory().c_str());
    alignas(struct dirent) char buffer[256];
    auto* record = reinterpret_cast<struct dirent*>(buffer);
    EXPECT_EQ(directory.GetNextDirents(record, 64), B_BAD_VALUE);
    Names names;
    EXPECT_EQ(directory.GetNextDirents(record, sizeof(buffer)), 1);
    names.emplace_back(record->d_name);
    entry_ref ref;
    EXPECT_EQ(directory.GetNextRef(&ref), B_OK);
    names.emplace_back(ref.name);
    std::sort(names.begin(), names.end());
    EXPECT_EQ(names, (Names{std::string(200, 'a'), std::string(200, 'b')}));
    EXPECT_EQ(directory.GetNextDirents(record, sizeof(buffer)), 0);
    EXPECT_EQ(directory.GetNextDirents(nullptr, sizeof(buffer)), B_BAD_VALUE);
    directory.Rewind();
    EXPECT_EQ(directory.GetNextDirents(record, sizeof(buffer), 0), 0);
}

TEST_F(DirectoryOf, FindsEntriesThatExist) {
    MakeDirectory("folder");
    MakeFile("folder/file");
    MakeLink("link", "folder/file");
    BDirectory directory(Directory().c_str());
    BEntry entry;
    EXPECT_EQ(directory.FindEntry("folder/file", &entry), B_OK);
    EXPECT_TRUE(entry.IsFile());
    EXPECT_EQ(directory.FindEntry("link", &entry), B_OK);
    EXPECT_TRUE(entry.IsSymLink());
    EXPECT_EQ(directory.FindEntry("link", &entry, true), B_OK);
    EXPECT_TRUE(entry.IsFile());
    EXPECT_EQ(directory.FindEntry("nothing", &entry), B_ENTRY_NOT_FOUND);
    EXPECT_EQ(entry.InitCheck(), B_NO_INIT);
    EXPECT_EQ(directory.FindEntry(nullptr, &entry), B_BAD_VALUE);
    EXPECT_EQ(directory.FindEntry("folder", nullptr), B_BAD_VALUE);
}

TEST_F(DirectoryOf, ContainsWhatLiesBelowByKind) {
    MakeDirectory("folder/inner");
    MakeFile("folder/inner/file");
    MakeFile("outside");
    MakeLink("folder/link", "inner");
    BDirectory directory(At("folder").c_str());
    EXPECT_TRUE(directory.Contains("inner/file"));
    EXPECT_TRUE(directory.Contains("inner/file", B_FILE_NODE));
    EXPECT_FALSE(directory.Contains("inner/file", B_DIRECTORY_NODE));
    EXPECT_TRUE(directory.Contains("inner", B_DIRECTORY_NODE));
    EXPECT_TRUE(directory.Contains("link", B_SYMLINK_NODE));
    EXPECT_FALSE(directory.Contains("nothing"));
    EXPECT_FALSE(directory.Contains("../outside"));
    BEntry self(At("folder").c_str());
    EXPECT_FALSE(directory.Contains(&self));
    BEntry outside(At("outside").c_str());
    EXPECT_FALSE(directory.Contains(&outside));
    EXPECT_FALSE(directory.Contains(static_cast<const BEntry*>(nullptr)));
}

TEST_F(DirectoryOf, GivesTheStatOfAPath) {
    MakeFile("file", "12345");
    BDirectory directory(Directory().c_str());
    struct stat stat;
    EXPECT_EQ(directory.GetStatFor("file", &stat), B_OK);
    EXPECT_EQ(stat.st_size, 5);
    EXPECT_EQ(directory.GetStatFor("nothing", &stat), B_ENTRY_NOT_FOUND);
    EXPECT_EQ(directory.GetStatFor(nullptr, &stat), B_OK);
    EXPECT_TRUE(S_ISDIR(stat.st_mode));
    EXPECT_EQ(directory.GetStatFor("file", nullptr), B_BAD_VALUE);
}

TEST_F(DirectoryOf, MakesDirectoriesFilesAndLinks) {
    BDirectory directory(Directory().c_str());
    BDirectory made;
    EXPECT_EQ(directory.CreateDirectory("made", &made), B_OK);
    EXPECT_EQ(made.InitCheck(), B_OK);
    EXPECT_EQ(directory.CreateDirectory("made", nullptr), B_FILE_EXISTS);
    EXPECT_EQ(directory.CreateDirectory("no/such", nullptr), B_ENTRY_NOT_FOUND);
    EXPECT_EQ(directory.CreateDirectory(nullptr, nullptr), B_BAD_VALUE);

    BFile file;
    EXPECT_EQ(made.CreateFile("file", &file), B_OK);
    EXPECT_EQ(file.Write("abc", 3), 3);
    EXPECT_EQ(made.CreateFile("file", nullptr, true), B_FILE_EXISTS);
    EXPECT_EQ(test::read_file(At("made/file")), "abc");
    EXPECT_EQ(made.CreateFile("file", nullptr), B_OK);
    EXPECT_EQ(test::read_file(At("made/file")), "");

    BSymLink link;
    EXPECT_EQ(directory.CreateSymLink("link", "made/file", &link), B_OK);
    EXPECT_EQ(fs::read_symlink(At("link")), "made/file");
    EXPECT_EQ(link.InitCheck(), B_OK);
    EXPECT_EQ(directory.CreateSymLink("link", "x", nullptr), B_FILE_EXISTS);
    EXPECT_EQ(directory.CreateSymLink("link2", nullptr, nullptr), B_BAD_VALUE);

    EXPECT_EQ(directory.CreateDirectory("made/deeper", &directory), B_OK);
    BEntry self;
    EXPECT_EQ(directory.GetEntry(&self), B_OK);
    EXPECT_EQ(BPath(&self).Path(), At("made/deeper"));
}

TEST_F(DirectoryOf, StaysTheSameWhenItIsMoved) {
    MakeDirectory("folder");
    MakeDirectory("other");
    BDirectory directory(At("folder").c_str());
    fs::rename(At("folder"), At("other/moved"));
    EXPECT_EQ(directory.CreateFile("file", nullptr), B_OK);
    EXPECT_TRUE(fs::exists(At("other/moved/file")));
    BEntry self;
    EXPECT_EQ(directory.GetEntry(&self), B_OK);
    EXPECT_EQ(BPath(&self).Path(), At("other/moved"));
}

TEST_F(DirectoryOf, KnowsTheVolumesRoot) {
    EXPECT_TRUE(BDirectory(Volume().c_str()).IsRootDirectory());
    EXPECT_FALSE(BDirectory(Directory().c_str()).IsRootDirectory());
}

TEST_F(DirectoryOf, CopiesHaveTheirOwnPlace) {
    MakeFile("a");
    BDirectory directory(Directory().c_str());
    EXPECT_EQ(NamesIn(directory), (Names{"a"}));
    BDirectory copy(directory);
    EXPECT_EQ(NamesIn(copy), (Names{"a"}));
    BDirectory assigned;
    assigned = directory;
    EXPECT_EQ(NamesIn(assigned), (Names{"a"}));
}

TEST_F(DirectoryOf, CreateDirectoryMakesWhatIsMissing) {
    EXPECT_EQ(create_directory(At("a/b//c/").c_str(), 0755), B_OK);
    EXPECT_TRUE(fs::is_directory(At("a/b/c")));
    EXPECT_EQ(create_directory(At("a/b/c").c_str(), 0755), B_OK);
    MakeFile("file");
    EXPECT_EQ(create_directory(At("file").c_str(), 0755), B_NOT_A_DIRECTORY);
    EXPECT_EQ(create_directory(At("file/x").c_str(), 0755), B_NOT_A_DIRECTORY);
    EXPECT_EQ(create_directory(nullptr, 0755), B_BAD_VALUE);
    EXPECT_EQ(create_directory("", 0755), B_BAD_VALUE);
    EXPECT_EQ(create_directory("/", 0755), B_OK);
}
