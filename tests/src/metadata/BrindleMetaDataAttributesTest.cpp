// The attributes of a track's file: what is written, byte for byte, and what is read from good and from bad
// ones.
#include "TrackVolume.h"
#include "metadata/BrindleMetaData.h"

#include "support/captured_output.h"

#include <Bitmap.h>
#include <CopyText.h>
#include <Message.h>
#include <Node.h>

#include <memory>
#include <string>
#include <vector>

using namespace std::string_literals;

namespace {

class BrindleMetaDataAttributes : public TrackTest {
  protected:
    static std::string Written(const BrindleMetaData& record, const std::string& attribute) {
        const std::string path = MakeFile("written.mp3");
        const entry_ref ref = RefOf(path);
        BNode node(&ref);
        const_cast<BrindleMetaData&>(record).WriteMetaAttributes(&node);
        return RawAttribute(path, attribute).value_or("(none)");
    }

    static std::string PlayTimeWrittenFor(int64 lengthUsec) {
        BrindleMetaData record;
        record.mLengthUsec = lengthUsec;
        return Written(record, "Audio:Length");
    }

    // A file with "Audio:Songname", and a record that is filled from its attributes.
    std::string mPath = MakeFile("track.mp3");
    BrindleMetaData mRecord;

    status_t Read() {
        const entry_ref ref = RefOf(mPath);
        BNode node(&ref);
        EXPECT_EQ(node.InitCheck(), B_OK);
        return mRecord.ReadMetaAttributes(&node);
    }
};

TEST_F(BrindleMetaDataAttributes, WritesSixTextsAndThePlayTimeWithTheirTerminators) {
    BrindleMetaData record;
    CopyText(record.mSongname, "Song");
    CopyText(record.mArtist, "Artist ");
    CopyText(record.mTrackNo, "01 ");
    CopyText(record.mDisc, "CD1 ");
    CopyText(record.mVersion, "Live");
    CopyText(record.mEncoder, "never written");
    record.mLengthUsec = 185000000;
    record.mBitrate = 128000;
    const entry_ref ref = RefOf(mPath);
    BNode node(&ref);

    record.WriteMetaAttributes(&node);

    EXPECT_EQ(RawAttribute(mPath, "Audio:Songname"), "CSTRSong\0"s);
    EXPECT_EQ(RawAttribute(mPath, "Audio:Artist"), "CSTRArtist \0"s);
    EXPECT_EQ(RawAttribute(mPath, "Audio:Album"), "CSTR\0"s);
    EXPECT_EQ(RawAttribute(mPath, "Audio:TrackNo"), "CSTR01 \0"s);
    EXPECT_EQ(RawAttribute(mPath, "Audio:Disc"), "CSTRCD1 \0"s);
    EXPECT_EQ(RawAttribute(mPath, "Audio:Version"), "CSTRLive\0"s);
    EXPECT_EQ(RawAttribute(mPath, "Audio:Length"), "CSTR 3:00\0"s);
    EXPECT_EQ(AttributeNames(mPath),
              (std::vector<std::string>{"Audio:Album", "Audio:Artist", "Audio:Disc", "Audio:Length",
                                        "Audio:Songname", "Audio:TrackNo", "Audio:Version"}));
}

TEST_F(BrindleMetaDataAttributes, WritesPlayTimesAsWholeMinutes) {
    EXPECT_EQ(PlayTimeWrittenFor(0), "CSTR 0:00\0"s);
    EXPECT_EQ(PlayTimeWrittenFor(59000000), "CSTR 0:00\0"s);
    EXPECT_EQ(PlayTimeWrittenFor(754000000), "CSTR12:00\0"s);
    EXPECT_EQ(PlayTimeWrittenFor(3599000000), "CSTR59:00\0"s);
    EXPECT_EQ(PlayTimeWrittenFor(3600000000), "CSTR  1: 0:00\0"s);
    EXPECT_EQ(PlayTimeWrittenFor(3725000000), "CSTR  1: 0:02\0"s);
}

TEST_F(BrindleMetaDataAttributes, WritingRemovesNothing) {
    SetText(mPath, "Media:Encoder", "Old encoder");
    SetText(mPath, "Audio:Bitrate", "128 kbit");
    SetRawAttribute(mPath, "Media:64x64CoverImage", "RAWTold cover");
    const entry_ref ref = RefOf(mPath);
    BNode node(&ref);

    mRecord.WriteMetaAttributes(&node);

    EXPECT_EQ(Text(mPath, "Media:Encoder"), "Old encoder");
    EXPECT_EQ(Text(mPath, "Audio:Bitrate"), "128 kbit");
    EXPECT_EQ(RawAttribute(mPath, "Media:64x64CoverImage"), "RAWTold cover");
}

TEST_F(BrindleMetaDataAttributes, WritingReplacesLongerTexts) {
    SetText(mPath, "Audio:Songname", "A much longer name than the new one");
    CopyText(mRecord.mSongname, "New");
    const entry_ref ref = RefOf(mPath);
    BNode node(&ref);

    mRecord.WriteMetaAttributes(&node);

    EXPECT_EQ(RawAttribute(mPath, "Audio:Songname"), "CSTRNew\0"s);
}

TEST_F(BrindleMetaDataAttributes, WritingToNoFileIsIgnored) {
    BNode node;
    mRecord.WriteMetaAttributes(&node);
}

TEST_F(BrindleMetaDataAttributes, ReadsEveryText) {
    SetText(mPath, "Audio:Songname", "Song");
    SetText(mPath, "Audio:Artist", "Artist");
    SetText(mPath, "Audio:Album", "Album");
    SetText(mPath, "Audio:TrackNo", "7");
    SetText(mPath, "Audio:Disc", "CD1");
    SetText(mPath, "Audio:Version", "Live");
    SetText(mPath, "Media:Encoder", "Encoder");

    EXPECT_EQ(Read(), 0);

    EXPECT_STREQ(mRecord.mSongname, "Song");
    EXPECT_STREQ(mRecord.mArtist, "Artist");
    EXPECT_STREQ(mRecord.mAlbum, "Album");
    EXPECT_STREQ(mRecord.mTrackNo, "7");
    EXPECT_STREQ(mRecord.mDisc, "CD1");
    EXPECT_STREQ(mRecord.mVersion, "Live");
    EXPECT_STREQ(mRecord.mEncoder, "Encoder");
}

TEST_F(BrindleMetaDataAttributes, AMissingTextLeavesItsField) {
    SetText(mPath, "Audio:Songname", "Song");
    CopyText(mRecord.mArtist, "As it was");

    EXPECT_EQ(Read(), 0);

    EXPECT_STREQ(mRecord.mArtist, "As it was");
}

TEST_F(BrindleMetaDataAttributes, APlayTimeIsNotReadBesideASongname) {
    SetText(mPath, "Audio:Songname", "Song");
    SetText(mPath, "Audio:Length", " 3:00");

    EXPECT_EQ(Read(), 0);

    EXPECT_EQ(mRecord.mLengthUsec, 0);
    EXPECT_STREQ(mRecord.mLengthText, "");
}

TEST_F(BrindleMetaDataAttributes, APlayTimeIsReadWithoutASongname) {
    SetText(mPath, "Audio:Length", "12:00");
    SetText(mPath, "Audio:Artist", "not read");

    EXPECT_EQ(Read(), -1);

    EXPECT_TRUE(mRecord.mIsValid);
    EXPECT_EQ(mRecord.mLengthUsec, 720000000);
    EXPECT_STREQ(mRecord.mLengthText, "12:00");
    EXPECT_STREQ(mRecord.mArtist, "");
}

TEST_F(BrindleMetaDataAttributes, AMissingPlayTimeIsAnEmptyOne) {
    CopyText(mRecord.mLengthText, "9:00");
    mRecord.mLengthUsec = 1;

    EXPECT_EQ(Read(), -1);

    EXPECT_EQ(mRecord.mLengthUsec, 0);
    EXPECT_STREQ(mRecord.mLengthText, "");
}

TEST_F(BrindleMetaDataAttributes, APlayTimeOfNoBytesChangesNothing) {
    SetRawAttribute(mPath, "Audio:Length", "CSTR");
    CopyText(mRecord.mLengthText, "9:00");
    mRecord.mLengthUsec = 1;

    EXPECT_EQ(Read(), -1);

    EXPECT_EQ(mRecord.mLengthUsec, 1);
    EXPECT_STREQ(mRecord.mLengthText, "9:00");
}

TEST_F(BrindleMetaDataAttributes, APlayTimeWithoutTerminatorEndsAfterTwentyBytes) {
    SetRawAttribute(mPath, "Audio:Length", "CSTR3:456789012345678901");

    EXPECT_EQ(Read(), -1);

    EXPECT_EQ(mRecord.mLengthUsec, 180000000);
    EXPECT_STREQ(mRecord.mLengthText, "3:456789012345678901");

    SetRawAttribute(mPath, "Audio:Length", "CSTR3:" + std::string(500, '9'));

    EXPECT_EQ(Read(), -1);

    EXPECT_EQ(mRecord.mLengthUsec, 180000000);
    EXPECT_EQ(mRecord.mLengthText, "3:" + std::string(18, '9'));
}

TEST_F(BrindleMetaDataAttributes, SecondsBehindThePlayTimesTerminatorCount) {
    SetRawAttribute(mPath, "Audio:Length", "CSTR3:00\0\0"s + "17\0"s);

    EXPECT_EQ(Read(), -1);

    EXPECT_EQ(mRecord.mLengthUsec, 197000000);
    EXPECT_STREQ(mRecord.mLengthText, "3:00");
}

TEST_F(BrindleMetaDataAttributes, PlayTimesWrapAroundAt32Bits) {
    SetText(mPath, "Audio:Length", "36:00");

    EXPECT_EQ(Read(), -1);

    EXPECT_EQ(mRecord.mLengthUsec, -2134967296);
}

TEST_F(BrindleMetaDataAttributes, AnySongnameCountsAsOneWhateverItHolds) {
    for (const std::string& value :
         {"CSTR"s, "CSTR\0"s, "LONG\1\2\3\4"s, "RAWT"s + std::string(3000, 'x'), "CSTRno end"s}) {
        SetRawAttribute(mPath, "Audio:Songname", value);
        mRecord.ClearData();
        EXPECT_EQ(Read(), 0) << value.substr(0, 8);
    }
}

TEST_F(BrindleMetaDataAttributes, UnterminatedTextsEndWithTheirBytes) {
    SetRawAttribute(mPath, "Audio:Songname", "CSTRSong");
    CopyText(mRecord.mSongname, "Something longer that was there");

    EXPECT_EQ(Read(), 0);

    EXPECT_STREQ(mRecord.mSongname, "Song");
}

TEST_F(BrindleMetaDataAttributes, LongTextsEndInsideTheirFields) {
    for (const size_t length : {253u, 254u, 255u, 256u, 1000u}) {
        const std::string text(length, 't');
        const std::string kept(std::min<size_t>(length, 254), 't');
        for (const std::string& value : {"CSTR" + text, "CSTR" + text + '\0'}) {
            for (const char* name : {"Audio:Songname", "Audio:Artist", "Audio:Version"})
                SetRawAttribute(mPath, name, value);
            mRecord.ClearData();

            EXPECT_EQ(Read(), 0);

            EXPECT_EQ(mRecord.mSongname, kept);
            EXPECT_EQ(mRecord.mArtist, kept);
            EXPECT_EQ(mRecord.mVersion, kept);
            EXPECT_STREQ(mRecord.mAlbum, "");
        }
    }
}

TEST_F(BrindleMetaDataAttributes, TextsEndAtTheirFirstTerminator) {
    SetRawAttribute(mPath, "Audio:Songname", "CSTRSong\0hidden\0"s);

    EXPECT_EQ(Read(), 0);

    EXPECT_STREQ(mRecord.mSongname, "Song");
}

TEST_F(BrindleMetaDataAttributes, AnEmptyTextEmptiesItsField) {
    SetRawAttribute(mPath, "Audio:Songname", "CSTR");
    SetRawAttribute(mPath, "Audio:Artist", "CSTR\0"s);
    CopyText(mRecord.mArtist, "As it was");

    EXPECT_EQ(Read(), 0);

    EXPECT_STREQ(mRecord.mSongname, "");
    EXPECT_STREQ(mRecord.mArtist, "");
}

TEST_F(BrindleMetaDataAttributes, ManyOtherAttributesDoNotMatter) {
    for (int i = 0; i < 30; ++i)
        SetText(mPath, "Other:" + std::to_string(i), "x");
    SetText(mPath, "Audio:Songname", "Song");

    EXPECT_EQ(Read(), 0);

    EXPECT_STREQ(mRecord.mSongname, "Song");
}

// From here on: the cover attribute.

TEST_F(BrindleMetaDataAttributes, WithoutACoverAttributeThereIsNoCover) {
    SetText(mPath, "Audio:Songname", "Song");
    mRecord.mCover64x64bitmap = new BBitmap(BRect(0, 0, 64, 64), B_RGB16, true, false);

    EXPECT_EQ(Read(), 0);

    EXPECT_EQ(mRecord.mCover64x64bitmap, nullptr);
}

TEST_F(BrindleMetaDataAttributes, AnEmptyCoverAttributeIsNoCover) {
    SetText(mPath, "Audio:Songname", "Song");
    SetRawAttribute(mPath, "Media:64x64CoverImage", "RAWT");

    EXPECT_EQ(Read(), 0);

    EXPECT_EQ(mRecord.mCover64x64bitmap, nullptr);
}

TEST_F(BrindleMetaDataAttributes, GarbageGivesAnInvalidCover) {
    SetText(mPath, "Audio:Songname", "Song");
    for (const std::string& value :
         {"x"s, std::string(3000, '\0'), std::string(3000, '\xFF'), "1FOB garbage"s}) {
        SetRawAttribute(mPath, "Media:64x64CoverImage", "RAWT" + value);

        EXPECT_EQ(Read(), 0);

        ASSERT_NE(mRecord.mCover64x64bitmap, nullptr);
        EXPECT_FALSE(mRecord.mCover64x64bitmap->IsValid());
    }
}

// Flattened messages inside one another, as docs/messages.md describes the form.
std::string NestedMessages(int depth) {
    const auto number = [](size_t value) {
        std::string bytes;
        for (int shift = 0; shift < 32; shift += 8)
            bytes += static_cast<char>(value >> shift & 0xFF);
        return bytes;
    };
    const std::string what = number(0);
    std::string form = "BKM\1" + number(16) + what + number(0);
    for (; depth > 1; --depth) {
        const std::string field = "GGSM\1\0\1\0"s + number(1) + number(form.size()) + "n" + form;
        form = "BKM\1" + number(16 + field.size()) + what + number(1) + field;
    }
    return form;
}

TEST_F(BrindleMetaDataAttributes, DeeplyNestedMessagesGiveAnInvalidCover) {
    BMessage message;
    ASSERT_EQ(message.Unflatten(NestedMessages(3).data(), NestedMessages(3).size()), B_OK);
    ASSERT_TRUE(message.HasMessage("n"));

    SetText(mPath, "Audio:Songname", "Song");
    const entry_ref ref = RefOf(mPath);
    BNode node(&ref);
    // 33 bytes a level: 300 levels are read whole, of 1000 the outer ones.
    for (const int depth : {3, 300, 1000}) {
        const std::string bytes = NestedMessages(depth);
        ASSERT_EQ(node.WriteAttr("Media:64x64CoverImage", B_RAW_TYPE, 0, bytes.data(), bytes.size()),
                  static_cast<ssize_t>(bytes.size()));

        EXPECT_EQ(Read(), 0);

        ASSERT_NE(mRecord.mCover64x64bitmap, nullptr);
        EXPECT_FALSE(mRecord.mCover64x64bitmap->IsValid());
    }
}

class BrindleMetaDataCoverAttribute : public BrindleMetaDataAttributes {
  protected:
    static std::unique_ptr<BBitmap> Painted(int side) {
        const auto edge = static_cast<float>(side - 1);
        auto bitmap = std::make_unique<BBitmap>(BRect(0, 0, edge, edge), B_RGB16, true, false);
        auto* bytes = static_cast<uint8*>(bitmap->Bits());
        for (int32 i = 0; i < bitmap->BitsLength(); ++i)
            bytes[i] = static_cast<uint8>(i * 7);
        return bitmap;
    }

