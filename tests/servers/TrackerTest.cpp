// The program that opens files and folders, launched on demand, with stand-ins for the user's preferred
// program and file manager.
#include "AppFiles.h"
#include "TrackerApp.h"
#include "support/program.h"
#include "support/temporary_environment.h"

#include <Message.h>
#include <Messenger.h>
#include <OS.h>
#include <Roster.h>

#include <algorithm>
#include <csignal>
#include <filesystem>
#include <functional>
#include <gtest/gtest.h>
#include <memory>
#include <sys/stat.h>

namespace {

constexpr const char* kTracker = "application/x-vnd.Be-TRAK";

bool Eventually(const std::function<bool()>& condition) {
    for (int round = 0; round < 2000; round++) {
        if (condition())
            return true;
        snooze(10'000);
    }
    return false;
}

class TrackerTest : public testing::Test {
  protected:
    TrackerTest() {
        mEnvironment.set("XDG_CURRENT_DESKTOP", "");
        // Nobody's bus: a test that wants one starts it.
        mEnvironment.set("DBUS_SESSION_BUS_ADDRESS", "unix:path=" + Path("no-bus"));
        std::filesystem::create_directory(Path("bin"));
        mEnvironment.set("PATH", Path("bin") + ":/usr/bin:/bin");
        AddRecorder(Path("bin/xdg-open"), "helper");
    }
    ~TrackerTest() override {
        const BMessenger tracker(kTracker);
        if (tracker.SendMessage(B_QUIT_REQUESTED) == B_OK) {
            EXPECT_TRUE(Eventually([&] { return kill(tracker.Team(), 0) != 0; }));
        }
    }

    std::string Path(const std::string& leaf) const { return mEnvironment.root() + "/" + leaf; }
    // A program that appends its arguments to a file, each ended by a zero byte.
    void AddRecorder(const std::string& path, const std::string& log) {
        test::write_file(path, "#!/bin/sh\nprintf '%s\\0' \"$@\" >> '" + Path(log) + "'\n");
        chmod(path.c_str(), 0755);
    }
    void PreferRecorderFor(const std::string& type) {
        AddRecorder(Path("player"), "played");
        const std::string directory = mEnvironment.home() + "/.local/share/applications";
        std::filesystem::create_directories(directory);
        test::write_file(directory + "/player.desktop",
                         "[Desktop Entry]\nType=Application\nName=Player\nExec=" + Path("player") +
                             " --play %f\nMimeType=" + type + ";\n");
    }
    void StartFileManager() {
        mEnvironment.set("DBUS_SESSION_BUS_ADDRESS", "unix:path=" + Path("bus"));
        mBus = std::make_unique<test::Program>(
            DBUS_DAEMON,
            std::vector<std::string>{"--session", "--nofork", "--address=unix:path=" + Path("bus")});
        ASSERT_TRUE(Eventually([&] { return std::filesystem::exists(Path("bus")); }));
        mFileManager = std::make_unique<test::Program>(
            TEST_FILE_MANAGER, std::vector<std::string>{Path("shown"), Path("ready")});
    }
    entry_ref MakeFile(const std::string& leaf, const std::string& content = "x") {
        test::write_file(Path(leaf), content);
        return RefOf(leaf);
    }
    entry_ref RefOf(const std::string& leaf) {
        entry_ref ref;
        EXPECT_TRUE(ref_of_path(Path(leaf), &ref)) << leaf;
        return ref;
    }
    static void Open(const entry_ref& ref, const char* field = "refs") {
        // As the application does it.
        if (!be_roster->IsRunning(kTracker)) {
            ASSERT_EQ(be_roster->Launch(kTracker), B_OK);
        }
        BMessage message(B_REFS_RECEIVED);
        ASSERT_EQ(message.AddRef(field, &ref), B_OK);
        ASSERT_EQ(BMessenger(kTracker).SendMessage(&message), B_OK);
    }
    void ExpectWritten(const std::string& leaf, const std::string& expected) {
        EXPECT_TRUE(Eventually([&] { return test::read_file(Path(leaf)).size() >= expected.size(); }));
        EXPECT_EQ(test::read_file(Path(leaf)), expected);
    }
    std::string Zeros(std::string text) const {
        std::replace(text.begin(), text.end(), '|', '\0');
        return text;
    }

    test::TemporaryEnvironment mEnvironment;
    std::unique_ptr<test::Program> mBus;
    std::unique_ptr<test::Program> mFileManager;
};

} // namespace

TEST_F(TrackerTest, AFileIsOpenedByThePreferredProgramWhateverItsName) {
    PreferRecorderFor("audio/mpeg");
    const char* names[] = {"song.mp3", "it's \"loud\" $(touch x).mp3", "two\nlines.mp3", "-rf.mp3",
                           "caf\xe9.mp3"};
    std::string expected;
    for (const char* name : names) {
        Open(MakeFile(name));
        expected += "--play|" + Path(name) + "|";
        ExpectWritten("played", Zeros(expected));
    }
    EXPECT_FALSE(std::filesystem::exists(Path("helper")));
}

TEST_F(TrackerTest, WithoutAPreferredProgramTheDesktopsHelperIsAsked) {
    mEnvironment.set("XDG_DATA_DIRS", "/usr/share/nothing");
    Open(MakeFile("odd.strange"));
    ExpectWritten("helper", Zeros(Path("odd.strange") + "|"));
}

TEST_F(TrackerTest, AFolderIsOpenedByTheHelperWhereThereIsNoFileManager) {
    std::filesystem::create_directory(Path("- folder"));
    Open(RefOf("- folder"));
    ExpectWritten("helper", Zeros(Path("- folder") + "|"));
}

TEST_F(TrackerTest, FoldersAndSelectedFilesAreShownByTheFileManager) {
    StartFileManager();
    std::filesystem::create_directory(Path("a folder"));
    // Until the service is there the helper would be asked.
    ASSERT_TRUE(Eventually([&] { return std::filesystem::exists(Path("ready")); }));
    Open(RefOf("a folder"));
    ExpectWritten("shown", "ShowFolders file://" + Path("a%20folder") + "\n");
    Open(MakeFile("caf\xe9.mp3"), "select");
    ExpectWritten("shown", "ShowFolders file://" + Path("a%20folder") + "\nShowItems file://" +
                               Path("caf%E9.mp3") + "\n");
    EXPECT_FALSE(std::filesystem::exists(Path("helper")));
}

TEST_F(TrackerTest, AProgramIsShownAndNotRun) {
    StartFileManager();
    ASSERT_TRUE(Eventually([&] { return std::filesystem::exists(Path("ready")); }));
    std::filesystem::copy_file("/bin/true", Path("program"));
    Open(RefOf("program"));
    ExpectWritten("shown", "ShowItems file://" + Path("program") + "\n");
}

TEST_F(TrackerTest, AFileThatIsGoneIsSaidSoAndTheNextIsOpened) {
    PreferRecorderFor("audio/mpeg");
    entry_ref gone = MakeFile("song.mp3");
    gone.set_name("gone.mp3");
    test::Program tracker(TRACKER, {});
    ASSERT_TRUE(Eventually([] { return be_roster->IsRunning(kTracker); }));
    Open(gone);
    Open(RefOf("song.mp3"));
    ExpectWritten("played", Zeros("--play|" + Path("song.mp3") + "|"));
    ASSERT_EQ(BMessenger(kTracker).SendMessage(B_QUIT_REQUESTED), B_OK);
    const test::ProgramResult result = tracker.wait();
    EXPECT_EQ(result.status, 0);
    EXPECT_EQ(result.errors, "tracker: gone.mp3: is not there\n");
}

TEST_F(TrackerTest, WithoutWorkItEndsByItself) {
    const bigtime_t begun = system_time();
    {
        TrackerApp tracker(300'000);
        EXPECT_GT(tracker.Run(), 0);
    }
    EXPECT_GE(system_time() - begun, 300'000);
    EXPECT_FALSE(be_roster->IsRunning(kTracker));
}
