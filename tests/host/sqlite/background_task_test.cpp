#include "host/sqlite/background_task.h"
#include <atomic>
#include <chrono>
#include <condition_variable>
#include <gtest/gtest.h>
#include <mutex>
#include <thread>

namespace host {
namespace {

/// Work that waits to be let through, so that a test knows when it is under way.
class Gate {
  public:
    void work() {
        std::unique_lock lock(mutex_);
        ++begun_;
        changed_.notify_all();
        changed_.wait(lock, [this] { return allowed_ >= begun_; });
        ++ended_;
        changed_.notify_all();
    }
    void allow(int times) {
        const std::lock_guard lock(mutex_);
        allowed_ = times;
        changed_.notify_all();
    }
    bool wait_for_begun(int times) {
        std::unique_lock lock(mutex_);
        return changed_.wait_for(lock, std::chrono::seconds(60), [&] { return begun_ >= times; });
    }
    bool wait_for_ended(int times) {
        std::unique_lock lock(mutex_);
        return changed_.wait_for(lock, std::chrono::seconds(60), [&] { return ended_ >= times; });
    }
    int begun() {
        const std::lock_guard lock(mutex_);
        return begun_;
    }

  private:
    std::mutex mutex_;
    std::condition_variable changed_;
    int begun_ = 0;
    int ended_ = 0;
    int allowed_ = 0;
};

TEST(BackgroundTask, DoesOnceMoreWhatIsAskedForWhileItIsUnderWay) {
    Gate gate;
    BackgroundTask task("test", [&] { gate.work(); });
    task.start();
    ASSERT_TRUE(gate.wait_for_begun(1));
    for (int i = 0; i < 5; ++i)
        task.start();
    gate.allow(100);
    EXPECT_TRUE(gate.wait_for_ended(2));
    task.stop();
    EXPECT_EQ(gate.begun(), 2);
}

TEST(BackgroundTask, DoesAgainWhatIsAskedForAfterItsEnd) {
    Gate gate;
    gate.allow(100);
    BackgroundTask task("test", [&] { gate.work(); });
    for (int i = 1; i <= 20; ++i) {
        task.start();
        ASSERT_TRUE(gate.wait_for_ended(i)) << i;
    }
    task.stop();
    EXPECT_EQ(gate.begun(), 20);
}

TEST(BackgroundTask, StopWaitsForTheWorkUnderWayAndLetsNoOtherBegin) {
    Gate gate;
    BackgroundTask task("test", [&] { gate.work(); });
    task.start();
    ASSERT_TRUE(gate.wait_for_begun(1));
    task.start();
    std::atomic<bool> stopped{false};
    std::thread stopper([&] {
        task.stop();
        stopped = true;
    });
    std::this_thread::sleep_for(std::chrono::milliseconds(20));
    EXPECT_FALSE(stopped);
    gate.allow(1);
    // It was asked for once more before the stop; whether that still begins is a matter of who comes first.
    gate.allow(2);
    stopper.join();
    const int begun = gate.begun();
    task.start();
    std::this_thread::sleep_for(std::chrono::milliseconds(20));
    EXPECT_EQ(gate.begun(), begun);
}

} // namespace
} // namespace host
