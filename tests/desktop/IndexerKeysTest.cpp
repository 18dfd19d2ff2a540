// The indexer window by the keyboard alone, and with volumes of every kind.
#include "desktop/IndexerOnDesktop.h"

#include <string>

namespace {

constexpr std::uint32_t kSelected = 0xC0C0C0;
constexpr std::uint32_t kWhite = 0xFFFFFF;

class IndexerKeys : public Indexer {
  protected:
    IndexerKeys() : mDeclared(std::getenv("BEKITS_VOLUMES")) {}
    ~IndexerKeys() override { setenv("BEKITS_VOLUMES", mDeclared.c_str(), 1); }

    // For the programs that are started from now on.
    static void DeclareVolumes(const std::string& directories) {
        setenv("BEKITS_VOLUMES", directories.c_str(), 1);
    }
    // The ground of a row of those that are shown, right of all that it says.
    bool RowIs(int row, std::uint32_t color) const {
        const Area area = WindowArea();
        return Desktop().becomes(area.left + 415, area.top + 40 + 21 * row, color);
    }
    // Whether a button shows that it has the keyboard.
    bool HasKeyboard(Button button) const {
        const Area area = WindowArea();
        const int left = area.left + 7 + 88 * button;
        for (int x = left; x < left + 12; ++x) {
            const std::uint32_t pixel = Desktop().pixel(x, area.top + area.height - 18);
            if ((pixel & 0xFF) > (pixel >> 16) + 0x40)
                return true;
        }
        return false;
    }

  private:
    const std::string mDeclared;
};

TEST_F(IndexerKeys, ArrowsSelectRowsAndTabGoesRoundThoseThatCanBePressed) {
    Start();
    EXPECT_TRUE(RowIs(0, kSelected));
    Press("Down");
    EXPECT_TRUE(RowIs(1, kSelected));
    EXPECT_TRUE(RowIs(0, kWhite));
    Press("Up");
    EXPECT_TRUE(RowIs(0, kSelected));
    Press("Tab");
    EXPECT_TRUE(HasKeyboard(kStrip));
    Press("Tab");
    EXPECT_TRUE(HasKeyboard(kIndex));
    EXPECT_FALSE(HasKeyboard(kStrip));
    Press("Tab");
    EXPECT_FALSE(HasKeyboard(kIndex));
    Press("Down");
    EXPECT_TRUE(RowIs(1, kSelected)) << "the list has the keys again";
    Press("shift+Tab");
    EXPECT_TRUE(HasKeyboard(kIndex));
    End();
}

TEST_F(IndexerKeys, AJobIsStartedAndThenTheNextRowChosen) {
    Start();
    Press("Tab");
    Press("Tab");
    Press("space");
    usleep(700000);
    Press("Down");
    EXPECT_TRUE(RowIs(1, kSelected)) << "the list has the keys of the button that was disabled";
    End();
}

TEST_F(IndexerKeys, AltOpensTheMenuBarAndEscapeGivesTheKeysBack) {
    Start();
    Press("alt+f");
    usleep(300000);
    const Area area = WindowArea();
    EXPECT_TRUE(Desktop().becomes(area.left + 200, area.top + 60, 0xD8D8D8)) << "the menu covers the list";
    Press("Escape");
    Press("Escape");
    EXPECT_TRUE(Desktop().becomes(area.left + 200, area.top + 60, kWhite));
    Press("Down");
    EXPECT_TRUE(RowIs(1, kSelected));
    End();
}

TEST_F(IndexerKeys, TheMenusCloseIsReachedByKeysAlone) {
    // The find window, which would keep the program, is not open.
    StartWithFrame(100, 100, 450, 200);
    Press("F10");
    Press("Down");
    Press("c");
    EXPECT_TRUE(Comes([] { return CountWindows() == 0; }));
    WaitForEnd();
}

TEST_F(IndexerKeys, NamesOfAnyBytesAreListedAndTheirVolumesIndexed) {
    std::string declared;
    const std::string names[] = {std::string(255, 'n'), "\xFF\xFE\x80 bytes \xC3", "%s%n%d", "line\nline",
                                 "\xE2\x80\xAE"
                                 "backwards"};
    for (const std::string& name : names) {
        MakeFile(name + "/Artist - Song.mp3");
        declared += Volume() + "/" + name + ":";
    }
    DeclareVolumes(declared);
    Start();
    KeepPicture("names");
    for (std::size_t i = 0; i < std::size(names); ++i) {
        Press("Tab");
        Press("Tab");
        Press("space");
        EXPECT_TRUE(WaitUntilTagged(static_cast<int>(i) + 1));
        usleep(700000);
        Press("Down");
    }
    EXPECT_TRUE(RowIs(4, kSelected));
    End();
}

TEST_F(IndexerKeys, AVolumeThatVanishesStaysInTheListAndHasNothingToIndex) {
    MakeFile("first/Artist - Song.mp3");
    MakeFile("second/Artist - Song.mp3");
    DeclareVolumes(Volume() + "/first:" + Volume() + "/second");
    Start();
    std::filesystem::remove_all(Volume() + "/first");
    Press("Tab");
    Press("Tab");
    Press("space");
    usleep(700000);
    KeepPicture("vanished");
    EXPECT_TRUE(RowIs(0, kSelected));
    Press("Down");
    Press("Tab");
    Press("Tab");
    Press("space");
    EXPECT_TRUE(WaitUntilTagged(1)) << "the other one is as it was";
    const std::string said = End();
    EXPECT_NE(said.find(" while on Fetch()\n"), std::string::npos) << said;
}

TEST_F(IndexerKeys, TwoHundredVolumesAreListed) {
    std::string declared;
    for (int i = 0; i < 200; ++i) {
        std::filesystem::create_directory(Volume() + "/" + std::to_string(i));
        declared += Volume() + "/" + std::to_string(i) + ":";
    }
    MakeFile("199/Artist - Song.mp3");
    DeclareVolumes(declared);
    Start();
    Press("End");
    usleep(300000);
    KeepPicture("many");
    Press("Tab");
    Press("Tab");
    Press("space");
    EXPECT_TRUE(WaitUntilTagged(1));
    mProgram->signal(SIGTERM);
    const test::ProgramResult result = mProgram->wait();
    EXPECT_EQ(result.status, 0) << "signal " << result.signal;
    // Each volume is watched by itself, and many systems allow 128 watchers.
    EXPECT_TRUE(result.errors.empty() ||
                result.errors.starts_with("The system's limit of watched directories"))
        << result.errors;
}

TEST_F(IndexerKeys, MinimisedAJobGoesOnAndTheWindowComesBackWithItsEnd) {
    MakeFiles(300);
    Start();
    Press("Tab");
    Press("Tab");
    Press("space");
    Desktop().tool({"windowminimize", mWindow});
    EXPECT_TRUE(Comes([] { return CountWindows() == 0; }));
    EXPECT_TRUE(WaitUntilTagged(300));
    usleep(600000);
    Desktop().tool({"windowactivate", mWindow});
    EXPECT_TRUE(Comes([] { return CountWindows() == 1; }));
    usleep(500000);
    KeepPicture("back-from-the-icon");
    // The bar of the first row is full.
    EXPECT_TRUE(Desktop().becomes(WindowArea().left + 200, WindowArea().top + 41, 0x404080));
    End();
}

} // namespace
