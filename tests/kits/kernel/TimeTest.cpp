#include <OS.h>

#include <ctime>
#include <gtest/gtest.h>

TEST(TimeTest, SnoozingTakesAtLeastThatLong) {
    const bigtime_t start = system_time();
    EXPECT_EQ(snooze(3000), B_OK);
    EXPECT_GE(system_time() - start, 3000);
}

TEST(TimeTest, SnoozingForNoTimeReturns) {
    EXPECT_EQ(snooze(0), B_OK);
    EXPECT_EQ(snooze(-5), B_OK);
    EXPECT_EQ(snooze_until(system_time() - 1000, B_SYSTEM_TIMEBASE), B_OK);
    EXPECT_EQ(snooze_until(-1, B_SYSTEM_TIMEBASE), B_OK);
}

TEST(TimeTest, SnoozesUntilATime) {
    const bigtime_t until = system_time() + 3000;
    EXPECT_EQ(snooze_until(until, B_SYSTEM_TIMEBASE), B_OK);
    EXPECT_GE(system_time(), until);
    EXPECT_EQ(snooze_until(until, 7), B_BAD_VALUE);
}

TEST(TimeTest, BothUnitsOfTheSystemClockAgree) {
    const bigtime_t before = system_time();
    const int64 nanoseconds = system_time_nsecs();
    const bigtime_t after = system_time();
    EXPECT_LE(before, nanoseconds / 1000);
    EXPECT_LE(nanoseconds / 1000, after);
}

TEST(TimeTest, TheRealTimeClockCountsFrom1970) {
    const time_t before = time(nullptr);
    EXPECT_GE(real_time_clock() + 1U, static_cast<uint32>(before));
    EXPECT_GE(real_time_clock_usecs() / 1000000 + 1, before);
    EXPECT_LE(real_time_clock_usecs() / 1000000, before + 60);
}
