#include "BitmapWithView.h"

#include <Polygon.h>
#include <SupportDefs.h>
#include <host/api/image_decoder.h>

#include <cstdlib>
#include <fstream>
#include <gtest/gtest.h>
#include <limits>
#include <thread>

namespace {

constexpr pattern kStripes = {{0xC7, 0x8F, 0x1F, 0x3E, 0x7C, 0xF8, 0xF1, 0xE3}};
constexpr rgb_color kRed = {255, 0, 0, 255};
constexpr rgb_color kBlue = {0, 0, 255, 255};

TEST(ViewDrawing, LinesLeaveThePenAtTheirEnd) {
    BitmapWithView canvas(5, 3);
    canvas.view->StrokeLine(BPoint(0, 0), BPoint(3, 0));
    EXPECT_EQ(canvas.view->PenLocation(), BPoint(3, 0));
    canvas.view->StrokeLine(BPoint(3, 2));
    canvas.view->MovePenBy(-3, 0);
    EXPECT_EQ(canvas.view->PenLocation(), BPoint(0, 2));
    canvas.view->StrokeLine(BPoint(0, 2), kStripes);
    EXPECT_EQ(canvas.Show(), (Rows{"####.", "...#.", "...#."}));
}

TEST(ViewDrawing, RectanglesHaveAllFourEdges) {
    BitmapWithView canvas(6, 4);
    canvas.view->StrokeRect(BRect(0, 0, 4, 3));
    canvas.view->FillRect(BRect(2, 1, 2, 2));
    canvas.view->FillRect(BRect(3, 3, 2, 0));
    EXPECT_EQ(canvas.Show(), (Rows{"#####.", "#.#.#.", "#.#.#.", "#####."}));
    BitmapWithView inverted(4, 3);
    inverted.view->SetDrawingMode(B_OP_INVERT);
    inverted.view->StrokeRect(BRect(0, 0, 3, 2));
    EXPECT_EQ(inverted.Show(), (Rows{"####", "#..#", "####"})) << "no corner is inverted twice";
}

TEST(ViewDrawing, FractionsGoToTheNearestPixel) {
    BitmapWithView canvas(5, 2);
    canvas.view->FillRect(BRect(0.6F, 0.4F, 2.4F, 0.4F));
    EXPECT_EQ(canvas.Show(), (Rows{".##..", "....."}));
}

TEST(ViewDrawing, PatternsAreAlignedToTheViewNotToTheBitmap) {
    BitmapWithView canvas(8, 2);
    auto* const child = new BView(BRect(3, 1, 7, 1), "child", 0, 0);
    canvas.view->AddChild(child);
    canvas.view->FillRect(canvas.view->Bounds(), kStripes);
    child->FillRect(child->Bounds(), kStripes);
    EXPECT_EQ(canvas.Show(), (Rows{"##...###", "#..##..."}));
}

TEST(ViewDrawing, ScrollingMovesThePatternAlong) {
    BitmapWithView canvas(8, 1);
    canvas.view->ScrollTo(3, 1);
    canvas.view->FillRect(canvas.view->Bounds(), kStripes);
    EXPECT_EQ(canvas.Show(), (Rows{".#####.."}));
}

TEST(ViewDrawing, ChildrenAreNotDrawnOver) {
    BitmapWithView canvas(6, 3);
    auto* const child = new BView(BRect(2, 1, 3, 5), "child", 0, 0);
    canvas.view->AddChild(child);
    canvas.view->FillRect(BRect(0, 0, 5, 2));
    EXPECT_EQ(canvas.Show(), (Rows{"######", "##..##", "##..##"}));
    child->SetHighColor(kRed);
    child->FillRect(BRect(-9, -9, 9, 9));
    EXPECT_EQ(canvas.Show(), (Rows{"######", "##rr##", "##rr##"}));
    child->Hide();
    child->FillRect(BRect(-9, -9, 9, 9));
    canvas.view->FillRect(BRect(0, 0, 5, 2));
    EXPECT_EQ(canvas.Show(), Rows(3, "######"));
    child->Show();
    child->MoveTo(0, 0);
    child->FillRect(BRect(-9, -9, 9, 9));
    EXPECT_EQ(canvas.Show(), (Rows{"rr####", "rr####", "rr####"}));
}

TEST(ViewDrawing, ClippingIsInViewCoordinatesAndComesOff) {
    BitmapWithView canvas(6, 2);
    canvas.view->ScrollTo(10, 0);
    BRegion region(BRect(11, 0, 12, 9));
    canvas.view->ConstrainClippingRegion(&region);
    BRegion clip;
    canvas.view->GetClippingRegion(&clip);
    EXPECT_EQ(clip.Frame(), BRect(11, 0, 12, 1));
    canvas.view->FillRect(BRect(0, 0, 99, 0));
    EXPECT_EQ(canvas.Show(), (Rows{".##...", "......"}));
    canvas.view->PushState();
    BRegion inner(BRect(12, 0, 15, 9));
    canvas.view->ConstrainClippingRegion(&inner);
    canvas.view->FillRect(BRect(0, 1, 99, 1));
    EXPECT_EQ(canvas.Show(), (Rows{".##...", "..#..."})) << "both limits hold";
    canvas.view->PopState();
    canvas.view->ConstrainClippingRegion(nullptr);
    canvas.view->FillRect(BRect(0, 1, 99, 1));
    EXPECT_EQ(canvas.Show(), (Rows{".##...", "######"}));
}

TEST(ViewDrawing, OriginAndScaleApplyToWhatIsDrawn) {
    BitmapWithView canvas(8, 4);
    canvas.view->SetOrigin(2, 1);
    canvas.view->FillRect(BRect(0, 0, 0, 0));
    canvas.view->PushState();
    canvas.view->SetOrigin(2, 0);
    canvas.view->SetScale(2);
    canvas.view->FillRect(BRect(0, 1, 1, 1));
    canvas.view->PopState();
    canvas.view->FillRect(BRect(-2, 2, -2, 2));
    EXPECT_EQ(canvas.Show(), (Rows{"........", "..#.....", "........", "#...###."}));
}

TEST(ViewDrawing, LineArraysHaveAColourALine) {
    BitmapWithView canvas(4, 3);
    canvas.view->BeginLineArray(2);
    canvas.view->AddLine(BPoint(0, 0), BPoint(3, 0), kRed);
    canvas.view->AddLine(BPoint(1, 0), BPoint(1, 2), kBlue);
    canvas.view->AddLine(BPoint(2, 2), BPoint(3, 2), make_color(0, 0, 0));
    EXPECT_EQ(canvas.Show()[0], "....") << "nothing before the end";
    canvas.view->EndLineArray();
    EXPECT_EQ(canvas.Show(), (Rows{"rbrr", ".b..", ".b##"}));
    canvas.view->EndLineArray();
    canvas.view->AddLine(BPoint(0, 2), BPoint(0, 2), kRed);
    EXPECT_EQ(canvas.Show()[2], ".b##");
    EXPECT_EQ(canvas.view->HighColor(), make_color(0, 0, 0));
}

TEST(ViewDrawing, ShapesAreFilledAndStroked) {
    BitmapWithView canvas(12, 5);
    canvas.view->FillTriangle(BPoint(0, 0), BPoint(4, 0), BPoint(0, 4));
    canvas.view->StrokeTriangle(BPoint(6, 0), BPoint(10, 0), BPoint(6, 4));
    EXPECT_EQ(canvas.Show(),
              (Rows{"#####.#####.", "####..#..#..", "###...#.#...", "##....##....", "#.....#....."}));
    BitmapWithView round(8, 7);
    round.view->FillEllipse(BRect(0, 0, 6, 6));
    EXPECT_EQ(round.Show()[0], "..###...");
    round.view->SetHighColor(kRed);
    round.view->StrokeEllipse(BPoint(3, 3), 3, 3);
    EXPECT_EQ(round.Show()[3], "r#####r.");
    BitmapWithView poly(6, 6);
    const BPoint points[] = {{0, 0}, {2, 0}, {2, 2}, {0, 2}};
    const BPolygon polygon(points, 4);
    poly.view->FillPolygon(&polygon);
    poly.view->SetHighColor(kRed);
    poly.view->StrokePolygon(points, 4, BRect(0, 0, 5, 5));
    EXPECT_EQ(poly.Show(), (Rows{"rrrrrr", "r##..r", "r##..r", "r....r", "r....r", "rrrrrr"}));
}

TEST(ViewDrawing, InvertingTwiceBringsThePictureBack) {
    BitmapWithView canvas(4, 2);
    canvas.view->SetHighColor(kRed);
    canvas.view->FillRect(BRect(0, 0, 1, 1));
    const Rows before = canvas.Show();
    canvas.view->InvertRect(BRect(1, 0, 3, 0));
    EXPECT_EQ(canvas.Show()[0], "r?##");
    canvas.view->InvertRect(BRect(1, 0, 3, 0));
    EXPECT_EQ(canvas.Show(), before);
}

TEST(ViewDrawing, WidePensAreCentred) {
    BitmapWithView canvas(6, 5);
    canvas.view->SetPenSize(3);
    canvas.view->StrokeLine(BPoint(1, 2), BPoint(4, 2));
    EXPECT_EQ(canvas.Show(), (Rows{"......", ".####.", ".####.", ".####.", "......"}));
}

TEST(ViewDrawing, CopiedPixelsMayOverlapAndAreClipped) {
    BitmapWithView canvas(6, 2);
    canvas.view->SetHighColor(kRed);
    canvas.view->FillRect(BRect(0, 0, 0, 0));
    canvas.view->SetHighColor(kBlue);
    canvas.view->FillRect(BRect(1, 0, 1, 1));
    canvas.view->CopyBits(BRect(0, 0, 3, 1), BRect(2, 0, 5, 1));
    EXPECT_EQ(canvas.Show(), (Rows{"rbrb..", ".b.b.."}));
    canvas.view->CopyBits(BRect(-3, 0, 0, 1), BRect(2, 0, 5, 1));
    EXPECT_EQ(canvas.Show(), (Rows{"rbrb.r", ".b.b.."})) << "what is not there is not copied";
}

TEST(ViewDrawing, BitmapsAreDrawnWhereTheyAreWanted) {
    BitmapWithView source(2, 2);
    source.view->SetHighColor(kRed);
    source.view->FillRect(BRect(0, 0, 0, 0));
    source.view->SetHighColor(kBlue);
    source.view->FillRect(BRect(1, 1, 1, 1));
    BitmapWithView canvas(6, 4);
    canvas.view->DrawBitmap(&source.Bitmap(), BPoint(1, 1));
    EXPECT_EQ(canvas.Show(), (Rows{"......", ".r....", "..b...", "......"}));
    canvas.view->MovePenTo(4, 0);
    canvas.view->DrawBitmap(&source.Bitmap());
    EXPECT_EQ(canvas.Show()[0], "....r.");
    canvas.view->DrawBitmapAsync(&source.Bitmap(), BRect(1, 1, 1, 1), BRect(0, 3, 5, 3));
    EXPECT_EQ(canvas.Show()[3], "bbbbbb");
    canvas.view->DrawBitmap(nullptr, BPoint(0, 0));
    const BBitmap invalid(BRect(), B_RGB32);
    canvas.view->DrawBitmap(&invalid, BRect(0, 0, 5, 3));
    EXPECT_EQ(canvas.Show()[3], "bbbbbb");
}

TEST(ViewDrawing, CoversAreAveragedDownIntoTheirFrame) {
    BBitmap picture(BRect(0, 0, 599, 299), B_RGB32, true);
    auto* const painted = new BView(picture.Bounds(), "", 0, 0);
    picture.AddChild(painted);
    painted->SetHighColor(200, 100, 50);
    painted->FillRect(BRect(0, 0, 299, 299));
    painted->FillRect(BRect(300, 0, 599, 299), B_MIXED_COLORS);
    // The way a cover is made: 65 x 65 pixels of 16 bits.
    BBitmap cover(BRect(0, 0, 64, 64), B_RGB16, true);
    auto* const view = new BView(BRect(0, 0, 64, 64), "", 0, 0);
    cover.AddChild(view);
    ASSERT_TRUE(cover.Lock());
    view->DrawBitmap(&picture, BRect(0, 0, 64, 64));
    view->Sync();
    cover.Unlock();
    const auto at = [&](int32 x, int32 y) {
        pixel32 pixel = 0;
        load_pixels(B_RGB16, cover.Surface().Row(y), x, 1, &pixel);
        return to_color(pixel);
    };
    EXPECT_NEAR(at(0, 0).red, 200, 8);
    EXPECT_NEAR(at(10, 64).green, 100, 8);
    EXPECT_NEAR(at(60, 30).red, 227, 10) << "half the colour, half white";
    EXPECT_NEAR(at(64, 64).blue, 152, 14);
}

TEST(ViewDrawing, TextMovesThePenByItsWidth) {
    BitmapWithView canvas(100, 20);
    canvas.view->DrawString("Hamburg", BPoint(2, 14));
    EXPECT_GT(canvas.CountInked(), 50);
    EXPECT_FLOAT_EQ(canvas.view->PenLocation().x, 2 + canvas.view->StringWidth("Hamburg"));
    EXPECT_EQ(canvas.view->PenLocation().y, 14);
    const auto end = static_cast<int32>(canvas.view->PenLocation().x) + 2;
    for (int32 y = 0; y < 20; ++y) {
        for (int32 x = end; x < 100; ++x) {
            ASSERT_EQ(canvas.At(x, y), 0xFFFFFFU);
        }
    }
    canvas.view->DrawString("Hamburg", 3);
    EXPECT_FLOAT_EQ(canvas.view->PenLocation().x,
                    2 + canvas.view->StringWidth("Hamburg") + canvas.view->StringWidth("Ham"));
    canvas.view->MovePenTo(0, 0);
    canvas.view->DrawString(nullptr);
    canvas.view->DrawString("", BPoint(50, 50));
    EXPECT_EQ(canvas.view->PenLocation(), BPoint(50, 50));
}

TEST(ViewDrawing, InvalidUtf8IsDrawnAndMovesThePen) {
    BitmapWithView canvas(60, 20);
    canvas.view->DrawString("\xFF\xFE", BPoint(2, 14));
    EXPECT_GT(canvas.CountInked(), 10);
    EXPECT_GT(canvas.view->PenLocation().x, 10);
    canvas.view->DrawChar('\xC3', BPoint(40, 14));
    EXPECT_GT(canvas.view->PenLocation().x, 44);
}

TEST(ViewDrawing, DeltasStretchTheText) {
    BitmapWithView canvas(100, 20);
    escapement_delta delta = {5, 11};
    canvas.view->DrawString("a b", BPoint(0, 14), &delta);
    EXPECT_NEAR(canvas.view->PenLocation().x,
                canvas.view->StringWidth("a") + canvas.view->StringWidth(" ") +
                    canvas.view->StringWidth("b") + 21,
                0.1);
}

TEST(ViewDrawing, WithoutABitmapDrawingDoesNothing) {
    BView view(BRect(0, 0, 9, 9), "view", 0, 0);
    view.FillRect(BRect(0, 0, 9, 9));
    view.DrawString("text", BPoint(1, 5));
    EXPECT_GT(view.PenLocation().x, 5) << "but the pen moves";
    view.StrokeLine(BPoint(3, 3));
    view.CopyBits(BRect(0, 0, 3, 3), BRect(4, 4, 7, 7));
    BRegion region(BRect(0, 0, 3, 3));
    view.FillRegion(&region);
    view.GetClippingRegion(&region);
    EXPECT_TRUE(region.IsEmpty());
}

TEST(ViewDrawing, NumbersThatAreNoneAreHarmless) {
    BitmapWithView canvas(8, 8);
    const float nan = std::numeric_limits<float>::quiet_NaN();
    const float huge = 1e30F;
    canvas.view->StrokeLine(BPoint(nan, 0), BPoint(huge, -huge));
    canvas.view->FillRect(BRect(nan, nan, nan, nan));
    canvas.view->StrokeRect(BRect(-huge, -huge, huge, huge));
    canvas.view->FillEllipse(BRect(-huge, -huge, huge, nan));
    canvas.view->StrokeArc(BPoint(0, 0), huge, huge, nan, huge);
    canvas.view->FillTriangle(BPoint(nan, 0), BPoint(huge, 0), BPoint(0, huge));
    canvas.view->FillRoundRect(BRect(0, 0, 3, 3), nan, -huge);
    canvas.view->SetPenSize(huge);
    canvas.view->StrokeLine(BPoint(0, 0), BPoint(5, 5));
    canvas.view->DrawString("x", BPoint(nan, huge));
    canvas.view->MoveTo(nan, huge);
    canvas.view->FillRect(BRect(0, 0, 3, 3));
    SUCCEED();
}

TEST(ViewDrawing, TwoThreadsDrawTextIntoTwoBitmaps) {
    const auto draw = [](BitmapWithView* canvas) {
        for (int i = 0; i < 100; ++i) {
            canvas->Bitmap().Lock();
            canvas->view->SetLowColor(make_color(255, 255, 255));
            canvas->view->FillRect(canvas->view->Bounds(), B_SOLID_LOW);
            canvas->view->DrawString("Two songs at once", BPoint(2, 14));
            canvas->Bitmap().Unlock();
        }
    };
    BitmapWithView first(120, 20);
    BitmapWithView second(120, 20);
    std::thread one(draw, &first);
    std::thread two(draw, &second);
    one.join();
    two.join();
    EXPECT_GT(first.CountInked(), 100);
    EXPECT_EQ(first.Show(), second.Show());
}

// Writes what a row of a list looks like, for a look at it: set QUIRNEL_TEST_PICTURE to a file name.
TEST(ViewDrawing, APictureToLookAt) {
    BitmapWithView canvas(420, 230);
    BView& view = *canvas.view;
    view.SetHighColor(216, 216, 216);
    view.FillRect(view.Bounds());
    view.SetLowColor(216, 216, 216);
    view.SetHighColor(0, 0, 0);
    view.DrawString("The quick brown fox jumps over the lazy dog", BPoint(10, 20));
    view.SetFont(be_bold_font);
    view.DrawString("Bold: Gr\xC3\xBC\xC3\x9F"
                    "e, \xD0\x9F\xD1\x80\xD0\xB8\xD0\xB2\xD0\xB5\xD1\x82",
                    BPoint(10, 38));
    view.SetFont(be_fixed_font);
    view.DrawString("Fixed: 0123456789 invalid \xFF\xFE", BPoint(10, 56));
    view.SetFont(be_plain_font);
    view.SetFontSize(24);
    view.DrawString("Large text", BPoint(280, 50));
    view.SetFontSize(12);
    view.StrokeRect(BRect(10, 70, 90, 100));
    view.FillRect(BRect(12, 72, 88, 98), kStripes);
    view.StrokeRoundRect(BRect(100, 70, 180, 100), 8, 8);
    view.FillEllipse(BRect(190, 70, 230, 100));
    view.SetHighColor(0, 0, 229);
    view.StrokeEllipse(BRect(240, 70, 300, 100));
    view.FillArc(BRect(310, 70, 350, 100), 30, 120);
    for (int i = 0; i <= 8; ++i) {
        view.StrokeLine(BPoint(10, 120), BPoint(90, static_cast<float>(110 + 10 * i)));
    }
    view.SetPenSize(5);
    view.StrokeLine(BPoint(110, 120), BPoint(180, 180));
    view.SetPenSize(1);
    BPoint curve[4] = {{200, 180}, {230, 100}, {270, 220}, {300, 120}};
    view.StrokeBezier(curve);
    BBitmap small(BRect(0, 0, 80, 60), B_RGB16, true);
    auto* const copy = new BView(small.Bounds(), "", 0, 0);
    small.AddChild(copy);
    copy->DrawBitmap(&canvas.Bitmap(), small.Bounds());
    view.DrawBitmap(&small, BPoint(320, 120));
    EXPECT_GT(canvas.CountInked(), 1000);
    if (const char* const path = std::getenv("QUIRNEL_TEST_PICTURE"); path != nullptr) {
        const auto* const pixels = static_cast<const uint32*>(canvas.Bitmap().Bits());
        const host::EncodedImage file =
            host::encode_image("png", 420, 230, false, std::span(pixels, 420 * 230));
        std::ofstream(path, std::ios::binary)
            .write(reinterpret_cast<const char*>(file.data.data()),
                   static_cast<std::streamsize>(file.data.size()));
    }
}

} // namespace
