// Random commands on four layers of the player, for minutes: it neither grows nor stumbles.
// QUIRNEL_SOAK_SECONDS: how long, six hundred seconds unless it is set.
#include "soundplay/ScriptMessage.h"
#include "soundplay/SoundplayScripter.h"
#include "support/captured_output.h"
#include "support/program.h"
#include "support/random_seed.h"
#include "support/sound_file.h"
#include "support/temporary_environment.h"

#include <Application.h>
#include <Entry.h>
#include <OS.h>
#include <Roster.h>

#include <algorithm>
#include <array>
#include <cstdlib>
#include <filesystem>
#include <gtest/gtest.h>
#include <random>
#include <sstream>
#include <vector>

namespace {

// What a process holds at a moment.
struct Holdings {
    long kilobytes = 0;
    long threads = 0;
    long descriptors = 0;
};

Holdings HoldingsOf(team_id process) {
    const std::string directory = "/proc/" + std::to_string(process);
    Holdings holdings;
    std::istringstream status(test::read_file(directory + "/status"));
    for (std::string word; status >> word;) {
        if (word == "VmRSS:")
            status >> holdings.kilobytes;
        else if (word == "Threads:")
            status >> holdings.threads;
    }
    for ([[maybe_unused]] const auto& entry : std::filesystem::directory_iterator(directory + "/fd"))
        holdings.descriptors++;
    return holdings;
}

// The middle value of each, of those between these parts of all moments.
Holdings MiddleOf(const std::vector<Holdings>& all, double from, double to) {
    const auto count = static_cast<double>(all.size());
    const std::vector<Holdings> part(all.begin() + static_cast<std::ptrdiff_t>(count * from),
                                     all.begin() + static_cast<std::ptrdiff_t>(count * to));
    const auto middle = [&](long Holdings::*field) {
        std::vector<long> values;
        for (const Holdings& holdings : part)
            values.push_back(holdings.*field);
        std::sort(values.begin(), values.end());
        return values.empty() ? 0 : values[values.size() / 2];
    };
    return {middle(&Holdings::kilobytes), middle(&Holdings::threads), middle(&Holdings::descriptors)};
}

class Client {
  public:
    Client(SoundplayScripter& scripter, std::vector<entry_ref> tracks, std::uint64_t seed)
        : mScripter(scripter), mTracks(std::move(tracks)), mRandom(seed) {
        for (sptrackinfo*& layer : mLayers)
            layer = Open();
    }
    ~Client() {
        for (sptrackinfo* layer : mLayers)
            mScripter.DeleteLayer(layer);
    }

    void Step() {
        sptrackinfo*& layer = mLayers[Number(mLayers.size())];
        mSteps++;
        switch (Number(24)) {
        case 0:
            mScripter.DeleteLayer(layer);
            layer = Open();
            break;
        case 1:
        case 2:
            mScripter.SetLayerTrack(layer, &mTracks[Number(mTracks.size())]);
            break;
        case 3:
        case 4:
        case 5:
            mScripter.RepitchLayer(layer, std::array{0.0, 0.01, 0.5, 1.0, 3.0, 100.0, -1.0}[Number(7)]);
            break;
        case 6:
        case 7:
        case 8:
        case 9:
            mScripter.SeekLayer(layer, std::array{0.0, 0.5, 3.0, 19.9, 1000.0, -1.0}[Number(6)]);
            break;
        case 10:
        case 11:
            mScripter.SetLevel(layer, std::array{0.0f, 0.3f, 1.0f, 2.0f}[Number(4)]);
            break;
        default:
            Look(layer);
        }
    }
    long Steps() const { return mSteps; }

