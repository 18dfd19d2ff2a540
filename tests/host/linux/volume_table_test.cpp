#include "host/linux/volume_table.h"

#include "host/linux/system_calls.h"
#include "support/attribute_file.h"
#include "support/loop_volume.h"
#include "support/temporary_environment.h"
#include <algorithm>
#include <condition_variable>
#include <fcntl.h>
#include <filesystem>
#include <gtest/gtest.h>
#include <mutex>
#include <sys/stat.h>

namespace host {
namespace {

ino_t inode_of(const std::string& path) {
    struct stat status = {};
    ::stat(path.c_str(), &status);
    return status.st_ino;
}

dev_t device_of(const std::string& path) {
    struct stat status = {};
    ::stat(path.c_str(), &status);
    return status.st_dev;
}

class VolumeTableTest : public testing::Test {
  protected:
    std::string make_directory(const std::string& path) {
        std::filesystem::create_directories(path);
        return path;
    }

    test::TemporaryEnvironment environment_;
};

TEST_F(VolumeTableTest, ListsExactlyTheDirectoriesOfTheVariableInTheirOrder) {
    const std::string second = make_directory(environment_.root() + "/second");
    environment_.declare_volumes(second + "/:" + environment_.volume() + ":" + second);

    const std::vector<DeviceId> ids = volumes().list();
    ASSERT_EQ(ids.size(), 2u);
    EXPECT_EQ(volumes().info(ids[0])->root, second);
    EXPECT_EQ(volumes().info(ids[1])->root, environment_.volume());
}

TEST_F(VolumeTableTest, DescribesADeclaredDirectory) {
    const std::vector<DeviceId> ids = volumes().list();
    ASSERT_EQ(ids.size(), 1u);
    const Result<VolumeInfo> info = volumes().info(ids[0]);
    ASSERT_TRUE(info.ok());

    EXPECT_NE(info->id & std::uint64_t{1} << 63, 0u);
    EXPECT_EQ(info->name, "volume");
    EXPECT_EQ(info->root_inode, inode_of(environment_.volume()));
    EXPECT_TRUE(info->declared);
    EXPECT_TRUE(info->persistent);
    EXPECT_TRUE(info->knows_attributes);
    EXPECT_TRUE(info->knows_queries);
    EXPECT_FALSE(info->read_only);
    EXPECT_FALSE(info->file_system.empty());
    EXPECT_GT(info->capacity, 0);
    EXPECT_GT(info->block_size, 0);
}

TEST_F(VolumeTableTest, GivesTheSameDirectoryTheSameNumberAndKeyAgain) {
    const DeviceId first = volumes().list().at(0);
    const std::string key = VolumeTable::instance().current()->find(first)->stable_key;
    environment_.declare_volumes("/");
    volumes().list();
    environment_.declare_volumes(environment_.volume());

    EXPECT_EQ(volumes().list().at(0), first);
    EXPECT_EQ(VolumeTable::instance().current()->find(first)->stable_key, key);
    EXPECT_EQ(key.find_first_not_of("0123456789abcdef-"), std::string::npos);
}

TEST_F(VolumeTableTest, ADeclaredDirectoryIsAVolumeAsSoonAsItExists) {
    const std::string later = environment_.root() + "/later";
    environment_.declare_volumes(later);
    EXPECT_TRUE(volumes().list().empty());

    make_directory(later);
    ASSERT_EQ(volumes().list().size(), 1u);
    const DeviceId id = volumes().list()[0];

    std::filesystem::remove(later);
    EXPECT_TRUE(volumes().list().empty());
    EXPECT_EQ(volumes().info(id).error(), ENODEV);
}

/// The paths that are looked at from outside.
class LookedAt final : public SystemCalls {
  public:
    int fstatat(int directory, const char* path, struct stat* result, int flags) override {
        {
            const std::lock_guard lock(mutex_);
            paths_.emplace_back(path);
        }
        return SystemCalls::fstatat(directory, path, result, flags);
    }
    bool has(const std::string& path) {
        const std::lock_guard lock(mutex_);
        return std::ranges::find(paths_, path) != paths_.end();
    }

