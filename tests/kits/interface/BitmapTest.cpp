#include <Bitmap.h>

#include "PixelFormat.h"
#include "PixelPicture.h"

#include <Message.h>
#include <TypeConstants.h>
#include <View.h>

#include <gtest/gtest.h>
#include <limits>
#include <memory>
#include <thread>

namespace {

uint8* BytesOf(const BBitmap& bitmap) {
    return static_cast<uint8*>(bitmap.Bits());
}

TEST(Bitmap, RowsAndLengthFollowFromBoundsAndSpace) {
    const BBitmap cover(BRect(0, 0, 64, 64), B_RGB16);
    EXPECT_EQ(cover.InitCheck(), B_OK);
    EXPECT_EQ(cover.BytesPerRow(), 132);
    EXPECT_EQ(cover.BitsLength(), 8580);
    EXPECT_EQ(cover.ColorSpace(), B_RGB16);
    const BBitmap arrow(BRect(0, 0, 10, 10), B_CMAP8);
    EXPECT_EQ(arrow.BytesPerRow(), 12);
    EXPECT_EQ(arrow.BitsLength(), 132);
    const BBitmap moved(BRect(10, 20, 12, 20), B_RGB32);
    EXPECT_EQ(moved.BitsLength(), 12);
    EXPECT_EQ(moved.Bounds(), BRect(10, 20, 12, 20));
}

TEST(Bitmap, OnesThatAcceptViewsStartWhiteAndOthersZero) {
    const BBitmap plain(BRect(0, 0, 1, 0), B_RGB32);
    EXPECT_EQ(BytesOf(plain)[0], 0);
    const BBitmap views(BRect(0, 0, 1, 0), B_RGB32, true);
    EXPECT_EQ(BytesOf(views)[0], 255);
    const BBitmap indexed(BRect(0, 0, 1, 0), B_CMAP8, true);
    EXPECT_EQ(BytesOf(indexed)[0], 63);
    const BBitmap cleared(BRect(0, 0, 1, 0), B_BITMAP_CLEAR_TO_WHITE, B_GRAY8);
    EXPECT_EQ(BytesOf(cleared)[1], 255);
}

TEST(Bitmap, ImpossibleOnesAreNotValid) {
    const float nan = std::numeric_limits<float>::quiet_NaN();
    const float infinite = std::numeric_limits<float>::infinity();
    for (const BRect& bounds :
         {BRect(0, 0, -1, 5), BRect(0, 0, nan, 5), BRect(nan, nan, nan, nan), BRect(0, 0, infinite, 5),
          BRect(-infinite, 0, infinite, 5), BRect(0, 0, 2147483648.0F, 1), BRect(0, 0, 32767, 0),
          BRect(0, 0, 32000, 32000)}) {
        const BBitmap bitmap(bounds, B_RGB32, true);
        EXPECT_EQ(bitmap.InitCheck(), B_BAD_VALUE);
        EXPECT_FALSE(bitmap.IsValid());
        EXPECT_EQ(bitmap.Bits(), nullptr);
        EXPECT_EQ(bitmap.BitsLength(), 0);
    }
    EXPECT_EQ(BBitmap(BRect(0, 0, 5, 5), B_YUV422).InitCheck(), B_BAD_VALUE);
    EXPECT_EQ(BBitmap(BRect(0, 0, 5, 5), B_NO_COLOR_SPACE).InitCheck(), B_BAD_VALUE);
    EXPECT_EQ(BBitmap(BRect(0, 0, 5, 5), 0, B_RGB32, 20).InitCheck(), B_BAD_VALUE) << "rows too short";
    EXPECT_EQ(BBitmap(BRect(0, 0, 5, 5), 0, B_RGB32, 28).BitsLength(), 168) << "longer rows are allowed";
    EXPECT_FALSE(BBitmap(static_cast<const BBitmap*>(nullptr)).IsValid());
}

TEST(Bitmap, EverythingOnAnInvalidOneFailsQuietly) {
    BBitmap bitmap(BRect(0, 0, -9, -9), B_RGB32, true);
    const uint8 data[4] = {};
    bitmap.SetBits(data, 4, 0, B_RGB32);
    EXPECT_EQ(bitmap.ImportBits(data, 4, 4, 0, B_RGB32), B_NO_INIT);
    EXPECT_FALSE(bitmap.Lock());
    bitmap.Unlock();
    EXPECT_EQ(bitmap.CountChildren(), 0);
    BMessage archive;
    EXPECT_EQ(bitmap.Archive(&archive), B_NO_INIT);
}

TEST(Bitmap, DataOfItsOwnSpaceIsCopiedAsItIs) {
    BBitmap bitmap(BRect(0, 0, 10, 1), B_CMAP8);
    std::vector<uint8> data(30);
    for (size_t i = 0; i < data.size(); ++i) {
        data[i] = static_cast<uint8>(i);
    }
    bitmap.SetBits(data.data(), 30, 0, B_CMAP8);
    EXPECT_EQ(BytesOf(bitmap)[11], 11) << "padding too";
    EXPECT_EQ(BytesOf(bitmap)[23], 23);
    bitmap.SetBits(data.data(), 5, 20, B_CMAP8);
    EXPECT_EQ(BytesOf(bitmap)[19], 19);
    EXPECT_EQ(BytesOf(bitmap)[20], 0);
    EXPECT_EQ(BytesOf(bitmap)[23], 3) << "cut at the end";
    bitmap.SetBits(data.data(), 5, -1, B_CMAP8);
    bitmap.SetBits(data.data(), 5, 24, B_CMAP8);
    bitmap.SetBits(data.data(), -5, 0, B_CMAP8);
    bitmap.SetBits(nullptr, 5, 0, B_CMAP8);
    EXPECT_EQ(BytesOf(bitmap)[0], 0);
}

TEST(Bitmap, Rgb32DataIsThreeBytesAPixelRedFirst) {
    const uint8 data[] = {255, 0, 0, 0, 255, 0, 0, 0, 255, 1, 2, 3};
    BBitmap bitmap(BRect(0, 0, 1, 1), B_RGB32);
    bitmap.SetBits(data, sizeof(data), 0, B_RGB32);
    EXPECT_EQ(PixelPicture::ShowSurface(bitmap.Surface())[0], "rg");
    EXPECT_EQ(BytesOf(bitmap)[8], 255) << "blue comes first in memory";
    EXPECT_EQ(BytesOf(bitmap)[12], 3);
}

TEST(Bitmap, IndexedDataOnOtherSpacesHasNoPadding) {
    const uint8 data[] = {0, 63, 0, 63, 63, 63};
    BBitmap bitmap(BRect(0, 0, 2, 1), B_RGB16);
    bitmap.SetBits(data, sizeof(data), 0, B_CMAP8);
    EXPECT_EQ(PixelPicture::ShowSurface(bitmap.Surface()), (Rows{"#.#", "..."}));
}

TEST(Bitmap, OtherDataHasPaddedRows) {
    const uint8 data[] = {0, 255, 0, 99, 255, 0, 255, 99};
    BBitmap bitmap(BRect(0, 0, 2, 1), B_RGB32);
    bitmap.SetBits(data, sizeof(data), 0, B_GRAY8);
    EXPECT_EQ(PixelPicture::ShowSurface(bitmap.Surface()), (Rows{"#.#", ".#."}));
}

TEST(Bitmap, ImportsAPartOfOtherDataIntoAPart) {
    const uint8 grey[] = {0, 1, 2, 3, 255, 0, 255, 7, 0, 255, 0, 11};
    BBitmap bitmap(BRect(0, 0, 3, 2), B_RGB32, true);
    EXPECT_EQ(bitmap.ImportBits(grey, 12, 4, B_GRAY8, BPoint(0, 1), BPoint(1, 0), 3, 2), B_OK);
    EXPECT_EQ(PixelPicture::ShowSurface(bitmap.Surface()), (Rows{"..#.", ".#.#", "...."}));
    EXPECT_EQ(bitmap.ImportBits(grey, 12, 4, B_GRAY8, BPoint(0, 2), BPoint(-1, -1), 3, 2), B_OK);
    EXPECT_EQ(PixelPicture::ShowSurface(bitmap.Surface())[0], "..#.") << "wholly cut off";
    EXPECT_EQ(bitmap.ImportBits(grey, 12, 4, B_GRAY8, BPoint(1, 2), BPoint(3, 2), 100, 100), B_OK);
    EXPECT_EQ(bitmap.ImportBits(grey, 12, 0, B_GRAY8, BPoint(), BPoint(), 3, 2), B_BAD_VALUE);
    EXPECT_EQ(bitmap.ImportBits(grey, 12, 4, B_YUV9, BPoint(), BPoint(), 3, 2), B_BAD_VALUE);
    EXPECT_EQ(bitmap.ImportBits(grey, 12, 4, 1000, B_GRAY8), B_BAD_VALUE);
    EXPECT_EQ(bitmap.ImportBits(nullptr, 12, 4, 0, B_GRAY8), B_BAD_VALUE);
}

TEST(Bitmap, ImportsFromAnotherBitmap) {
    BBitmap source(BRect(0, 0, 2, 0), B_CMAP8);
    const uint8 indices[] = {0, B_TRANSPARENT_MAGIC_CMAP8, 63};
    source.SetBits(indices, 3, 0, B_CMAP8);
    BBitmap target(BRect(5, 5, 7, 5), B_RGB32);
    EXPECT_EQ(target.ImportBits(&source), B_OK);
    EXPECT_EQ(reinterpret_cast<uint32*>(BytesOf(target))[1], B_TRANSPARENT_MAGIC_RGBA32);
    BBitmap back(BRect(0, 0, 2, 0), B_CMAP8);
    EXPECT_EQ(back.ImportBits(&target), B_OK);
    EXPECT_EQ(BytesOf(back)[0], 0);
    EXPECT_EQ(BytesOf(back)[1], B_TRANSPARENT_MAGIC_CMAP8);
    EXPECT_EQ(BytesOf(back)[2], 63);
    BBitmap other(BRect(0, 0, 3, 0), B_CMAP8);
    EXPECT_EQ(other.ImportBits(&source), B_BAD_VALUE) << "another size";
    EXPECT_EQ(other.ImportBits(&source, BPoint(2, 0), BPoint(0, 0), 9, 9), B_OK);
    EXPECT_EQ(BytesOf(other)[0], 63);
    EXPECT_EQ(BytesOf(other)[1], 0);
}

class BitmapArchive : public ::testing::Test {
  protected:
    void SetUp() override {
        BBitmap bitmap(BRect(0, 0, 3, 2), B_RGB16, true);
        for (int32 i = 0; i < bitmap.BitsLength(); ++i) {
            BytesOf(bitmap)[i] = static_cast<uint8>(i * 7);
        }
        ASSERT_EQ(bitmap.Archive(&mArchive), B_OK);
    }
    void ExpectInvalid() {
        const BBitmap bitmap(&mArchive);
        EXPECT_FALSE(bitmap.IsValid());
        EXPECT_NE(bitmap.InitCheck(), B_OK);
        EXPECT_EQ(bitmap.Bits(), nullptr);
    }

