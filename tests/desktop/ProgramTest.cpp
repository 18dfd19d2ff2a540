// The program as the desktop starts, calls and ends it.
#include "desktop/IndexerOnDesktop.h"

#include <Roster.h>

#include <sstream>
#include <string>
#include <vector>

namespace {

class ProgramOnDesktop : public Indexer {
  protected:
    ~ProgramOnDesktop() override {
        // Programs that were started by others.
        if (mLaunched)
            EndLaunched();
    }

    static test::ProgramResult Send(const std::string& code) {
        return test::run_program(QUIRNELCTL, {"send", code});
    }
    // Windows of the program, whatever their titles.
    static int CountAllWindows() {
        return static_cast<int>(
            test::lines_of(Desktop().tool({"search", "--onlyvisible", "--class", "^quirnel$"})).size());
    }
    static bool EndLaunched() {
        Send("_QRQ");
        return Comes([] { return Send("0").status != 0; });
    }
    // The values of a key in the desktop entry, in their order.
    static std::vector<std::string> OfDesktopEntry(const std::string& key) {
        std::vector<std::string> values;
        for (const std::string& line : test::lines_of(test::read_file(DESKTOP_ENTRY))) {
            if (line.starts_with(key + "="))
                values.push_back(line.substr(key.size() + 1));
        }
        return values;
    }
    static std::string FolderOf(const std::string& program) {
        return std::filesystem::path(program).parent_path();
    }
    // As a desktop does: words that are divided by spaces, the first one found in PATH.
    static test::ProgramResult RunCommand(const std::string& command) {
        std::istringstream stream(command);
        std::string program;
        stream >> program;
        std::vector<std::string> arguments;
        for (std::string word; stream >> word;)
            arguments.push_back(word);
        return test::run_program(program, arguments);
    }

    void ExpectEndWithoutDisplay() {
        ASSERT_TRUE(Comes([&] { return !mProgram->running(); }));
        const test::ProgramResult result = mProgram->wait();
        EXPECT_EQ(result.status, 1) << "signal " << result.signal;
        EXPECT_EQ(result.errors, "the display has gone\n");
        EXPECT_EQ(result.output.find("Bye"), std::string::npos) << "that tells of a clean end";
    }

