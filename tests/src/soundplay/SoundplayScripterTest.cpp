// What the remote control sends, and when it starts and ends the player.
#include "SoundplayScripterFixture.h"
#include "soundplay/ScriptMessage.h"

TEST_F(SoundplayScripterTest, AScriptMessageIsItsCommandFromTheBeginning) {
    const ScriptMessage message(SCRIPTSETVALUES);
    EXPECT_EQ(message.what, 1633841761u);
    EXPECT_EQ(message.GetInt32("command", -1), 4);
    EXPECT_EQ(message.CountNames(B_ANY_TYPE), 1);
    EXPECT_EQ(SCRIPTNEWLAYER, 1);
    EXPECT_EQ(SCRIPTDELETELAYER, 3);
    EXPECT_EQ(SCRIPTGETVALUES, 5);
}

TEST_F(SoundplayScripterTest, MakingAndDeletingItStartsNoPlayer) {
    Install();
    EXPECT_EQ(Printed([] { SoundplayScripter scripter; }), "");
    EXPECT_FALSE(be_roster->IsRunning(kSoundPlaySignature));
    EXPECT_EQ(Log(), "");
}

TEST_F(SoundplayScripterTest, TheFirstLayerStartsThePlayerWhichEndsWithTheScripter) {
    Install();
    auto scripter = std::make_unique<SoundplayScripter>();
    sptrackinfo* layer = nullptr;
    auto* const track = reinterpret_cast<SoundplayBrindleTrack*>(&mSong);
    const bigtime_t begun = system_time();
    EXPECT_EQ(Printed([&] { layer = scripter->NewLayer(&mSong, track); }),
              "Soundplay connection succeeded\nGetValues:\n");
    EXPECT_GE(system_time() - begun, 1'000'000);
    ASSERT_NE(layer, nullptr);
    EXPECT_EQ(layer->track, track);
    EXPECT_TRUE(layer->messenger->IsValid());
    EXPECT_FALSE(layer->messenger->IsTargetLocal());
    port_info info;
    ASSERT_EQ(get_port_info(layer->port, &info), B_OK);
    EXPECT_STREQ(info.name, "spport");
    EXPECT_EQ(info.capacity, 4);
    EXPECT_EQ(info.queue_count, 0);
    const std::string log = std::string("ready\n") + kMinimize + NewLayerLine(*layer) + kNewRef;
    EXPECT_TRUE(LogBecomes(log)) << Log();

    const bigtime_t ending = system_time();
    EXPECT_EQ(Printed([&] { scripter.reset(); }), "");
    EXPECT_GE(system_time() - ending, 1'000'000);
    EXPECT_TRUE(PlayerEnds());
    EXPECT_TRUE(LogBecomes(log + "quit\nended\n")) << Log();
    // The record of a layer that was not deleted outlives the scripter.
    EXPECT_EQ(layer->track, track);
    // Its process may take a moment more.
    EXPECT_TRUE(Eventually([&] { return !layer->messenger->IsValid(); }));
}

TEST_F(SoundplayScripterTest, APlayerThatRunsIsFoundAndNeverEnded) {
    const auto player = StartPlayer();
    sptrackinfo* layer = nullptr;
    std::unique_ptr<SoundplayScripter> scripter;
    EXPECT_EQ(Printed([&] { scripter = std::make_unique<SoundplayScripter>(); }),
              "SoundPlay already running, establishing connection...");
    EXPECT_EQ(Printed([&] { scripter->StartSoundPlay(); }), "");
    EXPECT_EQ(Printed([&] { layer = scripter->NewLayer(&mSong, nullptr); }), "GetValues:\n");
    ASSERT_NE(layer, nullptr);
    EXPECT_EQ(layer->track, nullptr);
    EXPECT_EQ(Printed([&] { scripter.reset(); }), "");
    // Neither minimised nor ended.
    EXPECT_TRUE(LogBecomes("ready\n" + NewLayerLine(*layer) + kNewRef)) << Log();
    EXPECT_TRUE(player->running());
}

TEST_F(SoundplayScripterTest, APlayerThatWasStartedMeanwhileIsConnectedToAndNotEnded) {
    Install();
    auto scripter = std::make_unique<SoundplayScripter>();
    const auto player = StartPlayer();
    sptrackinfo* layer = nullptr;
    EXPECT_EQ(Printed([&] { layer = scripter->NewLayer(&mSong, nullptr); }),
              "Soundplay already ran...\nSoundplay connection succeeded\nGetValues:\n");
    ASSERT_NE(layer, nullptr);
    EXPECT_TRUE(LogBecomes(std::string("ready\n") + kMinimize + NewLayerLine(*layer) + kNewRef)) << Log();
    EXPECT_EQ(Printed([&] { scripter.reset(); }), "");
    EXPECT_TRUE(player->running());
    EXPECT_TRUE(be_roster->IsRunning(kSoundPlaySignature));
}

