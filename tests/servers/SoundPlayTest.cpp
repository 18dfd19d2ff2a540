// The player as a program of its own: layers and their values.
#include "SoundPlayFixture.h"

#include <csignal>
#include <future>
#include <mutex>
#include <thread>

namespace {

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
