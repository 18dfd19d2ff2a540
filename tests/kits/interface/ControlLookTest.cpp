#include "ControlLook.h"

#include "BitmapWithView.h"

#include <Font.h>

#include <cmath>
#include <gtest/gtest.h>

namespace {

typedef ControlLook::Bevel Bevel;
typedef ControlLook::Direction Direction;

// '.' white, '#' black, 'p' panel, 's' shadow, 'd' dark frame, 'f' focus, 'x' disabled frame, 't' disabled
// text.
Rows Show(const BitmapWithView& picture, int32 width, int32 height) {
    Rows rows;
    for (int32 y = 0; y < height; ++y) {
        std::string row;
        for (int32 x = 0; x < width; ++x) {
            switch (picture.At(x, y)) {
            case 0xFFFFFF:
                row += '.';
                break;
            case 0x000000:
                row += '#';
                break;
            case 0xD8D8D8:
                row += 'p';
                break;
            case 0xB0B0B0:
                row += 'P';
                break;
            case 0x989898:
                row += 's';
                break;
            case 0x606060:
                row += 'd';
                break;
            case 0x0000E5:
                row += 'f';
                break;
            case 0xA0A0A0:
                row += 'x';
                break;
            case 0x808080:
                row += 't';
                break;
            default:
                row += '?';
            }
        }
        rows.push_back(row);
    }
    return rows;
}

TEST(ControlLook, BevelsAreOnePixelOfLightAndOneOfShadow) {
    BitmapWithView picture(5, 4);
    EXPECT_EQ(ControlLook(picture.view).Bevelled(BRect(0, 0, 4, 3), Bevel::Raised), BRect(1, 1, 3, 2));
    EXPECT_EQ(Show(picture, 5, 4), (Rows{
                                       "....s", //
                                       "....s", //
                                       "....s", //
                                       "sssss", //
                                   }));
    ControlLook(picture.view).Bevelled(BRect(0, 0, 4, 3), Bevel::Sunken);
    EXPECT_EQ(Show(picture, 5, 4), (Rows{
                                       "ssss.", //
                                       "s....", //
                                       "s....", //
                                       ".....", //
                                   }));
}

TEST(ControlLook, AFieldShowsFocusAndDisabling) {
    BitmapWithView picture(6, 5);
    EXPECT_EQ(ControlLook(picture.view).FieldFrame(BRect(0, 0, 5, 4), {}), BRect(2, 2, 3, 2));
    EXPECT_EQ(Show(picture, 6, 5), (Rows{
                                       "sssss.", //
                                       "sdddd.", //
                                       "sd..d.", //
                                       "sdddd.", //
                                       "......", //
                                   }));
    ControlLook(picture.view).FieldFrame(BRect(0, 0, 5, 4), {.focused = true});
    EXPECT_EQ(Show(picture, 6, 5)[1], "sffff.");
    ControlLook(picture.view).FieldFrame(BRect(0, 0, 5, 4), {.enabled = false, .focused = true});
    EXPECT_EQ(Show(picture, 6, 5)[1], "sxxxx.");
}

TEST(ControlLook, AButtonsFrameTellsItsState) {
    BitmapWithView picture(10, 9);
    const BRect all(0, 0, 9, 8);
    EXPECT_EQ(ControlLook(picture.view).ButtonFrame(all, {}), BRect(3, 3, 6, 5));
    EXPECT_EQ(Show(picture, 10, 9), (Rows{
                                        "dddddddddd", //
                                        "dppppppppd", //
                                        "dp.....spd", //
                                        "dp.ppppspd", //
                                        "dp.ppppspd", //
                                        "dp.ppppspd", //
                                        "dpsssssspd", //
                                        "dppppppppd", //
                                        "dddddddddd", //
                                    }));
    ControlLook(picture.view).ButtonFrame(all, {.pressed = true});
    EXPECT_EQ(Show(picture, 10, 9)[3], "dpsPPPP.pd");
    ControlLook(picture.view).ButtonFrame(all, {.isDefault = true});
    EXPECT_EQ(Show(picture, 10, 9)[1], "dddddddddd");
    EXPECT_EQ(Show(picture, 10, 9)[3], "dd.ppppsdd");
    ControlLook(picture.view).ButtonFrame(all, {.focused = true});
    EXPECT_EQ(Show(picture, 10, 9)[4], "dp.pffpspd");
    ControlLook(picture.view).ButtonFrame(all, {.enabled = false, .focused = true, .pressed = true});
    EXPECT_EQ(Show(picture, 10, 9)[4], "xp.ppppspx");
}

TEST(ControlLook, ArrowsPointWhereTheyAreTold) {
    BitmapWithView picture(9, 9);
    ControlLook(picture.view).Arrow(BRect(0, 0, 8, 8), Direction::Down, {});
    EXPECT_EQ(Show(picture, 9, 9), (Rows{
                                       ".........", //
                                       ".........", //
                                       ".........", //
                                       "..#####..", //
                                       "...###...", //
                                       "....#....", //
                                       ".........", //
                                       ".........", //
                                       ".........", //
                                   }));
    BitmapWithView other(9, 9);
    ControlLook(other.view).Arrow(BRect(0, 0, 8, 8), Direction::Left, {.enabled = false});
    EXPECT_EQ(Show(other, 9, 9), (Rows{
                                     ".........", //
                                     ".........", //
                                     ".....t...", //
                                     "....tt...", //
                                     "...ttt...", //
                                     "....tt...", //
                                     ".....t...", //
                                     ".........", //
                                     ".........", //
                                 }));
}

TEST(ControlLook, ATickStandsInTheMiddle) {
    BitmapWithView picture(9, 9);
    ControlLook(picture.view).CheckMark(BRect(0, 0, 8, 8), {});
    EXPECT_EQ(Show(picture, 9, 9), (Rows{
                                       ".........", //
                                       ".......#.", //
                                       "......##.", //
                                       ".#...##..", //
                                       ".##.##...", //
                                       "..###....", //
                                       "...#.....", //
                                       ".........", //
                                       ".........", //
                                   }));
}

TEST(ControlLook, LabelsStayInTheirRectangle) {
    BitmapWithView picture(60, 20);
    ControlLook(picture.view).Label("a text that is much too long", BRect(10, 0, 49, 19), B_ALIGN_LEFT, {});
    EXPECT_GT(picture.CountInked(), 20);
    for (int32 y = 0; y < 20; ++y) {
        for (int32 x = 51; x < 60; ++x) {
            EXPECT_EQ(picture.At(x, y), 0xFFFFFFU) << x << ", " << y;
        }
        EXPECT_EQ(picture.At(8, y), 0xFFFFFFU);
    }
    const int before = picture.CountInked();
    ControlLook(picture.view).Label(nullptr, BRect(0, 0, 59, 19), B_ALIGN_CENTER, {});
    EXPECT_EQ(picture.CountInked(), before);
}

TEST(ControlLook, ALineStandsInTheMiddleOfItsHeight) {
    const BFont font;
    font_height height;
    font.GetHeight(&height);
    const float baseline = ControlLook::Baseline(font, BRect(0, 100, 10, 139));
    const float above = baseline - std::ceil(height.ascent) - 100;
    const float below = 140 - (baseline + std::ceil(height.descent));
    EXPECT_LE(std::abs(above - below), 1);
}

TEST(ControlLook, TheViewKeepsItsDrawingState) {
    BitmapWithView picture(20, 20);
    picture.view->SetHighColor(1, 2, 3);
    picture.view->SetLowColor(4, 5, 6);
    picture.view->SetDrawingMode(B_OP_INVERT);
    picture.view->SetPenSize(3);
    picture.view->MovePenTo(7, 8);
    {
        ControlLook look(picture.view);
        look.ButtonFrame(BRect(0, 0, 19, 19), {.focused = true});
        look.Label("x", BRect(0, 0, 19, 19), B_ALIGN_CENTER, {});
    }
    EXPECT_EQ(picture.view->HighColor(), make_color(1, 2, 3));
    EXPECT_EQ(picture.view->LowColor(), make_color(4, 5, 6));
    EXPECT_EQ(picture.view->DrawingMode(), B_OP_INVERT);
    EXPECT_EQ(picture.view->PenSize(), 3);
    EXPECT_EQ(picture.view->PenLocation(), BPoint(7, 8));
}

} // namespace
