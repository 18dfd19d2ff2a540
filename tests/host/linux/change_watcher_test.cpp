#include "host/api/volumes.h"
#include "host/linux/change_watcher.h"
#include "host/linux/directory_cache.h"
#include <atomic>
#include <condition_variable>
#include <cstdlib>
#include <filesystem>
#include <fstream>
#include <gtest/gtest.h>
#include <mutex>
#include <string>
#include <unistd.h>

namespace host {
namespace {

class ChangeWatcherTest : public ::testing::Test {
  protected:
    void SetUp() override {
        std::string pattern = (std::filesystem::current_path() / "watcher-test-XXXXXX").string();
        ASSERT_NE(mkdtemp(pattern.data()), nullptr);
        base_ = pattern;
        root_ = base_ + "/volume";
        for (int i = 0; i < 20; ++i)
            std::filesystem::create_directories(root_ + "/" + std::to_string(i));
        setenv("BEKITS_VOLUMES", root_.c_str(), 1);
        setenv("XDG_CONFIG_HOME", (base_ + "/config").c_str(), 1);
        device_ = volumes().list().front();
    }
    void TearDown() override {
        DirectoryCache::instance().clear();
        std::filesystem::remove_all(base_);
    }
    static bool eventually(const std::function<bool()>& holds) {
        for (int i = 0; i < 3000 && !holds(); ++i)
            usleep(10000);
        return holds();
    }

    std::string base_;
    std::string root_;
    DeviceId device_ = 0;
};

TEST_F(ChangeWatcherTest, LimitIsSaidOnceAndChangesCountAsMissedFromThenOn) {
    ChangeWatcher::Limits limits;
    limits.directories = 5;
    limits.interval = std::chrono::milliseconds(20);
    std::atomic<int> missed{0};
    ChangeWatcher::Sink sink;
    sink.entry_changed = [](std::uint64_t, const std::string&) {};
    sink.changes_missed = [&] { ++missed; };
    ::testing::internal::CaptureStderr();
    {
        ChangeWatcher first(device_, sink, limits);
        ChangeWatcher second(device_, sink, limits);
        EXPECT_TRUE(eventually([&] { return missed >= 6; }));
    }
    const std::string said = ::testing::internal::GetCapturedStderr();
    const std::string wanted = "fs.inotify.max_user_watches";
    EXPECT_NE(said.find(wanted), std::string::npos);
    EXPECT_EQ(said.find(wanted), said.rfind(wanted)) << said;
}

TEST_F(ChangeWatcherTest, OverflowOfTheEventQueueCountsAsMissedChanges) {
    int capacity = 0;
    std::ifstream("/proc/sys/fs/inotify/max_queued_events") >> capacity;
    if (capacity <= 0 || capacity > 100000)
        GTEST_SKIP() << "the system's event queue holds " << capacity;
    std::mutex mutex;
    std::condition_variable changed;
    bool blocked = false;
    bool released = false;
    std::atomic<int> missed{0};
    ChangeWatcher::Sink sink;
    sink.entry_changed = [&](std::uint64_t, const std::string&) {
        std::unique_lock lock(mutex);
        blocked = true;
        changed.notify_all();
        changed.wait(lock, [&] { return released; });
    };
    sink.changes_missed = [&] { ++missed; };
    ChangeWatcher watcher(device_, sink);
    ASSERT_TRUE(eventually([&] { return missed == 1; })) << "all directories are watched by then";
    std::ofstream(root_ + "/3/first") << "x";
    {
        std::unique_lock lock(mutex);
        changed.wait(lock, [&] { return blocked; });
    }
    // A renaming is two events.
    const std::string names[] = {root_ + "/3/first", root_ + "/3/second"};
    for (int i = 0; i <= capacity; ++i)
        std::filesystem::rename(names[i % 2], names[(i + 1) % 2]);
    {
        const std::lock_guard lock(mutex);
        released = true;
        changed.notify_all();
    }
    EXPECT_TRUE(eventually([&] { return missed >= 2; }));
}

} // namespace
} // namespace host
