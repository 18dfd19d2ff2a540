#include <Rect.h>

#include <gtest/gtest.h>

TEST(RectTest, TheDefaultRectangleHoldsNothing) {
    const BRect rect;
    EXPECT_FALSE(rect.IsValid());
    EXPECT_FALSE(rect.Contains(BPoint(0, 0)));
    EXPECT_EQ(rect, BRect(0, 0, -1, -1));
}

TEST(RectTest, EdgesBelongToTheRectangle) {
    const BRect rect(10, 20, 25, 35);
    EXPECT_TRUE(rect.Contains(BPoint(10, 20)));
    EXPECT_TRUE(rect.Contains(BPoint(25, 35)));
    EXPECT_FALSE(rect.Contains(BPoint(25.5F, 35)));
    EXPECT_FALSE(rect.Contains(BPoint(9, 20)));
    EXPECT_EQ(rect.Width(), 15.0F);
    EXPECT_EQ(rect.IntegerHeight(), 15);
}

TEST(RectTest, AOnePixelRectangleIsValid) {
    EXPECT_TRUE(BRect(3, 3, 3, 3).IsValid());
    EXPECT_FALSE(BRect(3, 3, 2, 3).IsValid());
}

TEST(RectTest, IntegerSizesRoundUp) {
    EXPECT_EQ(BRect(0, 0, 10.2F, 10.8F).IntegerWidth(), 11);
    EXPECT_EQ(BRect(0.5F, 0.5F, 10.5F, 10.5F).IntegerHeight(), 10);
    EXPECT_EQ(BRect().IntegerWidth(), -1);
}

TEST(RectTest, CornersAreReadAndMovedOneByOne) {
    BRect rect(1, 2, 3, 4);
    EXPECT_EQ(rect.LeftTop(), BPoint(1, 2));
    EXPECT_EQ(rect.RightTop(), BPoint(3, 2));
    EXPECT_EQ(rect.LeftBottom(), BPoint(1, 4));
    EXPECT_EQ(rect.RightBottom(), BPoint(3, 4));
    rect.SetLeftTop(BPoint(0, 1));
    rect.SetRightBottom(BPoint(9, 8));
    EXPECT_EQ(rect, BRect(0, 1, 9, 8));
    rect.SetLeftBottom(BPoint(5, 6));
    rect.SetRightTop(BPoint(7, 3));
    EXPECT_EQ(rect, BRect(5, 3, 7, 6));
}

TEST(RectTest, InsettingMovesAllEdges) {
    BRect rect(0, 0, 20, 20);
    rect.InsetBy(2, 3);
    EXPECT_EQ(rect, BRect(2, 3, 18, 17));
    EXPECT_EQ(rect.InsetByCopy(-2, -3), BRect(0, 0, 20, 20));
    EXPECT_EQ(rect.InsetBySelf(BPoint(1, 1)), BRect(3, 4, 17, 16));
    EXPECT_EQ(rect, BRect(3, 4, 17, 16));
}

TEST(RectTest, OffsettingKeepsTheSize) {
    BRect rect(1, 2, 11, 22);
    rect.OffsetBy(4, -2);
    EXPECT_EQ(rect, BRect(5, 0, 15, 20));
    rect.OffsetTo(B_ORIGIN);
    EXPECT_EQ(rect, BRect(0, 0, 10, 20));
    EXPECT_EQ(rect.OffsetToCopy(3, 3), BRect(3, 3, 13, 23));
    EXPECT_EQ(rect.OffsetByCopy(BPoint(1, 1)), BRect(1, 1, 11, 21));
    EXPECT_EQ(rect.OffsetToSelf(BPoint(-1, -1)), BRect(-1, -1, 9, 19));
}

TEST(RectTest, IntersectionAndUnion) {
    const BRect first(0, 0, 10, 10);
    const BRect second(5, -5, 20, 5);
    EXPECT_EQ(first & second, BRect(5, 0, 10, 5));
    EXPECT_EQ(first | second, BRect(0, -5, 20, 10));
    EXPECT_FALSE((first & BRect(11, 11, 12, 12)).IsValid());
}

TEST(RectTest, RectanglesThatShareAnEdgeIntersect) {
    const BRect rect(0, 0, 10, 10);
    EXPECT_TRUE(rect.Intersects(BRect(10, 10, 20, 20)));
    EXPECT_FALSE(rect.Intersects(BRect(11, 0, 20, 10)));
    EXPECT_FALSE(rect.Intersects(BRect()));
    EXPECT_FALSE(BRect().Intersects(rect));
}

TEST(RectTest, ARectangleContainsItself) {
    const BRect rect(0, 0, 10, 10);
    EXPECT_TRUE(rect.Contains(rect));
    EXPECT_TRUE(rect.Contains(BRect(2, 2, 8, 8)));
    EXPECT_FALSE(rect.Contains(BRect(2, 2, 11, 8)));
}

TEST(RectTest, PrintsItsEdges) {
    testing::internal::CaptureStdout();
    BRect(1, 2, 3, 4.5F).PrintToStream();
    EXPECT_EQ(testing::internal::GetCapturedStdout(), "BRect(l:1.0, t:2.0, r:3.0, b:4.5)\n");
}
