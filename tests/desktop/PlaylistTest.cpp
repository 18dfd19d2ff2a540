// Collecting songs: from the find window, from other programs and to them.
#include "desktop/SongsOnDesktop.h"

#include "DragSession.h"

namespace {

class Playlist : public SongsOnDesktop {
  protected:
    Window OpenPlaylist() {
        EXPECT_EQ(Send("103").status, 0);
        const Window window = Arrange("Playlist", 40, 480, 600, 300);
        usleep(300000);
        return window;
    }
    // The song of that row is what a double click opens.
    Paths SongAt(const Window& playlist, int row) {
        return PlayedBy([&] { DoubleClickAt(playlist, kSongname, PlaylistRow(row)); });
    }
    bool NoSongIsAt(const Window& playlist, int row) {
        return NothingIsPlayedBy([&] { DoubleClickAt(playlist, kSongname, PlaylistRow(row)); });
    }
};

TEST_F(Playlist, TakesInSongsThatAreDraggedFromTheFindWindow) {
    const Window find = StartWithSongs();
    Search(find, "Lanterns");
    ClickAt(find, kSongname, 48 + 9);
    const Window playlist = OpenPlaylist();
    KeepPicture("playlist-1-empty");
    Activate(find);
    ClickAt(find, kSongname, FindRow(0));
    Desktop().tool({"keydown", "shift"});
    ClickAt(find, kSongname, FindRow(2));
    Desktop().tool({"keyup", "shift"});
    KeepPicture("playlist-2-three-selected");

    const int fromX = find.left + kSongname;
    const int fromY = find.top + FindRow(1);
    Desktop().move_pointer(fromX, fromY);
    Desktop().press();
    for (int i = 1; i <= 20; ++i) {
        Desktop().move_pointer(fromX + 5 * i, fromY + (playlist.top + 150 - fromY) * i / 20);
        usleep(20000);
    }
    usleep(500000);
    KeepPicture("playlist-3-ants");
    Desktop().release();
    usleep(700000);
    KeepPicture("playlist-4-dropped");

    const char* const order[] = {"Bridge", "Ferry", "Night"};
    for (int row = 0; row < 3; ++row) {
        EXPECT_EQ(SongAt(playlist, row), Paths{Volume() + "/Albums/Lanterns - " + order[row] + ".mp3"});
    }
    EXPECT_TRUE(NoSongIsAt(playlist, 3));
    End();
}

TEST_F(Playlist, TakesInAndGivesFilesToProgramsThatAreNotOurs) {
    StartWithSongs();
    const Window playlist = OpenPlaylist();
    {
        test::Program peer(DRAG_PEER, {"offer", "800", "100", UriOfPath(mPaths[2]), UriOfPath(mPaths[4])});
        ASSERT_NE(Desktop().window("Offering peer"), "");
        usleep(500000);
        Desktop().drag(880, 180, playlist.left + 200, playlist.top + 150);
        usleep(700000);
        KeepPicture("playlist-5-from-another-program");
        peer.signal(SIGTERM);
        EXPECT_EQ(peer.wait().output, "ready\nbegan\nended copy\n");
    }
    EXPECT_EQ(SongAt(playlist, 0), Paths{mPaths[2]});
    EXPECT_EQ(SongAt(playlist, 1), Paths{mPaths[4]});

    test::Program peer(DRAG_PEER, {"accept", "800", "100"});
    ASSERT_NE(Desktop().window("Accepting peer"), "");
    Activate(playlist);
    ClickAt(playlist, kSongname, PlaylistRow(1));
    Desktop().drag(playlist.left + kSongname, playlist.top + PlaylistRow(1), 880, 180);
    usleep(700000);
    KeepPicture("playlist-6-to-another-program");
    peer.signal(SIGTERM);
    const std::vector<std::string> lines = test::lines_of(peer.wait().output);
    ASSERT_EQ(lines.size(), 3u);
    EXPECT_NE(lines[1].find("text/uri-list"), std::string::npos) << lines[1];
    EXPECT_EQ(lines[2], "file " + UriOfPath(mPaths[4]));
    EXPECT_TRUE(std::filesystem::exists(mPaths[4])) << "the file is copied, not moved";
    EXPECT_EQ(SongAt(playlist, 1), Paths{mPaths[4]}) << "and the row stays";
    End();
}

TEST_F(Playlist, AFileThatIsNoAudioIsNotTakenIn) {
    Start();
    const Window playlist = OpenPlaylist();
    const std::string letter = MakeFile("letter.txt", "Dear reader");
    test::Program peer(DRAG_PEER, {"offer", "800", "100", UriOfPath(letter)});
    ASSERT_NE(Desktop().window("Offering peer"), "");
    usleep(500000);
    Desktop().drag(880, 180, playlist.left + 200, playlist.top + 150);
    usleep(700000);
    KeepPicture("playlist-7-no-audio");
    EXPECT_TRUE(Desktop().becomes(playlist.left + 92, playlist.top + PlaylistRow(0), 0xffffff));
    peer.signal(SIGTERM);
    peer.wait();
    End();
}

TEST_F(Playlist, ItsCloseLeavesTheProgramAndTheNextOneIsEmpty) {
    StartWithSongs();
    Window playlist = OpenPlaylist();
    test::Program peer(DRAG_PEER, {"offer", "800", "100", UriOfPath(mPaths[2])});
    ASSERT_NE(Desktop().window("Offering peer"), "");
    usleep(500000);
    Desktop().drag(880, 180, playlist.left + 200, playlist.top + 150);
    EXPECT_EQ(SongAt(playlist, 0), Paths{mPaths[2]});
    Activate(playlist);
    Press("ctrl+w");
    EXPECT_TRUE(Comes([] {
        return Desktop().tool({"search", "--onlyvisible", "--name", "^Playlist$"}).empty();
    }));
    EXPECT_TRUE(mProgram->running());
    playlist = OpenPlaylist();
    EXPECT_TRUE(NoSongIsAt(playlist, 0));
    peer.signal(SIGTERM);
    peer.wait();
    End();
}

} // namespace
