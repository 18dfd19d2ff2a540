// The application's own remote control.
#include "app/QuirnelApp.h"
#include "soundplay/SoundplayScripter.h"
#include "support/captured_output.h"
#include "support/program.h"
#include "support/temporary_environment.h"

#include <OS.h>
#include <Roster.h>

#include <gtest/gtest.h>
#include <memory>

TEST(SoundplayApplicationTest, TheScripterIsMadeOnceAndEndsThePlayerWithTheApplication) {
    test::TemporaryEnvironment environment;
    environment.set("TEST_PLAYER_LOG", environment.root() + "/log");
    environment.set("TEST_PLAYER_MODE", "answers");
    auto application = std::make_unique<QuirnelApp>();
    SoundplayScripter* const scripter = application->GetSoundplayScripter();
    EXPECT_EQ(application->GetSoundplayScripter(), scripter);
    EXPECT_FALSE(be_roster->IsRunning(kSoundPlaySignature));

    test::Program player(TEST_PLAYER, {});
    while (!be_roster->IsRunning(kSoundPlaySignature))
        snooze(10'000);
    CapturedOutput output;
    scripter->BuildConnection();
    // It did not run when the scripter was made.
    application.reset();
    EXPECT_EQ(output.text(), "Soundplay connection succeeded\n");
    EXPECT_EQ(player.wait().status, 0);
}
