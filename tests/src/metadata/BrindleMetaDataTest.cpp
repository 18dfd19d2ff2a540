// The record itself, its debugging print and its message form.
#include "metadata/BrindleMetaData.h"

#include "support/captured_output.h"

#include <Bitmap.h>
#include <CopyText.h>
#include <Message.h>
#include <TypeConstants.h>

#include <gtest/gtest.h>

#include <cstring>
#include <memory>
#include <string>
#include <vector>

namespace {

void FillTexts(BrindleMetaData& record) {
    record.mIsValid = true;
    CopyText(record.mSongname, "Song");
    CopyText(record.mArtist, "Artist ");
    CopyText(record.mAlbum, "Album");
    CopyText(record.mTrackNo, "01 ");
    CopyText(record.mDisc, "CD1 ");
    CopyText(record.mVersion, "Live");
    CopyText(record.mEncoder, "Encoder");
    CopyText(record.mLengthText, " 3:00");
    CopyText(record.mFilename, "01 - Song.mp3");
    record.mLengthUsec = 185000000;
    record.mBitrate = 128000;
    record.mRef = entry_ref(1, 2, "01 - Song.mp3");
}

void ExpectEmpty(const BrindleMetaData& record) {
    EXPECT_FALSE(record.mIsValid);
    EXPECT_STREQ(record.mSongname, "");
    EXPECT_STREQ(record.mArtist, "");
    EXPECT_STREQ(record.mAlbum, "");
    EXPECT_STREQ(record.mTrackNo, "");
    EXPECT_STREQ(record.mDisc, "");
    EXPECT_STREQ(record.mVersion, "");
    EXPECT_STREQ(record.mEncoder, "");
    EXPECT_STREQ(record.mFilename, "");
    EXPECT_EQ(record.mLengthUsec, 0);
    for (const int32 word : record.mNumeric)
        EXPECT_EQ(word, 0);
    EXPECT_EQ(record.mPicture, nullptr);
    EXPECT_EQ(record.mCover64x64bitmap, nullptr);
    EXPECT_EQ(record.mCover16x16bitmap, nullptr);
}

// The names and types of a message's fields in their order.
std::vector<std::string> FieldsOf(const BMessage& message) {
    std::vector<std::string> fields;
    char* name = nullptr;
    type_code type = 0;
    for (int32 i = 0; message.GetInfo(B_ANY_TYPE, i, &name, &type) == B_OK; ++i) {
        const char letters[] = {static_cast<char>(type >> 24), static_cast<char>(type >> 16),
                                static_cast<char>(type >> 8), static_cast<char>(type), '\0'};
        fields.push_back(std::string(name) + " " + letters);
    }
    return fields;
}

// A bitmap that can be locked, painted in a pattern of its own.
BBitmap* MakeCover(int size) {
    const auto side = static_cast<float>(size);
    auto* bitmap = new BBitmap(BRect(0, 0, side, side), B_RGB16, true, false);
    auto* bytes = static_cast<uint8*>(bitmap->Bits());
    for (int32 i = 0; i < bitmap->BitsLength(); ++i)
        bytes[i] = static_cast<uint8>(i * 7 + size);
    return bitmap;
}

bool SamePixels(const BBitmap& one, const BBitmap& other) {
    return one.Bounds() == other.Bounds() && one.ColorSpace() == other.ColorSpace() &&
           one.BitsLength() == other.BitsLength() &&
           memcmp(one.Bits(), other.Bits(), static_cast<size_t>(one.BitsLength())) == 0;
}

TEST(BrindleMetaData, BeginsEmptyAndInvalid) {
    const BrindleMetaData record;

    ExpectEmpty(record);
    EXPECT_STREQ(record.mLengthText, "");
    EXPECT_EQ(record.mRef, entry_ref());
}

TEST(BrindleMetaData, ClearingEmptiesAllButTheRefAndTheLengthText) {
    BrindleMetaData record;
    FillTexts(record);
    for (int32& word : record.mNumeric)
        word = 7;
    record.mSpare.words[2] = 1;
    record.mSpare.byte = 1;
    record.mSpare.text[0] = 'x';
    record.mSpare.texts[4][0] = 'x';

    record.ClearData();

    ExpectEmpty(record);
    EXPECT_STREQ(record.mLengthText, " 3:00");
    EXPECT_EQ(record.mRef, entry_ref(1, 2, "01 - Song.mp3"));
    EXPECT_EQ(record.mSpare.words[2], 0);
    EXPECT_EQ(record.mSpare.byte, 0);
    EXPECT_EQ(record.mSpare.text[0], '\0');
    EXPECT_EQ(record.mSpare.texts[4][0], '\0');
}

TEST(BrindleMetaData, ClearingLeavesTheBitmapsToTheirOwner) {
    const std::unique_ptr<BBitmap> picture(MakeCover(100));
    const std::unique_ptr<BBitmap> cover(MakeCover(64));
    const std::unique_ptr<BBitmap> icon(MakeCover(16));
    BrindleMetaData record;
    record.mPicture = picture.get();
    record.mCover64x64bitmap = cover.get();
    record.mCover16x16bitmap = icon.get();

    record.ClearData();

    EXPECT_TRUE(picture->IsValid());
    EXPECT_TRUE(cover->IsValid());
    EXPECT_TRUE(icon->IsValid());
}

TEST(BrindleMetaData, TheBitrateIsTheFifthNumericWord) {
    BrindleMetaData record;
    record.mBitrate = 128000;
    EXPECT_EQ(record.mNumeric[4], 128000);
    EXPECT_EQ(&record.mNumeric[4], &record.mBitrate);
}

class CountedBitmap : public BBitmap {
  public:
    explicit CountedBitmap(int& deleted) : BBitmap(BRect(0, 0, 15, 15), B_RGB16), mDeleted(deleted) {}
    ~CountedBitmap() override { ++mDeleted; }

