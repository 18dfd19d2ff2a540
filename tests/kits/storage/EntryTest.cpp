#include <Directory.h>
#include <Entry.h>
#include <Path.h>

#include "StorageTest.h"

#include <sys/stat.h>
#include <unistd.h>

namespace fs = std::filesystem;

namespace {

class Entry : public test::StorageTest {
  protected:
    static std::string PathOf(const BEntry& entry) {
        BPath path;
        return entry.GetPath(&path) == B_OK ? path.Path() : "";
    }
    static std::string NameOf(const BEntry& entry) {
        char name[B_FILE_NAME_LENGTH];
        return entry.GetName(name) == B_OK ? name : "";
    }
};

} // namespace

TEST_F(Entry, AnUnsetEntryAnswersNoInit) {
    BEntry entry;
    EXPECT_EQ(entry.InitCheck(), B_NO_INIT);
    EXPECT_FALSE(entry.Exists());
    entry_ref ref;
    BPath path;
    BEntry parent;
    BDirectory directory;
    char name[B_FILE_NAME_LENGTH];
    struct stat stat;
    EXPECT_EQ(entry.GetRef(&ref), B_NO_INIT);
    EXPECT_EQ(entry.GetPath(&path), B_NO_INIT);
    EXPECT_EQ(entry.GetParent(&parent), B_NO_INIT);
    EXPECT_EQ(entry.GetParent(&directory), B_NO_INIT);
    EXPECT_EQ(entry.GetName(name), B_NO_INIT);
    EXPECT_EQ(entry.Rename("x"), B_NO_INIT);
    EXPECT_EQ(entry.MoveTo(&directory), B_NO_INIT);
    EXPECT_EQ(entry.Remove(), B_NO_INIT);
    EXPECT_EQ(entry.GetStat(&stat), B_NO_INIT);
    EXPECT_EQ(entry.SetPermissions(0600), B_NO_INIT);
}

TEST_F(Entry, NullAndEmptyArgumentsAreBadValues) {
    EXPECT_EQ(BEntry(static_cast<const char*>(nullptr)).InitCheck(), B_BAD_VALUE);
    EXPECT_EQ(BEntry("").InitCheck(), B_BAD_VALUE);
    EXPECT_EQ(BEntry(static_cast<const entry_ref*>(nullptr)).InitCheck(), B_BAD_VALUE);
    EXPECT_EQ(BEntry(static_cast<const BDirectory*>(nullptr), "a").InitCheck(), B_BAD_VALUE);
    BDirectory unset;
    EXPECT_EQ(BEntry(&unset, "a").InitCheck(), B_BAD_VALUE);
    entry_ref nameless;
    EXPECT_EQ(BEntry(&nameless).InitCheck(), B_BAD_VALUE);
    entry_ref deep(1, 1, "a/b");
    EXPECT_EQ(BEntry(&deep).InitCheck(), B_BAD_VALUE);

    BEntry entry(Directory().c_str());
    EXPECT_EQ(entry.GetRef(nullptr), B_BAD_VALUE);
    EXPECT_EQ(entry.GetPath(nullptr), B_BAD_VALUE);
    EXPECT_EQ(entry.GetParent(static_cast<BEntry*>(nullptr)), B_BAD_VALUE);
    EXPECT_EQ(entry.GetParent(static_cast<BDirectory*>(nullptr)), B_BAD_VALUE);
    EXPECT_EQ(entry.GetName(nullptr), B_BAD_VALUE);
    EXPECT_EQ(entry.Rename(nullptr), B_BAD_VALUE);
    EXPECT_EQ(entry.MoveTo(nullptr), B_BAD_VALUE);
    entry_ref ref;
    EXPECT_EQ(get_ref_for_path(nullptr, &ref), B_BAD_VALUE);
    EXPECT_EQ(get_ref_for_path("/", nullptr), B_BAD_VALUE);
}

