// Players by libmpv, heard through files and through an output that only keeps the pace.
#include "host/api/player.h"

#include "support/sound_file.h"
#include "support/temporary_environment.h"

#include <cerrno>
#include <chrono>
#include <cmath>
#include <filesystem>
#include <gtest/gtest.h>
#include <thread>

namespace {

using host::PlayerFailure;
using host::PlayerState;

class PlayerTest : public testing::Test {
  protected:
    std::string path(const std::string& leaf) const { return environment_.root() + "/" + leaf; }
    std::string tone(double seconds, double frequency = 440) {
        test::write_tone(path("tone.wav"), seconds, frequency, 0.5);
        return path("tone.wav");
    }
    std::unique_ptr<host::Player> make(const std::string& output) {
        auto player = host::make_player(output);
        EXPECT_TRUE(player.ok()) << player.error();
        return player ? *std::move(player) : nullptr;
    }
    template <typename Condition>
    static bool eventually(Condition condition) {
        for (int round = 0; round < 4000; ++round) {
            if (condition())
                return true;
            std::this_thread::sleep_for(std::chrono::milliseconds(5));
        }
        return false;
    }
    static bool becomes(host::Player& player, PlayerState state) {
        return eventually([&] { return player.values().state == state; });
    }
    /// What of the tone reaches the output.
    test::Sound heard(double pitch, double volume, double from = 0) {
        const std::string file = tone(1);
        {
            const auto player = make("file:" + path("heard.wav"));
            EXPECT_TRUE(player->set_pitch(pitch).ok());
            EXPECT_TRUE(player->set_volume(volume).ok());
            EXPECT_TRUE(player->load(file).ok());
            if (from > 0) {
                EXPECT_TRUE(player->seek(from).ok());
            }
            EXPECT_TRUE(becomes(*player, PlayerState::ended));
        }
        return test::read_sound(path("heard.wav"));
    }

    test::TemporaryEnvironment environment_;
};

} // namespace

TEST_F(PlayerTest, ANewPlayerIsEmpty) {
    const auto player = make("null");
    const host::PlayerValues values = player->values();
    EXPECT_EQ(values.state, PlayerState::empty);
    EXPECT_EQ(values.pitch, 1);
    EXPECT_EQ(values.volume, 1);
    EXPECT_EQ(values.position, 0);
    EXPECT_LT(values.length, 0);
    EXPECT_EQ(player->seek(1).error(), ENOENT);
}

TEST_F(PlayerTest, AToneIsHeardAsItIs) {
    const test::Sound sound = heard(1, 1);
    EXPECT_NEAR(sound.seconds(), 1, 0.01);
    EXPECT_NEAR(sound.frequency(), 440, 5);
    EXPECT_NEAR(sound.peak(), 0.5, 0.01);
}

TEST_F(PlayerTest, PitchChangesFrequencyAndDurationInProportion) {
    struct Case {
        double pitch;
        double seconds;
        double frequency;
    };
    const Case cases[] = {{2, 0.5, 880}, {0.5, 2, 220}, {1.25, 0.8, 550}, {8, 0.125, 3520}};
    for (const Case& entry : cases) {
        const test::Sound sound = heard(entry.pitch, 1);
        EXPECT_NEAR(sound.seconds(), entry.seconds, entry.seconds * 0.05) << entry.pitch;
        EXPECT_NEAR(sound.frequency(), entry.frequency, entry.frequency * 0.05) << entry.pitch;
        EXPECT_NEAR(sound.peak(), 0.5, 0.02) << entry.pitch;
    }
}

TEST_F(PlayerTest, VolumeIsInProportionToTheAmplitude) {
    struct Case {
        double volume;
        double peak;
    };
    const Case cases[] = {{1, 0.5}, {0.5, 0.25}, {0.1, 0.05}, {0, 0}};
    for (const Case& entry : cases)
        EXPECT_NEAR(heard(1, entry.volume).peak(), entry.peak, 0.005) << entry.volume;
}