  private:
    std::mutex mutex_;
    std::vector<std::string> paths_;
};

TEST_F(VolumeTableTest, WhoAsksForOneVolumeHasNoOtherLookedAt) {
    const std::string first = make_directory(environment_.root() + "/first");
    const std::string second = make_directory(environment_.root() + "/second");
    const std::string third = make_directory(environment_.root() + "/third");
    environment_.declare_volumes(first + ":" + second + ":" + third);
    const std::vector<DeviceId> ids = volumes().list();
    ASSERT_EQ(ids.size(), 3u);

    LookedAt looked_at;
    const ScopedSystemCalls scope(looked_at);
    EXPECT_EQ(volumes().info(ids[1])->root, second);
    EXPECT_TRUE(looked_at.has(second));
    EXPECT_FALSE(looked_at.has(first));
    EXPECT_FALSE(looked_at.has(third));
}

TEST_F(VolumeTableTest, OthersThatChangedAreSeenAfterOneWasAskedFor) {
    const std::string stays = make_directory(environment_.root() + "/stays");
    const std::string goes = make_directory(environment_.root() + "/goes");
    const std::string comes = environment_.root() + "/comes";
    const std::string waits = make_directory(environment_.root() + "/waits");
    environment_.declare_volumes(stays + ":" + goes + ":" + comes);
    const std::vector<DeviceId> ids = volumes().list();
    ASSERT_EQ(ids.size(), 2u);

    std::filesystem::remove(goes);
    // Not made now: it would get the other's inode.
    std::filesystem::rename(waits, comes);
    EXPECT_EQ(volumes().info(ids[0])->root, stays);
    EXPECT_EQ(volumes().info(ids[1]).error(), ENODEV);
    const std::vector<DeviceId> now = volumes().list();
    ASSERT_EQ(now.size(), 2u);
    EXPECT_EQ(now[0], ids[0]);
    EXPECT_EQ(volumes().info(now[1])->root, comes);
}

TEST_F(VolumeTableTest, AnotherDirectoryInItsPlaceIsAnotherVolume) {
    const std::string place = make_directory(environment_.root() + "/place");
    environment_.declare_volumes(place);
    const DeviceId before = volumes().list().at(0);
    EXPECT_TRUE(volumes().info(before).ok());

    std::filesystem::rename(place, environment_.root() + "/elsewhere");
    make_directory(place);
    EXPECT_EQ(volumes().info(before).error(), ENODEV);
    EXPECT_NE(volumes().list().at(0), before);
}

TEST_F(VolumeTableTest, TheDeepestVolumeAnswersForAPath) {
    const std::string inner = make_directory(environment_.volume() + "/a/inner");
    make_directory(inner + "/b");
    environment_.declare_volumes(environment_.volume() + ":" + inner);
    const std::vector<DeviceId> ids = volumes().list();
    ASSERT_EQ(ids.size(), 2u);

    EXPECT_EQ(*volumes().volume_of(environment_.volume()), ids[0]);
    EXPECT_EQ(*volumes().volume_of(environment_.volume() + "/a"), ids[0]);
    EXPECT_EQ(*volumes().volume_of(inner), ids[1]);
    EXPECT_EQ(*volumes().volume_of(inner + "/b/not there"), ids[1]);
    EXPECT_EQ(volumes().volume_of(environment_.home()).error(), ENODEV);
    EXPECT_EQ(volumes().volume_of("relative").error(), EINVAL);
}

TEST_F(VolumeTableTest, ResolvesLinksInADeclaredPath) {
    const std::string link = environment_.root() + "/link";
    std::filesystem::create_symlink(environment_.volume(), link);
    const DeviceId direct = volumes().list().at(0);
    environment_.declare_volumes(link);

    ASSERT_EQ(volumes().list().size(), 1u);
    EXPECT_EQ(volumes().list()[0], direct);
    EXPECT_EQ(*volumes().volume_of(link), direct);
}

TEST_F(VolumeTableTest, BordersAreOtherVolumesRoots) {
    const std::string inner = make_directory(environment_.volume() + "/inner");
    const std::string plain = make_directory(environment_.volume() + "/plain");
    environment_.declare_volumes(environment_.volume() + ":" + inner);
    const auto snapshot = VolumeTable::instance().refresh();
    const Volume& outer = snapshot->volumes()[0];
    const dev_t device = device_of(inner);

    EXPECT_TRUE(snapshot->is_border(outer, device, inode_of(inner)));
    EXPECT_FALSE(snapshot->is_border(outer, device, inode_of(plain)));
    EXPECT_FALSE(snapshot->is_border(outer, device, inode_of(environment_.volume())));
    EXPECT_TRUE(snapshot->is_border(outer, device_of("/proc"), inode_of("/proc")));
}

TEST_F(VolumeTableTest, ListsMountedFileSystemsAfterTheUsersMusic) {
    make_directory(environment_.home() + "/Music");
    environment_.unset("BEKITS_VOLUMES");

    const std::vector<DeviceId> ids = volumes().list();
    ASSERT_GE(ids.size(), 2u);
    EXPECT_EQ(volumes().info(ids[0])->name, "Music");
    const Result<VolumeInfo> boot = volumes().info(volumes().boot_volume());
    ASSERT_TRUE(boot.ok());
    EXPECT_EQ(boot->root, "/");
    EXPECT_EQ(boot->id, device_of("/"));
    for (const DeviceId id : ids)
        EXPECT_NE(volumes().info(id)->file_system, "proc");
}

// What a listener heard, waited for.
class Heard {
  public:
    Volumes::Listener listener() {
        return [this](Volumes::Change change, DeviceId, const VolumeInfo& info) {
            const std::lock_guard lock(mutex_);
            heard_.push_back((change == Volumes::Change::mounted ? "+" : "-") + info.root);
            condition_.notify_all();
        };
    }
    bool wait_for(const std::string& text) {
        std::unique_lock lock(mutex_);
        return condition_.wait_for(lock, std::chrono::seconds(20), [&] {
            return std::find(heard_.begin(), heard_.end(), text) != heard_.end();
        });
    }