TEST_F(Entry, NamesAFileByPathRefAndDirectory) {
    std::string path = MakeFile("song.mp3");
    BEntry byPath(path.c_str());
    ASSERT_EQ(byPath.InitCheck(), B_OK);
    EXPECT_TRUE(byPath.Exists());
    EXPECT_TRUE(byPath.IsFile());
    EXPECT_EQ(PathOf(byPath), path);
    EXPECT_EQ(NameOf(byPath), "song.mp3");

    entry_ref ref;
    ASSERT_EQ(byPath.GetRef(&ref), B_OK);
    EXPECT_STREQ(ref.name, "song.mp3");
    BEntry byRef(&ref);
    EXPECT_EQ(byRef, byPath);

    BDirectory directory(Directory().c_str());
    BEntry byDirectory(&directory, "song.mp3");
    EXPECT_EQ(byDirectory, byPath);
    entry_ref again;
    EXPECT_EQ(get_ref_for_path(path.c_str(), &again), B_OK);
    EXPECT_EQ(again, ref);
}

TEST_F(Entry, TheLeafNeedNotExistButItsDirectoryMust) {
    BEntry abstract(At("nothing").c_str());
    EXPECT_EQ(abstract.InitCheck(), B_OK);
    EXPECT_FALSE(abstract.Exists());
    EXPECT_EQ(NameOf(abstract), "nothing");
    struct stat stat;
    EXPECT_EQ(abstract.GetStat(&stat), B_ENTRY_NOT_FOUND);

    EXPECT_EQ(BEntry(At("no/thing").c_str()).InitCheck(), B_ENTRY_NOT_FOUND);
    MakeFile("file");
    EXPECT_EQ(BEntry(At("file/thing").c_str()).InitCheck(), B_NOT_A_DIRECTORY);
}

TEST_F(Entry, ARefWhoseDirectoryIsGoneIsNotFound) {
    MakeDirectory("gone");
    entry_ref ref;
    ASSERT_EQ(get_ref_for_path(At("gone/file").c_str(), &ref), B_OK);
    EXPECT_EQ(BEntry(&ref).InitCheck(), B_OK);
    fs::remove(At("gone"));
    EXPECT_EQ(BEntry(&ref).InitCheck(), B_ENTRY_NOT_FOUND);
}

TEST_F(Entry, ARefSurvivesRenamingAndMovingOfTheDirectoriesAbove) {
    MakeDirectory("a/b");
    MakeDirectory("other");
    MakeFile("a/b/song.mp3", "x");
    entry_ref ref;
    ASSERT_EQ(get_ref_for_path(At("a/b/song.mp3").c_str(), &ref), B_OK);

    fs::rename(At("a/b"), At("a/c"));
    EXPECT_EQ(PathOf(BEntry(&ref)), At("a/c/song.mp3"));
    fs::rename(At("a"), At("other/z"));
    BEntry entry(&ref);
    EXPECT_TRUE(entry.Exists());
    EXPECT_EQ(PathOf(entry), At("other/z/c/song.mp3"));
}

TEST_F(Entry, ANameMayBeAnyBytes) {
    const std::string names[] = {std::string(255, 'n'),
                                 "new\nline",
                                 "\xFF\xFE invalid \x80",
                                 " blanks ",
                                 "\xC3\xA9t\xC3\xA9.mp3",
                                 "...",
                                 "*?[\"\\'"};
    for (const std::string& name : names) {
        std::string path = MakeFile(name);
        BEntry entry(path.c_str());
        ASSERT_EQ(entry.InitCheck(), B_OK) << name;
        EXPECT_EQ(NameOf(entry), name);
        EXPECT_EQ(PathOf(entry), path);
        entry_ref ref;
        entry.GetRef(&ref);
        EXPECT_TRUE(BEntry(&ref).IsFile()) << name;
    }
}

TEST_F(Entry, ANameOf256BytesIsTooLong) {
    std::string name(256, 'n');
    EXPECT_EQ(BEntry(At(name).c_str()).InitCheck(), B_NAME_TOO_LONG);
    entry_ref ref;
    ASSERT_EQ(get_ref_for_path(At("x").c_str(), &ref), B_OK);
    ref.set_name(name.c_str());
    EXPECT_EQ(BEntry(&ref).InitCheck(), B_NAME_TOO_LONG);
    MakeFile("y");
    BEntry entry(At("y").c_str());
    EXPECT_EQ(entry.Rename(name.c_str()), B_NAME_TOO_LONG);
    EXPECT_EQ(NameOf(entry), "y");
}

