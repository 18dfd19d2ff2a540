#include <ByteOrder.h>

#include <gtest/gtest.h>

TEST(ByteOrderTest, ValuesAreSwapped) {
    EXPECT_EQ(B_SWAP_INT16(0x1234), 0x3412);
    EXPECT_EQ(B_SWAP_INT32(0x12345678), 0x78563412U);
    EXPECT_EQ(B_SWAP_INT64(0x0102030405060708), 0x0807060504030201U);
    EXPECT_EQ(B_SWAP_FLOAT(B_SWAP_FLOAT(1.5F)), 1.5F);
    EXPECT_EQ(B_SWAP_DOUBLE(B_SWAP_DOUBLE(-2.25)), -2.25);
}

TEST(ByteOrderTest, BigEndianBytesStandMostSignificantFirst) {
    const uint32 value = B_HOST_TO_BENDIAN_INT32('CSTR');
    const uchar* bytes = reinterpret_cast<const uchar*>(&value);
    EXPECT_EQ(bytes[0], 'C');
    EXPECT_EQ(bytes[3], 'R');
    EXPECT_EQ(B_BENDIAN_TO_HOST_INT32(value), uint32{'CSTR'});
    const uint16 little = B_HOST_TO_LENDIAN_INT16(0x0102);
    EXPECT_EQ(reinterpret_cast<const uchar*>(&little)[0], 2);
}

TEST(ByteOrderTest, ArraysAreSwappedInPlace) {
    uint16 values[3] = {0x0102, 0x0304, 0x0506};
    EXPECT_EQ(swap_data(B_UINT16_TYPE, values, sizeof(values), B_SWAP_ALWAYS), B_OK);
    EXPECT_EQ(values[0], 0x0201);
    EXPECT_EQ(values[2], 0x0605);
    EXPECT_EQ(swap_data(B_UINT16_TYPE, values, sizeof(values), B_SWAP_HOST_TO_LENDIAN), B_OK);
    EXPECT_EQ(values[0], B_HOST_IS_LENDIAN ? 0x0201 : 0x0102);
}

TEST(ByteOrderTest, RefusesTypesWithoutByteOrderAndCutElements) {
    uint32 values[2] = {1, 2};
    EXPECT_EQ(swap_data(B_STRING_TYPE, values, sizeof(values), B_SWAP_ALWAYS), B_BAD_TYPE);
    EXPECT_EQ(swap_data(B_INT32_TYPE, values, 6, B_SWAP_ALWAYS), B_BAD_VALUE);
    EXPECT_EQ(swap_data(B_INT32_TYPE, nullptr, 4, B_SWAP_ALWAYS), B_BAD_VALUE);
    EXPECT_EQ(values[0], 1U);
    EXPECT_TRUE(is_type_swapped(B_DOUBLE_TYPE));
    EXPECT_FALSE(is_type_swapped(B_RAW_TYPE));
}
