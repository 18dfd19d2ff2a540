// The player as a program of its own, driven as the application drives it. The sound goes nowhere, at its
// pace.
#pragma once

#include "soundplay/ScriptMessage.h"
#include "soundplay/SoundplayScripter.h"
#include "support/captured_output.h"
#include "support/program.h"
#include "support/sound_file.h"
#include "support/temporary_environment.h"

#include <Application.h>
#include <Entry.h>
#include <OS.h>
#include <Roster.h>

#include <functional>
#include <gtest/gtest.h>
#include <memory>
#include <string>
#include <vector>

inline bool Eventually(const std::function<bool()>& condition) {
    for (int round = 0; round < 4000; round++) {
        if (condition())
            return true;
        snooze(5'000);
    }
    return false;
}

inline bool PlayerRuns() {
    return be_roster->IsRunning("application/x-marcone-soundplay");
}

inline BMessage ValuesOf(const BMessenger& target) {
    ScriptMessage request(SCRIPTGETVALUES);
    BMessage answer;
    EXPECT_EQ(target.SendMessage(&request, &answer, 10'000'000, 10'000'000), B_OK);
    return answer;
}

inline std::string StateOf(const sptrackinfo* layer) {
    return ValuesOf(*layer->messenger).GetString("state", "");
}

inline double PositionOf(const sptrackinfo* layer) {
    return ValuesOf(*layer->messenger).GetDouble("position", -1);
}

inline bool Becomes(const sptrackinfo* layer, const char* state) {
    return Eventually([&] { return StateOf(layer) == state; });
}

class SoundPlayTest : public testing::Test {
  protected:
    SoundPlayTest() {
        mEnvironment.set("SOUNDPLAY_OUTPUT", "null");
        mApplication = std::make_unique<BApplication>("application/x-vnd.Test-Client");
    }
    ~SoundPlayTest() override {
        if (PlayerRuns()) {
            BMessenger(kSoundPlaySignature).SendMessage(B_QUIT_REQUESTED);
            EXPECT_TRUE(Eventually([] { return !PlayerRuns(); }));
        }
    }

    std::string Path(const std::string& leaf) const { return mEnvironment.root() + "/" + leaf; }
    entry_ref Tone(const std::string& leaf, double seconds) {
        test::write_tone(Path(leaf), seconds, 440);
        return RefOf(leaf);
    }
    entry_ref RefOf(const std::string& leaf) const {
        entry_ref ref;
        EXPECT_EQ(BEntry(Path(leaf).c_str()).GetRef(&ref), B_OK);
        return ref;
    }
    // One whose end can be looked at.
    std::unique_ptr<test::Program> StartPlayer() {
        auto player = std::make_unique<test::Program>(SOUNDPLAY, std::vector<std::string>{});
        EXPECT_TRUE(Eventually(PlayerRuns));
        return player;
    }
    static test::ProgramResult EndOf(test::Program& player) {
        EXPECT_EQ(BMessenger(kSoundPlaySignature).SendMessage(B_QUIT_REQUESTED), B_OK);
        return player.wait();
    }
    static std::string Printed(const std::function<void()>& action) {
        CapturedOutput output;
        action();
        return output.text();
    }

    test::TemporaryEnvironment mEnvironment;
    std::unique_ptr<BApplication> mApplication;
};
