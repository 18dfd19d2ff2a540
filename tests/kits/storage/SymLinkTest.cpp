#include <Directory.h>
#include <Entry.h>
#include <Path.h>
#include <SymLink.h>

#include "StorageTest.h"

namespace {

class SymLink : public test::StorageTest {};

} // namespace

TEST_F(SymLink, ReadsItsTextCutToTheBuffer) {
    BSymLink link(MakeLink("link", "some/target").c_str());
    char buffer[32];
    EXPECT_EQ(link.ReadLink(buffer, sizeof(buffer)), 11);
    EXPECT_STREQ(buffer, "some/target");
    EXPECT_EQ(link.ReadLink(buffer, 5), 11);
    EXPECT_STREQ(buffer, "some");
    EXPECT_EQ(link.ReadLink(nullptr, 5), B_BAD_VALUE);
    EXPECT_FALSE(link.IsAbsolute());
}

TEST_F(SymLink, MakesThePathThatItNames) {
    MakeDirectory("folder");
    BSymLink relative(MakeLink("folder/link", "../target").c_str());
    BPath path;
    EXPECT_EQ(relative.MakeLinkedPath(At("folder").c_str(), &path),
              static_cast<ssize_t>(At("target").size()));
    EXPECT_EQ(path.Path(), At("target"));
    BDirectory directory(At("folder").c_str());
    EXPECT_GT(relative.MakeLinkedPath(&directory, &path), 0);
    EXPECT_EQ(path.Path(), At("target"));

    BSymLink absolute(MakeLink("absolute", "/etc/thing").c_str());
    EXPECT_TRUE(absolute.IsAbsolute());
    EXPECT_EQ(absolute.MakeLinkedPath(At("folder").c_str(), &path), 10);
    EXPECT_STREQ(path.Path(), "/etc/thing");
    EXPECT_EQ(absolute.MakeLinkedPath(static_cast<const char*>(nullptr), &path), B_BAD_VALUE);
    EXPECT_EQ(absolute.MakeLinkedPath(static_cast<const BDirectory*>(nullptr), &path), B_BAD_VALUE);
}

TEST_F(SymLink, OtherNodesHaveNoText) {
    char buffer[32];
    BSymLink file(MakeFile("file").c_str());
    EXPECT_EQ(file.InitCheck(), B_OK);
    EXPECT_EQ(file.ReadLink(buffer, sizeof(buffer)), B_BAD_VALUE);
    BSymLink unset;
    EXPECT_EQ(unset.ReadLink(buffer, sizeof(buffer)), B_NO_INIT);
    EXPECT_FALSE(unset.IsAbsolute());
}
