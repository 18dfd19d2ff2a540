// The device under a volume, or under the index, is pulled out while jobs, walks and queries go on.

#include "samples/SampleLibrary.h"
#include "support/program.h"
#include "support/pullable_volume.h"
#include "support/random_seed.h"
#include "support/temporary_environment.h"

#include <gtest/gtest.h>

#include <filesystem>
#include <random>
#include <set>
#include <sys/xattr.h>
#include <unistd.h>

namespace {

namespace fs = std::filesystem;

constexpr std::size_t kSongs = 2'000;
constexpr int kRounds = 6;
constexpr int kPatience = 60'000; // milliseconds
constexpr char kTagged[] = "Audio:Songname==\"*\"";

/// False when it does not end in time.
bool EndsInTime(test::Program& program) {
    for (int waited = 0; program.running(); ++waited) {
        if (waited == kPatience)
            return false;
        usleep(1'000);
    }
    return true;
}

std::set<std::string> TaggedFiles(const std::string& root) {
    std::set<std::string> tagged;
    for (std::size_t number = 0; number < kSongs; ++number) {
        const samples::Sample song = samples::LargeLibrarySong(number);
        const std::string path = root + "/" + song.folder + "/" + song.name;
        if (getxattr(path.c_str(), "user.be.Audio:Songname", nullptr, 0) > 0)
            tagged.insert(path);
    }
    return tagged;
}

std::set<std::string> FoundFiles(const std::string& root) {
    const auto found = test::run_program(QUIRNELCTL, {"query", kTagged, root});
    EXPECT_EQ(found.status, 0) << found.errors;
    const auto lines = test::lines_of(found.output);
    return {lines.begin(), lines.end()};
}

class PulledDevice : public testing::Test {
  protected:
    void SetUp() override {
        if (!mPullable.mounted())
            GTEST_SKIP() << mPullable.reason();
    }
    /// Any moment from a program's first directory to its end.
    void WaitAWhile() {
        usleep(static_cast<useconds_t>(std::uniform_int_distribution<int>(20'000, 700'000)(mRandom)));
    }

    test::TemporaryEnvironment mEnvironment;
    test::PullableVolume mPullable{48};
    std::mt19937_64 mRandom{RandomSeed()};
};

TEST_F(PulledDevice, UnderAVolumeEndsItsJobsAndLeavesAnIndexThatAgrees) {
    const std::string root = mPullable.path();
    mEnvironment.declare_volumes(root);
    ASSERT_EQ(samples::WriteLargeLibrary(root, kSongs), "");
    int pulledAtWork = 0;
    for (int round = 0; round < kRounds; ++round) {
        SCOPED_TRACE("round " + std::to_string(round));
        ASSERT_TRUE(mPullable.mount_afresh()) << mPullable.reason();
        test::Program program(QUIRNELCTL, {round % 2 == 0 ? "index" : "strip", root});
        WaitAWhile();
        pulledAtWork += program.running() ? 1 : 0;
        if (!mPullable.pull())
            GTEST_SKIP() << "this kernel cannot shut a file system down";
        ASSERT_TRUE(EndsInTime(program));
        const test::ProgramResult ended = program.wait();
        EXPECT_EQ(ended.signal, 0) << ended.errors;
        EXPECT_TRUE(ended.status == 0 || ended.status == 1) << ended.status << ended.errors;

        ASSERT_TRUE(mPullable.put_back()) << mPullable.reason();
        EXPECT_EQ(FoundFiles(root), TaggedFiles(root));
    }
    std::printf("%d of %d programs were at work\n", pulledAtWork, kRounds);
    EXPECT_GT(pulledAtWork, 0);
    EXPECT_EQ(test::run_program(QUIRNELCTL, {"index", root}).status, 0);
    EXPECT_EQ(FoundFiles(root).size(), kSongs);
}

TEST_F(PulledDevice, UnderAVolumeLosesNoRowToAWalkThatCannotReadIt) {
    const std::string root = mPullable.path();
    mEnvironment.declare_volumes(root);
    ASSERT_EQ(samples::WriteLargeLibrary(root, kSongs), "");
    ASSERT_EQ(test::run_program(QUIRNELCTL, {"index", root}).status, 0);
    for (const char* command : {"query", "reindex"}) {
        SCOPED_TRACE(command);
        ASSERT_TRUE(mPullable.mount_afresh()) << mPullable.reason();
        // The root is known, and all else must be read from the device.
        ASSERT_EQ(access(root.c_str(), F_OK), 0);
        if (!mPullable.pull())
            GTEST_SKIP() << "this kernel cannot shut a file system down";
        test::Program program(QUIRNELCTL, std::string(command) == "query"
                                              ? std::vector<std::string>{"query", "name==\"*\"", root}
                                              : std::vector<std::string>{"reindex", root});
        ASSERT_TRUE(EndsInTime(program));
        const test::ProgramResult ended = program.wait();
        EXPECT_EQ(ended.signal, 0) << ended.errors;
        EXPECT_TRUE(ended.status == 0 || ended.status == 1) << ended.status << ended.errors;

        ASSERT_TRUE(mPullable.put_back()) << mPullable.reason();
        EXPECT_EQ(FoundFiles(root).size(), kSongs);
    }
}

TEST_F(PulledDevice, UnderTheIndexDoesNotStopTheJobs) {
    const std::string root = mEnvironment.volume();
    ASSERT_EQ(samples::WriteLargeLibrary(root, kSongs), "");
    mEnvironment.set("XDG_DATA_HOME", mPullable.path());
    int pulledAtWork = 0;
    for (int round = 0; round < kRounds; ++round) {
        SCOPED_TRACE("round " + std::to_string(round));
        ASSERT_TRUE(mPullable.mount_afresh()) << mPullable.reason();
        test::Program program(QUIRNELCTL, {round % 2 == 0 ? "index" : "strip", root});
        WaitAWhile();
        pulledAtWork += program.running() ? 1 : 0;
        if (!mPullable.pull())
            GTEST_SKIP() << "this kernel cannot shut a file system down";
        ASSERT_TRUE(EndsInTime(program));
        const test::ProgramResult ended = program.wait();
        EXPECT_EQ(ended.signal, 0) << ended.errors;
        EXPECT_TRUE(ended.status == 0 || ended.status == 1) << ended.status << ended.errors;

        ASSERT_TRUE(mPullable.put_back()) << mPullable.reason();
        const std::set<std::string> tagged = TaggedFiles(root);
        // What was changed once the index could not be written to, it cannot know of.
        for (const std::string& file : FoundFiles(root))
            EXPECT_TRUE(tagged.contains(file)) << file;
        EXPECT_EQ(test::run_program(QUIRNELCTL, {"reindex", root}).status, 0);
        EXPECT_EQ(FoundFiles(root), tagged);
    }
    std::printf("%d of %d programs were at work\n", pulledAtWork, kRounds);
    EXPECT_GT(pulledAtWork, 0);
}

} // namespace
