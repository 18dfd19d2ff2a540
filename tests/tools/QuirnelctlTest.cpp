#include "samples/SampleLibrary.h"
#include "support/program.h"
#include "support/temporary_environment.h"

#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include <csignal>
#include <filesystem>
#include <fstream>
#include <sys/xattr.h>
#include <unistd.h>

namespace {

namespace fs = std::filesystem;
using ::testing::ElementsAre;
using ::testing::HasSubstr;
using ::testing::StartsWith;
using ::testing::UnorderedElementsAre;

class QuirnelctlTest : public ::testing::Test {
  protected:
    test::ProgramResult Run(const std::vector<std::string>& arguments) {
        return test::run_program(QUIRNELCTL, arguments);
    }
    std::string Song(const std::string& path) const { return environment.volume() + "/" + path; }
    void Touch(const std::string& path) {
        fs::create_directories(fs::path(Song(path)).parent_path());
        std::ofstream(Song(path)) << "sound";
    }
    std::string Attribute(const std::string& path, const char* name) {
        char value[300] = {};
        const ssize_t size = getxattr(Song(path).c_str(), name, value, sizeof(value));
        return size < 0 ? "(none)" : std::string(value, static_cast<size_t>(size));
    }
    void ExpectFailure(const test::ProgramResult& result, const std::string& line) {
        EXPECT_EQ(result.status, 1);
        EXPECT_EQ(result.output, "");
        EXPECT_EQ(result.errors, "quirnelctl: " + line + "\n");
    }

