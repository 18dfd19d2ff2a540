// The index job is killed at random moments; afterwards every attribute is whole or absent and the index
// agrees with the files.

#include "samples/SampleLibrary.h"
#include "support/program.h"
#include "support/random_seed.h"
#include "support/temporary_environment.h"

#include <gtest/gtest.h>

#include <csignal>
#include <filesystem>
#include <set>
#include <sys/xattr.h>
#include <unistd.h>

namespace {

namespace fs = std::filesystem;

constexpr std::size_t kSongs = 3'000;

/// Songname and artist as they must read when they are there at all.
struct Expected {
    std::string songname;
    std::string artist;
};

Expected FieldsOf(const samples::Sample& song) {
    const std::string album_folder = song.folder.substr(song.folder.find('/') + 1);
    return {song.name.substr(5, song.name.size() - 9), album_folder.substr(0, album_folder.find('-'))};
}

/// "(none)", or the value with its type code and terminator.
std::string Attribute(const std::string& path, const char* name) {
    char value[300] = {};
    const ssize_t size = getxattr(path.c_str(), name, value, sizeof(value));
    return size < 0 ? "(none)" : std::string(value, static_cast<size_t>(size));
}

std::string AsStored(const std::string& text) {
    return "CSTR" + text + std::string(1, '\0');
}

void KillAtRandomMoments(int kills) {
    test::TemporaryEnvironment environment;
    const std::string root = environment.volume();
    ASSERT_EQ(samples::WriteLargeLibrary(root, kSongs), "");
    std::mt19937_64 random(RandomSeed());
    int killed = 0;
    for (int attempt = 0; attempt < kills; ++attempt) {
        // Tagging and stripping in turn, so that a kill hits every kind of change.
        const bool tagging = attempt % 2 == 0;
        test::Program program(QUIRNELCTL, {tagging ? "index" : "strip", root});
        usleep(static_cast<useconds_t>(std::uniform_int_distribution<int>(1'000, 400'000)(random)));
        killed += program.running() ? 1 : 0;
        program.signal(SIGKILL);
        program.wait();

        std::set<std::string> tagged;
        for (std::size_t number = 0; number < kSongs; ++number) {
            const samples::Sample song = samples::LargeLibrarySong(number);
            const std::string path = root + "/" + song.folder + "/" + song.name;
            const std::string songname = Attribute(path, "user.be.Audio:Songname");
            const std::string artist = Attribute(path, "user.be.Audio:Artist");
            const Expected expected = FieldsOf(song);
            if (songname != "(none)") {
                ASSERT_EQ(songname, AsStored(expected.songname)) << path;
                tagged.insert(path);
            }
            if (artist != "(none)") {
                ASSERT_EQ(artist, AsStored(expected.artist)) << path;
                tagged.insert(path);
            }
        }
        if (attempt % 5 != 4 && attempt + 1 != kills)
            continue;
        // Files whose strip or tagging was cut short may have an album or a track number left alone.
        const auto found =
            test::run_program(QUIRNELCTL, {"query", "(Audio:Songname==\"*\")||(Audio:Artist==\"*\")", root});
        ASSERT_EQ(found.status, 0) << found.errors;
        const auto lines = test::lines_of(found.output);
        ASSERT_EQ(std::set<std::string>(lines.begin(), lines.end()), tagged)
            << "after " << attempt + 1 << " kills";
    }
    std::printf("%d of %d programs were killed at work\n", killed, kills);
    EXPECT_GT(killed, kills / 4);
    for (const auto& entry : fs::recursive_directory_iterator(environment.root())) {
        const std::string name = entry.path().filename().string();
        EXPECT_EQ(name.find(".tmp"), std::string::npos) << entry.path();
    }
}

TEST(KilledIndexJob, LeavesWholeAttributesAndAnIndexThatAgrees) {
    KillAtRandomMoments(QUIRNEL_KILLS);
}

} // namespace
