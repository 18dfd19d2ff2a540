#include <Rect.h>

#include <gtest/gtest.h>

TEST(PointTest, Arithmetic) {
    BPoint point(3, 4);
    EXPECT_EQ(point + BPoint(1, 2), BPoint(4, 6));
    EXPECT_EQ(point - BPoint(1, 2), BPoint(2, 2));
    EXPECT_EQ(-point, BPoint(-3, -4));
    point += BPoint(1, 1);
    EXPECT_EQ(point, BPoint(4, 5));
    point -= BPoint(4, 4);
    EXPECT_EQ(point, BPoint(0, 1));
    EXPECT_TRUE(point != B_ORIGIN);
    point.Set(0, 0);
    EXPECT_TRUE(point == B_ORIGIN);
}

TEST(PointTest, ConstrainingMovesToTheNearestPointInside) {
    const BRect rect(10, 10, 20, 20);
    struct Case {
        BPoint before;
        BPoint after;
    };
    const Case cases[] = {
        {{5, 15}, {10, 15}}, {{25, 30}, {20, 20}}, {{12, 13}, {12, 13}}, {{15, 0}, {15, 10}}};
    for (const Case& testCase : cases) {
        BPoint point = testCase.before;
        point.ConstrainTo(rect);
        EXPECT_EQ(point, testCase.after);
    }
}

TEST(PointTest, PrintsItself) {
    testing::internal::CaptureStdout();
    BPoint(1, 2.5F).PrintToStream();
    EXPECT_EQ(testing::internal::GetCapturedStdout(), "BPoint(x:1.0, y:2.5)\n");
}
