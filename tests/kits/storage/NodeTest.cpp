#include <Directory.h>
#include <Entry.h>
#include <Node.h>
#include <String.h>
#include <TypeConstants.h>

#include "StorageTest.h"

#include <algorithm>
#include <string.h>
#include <sys/xattr.h>
#include <vector>

namespace fs = std::filesystem;

namespace {

class Node : public test::StorageTest {
  protected:
    static std::vector<std::string> NamesOf(BNode& node) {
        std::vector<std::string> names;
        char name[B_ATTR_NAME_LENGTH];
        while (node.GetNextAttrName(name) == B_OK)
            names.emplace_back(name);
        std::sort(names.begin(), names.end());
        return names;
    }
    static std::string ValueOf(const BNode& node, const char* name) {
        char buffer[256];
        ssize_t count = node.ReadAttr(name, B_STRING_TYPE, 0, buffer, sizeof(buffer));
        return count < 0 ? "error" : std::string(buffer, static_cast<size_t>(count));
    }
};

} // namespace

TEST_F(Node, AnUnsetNodeAnswersNoInit) {
    BNode node;
    char buffer[B_ATTR_NAME_LENGTH];
    attr_info info;
    BString text;
    EXPECT_EQ(node.InitCheck(), B_NO_INIT);
    EXPECT_EQ(node.Lock(), B_NO_INIT);
    EXPECT_EQ(node.Unlock(), B_NO_INIT);
    EXPECT_EQ(node.Sync(), B_NO_INIT);
    EXPECT_EQ(node.WriteAttr("a", B_RAW_TYPE, 0, "x", 1), B_NO_INIT);
    EXPECT_EQ(node.ReadAttr("a", B_RAW_TYPE, 0, buffer, 1), B_NO_INIT);
    EXPECT_EQ(node.RemoveAttr("a"), B_NO_INIT);
    EXPECT_EQ(node.RenameAttr("a", "b"), B_NO_INIT);
    EXPECT_EQ(node.GetAttrInfo("a", &info), B_NO_INIT);
    EXPECT_EQ(node.GetNextAttrName(buffer), B_NO_INIT);
    EXPECT_EQ(node.RewindAttrs(), B_NO_INIT);
    EXPECT_EQ(node.ReadAttrString("a", &text), B_NO_INIT);
    EXPECT_FALSE(node.IsFile());
}

TEST_F(Node, SaysWhyOpeningFailed) {
    MakeFile("file");
    EXPECT_EQ(BNode(At("nothing").c_str()).InitCheck(), B_ENTRY_NOT_FOUND);
    EXPECT_EQ(BNode(At("no/thing").c_str()).InitCheck(), B_ENTRY_NOT_FOUND);
    EXPECT_EQ(BNode(At("file/thing").c_str()).InitCheck(), B_NOT_A_DIRECTORY);
    EXPECT_EQ(BNode(static_cast<const entry_ref*>(nullptr)).InitCheck(), B_BAD_VALUE);
    EXPECT_EQ(BNode(static_cast<const BEntry*>(nullptr)).InitCheck(), B_BAD_VALUE);
    EXPECT_EQ(BNode(static_cast<const char*>(nullptr)).InitCheck(), B_BAD_VALUE);
    BEntry unset;
    EXPECT_EQ(BNode(&unset).InitCheck(), B_NO_INIT);
    BEntry abstract(At("nothing").c_str());
    EXPECT_EQ(BNode(&abstract).InitCheck(), B_ENTRY_NOT_FOUND);
}

TEST_F(Node, IsOpenedByRefEntryPathAndDirectory) {
    std::string path = MakeFile("file");
    BEntry entry(path.c_str());
    entry_ref ref;
    entry.GetRef(&ref);
    BDirectory directory(Directory().c_str());
    BNode byRef(&ref);
    BNode byEntry(&entry);
    BNode byPath(path.c_str());
    BNode byDirectory(&directory, "file");
    EXPECT_EQ(byRef.InitCheck(), B_OK);
    EXPECT_TRUE(byRef == byEntry);
    EXPECT_TRUE(byRef == byPath);
    EXPECT_TRUE(byRef == byDirectory);
    EXPECT_TRUE(byRef != directory);
    EXPECT_TRUE(byRef != BNode());
    EXPECT_TRUE(BNode() == BNode());
}

