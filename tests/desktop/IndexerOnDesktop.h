// The program as a user has it in front of them: started on a screen of the test's own, used by mouse and
// keys.
#pragma once

#include "src/TrackVolume.h"
#include "support/desktop.h"
#include "support/program.h"

#include <File.h>
#include <Message.h>

#include <csignal>
#include <memory>
#include <unistd.h>

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
        const bool opensBoth = !std::filesystem::exists(SettingsPath());
        mProgram = std::make_unique<test::Program>(QUIRNEL_PROGRAM, std::vector<std::string>());
        mWindow = Desktop().window("Indexer", 30);
        ASSERT_FALSE(mWindow.empty());
        // The find window comes second, and would take the keys.
        if (opensBoth) {
            ASSERT_NE(Desktop().window("Find song", 30), "");
        }
        Desktop().tool({"windowactivate", "--sync", mWindow});
        usleep(300000);
    }
    static void WriteSettings(float x, float y, float width, float height) {
        BMessage frame;
        frame.AddFloat("winX", x);
        frame.AddFloat("winY", y);
        frame.AddFloat("winWidth", width);
        frame.AddFloat("winHeight", height);
        BMessage settings;
        settings.AddMessage("indexwindow", &frame);
        std::filesystem::create_directories(Home() + "/.config/bekits/settings");
        BFile file(SettingsPath().c_str(), B_WRITE_ONLY | B_CREATE_FILE | B_ERASE_FILE);
        ASSERT_EQ(settings.Flatten(&file), B_OK);
    }
    void StartWithFrame(float x, float y, float width, float height) {
        WriteSettings(x, y, width, height);
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
