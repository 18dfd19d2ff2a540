#include "widgets/PrefilledBitmap.h"

#include <gtest/gtest.h>
#include <numeric>
#include <vector>

namespace {

// 0, 1, .. 255, 0, ..
std::vector<uint8> Counted(size_t size) {
    std::vector<uint8> data(size);
    std::iota(data.begin(), data.end(), static_cast<uint8>(0));
    return data;
}

uint8 ByteAt(const BBitmap& bitmap, int32 index) {
    return static_cast<const uint8*>(bitmap.Bits())[index];
}

} // namespace

TEST(PrefilledBitmap, OfFifteenByFifteenIsMadeFrom256Bytes) {
    // Exactly as many, so that reading another one would be noticed.
    const std::vector<uint8> data = Counted(256);

    const PrefilledBitmap bitmap(BRect(0, 0, 15, 15), B_CMAP8, data.data(), false, false);

    EXPECT_EQ(256, PrefilledBitmap::CountDataBytes(BRect(0, 0, 15, 15)));
    ASSERT_EQ(256, bitmap.BitsLength());
    EXPECT_EQ(0, ByteAt(bitmap, 0));
    EXPECT_EQ(16, ByteAt(bitmap, 16));
    EXPECT_EQ(255, ByteAt(bitmap, 255));
}

TEST(PrefilledBitmap, OfSixteenBySevenIsMadeFrom128BytesALittleLessThanItHolds) {
    const std::vector<uint8> data = Counted(128);

    const PrefilledBitmap bitmap(BRect(0, 0, 16, 7), B_CMAP8, data.data(), false, false);

    EXPECT_EQ(128, PrefilledBitmap::CountDataBytes(BRect(0, 0, 16, 7)));
    // 17 pixels a row, padded to 20 bytes.
    ASSERT_EQ(160, bitmap.BitsLength());
    EXPECT_EQ(127, ByteAt(bitmap, 127));
    EXPECT_EQ(0, ByteAt(bitmap, 128));
    EXPECT_EQ(0, ByteAt(bitmap, 159));
}

TEST(PrefilledBitmap, CountsBytesOfBoundsThatDoNotBeginAtZeroAndOfFractions) {
    EXPECT_EQ(8 * 8, PrefilledBitmap::CountDataBytes(BRect(10, 20, 17, 27)));
    EXPECT_EQ(4 * 3, PrefilledBitmap::CountDataBytes(BRect(0, 0, 4.9F, 2.9F)));
    EXPECT_EQ(0, PrefilledBitmap::CountDataBytes(BRect(0, 0, 0, 5)));
}

TEST(PrefilledBitmap, TakesViewsWhereItIsToldTo) {
    const std::vector<uint8> data = Counted(256);
    PrefilledBitmap plain(BRect(0, 0, 15, 15), B_CMAP8, data.data(), false, false);
    PrefilledBitmap withViews(BRect(0, 0, 15, 15), B_CMAP8, data.data(), true, true);

    EXPECT_FALSE(plain.Lock());
    EXPECT_TRUE(withViews.Lock());
    withViews.Unlock();
}