  private:
    int& mDeleted;
};

TEST(BrindleMetaData, DestroyingFreesThePictureAndTheLargeCoverButNotTheSmallOne) {
    int picturesDeleted = 0;
    int coversDeleted = 0;
    int iconsDeleted = 0;
    BBitmap* icon = new CountedBitmap(iconsDeleted);
    {
        BrindleMetaData record;
        record.mPicture = new CountedBitmap(picturesDeleted);
        record.mCover64x64bitmap = new CountedBitmap(coversDeleted);
        record.mCover16x16bitmap = icon;
    }

    EXPECT_EQ(picturesDeleted, 1);
    EXPECT_EQ(coversDeleted, 1);
    EXPECT_EQ(iconsDeleted, 0);
    EXPECT_TRUE(icon->IsValid());
    delete icon;
}

TEST(BrindleMetaData, PrintsItsFieldsByteForByte) {
    BrindleMetaData record;
    FillTexts(record);

    CapturedOutput output;
    const int result = record.PrintToStream();

    EXPECT_EQ(output.text(), "Metadata:\n"
                             "  valid:    '1'\n"
                             "  songname: 'Song'\n"
                             "  artist  : 'Artist '\n"
                             "  album   : 'Album'\n"
                             "  disc    : 'CD1 '\n"
                             "  no      : '01 '\n"
                             "  len usec: '185000000'\b"
                             "  filename: '01 - Song.mp3'\n");
    EXPECT_EQ(result, 28);
}

TEST(BrindleMetaData, PrintsTheLowHalfOfTheLengthAsASignedNumber) {
    BrindleMetaData record;
    record.mLengthUsec = 0x1234567890;

    CapturedOutput output;
    record.PrintToStream();

    EXPECT_EQ(output.text(), "Metadata:\n"
                             "  valid:    '0'\n"
                             "  songname: ''\n"
                             "  artist  : ''\n"
                             "  album   : ''\n"
                             "  disc    : ''\n"
                             "  no      : ''\n"
                             "  len usec: '878082192'\b"
                             "  filename: ''\n");
}

TEST(BrindleMetaDataMessage, HoldsEveryTextOfAClearedRecordAndNoCover) {
    const BrindleMetaData record;
    BMessage message;

    record.SaveIntoMessage(&message);

    EXPECT_EQ(FieldsOf(message),
              (std::vector<std::string>{"IsValid BOOL", "Audio:Songname CSTR", "Audio:Artist CSTR",
                                        "Audio:Album CSTR", "Audio:TrackNo CSTR", "Audio:Disc CSTR",
                                        "Audio:Version CSTR", "Audio:LengthUsec LLNG", "Media:Encoder CSTR",
                                        "filename CSTR"}));
    bool isValid = true;
    EXPECT_EQ(message.FindBool("IsValid", &isValid), B_OK);
    EXPECT_FALSE(isValid);
    const char* album = nullptr;
    EXPECT_EQ(message.FindString("Audio:Album", &album), B_OK);
    EXPECT_STREQ(album, "");
    int64 length = 1;
    EXPECT_EQ(message.FindInt64("Audio:LengthUsec", &length), B_OK);
    EXPECT_EQ(length, 0);
}

TEST(BrindleMetaDataMessage, HoldsCoversBeforeTheFilename) {
    BrindleMetaData record;
    record.mCover64x64bitmap = MakeCover(64);
    const std::unique_ptr<BBitmap> icon(MakeCover(16));
    record.mCover16x16bitmap = icon.get();
    BMessage message;

    record.SaveIntoMessage(&message);
    record.mCover16x16bitmap = nullptr;

    EXPECT_EQ(FieldsOf(message),
              (std::vector<std::string>{"IsValid BOOL", "Audio:Songname CSTR", "Audio:Artist CSTR",
                                        "Audio:Album CSTR", "Audio:TrackNo CSTR", "Audio:Disc CSTR",
                                        "Audio:Version CSTR", "Audio:LengthUsec LLNG", "Media:Encoder CSTR",
                                        "cover64x64 MSGG", "cover16x16 MSGG", "filename CSTR"}));
}

TEST(BrindleMetaDataMessage, HoldsAnEmptyMessageForACoverThatCannotBeLocked) {
    BrindleMetaData record;
    record.mCover64x64bitmap = new BBitmap(BRect(0, 0, 64, 64), B_RGB16, false, false);
    ASSERT_FALSE(record.mCover64x64bitmap->Lock());
    BMessage message;

    record.SaveIntoMessage(&message);

    BMessage cover;
    ASSERT_EQ(message.FindMessage("cover64x64", &cover), B_OK);
    EXPECT_TRUE(cover.IsEmpty());
    EXPECT_FALSE(message.HasMessage("cover16x16"));
}

TEST(BrindleMetaDataMessage, SavingIntoNoMessageDoesNothing) {
    const BrindleMetaData record;
    record.SaveIntoMessage(nullptr);
}

TEST(BrindleMetaDataMessage, MakesTheSameRecordAgain) {
    BrindleMetaData record;
    FillTexts(record);
    record.mCover64x64bitmap = MakeCover(64);
    const std::unique_ptr<BBitmap> icon(MakeCover(16));
    record.mCover16x16bitmap = icon.get();
    BMessage message;
    record.SaveIntoMessage(&message);
    record.mCover16x16bitmap = nullptr;

    CapturedOutput output;
    BrindleMetaData copy(&message);

    EXPECT_EQ(output.text(), "and is valid\nand is valid\n");
    EXPECT_TRUE(copy.mIsValid);
    EXPECT_STREQ(copy.mSongname, "Song");
    EXPECT_STREQ(copy.mArtist, "Artist ");
    EXPECT_STREQ(copy.mAlbum, "Album");
    EXPECT_STREQ(copy.mTrackNo, "01 ");
    EXPECT_STREQ(copy.mDisc, "CD1 ");
    EXPECT_STREQ(copy.mVersion, "Live");
    EXPECT_STREQ(copy.mEncoder, "Encoder");
    EXPECT_STREQ(copy.mFilename, "01 - Song.mp3");
    EXPECT_EQ(copy.mLengthUsec, 185000000);
    ASSERT_NE(copy.mCover64x64bitmap, nullptr);
    ASSERT_NE(copy.mCover16x16bitmap, nullptr);
    EXPECT_TRUE(SamePixels(*copy.mCover64x64bitmap, *record.mCover64x64bitmap));
    EXPECT_TRUE(SamePixels(*copy.mCover16x16bitmap, *icon));
    // These stay behind.
    EXPECT_EQ(copy.mRef, entry_ref());
    EXPECT_STREQ(copy.mLengthText, "");
    EXPECT_EQ(copy.mBitrate, 0);
    EXPECT_EQ(copy.mPicture, nullptr);
}

TEST(BrindleMetaDataMessage, AnEmptyOneGivesAnEmptyRecord) {
    BMessage message;

    CapturedOutput output;
    const BrindleMetaData record(&message);

    EXPECT_EQ(output.text(), "No cover64x64 found...\nNo cover64x64 found...\n");
    ExpectEmpty(record);
}

TEST(BrindleMetaDataMessage, NoneGivesAnEmptyRecordWithoutAWord) {
    CapturedOutput output;
    const BrindleMetaData record(static_cast<BMessage*>(nullptr));

    EXPECT_EQ(output.text(), "");
    ExpectEmpty(record);
}

TEST(BrindleMetaDataMessage, LongTextsAreCutToTheirFields) {
    BMessage message;
    message.AddString("Audio:Songname", std::string(1000, 's').c_str());
    message.AddString("Media:Encoder", std::string(255, 'e').c_str());
    message.AddString("filename", std::string(1000, 'f').c_str());

    CapturedOutput output;
    const BrindleMetaData record(&message);

    EXPECT_EQ(record.mSongname, std::string(254, 's'));
    EXPECT_EQ(record.mEncoder, std::string(254, 'e'));
    EXPECT_EQ(record.mFilename, std::string(255, 'f'));
}

TEST(BrindleMetaDataMessage, FieldsOfOtherTypesCountAsMissing) {
    BMessage message;
    message.AddInt32("Audio:Songname", 7);
    message.AddString("Audio:LengthUsec", "7");
    message.AddInt32("IsValid", 1);
    message.AddString("cover64x64", "no message");

    CapturedOutput output;
    const BrindleMetaData record(&message);

    EXPECT_EQ(output.text(), "No cover64x64 found...\nNo cover64x64 found...\n");
    ExpectEmpty(record);
}

TEST(BrindleMetaDataMessage, AnArchiveThatIsNoBitmapStillBecomesTheCover) {
    BMessage message;
    const BMessage noBitmap;
    message.AddMessage("cover64x64", &noBitmap);

    CapturedOutput output;
    const BrindleMetaData record(&message);

    EXPECT_EQ(output.text(), "No cover64x64 found...\n");
    ASSERT_NE(record.mCover64x64bitmap, nullptr);
    EXPECT_FALSE(record.mCover64x64bitmap->IsValid());
}

} // namespace
