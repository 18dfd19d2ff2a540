// The player without clients.
#include "SoundPlayApp.h"
#include "support/temporary_environment.h"

#include <OS.h>
#include <Roster.h>

#include <gtest/gtest.h>

TEST(SoundPlayAloneTest, WithoutClientsItEndsByItself) {
    const test::TemporaryEnvironment environment;
    const bigtime_t begun = system_time();
    {
        SoundPlayApp player("null", 300'000);
        EXPECT_GT(player.Run(), 0);
    }
    EXPECT_GE(system_time() - begun, 300'000);
    EXPECT_FALSE(be_roster->IsRunning(kSoundPlaySignature));
}
