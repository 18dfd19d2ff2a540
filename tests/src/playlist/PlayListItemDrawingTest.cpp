// A song's row by its pixels: one cell at (10, 5) to (79, 25) of a red picture.
#include "playlist/PlayListItem.h"

#include "TrackVolume.h"
#include "kits/interface/BitmapWithView.h"
#include "metadata/BrindleMetaData.h"

#include <Bitmap.h>
#include <CopyText.h>
#include <Font.h>
#include <Region.h>

#include <cmath>
#include <cstring>
#include <memory>

namespace {

constexpr uint32 kRed = 0xFF0000;
constexpr uint32 kBlue = 0x0000FF;
constexpr uint32 kGreen = 0x00FF00;
constexpr uint32 kWhite = 0xFFFFFF;
constexpr uint32 kGrey = 0xB2B2B2;

constexpr BRect kCell(10, 5, 79, 25);
constexpr BRect kTallCell(10, 5, 79, 46);

class Picture {
  public:
    Picture() { MakeRed(); }
    void MakeRed() {
        Draw([](BView* view) {
            view->SetHighColor(255, 0, 0);
            view->FillRect(view->Bounds());
        });
    }
    template <typename Work>
    void Draw(Work work) {
        mPicture.Bitmap().Lock();
        work(mPicture.view);
        mPicture.view->Sync();
        mPicture.Bitmap().Unlock();
    }
    uint32 At(float x, float y) const { return mPicture.At(static_cast<int32>(x), static_cast<int32>(y)); }
    // Whether the rectangle is all of the one colour and everything else of the other.
    testing::AssertionResult Is(uint32 color, BRect where, uint32 outside, BRect within) const {
        for (float y = within.top; y <= within.bottom; ++y) {
            for (float x = within.left; x <= within.right; ++x) {
                if (At(x, y) != (where.Contains(BPoint(x, y)) ? color : outside))
                    return testing::AssertionFailure()
                           << std::hex << At(x, y) << std::dec << " at " << x << ", " << y;
            }
        }
        return testing::AssertionSuccess();
    }
    testing::AssertionResult IsAll(uint32 color, BRect where) const { return Is(color, where, color, where); }
    testing::AssertionResult IsRedOutside(BRect cell) const {
        for (float y = 0; y < 60; ++y) {
            for (float x = 0; x < 100; ++x) {
                if (!cell.Contains(BPoint(x, y)) && At(x, y) != kRed)
                    return testing::AssertionFailure() << x << ", " << y;
            }
        }
        return testing::AssertionSuccess();
    }
    bool operator==(const Picture& other) const { return mPicture.Show() == other.mPicture.Show(); }

  private:
    BitmapWithView mPicture{100, 60};
};

std::unique_ptr<BBitmap> MakeCover(float lastPixel, rgb_color color) {
    auto cover = std::make_unique<BBitmap>(BRect(0, 0, lastPixel, lastPixel), B_RGB32, true);
    auto* const view = new BView(cover->Bounds(), "", 0, 0); // the bitmap's
    cover->AddChild(view);
    cover->Lock();
    view->SetHighColor(color);
    view->FillRect(view->Bounds());
    view->Sync();
    cover->Unlock();
    return cover;
}

std::unique_ptr<BBitmap> MakeInvalidCover() {
    BMessage nothing;
    return std::make_unique<BBitmap>(&nothing);
}

class SongRow : public TrackTest {
  protected:
    SongRow() {
        entry_ref ref = RefOf(MakeFile("song.mp3"));
        mItem = std::make_unique<PlayListItem>(&ref);
        mPicture.Draw([&](BView* view) { mItem->Update(view, be_plain_font); });
    }
    void Draw(int32 column, bool complete, BRect cell = kCell) {
        mPicture.Draw([&](BView* view) { mItem->DrawItemColumn(view, cell, column, complete); });
    }
    void SetSmallCover(std::unique_ptr<BBitmap> cover) {
        mItem->MetaData().mCover16x16bitmap = cover.release();
    }
    void SetLargeCover(std::unique_ptr<BBitmap> cover) {
        mItem->MetaData().mCover64x64bitmap = cover.release();
    }