TEST_F(Node, AttributesAreWrittenAndReadWithTypeAndSize) {
    BNode node(MakeFile("file").c_str());
    EXPECT_EQ(node.WriteAttr("Audio:Artist", B_STRING_TYPE, 0, "Band", 5), 5);
    attr_info info;
    EXPECT_EQ(node.GetAttrInfo("Audio:Artist", &info), B_OK);
    EXPECT_EQ(info.type, 0x43535452u);
    EXPECT_EQ(info.size, 5);
    EXPECT_EQ(ValueOf(node, "Audio:Artist"), std::string("Band\0", 5));
    int32 channels = 2;
    EXPECT_EQ(node.WriteAttr("Audio:Channels", B_INT32_TYPE, 0, &channels, 4), 4);
    EXPECT_EQ(node.GetAttrInfo("Audio:Channels", &info), B_OK);
    EXPECT_EQ(info.type, 0x4C4F4E47u);
}

TEST_F(Node, AttributesLieInTheFilesExtendedAttributes) {
    std::string path = MakeFile("file");
    BNode node(path.c_str());
    ASSERT_EQ(node.WriteAttr("a", B_STRING_TYPE, 0, "x", 2), 2);
    char raw[16];
    ASSERT_EQ(getxattr(path.c_str(), "user.be.a", raw, sizeof(raw)), 6);
    EXPECT_EQ(std::string(raw, 6), std::string("CSTRx\0", 6));
    ASSERT_EQ(setxattr(path.c_str(), "user.be.b", "LONG\1\0\0\0", 8, 0), 0);
    int32 value = 0;
    EXPECT_EQ(node.ReadAttr("b", B_INT32_TYPE, 0, &value, 4), 4);
    EXPECT_EQ(value, 1);
}

TEST_F(Node, AMissingAttributeIsNotFound) {
    BNode node(MakeFile("file").c_str());
    char buffer[4];
    attr_info info;
    BString text;
    EXPECT_EQ(node.ReadAttr("a", B_STRING_TYPE, 0, buffer, 4), B_ENTRY_NOT_FOUND);
    EXPECT_EQ(node.RemoveAttr("a"), B_ENTRY_NOT_FOUND);
    EXPECT_EQ(node.RenameAttr("a", "b"), B_ENTRY_NOT_FOUND);
    EXPECT_EQ(node.GetAttrInfo("a", &info), B_ENTRY_NOT_FOUND);
    EXPECT_EQ(node.ReadAttrString("a", &text), B_ENTRY_NOT_FOUND);
}

TEST_F(Node, ReadingStopsAtTheBufferAndAtTheEnd) {
    BNode node(MakeFile("file").c_str());
    ASSERT_EQ(node.WriteAttr("a", B_RAW_TYPE, 0, "0123456789", 10), 10);
    char buffer[17] = "................";
    EXPECT_EQ(node.ReadAttr("a", B_STRING_TYPE, 0, buffer, 4), 4);
    EXPECT_EQ(std::string(buffer, 5), "0123.");
    EXPECT_EQ(node.ReadAttr("a", B_RAW_TYPE, 8, buffer, 16), 2);
    EXPECT_EQ(std::string(buffer, 2), "89");
    EXPECT_EQ(node.ReadAttr("a", B_RAW_TYPE, 10, buffer, 16), 0);
    EXPECT_EQ(node.ReadAttr("a", B_RAW_TYPE, 0, nullptr, 0), 0);
    EXPECT_EQ(node.ReadAttr("a", B_RAW_TYPE, -1, buffer, 4), B_BAD_VALUE);
}

