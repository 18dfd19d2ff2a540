#include <StopWatch.h>

#include <chrono>
#include <gtest/gtest.h>
#include <thread>

TEST(StopWatchTest, TimeGoesOnOnlyWhileItRuns) {
    BStopWatch watch("silent", true);
    std::this_thread::sleep_for(std::chrono::milliseconds(2));
    watch.Suspend();
    const bigtime_t stopped = watch.ElapsedTime();
    EXPECT_GE(stopped, 2000);
    std::this_thread::sleep_for(std::chrono::milliseconds(2));
    EXPECT_EQ(watch.ElapsedTime(), stopped);
    EXPECT_EQ(watch.Lap(), 0);
    watch.Resume();
    std::this_thread::sleep_for(std::chrono::milliseconds(2));
    EXPECT_GE(watch.Lap(), stopped + 2000);
}

TEST(StopWatchTest, PrintsItsNameWhenItIsNotSilent) {
    testing::internal::CaptureStdout();
    {
        const BStopWatch watch("loud");
        EXPECT_STREQ(watch.Name(), "loud");
    }
    EXPECT_EQ(testing::internal::GetCapturedStdout().find("StopWatch \"loud\": "), 0U);
    testing::internal::CaptureStdout();
    { const BStopWatch watch("quiet", true); }
    EXPECT_EQ(testing::internal::GetCapturedStdout(), "");
}
