#include <Bitmap.h>
#include <Entry.h>
#include <MimeType.h>
#include <Node.h>
#include <NodeInfo.h>
#include <TypeConstants.h>

#include "StorageTest.h"

#include "host/api/directories.h"

#include <string.h>
#include <thread>

namespace {

class NodeInfo : public test::StorageTest {
  protected:
    void SetUp() override {
        StorageTest::SetUp();
        std::filesystem::remove_all(host::config_directory() + "/mime");
        // Tells this process that the database has changed.
        BMimeType("application/x-vnd.nothing").Delete();
    }

    static BRect Frame(icon_size size) {
        return size == B_MINI_ICON ? BRect(0, 0, 15, 15) : BRect(0, 0, 31, 31);
    }
    static std::string Bits(const BBitmap& bitmap) {
        return {static_cast<const char*>(bitmap.Bits()), static_cast<size_t>(bitmap.BitsLength())};
    }
    static std::string TrackerIcon(const std::string& path, icon_size size = B_MINI_ICON) {
        BNode node(path.c_str());
        BNodeInfo info(&node);
        BBitmap icon(Frame(size), B_CMAP8);
        return info.GetTrackerIcon(&icon, size) == B_OK ? Bits(icon) : "none";
    }
};

} // namespace

TEST_F(NodeInfo, WithoutANodeNothingIsThere) {
    BNodeInfo info;
    BBitmap icon(Frame(B_MINI_ICON), B_CMAP8);
    char text[B_MIME_TYPE_LENGTH];
    entry_ref ref;
    EXPECT_EQ(info.InitCheck(), B_NO_INIT);
    EXPECT_EQ(info.GetType(text), B_NO_INIT);
    EXPECT_EQ(info.SetType("a/b"), B_NO_INIT);
    EXPECT_EQ(info.GetIcon(&icon, B_MINI_ICON), B_NO_INIT);
    EXPECT_EQ(info.SetIcon(&icon, B_MINI_ICON), B_NO_INIT);
    EXPECT_EQ(info.GetTrackerIcon(&icon, B_MINI_ICON), B_NO_INIT);
    EXPECT_EQ(info.GetPreferredApp(text), B_NO_INIT);
    EXPECT_EQ(info.GetAppHint(&ref), B_NO_INIT);
    EXPECT_EQ(BNodeInfo(nullptr).InitCheck(), B_BAD_VALUE);
    BNode nothing(At("nothing").c_str());
    EXPECT_EQ(BNodeInfo(&nothing).InitCheck(), B_ENTRY_NOT_FOUND);
}

TEST_F(NodeInfo, TypeAndApplicationAreAttributes) {
    BNode node(MakeFile("file").c_str());
    BNodeInfo info(&node);
    char text[B_MIME_TYPE_LENGTH];
    EXPECT_EQ(info.GetType(text), B_ENTRY_NOT_FOUND);
    EXPECT_EQ(info.SetType("audio/x-mpeg"), B_OK);
    EXPECT_EQ(info.GetType(text), B_OK);
    EXPECT_STREQ(text, "audio/x-mpeg");
    attr_info attribute;
    EXPECT_EQ(node.GetAttrInfo("Node:Type", &attribute), B_OK);
    EXPECT_EQ(attribute.type, static_cast<uint32>(B_MIME_STRING_TYPE));
    EXPECT_EQ(info.SetType("not a type"), B_BAD_VALUE);
    EXPECT_EQ(info.SetType(nullptr), B_OK);
    EXPECT_EQ(info.SetType(nullptr), B_OK);
    EXPECT_EQ(info.GetType(text), B_ENTRY_NOT_FOUND);

    EXPECT_EQ(info.SetPreferredApp("application/x-vnd.test"), B_OK);
    EXPECT_EQ(info.GetPreferredApp(text), B_OK);
    EXPECT_STREQ(text, "application/x-vnd.test");
    entry_ref ref;
    ref = RefOf(MakeFile("program"));
    EXPECT_EQ(info.SetAppHint(&ref), B_OK);
    entry_ref found;
    EXPECT_EQ(info.GetAppHint(&found), B_OK);
    EXPECT_EQ(found, ref);
}

