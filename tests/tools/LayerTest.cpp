// quirnelctl layer: tracks on the player, which sounds nowhere.
#include "support/program.h"
#include "support/sound_file.h"
#include "support/temporary_environment.h"

#include <chrono>
#include <csignal>
#include <filesystem>
#include <functional>
#include <gtest/gtest.h>
#include <memory>
#include <thread>

namespace {

class LayerTest : public testing::Test {
  protected:
    LayerTest() {
        environment_.set("SOUNDPLAY_OUTPUT", "null");
        test::write_tone(path("long.wav"), 60, 440);
        test::write_tone(path("short.wav"), 0.2, 440);
    }
    ~LayerTest() override {
        run({"send", "_QRQ", "--to", "application/x-marcone-soundplay"});
        EXPECT_TRUE(eventually([] {
            return run({"send", "0", "--to", "application/x-marcone-soundplay"}).errors ==
                   "quirnelctl: application/x-marcone-soundplay is not running\n";
        }));
    }

    std::string path(const std::string& leaf) const { return environment_.root() + "/" + leaf; }
    static test::ProgramResult run(const std::vector<std::string>& arguments) {
        return test::run_program(QUIRNELCTL, arguments);
    }
    static test::ProgramResult layer(std::vector<std::string> arguments) {
        arguments.insert(arguments.begin(), "layer");
        return run(arguments);
    }
    static std::string list() { return layer({"--json", "list"}).output; }
    static bool eventually(const std::function<bool()>& condition) {
        for (int round = 0; round < 500; ++round) {
            if (condition())
                return true;
            std::this_thread::sleep_for(std::chrono::milliseconds(20));
        }
        return false;
    }
    static bool lists(const std::string& text) {
        return eventually([&] { return list().find(text) != std::string::npos; });
    }
    static void expect_failure(const test::ProgramResult& result, const std::string& line) {
        EXPECT_EQ(result.status, 1);
        EXPECT_EQ(result.output, "");
        EXPECT_EQ(result.errors, "quirnelctl: " + line + "\n");
    }

    test::TemporaryEnvironment environment_;
};

} // namespace

TEST_F(LayerTest, AFileIsPlayedToItsEnd) {
    const test::ProgramResult result = layer({"play", path("short.wav")});
    EXPECT_EQ(result.status, 0) << result.errors;
    EXPECT_EQ(result.output, "Playing " + path("short.wav") + " as layer 1\n");
    EXPECT_EQ(result.errors, "");
    EXPECT_EQ(list(), "");
}

TEST_F(LayerTest, TwoTracksPlayTogetherAndAreChangedByNumber) {
    test::Program first(QUIRNELCTL, {"layer", "play", path("long.wav")});
    ASSERT_TRUE(lists("\"layer\":1,\"name\":\"long.wav\""));
    test::Program second(QUIRNELCTL, {"layer", "play", path("long.wav")});
    ASSERT_TRUE(lists("\"layer\":2,\"name\":\"long.wav\""));
    ASSERT_TRUE(eventually([] { return list().find("loading") == std::string::npos; }));
    EXPECT_EQ(layer({"pitch", "2", "0"}).status, 0);
    EXPECT_EQ(layer({"seek", "2", "30"}).status, 0);
    EXPECT_EQ(layer({"volume", "2", "0.5"}).status, 0);
    EXPECT_TRUE(lists("{\"layer\":2,\"name\":\"long.wav\",\"path\":\"" + path("long.wav") +
                      "\",\"state\":\"halted\",\"pitch\":0,\"position\":30,\"length\":60,\"volume\":0.5}\n"))
        << list();
    const test::ProgramResult table = layer({"list"});
    EXPECT_EQ(table.output.find("Layer  State    Position  Length  Pitch  Volume  Name\n1      playing  0:"),
              0u)
        << table.output;
    EXPECT_NE(table.output.find("\n2      halted   0:30      1:00    0.00   0.50    long.wav\n"),
              std::string::npos)
        << table.output;
    const test::ProgramResult changed = layer({"--json", "pitch", "1", "1.5"});
    EXPECT_NE(changed.output.find("\"pitch\":1.5,"), std::string::npos) << changed.output;
    // Who stops a layer ends the program that plays it, in order.
    EXPECT_EQ(layer({"stop", "2"}).status, 0);
    EXPECT_EQ(second.wait().status, 0);
    EXPECT_TRUE(first.running());
    // And so does Ctrl+C.
    first.signal(SIGINT);
    const test::ProgramResult end = first.wait();
    EXPECT_EQ(end.status, 0);
    EXPECT_EQ(end.errors, "");
    EXPECT_EQ(list(), "");
}

