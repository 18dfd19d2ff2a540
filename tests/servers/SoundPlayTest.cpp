// The player as a program of its own, driven as the application drives it. The sound goes nowhere, at its
// pace.
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

#include <csignal>
#include <filesystem>
#include <functional>
#include <future>
#include <gtest/gtest.h>
#include <memory>
#include <mutex>
#include <sys/stat.h>
#include <thread>
#include <vector>

namespace {

bool Eventually(const std::function<bool()>& condition) {
    for (int round = 0; round < 4000; round++) {
        if (condition())
            return true;
        snooze(5'000);
    }
    return false;
}

bool PlayerRuns() {
    return be_roster->IsRunning("application/x-marcone-soundplay");
}

BMessage ValuesOf(const BMessenger& target) {
    ScriptMessage request(SCRIPTGETVALUES);
    BMessage answer;
    EXPECT_EQ(target.SendMessage(&request, &answer, 10'000'000, 10'000'000), B_OK);
    return answer;
}

std::string StateOf(const sptrackinfo* layer) {
    return ValuesOf(*layer->messenger).GetString("state", "");
}

double PositionOf(const sptrackinfo* layer) {
    return ValuesOf(*layer->messenger).GetDouble("position", -1);
}

bool Becomes(const sptrackinfo* layer, const char* state) {
    return Eventually([&] { return StateOf(layer) == state; });
}

// An application that runs in a thread of its own and remembers what is answered to it.
class Listener {
  public:
    Listener()
        : mThread([this] {
              Application application(*this);
              application.Run();
          }) {
        mReady.get_future().wait();
    }
    ~Listener() {
        be_app_messenger.SendMessage(B_QUIT_REQUESTED);
        mThread.join();
    }
    Listener(const Listener&) = delete;
    Listener& operator=(const Listener&) = delete;

    std::vector<BMessage> Answers() {
        const std::lock_guard lock(mMutex);
        return mAnswers;
    }

  private:
    class Application : public BApplication {
      public:
        explicit Application(Listener& listener)
            : BApplication("application/x-vnd.Test-Listener"), mListener(listener) {}
        void ReadyToRun() override { mListener.mReady.set_value(); }
        void MessageReceived(BMessage* message) override {
            if (message->what != B_REPLY) {
                BApplication::MessageReceived(message);
                return;
            }
            const std::lock_guard lock(mListener.mMutex);
            mListener.mAnswers.push_back(*message);
        }

      private:
        Listener& mListener;
    };

    std::promise<void> mReady;
    std::mutex mMutex;
    std::vector<BMessage> mAnswers;
    std::thread mThread;
};

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

} // namespace

TEST_F(SoundPlayTest, ItIsLaunchedOnDemandPlaysAndEndsWithItsClient) {
    entry_ref song = Tone("song.wav", 60);
    auto scripter = std::make_unique<SoundplayScripter>();
    EXPECT_FALSE(PlayerRuns());
    sptrackinfo* layer = nullptr;
    EXPECT_EQ(Printed([&] { layer = scripter->NewLayer(&song, nullptr); }),
              "Soundplay connection succeeded\nGetValues:\n");
    ASSERT_NE(layer, nullptr);
    ASSERT_TRUE(layer->messenger->IsValid());
    EXPECT_TRUE(PlayerRuns());
    EXPECT_TRUE(Becomes(layer, "playing"));
    const double first = PositionOf(layer);
    EXPECT_TRUE(Eventually([&] { return PositionOf(layer) > first; }));
    EXPECT_EQ(Printed([&] { scripter.reset(); }), "");
    EXPECT_TRUE(Eventually([] { return !PlayerRuns(); }));
}

TEST_F(SoundPlayTest, ItOutlivesAClientThatFoundItRunning) {
    entry_ref song = Tone("song.wav", 60);
    const auto player = StartPlayer();
    auto scripter = std::make_unique<SoundplayScripter>();
    ASSERT_NE(scripter->NewLayer(&song, nullptr), nullptr);
    scripter.reset();
    EXPECT_TRUE(PlayerRuns());
    const test::ProgramResult end = EndOf(*player);
    EXPECT_EQ(end.status, 0);
    EXPECT_EQ(end.errors, "");
}

TEST_F(SoundPlayTest, ALayerTellsItsValues) {
    entry_ref song = Tone("caf\xe9.wav", 60);
    const auto player = StartPlayer();
    SoundplayScripter scripter;
    sptrackinfo* const layer = scripter.NewLayer(&song, nullptr);
    ASSERT_TRUE(Becomes(layer, "playing"));
    const BMessage values = ValuesOf(*layer->messenger);
    EXPECT_EQ(values.GetInt32("layer", -1), 1);
    EXPECT_STREQ(values.GetString("name", ""), "caf\xe9.wav");
    EXPECT_EQ(values.GetString("path", ""), Path("caf\xe9.wav"));
    EXPECT_STREQ(values.GetString("error", "?"), "");
    EXPECT_EQ(values.GetDouble("pitch", -1), 1);
    EXPECT_EQ(values.GetDouble("volume", -1), 1);
    EXPECT_NEAR(values.GetDouble("length", -1), 60, 0.001);
    EXPECT_EQ(values.CountNames(B_ANY_TYPE), 9);
}

TEST_F(SoundPlayTest, TheValuesThatAreAskedForGoToTheApplication) {
    entry_ref song = Tone("song.wav", 60);
    const auto player = StartPlayer();
    mApplication.reset();
    Listener listener;
    SoundplayScripter scripter;
    sptrackinfo* const layer = scripter.NewLayer(&song, nullptr);
    scripter.RepitchLayer(layer, 1.5);
    EXPECT_EQ(Printed([&] { scripter.UpdateLayerInfo(layer); }), "Reply to SCRIPTGETVALUES: \n");
    ASSERT_TRUE(Eventually([&] { return listener.Answers().size() == 1; }));
    EXPECT_EQ(listener.Answers()[0].GetDouble("pitch", -1), 1.5);
    // Other commands are not answered for.
    scripter.SeekLayer(layer, 5);
    scripter.UpdateLayerInfo(layer);
    ASSERT_TRUE(Eventually([&] { return listener.Answers().size() == 2; }));
    EXPECT_GE(listener.Answers()[1].GetDouble("position", -1), 5);
}

TEST_F(SoundPlayTest, SeekPitchAndVolumeAreTakenAndKeptForTheNextTrack) {
    entry_ref song = Tone("song.wav", 100);
    entry_ref other = Tone("other.wav", 50);
    const auto player = StartPlayer();
    SoundplayScripter scripter;
    sptrackinfo* const layer = scripter.NewLayer(&song, nullptr);
    // Before the file is open, too.
    scripter.SeekLayer(layer, 40);
    scripter.RepitchLayer(layer, 0.5);
    scripter.SetLevel(layer, 0.25f);
    ASSERT_TRUE(Becomes(layer, "playing"));
    EXPECT_GE(PositionOf(layer), 40);
    scripter.SeekLayer(layer, 10);
    EXPECT_TRUE(Eventually([&] { return PositionOf(layer) < 40 && PositionOf(layer) > 10; }));
    scripter.SetLayerTrack(layer, &other);
    EXPECT_TRUE(Eventually([&] { return ValuesOf(*layer->messenger).GetDouble("length", -1) == 50; }));
    const BMessage values = ValuesOf(*layer->messenger);
    EXPECT_STREQ(values.GetString("name", ""), "other.wav");
    EXPECT_LT(values.GetDouble("position", 99), 40);
    EXPECT_EQ(values.GetDouble("pitch", -1), 0.5);
    EXPECT_EQ(values.GetDouble("volume", -1), 0.25);
}

TEST_F(SoundPlayTest, PitchIsHowFastATrackPlays) {
    entry_ref song = Tone("song.wav", 60);
    const auto player = StartPlayer();
    SoundplayScripter scripter;
    sptrackinfo* const fast = scripter.NewLayer(&song, nullptr);
    sptrackinfo* const slow = scripter.NewLayer(&song, nullptr);
    ASSERT_TRUE(Becomes(fast, "playing"));
    ASSERT_TRUE(Becomes(slow, "playing"));
    scripter.RepitchLayer(fast, 20);
    scripter.RepitchLayer(slow, 0.05);
    const bigtime_t begun = system_time();
    const double first = PositionOf(slow);
    EXPECT_TRUE(Becomes(fast, "ended"));
    const double elapsed = static_cast<double>(system_time() - begun) / 1e6;
    // A minute's track in three seconds, or a little more.
    EXPECT_LT(elapsed, 59);
    EXPECT_GT(elapsed, 1);
    EXPECT_LT(PositionOf(slow) - first, elapsed);
    // Halted it stays where it is.
    scripter.RepitchLayer(slow, 0);
    EXPECT_EQ(StateOf(slow), "halted");
    const double halted = PositionOf(slow);
    snooze(300'000);
    EXPECT_NEAR(PositionOf(slow), halted, 0.01);
}

TEST_F(SoundPlayTest, AfterTheEndASeekGoesOn) {
    entry_ref song = Tone("song.wav", 30);
    const auto player = StartPlayer();
    SoundplayScripter scripter;
    sptrackinfo* const layer = scripter.NewLayer(&song, nullptr);
    scripter.SeekLayer(layer, 1000);
    EXPECT_TRUE(Becomes(layer, "ended"));
    EXPECT_NEAR(PositionOf(layer), 30, 0.1);
    scripter.SeekLayer(layer, 3);
    EXPECT_TRUE(Becomes(layer, "playing"));
    EXPECT_LT(PositionOf(layer), 30);
}

TEST_F(SoundPlayTest, ADeletedLayerIsGoneAndItsNumberFree) {
    entry_ref song = Tone("song.wav", 60);
    const auto player = StartPlayer();
    SoundplayScripter scripter;
    sptrackinfo* const first = scripter.NewLayer(&song, nullptr);
    sptrackinfo* const second = scripter.NewLayer(&song, nullptr);
    const BMessenger messenger = *first->messenger;
    EXPECT_EQ(ValuesOf(*second->messenger).GetInt32("layer", -1), 2);
    scripter.DeleteLayer(first);
    sptrackinfo* const third = scripter.NewLayer(&song, nullptr);
    EXPECT_EQ(ValuesOf(*third->messenger).GetInt32("layer", -1), 1);
    EXPECT_FALSE(messenger.IsValid());
    EXPECT_TRUE(second->messenger->IsValid());
}

TEST_F(SoundPlayTest, SixteenLayersPlayTogetherAndNoMore) {
    entry_ref song = Tone("song.wav", 60);
    const auto player = StartPlayer();
    SoundplayScripter scripter;
    std::vector<sptrackinfo*> layers;
    for (int count = 0; count < 16; count++)
        layers.push_back(scripter.NewLayer(&song, nullptr));
    for (const sptrackinfo* layer : layers)
        EXPECT_TRUE(Becomes(layer, "playing"));
    sptrackinfo* const refused = scripter.NewLayer(&song, nullptr);
    ASSERT_NE(refused, nullptr);
    EXPECT_FALSE(refused->messenger->IsValid());
    // All of them, in the order of their numbers.
    const BMessage list = ValuesOf(BMessenger(kSoundPlaySignature));
    for (int32 index = 0; index < 16; index++) {
        int32 number = 0;
        BMessenger messenger;
        EXPECT_EQ(list.FindInt32("layer", index, &number), B_OK);
        EXPECT_EQ(number, index + 1);
        EXPECT_EQ(list.FindMessenger("messenger", index, &messenger), B_OK);
        EXPECT_EQ(messenger, *layers[static_cast<size_t>(index)]->messenger);
    }
    EXPECT_FALSE(list.HasInt32("layer", 16));
    // Where one ends there is room for another.
    scripter.DeleteLayer(layers[6]);
    sptrackinfo* const next = scripter.NewLayer(&song, nullptr);
    EXPECT_EQ(ValuesOf(*next->messenger).GetInt32("layer", -1), 7);
    const test::ProgramResult end = EndOf(*player);
    EXPECT_EQ(end.status, 0);
    EXPECT_EQ(end.errors, "soundplay: there are 16 layers already\n");
}

TEST_F(SoundPlayTest, WhatCannotBePlayedIsSaidInOneLine) {
    test::write_file(Path("text.mp3"), "no sound");
    test::write_file(Path("two\nlines.mp3"), "no sound");
    std::filesystem::create_directory(Path("folder"));
    ASSERT_EQ(mkfifo(Path("pipe").c_str(), 0600), 0);
    entry_ref song = Tone("song.wav", 60);
    entry_ref gone = song;
    gone.set_name("gone.mp3");
    const auto player = StartPlayer();
    SoundplayScripter scripter;
    sptrackinfo* const layer = scripter.NewLayer(&song, nullptr);
    struct Case {
        entry_ref ref;
        std::string error;
        std::string line;
    };
    const Case cases[] = {
        {RefOf("text.mp3"), "holds no sound that can be played",
         Path("text.mp3") + ": holds no sound that can be played"},
        {RefOf("two\nlines.mp3"), "holds no sound that can be played",
         Path("two\\x0alines.mp3") + ": holds no sound that can be played"},
        {RefOf("folder"), "is no file", Path("folder") + ": is no file"},
        {RefOf("pipe"), "is no file", Path("pipe") + ": is no file"},
        {gone, "is not there", Path("gone.mp3") + ": is not there"},
    };
    std::string lines;
    for (const Case& entry : cases) {
        entry_ref ref = entry.ref;
        scripter.SetLayerTrack(layer, &ref);
        EXPECT_TRUE(Becomes(layer, "failed")) << entry.line;
        EXPECT_EQ(ValuesOf(*layer->messenger).GetString("error", ""), entry.error);
        lines += "soundplay: " + entry.line + "\n";
    }
    scripter.SetLayerTrack(layer, &song);
    EXPECT_TRUE(Becomes(layer, "playing"));
    scripter.RepitchLayer(layer, -1);
    scripter.SeekLayer(layer, -2);
    scripter.SetLevel(layer, 1.5f);
    EXPECT_EQ(ValuesOf(*layer->messenger).GetDouble("pitch", -1), 1);
    lines += "soundplay: layer 1: cannot take the pitch -1\n"
             "soundplay: layer 1: cannot take the position -2\n"
             "soundplay: layer 1: cannot take the volume 1.5\n";
    const test::ProgramResult end = EndOf(*player);
    EXPECT_EQ(end.status, 0);
    EXPECT_EQ(end.errors, lines);
}

TEST_F(SoundPlayTest, LayersOfAProcessThatIsKilledEndAndThoseOfOthersPlayOn) {
    entry_ref song = Tone("song.wav", 60);
    const auto player = StartPlayer();
    SoundplayScripter scripter;
    sptrackinfo* const layer = scripter.NewLayer(&song, nullptr);
    test::Program other(QUIRNELCTL, {"layer", "play", Path("song.wav")});
    const BMessenger application(kSoundPlaySignature);
    ASSERT_TRUE(Eventually([&] { return ValuesOf(application).HasInt32("layer", 1); }));
    other.signal(SIGKILL);
    other.wait();
    EXPECT_TRUE(Eventually([&] { return !ValuesOf(application).HasInt32("layer", 1); }));
    EXPECT_TRUE(ValuesOf(application).HasInt32("layer", 0));
    EXPECT_TRUE(layer->messenger->IsValid());
    EXPECT_EQ(StateOf(layer), "playing");
}

TEST_F(SoundPlayTest, MessagesThatMeanNothingAreAnsweredSoAndChangeNothing) {
    entry_ref song = Tone("song.wav", 60);
    const auto player = StartPlayer();
    SoundplayScripter scripter;
    sptrackinfo* const layer = scripter.NewLayer(&song, nullptr);
    ASSERT_TRUE(Becomes(layer, "playing"));
    const BMessenger application(kSoundPlaySignature);
    const auto answer = [](const BMessenger& target, BMessage message) {
        BMessage reply;
        EXPECT_EQ(target.SendMessage(&message, &reply, 10'000'000, 10'000'000), B_OK);
        return reply;
    };
    for (const int32 command : {-1, 0, 2, 3, 4, 6})
        EXPECT_EQ(answer(application, ScriptMessage(command)).what, B_MESSAGE_NOT_UNDERSTOOD) << command;
    for (const int32 command : {-1, 0, 1, 2, 6})
        EXPECT_EQ(answer(*layer->messenger, ScriptMessage(command)).what, B_MESSAGE_NOT_UNDERSTOOD)
            << command;
    EXPECT_EQ(answer(application, BMessage('abra')).what, B_MESSAGE_NOT_UNDERSTOOD);
    // Nothing to set, and a value of another type.
    EXPECT_EQ(answer(*layer->messenger, ScriptMessage(SCRIPTSETVALUES)).GetInt32("status", -1), B_OK);
    ScriptMessage whole(SCRIPTSETVALUES);
    whole.AddInt32("pitch", 2);
    EXPECT_EQ(answer(*layer->messenger, whole).GetInt32("status", -1), B_OK);
    ScriptMessage wrong(SCRIPTSETVALUES);
    wrong.AddDouble("volume", 2);
    EXPECT_EQ(answer(*layer->messenger, wrong).GetInt32("status", 0), B_BAD_VALUE);
    EXPECT_EQ(ValuesOf(*layer->messenger).GetDouble("pitch", -1), 1);
    EXPECT_EQ(application.SendMessage(B_MINIMIZE), B_OK);
    EXPECT_EQ(StateOf(layer), "playing");
}

TEST_F(SoundPlayTest, WithoutASoundOutputTheReasonIsTold) {
    mEnvironment.set("SOUNDPLAY_OUTPUT", "no-such-driver");
    entry_ref song = Tone("song.wav", 60);
    const auto player = StartPlayer();
    SoundplayScripter scripter;
    sptrackinfo* const layer = scripter.NewLayer(&song, nullptr);
    EXPECT_TRUE(Becomes(layer, "failed"));
    const test::ProgramResult end = EndOf(*player);
    EXPECT_EQ(end.errors, "soundplay: " + Path("song.wav") + ": cannot be heard: there is no sound output\n");
}

TEST_F(SoundPlayTest, ASignalEndsItInOrder) {
    entry_ref song = Tone("song.wav", 60);
    const auto player = StartPlayer();
    SoundplayScripter scripter;
    ASSERT_TRUE(Becomes(scripter.NewLayer(&song, nullptr), "playing"));
    player->signal(SIGTERM);
    const test::ProgramResult end = player->wait();
    EXPECT_EQ(end.status, 0);
    EXPECT_EQ(end.errors, "");
}
