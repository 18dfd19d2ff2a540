#include "metadata/PackedMetaData.h"

#include "metadata/BrindleMetaData.h"

#include <CopyText.h>

#include <gtest/gtest.h>
#include <string>

namespace {

TEST(PackedMetaData, HoldsEveryTextAndTheNumbers) {
    BrindleMetaData record;
    record.mRef = entry_ref(3, 4, "song.mp3");
    record.mIsValid = true;
    record.mBitrate = 128000;
    record.mLengthUsec = 185000000;
    CopyText(record.mSongname, "Song");
    CopyText(record.mArtist, "Artist ");
    CopyText(record.mAlbum, "Album");
    CopyText(record.mTrackNo, "01 ");
    CopyText(record.mDisc, "CD1 ");
    CopyText(record.mVersion, "live");
    CopyText(record.mLengthText, " 3:00");
    CopyText(record.mEncoder, "encoder");
    CopyText(record.mFilename, "song.mp3");
    const PackedMetaData packed(record);
    EXPECT_STREQ(packed.TextOf(PackedMetaData::kSongname), "Song");
    EXPECT_STREQ(packed.TextOf(PackedMetaData::kArtist), "Artist ");
    EXPECT_STREQ(packed.TextOf(PackedMetaData::kAlbum), "Album");
    EXPECT_STREQ(packed.TextOf(PackedMetaData::kTrackNo), "01 ");
    EXPECT_STREQ(packed.TextOf(PackedMetaData::kLengthText), " 3:00");
    EXPECT_EQ(packed.LengthUsec(), 185000000);
    EXPECT_EQ(packed.Ref(), entry_ref(3, 4, "song.mp3"));

    BrindleMetaData unpacked;
    packed.Unpack(unpacked);
    EXPECT_EQ(unpacked.mRef, entry_ref(3, 4, "song.mp3"));
    EXPECT_TRUE(unpacked.mIsValid);
    EXPECT_EQ(unpacked.mBitrate, 128000);
    EXPECT_EQ(unpacked.mLengthUsec, 185000000);
    EXPECT_STREQ(unpacked.mSongname, "Song");
    EXPECT_STREQ(unpacked.mArtist, "Artist ");
    EXPECT_STREQ(unpacked.mAlbum, "Album");
    EXPECT_STREQ(unpacked.mTrackNo, "01 ");
    EXPECT_STREQ(unpacked.mDisc, "CD1 ");
    EXPECT_STREQ(unpacked.mVersion, "live");
    EXPECT_STREQ(unpacked.mLengthText, " 3:00");
    EXPECT_STREQ(unpacked.mEncoder, "encoder");
    EXPECT_STREQ(unpacked.mFilename, "song.mp3");
    EXPECT_EQ(unpacked.mPicture, nullptr);
    EXPECT_EQ(unpacked.mCover64x64bitmap, nullptr);
    EXPECT_EQ(unpacked.mCover16x16bitmap, nullptr);
}

TEST(PackedMetaData, OfAnEmptyRecordIsEmpty) {
    const BrindleMetaData record;
    BrindleMetaData unpacked;
    PackedMetaData(record).Unpack(unpacked);
    EXPECT_FALSE(unpacked.mIsValid);
    EXPECT_EQ(unpacked.mRef, entry_ref());
    EXPECT_STREQ(unpacked.mSongname, "");
    EXPECT_STREQ(unpacked.mFilename, "");
}

TEST(PackedMetaData, HoldsTheLongestTexts) {
    const std::string longest(254, 'x');
    BrindleMetaData record;
    for (auto* const field : {&record.mSongname, &record.mArtist, &record.mAlbum, &record.mTrackNo,
                              &record.mDisc, &record.mVersion, &record.mLengthText, &record.mEncoder})
        CopyText(*field, longest.c_str());
    CopyText(record.mFilename, (longest + "y").c_str());
    BrindleMetaData unpacked;
    PackedMetaData(record).Unpack(unpacked);
    EXPECT_EQ(unpacked.mSongname, longest);
    EXPECT_EQ(unpacked.mEncoder, longest);
    EXPECT_EQ(unpacked.mFilename, longest + "y");
}

} // namespace
