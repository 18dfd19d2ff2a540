// Volumes that go away while they are walked, queried and followed, and come back.

#include "host/sqlite/volume_indexes.h"
#include "index_fixture.h"
#include "tests/support/loop_volume.h"
#include <cstdlib>

namespace host {
namespace {

constexpr int kFiles = 400;

class UnmountTest : public ::testing::Test {
  protected:
    void SetUp() override {
        if (!volume_.mounted())
            GTEST_SKIP() << volume_.reason();
        std::string pattern = (std::filesystem::current_path() / "unmount-test-XXXXXX").string();
        ASSERT_NE(mkdtemp(pattern.data()), nullptr);
        base_ = pattern;
        setenv("BEKITS_VOLUMES", volume_.path().c_str(), 1);
        setenv("XDG_DATA_HOME", (base_ + "/data").c_str(), 1);
        setenv("XDG_CONFIG_HOME", (base_ + "/config").c_str(), 1);
        device_ = volumes().list().front();
        ASSERT_TRUE(indexes().create(device_, "A", kText).ok());
        const std::string value = std::string("CSTRx") + '\0';
        for (int i = 0; i < kFiles; ++i) {
            const std::string folder = volume_.path() + "/d" + std::to_string(i % 40);
            const std::string file = folder + "/" + std::to_string(i);
            std::filesystem::create_directories(folder);
            std::ofstream(file) << "content";
            ASSERT_EQ(setxattr(file.c_str(), "user.be.A", value.data(), value.size(), 0), 0);
        }
        ASSERT_TRUE(indexes().reconcile(device_, Indexes::Depth::thorough, nullptr).ok());
    }
    void TearDown() override {
        indexes().shut_down();
        DirectoryCache::instance().clear();
        if (!base_.empty())
            std::filesystem::remove_all(base_);
    }
    static std::shared_ptr<const Predicate> predicate(const char* attribute, const char* text) {
        auto predicate = std::make_shared<Predicate>();
        predicate->op = Predicate::Operator::contains;
        predicate->attribute = attribute;
        predicate->value = std::string(text);
        return predicate;
    }
    void detach() {
        ASSERT_EQ(std::system(("umount -l " + volume_.path()).c_str()), 0);
        DirectoryCache::instance().clear();
    }
    /// Hits of a query that begins on the mounted volume and loses it after a few of them.
    int hits_while_unmounting(const std::shared_ptr<const Predicate>& wanted, Status& end) {
        auto query = indexes().query(device_, wanted, nullptr);
        EXPECT_TRUE(query.ok());
        RunningQuery::Hit hit;
        int hits = 0;
        for (; hits < 20; ++hits)
            EXPECT_TRUE((*query)->next(hit).ok());
        detach();
        while ((end = (*query)->next(hit)).ok())
            ++hits;
        return hits;
    }
    void expect_usable_again() {
        ASSERT_TRUE(volume_.mount()) << volume_.reason();
        device_ = volumes().list().front();
        EXPECT_EQ(hits_on(device_, "x"), kFiles);
    }
    static int hits_on(DeviceId device, const char* text) {
        const auto query = indexes().query(device, predicate("A", text), nullptr);
        EXPECT_TRUE(query.ok()) << query.error();
        RunningQuery::Hit hit;
        int hits = 0;
        while (query.ok() && (*query)->next(hit).ok()) {
            EXPECT_EQ(hit.ref.device, device);
            ++hits;
        }
        return hits;
    }

