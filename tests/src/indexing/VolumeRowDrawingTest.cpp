// The row of a volume by its pixels: drawn at (10, 30) to (445, 50) of a white picture.
#include "VolumeJobs.h"

#include <Bitmap.h>
#include <Font.h>
#include <View.h>

#include <filesystem>
#include <fstream>
#include <functional>
#include <memory>
#include <string>

namespace {

constexpr uint32 kWhite = 0xFFFFFF;
constexpr uint32 kGrey = 0xC0C0C0;
constexpr uint32 kDarkBlue = 0x404080;

class Picture {
  public:
    Picture() { mBitmap.AddChild(mView); }
    void Draw(const std::function<void(BView*)>& draw) {
        ASSERT_TRUE(mBitmap.Lock());
        draw(mView);
        mView->Sync();
        mBitmap.Unlock();
    }
    uint32 At(int32 x, int32 y) const {
        return reinterpret_cast<const uint32*>(mBitmap.Bits())[y * 500 + x] & 0xFFFFFF;
    }
    // The first difference between the two pictures in that rectangle; empty when there is none.
    std::string DifferenceTo(const Picture& other, BRect where) const {
        for (int32 y = static_cast<int32>(where.top); y <= static_cast<int32>(where.bottom); ++y) {
            for (int32 x = static_cast<int32>(where.left); x <= static_cast<int32>(where.right); ++x) {
                if (At(x, y) != other.At(x, y))
                    return "at " + std::to_string(x) + ", " + std::to_string(y);
            }
        }
        return "";
    }
    // Whether the whole rectangle is of that colour.
    testing::AssertionResult IsAll(uint32 color, BRect where) const {
        for (int32 y = static_cast<int32>(where.top); y <= static_cast<int32>(where.bottom); ++y) {
            for (int32 x = static_cast<int32>(where.left); x <= static_cast<int32>(where.right); ++x) {
                if (At(x, y) != color)
                    return testing::AssertionFailure()
                           << std::hex << At(x, y) << std::dec << " at " << x << ", " << y;
            }
        }
        return testing::AssertionSuccess();
    }

  private:
    BBitmap mBitmap{BRect(0, 0, 499, 79), B_RGB32, true};
    BView* const mView = new BView(BRect(0, 0, 499, 79), "", 0, 0); // belongs to the bitmap
};

constexpr BRect kRow(10, 30, 445, 50);
constexpr BRect kNamePlace(53, 30, 141, 50);
constexpr BRect kBar(142, 34, 213, 46);
constexpr BRect kInsideOfBar(143, 35, 212, 45);
constexpr BRect kStatusPlace(214, 30, 445, 50);

class VolumeRow : public TrackTest {
  protected:
    static void DrawRow(Picture& picture, FileIndexListItem& item, bool complete = false) {
        picture.Draw([&](BView* view) { item.DrawItem(view, kRow, complete); });
    }

    // The text, and nothing else, in the status text's place.
    static void ExpectStatus(FileIndexListItem& item, const char* text) {
        Picture row;
        DrawRow(row, item);
        Picture expected;
        expected.Draw([&](BView* view) {
            view->SetFontSize(12);
            view->SetHighColor(0, 0, 0);
            view->DrawString(text, BPoint(218, 43));
        });
        EXPECT_EQ(row.DifferenceTo(expected, kStatusPlace), "") << text;
    }

    static void ExpectOutline(const Picture& row) {
        EXPECT_TRUE(row.IsAll(kDarkBlue, BRect(142, 34, 213, 34)));
        EXPECT_TRUE(row.IsAll(kDarkBlue, BRect(142, 46, 213, 46)));
        EXPECT_TRUE(row.IsAll(kDarkBlue, BRect(142, 34, 142, 46)));
        EXPECT_TRUE(row.IsAll(kDarkBlue, BRect(213, 34, 213, 46)));
        EXPECT_TRUE(row.IsAll(kWhite, BRect(142, 30, 213, 33))) << "above the bar";
        EXPECT_TRUE(row.IsAll(kWhite, BRect(142, 47, 213, 50))) << "below the bar";
        EXPECT_TRUE(row.IsAll(kWhite, BRect(214, 30, 217, 50))) << "right of the bar";
    }

    static bool IsStripe(int32 x, int32 y) {
        const uint8 stripes[8] = {0xC7, 0x8F, 0x1F, 0x3E, 0x7C, 0xF8, 0xF1, 0xE3};
        return (stripes[y % 8] & (0x80 >> (x % 8))) != 0;
    }
    static void ExpectStriped(const Picture& row) {
        for (int32 y = 35; y <= 45; ++y) {
            for (int32 x = 143; x <= 212; ++x)
                ASSERT_EQ(row.At(x, y), IsStripe(x, y) ? kDarkBlue : kWhite) << x << ", " << y;
        }
    }

