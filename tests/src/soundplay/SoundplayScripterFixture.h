// The remote control against a player of the test's own, which writes down what it is sent.
#pragma once

#include "soundplay/SoundplayScripter.h"

#include "support/captured_output.h"
#include "support/program.h"
#include "support/temporary_environment.h"

#include <Application.h>
#include <Entry.h>
#include <OS.h>
#include <Roster.h>

#include <filesystem>
#include <functional>
#include <gtest/gtest.h>
#include <memory>
#include <string>
#include <vector>

inline constexpr const char* kNewRef = "layer 61627261 command=int32 4 newref=ref song.mp3\n";
inline constexpr const char* kMinimize = "player 5f574d4e minimize=bool true when=int64 now\n";

inline bool Eventually(const std::function<bool()>& condition) {
    for (int round = 0; round < 2000; round++) {
        if (condition())
            return true;
        snooze(10'000);
    }
    return false;
}

class SoundplayScripterTest : public testing::Test {
  protected:
    SoundplayScripterTest() : mApplication("application/x-vnd.Test-Scripter") {
        mEnvironment.set("TEST_PLAYER_LOG", Path("log"));
        mEnvironment.set("TEST_PLAYER_MODE", "answers");
        test::write_file(Path("song.mp3"), "x");
        BEntry(Path("song.mp3").c_str()).GetRef(&mSong);
    }
    ~SoundplayScripterTest() override {
        if (be_roster->IsRunning(kSoundPlaySignature)) {
            BMessenger(kSoundPlaySignature).SendMessage(B_QUIT_REQUESTED);
            EXPECT_TRUE(PlayerEnds());
        }
    }

    std::string Path(const std::string& leaf) const { return mEnvironment.root() + "/" + leaf; }
    std::string Log() const { return test::read_file(Path("log")); }
    bool LogBecomes(const std::string& text) const {
        return Eventually([&] { return Log() == text; });
    }
    // The player can be launched from now on.
    void Install(const std::string& program = TEST_PLAYER) {
        const std::string directory = mEnvironment.home() + "/.local/share/bekits/applications";
        std::filesystem::create_directories(directory);
        test::write_file(
            directory + "/application,x-marcone-soundplay.app",
            std::string("[Application]\nSignature=application/x-marcone-soundplay\nExecutable=") + program +
                "\nLaunch=exclusive\nBackground=true\n");
    }
    std::unique_ptr<test::Program> StartPlayer() {
        auto player = std::make_unique<test::Program>(TEST_PLAYER, std::vector<std::string>{});
        EXPECT_TRUE(Eventually([] { return be_roster->IsRunning("application/x-marcone-soundplay"); }));
        EXPECT_TRUE(Eventually([&] { return Log() == "ready\n"; }));
        return player;
    }
    static bool PlayerEnds() {
        return Eventually([] { return !be_roster->IsRunning("application/x-marcone-soundplay"); });
    }
    static std::string Printed(const std::function<void()>& action) {
        CapturedOutput output;
        action();
        return output.text();
    }
    static std::string NewLayerLine(const sptrackinfo& layer) {
        return "player 61627261 waiting command=int32 1 name=string song.mp3 port=int32 " +
               std::to_string(layer.port) + "\n";
    }

    test::TemporaryEnvironment mEnvironment;
    BApplication mApplication;
    entry_ref mSong;
};
