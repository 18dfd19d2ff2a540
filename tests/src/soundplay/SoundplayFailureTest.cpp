// The remote control where something fails: a line on standard output each time, and nothing else.
#include "SoundplayScripterFixture.h"

#include <csignal>
#include <new>

namespace {

thread_local bool memoryIsShort = false;

// There is no memory for what can do without.
class ShortMemory {
  public:
    ShortMemory() { memoryIsShort = true; }
    ~ShortMemory() { memoryIsShort = false; }
    ShortMemory(const ShortMemory&) = delete;
    ShortMemory& operator=(const ShortMemory&) = delete;
};

} // namespace

void* operator new(std::size_t size, const std::nothrow_t&) noexcept {
    if (memoryIsShort)
        return nullptr;
    try {
        return ::operator new(size);
    } catch (const std::bad_alloc&) {
        return nullptr;
    }
}

TEST_F(SoundplayScripterTest, APlayerThatCannotBeStartedIsSaidAndThereIsNoLayer) {
    SoundplayScripter scripter;
    sptrackinfo* layer = nullptr;
    // It ends before it runs.
    Install("/bin/false");
    EXPECT_EQ(Printed([&] { layer = scripter.NewLayer(&mSong, nullptr); }),
              "Error -2147475451 while launching SoundPlay\n");
    EXPECT_EQ(layer, nullptr);
    EXPECT_EQ(Printed([&] { scripter.QuitSoundPlay(); }), "");
}

TEST_F(SoundplayScripterTest, AFailedStartLeavesThePlayerThatSomebodyElseStartsRunning) {
    Install("/bin/false");
    auto scripter = std::make_unique<SoundplayScripter>();
    EXPECT_EQ(Printed([&] { scripter->StartSoundPlay(); }), "Error -2147475451 while launching SoundPlay\n");
    const auto player = StartPlayer();
    EXPECT_EQ(Printed([&] { scripter->BuildConnection(); }), "Soundplay connection succeeded\n");
    EXPECT_EQ(Printed([&] { scripter.reset(); }), "");
    EXPECT_TRUE(LogBecomes(std::string("ready\n") + kMinimize)) << Log();
    EXPECT_TRUE(player->running());
    EXPECT_TRUE(be_roster->IsRunning(kSoundPlaySignature));
}

TEST_F(SoundplayScripterTest, AConnectionToNobodySucceedsAndItsLayersAreThoseThatNothingReaches) {
    Install();
    auto scripter = std::make_unique<SoundplayScripter>();
    EXPECT_EQ(Printed([&] { scripter->BuildConnection(); }), "Soundplay connection succeeded\n");
    sptrackinfo* layer = nullptr;
    EXPECT_EQ(Printed([&] { layer = scripter->NewLayer(&mSong, nullptr); }), "GetValues:\n");
    ASSERT_NE(layer, nullptr);
    EXPECT_FALSE(layer->messenger->IsValid());
    // In the list all the same.
    EXPECT_EQ(Printed([&] { scripter->RepitchLayer(layer, 2); }), "");
    EXPECT_EQ(Printed([&] { scripter.reset(); }), "");
    EXPECT_FALSE(be_roster->IsRunning(kSoundPlaySignature));
    EXPECT_EQ(Log(), "");
}

TEST_F(SoundplayScripterTest, WithoutAMessengerThereIsNoConnection) {
    const auto player = StartPlayer();
    std::unique_ptr<SoundplayScripter> scripter;
    EXPECT_EQ(Printed([&] {
                  const ShortMemory shortage;
                  scripter = std::make_unique<SoundplayScripter>();
              }),
              "SoundPlay already running, establishing connection..."
              "SoundplayScripter::SoundplayScripter() SP running, but not running anymore ? Connection "
              "failed.\n");
    sptrackinfo* layer = nullptr;
    Install();
    EXPECT_EQ(Printed([&] {
                  const ShortMemory shortage;
                  layer = scripter->NewLayer(&mSong, nullptr);
              }),
              "Soundplay already ran...\nERROR: Can't build a connection to SoundPlay\n");
    EXPECT_EQ(layer, nullptr);
    EXPECT_EQ(Printed([&] { scripter->QuitSoundPlay(); }), "");
    // The next one tries again.
    EXPECT_EQ(Printed([&] { layer = scripter->NewLayer(&mSong, nullptr); }),
              "Soundplay already ran...\nSoundplay connection succeeded\nGetValues:\n");
    ASSERT_NE(layer, nullptr);
    EXPECT_TRUE(LogBecomes(std::string("ready\n") + kMinimize + NewLayerLine(*layer) + kNewRef)) << Log();
}

