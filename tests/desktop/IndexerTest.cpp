// The program with its indexer window, as a user has it in front of them.
#include "src/TrackVolume.h"
#include "support/desktop.h"
#include "support/program.h"
#include "widgets/WindowFrame.h"

#include <File.h>
#include <Message.h>

#include <csignal>
#include <memory>
#include <unistd.h>

namespace {

constexpr char kAdditions[] = "Adding 'Audio:Songname' to Tracker attributes\n"
                              "Adding 'Audio:Artist' to Tracker attributes\n"
                              "Adding 'Audio:Album' to Tracker attributes\n"
                              "Adding 'Audio:TrackNo' to Tracker attributes\n"
                              "Adding 'Audio:Disc' to Tracker attributes\n"
                              "Adding 'Audio:Version' to Tracker attributes\n"
                              "Adding 'Audio:LengthUsec' to Tracker attributes\n"
                              "Adding 'Audio:Samplerate' to Tracker attributes\n"
                              "Adding 'Audio:Bitrate' to Tracker attributes\n"
                              "Adding 'Audio:Channels' to Tracker attributes\n"
                              "Adding 'Media:Encoder' to Tracker attributes\n";

// Which button of the lower row, from the left.
enum Button { kStatus, kStrip, kStop, kIndex };

struct Area {
    int left = 0;
    int top = 0;
    int width = 0;
    int height = 0;
    bool operator==(const Area&) const = default;
};

class Indexer : public TrackTest {
  protected:
    Indexer() {
        std::filesystem::remove_all(Home() + "/.config/bekits/settings");
        std::filesystem::remove_all(Home() + "/.config/bekits/mime");
    }
    void SetUp() override { ASSERT_TRUE(Desktop().works()); }

    static const test::Desktop& Desktop() {
        static const test::Desktop desktop(test::Desktop::WindowManager::openbox);
        return desktop;
    }
    // Waits for it, half a minute at most.
    template <typename Condition>
    static bool Comes(Condition condition) {
        for (int i = 0; i < 300 && !condition(); ++i)
            usleep(100000);
        return condition();
    }
    static int CountWindows() {
        return static_cast<int>(
            test::lines_of(Desktop().tool({"search", "--onlyvisible", "--name", "^Indexer$"})).size());
    }
    // The content, without what the window manager puts around it.
    Area WindowArea() const {
        Area area;
        for (const std::string& line :
             test::lines_of(test::run_program("/usr/bin/xwininfo", {"-id", mWindow}).output)) {
            const auto take = [&](const std::string& name, int& value) {
                if (const std::size_t at = line.find(name); at != std::string::npos)
                    value = std::atoi(line.c_str() + at + name.size());
            };
            take("Absolute upper-left X:", area.left);
            take("Absolute upper-left Y:", area.top);
            take("  Width:", area.width);
            take("  Height:", area.height);
        }
        return area;
    }
    void Resize(int width, int height) const {
        Desktop().tool({"windowsize", mWindow, std::to_string(width), std::to_string(height)});
        usleep(500000);
    }
    static void Press(const std::string& key) {
        Desktop().key(key);
        usleep(200000);
    }
    // Where QUIRNEL_TEST_PICTURES names a folder for them.
    static void KeepPicture(const std::string& name) {
        if (const char* folder = std::getenv("QUIRNEL_TEST_PICTURES"))
            Desktop().screenshot(std::string(folder) + "/" + name + ".png");
    }

    static std::string Home() { return std::getenv("HOME"); }
    static std::string SettingsPath() { return Home() + "/.config/bekits/settings/Quirnel settings"; }

