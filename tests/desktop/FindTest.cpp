// Finding songs: index, search, sort, open, by mouse and by keys.
#include "desktop/SongsOnDesktop.h"

namespace {

class Find : public SongsOnDesktop {};

TEST_F(Find, ByTextSortedByArtistThenSongnameAndOpenedByADoubleClick) {
    const Window find = StartWithSongs();
    KeepPicture("find-1-indexed");
    Search(find, "a");
    KeepPicture("find-2-found");
    ClickAt(find, kArtist, 48 + 9);
    KeepPicture("find-3-by-artist");
    Desktop().tool({"keydown", "shift"});
    ClickAt(find, kSongname, 48 + 9);
    Desktop().tool({"keyup", "shift"});
    KeepPicture("find-4-by-artist-and-song");

    // Birch - Summer has no "a".
    const char* const order[] = {"Lanterns - Bridge", "Lanterns - Ferry", "Lanterns - Night", "Oak - Autumn",
                                 "Oak - Winter"};
    for (int row = 0; row < 5; ++row) {
        EXPECT_EQ(PlayedBy([&] { DoubleClickAt(find, kSongname, FindRow(row)); }),
                  Paths{Volume() + "/Albums/" + order[row] + ".mp3"})
            << row;
    }
    EXPECT_TRUE(NothingIsPlayedBy([&] { DoubleClickAt(find, kSongname, FindRow(6)); })) << "empty space";
    KeepPicture("find-5-opened");
    End();
}

TEST_F(Find, ByTheKeyboardAlone) {
    const Window find = StartWithSongs();
    Search(find, "Lanterns");
    Press("Tab");
    Press("Home");
    KeepPicture("find-keys-1-first");
    const Paths first = PlayedBy([] { Press("space"); });
    ASSERT_EQ(first.size(), 1u);
    Press("Down");
    Press("Down");
    KeepPicture("find-keys-2-third");
    const Paths third = PlayedBy([] { Press("space"); });
    ASSERT_EQ(third.size(), 1u);
    EXPECT_NE(third, first);
    EXPECT_TRUE(NothingIsPlayedBy([] { Press("Return"); })) << "Return does nothing in a list of songs";

    Press("Delete");
    Press("Home");
    Press("Delete");
    KeepPicture("find-keys-3-one-left");
    const Paths left = PlayedBy([] { Press("space"); });
    ASSERT_EQ(left.size(), 1u);
    EXPECT_NE(left, first);
    EXPECT_NE(left, third);
    Press("Delete");
    EXPECT_TRUE(NothingIsPlayedBy([] { Press("space"); })) << "nothing is left";
    End();
}

TEST_F(Find, AnEmptyTextListsAllAndASecondSearchTakesItsPlace) {
    const Window find = StartWithSongs();
    Search(find, "Winter");
    EXPECT_EQ(PlayedBy([&] { DoubleClickAt(find, kSongname, FindRow(0)); }), Paths{mPaths[0]});
    ClickAt(find, 100, 33);
    Press("ctrl+a");
    Press("BackSpace");
    Press("Return");
    usleep(700000);
    KeepPicture("find-all");
    EXPECT_EQ(PlayedBy([&] { DoubleClickAt(find, kSongname, FindRow(5)); }).size(), 1u) << "six rows";
    EXPECT_TRUE(NothingIsPlayedBy([&] { DoubleClickAt(find, kSongname, FindRow(6)); }));
    End();
}

TEST_F(Find, TheRightButtonShowsWhereASongLies) {
    const Window find = StartWithSongs();
    Search(find, "Winter");
    Desktop().move_pointer(find.left + kSongname, find.top + FindRow(0));
    Desktop().press(3);
    usleep(700000);
    KeepPicture("find-menu-1-open");
    Desktop().release(3);
    usleep(500000);
    // The menu's first item, the file, lies under the pointer; the folder's name comes next.
    ForgetOpened();
    Press("Down");
    usleep(300000);
    KeepPicture("find-menu-2-folder");
    Press("Return");
    EXPECT_TRUE(Comes([] { return !Shown().empty(); }));
    EXPECT_EQ(Shown(), Paths{Volume() + "/Albums"});
    EXPECT_EQ(Played(), Paths{});
    End();
}

TEST_F(Find, ASavedFrameIsRestoredAndAMissingPlaceIsTheLeftEdge) {
    const struct {
        bool withPlace;
        int left;
    } cases[] = {{true, 211}, {false, 0}};
    for (const auto& saved : cases) {
        BMessage frame;
        if (saved.withPlace)
            frame.AddFloat("winX", 211);
        frame.AddFloat("winY", 133);
        frame.AddFloat("winWidth", 517);
        frame.AddFloat("winHeight", 289);
        BMessage settings;
        settings.AddMessage("findwindow", &frame);
        std::filesystem::create_directories(Home() + "/.config/bekits/settings");
        {
            BFile file(SettingsPath().c_str(), B_WRITE_ONLY | B_CREATE_FILE | B_ERASE_FILE);
            ASSERT_EQ(settings.Flatten(&file), B_OK);
        }
        mProgram = std::make_unique<test::Program>(QUIRNEL_PROGRAM, std::vector<std::string>());
        mWindow = Desktop().window("Find song", 30);
        ASSERT_NE(mWindow, "");
        usleep(500000);
        EXPECT_EQ(CountWindows(), 0) << "the indexer was not open";
        EXPECT_EQ(WindowArea().width, 518);
        EXPECT_EQ(WindowArea().height, 290);
        EXPECT_EQ(WindowArea().left, saved.left);
        EXPECT_EQ(WindowArea().top, 133);
        End();
        BMessage kept;
        ASSERT_EQ(Saved().FindMessage("findwindow", &kept), B_OK);
        EXPECT_EQ(kept.GetFloat("winWidth", -1), 517);
    }
}

} // namespace
