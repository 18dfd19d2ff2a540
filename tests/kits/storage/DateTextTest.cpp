#include <DateText.h>

#include <gtest/gtest.h>
#include <stdlib.h>
#include <string>

namespace {

constexpr time_t kNow = 1'000'200'000; // 2001-09-11 09:20 UTC, a Tuesday

class DateText : public testing::Test {
  protected:
    void SetUp() override {
        const char* zone = getenv("TZ");
        mHadZone = zone != nullptr;
        mZone = mHadZone ? zone : "";
        setenv("TZ", "UTC", 1);
        tzset();
    }
    void TearDown() override {
        if (mHadZone)
            setenv("TZ", mZone.c_str(), 1);
        else
            unsetenv("TZ");
        tzset();
    }

    static std::string Text(std::string_view words) {
        std::optional<time_t> time = TimeFromText(words, kNow);
        if (!time)
            return "none";
        tm fields;
        gmtime_r(&*time, &fields);
        char buffer[64];
        strftime(buffer, sizeof(buffer), "%Y-%m-%d %H:%M:%S", &fields);
        return buffer;
    }

    bool mHadZone = false;
    std::string mZone;
};

} // namespace

TEST_F(DateText, NamedDaysBeginAtMidnight) {
    EXPECT_EQ(Text("now"), "2001-09-11 09:20:00");
    EXPECT_EQ(Text("today"), "2001-09-11 00:00:00");
    EXPECT_EQ(Text("Yesterday"), "2001-09-10 00:00:00");
    EXPECT_EQ(Text("tomorrow 12:30"), "2001-09-12 12:30:00");
    EXPECT_EQ(Text("08:05:09"), "2001-09-11 08:05:09");
}

TEST_F(DateText, SpansCountFromNow) {
    EXPECT_EQ(Text("3 days ago"), "2001-09-08 09:20:00");
    EXPECT_EQ(Text("1 week ago"), "2001-09-04 09:20:00");
    EXPECT_EQ(Text("2 months ago"), "2001-07-11 09:20:00");
    EXPECT_EQ(Text("1 year ago"), "2000-09-11 09:20:00");
    EXPECT_EQ(Text("90 minutes"), "2001-09-11 10:50:00");
    EXPECT_EQ(Text("30 seconds ago"), "2001-09-11 09:19:30");
}

TEST_F(DateText, WeekdaysAreThoseBefore) {
    EXPECT_EQ(Text("monday"), "2001-09-10 00:00:00");
    EXPECT_EQ(Text("last tuesday"), "2001-09-04 00:00:00");
    EXPECT_EQ(Text("wednesday"), "2001-09-05 00:00:00");
}

TEST_F(DateText, WrittenDates) {
    EXPECT_EQ(Text("2001-02-03"), "2001-02-03 00:00:00");
    EXPECT_EQ(Text("2001-02-03 04:05"), "2001-02-03 04:05:00");
    EXPECT_EQ(Text("2001-02-03T04:05:06"), "2001-02-03 04:05:06");
    EXPECT_EQ(Text("02/03/2001"), "2001-02-03 00:00:00");
    EXPECT_EQ(Text("2/3/99"), "1999-02-03 00:00:00");
    EXPECT_EQ(Text("2/3/05"), "2005-02-03 00:00:00");
    EXPECT_EQ(Text("Feb 3, 2001"), "2001-02-03 00:00:00");
    EXPECT_EQ(Text("3 february 2001 23:59"), "2001-02-03 23:59:00");
}

TEST_F(DateText, AnythingElseIsRefused) {
    for (const char* text : {"",
                             " ",
                             "soon",
                             "2001-13-01",
                             "2001-04-31",
                             "2001-02-03 25:00",
                             "13/01/2001",
                             "1/2/3/4",
                             "2001-02",
                             "3 apples ago",
                             "ago",
                             "now now",
                             "today today",
                             "12:",
                             ":",
                             "1:2:3:4",
                             "feb 3",
                             "2001-02-03tT",
                             "99999999 days ago",
                             "last",
                             "-1 days"})
        EXPECT_EQ(Text(text), "none") << text;
}