TEST_F(Node, WritingReplacesFromItsOffsetOn) {
    BNode node(MakeFile("file").c_str());
    ASSERT_EQ(node.WriteAttr("a", B_RAW_TYPE, 0, "0123456789", 10), 10);
    EXPECT_EQ(node.WriteAttr("a", B_RAW_TYPE, 4, "xy", 2), 2);
    EXPECT_EQ(ValueOf(node, "a"), "0123xy");
    EXPECT_EQ(node.WriteAttr("a", B_RAW_TYPE, 8, "z", 1), 1);
    EXPECT_EQ(ValueOf(node, "a"), std::string("0123xy\0\0z", 9));
    EXPECT_EQ(node.WriteAttr("a", B_RAW_TYPE, 0, "s", 1), 1);
    EXPECT_EQ(ValueOf(node, "a"), "s");
    EXPECT_EQ(node.WriteAttr("a", B_RAW_TYPE, 0, nullptr, 0), 0);
    EXPECT_EQ(ValueOf(node, "a"), "");
}

TEST_F(Node, NullArgumentsAreBadValues) {
    BNode node(MakeFile("file").c_str());
    char buffer[4];
    attr_info info;
    EXPECT_EQ(node.WriteAttr(nullptr, B_RAW_TYPE, 0, "x", 1), B_BAD_VALUE);
    EXPECT_EQ(node.WriteAttr("a", B_RAW_TYPE, 0, nullptr, 1), B_BAD_VALUE);
    EXPECT_EQ(node.ReadAttr(nullptr, B_RAW_TYPE, 0, buffer, 1), B_BAD_VALUE);
    EXPECT_EQ(node.ReadAttr("a", B_RAW_TYPE, 0, nullptr, 1), B_BAD_VALUE);
    EXPECT_EQ(node.RemoveAttr(nullptr), B_BAD_VALUE);
    EXPECT_EQ(node.RenameAttr(nullptr, "a"), B_BAD_VALUE);
    EXPECT_EQ(node.GetAttrInfo(nullptr, &info), B_BAD_VALUE);
    EXPECT_EQ(node.GetAttrInfo("a", nullptr), B_BAD_VALUE);
    EXPECT_EQ(node.GetNextAttrName(nullptr), B_BAD_VALUE);
    EXPECT_EQ(node.WriteAttrString("a", nullptr), B_BAD_VALUE);
    EXPECT_EQ(node.ReadAttrString("a", nullptr), B_BAD_VALUE);
}

TEST_F(Node, WalksTheNamesAndStartsAgain) {
    BNode node(MakeFile("file").c_str());
    char name[B_ATTR_NAME_LENGTH];
    EXPECT_EQ(node.GetNextAttrName(name), B_ENTRY_NOT_FOUND);
    for (const char* attribute : {"one", "two", "three"})
        ASSERT_EQ(node.WriteAttr(attribute, B_RAW_TYPE, 0, "x", 1), 1);
    EXPECT_EQ(node.GetNextAttrName(name), B_ENTRY_NOT_FOUND);
    EXPECT_EQ(node.RewindAttrs(), B_OK);
    const std::vector<std::string> expected = {"one", "three", "two"};
    EXPECT_EQ(NamesOf(node), expected);
    BNode copy(node);
    EXPECT_EQ(NamesOf(copy), expected);
}

TEST_F(Node, RemovesAndRenamesAttributes) {
    BNode node(MakeFile("file").c_str());
    ASSERT_EQ(node.WriteAttr("a", B_STRING_TYPE, 0, "1", 1), 1);
    ASSERT_EQ(node.WriteAttr("b", B_RAW_TYPE, 0, "2", 1), 1);
    EXPECT_EQ(node.RenameAttr("a", "b"), B_OK);
    EXPECT_EQ(ValueOf(node, "b"), "1");
    EXPECT_EQ(ValueOf(node, "a"), "error");
    EXPECT_EQ(node.RemoveAttr("b"), B_OK);
    EXPECT_EQ(NamesOf(node), std::vector<std::string>());
}