TEST_F(NodeInfo, ATypeAttributeThatIsNoTypeIsNotThere) {
    BNode node(MakeFile("file").c_str());
    BNodeInfo info(&node);
    char text[B_MIME_TYPE_LENGTH];
    const std::string longText(2000, 'x');
    ASSERT_GT(node.WriteAttr("Node:Type", B_MIME_STRING_TYPE, 0, "no type", 8), 0);
    EXPECT_EQ(info.GetType(text), B_ENTRY_NOT_FOUND);
    ASSERT_GT(node.WriteAttr("Node:Type", B_MIME_STRING_TYPE, 0, "", 0) + 1, 0);
    EXPECT_EQ(info.GetType(text), B_ENTRY_NOT_FOUND);
    ASSERT_GT(node.WriteAttr("Node:Type", B_MIME_STRING_TYPE, 0, longText.data(), longText.size()), 0);
    (void)info.GetType(text);
    EXPECT_LT(strlen(text), B_MIME_TYPE_LENGTH);
}

TEST_F(NodeInfo, IconsAreAttributesOfTheirSize) {
    BNode node(MakeFile("file").c_str());
    BNodeInfo info(&node);
    BBitmap mini(Frame(B_MINI_ICON), B_CMAP8);
    BBitmap large(Frame(B_LARGE_ICON), B_CMAP8);
    EXPECT_EQ(info.GetIcon(&mini, B_MINI_ICON), B_ENTRY_NOT_FOUND);
    memset(mini.Bits(), 5, 256);
    memset(large.Bits(), 6, 1024);
    EXPECT_EQ(info.SetIcon(&mini, B_MINI_ICON), B_OK);
    EXPECT_EQ(info.SetIcon(&large, B_LARGE_ICON), B_OK);
    attr_info attribute;
    EXPECT_EQ(node.GetAttrInfo("Node:MiniIcon", &attribute), B_OK);
    EXPECT_EQ(attribute.type, static_cast<uint32>(B_MINI_ICON_TYPE));
    EXPECT_EQ(attribute.size, 256);
    EXPECT_EQ(node.GetAttrInfo("Node:LargeIcon", &attribute), B_OK);
    EXPECT_EQ(attribute.size, 1024);
    BBitmap found(Frame(B_MINI_ICON), B_CMAP8);
    EXPECT_EQ(info.GetIcon(&found, B_MINI_ICON), B_OK);
    EXPECT_EQ(Bits(found), std::string(256, '\5'));
    EXPECT_EQ(info.GetIcon(&found, B_LARGE_ICON), B_BAD_VALUE);
    EXPECT_EQ(info.SetIcon(nullptr, B_MINI_ICON), B_OK);
    EXPECT_EQ(info.GetIcon(&found, B_MINI_ICON), B_ENTRY_NOT_FOUND);
    EXPECT_EQ(info.SetIcon(&mini, static_cast<icon_size>(17)), B_BAD_VALUE);
}

TEST_F(NodeInfo, APictureOfAnotherSizeAndSpaceIsTurnedIntoTheIcon) {
    BNode node(MakeFile("file").c_str());
    BNodeInfo info(&node);
    BBitmap picture(BRect(0, 0, 16, 16), B_RGB16);
    memset(picture.Bits(), 0xFF, static_cast<size_t>(picture.BitsLength()));
    EXPECT_EQ(info.SetIcon(&picture, B_MINI_ICON), B_OK);
    BBitmap icon(Frame(B_MINI_ICON), B_RGB32);
    EXPECT_EQ(info.GetIcon(&icon, B_MINI_ICON), B_OK);
    const auto* pixels = static_cast<const uint32*>(icon.Bits());
    for (int i = 0; i < 256; i++)
        ASSERT_EQ(pixels[i] & 0xFFFFFF, 0xFFFFFFu) << i;
    BBitmap invalid(BRect(0, 0, -5, -5), B_CMAP8);
    EXPECT_EQ(info.SetIcon(&invalid, B_MINI_ICON), B_BAD_VALUE);
}

TEST_F(NodeInfo, TheFilesOwnIconComesFirst) {
    std::string path = MakeFile("song.mp3");
    BNode node(path.c_str());
    std::string own(256, '\x21');
    ASSERT_EQ(node.WriteAttr("Node:MiniIcon", B_MINI_ICON_TYPE, 0, own.data(), own.size()), 256);
    EXPECT_EQ(TrackerIcon(path), own);
    for (size_t wrong : {size_t(0), size_t(255), size_t(257)}) {
        std::string bits(wrong, '\x21');
        node.RemoveAttr("Node:MiniIcon");
        ASSERT_GE(node.WriteAttr("Node:MiniIcon", B_MINI_ICON_TYPE, 0, bits.data(), bits.size()), 0);
        std::string icon = TrackerIcon(path);
        EXPECT_EQ(icon.size(), 256u);
        EXPECT_NE(icon, own);
    }
}

