#include "widgets/WindowFrame.h"

#include <Message.h>

#include <gtest/gtest.h>

#include <cmath>
#include <limits>

namespace {

constexpr BRect kScreen(0, 0, 1279, 1023);

BRect FrameOf(float x, float y, float width, float height) {
    BMessage settings;
    settings.AddFloat("winX", x);
    settings.AddFloat("winY", y);
    settings.AddFloat("winWidth", width);
    settings.AddFloat("winHeight", height);
    return WindowFrameOf(settings, kScreen);
}

TEST(WindowFrame, FourFloatsAreKeptInOrder) {
    BMessage settings;
    AddWindowFrame(&settings, BRect(10, 20, 310, 220));

    EXPECT_EQ(settings.what, 0u);
    EXPECT_EQ(settings.CountNames(B_ANY_TYPE), 4);
    const char* const names[] = {"winX", "winY", "winWidth", "winHeight"};
    const float values[] = {10, 20, 300, 200};
    for (int32 i = 0; i < 4; ++i) {
        char* name = nullptr;
        type_code type = 0;
        ASSERT_EQ(settings.GetInfo(B_FLOAT_TYPE, i, &name, &type), B_OK);
        EXPECT_STREQ(name, names[i]);
        EXPECT_EQ(settings.GetFloat(name, -1), values[i]);
    }
}

TEST(WindowFrame, NoMessageIsNoFault) {
    AddWindowFrame(nullptr, BRect(10, 20, 310, 220));
}

TEST(WindowFrame, AFrameOnTheScreenIsRestoredExactly) {
    EXPECT_EQ(FrameOf(123, 45, 678, 321), BRect(123, 45, 801, 366));
    EXPECT_EQ(FrameOf(0, 0, 1279, 1023), BRect(0, 0, 1279, 1023));
    EXPECT_EQ(FrameOf(1279, 1023, 0, 0), BRect(1279, 1023, 1279, 1023));
}

TEST(WindowFrame, MissingFieldsKeepTheirDefaults) {
    EXPECT_EQ(WindowFrameOf(BMessage(), kScreen), BRect(0, 0, 400, 150));
    BMessage onlyWidth;
    onlyWidth.AddFloat("winWidth", 900);
    EXPECT_EQ(WindowFrameOf(onlyWidth, kScreen), BRect(0, 0, 900, 150));
    BMessage onlyY;
    onlyY.AddFloat("winY", 77);
    EXPECT_EQ(WindowFrameOf(onlyY, kScreen), BRect(0, 77, 400, 227));
    BMessage otherType;
    otherType.AddInt32("winX", 50);
    otherType.AddString("winHeight", "300");
    EXPECT_EQ(WindowFrameOf(otherType, kScreen), BRect(0, 0, 400, 150));
}

TEST(WindowFrame, AFrameThatLeavesTheScreenIsReplaced) {
    const BRect replaced(0, 0, 400, 150);
    EXPECT_EQ(FrameOf(-1, 45, 300, 200), replaced);
    EXPECT_EQ(FrameOf(10, -1, 300, 200), replaced);
    EXPECT_EQ(FrameOf(1000, 45, 280, 200), replaced);
    EXPECT_EQ(FrameOf(10, 900, 300, 124), replaced);
    EXPECT_EQ(FrameOf(5000, 5000, 300, 200), replaced);
    EXPECT_EQ(FrameOf(0, 0, 1280, 1023), replaced);
}

TEST(WindowFrame, NumbersThatAreNoneLeaveTheScreen) {
    const BRect replaced(0, 0, 400, 150);
    const float nan = std::numeric_limits<float>::quiet_NaN();
    const float infinity = std::numeric_limits<float>::infinity();
    EXPECT_EQ(FrameOf(nan, 45, 300, 200), replaced);
    EXPECT_EQ(FrameOf(10, 45, nan, 200), replaced);
    EXPECT_EQ(FrameOf(10, 45, 300, infinity), replaced);
    EXPECT_EQ(FrameOf(-infinity, 45, 300, 200), replaced);
}

TEST(WindowFrame, AFrameInsideOutIsReplaced) {
    EXPECT_EQ(FrameOf(500, 500, -100, 50), BRect(0, 0, 400, 150));
    EXPECT_EQ(FrameOf(500, 500, 100, -50), BRect(0, 0, 400, 150));
}

} // namespace
