// quirnelctl in surroundings that a shell, a service or a full disk gives it.
#include "support/program.h"
#include "support/temporary_environment.h"

#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include <csignal>
#include <filesystem>
#include <fstream>
#include <unistd.h>

namespace {

class Surroundings : public ::testing::Test {
  protected:
    // A line of the shell, in which $0 is the program.
    static test::ProgramResult Shell(const std::string& line) {
        return test::run_program("/bin/sh", {"-c", line, QUIRNELCTL});
    }
    void Touch(const std::string& path) { std::ofstream(environment.volume() + "/" + path) << "sound"; }

    test::TemporaryEnvironment environment;
};

TEST_F(Surroundings, SongsAreFoundThoughTheIndexWasDeleted) {
    Touch("Oak - Leaf.mp3");
    ASSERT_EQ(Shell("\"$0\" index").status, 0);
    ASSERT_EQ(Shell("rm -r \"$XDG_DATA_HOME/bekits\"").status, 0);

    EXPECT_EQ(Shell("\"$0\" find Leaf").output, environment.volume() + "/Oak - Leaf.mp3\n");
    ASSERT_EQ(Shell("rm -r \"$XDG_DATA_HOME/bekits\"").status, 0);
    EXPECT_EQ(Shell("\"$0\" query 'Audio:Songname==Leaf'").output,
              environment.volume() + "/Oak - Leaf.mp3\n");
}

TEST_F(Surroundings, ResultsThatCannotBeWrittenAreAFailure) {
    for (const char* command : {"volumes", "--help"}) {
        const auto full = Shell("\"$0\" " + std::string(command) + " > /dev/full");
        EXPECT_EQ(full.status, 1) << command;
        EXPECT_EQ(full.errors, "quirnelctl: the results could not be written\n") << command;
        const auto closed = Shell("\"$0\" " + std::string(command) + " >&-");
        EXPECT_EQ(closed.status, 1) << command;
        EXPECT_EQ(closed.errors, "quirnelctl: the results could not be written\n") << command;
    }
}

TEST_F(Surroundings, ClosedDescriptorsHarmNeitherSongsNorIndex) {
    Touch("Oak - Leaf.mp3");

    EXPECT_EQ(Shell("\"$0\" --verbose index <&- >&- 2>&-").status, 1) << "its result could not be written";

    EXPECT_EQ(test::read_file(environment.volume() + "/Oak - Leaf.mp3"), "sound");
    EXPECT_EQ(Shell("\"$0\" find Leaf").output, environment.volume() + "/Oak - Leaf.mp3\n");
}

TEST_F(Surroundings, AJobUnderNohupSurvivesTheHangUp) {
    for (int i = 0; i < 3000; ++i)
        Touch("Oak - Leaf " + std::to_string(i) + ".mp3");
    test::Program program("/bin/sh", {"-c", "trap '' HUP; exec \"$0\" index", QUIRNELCTL});
    // The shell has set the trap when it is the job.
    const std::string name = "/proc/" + std::to_string(program.process()) + "/comm";
    for (int i = 0; i < 30'000 && test::read_file(name) != "quirnelctl\n"; ++i)
        usleep(1'000);

    program.signal(SIGHUP);

    const auto result = program.wait();
    EXPECT_EQ(result.status, 0) << result.errors;
    EXPECT_EQ(result.output, "Indexed 3000 files on volume (" + environment.volume() + ")\n");
}

TEST_F(Surroundings, ASearchThatNoVolumeCanAnswerIsAFailure) {
    Touch("Oak - Leaf.mp3");
    ASSERT_EQ(Shell("\"$0\" index").status, 0);
    environment.set("XDG_DATA_HOME", "/proc/nowhere");

    for (const char* search : {"find Leaf", "query 'Audio:Songname==Leaf'"}) {
        const auto result = Shell("\"$0\" " + std::string(search));
        EXPECT_EQ(result.status, 1) << search;
        EXPECT_EQ(result.errors, "quirnelctl: no volume here answers queries\n") << search;
    }
}

TEST_F(Surroundings, AnIndexThatCannotBeKeptIsSaidToBeSo) {
    Touch("Oak - Leaf.mp3");
    const std::string data = environment.home() + "/.local/share/bekits";
    std::filesystem::create_directories(data);
    std::ofstream(data + "/index") << "in the way";

    for (const char* search : {"find Leaf", "query 'Audio:Songname==Leaf'"}) {
        const auto result = Shell("\"$0\" " + std::string(search));
        EXPECT_EQ(result.status, 1) << search;
        EXPECT_EQ(result.output, "") << search;
        EXPECT_EQ(result.errors, "quirnelctl: no volume here answers queries\n") << search;
    }
    const auto result = Shell("\"$0\" index '" + environment.volume() + "'");
    EXPECT_EQ(result.status, 1);
    EXPECT_EQ(result.errors, "quirnelctl: " + environment.volume() + ": this volume answers no queries\n");
}

TEST_F(Surroundings, SongsAreFoundWhosePathIsLongerThanTheSystemTakesAtOnce) {
    const std::string leaf(200, 'd');
    std::string path = environment.volume();
    std::filesystem::current_path(path);
    for (int i = 0; i < 25; ++i) {
        std::filesystem::create_directory(leaf);
        std::filesystem::current_path(leaf);
        path += "/" + leaf;
    }
    std::ofstream("Oak - Leaf.mp3") << "sound";
    std::filesystem::current_path("/");

    ASSERT_EQ(Shell("\"$0\" index").status, 0);
    const auto found = Shell("\"$0\" find Leaf");
    EXPECT_EQ(found.status, 0) << found.errors;
    EXPECT_EQ(found.output, path + "/Oak - Leaf.mp3\n");
}

TEST_F(Surroundings, AVolumeThatIsNamedTwiceIsIndexedOnce) {
    Touch("Oak - Leaf.mp3");
    const auto result = Shell("\"$0\" index '" + environment.volume() + "' '" + environment.volume() + "/.'");
    EXPECT_EQ(result.output, "Indexed 1 files on volume (" + environment.volume() + ")\n");
}

} // namespace