    test::LoopVolume volume_{"ext4", 32};
    std::string base_;
    DeviceId device_ = 0;
};

TEST_F(UnmountTest, IndexQueryEndsWithNoDevice) {
    Status end;
    EXPECT_LE(hits_while_unmounting(predicate("A", "x"), end), kFiles);
    EXPECT_EQ(end.error(), ENODEV);
    EXPECT_EQ(indexes().query(device_, predicate("A", "x"), nullptr).error(), ENODEV);
    expect_usable_again();
}

TEST_F(UnmountTest, WalkEndsWithNoDevice) {
    Status end;
    EXPECT_LE(hits_while_unmounting(predicate("name", ""), end), kFiles + 41);
    EXPECT_EQ(end.error(), ENODEV);
    EXPECT_EQ(indexes().query(device_, predicate("name", "1"), nullptr).error(), ENODEV);
    expect_usable_again();
}

TEST_F(UnmountTest, OpenIndexDoesNotKeepTheVolumeBusy) {
    indexes().follow_changes();
    Status end;
    {
        const auto query = indexes().query(device_, predicate("A", "x"), nullptr);
        ASSERT_TRUE(query.ok());
        RunningQuery::Hit hit;
        while ((*query)->next(hit).ok()) {
        }
    }
    // The watcher reads the directories first, and the directory cache lets go after a while.
    bool unmounted = false;
    for (int i = 0; i < 100 && !unmounted; ++i) {
        unmounted = volume_.unmount();
        usleep(100000);
        DirectoryCache::instance().clear();
    }
    ASSERT_TRUE(unmounted) << volume_.reason();
    EXPECT_EQ(indexes().query(device_, predicate("A", "x"), nullptr).error(), ENODEV);
    expect_usable_again();
}

TEST_F(UnmountTest, RebuildEndsWithNoDeviceAndKeepsTheRows) {
    bool detached = false;
    for (int i = 0; i < 3000; ++i)
        std::ofstream(volume_.path() + "/d0/more" + std::to_string(i)) << "c";
    const Status rebuilt = indexes().rebuild(device_, [&](std::uint64_t) {
        if (!std::exchange(detached, true))
            detach();
        return true;
    });
    EXPECT_TRUE(detached);
    EXPECT_EQ(rebuilt.error(), ENODEV);
    expect_usable_again();
}

TEST_F(UnmountTest, MountedUnderAnotherNumberItKeepsItsIndexAndItsNumberIsTheOthers) {
    const DeviceId old_device = device_;
    const std::string key = VolumeTable::instance().current()->find(device_)->stable_key;
    const auto old_ref = file_system().entry_of(volume_.path() + "/d0/0", Follow::no);
    ASSERT_TRUE(old_ref.ok());
    ASSERT_TRUE(volume_.unmount() || (DirectoryCache::instance().clear(), volume_.unmount()))
        << volume_.reason();
    // Takes the loop device that has become free, and with it the number.
    test::LoopVolume other("ext4", 32);
    ASSERT_TRUE(other.mounted()) << other.reason();
    ASSERT_TRUE(volume_.mount()) << volume_.reason();
    setenv("BEKITS_VOLUMES", (volume_.path() + ":" + other.path()).c_str(), 1);
    const auto list = volumes().list();
    ASSERT_EQ(list.size(), 2U);
    device_ = list[0];
    if (list[1] != old_device)
        GTEST_SKIP() << "the system gave the other volume another number";

    // The index is the same one, and its rows are good as they are.
    EXPECT_NE(device_, old_device);
    EXPECT_EQ(VolumeTable::instance().current()->find(device_)->stable_key, key);
    EXPECT_EQ(hits_on(device_, "x"), kFiles);
    const WriterStatistics statistics = dynamic_cast<VolumeIndexes&>(indexes()).of(device_)->statistics();
    EXPECT_EQ(statistics.reported_read + statistics.observed_read, 0U);
    const auto ref = file_system().entry_of(volume_.path() + "/d0/0", Follow::no);
    ASSERT_TRUE(ref.ok());
    EXPECT_EQ(ref->device, device_);
    EXPECT_EQ(ref->directory, old_ref->directory);
    EXPECT_TRUE(file_system().open(*ref, {}).ok());

    // The old number means the other volume now, which has neither that file nor an index.
    EXPECT_EQ(file_system().open(*old_ref, {}).error(), ENOENT);
    EXPECT_EQ(indexes().list(old_device)->size(), 3U);
    EXPECT_TRUE(indexes().create(old_device, "A", kText).ok());
    std::ofstream(other.path() + "/alone") << "content";
    const std::string value = std::string("CSTRx") + '\0';
    ASSERT_EQ(setxattr((other.path() + "/alone").c_str(), "user.be.A", value.data(), value.size(), 0), 0);
    ASSERT_TRUE(indexes().reconcile(old_device, Indexes::Depth::thorough, nullptr).ok());
    EXPECT_EQ(hits_on(old_device, "x"), 1);
    EXPECT_EQ(hits_on(device_, "x"), kFiles);
    indexes().shut_down();
    DirectoryCache::instance().clear();
}

TEST_F(UnmountTest, VolumeMountedLaterIsFollowed) {
    ASSERT_TRUE(volume_.unmount() || (DirectoryCache::instance().clear(), volume_.unmount()))
        << volume_.reason();
    indexes().follow_changes();
    ASSERT_TRUE(volume_.mount());
    const std::string file = volume_.path() + "/d0/0";
    const std::string value = std::string("CSTRother") + '\0';
    bool found = false;
    for (int i = 0; i < 200 && !found; ++i) {
        usleep(100000);
        // Only a watcher tells the index: nothing here makes it look.
        ASSERT_EQ(setxattr(file.c_str(), "user.be.A", value.data(), value.size(), 0), 0);
        const auto list = volumes().list();
        if (list.empty())
            continue;
        const auto query = indexes().query(list.front(), predicate("A", "other"), nullptr);
        RunningQuery::Hit hit;
        found = query.ok() && (*query)->next(hit).ok();
    }
    EXPECT_TRUE(found);
}

} // namespace
} // namespace host