    bool mLaunched = false;
};

TEST_F(ProgramOnDesktop, EachWindowOpensOnceHoweverOftenItIsAskedFor) {
    StartWithFrame(211, 133, 450, 200);
    for (const char* code : {"103", "105", "103", "105", "107"})
        EXPECT_EQ(Send(code).status, 0);
    EXPECT_TRUE(Comes([] { return CountAllWindows() == 3; }));
    usleep(500000);
    EXPECT_EQ(CountAllWindows(), 3);
    EXPECT_TRUE(End().ends_with("Bye !\n")) << "the playlist window ends with the program";
    EXPECT_FALSE(Saved().HasMessage("playlistwindow"));
    EXPECT_EQ(Saved().CountNames(B_ANY_TYPE), 2);
}

TEST_F(ProgramOnDesktop, TheAboutBoxHasOneButtonWithoutALabelAndGoesOnReturnAndEscape) {
    StartWithFrame(100, 100, 450, 200);
    ASSERT_EQ(Send("_ABR").status, 0);
    ASSERT_TRUE(Comes([] { return CountAllWindows() == 2; }));
    usleep(500000);
    KeepPicture("about");
    Press("Return");
    EXPECT_TRUE(Comes([] { return CountAllWindows() == 1; }));
    // The program goes on.
    ASSERT_EQ(Send("_ABR").status, 0);
    EXPECT_TRUE(Comes([] { return CountAllWindows() == 2; }));
    usleep(500000);
    Press("Escape");
    EXPECT_TRUE(Comes([] { return CountAllWindows() == 1; }));
    End();
}

TEST_F(ProgramOnDesktop, ARequestToEndIsNotKeptWaitingByTheAboutBox) {
    StartWithFrame(211, 133, 517, 289);
    std::filesystem::remove(SettingsPath());
    ASSERT_EQ(Send("_ABR").status, 0);
    ASSERT_TRUE(Comes([] { return CountAllWindows() == 2; }));
    mProgram->signal(SIGTERM);
    ASSERT_TRUE(Comes([&] { return !mProgram->running(); }));
    const std::string said = WaitForEnd();
    EXPECT_TRUE(said.ends_with("Bye !\n")) << said;
    EXPECT_EQ(SavedFrame(), BRect(211, 133, 728, 422));
}

TEST_F(ProgramOnDesktop, TheDesktopKnowsItsWindowsByTheNameInTheDesktopEntry) {
    Start();
    const std::string properties = test::run_program("/usr/bin/xprop", {"-id", mWindow, "WM_CLASS"}).output;
    ASSERT_EQ(OfDesktopEntry("StartupWMClass"), std::vector<std::string>{"quirnel"});
    EXPECT_EQ(properties, "WM_CLASS(STRING) = \"quirnel\", \"quirnel\"\n");
    End();
}

TEST_F(ProgramOnDesktop, TheDesktopEntrysCommandsRunAsTheyAreWritten) {
    setenv("PATH",
           (FolderOf(QUIRNEL_PROGRAM) + ":" + FolderOf(QUIRNELCTL) + ":" + std::getenv("PATH")).c_str(), 1);
    const std::vector<std::string> commands = OfDesktopEntry("Exec");
    ASSERT_EQ(commands.size(), 4u);
    ASSERT_EQ(commands.front(), "quirnel");
    mLaunched = true;
    for (std::size_t i = 1; i < commands.size(); ++i) {
        // Once to start it, once more while it runs.
        for (int round = 0; round < 2; ++round) {
            const test::ProgramResult result = RunCommand(commands[i]);
            EXPECT_EQ(result.status, 0) << commands[i] << "\n" << result.errors;
            EXPECT_EQ(result.output + result.errors, "") << commands[i];
            EXPECT_TRUE(Comes([] { return CountWindows() == 1; })) << commands[i];
        }
        // Both main windows, as at any first start, and the playlist where it was asked for.
        const int windows = commands[i].ends_with("103") ? 3 : 2;
        EXPECT_TRUE(Comes([&] { return CountAllWindows() == windows; })) << commands[i];
        usleep(500000);
        EXPECT_EQ(CountAllWindows(), windows) << commands[i];
        EXPECT_TRUE(EndLaunched()) << commands[i];
    }
}

TEST_F(ProgramOnDesktop, AWindowThatItsLauncherAsksForIsTheOneOfTheSettings) {
    WriteSettings(211, 133, 517, 289);
    BMessage open(107);
    mLaunched = true;
    ASSERT_EQ(be_roster->Launch("application/x-vnd.vorn-quirnel", &open), B_OK);
    mWindow = Desktop().window("Indexer", 30);
    ASSERT_FALSE(mWindow.empty());
    usleep(1000000);
    EXPECT_EQ(CountWindows(), 1);
    EXPECT_EQ(WindowArea(), (Area{211, 133, 518, 290}));
    EXPECT_TRUE(EndLaunched());
}

TEST_F(ProgramOnDesktop, OfTwoThatAreStartedAtOnceOneStays) {
    for (int round = 0; round < 5; ++round) {
        const auto first = std::make_unique<test::Program>(QUIRNEL_PROGRAM, std::vector<std::string>());
        const auto second = std::make_unique<test::Program>(QUIRNEL_PROGRAM, std::vector<std::string>());
        ASSERT_TRUE(Comes([&] { return !first->running() || !second->running(); }));
        ASSERT_TRUE(Comes([] { return CountWindows() == 1; }));
        usleep(500000);
        EXPECT_EQ(CountWindows(), 1);
        test::Program& stays = first->running() ? *first : *second;
        ASSERT_TRUE(stays.running());
        stays.signal(SIGTERM);
        for (test::Program* program : {first.get(), second.get()}) {
            const test::ProgramResult result = program->wait();
            EXPECT_EQ(result.status, 0) << "signal " << result.signal;
            EXPECT_EQ(result.errors, "");
            EXPECT_TRUE(result.output.ends_with("Bye !\n")) << result.output;
        }
    }
}

// As a window manager does with a program that does not answer.
TEST_F(ProgramOnDesktop, CutOffFromTheDisplayItSavesItsSettings) {
    StartWithFrame(211, 133, 517, 289);
    std::filesystem::remove(SettingsPath());
    Desktop().tool({"windowkill", mWindow});
    ExpectEndWithoutDisplay();
    EXPECT_EQ(SavedFrame(), BRect(211, 133, 728, 422));
}

TEST_F(ProgramOnDesktop, CutOffFromTheDisplayItStopsItsJobs) {
    MakeFiles(30000);
    Start();
    Click(kIndex);
    ASSERT_TRUE(Comes([] { return CountTagged() > 0; }));
    Desktop().tool({"windowkill", mWindow});
    ExpectEndWithoutDisplay();
    const int tagged = CountTagged();
    EXPECT_LT(tagged, 30000);
    EXPECT_EQ(CountTagged(), tagged) << "nothing goes on";
    Start();
    End();
}

TEST_F(ProgramOnDesktop, CutOffFromTheDisplayWithTheAboutBoxOpenItEnds) {
    StartWithFrame(100, 100, 450, 200);
    ASSERT_EQ(Send("_ABR").status, 0);
    ASSERT_TRUE(Comes([] { return CountAllWindows() == 2; }));
    Desktop().tool({"windowkill", mWindow});
    ExpectEndWithoutDisplay();
    EXPECT_EQ(SavedFrame(), BRect(100, 100, 550, 300));
}

TEST_F(ProgramOnDesktop, WithoutADirectoryForSettingsItStartsAsAtFirst) {
    std::filesystem::create_directories(Home() + "/.config/bekits");
    test::write_file(Home() + "/.config/bekits/settings", "in the way");
    Start();
    const std::string said = End();
    EXPECT_NE(said.find("no settings directory found!\nNo preferences found...\n"), std::string::npos)
        << said;
    EXPECT_TRUE(said.ends_with("SavePreferences: no settings directory found!\nBye !\n")) << said;
}

TEST_F(ProgramOnDesktop, WithoutRoomForTypesItStartsAllTheSame) {
    std::filesystem::create_directories(Home() + "/.config/bekits");
    test::write_file(Home() + "/.config/bekits/mime", "in the way");
    Start();
    EXPECT_TRUE(End().ends_with("Bye !\n"));
}

} // namespace
