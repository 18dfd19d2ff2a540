#include "metadata/NameParsing.h"

#include "NameTable.h"

#include <CopyText.h>

#include <gtest/gtest.h>

#include <clocale>
#include <cstring>
#include <string>

namespace {

// What an empty record would hold after both names were read, put together as the record does it.
TrackFields FieldsOf(const std::string& fileName, const std::string& folderName) {
    FileNameParts file;
    ParseFileName(fileName.c_str(), file);

    FolderNameParts folder;
    if (file.asksForFolder) {
        char name[kNameBufferSize];
        CopyText(name, folderName.c_str());
        ParseFolderName(name, folder);
    }
    if (file.hasArtist)
        CopyText(folder.artist, file.artist);
    else
        DropLeadingBlank(folder.artist);
    return {file.trackNo, file.disc, folder.artist, folder.album, file.songname};
}

class NameParsingTable : public testing::TestWithParam<NameCase> {};

TEST_P(NameParsingTable, GivesTheFieldsOfTheTable) {
    const NameCase& given = GetParam();
    EXPECT_EQ(FieldsOf(given.fileName, given.folderName), given.fields);
}

INSTANTIATE_TEST_SUITE_P(Names, NameParsingTable, testing::ValuesIn(kNameTable), NameOfCase);

class FolderParsingTable : public testing::TestWithParam<FolderCase> {};

TEST_P(FolderParsingTable, GivesArtistAndAlbumOfTheTable) {
    const FolderCase& given = GetParam();
    char name[kNameBufferSize];
    CopyText(name, given.folderName);
    FolderNameParts parts;

    ParseFolderName(name, parts);

    EXPECT_STREQ(parts.artist, given.artist);
    EXPECT_STREQ(parts.album, given.album);
}

INSTANTIATE_TEST_SUITE_P(Folders, FolderParsingTable, testing::ValuesIn(kFolderTable), NameOfFolderCase);

TEST(NameParsing, AsksForTheFolderOnlyForADashAtPositionsOneToFive) {
    const struct {
        const char* name;
        bool asksForFolder;
    } cases[] = {
        {"-x.mp3", false},       {"1-x.mp3", true},   {"12345-x.mp3", true},
        {"123456-x.mp3", false}, {"Song.mp3", false}, {"     -x.mp3", true},
        {"a]x.mp3", true},       {"CD1-x.mp3", true}, {"", false},
    };
    for (const auto& given : cases) {
        FileNameParts parts;
        ParseFileName(given.name, parts);
        EXPECT_EQ(parts.asksForFolder, given.asksForFolder) << given.name;
    }
}

TEST(NameParsing, CleansTheFolderNameInPlace) {
    char name[] = "Band_[Live]_A-B";
    FolderNameParts parts;

    ParseFolderName(name, parts);

    EXPECT_STREQ(name, "Band  Live- A-B");
}

TEST(NameParsing, KeepsALeafNameOfFullLengthWhole) {
    const std::string name(255, 'x');
    FileNameParts parts;

    ParseFileName(name.c_str(), parts);

    EXPECT_EQ(parts.songname, name);
}

TEST(NameParsing, CutsANameBeyondTheLengthOfALeafName) {
    const std::string name(300, 'x');
    FileNameParts parts;

    ParseFileName(name.c_str(), parts);

    EXPECT_EQ(parts.songname, std::string(255, 'x'));
}

TEST(NameParsing, ForgetsWhatThePartsHeldBefore) {
    FileNameParts parts;
    ParseFileName("CD1 - 02 - Artist - Song.mp3", parts);

    ParseFileName("Song.mp3", parts);

    EXPECT_STREQ(parts.disc, "");
    EXPECT_STREQ(parts.trackNo, "");
    EXPECT_STREQ(parts.artist, "");
    EXPECT_FALSE(parts.asksForFolder);
    EXPECT_FALSE(parts.hasArtist);
    EXPECT_STREQ(parts.songname, "Song");
}

TEST(NameParsing, FoldsEveryLetterButTheFirst) {
    char text[] = "THE BAND \xC3\x84 9Z";
    FoldLoudText(text);
    EXPECT_STREQ(text, "The band \xC3\x84 9z");

    char one[] = "A";
    FoldLoudText(one);
    EXPECT_STREQ(one, "A");

    char empty[] = {'\0', 'X', '\0'};
    FoldLoudText(empty);
    EXPECT_EQ(empty[1], 'X');
}

TEST(NameParsing, DropsOneLeadingBlankAndNoMore) {
    char text[] = "  x ";
    DropLeadingBlank(text);
    EXPECT_STREQ(text, " x ");

    char tab[] = "\tx";
    DropLeadingBlank(tab);
    EXPECT_STREQ(tab, "\tx");

    char empty[] = "";
    DropLeadingBlank(empty);
    EXPECT_STREQ(empty, "");
}

// 0xE9 is a lower-case letter of ISO-8859-1 and 0xC9 its upper-case form; neither counts as a letter here.
TEST(NameParsing, DoesNotFollowTheLocaleOfTheProcess) {
    const std::string before = setlocale(LC_ALL, nullptr);
    for (const char* locale : {"C", "C.UTF-8", "", "de_DE.ISO-8859-1", "tr_TR.UTF-8"}) {
        if (!setlocale(LC_ALL, locale))
            continue;
        EXPECT_EQ(FieldsOf("CAF\xE9 \xC9TE I.MP3", "any").songname, "Caf\xE9 \xC9te i") << locale;
    }
    setlocale(LC_ALL, before.c_str());
}

} // namespace