TEST_F(SoundplayScripterTest, EachCommandReachesTheLayerWithItsOneField) {
    const auto player = StartPlayer();
    SoundplayScripter scripter;
    sptrackinfo* const layer = scripter.NewLayer(&mSong, nullptr);
    ASSERT_NE(layer, nullptr);
    std::string log = "ready\n" + NewLayerLine(*layer) + kNewRef;
    ASSERT_TRUE(LogBecomes(log));
    struct Case {
        std::function<void()> command;
        const char* printed;
        const char* logged;
    };
    const Case cases[] = {
        {[&] { scripter.RepitchLayer(layer, 1.25); }, "",
         "layer 61627261 command=int32 4 pitch=double 1.25\n"},
        {[&] { scripter.RepitchLayer(layer, -0.5); }, "",
         "layer 61627261 command=int32 4 pitch=double -0.5\n"},
        {[&] { scripter.SeekLayer(layer, 61.5); }, "", "layer 61627261 command=int32 4 abspos=double 61.5\n"},
        {[&] { scripter.SetLevel(layer, 0.1f); }, "SoundplayScripter::SetLevel(): 0.100000\n",
         "layer 61627261 command=int32 4 volume=double 0.10000000149011612\n"},
        {[&] { scripter.UpdateLayerInfo(layer); }, "Reply to SCRIPTGETVALUES: \n",
         "layer 61627261 command=int32 5\n"},
        {[&] { scripter.SetLayerTrack(layer, &mSong); }, "", kNewRef},
        {[&] { scripter.DeleteLayer(layer); }, "", "layer 61627261 command=int32 3\n"},
    };
    const port_id port = layer->port;
    const BMessenger* const messenger = layer->messenger;
    for (const Case& entry : cases) {
        EXPECT_EQ(Printed(entry.command), entry.printed);
        log += entry.logged;
        EXPECT_TRUE(LogBecomes(log)) << Log();
    }
    // Neither is freed with its layer.
    port_info info;
    EXPECT_EQ(get_port_info(port, &info), B_OK);
    EXPECT_TRUE(messenger->IsValid());
}

TEST_F(SoundplayScripterTest, APlayerThatWasEndedIsNotStartedAgain) {
    Install();
    auto scripter = std::make_unique<SoundplayScripter>();
    EXPECT_EQ(Printed([&] { scripter->StartSoundPlay(); }), "Soundplay connection succeeded\n");
    EXPECT_EQ(Printed([&] { scripter->QuitSoundPlay(); }), "");
    EXPECT_TRUE(PlayerEnds());
    sptrackinfo* layer = nullptr;
    EXPECT_EQ(Printed([&] { layer = scripter->NewLayer(&mSong, nullptr); }), "");
    EXPECT_EQ(layer, nullptr);
    EXPECT_FALSE(be_roster->IsRunning(kSoundPlaySignature));
    EXPECT_EQ(Printed([&] { scripter->QuitSoundPlay(); }),
              "SoundplayScripter::QuitSoundPlay(): No messenger\n");
    EXPECT_EQ(Printed([&] { scripter.reset(); }), "SoundplayScripter::QuitSoundPlay(): No messenger\n");
}

TEST_F(SoundplayScripterTest, OfTwoClientsOnlyTheOneThatStartedThePlayerEndsIt) {
    Install();
    auto first = std::make_unique<SoundplayScripter>();
    Printed([&] { first->StartSoundPlay(); });
    std::unique_ptr<SoundplayScripter> second;
    EXPECT_EQ(Printed([&] { second = std::make_unique<SoundplayScripter>(); }),
              "SoundPlay already running, establishing connection...");
    sptrackinfo* layer = nullptr;
    Printed([&] { layer = second->NewLayer(&mSong, nullptr); });
    // A layer belongs to the scripter that opened it.
    EXPECT_EQ(Printed([&] { first->SeekLayer(layer, 1); }),
              "SoundplayScripter::SeekLayer: layer not found\n");
    second.reset();
    EXPECT_TRUE(be_roster->IsRunning(kSoundPlaySignature));
    first.reset();
    EXPECT_TRUE(PlayerEnds());
}

TEST_F(SoundplayScripterTest, ALayerOfAnotherClientCanBeTakenUp) {
    const auto player = StartPlayer();
    SoundplayScripter first;
    sptrackinfo* const layer = first.NewLayer(&mSong, nullptr);
    ASSERT_TRUE(LogBecomes("ready\n" + NewLayerLine(*layer) + kNewRef));
    SoundplayScripter second;
    sptrackinfo* const same = second.TakeUpLayer(*layer->messenger);
    EXPECT_EQ(Printed([&] { second.SeekLayer(same, 7); }), "");
    EXPECT_TRUE(LogBecomes("ready\n" + NewLayerLine(*layer) + kNewRef +
                           "layer 61627261 command=int32 4 abspos=double 7\n"))
        << Log();
}