TEST_F(Node, AValueTooLargeForTheFileIsKeptAllTheSame) {
    BNode node(MakeFile("file").c_str());
    std::vector<char> cover(100'000);
    for (size_t i = 0; i < cover.size(); i++)
        cover[i] = static_cast<char>(i * 7 + i / 251);
    ASSERT_EQ(node.WriteAttr("Media:64x64CoverImage", B_RAW_TYPE, 0, cover.data(), cover.size()), 100'000);
    std::vector<char> read(cover.size());
    EXPECT_EQ(node.ReadAttr("Media:64x64CoverImage", B_RAW_TYPE, 0, read.data(), read.size()), 100'000);
    EXPECT_EQ(read, cover);
}

TEST_F(Node, StringsAreStoredWithTheirTerminator) {
    BNode node(MakeFile("file").c_str());
    BString text("Song \xC3\xA9");
    EXPECT_EQ(node.WriteAttrString("title", &text), B_OK);
    attr_info info;
    EXPECT_EQ(node.GetAttrInfo("title", &info), B_OK);
    EXPECT_EQ(info.type, static_cast<uint32>(B_STRING_TYPE));
    EXPECT_EQ(info.size, 8);
    BString read;
    EXPECT_EQ(node.ReadAttrString("title", &read), B_OK);
    EXPECT_STREQ(read.String(), "Song \xC3\xA9");

    std::string unterminated(255, 'u');
    ASSERT_EQ(node.WriteAttr("raw", B_STRING_TYPE, 0, unterminated.data(), 255), 255);
    EXPECT_EQ(node.ReadAttrString("raw", &read), B_OK);
    EXPECT_EQ(read.String(), unterminated);
}

TEST_F(Node, StaysTheSameFileWhenItIsRenamedAndRemoved) {
    std::string path = MakeFile("file");
    BNode node(path.c_str());
    fs::rename(path, At("other"));
    EXPECT_EQ(node.WriteAttr("a", B_STRING_TYPE, 0, "x", 1), 1);
    BNode other(At("other").c_str());
    EXPECT_EQ(ValueOf(other, "a"), "x");
    fs::remove(At("other"));
    EXPECT_EQ(ValueOf(node, "a"), "x");
}

TEST_F(Node, LinksAreNotFollowed) {
    BNode file(MakeFile("file").c_str());
    BNode link(MakeLink("link", "file").c_str());
    ASSERT_EQ(link.InitCheck(), B_OK);
    EXPECT_TRUE(link.IsSymLink());
    EXPECT_LT(link.WriteAttr("a", B_STRING_TYPE, 0, "x", 1), 0);
    EXPECT_EQ(ValueOf(file, "a"), "error");
    char name[B_ATTR_NAME_LENGTH];
    EXPECT_NE(link.GetNextAttrName(name), B_OK);
}

TEST_F(Node, DirectoriesHaveAttributesToo) {
    BNode node(MakeDirectory("folder").c_str());
    EXPECT_EQ(node.WriteAttr("a", B_STRING_TYPE, 0, "x", 1), 1);
    EXPECT_EQ(ValueOf(node, "a"), "x");
}

TEST_F(Node, ALockKeepsOutOtherLocks) {
    std::string path = MakeFile("file");
    BNode one(path.c_str());
    BNode two(path.c_str());
    EXPECT_EQ(one.Lock(), B_OK);
    EXPECT_EQ(two.Lock(), B_BUSY);
    EXPECT_EQ(one.Unlock(), B_OK);
    EXPECT_EQ(two.Lock(), B_OK);
    EXPECT_EQ(two.Unlock(), B_OK);
}

TEST_F(Node, SyncsAndCopies) {
    BNode node(MakeFile("file").c_str());
    EXPECT_EQ(node.Sync(), B_OK);
    BNode copy(node);
    BNode assigned;
    assigned = node;
    node.Unset();
    EXPECT_EQ(node.InitCheck(), B_NO_INIT);
    EXPECT_EQ(copy.WriteAttr("a", B_STRING_TYPE, 0, "x", 1), 1);
    EXPECT_EQ(ValueOf(assigned, "a"), "x");
}
