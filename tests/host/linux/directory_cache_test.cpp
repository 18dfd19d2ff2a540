#include "host/linux/directory_cache.h"

#include "host/linux/opening.h"
#include "host/linux/volume_table.h"
#include "support/random_seed.h"
#include "support/temporary_environment.h"
#include <atomic>
#include <fcntl.h>
#include <filesystem>
#include <gtest/gtest.h>
#include <thread>

namespace host {
namespace {

namespace fs = std::filesystem;

class DirectoryCacheTest : public testing::Test {
  protected:
    DirectoryCacheTest() : device_(volumes().list().at(0)) {}

    std::string path(const std::string& relative) const { return environment_.volume() + "/" + relative; }
    std::uint64_t make(const std::string& relative) {
        fs::create_directories(path(relative));
        struct stat status = {};
        EXPECT_EQ(::stat(path(relative).c_str(), &status), 0);
        return status.st_ino;
    }

    test::TemporaryEnvironment environment_;
    const DeviceId device_;
    DirectoryCache cache_{4, 64};
};

TEST_F(DirectoryCacheTest, FindsADirectoryThatWasNeverOpened) {
    const std::uint64_t inode = make("a/b/c");

    const auto found = cache_.find(device_, inode);
    ASSERT_TRUE(found.ok());
    EXPECT_EQ(*(*found)->path(), path("a/b/c"));
    EXPECT_EQ((*found)->place()->leaf, "c");
    EXPECT_EQ((*found)->device(), device_);
}

TEST_F(DirectoryCacheTest, FindsNothingByHintsAloneWhereThereAreNone) {
    EXPECT_EQ(cache_.find(device_, make("a/b"), DirectoryCache::Search::hints_only).error(), ENOENT);
}

TEST_F(DirectoryCacheTest, FollowsHintsFromTheRoot) {
    const std::uint64_t a = make("a");
    const std::uint64_t b = make("a/b");
    const std::uint64_t root = volumes().info(device_)->root_inode;
    cache_.remember(device_, a, root, "a");
    cache_.remember(device_, b, a, "b");

    EXPECT_TRUE(cache_.find(device_, b, DirectoryCache::Search::hints_only).ok());
}

TEST_F(DirectoryCacheTest, DoesNotBelieveAWrongHintNorARingOfThem) {
    const std::uint64_t a = make("a");
    const std::uint64_t b = make("b");
    cache_.remember(device_, a, volumes().info(device_)->root_inode, "b");
    EXPECT_EQ(cache_.find(device_, a, DirectoryCache::Search::hints_only).error(), ENOENT);
    cache_.remember(device_, a, b, "x");
    cache_.remember(device_, b, a, "y");

    EXPECT_EQ(cache_.find(device_, a, DirectoryCache::Search::hints_only).error(), ENOENT);
    EXPECT_EQ(*(*cache_.find(device_, a))->path(), path("a"));
}

TEST_F(DirectoryCacheTest, RemembersWhereClosedDirectoriesAre) {
    const std::uint64_t first = make("deep/er/first");
    ASSERT_TRUE(cache_.open_path(path("deep/er/first").c_str()).ok());
    ASSERT_TRUE(cache_.open_path(path("deep/er").c_str()).ok());
    ASSERT_TRUE(cache_.open_path(path("deep").c_str()).ok());
    for (int i = 0; i < 8; ++i) {
        make("other" + std::to_string(i));
        ASSERT_TRUE(cache_.open_path(path("other" + std::to_string(i)).c_str()).ok());
    }
    EXPECT_EQ(cache_.open_count(), 4u);

    EXPECT_TRUE(cache_.find(device_, first, DirectoryCache::Search::hints_only).ok());
}

TEST_F(DirectoryCacheTest, KeepsTheNewestHintsAndThoseInUseAmongTooMany) {
    const std::uint64_t root = volumes().info(device_)->root_inode;
    std::vector<std::uint64_t> inodes;
    for (int i = 0; i < 200; ++i) {
        inodes.push_back(make("d" + std::to_string(i)));
        cache_.remember(device_, inodes.back(), root, "d" + std::to_string(i));
        // In use from the beginning on.
        EXPECT_TRUE(cache_.find(device_, inodes.front(), DirectoryCache::Search::hints_only).ok()) << i;
    }
    // Of 64 at least half.
    for (int i = 199; i >= 200 - 31; --i)
        EXPECT_TRUE(
            cache_.find(device_, inodes[static_cast<std::size_t>(i)], DirectoryCache::Search::hints_only)
                .ok())
            << i;
    EXPECT_EQ(cache_.find(device_, inodes[1], DirectoryCache::Search::hints_only).error(), ENOENT);
}

TEST_F(DirectoryCacheTest, ASearchRemembersTheDirectoriesThatItPasses) {
    std::vector<std::uint64_t> passed;
    for (const char* const name : {"a", "b", "a/c", "b/d"})
        passed.push_back(make(name));
    const std::uint64_t deepest = make("a/c/e");
    ASSERT_TRUE(cache_.find(device_, deepest).ok());
    for (const std::uint64_t inode : passed)
        EXPECT_TRUE(cache_.find(device_, inode, DirectoryCache::Search::hints_only).ok());
}

TEST_F(DirectoryCacheTest, FindsADirectoryAfterItAndItsParentsWereRenamedAndMoved) {
    const std::uint64_t inode = make("a/b/c");
    ASSERT_TRUE(cache_.open_path(path("a/b/c").c_str()).ok());
    fs::rename(path("a/b/c"), path("a/b/renamed"));
    EXPECT_EQ((*cache_.find(device_, inode))->place()->leaf, "renamed");

    DirectoryCache fresh(4, 64);
    make("elsewhere");
    fresh.remember(device_, inode, make("a/b"), "c"); // an old place
    fs::rename(path("a"), path("elsewhere/x"));
    EXPECT_EQ(*(*fresh.find(device_, inode))->path(), path("elsewhere/x/b/renamed"));
}

TEST_F(DirectoryCacheTest, LearnsANameAgainAtOnceAfterARename) {
    make("name0");
    const auto directory = cache_.open_path(path("name0").c_str());
    for (int i = 0; i < 50; ++i) {
        EXPECT_EQ((*directory)->place()->leaf, "name" + std::to_string(i));
        fs::rename(path("name" + std::to_string(i)), path("name" + std::to_string(i + 1)));
    }
    std::this_thread::sleep_for(std::chrono::milliseconds(80));
    EXPECT_EQ((*directory)->place()->leaf, "name50");
    EXPECT_EQ((*directory)->place()->leaf, "name50"); // remembered now
    fs::rename(path("name50"), path("last"));
    EXPECT_EQ((*directory)->place()->leaf, "last");
}

TEST_F(DirectoryCacheTest, SaysNotThereForARemovedDirectory) {
    const std::uint64_t inode = make("gone");
    const auto open = cache_.open_path(path("gone").c_str());
    fs::remove(path("gone"));

    EXPECT_EQ((*open)->path().error(), ENOENT);
    cache_.clear();
    EXPECT_EQ(cache_.find(device_, inode).error(), ENOENT);
    EXPECT_EQ(cache_.find(device_ + 1, inode).error(), ENODEV);
}

TEST_F(DirectoryCacheTest, IsNotMisledByANameThatEndsLikeARemovedOnes) {
    make("odd (deleted)");
    EXPECT_EQ(*(*cache_.open_path(path("odd (deleted)").c_str()))->path(), path("odd (deleted)"));
}

TEST_F(DirectoryCacheTest, HasOneHandleForADirectory) {
    make("a");
    const auto first = cache_.open_path(path("a").c_str());
    const auto second = cache_.open_path((path("a") + "/../a").c_str());
    EXPECT_EQ(first->get(), second->get());
}

TEST_F(DirectoryCacheTest, DoesNotSearchBeyondTheVolumesBorder) {
    const std::uint64_t inside = make("inner/inside");
    const std::uint64_t border = make("inner");
    environment_.declare_volumes(environment_.volume() + ":" + path("inner"));
    const std::vector<DeviceId> ids = volumes().list();
    ASSERT_EQ(ids.size(), 2u);

    EXPECT_EQ(cache_.find(ids[0], inside).error(), ENOENT);
    EXPECT_EQ(cache_.find(ids[0], border).error(), ENOENT);
    EXPECT_TRUE(cache_.find(ids[1], inside).ok());
    EXPECT_TRUE(cache_.find(ids[1], border).ok());
    const auto outer = cache_.open_path(environment_.volume().c_str());
    EXPECT_EQ((*cache_.open_child(**outer, "inner"))->device(), ids[1]);
}

TEST_F(DirectoryCacheTest, FindsDirectoriesOnFileSystemsThatAreNoVolumes) {
    struct stat status = {};
    ASSERT_EQ(::stat(environment_.home().c_str(), &status), 0);
    cache_.remember(status.st_dev, status.st_ino, 0, "wrong");
    const auto opened = cache_.open_path(environment_.home().c_str());
    ASSERT_TRUE(opened.ok());

    EXPECT_EQ((*opened)->device(), status.st_dev);
    EXPECT_TRUE(cache_.find(status.st_dev, status.st_ino).ok());
}

TEST_F(DirectoryCacheTest, ForgetsOneVolume) {
    make("a");
    ASSERT_TRUE(cache_.open_path(path("a").c_str()).ok());
    ASSERT_TRUE(cache_.open_path(environment_.home().c_str()).ok());
    cache_.forget(device_);
    EXPECT_EQ(cache_.open_count(), 1u);
}

TEST_F(DirectoryCacheTest, ServesThreadsWhileDirectoriesMove) {
    std::vector<std::uint64_t> inodes;
    for (int i = 0; i < 12; ++i)
        inodes.push_back(make("left/d" + std::to_string(i)));
    make("right");
    const std::uint64_t seed = RandomSeed();
    std::atomic<bool> moving{true};
    std::vector<std::thread> threads;
    for (unsigned t = 0; t < 3; ++t) {
        threads.emplace_back([&, t] {
            std::mt19937_64 random(seed + t);
            for (int i = 0; i < 300; ++i) {
                const std::uint64_t inode = inodes[random() % inodes.size()];
                const auto found = cache_.find(device_, inode);
                // A search may run past a directory just as it moves; an open one is always found.
                if (found.ok()) {
                    EXPECT_EQ((*found)->inode(), inode);
                    (void)(*found)->place();
                } else {
                    EXPECT_EQ(found.error(), ENOENT);
                }
                if (random() % 50 == 0)
                    cache_.clear();
            }
        });
    }
    std::thread mover([&] {
        for (int i = 0; moving; i = (i + 1) % 12) {
            fs::rename(path("left/d" + std::to_string(i)), path("right/d" + std::to_string(i)));
            std::this_thread::sleep_for(std::chrono::milliseconds(1));
            fs::rename(path("right/d" + std::to_string(i)), path("left/d" + std::to_string(i)));
        }
    });
    for (std::thread& thread : threads)
        thread.join();
    moving = false;
    mover.join();
    cache_.clear();
    std::this_thread::sleep_for(std::chrono::milliseconds(2100)); // a vain search is not repeated before
    for (const std::uint64_t inode : inodes)
        EXPECT_TRUE(cache_.find(device_, inode).ok());
}

} // namespace
} // namespace host
