// Filling a record from a file: the order of the sources, and names on real files.
#include "NameTable.h"
#include "ReferenceNameRules.h"
#include "TrackVolume.h"
#include "metadata/BrindleMetaData.h"

#include "support/captured_output.h"

#include <Bitmap.h>
#include <CopyText.h>

#include <unistd.h>

#include <string>
#include <vector>

namespace {

TrackFields FieldsIn(const BrindleMetaData& record) {
    return {record.mTrackNo, record.mDisc, record.mArtist, record.mAlbum, record.mSongname};
}

class BrindleMetaDataFromFile : public TrackTest {
  protected:
    BrindleMetaData mRecord;

    status_t Read(const std::string& path) {
        entry_ref ref = RefOf(path);
        return mRecord.ReadMetaDataFromRef(&ref);
    }
};

TEST_F(BrindleMetaDataFromFile, TakesTheAttributesWhenThereIsASongname) {
    const std::string path = MakeFile("Artist - Album/01 - Song.mp3");
    SetText(path, "Audio:Songname", "Other song");
    SetText(path, "Audio:Artist", "Other artist");

    EXPECT_EQ(Read(path), 0);

    EXPECT_TRUE(mRecord.mIsValid);
    EXPECT_EQ(FieldsIn(mRecord), (TrackFields{"", "", "Other artist", "", "Other song"}));
    EXPECT_STREQ(mRecord.mFilename, "01 - Song.mp3");
    EXPECT_EQ(mRecord.mRef, RefOf(path));
    // And writes nothing of its own.
    EXPECT_EQ(AttributeNames(path), (std::vector<std::string>{"Audio:Artist", "Audio:Songname"}));
}

TEST_F(BrindleMetaDataFromFile, TagsAFileThatHasNoSongname) {
    const std::string path = MakeFile("Artist - Album/01 - Song.mp3");
    SetText(path, "Audio:Artist", "Overwritten");
    SetText(path, "Audio:Length", "12:00");

    EXPECT_EQ(Read(path), 0);

    EXPECT_TRUE(mRecord.mIsValid);
    EXPECT_EQ(FieldsIn(mRecord), (TrackFields{"01 ", "", "Artist ", "Album", "Song"}));
    EXPECT_EQ(mRecord.mLengthUsec, 720000000);
    EXPECT_EQ(Text(path, "Audio:Songname"), "Song");
    EXPECT_EQ(Text(path, "Audio:Artist"), "Artist ");
    EXPECT_EQ(Text(path, "Audio:Album"), "Album");
    EXPECT_EQ(Text(path, "Audio:TrackNo"), "01 ");
    EXPECT_EQ(Text(path, "Audio:Disc"), "");
    EXPECT_EQ(Text(path, "Audio:Version"), "");
    EXPECT_EQ(Text(path, "Audio:Length"), "12:00");
}

TEST_F(BrindleMetaDataFromFile, AFileThatIsNotThereIsInvalidWithItsNameAlone) {
    MakeFile("folder/other.mp3");
    entry_ref ref = RefOf(Volume() + "/folder/other.mp3");
    ref.set_name("01 - Gone.mp3");
    mRecord.mIsValid = true;

    EXPECT_EQ(mRecord.ReadMetaDataFromRef(&ref), -1);

    EXPECT_FALSE(mRecord.mIsValid);
    EXPECT_EQ(FieldsIn(mRecord), TrackFields());
    EXPECT_STREQ(mRecord.mFilename, "01 - Gone.mp3");
    EXPECT_EQ(mRecord.mRef, ref);
}

TEST_F(BrindleMetaDataFromFile, ARefWithoutANameIsInvalid) {
    entry_ref ref;

    EXPECT_EQ(mRecord.ReadMetaDataFromRef(&ref), -1);

    EXPECT_FALSE(mRecord.mIsValid);
    EXPECT_STREQ(mRecord.mFilename, "");
}

TEST_F(BrindleMetaDataFromFile, ForgetsTheFileBefore) {
    const std::string first = MakeFile("Band - Record/CD1 - 02 - First.mp3");
    const std::string second = MakeFile("Band - Record/Second.mp3");
    ASSERT_EQ(Read(first), 0);
    CopyText(mRecord.mVersion, "Live");
    mRecord.mBitrate = 128000;

    EXPECT_EQ(Read(second), 0);

    EXPECT_EQ(FieldsIn(mRecord), (TrackFields{"", "", "", "", "Second"}));
    EXPECT_STREQ(mRecord.mVersion, "");
    EXPECT_EQ(mRecord.mBitrate, 0);
    EXPECT_EQ(Text(second, "Audio:Disc"), "");
}

TEST_F(BrindleMetaDataFromFile, KeepsNoIconAndNoBitmapOfTheFileBefore) {
    const std::string path = MakeFile("Song.mp3");
    mRecord.mPicture = new BBitmap(BRect(0, 0, 9, 9), B_RGB32);
    mRecord.mCover64x64bitmap = new BBitmap(BRect(0, 0, 64, 64), B_RGB16);
    mRecord.mCover16x16bitmap = new BBitmap(BRect(0, 0, 15, 15), B_CMAP8);

    EXPECT_EQ(Read(path), 0);

    // The leak checker sees to it that they were freed.
    EXPECT_EQ(mRecord.mPicture, nullptr);
    EXPECT_EQ(mRecord.mCover64x64bitmap, nullptr);
    EXPECT_EQ(mRecord.mCover16x16bitmap, nullptr);
}

TEST_F(BrindleMetaDataFromFile, TheConstructorReadsTheFile) {
    const std::string path = MakeFile("Artist - Song.mp3");
    entry_ref ref = RefOf(path);

    const BrindleMetaData record(&ref);

    EXPECT_TRUE(record.mIsValid);
    EXPECT_EQ(FieldsIn(record), (TrackFields{"", "", "Artist ", "", "Song"}));
    EXPECT_EQ(Text(path, "Audio:Artist"), "Artist ");
}

TEST_F(BrindleMetaDataFromFile, AFileInTheVolumesRootTakesTheRootsName) {
    const std::string path = MakeFile("01 - Song.mp3");

    EXPECT_EQ(Read(path), 0);

    EXPECT_EQ(FieldsIn(mRecord), (TrackFields{"01 ", "", "Music", "Music", "Song"}));
}

TEST_F(BrindleMetaDataFromFile, AFolderIsReadUnderItsPresentName) {
    const std::string path = MakeFile("Old name/01 - Song.mp3");
    entry_ref ref = RefOf(path);
    std::filesystem::rename(Volume() + "/Old name", Volume() + "/Artist - Album");

    EXPECT_EQ(mRecord.ReadMetaDataFromRef(&ref), 0);

    EXPECT_EQ(FieldsIn(mRecord), (TrackFields{"01 ", "", "Artist ", "Album", "Song"}));
}

TEST_F(BrindleMetaDataFromFile, SaysNothing) {
    const std::string path = MakeFile("Artist - Song.mp3");

    CapturedOutput output;
    Read(path);
    Read(path);

    EXPECT_EQ(output.text(), "");
}

TEST_F(BrindleMetaDataFromFile, ASymbolicLinkIsNotFollowed) {
    const std::string target = MakeFile("target.mp3");
    const std::string link = Volume() + "/Artist - Song.mp3";
    ASSERT_EQ(symlink(target.c_str(), link.c_str()), 0);

    Read(link);

    EXPECT_TRUE(AttributeNames(target).empty());
}

TEST_F(BrindleMetaDataFromFile, NamesOf255BytesFitAndAreCutInTheirFields) {
    const std::string name = "01 - " + std::string(250, 'n');
    const std::string folder = std::string(255, 'f');
    const std::string path = MakeFile(folder + "/" + name);

    EXPECT_EQ(Read(path), 0);

    EXPECT_EQ(mRecord.mFilename, name);
    EXPECT_EQ(mRecord.mSongname, std::string(250, 'n'));
    EXPECT_EQ(mRecord.mArtist, std::string(254, 'f'));
    EXPECT_EQ(mRecord.mAlbum, std::string(254, 'f'));
    EXPECT_EQ(Text(path, "Audio:Album"), std::string(254, 'f'));
}

TEST_F(BrindleMetaDataFromFile, ThereAreNoTagsInsideFiles) {
    const std::string path = MakeFile("Song.mp3", "ID3\x03");
    entry_ref ref = RefOf(path);
    mRecord.mIsValid = true;

    EXPECT_EQ(mRecord.ReadMetaID3Tag(&ref), -1);

    EXPECT_FALSE(mRecord.mIsValid);
}

TEST_F(BrindleMetaDataFromFile, ReadingTheNameAloneKeepsWhatItDoesNotSet) {
    const std::string path = MakeFile("Song.mp3");
    entry_ref ref = RefOf(path);
    CopyText(mRecord.mArtist, " Kept artist");
    CopyText(mRecord.mVersion, "Kept version");

    EXPECT_EQ(mRecord.ReadMetaFilename(&ref), 0);

    EXPECT_TRUE(mRecord.mIsValid);
    EXPECT_STREQ(mRecord.mSongname, "Song");
    EXPECT_STREQ(mRecord.mArtist, "Kept artist");
    EXPECT_EQ(Text(path, "Audio:Version"), "Kept version");
}

TEST_F(BrindleMetaDataFromFile, MembersParseAFoldersNameAndFoldLoudTexts) {
    char folder[] = "SOME_BAND_-_SOME_RECORD";
    mRecord.ParseDirName(folder);
    EXPECT_STREQ(mRecord.mArtist, "Some band ");
    EXPECT_STREQ(mRecord.mAlbum, "Some record");

    char text[] = "THE BAND";
    mRecord.LessLoud(text);
    EXPECT_STREQ(text, "The band");
}

// Names that a file and a folder can really have.
bool CanBeOnDisk(const std::string& name) {
    return !name.empty() && name != "." && name != ".." && name.find('/') == std::string::npos;
}

TEST_F(BrindleMetaDataFromFile, EveryNameOfTheTableGivesItsFieldsAndAttributes) {
    int read = 0;
    for (const NameCase& given : kNameTable) {
        if (!CanBeOnDisk(given.fileName))
            continue;
        SCOPED_TRACE(given.behaviour);
        const std::string path = MakeFile(std::string(given.folderName) + "/" + given.fileName);

        ASSERT_EQ(Read(path), 0);

        EXPECT_EQ(FieldsIn(mRecord), given.fields);
        EXPECT_EQ(
            (TrackFields{Text(path, "Audio:TrackNo"), Text(path, "Audio:Disc"), Text(path, "Audio:Artist"),
                         Text(path, "Audio:Album"), Text(path, "Audio:Songname")}),
            given.fields);
        std::filesystem::remove_all(Volume() + "/" + given.folderName);
        ++read;
    }
    EXPECT_GT(read, 60);
}

TEST_F(BrindleMetaDataFromFile, EveryFolderOfTheTableGivesItsFields) {
    for (const FolderCase& given : kFolderTable) {
        if (!CanBeOnDisk(given.folderName))
            continue;
        SCOPED_TRACE(given.behaviour);
        const std::string path = MakeFile(std::string(given.folderName) + "/1-Song.mp3");

        ASSERT_EQ(Read(path), 0);

        // What the folder gave loses one more leading blank with the file's own fields.
        const std::string artist = given.artist;
        EXPECT_EQ(mRecord.mArtist, artist.starts_with(' ') ? artist.substr(1) : artist);
        EXPECT_STREQ(mRecord.mAlbum, given.album);
    }
}

} // namespace