TEST_F(Entry, LinksAreFollowedOnlyWhenAsked) {
    std::string file = MakeFile("file");
    std::string link = MakeLink("link", "file");
    std::string second = MakeLink("second", link);
    EXPECT_TRUE(BEntry(link.c_str()).IsSymLink());
    EXPECT_EQ(PathOf(BEntry(link.c_str())), link);
    EXPECT_EQ(PathOf(BEntry(link.c_str(), true)), file);
    EXPECT_EQ(PathOf(BEntry(second.c_str(), true)), file);
    entry_ref ref;
    ASSERT_EQ(get_ref_for_path(second.c_str(), &ref), B_OK);
    EXPECT_TRUE(BEntry(&ref).IsSymLink());
    EXPECT_EQ(PathOf(BEntry(&ref, true)), file);
    BDirectory directory(Directory().c_str());
    EXPECT_EQ(PathOf(BEntry(&directory, "second", true)), file);
}

TEST_F(Entry, ADanglingLinkExistsAndLeadsToAnAbstractEntry) {
    std::string link = MakeLink("link", "nothing");
    EXPECT_TRUE(BEntry(link.c_str()).Exists());
    BEntry followed(link.c_str(), true);
    EXPECT_EQ(followed.InitCheck(), B_OK);
    EXPECT_FALSE(followed.Exists());
    EXPECT_EQ(PathOf(followed), At("nothing"));
}

TEST_F(Entry, ALoopOfLinksIsALinkLimit) {
    MakeLink("one", "two");
    MakeLink("two", "one");
    EXPECT_EQ(BEntry(At("one").c_str(), true).InitCheck(), B_LINK_LIMIT);
    EXPECT_EQ(BEntry(At("one").c_str()).InitCheck(), B_OK);
}

TEST_F(Entry, GivesItsParentAsEntryAndAsDirectory) {
    MakeDirectory("folder");
    MakeFile("folder/file");
    BEntry entry(At("folder/file").c_str());
    BEntry parent;
    ASSERT_EQ(entry.GetParent(&parent), B_OK);
    EXPECT_EQ(PathOf(parent), At("folder"));
    EXPECT_EQ(NameOf(parent), "folder");
    BDirectory directory;
    ASSERT_EQ(entry.GetParent(&directory), B_OK);
    BEntry self;
    ASSERT_EQ(directory.GetEntry(&self), B_OK);
    EXPECT_EQ(self, parent);

    BEntry same(entry);
    EXPECT_EQ(same.GetParent(&same), B_OK);
    EXPECT_EQ(same, parent);
}

TEST_F(Entry, TheRootHasNoParent) {
    BEntry root("/");
    ASSERT_EQ(root.InitCheck(), B_OK);
    EXPECT_EQ(PathOf(root), "/");
    BEntry parent;
    BDirectory directory;
    EXPECT_EQ(root.GetParent(&parent), B_ENTRY_NOT_FOUND);
    EXPECT_EQ(root.GetParent(&directory), B_ENTRY_NOT_FOUND);
}

TEST_F(Entry, RenamesInPlaceAndToOtherPaths) {
    MakeDirectory("folder");
    MakeFile("file", "content");
    BEntry entry(At("file").c_str());
    EXPECT_EQ(entry.Rename("other"), B_OK);
    EXPECT_EQ(PathOf(entry), At("other"));
    EXPECT_EQ(test::read_file(At("other")), "content");
    EXPECT_EQ(entry.Rename("folder/deep"), B_OK);
    EXPECT_EQ(PathOf(entry), At("folder/deep"));
    EXPECT_EQ(entry.Rename(At("back").c_str()), B_OK);
    EXPECT_EQ(test::read_file(At("back")), "content");
}