TEST_F(PlayerTest, ASeekWhileTheFileIsBeingOpenedIsCarriedOutLater) {
    const std::string file = tone(20);
    const auto player = make("null");
    ASSERT_TRUE(player->load(file).ok());
    ASSERT_TRUE(player->seek(12.5).ok());
    EXPECT_GE(player->values().position, 12.5);
    ASSERT_TRUE(becomes(*player, PlayerState::playing));
    // The player's clock counts samples.
    EXPECT_GE(player->values().position, 12.499);
    EXPECT_TRUE(eventually([&] { return player->values().position > 12.6; }));
}

TEST_F(PlayerTest, ThePositionAdvancesAndASeekIsSeenAtOnce) {
    const std::string file = tone(120);
    const auto player = make("null");
    ASSERT_TRUE(player->load(file).ok());
    ASSERT_TRUE(becomes(*player, PlayerState::playing));
    EXPECT_NEAR(player->values().length, 120, 0.001);
    const double first = player->values().position;
    EXPECT_TRUE(eventually([&] { return player->values().position > first; }));
    ASSERT_TRUE(player->seek(60).ok());
    EXPECT_GE(player->values().position, 59.9);
    EXPECT_TRUE(eventually([&] { return player->values().position > 60.1; }));
    ASSERT_TRUE(player->seek(10).ok());
    EXPECT_LT(player->values().position, 60);
    EXPECT_TRUE(eventually([&] { return player->values().position > 10.1; }));
    EXPECT_LT(player->values().position, 60);
}

TEST_F(PlayerTest, TheEndIsAPlaceThatCanBeLeftAgain) {
    const std::string file = tone(60);
    const auto player = make("null");
    ASSERT_TRUE(player->load(file).ok());
    ASSERT_TRUE(player->seek(59.8).ok());
    EXPECT_TRUE(becomes(*player, PlayerState::ended));
    EXPECT_NEAR(player->values().position, 60, 0.1);
    ASSERT_TRUE(player->seek(5).ok());
    EXPECT_EQ(player->values().state, PlayerState::playing);
    EXPECT_TRUE(eventually([&] { return player->values().position > 5.1; }));
    EXPECT_LT(player->values().position, 59);
    // Beyond the end is the end.
    ASSERT_TRUE(player->seek(1000).ok());
    EXPECT_LE(player->values().position, 60);
    EXPECT_TRUE(becomes(*player, PlayerState::ended));
}

TEST_F(PlayerTest, PitchZeroHaltsAndAnotherGoesOn) {
    const std::string file = tone(120);
    const auto player = make("null");
    ASSERT_TRUE(player->load(file).ok());
    ASSERT_TRUE(becomes(*player, PlayerState::playing));
    ASSERT_TRUE(player->set_pitch(0).ok());
    EXPECT_EQ(player->values().state, PlayerState::halted);
    EXPECT_EQ(player->values().pitch, 0);
    const double halted = player->values().position;
    std::this_thread::sleep_for(std::chrono::milliseconds(200));
    EXPECT_NEAR(player->values().position, halted, 0.05);
    // Also after a seek, to the very position.
    ASSERT_TRUE(player->seek(30).ok());
    std::this_thread::sleep_for(std::chrono::milliseconds(200));
    EXPECT_EQ(player->values().position, 30);
    EXPECT_EQ(player->values().state, PlayerState::halted);
    ASSERT_TRUE(player->seek(halted).ok());
    ASSERT_TRUE(player->set_pitch(100).ok());
    EXPECT_TRUE(eventually([&] { return player->values().position > halted + 1; }));
}

TEST_F(PlayerTest, ASlowPitchNeverRunsAheadOfTheClock) {
    const std::string file = tone(60);
    const auto player = make("null");
    ASSERT_TRUE(player->set_pitch(0.1).ok());
    ASSERT_TRUE(player->load(file).ok());
    const auto begun = std::chrono::steady_clock::now();
    ASSERT_TRUE(eventually([&] { return player->values().position > 0.1; }));
    const std::chrono::duration<double> elapsed = std::chrono::steady_clock::now() - begun;
    // What is on its way to the output, a fifth of a second, may be counted already.
    EXPECT_GT(elapsed.count(), 0.5);
}

