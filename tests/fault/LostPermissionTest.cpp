// Folders and files close to an ordinary user while a job of his walks through them.

#include "samples/SampleLibrary.h"
#include "support/program.h"
#include "support/random_seed.h"
#include "support/temporary_environment.h"

#include <gtest/gtest.h>

#include <filesystem>
#include <random>
#include <set>
#include <sys/stat.h>
#include <unistd.h>
#include <vector>

namespace {

namespace fs = std::filesystem;

constexpr std::size_t kSongs = 2'000;
constexpr uid_t kNobody = 65534;

class LostPermission : public testing::Test {
  protected:
    LostPermission() {
        EXPECT_EQ(samples::WriteLargeLibrary(mRoot, kSongs), "");
        std::set<std::string> folders;
        for (std::size_t number = 0; number < kSongs; ++number) {
            const samples::Sample song = samples::LargeLibrarySong(number);
            folders.insert(mRoot + "/" + song.folder);
            mFiles.push_back(mRoot + "/" + song.folder + "/" + song.name);
        }
        mFolders.assign(folders.begin(), folders.end());
        if (geteuid() == 0) {
            for (const auto& entry : fs::recursive_directory_iterator(mEnvironment.root()))
                EXPECT_EQ(lchown(entry.path().c_str(), kNobody, kNobody), 0);
            EXPECT_EQ(chown(mEnvironment.root().c_str(), kNobody, kNobody), 0);
        }
    }
    ~LostPermission() override { Restore(); }

    /// As the user whose files these are, who is not root.
    static std::vector<std::string> AsUser(const std::vector<std::string>& arguments) {
        std::vector<std::string> words;
        if (geteuid() == 0)
            words = {"setpriv", "--reuid=65534", "--regid=65534", "--clear-groups"};
        words.push_back(QUIRNELCTL);
        words.insert(words.end(), arguments.begin(), arguments.end());
        return words;
    }
    static test::ProgramResult Run(const std::vector<std::string>& arguments) {
        return test::run_program("/usr/bin/env", AsUser(arguments));
    }
    std::size_t Found() {
        const auto found = Run({"query", "Audio:Songname==\"*\"", mRoot});
        EXPECT_EQ(found.status, 0) << found.errors;
        return test::lines_of(found.output).size();
    }
    void Restore() {
        for (const std::string& folder : mFolders)
            chmod(folder.c_str(), 0755);
        for (const std::string& file : mFiles)
            chmod(file.c_str(), 0644);
    }

    test::TemporaryEnvironment mEnvironment;
    const std::string mRoot = mEnvironment.volume();
    std::vector<std::string> mFolders;
    std::vector<std::string> mFiles;
    std::mt19937_64 mRandom{RandomSeed()};
};

TEST_F(LostPermission, ToFoldersAndFilesLetsTheJobEndWithTheRest) {
    if (Run({"volumes"}).status != 0)
        GTEST_SKIP() << "setpriv cannot start the program as another user";
    test::Program job("/usr/bin/env", AsUser({"index", mRoot}));
    int changes = 0;
    while (job.running()) {
        chmod(mFolders[mRandom() % mFolders.size()].c_str(), mRandom() % 2 == 0 ? 0 : 0755);
        chmod(mFiles[mRandom() % mFiles.size()].c_str(), mRandom() % 2 == 0 ? 0 : 0644);
        ++changes;
        usleep(500);
    }
    const test::ProgramResult ended = job.wait();
    EXPECT_EQ(ended.signal, 0) << ended.errors;
    EXPECT_EQ(ended.status, 0) << ended.errors;
    EXPECT_GT(changes, 10);

    // What cannot be read is no hit; what is open again is tagged by the next job, and found.
    Restore();
    EXPECT_EQ(Run({"index", mRoot}).status, 0);
    EXPECT_EQ(Found(), kSongs);
    for (std::size_t i = 0; i < mFolders.size(); i += 2)
        chmod(mFolders[i].c_str(), 0);
    EXPECT_LT(Found(), kSongs);
    EXPECT_GT(Found(), 0U);
    Restore();
    EXPECT_EQ(Found(), kSongs);
}

TEST_F(LostPermission, ToTheWholeVolumeEndsTheJob) {
    if (Run({"volumes"}).status != 0)
        GTEST_SKIP() << "setpriv cannot start the program as another user";
    test::Program job("/usr/bin/env", AsUser({"index", mRoot}));
    usleep(static_cast<useconds_t>(mRandom() % 300'000));
    chmod(mRoot.c_str(), 0);
    const test::ProgramResult ended = job.wait();
    chmod(mRoot.c_str(), 0755);
    EXPECT_EQ(ended.signal, 0) << ended.errors;
    EXPECT_TRUE(ended.status == 0 || ended.status == 1) << ended.status << ended.errors;
    EXPECT_EQ(Run({"index", mRoot}).status, 0);
    EXPECT_EQ(Found(), kSongs);
}

} // namespace
