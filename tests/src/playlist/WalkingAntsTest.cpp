// The frame of marching stripes, by its pixels.
#include "playlist/WalkingAnts.h"

#include "kits/interface/BitmapWithView.h"

#include <gtest/gtest.h>

namespace {

constexpr uint32 kRed = 0xFF0000;
constexpr uint32 kWhite = 0xFFFFFF;
constexpr uint32 kBlack = 0x000000;

// Step after step, the stripes of the top and right edges move up by a row, those of the other two down.
constexpr uint8 kStripes[8] = {0xC7, 0x8F, 0x1F, 0x3E, 0x7C, 0xF8, 0xF1, 0xE3};

uint32 Stripe(int x, int y, int shift) {
    return (kStripes[(y + shift + 800) % 8] & (0x80 >> (x % 8))) != 0 ? kWhite : kBlack;
}

class WalkingAntsTest : public testing::Test {
  protected:
    WalkingAntsTest() {
        mPicture.Bitmap().Lock();
        mPicture.view->SetHighColor(255, 0, 0);
        mPicture.view->FillRect(mPicture.view->Bounds());
        mPicture.Bitmap().Unlock();
    }
    void Step() {
        mPicture.Bitmap().Lock();
        mAnts.DrawAndStep(mPicture.view, BRect(4, 5, 44, 35));
        mPicture.view->Sync();
        mPicture.Bitmap().Unlock();
    }

    BitmapWithView mPicture{50, 40};
    WalkingAnts mAnts;
};

TEST_F(WalkingAntsTest, MarchInOppositeDirectionsAndAreBackAfterEightSteps) {
    Rows first;
    for (int step = 0; step < 8; ++step) {
        Step();
        SCOPED_TRACE(step);
        // Away from the corners, which two edges share.
        for (int x = 8; x <= 40; ++x) {
            ASSERT_EQ(mPicture.At(x, 5), Stripe(x, 5, step)) << "top, " << x;
            ASSERT_EQ(mPicture.At(x, 35), Stripe(x, 35, -step)) << "bottom, " << x;
        }
        for (int y = 9; y <= 31; ++y) {
            ASSERT_EQ(mPicture.At(44, y), Stripe(44, y, step)) << "right, " << y;
            ASSERT_EQ(mPicture.At(4, y), Stripe(4, y, -step)) << "left, " << y;
        }
        if (step == 0)
            first = mPicture.Show();
        else
            EXPECT_NE(mPicture.Show(), first);
    }
    Step();
    EXPECT_EQ(mPicture.Show(), first);
}

TEST_F(WalkingAntsTest, AreTwoPixelsWideAndLeaveTheRestAlone) {
    Step();
    const auto countInked = [&](int x, int y, int dx, int dy) {
        int inked = 0;
        for (int i = -4; i <= 4; ++i)
            inked += mPicture.At(x + i * dx, y + i * dy) != kRed;
        return inked;
    };
    EXPECT_EQ(countInked(24, 5, 0, 1), 2) << "top";
    EXPECT_EQ(countInked(24, 35, 0, 1), 2) << "bottom";
    EXPECT_EQ(countInked(4, 20, 1, 0), 2) << "left";
    EXPECT_EQ(countInked(44, 20, 1, 0), 2) << "right";
    for (int y = 8; y <= 32; ++y) {
        for (int x = 7; x <= 41; ++x)
            ASSERT_EQ(mPicture.At(x, y), kRed) << x << ", " << y;
    }
}

} // namespace