TEST_F(PlayerTest, WhatIsOutOfRangeIsRefusedAndChangesNothing) {
    const auto player = make("null");
    for (const double pitch : {-1.0, -0.01, 0.001, 100.5, std::nan(""), HUGE_VAL})
        EXPECT_EQ(player->set_pitch(pitch).error(), EINVAL) << pitch;
    for (const double volume : {-0.1, 1.1, std::nan(""), HUGE_VAL})
        EXPECT_EQ(player->set_volume(volume).error(), EINVAL) << volume;
    for (const double position : {-0.1, std::nan(""), HUGE_VAL})
        EXPECT_EQ(player->seek(position).error(), EINVAL) << position;
    EXPECT_EQ(player->values().pitch, 1);
    EXPECT_EQ(player->values().volume, 1);
}

TEST_F(PlayerTest, WhatCannotBePlayedHasItsReason) {
    test::write_file(path("text.mp3"), "Not a sound, whatever its name.\n");
    test::write_file(path("empty.mp3"), "");
    test::write_file(path("list.m3u"), "#EXTM3U\n" + tone(1) + "\n");
    std::filesystem::create_directory(path("folder"));
    struct Case {
        const char* leaf;
        PlayerFailure failure;
    };
    const Case cases[] = {
        {"gone.mp3", PlayerFailure::unreadable}, {"text.mp3", PlayerFailure::not_sound},
        {"empty.mp3", PlayerFailure::not_sound}, {"list.m3u", PlayerFailure::not_sound},
        {"folder", PlayerFailure::not_sound},
    };
    const auto player = make("null");
    for (const Case& entry : cases) {
        ASSERT_TRUE(player->load(path(entry.leaf)).ok());
        EXPECT_TRUE(becomes(*player, PlayerState::failed)) << entry.leaf;
        EXPECT_EQ(player->values().failure, entry.failure) << entry.leaf;
        EXPECT_EQ(player->seek(1).error(), ENOENT);
    }
    // The next one plays.
    ASSERT_TRUE(player->load(tone(60)).ok());
    EXPECT_TRUE(becomes(*player, PlayerState::playing));
    EXPECT_EQ(player->values().failure, PlayerFailure::none);
}

TEST_F(PlayerTest, AnOutputThatIsNotThereIsTheReason) {
    const std::string file = tone(60);
    const auto player = make("no-such-driver");
    ASSERT_TRUE(player->load(file).ok());
    EXPECT_TRUE(becomes(*player, PlayerState::failed));
    EXPECT_EQ(player->values().failure, PlayerFailure::no_output);
}

TEST_F(PlayerTest, OfFilesLoadedInARowTheLastOneCounts) {
    test::write_file(path("text.mp3"), "no sound");
    const std::string file = tone(60);
    const auto player = make("null");
    for (int round = 0; round < 10; ++round) {
        ASSERT_TRUE(player->load(path("text.mp3")).ok());
        ASSERT_TRUE(player->load(path("gone.mp3")).ok());
        ASSERT_TRUE(player->load(file).ok());
        ASSERT_TRUE(eventually([&] {
            EXPECT_NE(player->values().state, PlayerState::failed);
            return player->values().state == PlayerState::playing;
        }));
    }
}

TEST_F(PlayerTest, DecodersSayNothingWhenTheFirstPlayerHasGone) {
    const std::string file = tone(60);
    testing::internal::CaptureStderr();
    auto first = make("null");
    const auto second = make("null");
    first.reset();
    // Cut off in the middle of a packet.
    for (int round = 0; round < 20; ++round) {
        std::filesystem::resize_file(file, 4000001 - round * 2);
        ASSERT_TRUE(second->load(file).ok());
        ASSERT_TRUE(second->seek(45.2).ok());
        EXPECT_TRUE(becomes(*second, PlayerState::ended));
    }
    EXPECT_EQ(testing::internal::GetCapturedStderr(), "");
}

TEST_F(PlayerTest, NamesAreBytes) {
    test::write_tone(path("caf\xe9 #1%20?.wav"), 60, 440);
    const auto player = make("null");
    ASSERT_TRUE(player->load(path("caf\xe9 #1%20?.wav")).ok());
    EXPECT_TRUE(becomes(*player, PlayerState::playing));
}
