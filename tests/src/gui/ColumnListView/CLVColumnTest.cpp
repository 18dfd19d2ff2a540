#include "gui/ColumnListView/CLVColumn.h"

#include <Bitmap.h>
#include <Font.h>
#include <View.h>

#include <gtest/gtest.h>

#include <string>

namespace {

constexpr BRect kNowhere(-1, -1, -1, -1);

float WidthOf(const char* text) {
    return be_plain_font->StringWidth(text);
}

// The column as wide as needed for this much of its label.
float ColumnWidthFor(const char* text) {
    return WidthOf(text) + 15;
}

TEST(CLVColumn, ANewColumnIsShownAndNoSortKey) {
    const CLVColumn column("Name", 80, CLV_COLUMN_SORTABLE, 20);

    EXPECT_STREQ(column.GetLabel(), "Name");
    EXPECT_EQ(column.Width(), 80);
    EXPECT_EQ(column.MinWidth(), 20);
    EXPECT_EQ(column.Flags(), 0x0001U);
    EXPECT_TRUE(column.IsShown());
    EXPECT_EQ(column.SortMode(), CLV_SORT_NONE);
    EXPECT_EQ(column.GetParent(), nullptr);
    EXPECT_EQ(column.GetHeaderView(), nullptr);
    EXPECT_FALSE(column.IsPushedByExpander());
    EXPECT_EQ(column.HeaderFrame(), kNowhere);
}

TEST(CLVColumn, ItIsNeverNarrowerThanItsMinimumNorThanFourPixels) {
    const struct {
        float width;
        float minimum;
        float expectedWidth;
        float expectedMinimum;
    } kCases[] = {{2, 1, 4, 4}, {50, 1, 50, 4}, {50, 60, 60, 60}, {50, -3, 50, 4}, {100000, 20, 100000, 20}};
    for (const auto& each : kCases) {
        const CLVColumn column("X", each.width, 0, each.minimum);
        EXPECT_EQ(column.Width(), each.expectedWidth) << each.width << " " << each.minimum;
        EXPECT_EQ(column.MinWidth(), each.expectedMinimum) << each.width << " " << each.minimum;
    }
}

TEST(CLVColumn, AnExpanderHasNoLabelAndAWidthOfItsOwn) {
    const CLVColumn column("X", 90, CLV_COLUMN_EXPANDER | 0x0001 | 0x0010 | 0x0400, 50);

    EXPECT_EQ(column.GetLabel(), nullptr);
    EXPECT_EQ(column.TruncatedLabel(), nullptr);
    EXPECT_EQ(column.Width(), 20);
    EXPECT_EQ(column.MinWidth(), 20);
    EXPECT_EQ(column.Flags(), 0x0144U);
    EXPECT_TRUE(column.IsExpander());
}

TEST(CLVColumn, AnExpanderKeepsFourOfItsFlags) {
    const CLVColumn column(nullptr, 20, 0xFFF, 20);

    EXPECT_EQ(column.Flags(), 0x01EEU);
    EXPECT_FALSE(column.IsShown());
}

TEST(CLVColumn, AColumnMayHaveNoLabel) {
    CLVColumn column(nullptr, 50, CLV_COLUMN_HEADER_TRUNCATE, 20);

    EXPECT_EQ(column.GetLabel(), nullptr);
    EXPECT_EQ(column.TruncatedLabel(), nullptr);
    EXPECT_EQ(column.TruncateText(10), kNowhere);
}

TEST(CLVColumn, TheLabelIsCopiedAndShortenedToTheWidth) {
    std::string label = "Hello world";
    const CLVColumn column(label.c_str(), ColumnWidthFor("Hello w..."), 0, 4);
    label = "changed";

    EXPECT_STREQ(column.GetLabel(), "Hello world");
    EXPECT_STREQ(column.TruncatedLabel(), "Hello w...");
}

TEST(CLVColumn, WithoutAListAColumnOnlyStoresWhatItIsTold) {
    CLVColumn column("Name", 80, 0, 20);

    column.SetWidth(5);
    EXPECT_EQ(column.Width(), 20);
    column.SetWidth(33);
    EXPECT_EQ(column.Width(), 33);
    column.SetShown(false);
    EXPECT_FALSE(column.IsShown());
    EXPECT_EQ(column.Flags(), 0x0020U);
    column.SetShown(true);
    EXPECT_TRUE(column.IsShown());
    column.SetSortMode(CLV_SORT_DESCENDING);
    EXPECT_EQ(column.SortMode(), CLV_SORT_DESCENDING) << "though it is not sortable";
}

// A header of one cell, on a bitmap.
class CLVColumnDrawingTest : public testing::Test {
  protected:
    CLVColumnDrawingTest() : mBitmap(BRect(0, 0, 99, 19), B_RGB32, true) {
        mView = new BView(mBitmap.Bounds(), "header", B_FOLLOW_ALL, B_WILL_DRAW);
        mBitmap.AddChild(mView);
        mBitmap.Lock();
    }
    ~CLVColumnDrawingTest() override { mBitmap.Unlock(); }

    void Clear() {
        mView->SetHighColor(255, 255, 255);
        mView->FillRect(mView->Bounds());
    }
    uint32 At(int32 x, int32 y) const {
        const auto* const row = static_cast<const uint8*>(mBitmap.Bits()) + y * mBitmap.BytesPerRow();
        return reinterpret_cast<const uint32*>(row)[x] & 0xFFFFFF;
    }
    int CountOf(uint32 color) const {
        int count = 0;
        for (int32 y = 0; y < 20; ++y) {
            for (int32 x = 0; x < 100; ++x) {
                count += At(x, y) == color;
            }
        }
        return count;
    }
    bool SamePictureAs(const std::string& other) const { return other == Picture(); }
    std::string Picture() const {
        return std::string(static_cast<const char*>(mBitmap.Bits()),
                           static_cast<size_t>(mBitmap.BitsLength()));
    }

