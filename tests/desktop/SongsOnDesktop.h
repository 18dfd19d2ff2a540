// The find and playlist windows as a user has them in front of them, with a player that writes down what it
// is given.
#pragma once

#include "desktop/IndexerOnDesktop.h"

#include <Messenger.h>
#include <Node.h>
#include <TypeConstants.h>

#include <sys/stat.h>

#include <string>
#include <vector>

class SongsOnDesktop : public Indexer {
  protected:
    typedef std::vector<std::string> Paths;

    SongsOnDesktop() {
        std::filesystem::create_directories(Home() + "/bin");
        std::filesystem::create_directories(Home() + "/.local/share/applications");
        AddRecorder(Home() + "/bin/player", "played");
        AddRecorder(Home() + "/bin/xdg-open", "shown");
        test::write_file(Home() + "/.local/share/applications/player.desktop",
                         "[Desktop Entry]\nType=Application\nName=Player\nExec=" + Home() +
                             "/bin/player %f\nMimeType=audio/mpeg;audio/x-mpeg;\n");
        setenv("PATH", (Home() + "/bin:/usr/bin:/bin").c_str(), 1);
        setenv("XDG_CURRENT_DESKTOP", "", 1);
        setenv("DBUS_SESSION_BUS_ADDRESS", ("unix:path=" + Home() + "/no-bus").c_str(), 1);
        ForgetOpened();
    }
    ~SongsOnDesktop() override {
        const BMessenger tracker("application/x-vnd.Be-TRAK");
        tracker.SendMessage(B_QUIT_REQUESTED);
    }

    // A program that writes down what it is called with.
    static void AddRecorder(const std::string& path, const std::string& log) {
        test::write_file(path, "#!/bin/sh\nprintf '%s\\n' \"$@\" >> '" + Home() + "/" + log + "'\n");
        chmod(path.c_str(), 0755);
    }
    static void ForgetOpened() {
        std::filesystem::remove(Home() + "/played");
        std::filesystem::remove(Home() + "/shown");
    }
    static Paths Played() { return test::lines_of(test::read_file(Home() + "/played")); }
    static Paths Shown() { return test::lines_of(test::read_file(Home() + "/shown")); }
    // What the player gets by what `use` does.
    template <typename Use>
    static Paths PlayedBy(Use use) {
        return PlayedWithin(20, use);
    }
    // Nothing in two seconds counts as nothing.
    template <typename Use>
    static bool NothingIsPlayedBy(Use use) {
        return PlayedWithin(2, use).empty();
    }
    template <typename Use>
    static Paths PlayedWithin(int seconds, Use use) {
        ForgetOpened();
        use();
        for (int i = 0; i < 10 * seconds && Played().empty(); ++i)
            usleep(100000);
        usleep(300000);
        return Played();
    }

    // Files that are named so that the index job knows artist and song, and their paths.
    static Paths MakeLibrary() {
        Paths paths;
        for (const char* name : {"Oak - Winter", "Lanterns - Night", "Oak - Autumn", "Lanterns - Ferry",
                                 "Birch - Summer", "Lanterns - Bridge"})
            paths.push_back(MakeFile(std::string("Albums/") + name + ".mp3", "ID3 not music"));
        return paths;
    }

    static test::ProgramResult Send(const std::string& code) {
        return test::run_program(QUIRNELCTL, {"send", code});
    }

    // A window's content, placed and sized by the test; the window is in front.
    struct Window {
        std::string number;
        int left = 0;
        int top = 0;
    };
    Window Arrange(const std::string& title, int left, int top, int width, int height) {
        Window window;
        window.number = Desktop().window(title, 30);
        EXPECT_NE(window.number, "") << title;
        Desktop().tool({"windowmove", "--sync", window.number, std::to_string(left), std::to_string(top)});
        Desktop().tool(
            {"windowsize", "--sync", window.number, std::to_string(width), std::to_string(height)});
        Activate(window);
        const std::string indexer = mWindow;
        mWindow = window.number;
        const Area area = WindowArea();
        mWindow = indexer;
        window.left = area.left;
        window.top = area.top;
        return window;
    }
    static void Activate(const Window& window) {
        Desktop().tool({"windowactivate", "--sync", window.number});
        usleep(400000);
    }
    static void ClickAt(const Window& window, int x, int y, int button = 1) {
        Desktop().click(window.left + x, window.top + y, button);
        usleep(500000);
    }
    static void DoubleClickAt(const Window& window, int x, int y) {
        Desktop().move_pointer(window.left + x, window.top + y);
        Desktop().tool({"click", "--repeat", "2", "--delay", "80", "1"});
        usleep(300000);
    }
    static void Type(const std::string& text) {
        Desktop().tool({"type", "--delay", "30", text});
        usleep(300000);
    }

    // Rows are 21 pixels high and lie below a header.
    static int FindRow(int row) { return 48 + kHeader + 21 * row + 10; }
    static int PlaylistRow(int row) { return 20 + kHeader + 21 * row + 10; }
    static constexpr int kHeader = 20;
    // In the middle of the columns, from the window's left edge.
    static constexpr int kSongname = 160;
    static constexpr int kArtist = 310;

    // Starts with both main windows open and the library indexed.
    Window StartWithSongs() {
        mPaths = MakeLibrary();
        Start();
        Click(kIndex);
        EXPECT_TRUE(WaitUntilTagged(static_cast<int>(mPaths.size())));
        usleep(500000);
        return Arrange("Find song", 40, 60, 600, 300);
    }
    void Search(const Window& find, const std::string& text) {
        ClickAt(find, 100, 33);
        Press("ctrl+a");
        Type(text);
        Press("Return");
        usleep(700000);
    }

    Paths mPaths;
};