TEST_F(LayerTest, TheFirstPlayersEndLeavesTheSecondPlaying) {
    test::Program first(QUIRNELCTL, {"layer", "play", path("long.wav")});
    ASSERT_TRUE(lists("\"layer\":1"));
    test::Program second(QUIRNELCTL, {"layer", "play", path("long.wav")});
    ASSERT_TRUE(lists("\"layer\":2"));
    first.signal(SIGTERM);
    EXPECT_EQ(first.wait().status, 0);
    EXPECT_TRUE(eventually([] { return list().find("\"layer\":1,") == std::string::npos; }));
    EXPECT_TRUE(lists("\"layer\":2,"));
    EXPECT_TRUE(second.running());
}

TEST_F(LayerTest, WithoutAPlayerNothingPlays) {
    const test::ProgramResult empty = layer({"list"});
    EXPECT_EQ(empty.status, 0);
    EXPECT_EQ(empty.output, "");
    expect_failure(layer({"stop", "1"}), "there is no layer 1; 'quirnelctl layer list' lists them");
}

TEST_F(LayerTest, WhenThePlayerGoesItIsSaid) {
    test::Program playing(QUIRNELCTL, {"layer", "play", path("long.wav")});
    ASSERT_TRUE(lists("\"state\":\"playing\""));
    EXPECT_EQ(run({"send", "_QRQ", "--to", "application/x-marcone-soundplay"}).status, 0);
    const test::ProgramResult end = playing.wait();
    EXPECT_EQ(end.status, 1);
    EXPECT_EQ(end.errors, "quirnelctl: the player has ended\n");
}

TEST_F(LayerTest, WhatIsNotInstalledIsSaid) {
    const std::string directory = environment_.home() + "/.local/share/bekits/applications";
    std::filesystem::create_directories(directory);
    test::write_file(directory + "/application,x-marcone-soundplay.app",
                     "[Application]\nSignature=application/x-marcone-soundplay\nExecutable=/bin/false\n"
                     "Launch=exclusive\n");
    const test::ProgramResult result = layer({"play", path("long.wav")});
    EXPECT_EQ(result.status, 1);
    EXPECT_EQ(result.errors.find("quirnelctl: application/x-marcone-soundplay: "), 0u) << result.errors;
}

TEST_F(LayerTest, WrongArgumentsAreSaid) {
    test::write_file(path("text.mp3"), "no sound");
    struct Case {
        std::vector<std::string> arguments;
        std::string line;
    };
    const std::string pitch = "a pitch is 0 or a number from 0.01 to 100: ";
    const std::string what = "layer takes play, list, pitch, seek, volume or stop";
    const Case cases[] = {
        {{}, what},
        {{"sing"}, what + ", not sing"},
        {{"play"}, "layer play takes one file"},
        {{"play", "a", "b"}, "layer play takes one file"},
        {{"play", path("gone.mp3")}, path("gone.mp3") + ": no such file"},
        {{"play", environment_.root()}, environment_.root() + ": is no file"},
        {{"list", "1"}, "layer list takes nothing more"},
        {{"stop"}, "layer stop takes the number of a layer"},
        {{"stop", "one"}, "no number of a layer: one"},
        {{"stop", "99999999999"}, "no number of a layer: 99999999999"},
        {{"pitch", "1"}, "layer pitch takes the number of a layer and a pitch"},
        {{"seek", "1"}, "layer seek takes the number of a layer and seconds"},
        {{"volume", "1"}, "layer volume takes the number of a layer and a volume"},
        {{"pitch", "1", "fast"}, pitch + "fast"},
        {{"pitch", "1", "1x"}, pitch + "1x"},
        {{"pitch", "1", "nan"}, pitch + "nan"},
        {{"pitch", "1", "101"}, pitch + "101"},
        {{"pitch", "--", "1", "-1"}, pitch + "-1"},
        {{"seek", "--", "1", "-1"}, "a position is a number of seconds, 0 or more: -1"},
        {{"seek", "1", "inf"}, "a position is a number of seconds, 0 or more: inf"},
        {{"volume", "1", "1.1"}, "a volume is a number from 0 to 1: 1.1"},
        {{"volume", "1", "1"}, "there is no layer 1; 'quirnelctl layer list' lists them"},
    };
    for (const Case& entry : cases)
        expect_failure(layer(entry.arguments), entry.line);
    expect_failure(layer({"play", path("text.mp3")}),
                   path("text.mp3") + ": holds no sound that can be played");
}
