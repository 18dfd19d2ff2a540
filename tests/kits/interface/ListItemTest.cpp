#include <ListItem.h>

#include <Bitmap.h>
#include <Message.h>
#include <View.h>

#include <gtest/gtest.h>
#include <string.h>

namespace {

// A white picture with one view on it.
class ListItemDrawing : public ::testing::Test {
  protected:
    void SetUp() override {
        mView = new BView(BRect(0, 0, 99, 19), "list", 0, 0);
        mBitmap.AddChild(mView);
    }
    uint32 At(int32 x, int32 y) const {
        return static_cast<const uint32*>(mBitmap.Bits())[y * 100 + x] & 0xFFFFFF;
    }
    int CountDark() const {
        int count = 0;
        for (int32 i = 0; i < 100 * 20; ++i) {
            count += (At(i % 100, i / 100) & 0xFF) < 64;
        }
        return count;
    }

    BBitmap mBitmap{BRect(0, 0, 99, 19), B_RGB32, true};
    BView* mView = nullptr; // belongs to the bitmap
};

TEST(ListItem, StartsAsItWasMade) {
    const BStringItem item("text", 2, false);
    EXPECT_STREQ(item.Text(), "text");
    EXPECT_EQ(item.OutlineLevel(), 2U);
    EXPECT_FALSE(item.IsExpanded());
    EXPECT_FALSE(item.IsSelected());
    EXPECT_TRUE(item.IsEnabled());
    EXPECT_EQ(item.Height(), 0);
    EXPECT_STREQ(BStringItem(static_cast<const char*>(nullptr)).Text(), "");
}

TEST(ListItem, KeepsWhatItIsTold) {
    BStringItem item("text");
    item.Select();
    item.SetEnabled(false);
    item.SetHeight(20);
    item.SetWidth(50);
    item.SetExpanded(false);
    item.SetText("other");
    EXPECT_TRUE(item.IsSelected());
    EXPECT_FALSE(item.IsEnabled());
    EXPECT_EQ(item.Height(), 20);
    EXPECT_EQ(item.Width(), 50);
    EXPECT_FALSE(item.IsExpanded());
    EXPECT_STREQ(item.Text(), "other");
    item.Deselect();
    EXPECT_FALSE(item.IsSelected());
}

TEST(ListItem, ArchivesAndComesBack) {
    BStringItem item("text", 3, false);
    item.Select();
    item.SetEnabled(false);
    BMessage archive;
    ASSERT_EQ(item.Archive(&archive), B_OK);
    const BStringItem back(&archive);
    EXPECT_STREQ(back.Text(), "text");
    EXPECT_EQ(back.OutlineLevel(), 3U);
    EXPECT_FALSE(back.IsExpanded());
    EXPECT_TRUE(back.IsSelected());
    EXPECT_FALSE(back.IsEnabled());
    BMessage empty;
    EXPECT_STREQ(BStringItem(&empty).Text(), "");
}

TEST_F(ListItemDrawing, UpdateTakesTheSizeFromTheFont) {
    BStringItem item("some text");
    item.Update(mView, be_plain_font);
    EXPECT_GT(item.Width(), be_plain_font->StringWidth("some text"));
    const float height = item.Height();
    EXPECT_GE(height, 13);
    EXPECT_LE(height, 22);
    BFont large;
    large.SetSize(24);
    item.Update(mView, &large);
    EXPECT_GT(item.Height(), height * 1.5F);
}

TEST_F(ListItemDrawing, DrawsItsTextOnTheBackgroundItFinds) {
    BStringItem item("some text");
    item.Update(mView, be_plain_font);
    item.DrawItem(mView, BRect(0, 0, 99, 17));
    EXPECT_GT(CountDark(), 20);
    EXPECT_EQ(At(99, 0), 0xFFFFFFU);
}

TEST_F(ListItemDrawing, ASelectedRowIsGreyAllOver) {
    BStringItem item("");
    item.Update(mView, be_plain_font);
    item.Select();
    item.DrawItem(mView, BRect(0, 2, 99, 10), true);
    EXPECT_EQ(At(0, 1), 0xFFFFFFU);
    EXPECT_EQ(At(0, 2), 0xB2B2B2U);
    EXPECT_EQ(At(99, 10), 0xB2B2B2U);
    EXPECT_EQ(At(0, 11), 0xFFFFFFU);
    EXPECT_EQ(mView->HighColor(), make_color(0, 0, 0)) << "the owner's colours come back";
    EXPECT_EQ(mView->LowColor(), make_color(255, 255, 255));
}

TEST_F(ListItemDrawing, ADisabledRowIsGreyText) {
    BStringItem item("some text");
    item.SetEnabled(false);
    item.Update(mView, be_plain_font);
    item.DrawItem(mView, BRect(0, 0, 99, 17));
    EXPECT_EQ(CountDark(), 0);
}

} // namespace
