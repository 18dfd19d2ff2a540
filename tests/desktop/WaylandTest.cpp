// The program on a Wayland desktop.
#include "src/TrackVolume.h"
#include "support/program.h"
#include "support/wayland_desktop.h"

#include <File.h>
#include <Message.h>

#include <QLibraryInfo>

#include <csignal>
#include <memory>
#include <unistd.h>

namespace {

constexpr unsigned kBarColor = 0x404080;

bool QtHasWayland() {
    const std::filesystem::path plugins = QLibraryInfo::path(QLibraryInfo::PluginsPath).toStdString();
    return std::filesystem::exists(plugins / "platforms/libqwayland-generic.so");
}

class OnWayland : public TrackTest {
  protected:
    void SetUp() override {
        const std::string problem =
            QtHasWayland() ? test::WaylandDesktop::problem() : "Qt's plugin for Wayland is not installed";
        if (!problem.empty())
            GTEST_SKIP() << problem;
        std::filesystem::remove_all(SettingsPath());
        mDesktop = std::make_unique<test::WaylandDesktop>();
        ASSERT_TRUE(mDesktop->works());
    }

    // Waits for it, half a minute at most.
    template <typename Condition>
    static bool Comes(Condition condition) {
        for (int i = 0; i < 150 && !condition(); ++i)
            usleep(200000);
        return condition();
    }
    static std::string SettingsPath() {
        return std::string(std::getenv("HOME")) + "/.config/bekits/settings/Quirnel settings";
    }
    static test::ProgramResult Send(const std::string& code) {
        return test::run_program(QUIRNELCTL, {"send", code});
    }
    // Starts the program and waits until its list, the only thing that is white here, is on the screen.
    void Start(const char* path) {
        mProgram = std::make_unique<test::Program>(path, std::vector<std::string>());
        const long white = mDesktop->count_pixels(0xFFFFFF);
        ASSERT_TRUE(Comes([&] { return mDesktop->count_pixels(0xFFFFFF) > white + 10000; }));
    }
    std::string End() {
        mProgram->signal(SIGTERM);
        const test::ProgramResult result = mProgram->wait();
        EXPECT_EQ(result.status, 0) << "signal " << result.signal << "\n" << result.errors;
        EXPECT_EQ(result.errors, "");
        return result.output;
    }
    // Where QUIRNEL_TEST_PICTURES names a folder for them.
    void KeepPicture(const std::string& name) const {
        const char* const folder = std::getenv("QUIRNEL_TEST_PICTURES");
        if (folder == nullptr)
            return;
        EXPECT_TRUE(mDesktop->screenshot(std::string(folder) + "/wayland-" + name + ".png"));
    }
    static BMessage SavedFrame() {
        BFile file(SettingsPath().c_str(), B_READ_ONLY);
        BMessage settings;
        EXPECT_EQ(settings.Unflatten(&file), B_OK);
        BMessage frame;
        EXPECT_EQ(settings.FindMessage("indexwindow", &frame), B_OK);
        return frame;
    }

    std::unique_ptr<test::WaylandDesktop> mDesktop;
    std::unique_ptr<test::Program> mProgram;
};

TEST_F(OnWayland, TheProgramShowsItsWindowAndKeepsItsSizeForTheNextTime) {
    Start(QUIRNEL_PROGRAM);
    KeepPicture("first-start");
    EXPECT_TRUE(End().ends_with("Bye !\n"));
    // Where a window stands is the desktop's secret there.
    EXPECT_EQ(SavedFrame().GetFloat("winWidth", -1), 450);
    EXPECT_EQ(SavedFrame().GetFloat("winHeight", -1), 200);

    Start(QUIRNEL_PROGRAM);
    EXPECT_EQ(End(), "Bye !\n") << "a second start has nothing to say";
    EXPECT_EQ(SavedFrame().GetFloat("winWidth", -1), 450);
    EXPECT_EQ(SavedFrame().GetFloat("winHeight", -1), 200);
}

TEST_F(OnWayland, TheWindowIndexesAndStripsAVolume) {
    const std::string first = MakeFile("The Lanterns - Harbour Lights/01 - First Ferry.mp3");
    const std::string second = MakeFile("Oak & Ash - Winter Road.mp3");
    Start(SENDABLE_QUIRNEL);
    // The frames of bars that are empty.
    const long before = mDesktop->count_pixels(kBarColor);
    EXPECT_EQ(Send("713").status, 0);
    EXPECT_TRUE(Comes([&] { return Text(second, "Audio:Songname") == "Winter Road"; }));
    EXPECT_EQ(Text(first, "Audio:Songname"), "First Ferry");
    EXPECT_EQ(Text(first, "Audio:Album"), "Harbour Lights");
    // The bar of the first row is full.
    EXPECT_TRUE(Comes([&] { return mDesktop->count_pixels(kBarColor) > before + 300; }));
    KeepPicture("indexed");

    EXPECT_EQ(Send("711").status, 0);
    EXPECT_TRUE(Comes([&] { return AttributeNames(first).empty() && AttributeNames(second).empty(); }));
    EXPECT_TRUE(End().ends_with("Bye !\n"));
    EXPECT_EQ(SavedFrame().GetFloat("winWidth", -1), 450);
}

TEST_F(OnWayland, ASecondStartLeavesTheFirstOneAtWork) {
    Start(QUIRNEL_PROGRAM);
    const test::ProgramResult second = test::run_program(QUIRNEL_PROGRAM, {});
    EXPECT_EQ(second.status, 0);
    EXPECT_EQ(second.errors, "");
    EXPECT_TRUE(mProgram->running());
    EXPECT_TRUE(End().ends_with("Bye !\n"));
}

} // namespace
