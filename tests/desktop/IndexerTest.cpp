// The program with its indexer window, as a user has it in front of them.
#include "desktop/IndexerOnDesktop.h"

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

TEST_F(Indexer, AFirstStartPreparesTheFileManagerAndOpensBothMainWindows) {
    Start();
    EXPECT_NE(Desktop().window("Find song"), "");
    KeepPicture("first-start");
    EXPECT_EQ(WindowArea(), (Area{100, 100, 451, 201}));
    EXPECT_EQ(End(), std::string(kAdditions) + "No preferences found...\n"
                                               "Bye !\n");
    EXPECT_TRUE(Saved().HasMessage("findwindow"));
    EXPECT_TRUE(Saved().HasMessage("indexwindow"));
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

TEST_F(Indexer, SavedAsASinglePixelItCanBeGrownAndUsed) {
    MakeFiles(2);
    StartWithFrame(211, 133, 0, 0);
    EXPECT_EQ(WindowArea(), (Area{211, 133, 1, 1}));
    Resize(451, 201);
    KeepPicture("grown");
    // The middle of the fourth button; they are 51 pixels wide and 7 apart.
    Desktop().click(211 + 7 + 3 * 58 + 25, 133 + 201 - 18);
    EXPECT_TRUE(WaitUntilTagged(2));
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
    StartWithFrame(100, 100, 450, 200);
    Press("ctrl+w");
    EXPECT_TRUE(Comes([] { return CountWindows() == 0; }));
    const std::string said = WaitForEnd();
    EXPECT_EQ(said.substr(said.size() - 6), "Bye !\n");
    EXPECT_TRUE(Saved().IsEmpty()) << "no window was left to be saved";

    // Settings that name no window open the find window alone.
    mProgram = std::make_unique<test::Program>(QUIRNEL_PROGRAM, std::vector<std::string>());
    EXPECT_NE(Desktop().window("Find song", 30), "");
    EXPECT_EQ(CountWindows(), 0);
    EXPECT_EQ(End(), "Bye !\n");
}

TEST_F(Indexer, TheCloseBoxStopsAJobAndEndsTheProgram) {
    MakeFiles(30000);
    StartWithFrame(100, 100, 450, 200);
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
    StartWithFrame(100, 100, 450, 200);
    Press("ctrl+d");
    usleep(500000);
    EXPECT_EQ(CountWindows(), 1);
    Press("ctrl+f");
    EXPECT_NE(Desktop().window("Find song"), "");
    Desktop().tool({"windowactivate", "--sync", mWindow});
    usleep(300000);
    Press("ctrl+f");
    usleep(500000);
    EXPECT_EQ(test::lines_of(Desktop().tool({"search", "--onlyvisible", "--name", "^Find song$"})).size(),
              1u);
    Desktop().tool({"windowactivate", "--sync", mWindow});
    usleep(300000);
    Press("F10");
    usleep(300000);
    Press("Down");
    usleep(500000);
    KeepPicture("file-menu");
    Press("Escape");
    Press("Escape");
    End();
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
