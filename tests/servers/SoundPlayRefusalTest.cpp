// The player as a program of its own: what it refuses, and whose layers end.
#include "SoundPlayFixture.h"

#include <csignal>
#include <filesystem>
#include <sys/stat.h>

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
    EXPECT_TRUE(Becomes(layer, "playing"));
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