    test::TemporaryEnvironment environment;
};

TEST_F(QuirnelctlTest, ListsTheDeclaredVolumeWithItsAbilities) {
    const auto result = Run({"--json", "volumes"});
    EXPECT_EQ(result.status, 0);
    const auto lines = test::lines_of(result.output);
    ASSERT_EQ(lines.size(), 1u);
    EXPECT_THAT(lines[0], HasSubstr("\"name\":\"volume\",\"root\":\"" + environment.volume() +
                                    "\",\"attributes\":true,\"queries\":true}"));
}

TEST_F(QuirnelctlTest, IndexTagsFilesAndFindListsThem) {
    Touch("Oak & Ash - Leaves/01 - First.mp3");
    Touch("Other/Unrelated.mp3");

    const auto indexed = Run({"index", environment.volume()});

    EXPECT_EQ(indexed.status, 0) << indexed.errors;
    EXPECT_EQ(indexed.output, "Indexed 2 files on volume (" + environment.volume() + ")\n");
    EXPECT_EQ(indexed.errors, "");
    EXPECT_EQ(Attribute("Oak & Ash - Leaves/01 - First.mp3", "user.be.Audio:Songname"),
              std::string("CSTRFirst\0", 10));
    const auto found = Run({"find", "Ash"});
    EXPECT_EQ(found.status, 0);
    EXPECT_EQ(found.output, Song("Oak & Ash - Leaves/01 - First.mp3") + "\n");
}

TEST_F(QuirnelctlTest, FindTellsUpperFromLowerCaseAndTakesTheTextAsItIs) {
    Touch("50% [live] *.mp3");
    Touch("Oak - Leaf-2.mp3");
    Run({"index"});
    EXPECT_EQ(Run({"find", "LIVE"}).output, "");
    EXPECT_EQ(Run({"find", "*"}).output, Song("50% [live] *.mp3") + "\n");
    EXPECT_EQ(Run({"find", "?"}).output, "");
    EXPECT_EQ(Run({"find", "% live"}).output, "");
    EXPECT_EQ(Run({"find", "%  live"}).output, Song("50% [live] *.mp3") + "\n")
        << "the bracket became a blank";
    EXPECT_EQ(Run({"find", "--", "-2"}).output, Song("Oak - Leaf-2.mp3") + "\n");
}

TEST_F(QuirnelctlTest, AnEmptyTextFindsEveryTaggedFile) {
    Touch("One.mp3");
    Touch("Two.MP3");
    Touch("Three.Mp3");
    Run({"index"});
    EXPECT_THAT(test::lines_of(Run({"find", ""}).output),
                UnorderedElementsAre(Song("One.mp3"), Song("Two.MP3")));
}

TEST_F(QuirnelctlTest, StripRemovesTheAttributesAndTheHits) {
    Touch("Song.mp3");
    Run({"index"});
    const auto result = Run({"strip", environment.volume()});
    EXPECT_EQ(result.output, "Stripped 1 files on volume (" + environment.volume() + ")\n");
    EXPECT_EQ(Attribute("Song.mp3", "user.be.Audio:Songname"), "(none)");
    EXPECT_EQ(Run({"find", "Song"}).output, "");
}

TEST_F(QuirnelctlTest, WhatOtherProgramsDidIsSeenByTheNextSearch) {
    Touch("a/Song.mp3");
    Touch("b/keep.txt");
    Run({"index"});
    fs::rename(Song("a/Song.mp3"), Song("b/Renamed.mp3"));
    EXPECT_EQ(Run({"find", "Song"}).output, Song("b/Renamed.mp3") + "\n");
    fs::remove(Song("b/Renamed.mp3"));
    EXPECT_EQ(Run({"find", "Song"}).output, "");
}

TEST_F(QuirnelctlTest, QueryUnderstandsThePredicateLanguage) {
    Touch("CD1 - 01 - One.mp3");
    Touch("CD2 - 01 - Two.mp3");
    Run({"index"});
    EXPECT_EQ(Run({"query", "Audio:Disc==\"CD2*\""}).output, Song("CD2 - 01 - Two.mp3") + "\n");
    ExpectFailure(Run({"query", "Audio:Disc=="}), "not a predicate: Audio:Disc==");
}

TEST_F(QuirnelctlTest, FieldsAreShownAsATable) {
    Touch("Oak - Leaf.mp3");
    Run({"index"});
    EXPECT_THAT(test::lines_of(Run({"find", "--fields", "Leaf"}).output),
                ElementsAre("File            No  Disc  Artist  Album   Songname",
                            "Oak - Leaf.mp3            Oak     volume  Leaf"));
}

TEST_F(QuirnelctlTest, AttributesAreShownWithTypeSizeAndValue) {
    Touch("Oak - Leaf.mp3");
    Run({"index"});
    const auto result = Run({"attr", Song("Oak - Leaf.mp3")});
    EXPECT_THAT(result.output, StartsWith(Song("Oak - Leaf.mp3") + ":\n"));
    EXPECT_THAT(result.output, HasSubstr("Audio:Artist    CSTR  5  \"Oak \"\n"));
    EXPECT_THAT(result.output, HasSubstr("Audio:Length    CSTR  6  \" 0:00\"\n"));
    EXPECT_THAT(Run({"--json", "attr", Song("Oak - Leaf.mp3")}).output,
                HasSubstr("\"name\":\"Audio:Artist\",\"type\":\"CSTR\",\"size\":5,\"value\":\"Oak \"}"));
}

TEST_F(QuirnelctlTest, InvalidUtf8InAPathComesThroughInEveryForm) {
    const std::string name = "Bj\xF6rk.mp3";
    Touch(name);
    Run({"index"});
    EXPECT_EQ(Run({"find", "Bj"}).output, Song(name) + "\n");
    EXPECT_EQ(Run({"find", "--null", "Bj"}).output, Song(name) + std::string(1, '\0'));
    const auto json = Run({"find", "--json", "Bj"}).output;
    EXPECT_THAT(json, HasSubstr("Bj\xEF\xBF\xBDrk.mp3\",\"path_hex\":\""));
    EXPECT_THAT(json, HasSubstr("426af6726b2e6d7033\"}"));
}

TEST_F(QuirnelctlTest, ACoverIsSetAndAnUnreadablePictureRefused) {
    samples::WriteSmallLibrary(environment.volume());
    const std::string folder = Song("The Lanterns - Harbour Lights/");
    Run({"index"});
    const std::string song = folder + "01 - First Ferry.mp3";

    const auto set = Run({"cover", song, folder + "cover.ppm"});

    EXPECT_EQ(set.status, 0) << set.errors;
    EXPECT_EQ(set.output, "Set the cover of " + song + "\n");
    EXPECT_THAT(Run({"attr", song}).output, HasSubstr("Media:64x64CoverImage"));
    ExpectFailure(Run({"cover", song, song}), song + ": not a picture that can be read");
    ExpectFailure(Run({"cover", song, folder + "none.png"}), folder + "none.png: no such file");
}

TEST_F(QuirnelctlTest, ReindexBuildsTheIndexFromTheFiles) {
    Touch("Song.mp3");
    Run({"index"});
    const auto result = Run({"reindex", environment.volume()});
    EXPECT_EQ(result.status, 0) << result.errors;
    EXPECT_THAT(result.output, StartsWith("Rebuilt the index of volume (" + environment.volume() + "), "));
    EXPECT_EQ(Run({"find", "Song"}).output, Song("Song.mp3") + "\n");
}

TEST_F(QuirnelctlTest, MistakesAreNamedInOneLine) {
    ExpectFailure(Run({}), "no command given; 'quirnelctl --help' lists them");
    ExpectFailure(Run({"dance"}), "no such command: dance; 'quirnelctl --help' lists them");
    ExpectFailure(Run({"--loud", "volumes"}), "no such option: --loud");
    ExpectFailure(Run({"find"}), "find takes one text");
    ExpectFailure(Run({"attr", "/no/such/file"}), "/no/such/file: no such file");
    const auto result = Run({"index", "/"});
    EXPECT_EQ(result.status, 1);
    EXPECT_THAT(result.errors, StartsWith("quirnelctl: / is not the root of a volume; "));
    EXPECT_EQ(test::lines_of(result.errors).size(), 1u);
}

TEST_F(QuirnelctlTest, InterruptingTheIndexJobLeavesWholeFilesAndSaysSo) {
    samples::WriteLargeLibrary(environment.volume(), 15'000);
    test::Program program(QUIRNELCTL, {"index", environment.volume()});
    // As soon as the job is seen at work.
    for (size_t number = 0; program.running(); number = (number + 997) % 15'000) {
        const samples::Sample song = samples::LargeLibrarySong(number);
        if (Attribute(song.folder + "/" + song.name, "user.be.Audio:Songname") != "(none)")
            break;
        usleep(100);
    }
    program.signal(SIGINT);
    const auto result = program.wait();
    ASSERT_EQ(result.status, 1) << result.output;
    EXPECT_EQ(result.output, "");
    EXPECT_THAT(result.errors, StartsWith("quirnelctl: cancelled on " + environment.volume() + " after "));

    const auto again = Run({"index", environment.volume()});
    EXPECT_EQ(again.output, "Indexed 15000 files on volume (" + environment.volume() + ")\n");
    EXPECT_EQ(test::lines_of(Run({"find", ".mp3"}).output).size(), 0u);
    EXPECT_EQ(test::lines_of(Run({"find", ""}).output).size(), 15'000U);
}

} // namespace
