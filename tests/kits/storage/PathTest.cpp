#include <Directory.h>
#include <Entry.h>
#include <Path.h>
#include <TypeConstants.h>

#include "StorageTest.h"

#include <vector>

namespace fs = std::filesystem;

namespace {

class Path : public test::StorageTest {};

} // namespace

TEST_F(Path, AnUnsetPathHasNothing) {
    BPath path;
    EXPECT_EQ(path.InitCheck(), B_NO_INIT);
    EXPECT_EQ(path.Path(), nullptr);
    EXPECT_EQ(path.Leaf(), nullptr);
    EXPECT_EQ(path.Append("x"), B_NO_INIT);
    BPath parent;
    EXPECT_EQ(path.GetParent(&parent), B_NO_INIT);
    EXPECT_FALSE(path.IsAbsolute());
    EXPECT_EQ(path.FlattenedSize(), B_NO_INIT);
}

TEST_F(Path, KeepsAPlainPathWithoutLookingAtTheFiles) {
    BPath path("/no/such/thing");
    EXPECT_EQ(path.InitCheck(), B_OK);
    EXPECT_STREQ(path.Path(), "/no/such/thing");
    EXPECT_STREQ(path.Leaf(), "thing");
    EXPECT_TRUE(path.IsAbsolute());
    EXPECT_STREQ(BPath("/no/such", "thing").Path(), "/no/such/thing");
    EXPECT_STREQ(BPath("/").Path(), "/");
    EXPECT_STREQ(BPath("/").Leaf(), "");
    EXPECT_STREQ(BPath("/", "etc").Path(), "/etc");
}

TEST_F(Path, NormalizesDotsSlashesAndRelativePaths) {
    MakeDirectory("a/b");
    for (const char* part : {"/a/./b", "/a/b/", "/a//b", "/a/b/../b", "/a/../a/b", "/a/b/."})
        EXPECT_STREQ(BPath((Directory() + part).c_str()).Path(), At("a/b").c_str()) << part;
    fs::path before = fs::current_path();
    fs::current_path(At("a"));
    EXPECT_STREQ(BPath("b").Path(), At("a/b").c_str());
    EXPECT_STREQ(BPath("nothing").Path(), At("a/nothing").c_str());
    EXPECT_STREQ(BPath("..").Path(), Directory().c_str());
    fs::current_path(before);
}

TEST_F(Path, NormalizingNeedsTheDirectories) {
    EXPECT_EQ(BPath(At("no/such/../thing").c_str()).InitCheck(), B_ENTRY_NOT_FOUND);
    EXPECT_EQ(BPath(At("no/such").c_str(), nullptr, true).InitCheck(), B_ENTRY_NOT_FOUND);
}

TEST_F(Path, NormalizingResolvesLinksAboveTheLeafOnly) {
    MakeDirectory("real");
    MakeLink("link", "real");
    MakeLink("real/leaf", "nothing");
    EXPECT_STREQ(BPath(At("link/leaf").c_str()).Path(), At("link/leaf").c_str());
    EXPECT_STREQ(BPath(At("link/leaf").c_str(), nullptr, true).Path(), At("real/leaf").c_str());
}

TEST_F(Path, BadArgumentsUnsetThePath) {
    BPath path("/a");
    EXPECT_EQ(path.SetTo(static_cast<const char*>(nullptr)), B_BAD_VALUE);
    EXPECT_EQ(path.InitCheck(), B_BAD_VALUE);
    EXPECT_EQ(path.Path(), nullptr);
    EXPECT_EQ(path.SetTo(""), B_BAD_VALUE);
    EXPECT_EQ(path.SetTo("/a", "/b"), B_BAD_VALUE);
    EXPECT_EQ(path.SetTo(static_cast<const BEntry*>(nullptr)), B_BAD_VALUE);
    EXPECT_EQ(path.SetTo(static_cast<const entry_ref*>(nullptr)), B_BAD_VALUE);
    EXPECT_EQ(path.SetTo(static_cast<const BDirectory*>(nullptr)), B_BAD_VALUE);
    BEntry unset;
    EXPECT_EQ(path.SetTo(&unset), B_NO_INIT);
    path = "/a";
    EXPECT_EQ(path.Append("/b"), B_BAD_VALUE);
    path = "/a";
    EXPECT_EQ(path.Append(nullptr), B_BAD_VALUE);
}

