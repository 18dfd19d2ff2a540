#include "metadata/PlayTime.h"

#include <gtest/gtest.h>

#include <cstring>
#include <limits>
#include <string>

namespace {

std::string Formatted(int64 lengthUsec) {
    char text[kPlayTimeTextSize];
    FormatPlayTime(lengthUsec, text);
    return text;
}

int64 Parsed(const std::string& value) {
    char buffer[kPlayTimeBufferSize] = {};
    memcpy(buffer, value.data(), std::min(value.size(), sizeof(buffer)));
    return ParsePlayTime(buffer);
}

std::string FormattedBitrate(int32 bitsPerSecond) {
    char text[kBitrateTextSize];
    FormatBitrate(bitsPerSecond, text);
    return text;
}

TEST(PlayTime, IsStoredAsWholeMinutesBelowAnHour) {
    EXPECT_EQ(Formatted(0), " 0:00");
    EXPECT_EQ(Formatted(999999), " 0:00");
    EXPECT_EQ(Formatted(59000000), " 0:00");
    EXPECT_EQ(Formatted(60000000), " 1:00");
    EXPECT_EQ(Formatted(185000000), " 3:00");
    EXPECT_EQ(Formatted(754000000), "12:00");
    EXPECT_EQ(Formatted(3599000000), "59:00");
    EXPECT_EQ(Formatted(3599999999), "59:00");
}

TEST(PlayTime, IsStoredAsHoursAZeroAndMinutesFromAnHourOn) {
    EXPECT_EQ(Formatted(3600000000), "  1: 0:00");
    EXPECT_EQ(Formatted(3725000000), "  1: 0:02");
    EXPECT_EQ(Formatted(36000000000 + 59 * 60000000LL), " 10: 0:59");
    EXPECT_EQ(Formatted(999 * 3600000000LL), "999: 0:00");
}

TEST(PlayTime, FillsTheEighthCharacterAloneWhenTheHoursTakeMoreRoom) {
    EXPECT_EQ(Formatted(1000 * 3600000000LL), "1000: 0: 0");
    EXPECT_EQ(Formatted(10000 * 3600000000LL + 120000000), "10000: 0: 2");
    EXPECT_EQ(Formatted(100000 * 3600000000LL), "100000:00: 0");
}

// -1 microsecond as an unsigned number is 18446744073709 seconds: 5124095576 hours, whose halves are 1 and
// 829128280.
TEST(PlayTime, CountsANegativeTimeAsAVeryLargeOne) {
    EXPECT_EQ(Formatted(-1), "829128280: 1: 1");
    EXPECT_EQ(Formatted(std::numeric_limits<int64>::min()), "-1732919508: 0: 0");
}

TEST(PlayTime, ReadsWholeMinutesBack) {
    EXPECT_EQ(Parsed(" 0:00"), 0);
    EXPECT_EQ(Parsed(" 3:00"), 180000000);
    EXPECT_EQ(Parsed("12:00"), 720000000);
    EXPECT_EQ(Parsed(""), 0);
    EXPECT_EQ(Parsed("7"), 420000000);
    EXPECT_EQ(Parsed(" 3:25"), 180000000);
    EXPECT_EQ(Parsed("x:30"), 0);
    EXPECT_EQ(Parsed("-2:00"), -120000000);
    // Hours read as minutes.
    EXPECT_EQ(Parsed("  1: 0:02"), 60000000);
}

TEST(PlayTime, WrapsAroundAt32Bits) {
    EXPECT_EQ(Parsed("35:00"), 2100000000);
    EXPECT_EQ(Parsed("36:00"), -2134967296);
    EXPECT_EQ(Parsed("59:00"), -754967296);
    EXPECT_EQ(Parsed("72:00"), 25032704);
    EXPECT_EQ(Parsed("4294967:00"), -17760000);
}

TEST(PlayTime, TakesSecondsOnlyFromBehindTheTextsEnd) {
    using namespace std::string_literals;
    EXPECT_EQ(Parsed("3:00\0"s + "17"), 180000000 + 7000000);
    EXPECT_EQ(Parsed("3:00\0\0"s + "17"), 180000000 + 17000000);
    EXPECT_EQ(Parsed("3\0"s + "17"), 180000000 + 17000000);
}

TEST(PlayTime, EndsInsideTheValueWithoutATerminator) {
    EXPECT_EQ(Parsed("2:345678901234567890"), 120000000);
    EXPECT_EQ(Parsed("2:34567890123456789012345678901"), 120000000);
    EXPECT_EQ(Parsed("                   2"), 120000000);
    // Twenty digits: beyond 64 bits a number stops at their limit, whose low half is -1.
    EXPECT_EQ(Parsed("99999999999999999999"), -60000000);
}

TEST(Bitrate, IsShownInKilobitsBetweenItsLimits) {
    EXPECT_EQ(FormattedBitrate(999), "");
    EXPECT_EQ(FormattedBitrate(1000), "  1 kbit");
    EXPECT_EQ(FormattedBitrate(1999), "  1 kbit");
    EXPECT_EQ(FormattedBitrate(64000), " 64 kbit");
    EXPECT_EQ(FormattedBitrate(320000), "320 kbit");
    EXPECT_EQ(FormattedBitrate(999999), "999 kbit");
    EXPECT_EQ(FormattedBitrate(1000000), "");
    EXPECT_EQ(FormattedBitrate(0), "");
    EXPECT_EQ(FormattedBitrate(-128000), "");
}

} // namespace
