// Where libmpv is missing.
#include "host/api/player.h"

#include <cerrno>
#include <gtest/gtest.h>

TEST(NoPlayer, ThereIsNoneForAnyOutput) {
    for (const char* output : {"", "null", "file:/tmp/sound.wav", "pulse"})
        EXPECT_EQ(host::make_player(output).error(), ENOTSUP) << output;
}