TEST_F(Path, AppendsParts) {
    BPath path("/a");
    EXPECT_EQ(path.Append("b/c"), B_OK);
    EXPECT_STREQ(path.Path(), "/a/b/c");
    BPath settings(Directory().c_str());
    EXPECT_EQ(settings.Append("Quirnel settings"), B_OK);
    EXPECT_EQ(settings.Path(), Directory() + "/Quirnel settings");
}

TEST_F(Path, GivesItsParentUpToTheRoot) {
    BPath path("/a/b");
    BPath parent;
    EXPECT_EQ(path.GetParent(&parent), B_OK);
    EXPECT_STREQ(parent.Path(), "/a");
    EXPECT_EQ(parent.GetParent(&parent), B_OK);
    EXPECT_STREQ(parent.Path(), "/");
    EXPECT_EQ(parent.GetParent(&parent), B_ENTRY_NOT_FOUND);
    EXPECT_EQ(path.GetParent(nullptr), B_BAD_VALUE);
}

TEST_F(Path, ComesFromRefsEntriesAndDirectories) {
    MakeFile("file");
    BEntry entry(At("file").c_str());
    entry_ref ref;
    entry.GetRef(&ref);
    EXPECT_EQ(BPath(&entry).Path(), At("file"));
    EXPECT_EQ(BPath(&ref).Path(), At("file"));
    BDirectory directory(Directory().c_str());
    EXPECT_EQ(BPath(&directory).Path(), Directory());
    EXPECT_EQ(BPath(&directory, "file").Path(), At("file"));
}

TEST_F(Path, ComparesTexts) {
    EXPECT_TRUE(BPath("/a") == BPath("/a"));
    EXPECT_TRUE(BPath("/a") != BPath("/b"));
    EXPECT_TRUE(BPath("/a") == "/a");
    EXPECT_TRUE(BPath("/a") != "/b");
    EXPECT_TRUE(BPath() == static_cast<const char*>(nullptr));
    EXPECT_TRUE(BPath() == BPath());
    EXPECT_TRUE(BPath() != BPath("/a"));
}

TEST_F(Path, FlattenedItFollowsItsDirectory) {
    MakeDirectory("folder");
    MakeFile("folder/file");
    BPath path(At("folder/file").c_str());
    EXPECT_EQ(path.TypeCode(), B_REF_TYPE);
    EXPECT_FALSE(path.IsFixedSize());
    EXPECT_TRUE(path.AllowsTypeCode(B_REF_TYPE));
    EXPECT_FALSE(path.AllowsTypeCode(B_STRING_TYPE));
    ASSERT_EQ(path.FlattenedSize(), 16 + 5);
    std::vector<char> bytes(21);
    EXPECT_EQ(path.Flatten(bytes.data(), 20), B_BAD_VALUE);
    ASSERT_EQ(path.Flatten(bytes.data(), 21), B_OK);

    fs::rename(At("folder"), At("moved"));
    BPath again;
    EXPECT_EQ(again.Unflatten(B_REF_TYPE, bytes.data(), 21), B_OK);
    EXPECT_EQ(again.Path(), At("moved/file"));
}

TEST_F(Path, UnflattensNothingButAPath) {
    MakeFile("file");
    BPath path(At("file").c_str());
    std::vector<char> bytes(static_cast<size_t>(path.FlattenedSize()));
    ASSERT_EQ(path.Flatten(bytes.data(), static_cast<ssize_t>(bytes.size())), B_OK);
    BPath again;
    EXPECT_EQ(again.Unflatten(B_STRING_TYPE, bytes.data(), 21), B_BAD_TYPE);
    EXPECT_EQ(again.Unflatten(B_REF_TYPE, nullptr, 21), B_BAD_VALUE);
    for (ssize_t size = -1; size < 21; size++)
        EXPECT_NE(again.Unflatten(B_REF_TYPE, bytes.data(), size), B_OK) << size;
    EXPECT_EQ(again.Path(), nullptr);
}