    BMessage mArchive;
};

TEST_F(BitmapArchive, BringsTheBitmapBack) {
    BBitmap bitmap(&mArchive);
    ASSERT_EQ(bitmap.InitCheck(), B_OK);
    EXPECT_EQ(bitmap.Bounds(), BRect(0, 0, 3, 2));
    EXPECT_EQ(bitmap.ColorSpace(), B_RGB16);
    EXPECT_EQ(bitmap.BytesPerRow(), 8);
    EXPECT_EQ(BytesOf(bitmap)[23], static_cast<uint8>(161));
    EXPECT_TRUE(bitmap.Lock()) << "it accepts views as before";
    bitmap.Unlock();
}

TEST_F(BitmapArchive, IsInstantiatedByItsClass) {
    const std::unique_ptr<BArchivable> object(BBitmap::Instantiate(&mArchive));
    auto* const bitmap = dynamic_cast<BBitmap*>(object.get());
    ASSERT_NE(bitmap, nullptr);
    EXPECT_TRUE(bitmap->IsValid());
}

TEST_F(BitmapArchive, OfACoverIsSmallEnoughForItsAttribute) {
    const BBitmap cover(BRect(0, 0, 64, 64), B_RGB16, true);
    BMessage archive;
    ASSERT_EQ(cover.Archive(&archive, true), B_OK);
    EXPECT_GT(archive.FlattenedSize(), 8580);
    EXPECT_LT(archive.FlattenedSize(), 9000);
}

TEST_F(BitmapArchive, WithoutItsDataIsDamaged) {
    mArchive.RemoveName("_data");
    ExpectInvalid();
}

TEST_F(BitmapArchive, WithoutItsFrameIsDamaged) {
    mArchive.RemoveName("_frame");
    ExpectInvalid();
}

TEST_F(BitmapArchive, OfAnUnknownSpaceIsDamaged) {
    for (const int32 space : {0, -1, 0x4000, 0x7FFFFFFF}) {
        mArchive.ReplaceInt32("_cspace", space);
        ExpectInvalid();
    }
    mArchive.ReplaceInt32("_cspace", B_RGB32);
    ExpectInvalid();
}

TEST_F(BitmapArchive, WithMoreOrLessDataThanItsFrameIsDamaged) {
    const std::vector<uint8> data(25, 1);
    for (const ssize_t size : {1, 23, 25}) {
        ASSERT_EQ(mArchive.RemoveName("_data"), B_OK);
        ASSERT_EQ(mArchive.AddData("_data", B_RAW_TYPE, data.data(), size), B_OK);
        ExpectInvalid();
    }
}

TEST_F(BitmapArchive, WithAnAbsurdFrameIsDamagedAndTakesNoMemory) {
    const float nan = std::numeric_limits<float>::quiet_NaN();
    for (const BRect& frame :
         {BRect(0, 0, 2147483648.0F, 2), BRect(0, 0, 3, 2147483648.0F), BRect(0, 0, nan, 2),
          BRect(0, 0, 3, nan), BRect(nan, nan, nan, nan), BRect(0, 0, -1, -1), BRect(0, 0, 1e38F, 1e38F),
          BRect(-1e38F, -1e38F, 1e38F, 1e38F), BRect(0, 0, 3, 32766)}) {
        mArchive.ReplaceRect("_frame", frame);
        ExpectInvalid();
    }
}

TEST_F(BitmapArchive, WithAbsurdRowsIsDamaged) {
    for (const int32 rowBytes : {0, -8, 7, 4, 12, 0x7FFFFFFF, static_cast<int32>(0x80000000)}) {
        mArchive.ReplaceInt32("_rowbytes", rowBytes);
        ExpectInvalid();
    }
}

TEST_F(BitmapArchive, OfNothingIsDamaged) {
    BMessage empty;
    EXPECT_FALSE(BBitmap(&empty).IsValid());
    EXPECT_FALSE(BBitmap(static_cast<BMessage*>(nullptr)).IsValid());
}

TEST(Bitmap, LocksRecursivelyForOneThread) {
    BBitmap bitmap(BRect(0, 0, 3, 3), B_RGB32, true);
    EXPECT_FALSE(bitmap.IsLocked());
    EXPECT_TRUE(bitmap.Lock());
    EXPECT_TRUE(bitmap.Lock());
    bitmap.Unlock();
    EXPECT_TRUE(bitmap.IsLocked());
    std::thread([&] { EXPECT_FALSE(bitmap.IsLocked()); }).join();
    bitmap.Unlock();
    EXPECT_FALSE(bitmap.IsLocked());
    BBitmap plain(BRect(0, 0, 3, 3), B_RGB32);
    EXPECT_FALSE(plain.Lock()) << "there is nothing to lock without views";
}

TEST(Bitmap, OwnsItsViewsUntilTheyAreRemoved) {
    struct CountedView : BView {
        explicit CountedView(int* count) : BView(BRect(0, 0, 3, 3), "counted", 0, 0), mCount(count) {
            ++*mCount;
        }
        ~CountedView() override { --*mCount; }
        int* mCount;
    };
    int count = 0;
    {
        BBitmap bitmap(BRect(0, 0, 3, 3), B_RGB32, true);
        auto* const first = new CountedView(&count);
        auto* const second = new CountedView(&count);
        bitmap.AddChild(first);
        bitmap.AddChild(second);
        bitmap.AddChild(second);
        EXPECT_EQ(bitmap.CountChildren(), 2);
        EXPECT_EQ(bitmap.ChildAt(1), second);
        EXPECT_EQ(bitmap.ChildAt(2), nullptr);
        EXPECT_EQ(bitmap.FindView("counted"), first);
        EXPECT_EQ(bitmap.FindView(BPoint(1, 1)), second);
        EXPECT_TRUE(bitmap.RemoveChild(first));
        EXPECT_FALSE(bitmap.RemoveChild(first));
        EXPECT_EQ(bitmap.CountChildren(), 1);
        delete first;
        auto* const third = new CountedView(&count);
        bitmap.AddChild(third);
        delete third;
        EXPECT_EQ(bitmap.CountChildren(), 1);
        EXPECT_EQ(count, 1);
    }
    EXPECT_EQ(count, 0);
}

} // namespace