TEST_F(SoundplayScripterTest, APlayerThatTakesNoMessagesLeavesALayerThatNothingReaches) {
    const auto player = StartPlayer();
    SoundplayScripter scripter;
    player->signal(SIGSTOP);
    sptrackinfo* layer = nullptr;
    const bigtime_t begun = system_time();
    EXPECT_EQ(Printed([&] { layer = scripter.NewLayer(&mSong, nullptr); }), "GetValues:\n");
    EXPECT_GE(system_time() - begun, 3'000'000);
    player->signal(SIGCONT);
    ASSERT_NE(layer, nullptr);
    EXPECT_FALSE(layer->messenger->IsValid());
    EXPECT_EQ(Printed([&] { scripter.SeekLayer(layer, 2); }), "");
    EXPECT_EQ(Printed([&] { scripter.DeleteLayer(layer); }), "");
}

TEST_F(SoundplayScripterTest, ALayerThatIsNotOpenIsRefusedWithItsText) {
    const auto player = StartPlayer();
    SoundplayScripter scripter;
    sptrackinfo* const layer = scripter.NewLayer(&mSong, nullptr);
    const std::string log = "ready\n" + NewLayerLine(*layer) + kNewRef;
    ASSERT_TRUE(LogBecomes(log)) << Log();
    // A record with the layer's own messenger is still not the layer's record.
    sptrackinfo stranger = *layer;
    struct Case {
        std::function<void()> command;
        const char* printed;
    };
    const Case cases[] = {
        {[&] { scripter.DeleteLayer(&stranger); }, "SoundplayScripter::DeleteLayer: layer not found\n"},
        {[&] { scripter.UpdateLayerInfo(&stranger); },
         "SoundplayScripter::UpdateLayerInfo: layer not found\n"},
        {[&] { scripter.RepitchLayer(&stranger, 2); }, "SoundplayScripter::RepitchLayer: layer not found\n"},
        {[&] { scripter.SeekLayer(&stranger, 2); }, "SoundplayScripter::SeekLayer: layer not found\n"},
        {[&] { scripter.SetLevel(&stranger, 0.5f); },
         "SoundplayScripter::SetLevel(): 0.500000\nSoundplayScripter::SeekLayer: layer not found\n"},
        {[&] { scripter.DeleteLayer(nullptr); }, "SoundplayScripter::DeleteLayer: layer not found\n"},
    };
    for (const Case& entry : cases)
        EXPECT_EQ(Printed(entry.command), entry.printed);
    // The layer is open as before, and what it gets next is what is sent next.
    EXPECT_EQ(Printed([&] { scripter.SeekLayer(layer, 7); }), "");
    const std::string sought = log + "layer 61627261 command=int32 4 abspos=double 7\n";
    EXPECT_TRUE(LogBecomes(sought)) << Log();
    // A track is for any record.
    EXPECT_EQ(Printed([&] { scripter.SetLayerTrack(&stranger, &mSong); }), "");
    EXPECT_TRUE(LogBecomes(sought + kNewRef)) << Log();
    scripter.DeleteLayer(layer);
    EXPECT_TRUE(LogBecomes(sought + kNewRef + "layer 61627261 command=int32 3\n")) << Log();
    for (const Case& entry : cases)
        EXPECT_EQ(Printed(entry.command), entry.printed);
}