    BBitmap mBitmap;
    BView* mView;
};

TEST_F(CLVColumnDrawingTest, TheLabelStandsEightPixelsInOnTheFontsBaseline) {
    CLVColumn column("Name", 80, 0, 20);

    column.DrawColumnHeader(mView, BRect(10, 1, 90, 18), false, false, 12);
    const std::string drawn = Picture();

    Clear();
    mView->SetHighColor(0, 0, 0);
    mView->SetDrawingMode(B_OP_OVER);
    mView->DrawString("Name", BPoint(18, 14));
    EXPECT_TRUE(SamePictureAs(drawn));
    EXPECT_EQ(column.HeaderFrame(), BRect(10, 1, 90, 18));
}

TEST_F(CLVColumnDrawingTest, APressedLabelIsBlue) {
    CLVColumn column("Name", 80, 0, 20);

    column.DrawColumnHeader(mView, BRect(10, 1, 90, 18), false, true, 12);
    EXPECT_EQ(mView->DrawingMode(), B_OP_COPY);
    const std::string drawn = Picture();

    Clear();
    mView->SetHighColor(0, 0, 229);
    mView->SetDrawingMode(B_OP_OVER);
    mView->DrawString("Name", BPoint(18, 14));
    EXPECT_TRUE(SamePictureAs(drawn));
}

TEST_F(CLVColumnDrawingTest, ASortKeyIsUnderlinedAsFarAsItsTextReaches) {
    CLVColumn column("mmmm", 80, 0, 20);

    column.DrawColumnHeader(mView, BRect(10, 0, 90, 18), true, false, 12);

    const auto end = static_cast<int32>(17 + WidthOf("mmmm"));
    for (int32 x = 17; x <= end; ++x) {
        EXPECT_EQ(At(x, 15), 0x000000U) << x;
    }
    EXPECT_EQ(At(16, 15), 0xFFFFFFU);
    EXPECT_EQ(At(end + 1, 15), 0xFFFFFFU);
    EXPECT_EQ(At(17, 16), 0xFFFFFFU);
}

TEST_F(CLVColumnDrawingTest, TheUnderlineHasTheColourOfThePressedLabel) {
    CLVColumn column("m", 80, 0, 20);

    column.DrawColumnHeader(mView, BRect(10, 0, 90, 18), true, true, 12);

    EXPECT_EQ(At(17, 15), 0x0000E5U);
}

TEST_F(CLVColumnDrawingTest, WithoutALabelNothingIsDrawn) {
    CLVColumn column(nullptr, 80, 0, 20);

    column.DrawColumnHeader(mView, BRect(10, 0, 90, 18), true, true, 12);

    EXPECT_EQ(CountOf(0xFFFFFF), 100 * 20);
    EXPECT_EQ(column.HeaderFrame(), kNowhere);
}

TEST_F(CLVColumnDrawingTest, TheShortenedLabelIsDrawnWhereItIsAskedFor) {
    const float width = ColumnWidthFor("Na...");
    CLVColumn truncating("Name of all names", width, CLV_COLUMN_HEADER_TRUNCATE, 20);
    CLVColumn plain("Name of all names", width, 0, 20);
    CLVColumn expected("Na...", width, 0, 20);

    expected.DrawColumnHeader(mView, BRect(0, 0, 90, 18), false, false, 12);
    const std::string shortened = Picture();
    Clear();
    truncating.DrawColumnHeader(mView, BRect(0, 0, 90, 18), false, false, 12);
    EXPECT_TRUE(SamePictureAs(shortened));
    Clear();
    plain.DrawColumnHeader(mView, BRect(0, 0, 90, 18), false, false, 12);
    EXPECT_FALSE(SamePictureAs(shortened));
}

TEST_F(CLVColumnDrawingTest, AHeaderThatWasNeverDrawnHasNothingToRedraw) {
    CLVColumn column("Hello world", 200, CLV_COLUMN_HEADER_TRUNCATE, 20);

    EXPECT_EQ(column.TruncateText(ColumnWidthFor("Hello...")), kNowhere);
    EXPECT_STREQ(column.TruncatedLabel(), "Hello...") << "shortened all the same";
}

TEST_F(CLVColumnDrawingTest, OnlyTheChangedTailOfALabelIsRedrawn) {
    CLVColumn column("Hello world", 200, CLV_COLUMN_HEADER_TRUNCATE, 20);
    column.DrawColumnHeader(mView, BRect(10, 1, 90, 18), false, false, 12);

    EXPECT_EQ(column.TruncateText(ColumnWidthFor("Hello w...")), BRect(18 + WidthOf("Hello w"), 1, 90, 18));
    EXPECT_EQ(column.TruncateText(ColumnWidthFor("Hello w...") + 1), kNowhere) << "nothing has changed";
    EXPECT_EQ(column.TruncateText(ColumnWidthFor("Hell...")), BRect(18 + WidthOf("Hell"), 1, 90, 18));
}

TEST_F(CLVColumnDrawingTest, TheTailThatIsRedrawnBeginsWithAWholeCharacter) {
    // Both have the same first byte of two.
    CLVColumn column("Moön", 200, CLV_COLUMN_HEADER_TRUNCATE, 4);
    column.DrawColumnHeader(mView, BRect(10, 1, 90, 18), false, false, 12);

    const BRect changed = column.TruncateText(ColumnWidthFor("Mo..."));

    EXPECT_EQ(changed.left, 18 + WidthOf("Mo"));
}

} // namespace