    // Starts the program and waits for its window, at rest and with the keyboard.
    void Start() {
        mProgram = std::make_unique<test::Program>(QUIRNEL_PROGRAM, std::vector<std::string>());
        mWindow = Desktop().window("Indexer", 30);
        ASSERT_FALSE(mWindow.empty());
        Desktop().tool({"windowactivate", "--sync", mWindow});
        usleep(300000);
    }
    void StartWithFrame(float x, float y, float width, float height) {
        BMessage frame;
        frame.AddFloat("winX", x);
        frame.AddFloat("winY", y);
        frame.AddFloat("winWidth", width);
        frame.AddFloat("winHeight", height);
        BMessage settings;
        settings.AddMessage("indexwindow", &frame);
        std::filesystem::create_directories(Home() + "/.config/bekits/settings");
        {
            BFile file(SettingsPath().c_str(), B_WRITE_ONLY | B_CREATE_FILE | B_ERASE_FILE);
            ASSERT_EQ(settings.Flatten(&file), B_OK);
        }
        Start();
    }
    // Ends it by the system's request and answers what it has said.
    std::string End() {
        mProgram->signal(SIGTERM);
        return WaitForEnd();
    }
    std::string WaitForEnd() {
        const test::ProgramResult result = mProgram->wait();
        EXPECT_EQ(result.status, 0) << "signal " << result.signal << "\n" << result.errors;
        EXPECT_EQ(result.errors, "");
        return result.output;
    }
    static BMessage Saved() {
        BFile file(SettingsPath().c_str(), B_READ_ONLY);
        BMessage settings;
        EXPECT_EQ(settings.Unflatten(&file), B_OK);
        return settings;
    }
    static BRect SavedFrame() {
        BMessage frame;
        EXPECT_EQ(Saved().FindMessage("indexwindow", &frame), B_OK);
        const float x = frame.GetFloat("winX", -1);
        const float y = frame.GetFloat("winY", -1);
        return BRect(x, y, x + frame.GetFloat("winWidth", -1), y + frame.GetFloat("winHeight", -1));
    }

    void Click(Button button) {
        const Area area = WindowArea();
        Desktop().click(area.left + 7 + 88 * button + 40, area.top + area.height - 18);
    }
    static void MakeFiles(int count) {
        for (int i = 0; i < count; ++i)
            MakeFile(std::to_string(i % 20) + "/Artist - " + std::to_string(i) + ".mp3");
    }
    static int CountTagged() {
        int count = 0;
        for (const auto& entry : std::filesystem::recursive_directory_iterator(Volume()))
            count += entry.is_regular_file() && RawAttribute(entry.path(), "Audio:Songname").has_value();
        return count;
    }
    static bool WaitUntilTagged(int count) {
        return Comes([&] { return CountTagged() == count; });
    }

