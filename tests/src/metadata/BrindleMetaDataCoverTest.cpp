// Taking a track's covers from an image file.
#include "SamplePictures.h"
#include "TrackVolume.h"
#include "metadata/BrindleMetaData.h"

#include "support/captured_output.h"

#include <Bitmap.h>
#include <CopyText.h>
#include <Message.h>
#include <Node.h>
#include <NodeInfo.h>

#include <memory>
#include <string>

namespace {

constexpr uint16 kRed = 0xF800;
constexpr uint16 kGreen = 0x07E0;
constexpr uint16 kBlue = 0x001F;

template <size_t kSize>
std::string Bytes(const unsigned char (&picture)[kSize]) {
    return std::string(reinterpret_cast<const char*>(picture), kSize);
}

uint16 PixelAt(const BBitmap& bitmap, int x, int y) {
    const auto* row = static_cast<const uint8*>(bitmap.Bits()) + y * bitmap.BytesPerRow();
    return static_cast<uint16>(row[2 * x] | row[2 * x + 1] << 8);
}

class TrackPicture : public TrackTest {
  protected:
    TrackPicture() {
        CopyText(mRecord.mSongname, "Song");
        mRecord.mRef = RefOf(mTrack);
    }
    // The small cover is nobody's: the test takes it away.
    ~TrackPicture() override {
        delete mRecord.mCover16x16bitmap;
        mRecord.mCover16x16bitmap = nullptr;
    }

    status_t SetFrom(const std::string& imagePath) {
        entry_ref ref = RefOf(imagePath);
        CapturedOutput output;
        const status_t result = mRecord.SetTrackPicture(&ref);
        mOutput = output.text();
        return result;
    }

