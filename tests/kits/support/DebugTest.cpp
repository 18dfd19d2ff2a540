#undef NDEBUG
#include <Debug.h>

#include <gtest/gtest.h>

TEST(DebugTest, AnAssertionThatHoldsDoesNothing) {
    int evaluated = 0;
    ASSERT(++evaluated == 1);
    EXPECT_EQ(evaluated, 1);
}

TEST(DebugDeathTest, AFailedAssertionSaysWhatAndWhere) {
    GTEST_FLAG_SET(death_test_style, "threadsafe");
    EXPECT_DEATH(ASSERT(1 + 1 == 3), "DebugTest\\.cpp:[0-9]+: assertion failed: 1 \\+ 1 == 3");
    EXPECT_DEATH(TRESPASS(), "should not be here");
}