    std::unique_ptr<test::Program> mProgram;
    std::string mWindow;
};

TEST_F(Indexer, AFirstStartPreparesTheFileManagerAndOpensTheIndexer) {
    Start();
    KeepPicture("first-start");
    EXPECT_EQ(WindowArea(), (Area{100, 100, 451, 201}));
    EXPECT_EQ(End(), std::string(kAdditions) + "No preferences found...\n"
                                               "The find window is not there yet\n"
                                               "Bye !\n");
}

TEST_F(Indexer, ARequestToEndSavesWhereTheWindowStood) {
    Start();
    Desktop().tool({"windowmove", mWindow, "300", "200"});
    usleep(500000);
    const Area area = WindowArea();
    End();
    EXPECT_EQ(SavedFrame(), BRect(static_cast<float>(area.left), static_cast<float>(area.top),
                                  static_cast<float>(area.left + area.width - 1),
                                  static_cast<float>(area.top + area.height - 1)));

    Start();
    EXPECT_EQ(WindowArea(), area);
    EXPECT_EQ(End(), "Bye !\n") << "a second start has nothing to say";
    EXPECT_EQ(SavedFrame().left, static_cast<float>(area.left));
}

TEST_F(Indexer, ASavedFrameIsRestoredExactly) {
    StartWithFrame(211, 133, 517, 289);
    EXPECT_EQ(WindowArea(), (Area{211, 133, 518, 290}));
    End();
    EXPECT_EQ(SavedFrame(), BRect(211, 133, 728, 422));
}

TEST_F(Indexer, ASavedFrameThatLeavesTheScreenIsReplaced) {
    StartWithFrame(1000, 133, 517, 289);
    const Area area = WindowArea();
    EXPECT_EQ(area.width, 401);
    EXPECT_EQ(area.height, 151);
    KeepPicture("replaced-frame");
    End();
}

TEST_F(Indexer, CannotBeMadeSmallerThanItOpened) {
    Start();
    Resize(200, 100);
    EXPECT_EQ(WindowArea().width, 451);
    EXPECT_EQ(WindowArea().height, 201);
    Resize(700, 500);
    EXPECT_EQ(WindowArea().width, 700);
    EXPECT_EQ(WindowArea().height, 500);
    KeepPicture("larger");
    End();
}

TEST_F(Indexer, TheMouseIndexesAndStrips) {
    MakeFiles(20);
    Start();
    Click(kIndex);
    EXPECT_TRUE(WaitUntilTagged(20));
    usleep(600000);
    KeepPicture("indexed");
    // The bar of the first row is full.
    EXPECT_TRUE(Desktop().becomes(WindowArea().left + 200, WindowArea().top + 41, 0x404080));
    Click(kStrip);
    EXPECT_TRUE(WaitUntilTagged(0));
    usleep(600000);
    KeepPicture("striped");
    End();
}

TEST_F(Indexer, TheKeyboardIndexesAndStrips) {
    MakeFiles(20);
    Start();
    // The list has the keys at first; then come the buttons that are not disabled.
    Press("Tab");
    Press("Tab");
    Press("space");
    EXPECT_TRUE(WaitUntilTagged(20));
    usleep(600000);
    KeepPicture("indexed-by-keys");
    End();
}

TEST_F(Indexer, AJobAtWorkIsSeenAndCanBeStopped) {
    MakeFiles(30000);
    Start();
    Click(kIndex);
    for (int i = 0; i < 300 && CountTagged() < 100; ++i)
        usleep(10000);
    KeepPicture("at-work");
    Click(kStop);
    usleep(700000);
    const int tagged = CountTagged();
    EXPECT_GT(tagged, 0);
    EXPECT_LT(tagged, 30000);
    usleep(500000);
    EXPECT_EQ(CountTagged(), tagged);
    KeepPicture("stopped");
    End();
}

TEST_F(Indexer, TheMenusCloseEndsTheProgramWithItsLastWindow) {
    Start();
    Press("ctrl+w");
    EXPECT_TRUE(Comes([] { return CountWindows() == 0; }));
    const std::string said = WaitForEnd();
    EXPECT_EQ(said.substr(said.size() - 6), "Bye !\n");
    EXPECT_TRUE(Saved().IsEmpty()) << "no window was left to be saved";

    // Present behaviour: as the find window is not there yet, the indexer opens in its place.
    Start();
    EXPECT_EQ(End(), "The find window is not there yet\nBye !\n");
}

TEST_F(Indexer, TheCloseBoxStopsAJobAndEndsTheProgram) {
    MakeFiles(30000);
    Start();
    Click(kIndex);
    for (int i = 0; i < 300 && CountTagged() < 100; ++i)
        usleep(10000);
    Press("alt+F4");
    EXPECT_TRUE(Comes([] { return CountWindows() == 0; }));
    WaitForEnd();
    const int tagged = CountTagged();
    EXPECT_GT(tagged, 0);
    EXPECT_LT(tagged, 30000);
    EXPECT_TRUE(Saved().IsEmpty());
}

TEST_F(Indexer, TheMenuOpensTheOneWindowOnce) {
    Start();
    Press("ctrl+d");
    Press("ctrl+f");
    usleep(500000);
    EXPECT_EQ(CountWindows(), 1);
    Press("F10");
    usleep(300000);
    Press("Down");
    usleep(500000);
    KeepPicture("file-menu");
    Press("Escape");
    Press("Escape");
    const std::string said = End();
    EXPECT_NE(said.find("The find window is not there yet\nBye !\n"), std::string::npos)
        << "said once, however often it is asked for: " << said;
}

TEST_F(Indexer, WithoutADisplayTheProgramSaysSoInOneLine) {
    const std::string display = std::getenv("DISPLAY");
    unsetenv("DISPLAY");
    const test::ProgramResult result = test::run_program(QUIRNEL_PROGRAM, {});
    setenv("DISPLAY", display.c_str(), 1);
    EXPECT_EQ(result.status, 1);
    EXPECT_EQ(result.output, "");
    EXPECT_EQ(test::lines_of(result.errors).size(), 1u) << result.errors;
}

} // namespace