    std::unique_ptr<FileIndexListItem> mItem = MakeItem(Volume());
};

TEST_F(VolumeRow, AVolumeWithoutAJobHasAnEmptyBarAndNoStatus) {
    Picture row;
    DrawRow(row, *mItem);

    EXPECT_TRUE(row.IsAll(kWhite, kInsideOfBar));
    ExpectOutline(row);
    ExpectStatus(*mItem, "");
}

TEST_F(VolumeRow, TheIconLies20RightAnd2BelowTheRowsCorner) {
    ASSERT_NE(mItem->Icon(), nullptr);
    Picture row;
    DrawRow(row, *mItem);
    Picture expected;
    expected.Draw([&](BView* view) {
        view->SetDrawingMode(B_OP_OVER);
        view->DrawBitmap(mItem->Icon(), BPoint(30, 32));
    });

    EXPECT_EQ(row.DifferenceTo(expected, BRect(10, 30, 52, 50)), "");
    EXPECT_FALSE(expected.IsAll(kWhite, BRect(30, 32, 45, 47))) << "the icon shows nothing";
}

TEST_F(VolumeRow, TheNameIsBlackAt12PixelsFiveAboveTheBottom) {
    Picture row;
    DrawRow(row, *mItem);
    Picture expected;
    expected.Draw([](BView* view) {
        view->SetFontSize(12);
        view->SetHighColor(0, 0, 0);
        view->DrawString("Music", BPoint(53, 45));
    });

    EXPECT_EQ(row.DifferenceTo(expected, kNamePlace), "");
}

TEST_F(VolumeRow, ANameThatIsTooLongIsCutBeforeTheBar) {
    const std::string root = TestVolumes::Instance().LongName();
    const auto item = MakeItem(root);
    ASSERT_NE(item, nullptr);
    Picture row;
    DrawRow(row, *item);

    EXPECT_FALSE(row.IsAll(kWhite, BRect(110, 30, 137, 50))) << "most of the room is used";
    EXPECT_TRUE(row.IsAll(kWhite, BRect(139, 30, 141, 50)));
    ExpectOutline(row);
}

TEST_F(VolumeRow, ASelectedRowIsGreyAndItsTextBlack) {
    mItem->Select();
    Picture row;
    DrawRow(row, *mItem);
    Picture expected;
    expected.Draw([](BView* view) {
        view->SetHighColor(192, 192, 192);
        view->FillRect(BRect(10, 30, 445, 50));
        view->SetFontSize(12);
        view->SetHighColor(0, 0, 0);
        view->SetLowColor(192, 192, 192);
        view->DrawString("Music", BPoint(53, 45));
    });

    EXPECT_EQ(row.DifferenceTo(expected, kNamePlace), "");
    EXPECT_TRUE(row.IsAll(kGrey, BRect(10, 30, 29, 50)));
    EXPECT_TRUE(row.IsAll(kGrey, BRect(142, 30, 213, 33)));
    EXPECT_TRUE(row.IsAll(kGrey, kStatusPlace));
    EXPECT_TRUE(row.IsAll(kWhite, kInsideOfBar)) << "the bar is the same in every row";
    EXPECT_TRUE(row.IsAll(kWhite, BRect(0, 0, 499, 29))) << "nothing outside of the row";
    EXPECT_TRUE(row.IsAll(kWhite, BRect(446, 30, 499, 50)));
    EXPECT_TRUE(row.IsAll(kWhite, BRect(0, 51, 499, 79)));
}

TEST_F(VolumeRow, OnlyACompleteDrawingClearsARowThatIsNotSelected) {
    Picture row;
    const auto fillWithRed = [](BView* view) {
        view->SetHighColor(255, 0, 0);
        view->FillRect(BRect(0, 0, 499, 79));
    };
    row.Draw(fillWithRed);
    DrawRow(row, *mItem);
    EXPECT_TRUE(row.IsAll(0xFF0000, kStatusPlace));

    DrawRow(row, *mItem, true);
    EXPECT_TRUE(row.IsAll(kWhite, kStatusPlace));
    EXPECT_TRUE(row.IsAll(0xFF0000, BRect(446, 30, 499, 50)));
}

TEST_F(VolumeRow, TheViewIsLeftAsItWas) {
    Picture picture;
    picture.Draw([&](BView* view) {
        view->SetHighColor(1, 2, 3);
        view->SetLowColor(4, 5, 6);
        view->SetFontSize(20);
        mItem->DrawItem(view, kRow);
        EXPECT_EQ(view->HighColor().blue, 3);
        EXPECT_EQ(view->LowColor().blue, 6);
        EXPECT_EQ(view->DrawingMode(), B_OP_COPY);
        BFont font;
        view->GetFont(&font);
        EXPECT_EQ(font.Size(), 20);
    });
}

TEST_F(VolumeRow, AVolumeThatHoldsNoAttributesIsGreyAndHasNoBar) {
    const auto item = MakeItem("/sys/class");
    ASSERT_NE(item, nullptr);
    Picture row;
    DrawRow(row, *item);
    Picture expected;
    expected.Draw([](BView* view) {
        view->SetFontSize(12);
        view->SetHighColor(128, 128, 128);
        view->DrawString("class", BPoint(53, 45));
        view->DrawString("Unsupported", BPoint(142, 43));
    });

    EXPECT_EQ(row.DifferenceTo(expected, BRect(53, 30, 445, 50)), "");
}

TEST_F(VolumeRow, AVolumeThatHoldsNoAttributesIsBlackOnGreyWhenSelected) {
    const auto item = MakeItem("/sys/class");
    ASSERT_NE(item, nullptr);
    item->Select();
    Picture row;
    DrawRow(row, *item);
    Picture expected;
    expected.Draw([](BView* view) {
        view->SetHighColor(192, 192, 192);
        view->FillRect(BRect(10, 30, 445, 50));
        view->SetFontSize(12);
        view->SetHighColor(0, 0, 0);
        view->SetLowColor(192, 192, 192);
        view->DrawString("class", BPoint(53, 45));
        view->DrawString("Unsupported", BPoint(142, 43));
    });

    EXPECT_EQ(row.DifferenceTo(expected, BRect(53, 30, 445, 50)), "");
}

TEST_F(VolumeRow, AFinishedJobFillsTheBar) {
    MakeFile("Artist - One.mp3");
    MakeFile("Artist - Two.mp3");

    RunToEnd(*mItem, &FileIndexListItem::IndexAttributes);
    Picture row;
    DrawRow(row, *mItem);
    EXPECT_TRUE(row.IsAll(kDarkBlue, kBar));
    ExpectOutline(row);
    ExpectStatus(*mItem, "Indexed 2 files");

    RunToEnd(*mItem, &FileIndexListItem::EraseAttributes);
    ExpectStatus(*mItem, "Striped 2 files");
}

TEST_F(VolumeRow, AStatusJobFillsTheBarByAndBy) {
    mItem->StatAttributes();
    ExpectStatus(*mItem, "Getting status...");
    EXPECT_TRUE(WaitUntil([&] { return mItem->Progress() >= 0.5f; }));
    mItem->CancelScan();
    ASSERT_LT(mItem->Progress(), 0.7f);
    Picture row;
    DrawRow(row, *mItem);

    EXPECT_TRUE(row.IsAll(kDarkBlue, BRect(143, 35, 177, 45)));
    EXPECT_TRUE(row.IsAll(kWhite, BRect(193, 35, 212, 45)));
    ExpectOutline(row);
    ExpectStatus(*mItem, "Cancelled.");
}

TEST_F(VolumeRow, AFinishedStatusJobSaysSo) {
    RunToEnd(*mItem, &FileIndexListItem::StatAttributes);
    ExpectStatus(*mItem, "Got status");
}

TEST_F(VolumeRow, AJobThatWalksFilesHasStripes) {
    for (int i = 0; i < 2000; ++i)
        MakeFile(std::to_string(i % 10) + "/Artist - " + std::to_string(i) + ".mp3");

    mItem->IndexAttributes();
    EXPECT_TRUE(WaitUntil([&] { return mItem->FileCount() > 1; }));
    mItem->CancelScan();
    ASSERT_EQ(mItem->Progress(), -1.0f);
    Picture row;
    DrawRow(row, *mItem);

    ExpectStriped(row);
    ExpectOutline(row);
    ExpectStatus(*mItem, "Cancelled.");
}

// A job that fails before its first file keeps the words of a running one and a twentieth of the bar.
TEST_F(VolumeRow, AJobThatFailsAtOnceKeepsItsFirstProgress) {
    const std::string& root = TestVolumes::Instance().Passing();
    std::filesystem::create_directory(root);
    const auto item = MakeItem(root);
    std::filesystem::remove_all(root);

    RunToEnd(*item, &FileIndexListItem::EraseAttributes);
    Picture row;
    DrawRow(row, *item);

    EXPECT_TRUE(row.IsAll(kDarkBlue, BRect(143, 35, 145, 45)));
    EXPECT_TRUE(row.IsAll(kWhite, BRect(146, 35, 212, 45)));
    ExpectStatus(*item, "Stripping (0)");
    std::filesystem::create_directory(root);
}

TEST_F(VolumeRow, IsHighEnoughForItsIcon) {
    Picture picture;
    picture.Draw([&](BView* view) {
        BFont font;
        font.SetSize(12);
        mItem->Update(view, &font);
        EXPECT_EQ(mItem->Height(), 20);
        EXPECT_EQ(mItem->Width(), 499);
        font.SetSize(40);
        mItem->Update(view, &font);
        EXPECT_GE(mItem->Height(), 40);
    });
}

} // namespace
