// Random names, read by the production rules and by the reference rules.
#include "ReferenceNameRules.h"
#include "metadata/NameParsing.h"

#include "support/random_seed.h"

#include <CopyText.h>

#include <gtest/gtest.h>

#include <random>
#include <string>
#include <string_view>

namespace {

constexpr int kNames = 20000;
constexpr size_t kLongestName = 255;

class NameMaker {
  public:
    explicit NameMaker(uint64_t seed) : mRandom(seed) {}

    std::string Make() {
        std::string name;
        const int pieces = 1 + Below(Below(12) == 0 ? 200 : 9);
        for (int i = 0; i < pieces; ++i)
            name += Piece();
        if (Below(3) == 0)
            name = Louder(name);
        name += Extension();
        if (name.size() > kLongestName)
            name.resize(kLongestName);
        return name.empty() ? "x" : name;
    }

  private:
    int Below(int limit) { return static_cast<int>(mRandom() % static_cast<uint64_t>(limit)); }

    std::string_view Piece() {
        static constexpr std::string_view kPieces[] = {
            "-", "-",    " ",  " ",  "_",  "[",        "]",        " - ",  "_-_",  "--",  "0",    "01",
            "7", "9",    "cd", "CD", "cD", "c",        "d",        "C",    "D",    ".",   ".mp3", "a",
            "Z", "Song", "+",  "\t", "\n", "\xC3\xA9", "\xC3\x89", "\xFF", "\x80", "THE", "mp",   "x-y",
        };
        return kPieces[Below(std::size(kPieces))];
    }

    std::string_view Extension() {
        static constexpr std::string_view kExtensions[] = {".mp3",  ".MP3", ".Mp3", "",
                                                           ".mpeg", ".",    ".a-",  ".x"};
        return kExtensions[Below(std::size(kExtensions))];
    }

    static std::string Louder(std::string name) {
        for (char& character : name) {
            if (character >= 'a' && character <= 'z')
                character = static_cast<char>(character - 'a' + 'A');
        }
        return name;
    }

    std::mt19937_64 mRandom;
};

ReferenceTrackFields ProductionFieldsOf(const std::string& fileName, const std::string& folderName) {
    FileNameParts file;
    ParseFileName(fileName.c_str(), file);

    char artist[255] = "";
    char album[255] = "";
    char songname[255] = "";
    if (file.asksForFolder) {
        char name[kNameBufferSize];
        CopyText(name, folderName.c_str());
        FolderNameParts folder;
        ParseFolderName(name, folder);
        CopyText(artist, folder.artist);
        CopyText(album, folder.album);
    }
    if (file.hasArtist)
        CopyText(artist, file.artist);
    else
        DropLeadingBlank(artist);
    CopyText(songname, file.songname);
    return {songname, artist, album, file.trackNo, file.disc};
}

std::string Shown(const ReferenceTrackFields& fields) {
    return "song '" + fields.songname + "' artist '" + fields.artist + "' album '" + fields.album +
           "' track number '" + fields.trackNo + "' disc '" + fields.disc + "'";
}

TEST(NameRulesProperty, RandomNamesGiveWhatTheReferenceRulesGive) {
    NameMaker names(RandomSeed());
    int withTrackNo = 0;
    int withDisc = 0;
    int withFolder = 0;
    for (int i = 0; i < kNames; ++i) {
        const std::string fileName = names.Make();
        const std::string folderName = names.Make();

        const ReferenceTrackFields expected = ReferenceFieldsOf(fileName, folderName);
        const ReferenceTrackFields got = ProductionFieldsOf(fileName, folderName);

        ASSERT_EQ(Shown(got), Shown(expected))
            << "file '" << fileName << "' in folder '" << folderName << "'";
        withTrackNo += !got.trackNo.empty();
        withDisc += !got.disc.empty();
        withFolder += !got.album.empty();
    }
    // The names are of use only when they reach the rules.
    EXPECT_GT(withTrackNo, kNames / 50);
    EXPECT_GT(withDisc, kNames / 200);
    EXPECT_GT(withFolder, kNames / 10);
}

TEST(NameRulesProperty, RandomFolderNamesGiveWhatTheReferenceRulesGive) {
    NameMaker names(RandomSeed());
    for (int i = 0; i < kNames; ++i) {
        const std::string folderName = names.Make();
        char name[kNameBufferSize];
        CopyText(name, folderName.c_str());
        FolderNameParts parts;
        ParseFolderName(name, parts);

        const ReferenceTrackFields expected = ReferenceFieldsOfFolder(folderName);

        ASSERT_EQ(std::string(parts.artist).substr(0, 254), expected.artist)
            << "folder '" << folderName << "'";
        ASSERT_EQ(std::string(parts.album).substr(0, 254), expected.album) << "folder '" << folderName << "'";
    }
}

} // namespace