    std::string mTrack = MakeFile("track.mp3");
    BrindleMetaData mRecord;
    std::string mOutput;
};

TEST_F(TrackPicture, GivesBothCoversInTheirInclusiveSizes) {
    EXPECT_EQ(SetFrom(MakeFile("cover.png", Bytes(kRedAndBluePng))), 0);

    EXPECT_EQ(mOutput, "Reading bitmap succeeded\n");
    ASSERT_NE(mRecord.mPicture, nullptr);
    EXPECT_EQ(mRecord.mPicture->Bounds(), BRect(0, 0, 129, 129));
    ASSERT_NE(mRecord.mCover64x64bitmap, nullptr);
    EXPECT_EQ(mRecord.mCover64x64bitmap->Bounds(), BRect(0, 0, 64, 64));
    EXPECT_EQ(mRecord.mCover64x64bitmap->ColorSpace(), B_RGB16);
    ASSERT_NE(mRecord.mCover16x16bitmap, nullptr);
    EXPECT_EQ(mRecord.mCover16x16bitmap->Bounds(), BRect(0, 0, 16, 16));
    EXPECT_EQ(mRecord.mCover16x16bitmap->ColorSpace(), B_RGB16);
}

TEST_F(TrackPicture, FillsTheCoversWithTheScaledPicture) {
    ASSERT_EQ(SetFrom(MakeFile("cover.png", Bytes(kRedAndBluePng))), 0);

    for (const int y : {0, 32, 64}) {
        EXPECT_EQ(PixelAt(*mRecord.mCover64x64bitmap, 0, y), kRed);
        EXPECT_EQ(PixelAt(*mRecord.mCover64x64bitmap, 30, y), kRed);
        EXPECT_EQ(PixelAt(*mRecord.mCover64x64bitmap, 34, y), kBlue);
        EXPECT_EQ(PixelAt(*mRecord.mCover64x64bitmap, 64, y), kBlue);
    }
    EXPECT_EQ(PixelAt(*mRecord.mCover16x16bitmap, 0, 8), kRed);
    EXPECT_EQ(PixelAt(*mRecord.mCover16x16bitmap, 16, 8), kBlue);
}

TEST_F(TrackPicture, ReadsJpeg) {
    ASSERT_EQ(SetFrom(MakeFile("cover.jpg", Bytes(kGreenJpeg))), 0);

    // The format loses a little: each channel may be off by a step or two.
    const uint16 pixel = PixelAt(*mRecord.mCover64x64bitmap, 32, 32);
    EXPECT_LE(pixel >> 11, 1);
    EXPECT_GE((pixel & kGreen) >> 5, 61);
    EXPECT_LE(pixel & kBlue, 1);
}

TEST_F(TrackPicture, WritesTheAttributesOfTheTrackAndNotOfTheImage) {
    const std::string image = MakeFile("cover.png", Bytes(kRedAndBluePng));

    ASSERT_EQ(SetFrom(image), 0);

    EXPECT_EQ(Text(mTrack, "Audio:Songname"), "Song");
    EXPECT_EQ(Text(mTrack, "Audio:Length"), " 0:00");
    EXPECT_TRUE(RawAttribute(mTrack, "Media:64x64CoverImage").has_value());
    EXPECT_TRUE(AttributeNames(image).empty());
}

TEST_F(TrackPicture, GivesTheTrackItsMiniIcon) {
    const entry_ref ref = RefOf(mTrack);
    BNode node(&ref);
    const BNodeInfo nodeInfo(&node);
    BBitmap icon(BRect(0, 0, 15, 15), B_CMAP8);
    ASSERT_NE(nodeInfo.GetIcon(&icon, B_MINI_ICON), B_OK);

    ASSERT_EQ(SetFrom(MakeFile("cover.png", Bytes(kRedAndBluePng))), 0);

    ASSERT_EQ(nodeInfo.GetIcon(&icon, B_MINI_ICON), B_OK);
    const auto* bits = static_cast<const uint8*>(icon.Bits());
    EXPECT_NE(bits[8 * icon.BytesPerRow()], bits[8 * icon.BytesPerRow() + 15]) << "red left, blue right";
}

TEST_F(TrackPicture, IsReadBackFromTheTrack) {
    ASSERT_EQ(SetFrom(MakeFile("cover.png", Bytes(kRedAndBluePng))), 0);
    entry_ref ref = RefOf(mTrack);

    const BrindleMetaData read(&ref);

    ASSERT_NE(read.mCover64x64bitmap, nullptr);
    ASSERT_TRUE(read.mCover64x64bitmap->IsValid());
    EXPECT_EQ(read.mCover64x64bitmap->Bounds(), BRect(0, 0, 64, 64));
    EXPECT_EQ(PixelAt(*read.mCover64x64bitmap, 0, 0), kRed);
    EXPECT_EQ(PixelAt(*read.mCover64x64bitmap, 64, 64), kBlue);
}

TEST_F(TrackPicture, TakesThePlaceOfTheOneBefore) {
    ASSERT_EQ(SetFrom(MakeFile("cover.png", Bytes(kRedAndBluePng))), 0);

    ASSERT_EQ(SetFrom(MakeFile("cover.jpg", Bytes(kGreenJpeg))), 0);

    EXPECT_EQ(mRecord.mPicture->Bounds(), BRect(0, 0, 15, 15));
    EXPECT_NE(PixelAt(*mRecord.mCover64x64bitmap, 0, 0), kRed);
}

TEST_F(TrackPicture, AFileThatIsNoImageChangesNothing) {
    mRecord.mCover64x64bitmap = new BBitmap(BRect(0, 0, 64, 64), B_RGB16, true, false);
    const BBitmap* before = mRecord.mCover64x64bitmap;

    EXPECT_EQ(SetFrom(MakeFile("cover.png", "no picture at all")), -1);

    EXPECT_EQ(mOutput, "Can't read bitmap\n");
    EXPECT_EQ(mRecord.mPicture, nullptr);
    EXPECT_EQ(mRecord.mCover64x64bitmap, before);
    EXPECT_EQ(mRecord.mCover16x16bitmap, nullptr);
    EXPECT_TRUE(AttributeNames(mTrack).empty());
}

TEST_F(TrackPicture, AFileThatIsNotThereIsNoImage) {
    EXPECT_EQ(SetFrom(Volume() + "/none.png"), -1);
    EXPECT_EQ(mOutput, "Can't read bitmap\n");
}

TEST_F(TrackPicture, ATruncatedImageDoesNoHarm) {
    const std::string whole = Bytes(kRedAndBluePng);
    for (const size_t length : {0u, 1u, 8u, 30u, 60u, 200u}) {
        const status_t result = SetFrom(MakeFile("cover.png", whole.substr(0, length)));
        EXPECT_EQ(mOutput, result == 0 ? "Reading bitmap succeeded\n" : "Can't read bitmap\n");
    }
}

TEST_F(TrackPicture, ScalingABitmapThatCannotBeDrawnGivesABlankOne) {
    BMessage empty;
    BBitmap invalid(&empty);

    const std::unique_ptr<BBitmap> made(mRecord.MakeBitmap(BRect(0, 0, 9, 4), &invalid));

    ASSERT_NE(made, nullptr);
    EXPECT_EQ(made->Bounds(), BRect(0, 0, 9, 4));
    EXPECT_EQ(made->ColorSpace(), B_RGB16);
}

} // namespace
