// Jobs on a volume that others change, that cannot be written, or that goes away.
#include "VolumeJobs.h"

#include "support/captured_output.h"
#include "support/random_seed.h"

#include <atomic>
#include <random>
#include <thread>

namespace {

class ChangingVolume : public TrackTest {
  protected:
    std::unique_ptr<FileIndexListItem> mItem = MakeItem(Volume());
};

// What others do to files at any moment, failing or not.
class Disturber {
  public:
    Disturber(std::string root, uint64_t seed)
        : mRoot(std::move(root)), mRandom(seed), mThread([this] { Run(); }) {}
    ~Disturber() {
        mStop = true;
        mThread.join();
    }
    int Changes() const { return mChanges; }

  private:
    std::string AnyPath() {
        return mRoot + "/" + std::to_string(mRandom() % 10) + "/Artist - " + std::to_string(mRandom() % 400) +
               ".mp3";
    }

    void Run() {
        std::error_code ignored;
        while (!mStop) {
            const std::string path = AnyPath();
            const std::string folder = mRoot + "/" + std::to_string(mRandom() % 10);
            switch (mRandom() % 8) {
            case 0:
                std::filesystem::remove(path, ignored);
                break;
            case 1:
                std::ofstream(path) << "new";
                break;
            case 2:
                std::filesystem::rename(path, AnyPath(), ignored);
                break;
            case 3:
                std::filesystem::permissions(path, std::filesystem::perms::none, ignored);
                break;
            case 4:
                std::filesystem::permissions(path, std::filesystem::perms::owner_all, ignored);
                break;
            case 5:
                std::filesystem::rename(folder, folder + "x", ignored);
                std::filesystem::rename(folder + "x", folder, ignored);
                break;
            case 6:
                std::filesystem::remove(path, ignored);
                std::filesystem::create_directory(path, ignored);
                break;
            case 7:
                std::filesystem::remove(path, ignored);
                // To nothing: other steps write through it.
                std::filesystem::create_symlink("nowhere", path, ignored);
                break;
            }
            ++mChanges;
            // The jobs run at low priority: they must get their turn between the changes.
            snooze(200);
        }
    }

    std::string mRoot;
    std::mt19937_64 mRandom;
    std::atomic<bool> mStop{false};
    std::atomic<int> mChanges{0};
    std::thread mThread;
};

TEST_F(ChangingVolume, JobsEndWhileFilesComeGoAndChange) {
    for (int i = 0; i < 1000; ++i)
        MakeFile(std::to_string(i % 10) + "/Artist - " + std::to_string(i) + ".mp3");

    {
        const Disturber disturber(Volume(), RandomSeed());
        for (int round = 0; round < 2; ++round) {
            RunToEnd(*mItem, &FileIndexListItem::IndexAttributes);
            EXPECT_EQ(mItem->Progress(), 1.0f);
            RunToEnd(*mItem, &FileIndexListItem::EraseAttributes);
            EXPECT_EQ(mItem->Progress(), 1.0f);
        }
        EXPECT_GT(disturber.Changes(), 0);
    }

    // Files that nobody touched were all done.
    RunToEnd(*mItem, &FileIndexListItem::IndexAttributes);
    EXPECT_EQ(Text(Volume() + "/5/Artist - 995.mp3", "Audio:Artist"), "Artist ");
}

TEST_F(ChangingVolume, AJobCanBeCancelledAtAnyMoment) {
    for (int i = 0; i < 300; ++i)
        MakeFile(std::to_string(i % 10) + "/Artist - " + std::to_string(i) + ".mp3");
    std::mt19937_64 random(RandomSeed());

    for (int i = 0; i < 60; ++i) {
        if (random() % 2)
            mItem->IndexAttributes();
        else
            mItem->EraseAttributes();
        snooze(static_cast<bigtime_t>(random() % 3000));
        mItem->CancelScan();
        ASSERT_FALSE(mItem->IsRunning());
        ASSERT_EQ(StatusTextOf(*mItem), "Cancelled.");
    }
}

TEST_F(ChangingVolume, AFolderNamedLikeAFileIsVisitedLikeOne) {
    const std::string folder = Volume() + "/Artist - Folder.mp3";
    std::filesystem::create_directory(folder);
    MakeFile("Artist - Folder.mp3/01 - Song.mp3");

    RunToEnd(*mItem, &FileIndexListItem::IndexAttributes);

    EXPECT_EQ(mItem->FileCount(), 2);
    EXPECT_EQ(Text(folder, "Audio:Songname"), "Folder");
}

TEST_F(ChangingVolume, AVolumeThatCannotBeWrittenIsWalkedAndLeftAsItIs) {
    const std::string root = TestVolumes::Instance().ReadOnly();
    if (root.empty())
        GTEST_SKIP() << "this process may not mount file systems";
    const auto item = MakeItem(root);

    CapturedOutput output;
    RunToEnd(*item, &FileIndexListItem::IndexAttributes);
    EXPECT_EQ(item->FileCount(), 1);
    RunToEnd(*item, &FileIndexListItem::EraseAttributes);
    EXPECT_EQ(item->FileCount(), 1);

    EXPECT_EQ(output.text(), "");
    EXPECT_TRUE(AttributeNames(root + "/Artist - Song.mp3").empty());
}

TEST_F(ChangingVolume, AJobWhoseQueryFailsSaysSoAndKeepsTheWordsOfARunningOne) {
    const std::string root = TestVolumes::Instance().Passing();
    const auto item = MakeItem(root);
    std::filesystem::remove_all(root);

    CapturedOutput output;
    RunToEnd(*item, &FileIndexListItem::IndexAttributes);
    const std::string text = output.text();
    std::filesystem::create_directory(root);

    EXPECT_EQ(text, "Error Invalid argument while on Fetch()\n");
    EXPECT_FALSE(item->IsRunning());
    EXPECT_TRUE(item->IsDone());
    EXPECT_EQ(item->Progress(), 0.05f);
    EXPECT_EQ(StatusTextOf(*item), "Indexing files (0)");
}

TEST_F(ChangingVolume, ARowOfAVolumeThatHasGoneSaysThatItFoundNoIcon) {
    const std::string root = TestVolumes::Instance().Passing();
    const auto item = MakeItem(root);
    auto entry = std::make_unique<VolumeListEntry>();
    entry->query = std::make_unique<BQuery>();
    entry->volume = std::make_unique<BVolume>(*item->Entry().volume);
    std::filesystem::remove_all(root);

    CapturedOutput output;
    const FileIndexListItem gone(entry.release());
    const std::string text = output.text();
    std::filesystem::create_directory(root);

    EXPECT_EQ(text, "can't get icon for volume\n");
    EXPECT_EQ(gone.Icon(), nullptr);
    EXPECT_FALSE(gone.IsSupported());
    EXPECT_NE(item->Icon(), nullptr);
}

TEST_F(ChangingVolume, AJobEndsOnAVolumeThatGoesAway) {
    const std::string root = TestVolumes::Instance().Passing();
    for (int i = 0; i < 500; ++i) {
        std::filesystem::create_directories(root + "/" + std::to_string(i));
        std::ofstream(root + "/" + std::to_string(i) + "/Artist - Song.mp3") << "not music";
    }
    const auto item = MakeItem(root);

    item->IndexAttributes();
    EXPECT_TRUE(WaitUntil([&] { return item->FileCount() > 0 || item->IsDone(); }));
    std::filesystem::remove_all(root);
    EXPECT_TRUE(WaitUntil([&] { return item->IsDone(); }));
    EXPECT_FALSE(item->IsRunning());

    std::filesystem::create_directory(root);
}

} // namespace