    void WriteCover(int side) {
        const entry_ref ref = RefOf(mPath);
        BNode node(&ref);
        BrindleMetaData record;
        CopyText(record.mSongname, "Song");
        record.mCover64x64bitmap = Painted(side).release();
        record.WriteMetaAttributes(&node);
    }
};

TEST_F(BrindleMetaDataCoverAttribute, ComesBackPixelForPixel) {
    WriteCover(65);

    EXPECT_EQ(Read(), 0);

    ASSERT_NE(mRecord.mCover64x64bitmap, nullptr);
    ASSERT_TRUE(mRecord.mCover64x64bitmap->IsValid());
    EXPECT_EQ(mRecord.mCover64x64bitmap->Bounds(), BRect(0, 0, 64, 64));
    EXPECT_EQ(mRecord.mCover64x64bitmap->ColorSpace(), B_RGB16);
    const std::unique_ptr<BBitmap> painted = Painted(65);
    ASSERT_EQ(mRecord.mCover64x64bitmap->BitsLength(), painted->BitsLength());
    EXPECT_EQ(memcmp(mRecord.mCover64x64bitmap->Bits(), painted->Bits(),
                     static_cast<size_t>(painted->BitsLength())),
              0);
}

TEST_F(BrindleMetaDataCoverAttribute, FitsIntoWhatIsRead) {
    WriteCover(65);
    const entry_ref ref = RefOf(mPath);
    const BNode node(&ref);
    attr_info info;

    ASSERT_EQ(node.GetAttrInfo("Media:64x64CoverImage", &info), B_OK);

    EXPECT_EQ(info.type, static_cast<uint32>(B_RAW_TYPE));
    EXPECT_GT(info.size, 65 * 65 * 2);
    EXPECT_LE(info.size, 10000);
}

TEST_F(BrindleMetaDataCoverAttribute, IsCutAfterTenThousandBytesAndThenInvalid) {
    WriteCover(100);

    EXPECT_EQ(Read(), 0);

    ASSERT_NE(mRecord.mCover64x64bitmap, nullptr);
    EXPECT_FALSE(mRecord.mCover64x64bitmap->IsValid());
}

TEST_F(BrindleMetaDataCoverAttribute, IsNotWrittenWhenTheCoverCannotBeLocked) {
    mRecord.mCover64x64bitmap = new BBitmap(BRect(0, 0, 64, 64), B_RGB16, false, false);
    ASSERT_FALSE(mRecord.mCover64x64bitmap->Lock());
    const entry_ref ref = RefOf(mPath);
    BNode node(&ref);

    mRecord.WriteMetaAttributes(&node);

    EXPECT_EQ(RawAttribute(mPath, "Media:64x64CoverImage"), std::nullopt);
    EXPECT_EQ(Text(mPath, "Audio:Length"), " 0:00");
}

TEST_F(BrindleMetaDataCoverAttribute, TakesThePlaceOfTheCoverBefore) {
    WriteCover(65);
    mRecord.mCover64x64bitmap = Painted(3).release();

    EXPECT_EQ(Read(), 0);

    ASSERT_NE(mRecord.mCover64x64bitmap, nullptr);
    EXPECT_EQ(mRecord.mCover64x64bitmap->Bounds(), BRect(0, 0, 64, 64));
}

TEST_F(BrindleMetaDataCoverAttribute, AnInvalidSmallCoverIsSkippedWithAWord) {
    BMessage empty;
    const auto invalid = std::make_unique<BBitmap>(&empty);
    ASSERT_FALSE(invalid->IsValid());
    mRecord.mCover16x16bitmap = invalid.get();
    const entry_ref ref = RefOf(mPath);
    BNode node(&ref);

    CapturedOutput output;
    mRecord.WriteMetaAttributes(&node);
    mRecord.mCover16x16bitmap = nullptr;

    EXPECT_EQ(output.text(), "WriteAttr: mCover16x16bitmap isn't valid, skipped\n");
    EXPECT_EQ(Text(mPath, "Audio:Length"), " 0:00");
}

} // namespace