  private:
    std::mutex mutex_;
    std::condition_variable condition_;
    std::vector<std::string> heard_;
};

TEST_F(VolumeTableTest, TellsListenersOfDeclaredDirectoriesThatComeAndGo) {
    const std::string later = environment_.root() + "/later";
    environment_.declare_volumes(environment_.volume() + ":" + later);
    Heard heard;
    auto token = volumes().listen(heard.listener());
    make_directory(later);
    EXPECT_TRUE(heard.wait_for("+" + later));
    std::filesystem::remove(later);
    EXPECT_TRUE(heard.wait_for("-" + later));
    token.reset();
    token = volumes().listen(heard.listener()); // and again after the last one has gone
}

class MountedVolume : public testing::Test {
  protected:
    test::TemporaryEnvironment environment_{test::TemporaryEnvironment::DeclaredVolume::none};
};

TEST_F(MountedVolume, AppearsOnceWithItsLabelAndGoesWhenUnmounted) {
    Heard heard;
    const auto token = volumes().listen(heard.listener());
    test::LoopVolume loop("ext4", 16, "-L Tunes");
    if (!loop.mounted())
        GTEST_SKIP() << loop.reason();
    const std::string elsewhere = environment_.root() + "/elsewhere";
    std::filesystem::create_directory(elsewhere);
    ASSERT_TRUE(loop.bind_to(elsewhere)) << loop.reason();

    const Result<DeviceId> id = volumes().volume_of(loop.path());
    ASSERT_TRUE(id.ok());
    const Result<VolumeInfo> info = volumes().info(*id);
    EXPECT_EQ(*id, device_of(loop.path()));
    EXPECT_EQ(info->name, "Tunes");
    EXPECT_EQ(info->root, loop.path());
    EXPECT_EQ(info->file_system, "ext4");
    EXPECT_TRUE(info->knows_attributes);
    EXPECT_FALSE(info->declared);
    int appearances = 0;
    for (const DeviceId each : volumes().list())
        appearances += each == *id ? 1 : 0;
    EXPECT_EQ(appearances, 1);
    EXPECT_TRUE(heard.wait_for("+" + loop.path()));
}

TEST_F(MountedVolume, IsToldOfWhenUnmounted) {
    Heard heard;
    const auto token = volumes().listen(heard.listener());
    test::LoopVolume loop("ext4", 16);
    if (!loop.mounted())
        GTEST_SKIP() << loop.reason();
    ASSERT_TRUE(heard.wait_for("+" + loop.path()));
    const Result<DeviceId> id = volumes().volume_of(loop.path());
    ASSERT_TRUE(loop.unmount()) << loop.reason();

    EXPECT_TRUE(heard.wait_for("-" + loop.path()));
    EXPECT_EQ(volumes().info(*id).error(), ENODEV);
}

TEST_F(MountedVolume, MountedReadOnlyStillKnowsAttributes) {
    test::LoopVolume loop("ext4", 16);
    if (!loop.mounted())
        GTEST_SKIP() << loop.reason();
    ASSERT_TRUE(loop.remount_read_only()) << loop.reason();

    const Result<VolumeInfo> info = volumes().info(*volumes().volume_of(loop.path()));
    EXPECT_TRUE(info->read_only);
    EXPECT_TRUE(info->knows_attributes);
    EXPECT_EQ(info->name, "mounted");
}

TEST_F(MountedVolume, OfFatKnowsNoAttributes) {
    test::LoopVolume loop("vfat", 16, "-n STICK");
    if (!loop.mounted())
        GTEST_SKIP() << loop.reason();

    const Result<VolumeInfo> info = volumes().info(*volumes().volume_of(loop.path()));
    ASSERT_TRUE(info.ok());
    EXPECT_FALSE(info->knows_attributes);
    EXPECT_FALSE(info->knows_queries);
    EXPECT_EQ(test::OpenFile(loop.path() + "/file").write("a", "b").error(), ENOTSUP);
}

TEST_F(MountedVolume, OfBtrfsHasTheNumberThatStatGivesItsFiles) {
    test::LoopVolume loop("btrfs", 128, "-L Tunes");
    if (!loop.mounted())
        GTEST_SKIP() << loop.reason();

    const Result<DeviceId> id = volumes().volume_of(loop.path());
    ASSERT_TRUE(id.ok());
    EXPECT_EQ(*id, device_of(loop.path()));
    EXPECT_EQ(volumes().info(*id)->name, "Tunes");
    EXPECT_TRUE(volumes().info(*id)->knows_attributes);
}

TEST_F(MountedVolume, CanBeUnmountedSoonAfterItsFilesWereLookedAt) {
    test::LoopVolume loop("ext4", 16);
    if (!loop.mounted())
        GTEST_SKIP() << loop.reason();
    ASSERT_TRUE(DirectoryCache::instance().open_path(loop.path().c_str()).ok());
    EXPECT_FALSE(loop.unmount()); // still open

    bool unmounted = false;
    for (int i = 0; i < 100 && !unmounted; ++i) {
        std::this_thread::sleep_for(std::chrono::milliseconds(100));
        unmounted = loop.unmount();
    }
    EXPECT_TRUE(unmounted) << loop.reason();
}

} // namespace
} // namespace host