TEST_F(Entry, RenamingOntoAFileNeedsClobber) {
    MakeFile("one", "1");
    MakeFile("two", "2");
    BEntry entry(At("one").c_str());
    EXPECT_EQ(entry.Rename("two"), B_FILE_EXISTS);
    EXPECT_EQ(NameOf(entry), "one");
    EXPECT_EQ(test::read_file(At("two")), "2");
    EXPECT_EQ(entry.Rename("two", true), B_OK);
    EXPECT_EQ(test::read_file(At("two")), "1");
    EXPECT_FALSE(fs::exists(At("one")));
}

TEST_F(Entry, RenamingNothingIsNotFound) {
    BEntry entry(At("nothing").c_str());
    EXPECT_EQ(entry.Rename("other"), B_ENTRY_NOT_FOUND);
    EXPECT_EQ(entry.Remove(), B_ENTRY_NOT_FOUND);
}

TEST_F(Entry, MovesIntoADirectoryUnderItsOwnOrAnotherName) {
    MakeDirectory("folder");
    MakeFile("file", "x");
    BDirectory folder(At("folder").c_str());
    BEntry entry(At("file").c_str());
    EXPECT_EQ(entry.MoveTo(&folder), B_OK);
    EXPECT_EQ(PathOf(entry), At("folder/file"));
    BDirectory top(Directory().c_str());
    EXPECT_EQ(entry.MoveTo(&top, "renamed"), B_OK);
    EXPECT_EQ(PathOf(entry), At("renamed"));
    BDirectory unset;
    EXPECT_EQ(entry.MoveTo(&unset), B_BAD_VALUE);
}

TEST_F(Entry, RemovesFilesLinksAndEmptyDirectories) {
    std::string file = MakeFile("file");
    MakeDirectory("folder/inner");
    std::string link = MakeLink("link", "file");
    BEntry folder(At("folder").c_str());
    EXPECT_EQ(folder.Remove(), B_DIRECTORY_NOT_EMPTY);
    EXPECT_EQ(BEntry(At("folder/inner").c_str()).Remove(), B_OK);
    EXPECT_EQ(folder.Remove(), B_OK);
    EXPECT_FALSE(folder.Exists());
    EXPECT_EQ(folder.InitCheck(), B_OK);
    EXPECT_EQ(BEntry(link.c_str()).Remove(), B_OK);
    EXPECT_TRUE(fs::exists(file));
}

TEST_F(Entry, ComparesPlacesNotFiles) {
    MakeFile("one");
    fs::create_hard_link(At("one"), At("two"));
    EXPECT_EQ(BEntry(At("one").c_str()), BEntry((Directory() + "/./one").c_str()));
    EXPECT_NE(BEntry(At("one").c_str()), BEntry(At("two").c_str()));
    EXPECT_EQ(BEntry(), BEntry());
    EXPECT_NE(BEntry(), BEntry(At("one").c_str()));
}

TEST_F(Entry, RelativePathsStartAtTheDirectoryOrTheCurrentOne) {
    MakeDirectory("folder");
    MakeFile("folder/file");
    BDirectory directory(Directory().c_str());
    EXPECT_EQ(PathOf(BEntry(&directory, "folder/file")), At("folder/file"));
    EXPECT_EQ(PathOf(BEntry(&directory, "folder/../folder/./file")), At("folder/file"));
    EXPECT_EQ(PathOf(BEntry(&directory, nullptr)), Directory());

    fs::path before = fs::current_path();
    fs::current_path(At("folder"));
    EXPECT_EQ(PathOf(BEntry("file")), At("folder/file"));
    fs::current_path(before);
}

TEST_F(Entry, CopiesStandOnTheirOwn) {
    MakeFile("one");
    BEntry entry(At("one").c_str());
    BEntry copy(entry);
    BEntry assigned;
    assigned = entry;
    EXPECT_EQ(entry.Rename("two"), B_OK);
    EXPECT_EQ(NameOf(copy), "one");
    EXPECT_EQ(NameOf(assigned), "one");
    entry.Unset();
    EXPECT_EQ(entry.InitCheck(), B_NO_INIT);
    EXPECT_EQ(copy.InitCheck(), B_OK);
}
