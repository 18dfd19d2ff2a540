#include <SupportDefs.h>
#include <TypeConstants.h>

#include <gtest/gtest.h>

TEST(SupportDefsTest, IntegerTypesHaveTheirWidths) {
    EXPECT_EQ(sizeof(int8), 1U);
    EXPECT_EQ(sizeof(uint16), 2U);
    EXPECT_EQ(sizeof(int32), 4U);
    EXPECT_EQ(sizeof(bigtime_t), 8U);
    EXPECT_EQ(sizeof(status_t), 4U);
    EXPECT_EQ(sizeof(type_code), 4U);
}

TEST(SupportDefsTest, TypeCodesReadAsTheirLetters) {
    EXPECT_EQ(uint32{B_STRING_TYPE}, 0x43535452U);
    EXPECT_EQ(uint32{B_INT32_TYPE}, 0x4C4F4E47U);
    EXPECT_EQ(uint32{B_REF_TYPE}, 0x52524546U);
    EXPECT_EQ(uint32{B_RAW_TYPE}, 0x52415754U);
}

TEST(SupportDefsTest, AtomicOperationsAnswerTheValueBefore) {
    int32 value = 6;
    EXPECT_EQ(atomic_add(&value, 4), 6);
    EXPECT_EQ(atomic_and(&value, 3), 10);
    EXPECT_EQ(atomic_or(&value, 8), 2);
    EXPECT_EQ(atomic_get_and_set(&value, 1), 10);
    EXPECT_EQ(atomic_test_and_set(&value, 5, 2), 1);
    EXPECT_EQ(atomic_get(&value), 1);
    EXPECT_EQ(atomic_test_and_set(&value, 5, 1), 1);
    EXPECT_EQ(atomic_get(&value), 5);

    int64 wide = 1;
    EXPECT_EQ(atomic_add64(&wide, 0x100000000), 1);
    EXPECT_EQ(atomic_and64(&wide, 0x100000000), 0x100000001);
    EXPECT_EQ(atomic_or64(&wide, 2), 0x100000000);
    EXPECT_EQ(atomic_test_and_set64(&wide, 0, 7), 0x100000002);
    atomic_set64(&wide, 9);
    EXPECT_EQ(atomic_get64(&wide), 9);
}

TEST(SupportDefsTest, SmallerAndGreaterOfTwo) {
    EXPECT_EQ(min_c(3, 5), 3);
    EXPECT_EQ(max_c(3, 5), 5);
    EXPECT_EQ(min_c(-1, -2), -2);
}
