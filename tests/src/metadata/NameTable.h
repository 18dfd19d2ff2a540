// File and folder names with the fields that they give, for the tests of the rules and of the record.
#pragma once

#include <gtest/gtest.h>

#include <ostream>
#include <string>

struct TrackFields {
    std::string trackNo;
    std::string disc;
    std::string artist;
    std::string album;
    std::string songname;

    bool operator==(const TrackFields&) const = default;
};

inline std::ostream& operator<<(std::ostream& stream, const TrackFields& fields) {
    return stream << "track number '" << fields.trackNo << "', disc '" << fields.disc << "', artist '"
                  << fields.artist << "', album '" << fields.album << "', song '" << fields.songname << "'";
}

struct NameCase {
    const char* behaviour;
    const char* fileName;
    const char* folderName;
    TrackFields fields;
};

inline std::ostream& operator<<(std::ostream& stream, const NameCase& given) {
    return stream << "file '" << given.fileName << "' in folder '" << given.folderName << "'";
}

inline const NameCase kNameTable[] = {
    // Artist and song.
    {"ArtistKeepsItsTrailingBlank", "Artist - Song.mp3", "any", {"", "", "Artist ", "", "Song"}},
    {"UnspacedDashSplitsWhenNoneIsSpaced", "Artist-Song.mp3", "any", {"", "", "Artist", "", "Song"}},
    {"UnspacedFirstDashIsSkippedForASpacedOne",
     "a-ha - Take on me.mp3",
     "Greatest Hits",
     {"", "", "a-ha ", "Greatest Hits", "Take on me"}},
    {"OnlyOneDashIsSkipped",
     "jean-luc-marie - Song.mp3",
     "Folder",
     {"", "", "jean-luc", "Folder", "marie - Song"}},
    {"SkippedToDashNeedsNoBlanks", "ab-cd-ef - gh.mp3", "Folder", {"", "", "ab-cd", "Folder", "ef - gh"}},
    {"DashBlankOnOneSideOnlyIsSkipped", "Artist- x - Song.mp3", "Folder", {"", "", "Artist- x ", "", "Song"}},
    {"LaterDashesStayInTheSong", "Artist - Song - Live.mp3", "any", {"", "", "Artist ", "", "Song - Live"}},
    {"OnlyOneBlankLeavesTheSong", "Artist -  Song.mp3", "any", {"", "", "Artist ", "", " Song"}},
    {"SongKeepsItsTrailingBlank", "Artist - Song .mp3", "any", {"", "", "Artist ", "", "Song "}},
    {"LeadingDashGivesAnEmptyArtist", "-Song.mp3", "Folder", {"", "", "", "", "Song"}},
    {"DoubleDashGivesASongThatBeginsWithADash", "Artist--Song.mp3", "any", {"", "", "Artist", "", "-Song"}},
    {"TrailingDashGivesAnEmptySong", "Artist-.mp3", "any", {"", "", "Artist", "", ""}},
    {"ThreeBlanksBeforeTheArtistLeaveNone", "   Artist - Song.mp3", "any", {"", "", "Artist ", "", "Song"}},
    {"FourBlanksBeforeTheArtistLeaveOne", "    Artist - Song.mp3", "any", {"", "", " Artist ", "", "Song"}},
    // No dash.
    {"NameWithoutDashIsTheSong", "Song.mp3", "Artist - Album", {"", "", "", "", "Song"}},
    {"TwoBlanksBeforeTheSongGo", "  Song.mp3", "any", {"", "", "", "", "Song"}},
    {"ThirdBlankBeforeTheSongStays", "   Song.mp3", "any", {"", "", "", "", " Song"}},
    {"LateDashReadsNoFolder", "Beatles - Help.mp3", "Artist - Album", {"", "", "Beatles ", "", "Help"}},
    {"DashAtPositionSixReadsNoFolder", "123456-Help.mp3", "Artist - Album", {"", "", "123456", "", "Help"}},
    // Track numbers.
    {"TrackNumberKeepsItsBlank", "01 - Song.mp3", "Artist - Album", {"01 ", "", "Artist ", "Album", "Song"}},
    {"UnspacedTrackNumber", "01-Song.mp3", "Artist - Album", {"01", "", "Artist ", "Album", "Song"}},
    {"TrackNumberBeforeArtistAndSong",
     "07 - Artist - Song.mp3",
     "Band - Album",
     {"07 ", "", "Artist ", "Album", "Song"}},
    {"DashAtPositionFiveStillEndsANumber",
     "12345-Song.mp3",
     "Band - Album",
     {"12345", "", "Band ", "Album", "Song"}},
    {"NumberPartMayHoldMoreThanANumber",
     "3rd -Song.mp3",
     "Band - Album",
     {"3rd ", "", "Band ", "Album", "Song"}},
    {"NumberPartMayBeginWithBlanksAndASign",
     "  +7-Song.mp3",
     "Band - Album",
     {"  +7", "", "Band ", "Album", "Song"}},
    {"ZeroIsNoTrackNumberButReadsTheFolder", "00 - X.mp3", "Band - Album", {"", "", "00 ", "Album", "X"}},
    {"WordIsNoTrackNumberButReadsTheFolder", "ab - X.mp3", "Band - Album", {"", "", "ab ", "Album", "X"}},
    {"TrackNumberBeforeAnUnspacedWord",
     "01 - a-ha.mp3",
     "Band - Album",
     {"01 ", "", "Band ", "Album", "a-ha"}},
    {"BlankNumberPartLosesItsBlank", " - Song.mp3", "Band - Album", {"", "", "Band ", "Album", "- Song"}},
    // Discs.
    {"DiscAndTrackNumber",
     "CD2 - 03 - Title.mp3",
     "Band - Record",
     {" 03 ", "CD2 ", "Band ", "Record", "Title"}},
    {"DiscInSmallLetters", "cd1-03-Title.mp3", "Band - Record", {"03", "cd1", "Band ", "Record", "Title"}},
    {"DiscInMixedLetters", "cD1-03-Title.mp3", "Band - Record", {"03", "cD1", "Band ", "Record", "Title"}},
    {"DiscWithoutNumber", "CD-Title.mp3", "Band - Record", {"", "CD", "Band ", "Record", "Title"}},
    {"DiscWithoutTrackNumber", "CD1 - Title.mp3", "Band - Record", {"", "CD1 ", "Band ", "Record", "Title"}},
    {"DiscAndLateSecondDash",
     "CD1 - Artist - Title.mp3",
     "Band - Record",
     {"", "CD1 ", "Artist ", "Record", "Title"}},
    {"SecondDiscIsNone", "CD1-CD2-Title.mp3", "Band - Record", {"", "CD1", "CD2", "Record", "Title"}},
    {"DiscAfterABlankIsNone", " CD1-Title.mp3", "Band - Record", {"", "", "CD1", "Record", "Title"}},
    {"DiscAndDashAtOnce", "CD1--Title.mp3", "Band - Record", {"", "CD1", "", "Record", "Title"}},
    {"LoneLetterIsNoDisc", "C-D.mp3", "Band - Record", {"", "", "C", "Record", "D"}},
    // Extensions.
    {"LongExtensionStays", "Song.mpeg", "any", {"", "", "", "", "Song.mpeg"}},
    {"ShortExtensionsGo", "Song.x", "any", {"", "", "", "", "Song"}},
    {"DotAtTheEndGoes", "Song.", "any", {"", "", "", "", "Song"}},
    {"OnlyTheLastExtensionGoes", "Song.old.mp3", "any", {"", "", "", "", "Song.old"}},
    {"DashInAnExtensionGoesWithIt", "Song.a-b", "any", {"", "", "", "", "Song"}},
    {"NameThatIsAnExtensionIsEmpty", ".mp3", "any", {"", "", "", "", ""}},
    {"DotFarFromTheEndStays", "Mr. Song", "any", {"", "", "", "", "Mr. Song"}},
    // Separators.
    {"UnderscoresAreBlanks", "Some_Band_-_Some_Song.mp3", "any", {"", "", "Some Band ", "", "Some Song"}},
    {"OpeningBracketIsADroppedBlank", "[Song.mp3", "any", {"", "", "", "", "Song"}},
    {"LeadingUnderscoreIsADroppedBlank", "_Song.mp3", "any", {"", "", "", "", "Song"}},
    {"ClosingBracketIsADash", "[Artist]Song.mp3", "any", {"", "", "Artist", "", "Song"}},
    {"BracketedNumber", "[01]Song.mp3", "Band - Album", {" 01", "", "Band ", "Album", "Song"}},
    {"BracketsMakeASpacedDash", "[01] [x_]_Song.mp3", "Band - Album", {" 01", "", "x ", "Album", "Song"}},
    // Capitals.
    {"LoudNameIsFolded", "SOME_BAND_-_SOME_SONG.MP3", "any", {"", "", "Some band ", "", "Some song"}},
    {"LoudNameWithSmallExtensionIsFolded", "SONG.mp3", "any", {"", "", "", "", "Song"}},
    {"LongExtensionTakesPartInTheTest", "SONG.mpeg", "any", {"", "", "", "", "SONG.mpeg"}},
    {"LoudLongExtensionIsFolded", "SONG.MPEG", "any", {"", "", "", "", "Song.mpeg"}},
    {"OneSmallLetterKeepsTheName", "SOMe BAND - SONG.MP3", "any", {"", "", "SOMe BAND ", "", "SONG"}},
    {"LoudFileInAQuietFolder", "01 - SONG.MP3", "Artist - Album", {"01 ", "", "Artist ", "Album", "Song"}},
    {"QuietFileInALoudFolder", "01 - Song.mp3", "ARTIST - ALBUM", {"01 ", "", "Artist ", "Album", "Song"}},
    {"BlankLeftBeforeALoudArtistCountsAsItsFirstLetter",
     "  \xC3\x84"
     "BC - X.MP3",
     "any",
     {"", "",
      "\xC3\x84"
      "bc ",
      "", "X"}},
    {"SecondBlankBeforeALoudArtistTakesItsCapital", "   BAND - X.MP3", "any", {"", "", "band ", "", "X"}},
    {"DigitsAreLoud", "99 - 77.MP3", "123", {"99 ", "", "123", "123", "77"}},
    // Folders.
    {"FolderWithoutDashIsArtistAndAlbum",
     "01 - Song.mp3",
     "Greatest Hits",
     {"01 ", "", "Greatest Hits", "Greatest Hits", "Song"}},
    {"FolderArtistLosesTwoBlanks", "01 - Song.mp3", "  Hits", {"01 ", "", "Hits", " Hits", "Song"}},
    {"LoudFolderWithoutDashKeepsItsArtist",
     "01 - Song.mp3",
     "GREATEST_HITS",
     {"01 ", "", "GREATEST_HITS", "Greatest hits", "Song"}},
    // Bytes.
    {"OtherBytesPass", "\xFF\xFE - \x80.mp3", "any", {"", "", "\xFF\xFE ", "any", "\x80"}},
    {"LineEndsPass", "Line\nBreak - So\nng.mp3", "any", {"", "", "Line\nBreak ", "", "So\nng"}},
    {"OneCharacter", "x", "any", {"", "", "", "", "x"}},
    {"OneDash", "-", "any", {"", "", "", "", ""}},
    {"TwoCharacters", " -", "any", {"", "", "", "any", ""}},
};