TEST_F(NodeInfo, ThenComesTheIconOfTheTypeThenOfTheSupertype) {
    std::string song = MakeFile("song.mp3");
    std::string plain = TrackerIcon(song);
    BBitmap icon(Frame(B_MINI_ICON), B_CMAP8);
    memset(icon.Bits(), 3, 256);
    ASSERT_EQ(BMimeType("audio").SetIcon(&icon, B_MINI_ICON), B_OK);
    EXPECT_EQ(TrackerIcon(song), std::string(256, '\3'));
    memset(icon.Bits(), 4, 256);
    ASSERT_EQ(BMimeType("audio/x-mpeg").SetIcon(&icon, B_MINI_ICON), B_OK);
    EXPECT_EQ(TrackerIcon(song), std::string(256, '\4'));
    // The type that the file carries counts more than its name.
    std::string typed = MakeFile("picture.png");
    BNode node(typed.c_str());
    BNodeInfo info(&node);
    ASSERT_EQ(info.SetType("audio/x-mpeg"), B_OK);
    EXPECT_EQ(TrackerIcon(typed), std::string(256, '\4'));
    ASSERT_EQ(BMimeType("audio/x-mpeg").Delete(), B_OK);
    ASSERT_EQ(BMimeType("audio").Delete(), B_OK);
    EXPECT_EQ(TrackerIcon(song), plain);
}

TEST_F(NodeInfo, EveryKindOfNodeHasAnIconInBothSizes) {
    for (icon_size size : {B_MINI_ICON, B_LARGE_ICON}) {
        const size_t bytes = static_cast<size_t>(size) * static_cast<size_t>(size);
        for (const std::string& path :
             {MakeFile("song.mp3"), MakeFile("without extension", "text"), MakeFile("x.unheard-of"),
              MakeDirectory("folder"), Volume(), MakeFile("\xFF\n.\x80")})
            EXPECT_EQ(TrackerIcon(path, size).size(), bytes) << path;
    }
    EXPECT_EQ(TrackerIcon(MakeLink("link", "nowhere")).size(), 256u);
    EXPECT_NE(TrackerIcon(At("song.mp3")), TrackerIcon(At("folder")));
}

TEST_F(NodeInfo, OtherColourSpacesAreFilledToo) {
    std::string song = MakeFile("song.mp3");
    entry_ref ref;
    ref = RefOf(song);
    for (color_space space : {B_RGB32, B_RGBA32, B_RGB16, B_GRAY8}) {
        BBitmap icon(Frame(B_MINI_ICON), space);
        EXPECT_EQ(BNodeInfo::GetTrackerIcon(&ref, &icon, B_MINI_ICON), B_OK);
        EXPECT_NE(Bits(icon), std::string(static_cast<size_t>(icon.BitsLength()), '\0'));
    }
}

TEST_F(NodeInfo, BitmapsThatDoNotFitAreRefused) {
    entry_ref ref;
    ref = RefOf(MakeFile("song.mp3"));
    BBitmap wide(BRect(0, 0, 16, 15), B_CMAP8);
    EXPECT_EQ(BNodeInfo::GetTrackerIcon(&ref, &wide, B_MINI_ICON), B_BAD_VALUE);
    EXPECT_EQ(BNodeInfo::GetTrackerIcon(&ref, nullptr, B_MINI_ICON), B_BAD_VALUE);
    entry_ref nothing;
    nothing = RefOf(At("nothing"));
    BBitmap icon(Frame(B_MINI_ICON), B_CMAP8);
    EXPECT_EQ(BNodeInfo::GetTrackerIcon(&nothing, &icon, B_MINI_ICON), B_ENTRY_NOT_FOUND);
}

TEST_F(NodeInfo, ThreadsAskAtTheSameTimeWhileTheDatabaseChanges) {
    std::string song = MakeFile("song.mp3");
    std::vector<std::thread> threads;
    for (int i = 0; i < 3; i++) {
        threads.emplace_back([&song] {
            for (int n = 0; n < 100; n++)
                EXPECT_EQ(TrackerIcon(song).size(), 256u);
        });
    }
    BBitmap icon(Frame(B_MINI_ICON), B_CMAP8);
    for (int n = 0; n < 5; n++)
        EXPECT_EQ(BMimeType("audio/x-mpeg").SetIcon(&icon, B_MINI_ICON), B_OK);
    for (std::thread& thread : threads)
        thread.join();
    EXPECT_EQ(TrackerIcon(song), std::string(256, '\0'));
}