TEST_F(SoundplayScripterTest, APlayerThatDoesNotAnswerLeavesALayerThatNothingReaches) {
    mEnvironment.set("TEST_PLAYER_MODE", "silent");
    const auto player = StartPlayer();
    SoundplayScripter scripter;
    sptrackinfo* layer = nullptr;
    const bigtime_t begun = system_time();
    EXPECT_EQ(Printed([&] { layer = scripter.NewLayer(&mSong, nullptr); }), "GetValues:\n");
    EXPECT_GE(system_time() - begun, 3'000'000);
    ASSERT_NE(layer, nullptr);
    EXPECT_FALSE(layer->messenger->IsValid());
    EXPECT_EQ(Printed([&] {
                  scripter.RepitchLayer(layer, 2);
                  scripter.SeekLayer(layer, 2);
                  scripter.UpdateLayerInfo(layer);
                  scripter.DeleteLayer(layer);
              }),
              "Reply to SCRIPTGETVALUES: \n");
    EXPECT_EQ(Printed([&] { scripter.DeleteLayer(layer); }),
              "SoundplayScripter::DeleteLayer: layer not found\n");
}

TEST_F(SoundplayScripterTest, AnAnswerWithoutMessengerLeavesALayerThatNothingReaches) {
    mEnvironment.set("TEST_PLAYER_MODE", "nameless");
    const auto player = StartPlayer();
    SoundplayScripter scripter;
    sptrackinfo* layer = nullptr;
    EXPECT_EQ(Printed([&] { layer = scripter.NewLayer(&mSong, nullptr); }), "GetValues:\n");
    ASSERT_NE(layer, nullptr);
    EXPECT_FALSE(layer->messenger->IsValid());
    const std::string log = "ready\n" + NewLayerLine(*layer);
    EXPECT_EQ(Printed([&] { scripter.SeekLayer(layer, 2); }), "");
    EXPECT_EQ(Printed([&] { scripter.SetLayerTrack(layer, &mSong); }), "error sending opentrack\n");
    EXPECT_EQ(Printed([&] { scripter.DeleteLayer(layer); }), "");
    // Nothing was sent to a layer.
    EXPECT_EQ(Log(), log);
}

TEST_F(SoundplayScripterTest, ALayerThatEndsBeforeItsTrackIsSaidAndStaysInTheList) {
    mEnvironment.set("TEST_PLAYER_MODE", "gone");
    const auto player = StartPlayer();
    SoundplayScripter scripter;
    sptrackinfo* layer = nullptr;
    EXPECT_EQ(Printed([&] { layer = scripter.NewLayer(&mSong, nullptr); }),
              "GetValues:\nerror sending opentrack\n");
    ASSERT_NE(layer, nullptr);
    const std::string log = "ready\n" + NewLayerLine(*layer);
    EXPECT_EQ(Printed([&] { scripter.RepitchLayer(layer, 2); }), "");
    EXPECT_EQ(Printed([&] { scripter.DeleteLayer(layer); }), "");
    EXPECT_EQ(Log(), log);
}

TEST_F(SoundplayScripterTest, APlayerThatDiesIsNotNoticedButByTheTrack) {
    const auto player = StartPlayer();
    SoundplayScripter scripter;
    sptrackinfo* const layer = scripter.NewLayer(&mSong, nullptr);
    ASSERT_NE(layer, nullptr);
    player->signal(SIGKILL);
    player->wait();
    EXPECT_EQ(Printed([&] {
                  scripter.RepitchLayer(layer, 2);
                  scripter.SeekLayer(layer, 2);
              }),
              "");
    EXPECT_EQ(Printed([&] { scripter.SetLayerTrack(layer, &mSong); }), "error sending opentrack\n");
    EXPECT_EQ(Printed([&] { scripter.DeleteLayer(layer); }), "");
    // Connected it stays: there is no other start, and the layer is one that nothing reaches.
    sptrackinfo* orphan = nullptr;
    EXPECT_EQ(Printed([&] { orphan = scripter.NewLayer(&mSong, nullptr); }), "GetValues:\n");
    ASSERT_NE(orphan, nullptr);
    EXPECT_FALSE(orphan->messenger->IsValid());
    EXPECT_EQ(Printed([&] { scripter.DeleteLayer(orphan); }), "");
}