  private:
    size_t Number(size_t below) { return static_cast<size_t>(mRandom() % below); }
    sptrackinfo* Open() {
        sptrackinfo* const layer = mScripter.NewLayer(&mTracks[Number(mTracks.size())], nullptr);
        EXPECT_TRUE(layer != nullptr && layer->messenger->IsValid());
        return layer;
    }
    static void Look(const sptrackinfo* layer) {
        ScriptMessage request(SCRIPTGETVALUES);
        BMessage answer;
        ASSERT_EQ(layer->messenger->SendMessage(&request, &answer, 30'000'000, 30'000'000), B_OK);
        const double length = answer.GetDouble("length", -2);
        const double position = answer.GetDouble("position", -2);
        ASSERT_GE(position, 0);
        if (length >= 0) {
            ASSERT_LE(position, length);
        }
    }

    SoundplayScripter& mScripter;
    std::vector<entry_ref> mTracks;
    std::mt19937_64 mRandom;
    std::array<sptrackinfo*, 4> mLayers{};
    long mSteps = 0;
};

} // namespace

TEST(SoundPlaySoakTest, RandomCommandsOnFourLayersLeaveNothingBehind) {
    test::TemporaryEnvironment environment;
    environment.set("SOUNDPLAY_OUTPUT", "null");
    // What is freed is free again at once, so that growth is growth.
    environment.set("ASAN_OPTIONS", "quarantine_size_mb=0:thread_local_quarantine_size_kb=0");
    const BApplication application("application/x-vnd.Test-Client");
    std::vector<entry_ref> tracks(5);
    test::write_tone(environment.root() + "/20.wav", 20, 440);
    test::write_tone(environment.root() + "/half.wav", 0.5, 880);
    test::write_tone(environment.root() + "/cut.wav", 2, 440);
    std::filesystem::resize_file(environment.root() + "/cut.wav", 100'001);
    test::write_file(environment.root() + "/text.mp3", "no sound");
    size_t at = 0;
    for (const char* leaf : {"20.wav", "half.wav", "cut.wav", "text.mp3", "gone.mp3"})
        BEntry((environment.root() + "/" + leaf).c_str()).GetRef(&tracks[at++]);

    const char* const given = std::getenv("QUIRNEL_SOAK_SECONDS");
    const bigtime_t duration = (given != nullptr ? std::atoll(given) : 600) * bigtime_t{1'000'000};
    test::Program player(SOUNDPLAY, {});
    while (!be_roster->IsRunning(kSoundPlaySignature))
        snooze(10'000);
    const team_id process = be_roster->TeamFor(kSoundPlaySignature);
    const std::uint64_t seed = RandomSeed();

    std::vector<Holdings> all;
    long steps = 0;
    {
        CapturedOutput silence;
        SoundplayScripter scripter;
        Client client(scripter, tracks, seed);
        const bigtime_t begun = system_time();
        while (system_time() - begun < duration && !testing::Test::HasFailure()) {
            for (int step = 0; step < 20; step++)
                client.Step();
            all.push_back(HoldingsOf(process));
            snooze(2'000);
        }
        steps = client.Steps();
    }
    // A tenth of the time to come to its size.
    const Holdings early = MiddleOf(all, 0.1, 0.3);
    const Holdings late = MiddleOf(all, 0.8, 1);
    std::printf("%ld commands; memory %ld -> %ld kB, threads %ld -> %ld, descriptors %ld -> %ld\n", steps,
                early.kilobytes, late.kilobytes, early.threads, late.threads, early.descriptors,
                late.descriptors);
    // Four layers do not hold the same at every moment; a layer has about five threads.
    EXPECT_LT(late.kilobytes, early.kilobytes * 5 / 4);
    EXPECT_LE(late.threads, early.threads + 8);
    EXPECT_LE(late.descriptors, early.descriptors + 8);

    EXPECT_EQ(BMessenger(kSoundPlaySignature).SendMessage(B_QUIT_REQUESTED), B_OK);
    const test::ProgramResult end = player.wait();
    EXPECT_EQ(end.status, 0);
    for (const std::string& line : test::lines_of(end.errors))
        EXPECT_EQ(line.rfind("soundplay: ", 0), 0u) << line;
}