struct FolderCase {
    const char* behaviour;
    const char* folderName;
    const char* artist;
    const char* album;
};

inline std::ostream& operator<<(std::ostream& stream, const FolderCase& given) {
    return stream << "folder '" << given.folderName << "'";
}

inline const FolderCase kFolderTable[] = {
    {"ArtistKeepsItsTrailingBlank", "Artist - Album", "Artist ", "Album"},
    {"UnspacedDashSplits", "Artist-Album", "Artist", "Album"},
    {"NoDashGivesBoth", "Greatest Hits", "Greatest Hits", "Greatest Hits"},
    {"NoDashKeepsTheArtistAsItStands", "Greatest_Hits_[Live", "Greatest_Hits_[Live", "Greatest Hits  Live"},
    {"LoudNameIsFolded", "SOME_BAND_-_SOME_RECORD", "Some band ", "Some record"},
    {"LoudNameWithoutDashFoldsTheAlbumAlone", "THE_HITS", "THE_HITS", "The hits"},
    {"UnspacedFirstDashIsSkipped", "a-ha - Hits", "a-ha ", "Hits"},
    {"OnlyOneDashIsSkipped", "a-b-c - Hits", "a-b", "c - Hits"},
    {"SkippedDashWithNoOtherSplitsAtTheSpacedOne", "x- y - z", "x- y ", "z"},
    {"ClosingBracketIsADash", "[Band]Album", "Band", "Album"},
    {"LeadingBlanksOfTheArtist", "   Band - Album", " Band ", "Album"},
    {"LeadingBlankWithoutDash", " Hits", "Hits", "Hits"},
    {"LeadingUnderscoreWithoutDash", "_Hits", "_Hits", "Hits"},
    {"ExtensionsStay", "Band - Vol.1", "Band ", "Vol.1"},
    {"NumbersAreNoTrackNumbers", "01 - Album", "01 ", "Album"},
    {"DashAlone", "-", "", ""},
    {"Root", "/", "/", "/"},
    {"Empty", "", "", ""},
};

inline std::string NameOfCase(const testing::TestParamInfo<NameCase>& info) {
    return info.param.behaviour;
}

inline std::string NameOfFolderCase(const testing::TestParamInfo<FolderCase>& info) {
    return info.param.behaviour;
}