    Picture mPicture;
    std::unique_ptr<PlayListItem> mItem;
};

TEST_F(SongRow, IsTwentyHighAtLeast) {
    EXPECT_EQ(mItem->Height(), 20);
    EXPECT_EQ(mItem->OutlineLevel(), 0u);
    EXPECT_FALSE(mItem->IsSuperItem());
}

TEST_F(SongRow, KnowsItsFile) {
    const std::string path = MakeFile("song.mp3");
    entry_ref ref;
    mItem->GetRef(&ref);
    EXPECT_EQ(ref, RefOf(path));
}

TEST_F(SongRow, ClearsItsBackgroundWhenSelectedOrDrawnAsAWhole) {
    const struct {
        bool selected, complete;
        uint32 background;
    } cases[] = {{false, false, kRed}, {false, true, kWhite}, {true, false, kGrey}, {true, true, kGrey}};
    for (const auto& expected : cases) {
        for (const int32 column : {-1, 0, 6}) {
            mPicture.MakeRed();
            if (expected.selected)
                mItem->Select();
            else
                mItem->Deselect();
            Draw(column, expected.complete);
            EXPECT_TRUE(mPicture.Is(expected.background, kCell, kRed, BRect(0, 0, 99, 59)))
                << column << (expected.selected ? " selected" : "") << (expected.complete ? " complete" : "");
        }
    }
}

TEST_F(SongRow, WithoutACoverTheFirstColumnIsEmpty) {
    Draw(0, true);
    EXPECT_TRUE(mPicture.IsAll(kWhite, kCell));
    EXPECT_TRUE(mPicture.IsRedOutside(kCell));
}

TEST_F(SongRow, TheSmallCoverStandsTwoPixelsFromTheCellsCorner) {
    SetSmallCover(MakeCover(15, {0, 0, 255, 255}));
    Draw(0, true);
    EXPECT_TRUE(mPicture.Is(kBlue, BRect(12, 7, 27, 22), kWhite, kCell));
    EXPECT_TRUE(mPicture.IsRedOutside(kCell));
}

TEST_F(SongRow, OfALargerSmallCoverTheFirstSixteenPixelsAreShown) {
    SetSmallCover(MakeCover(16, {0, 0, 255, 255}));
    mItem->MetaData().mCover16x16bitmap->Lock();
    BView* const view = mItem->MetaData().mCover16x16bitmap->ChildAt(0);
    view->SetHighColor(0, 255, 0);
    view->StrokeLine(BPoint(16, 0), BPoint(16, 16));
    view->StrokeLine(BPoint(0, 16), BPoint(16, 16));
    view->Sync();
    mItem->MetaData().mCover16x16bitmap->Unlock();
    Draw(0, true);
    EXPECT_TRUE(mPicture.Is(kBlue, BRect(12, 7, 27, 22), kWhite, kCell));
}

TEST_F(SongRow, TheSmallCoverStandsInTheMiddleOfAHighRow) {
    mItem->SetHeight(41);
    SetSmallCover(MakeCover(15, {0, 0, 255, 255}));
    Draw(0, true, kTallCell);
    EXPECT_TRUE(mPicture.Is(kBlue, BRect(12, 18, 27, 33), kWhite, kTallCell)) << "21 / 2 is rounded up";
}

TEST_F(SongRow, TheSmallCoversTransparentPixelsShowTheBackground) {
    auto cover = std::make_unique<BBitmap>(BRect(0, 0, 15, 15), B_CMAP8);
    memset(cover->Bits(), B_TRANSPARENT_MAGIC_CMAP8, static_cast<size_t>(cover->BitsLength()));
    SetSmallCover(std::move(cover));
    mItem->Select();
    Draw(0, true);
    EXPECT_TRUE(mPicture.IsAll(kGrey, kCell));
}

TEST_F(SongRow, ALargeCoverAloneFillsTheCell) {
    SetLargeCover(MakeCover(64, {0, 255, 0, 255}));
    Draw(0, true);
    EXPECT_TRUE(mPicture.IsAll(kGreen, kCell));
    EXPECT_TRUE(mPicture.IsRedOutside(kCell));
}

TEST_F(SongRow, OfALargeCoverAloneNothingIsCutOff) {
    auto cover = MakeCover(63, {0, 255, 0, 255});
    cover->Lock();
    BView* const view = cover->ChildAt(0);
    view->SetHighColor(0, 0, 255);
    view->FillRect(BRect(32, 32, 63, 63));
    view->Sync();
    cover->Unlock();
    SetLargeCover(std::move(cover));
    const BRect cell(10, 5, 29, 24);
    Draw(0, true, cell);
    // Its lower right quarter is that of the cell, but for where the two colours meet.
    EXPECT_TRUE(mPicture.IsAll(kGreen, BRect(10, 5, 29, 13)));
    EXPECT_TRUE(mPicture.IsAll(kGreen, BRect(10, 5, 18, 24)));
    EXPECT_TRUE(mPicture.IsAll(kBlue, BRect(21, 16, 29, 24)));
    EXPECT_TRUE(mPicture.IsRedOutside(cell));
}

TEST_F(SongRow, ALargeCoverIsDrawnOverTheSmallOne) {
    SetSmallCover(MakeCover(15, {0, 0, 255, 255}));
    SetLargeCover(MakeCover(64, {0, 255, 0, 255}));
    Draw(0, true);
    EXPECT_TRUE(mPicture.Is(kGreen, BRect(12, 7, 27, 22), kWhite, kCell));
}

TEST_F(SongRow, AnInvalidCoverIsLikeNone) {
    SetSmallCover(MakeInvalidCover());
    SetLargeCover(MakeInvalidCover());
    Draw(0, true);
    EXPECT_TRUE(mPicture.IsAll(kWhite, kCell));
}

TEST_F(SongRow, ANarrowCellCutsTheCover) {
    SetSmallCover(MakeCover(15, {0, 0, 255, 255}));
    const BRect narrow(10, 5, 19, 25);
    Draw(0, true, narrow);
    EXPECT_TRUE(mPicture.Is(kBlue, BRect(12, 7, 19, 22), kWhite, narrow));
    EXPECT_TRUE(mPicture.IsRedOutside(narrow));
}

TEST_F(SongRow, ShowsTheTextOfEachColumnCutOffAtItsEdge) {
    BrindleMetaData& data = mItem->MetaData();
    CopyText(data.mTrackNo, "07 ");
    CopyText(data.mLengthText, " 3:21");
    CopyText(data.mSongname, "A song with a name that is too long");
    CopyText(data.mArtist, "An artist");
    CopyText(data.mAlbum, "\xC3\x84lbum");
    font_height height;
    be_plain_font->GetHeight(&height);
    const float ascent = std::ceil(height.ascent);
    const float descent = std::ceil(height.descent);
    const BPoint origin(12, 5 + (20 - (ascent + descent)) / 2 + ascent);

    const char* const texts[] = {"07 ", " 3:21", "A song with a name that is too long", "An artist",
                                 "\xC3\x84lbum"};
    for (int32 column = 1; column <= 5; ++column) {
        mPicture.MakeRed();
        Draw(column, true);
        Picture expected;
        expected.Draw([&](BView* view) {
            view->SetHighColor(255, 255, 255);
            view->FillRect(kCell);
            BRegion cell(kCell);
            view->ConstrainClippingRegion(&cell);
            view->SetLowColor(255, 255, 255);
            view->SetHighColor(0, 0, 0);
            view->SetFontSize(14);
            view->DrawString(texts[column - 1], origin);
            view->ConstrainClippingRegion(nullptr);
        });
        EXPECT_TRUE(mPicture == expected) << "column " << column;
        EXPECT_FALSE(mPicture.IsAll(kWhite, kCell)) << "column " << column;
        EXPECT_TRUE(mPicture.IsRedOutside(kCell));
    }
}

TEST_F(SongRow, TextsStandInTheMiddleOfAHighRowInThePlainFontWhateverTheListHas) {
    CopyText(mItem->MetaData().mSongname, "Song");
    // The list's own font is large, which makes the row high; the text is placed by the plain one.
    BFont large(be_plain_font);
    large.SetSize(30);
    mPicture.Draw([&](BView* view) { mItem->Update(view, &large); });
    const float rowHeight = mItem->Height();
    ASSERT_GT(rowHeight, 20);
    Draw(3, true, kTallCell);

    font_height height;
    be_plain_font->GetHeight(&height);
    const float ascent = std::ceil(height.ascent);
    const float baseline = 5 + (rowHeight - (ascent + std::ceil(height.descent))) / 2 + ascent;
    Picture expected;
    expected.Draw([&](BView* view) {
        view->SetHighColor(255, 255, 255);
        view->FillRect(kTallCell);
        view->SetLowColor(255, 255, 255);
        view->SetHighColor(0, 0, 0);
        view->SetFontSize(14);
        view->DrawString("Song", BPoint(12, baseline));
    });
    EXPECT_TRUE(mPicture == expected);
}

TEST_F(SongRow, LeavesNoClippingBehind) {
    Draw(3, true);
    mPicture.Draw([](BView* view) {
        view->SetHighColor(0, 0, 255);
        view->FillRect(view->Bounds());
    });
    EXPECT_TRUE(mPicture.IsAll(kBlue, BRect(0, 0, 99, 59)));
}

} // namespace
