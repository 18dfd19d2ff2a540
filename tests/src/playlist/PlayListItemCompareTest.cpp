// The order of songs in each column.
#include "playlist/PlayListItem.h"

#include "TrackVolume.h"
#include "metadata/BrindleMetaData.h"

#include <CopyText.h>

#include <memory>

namespace {

struct Song {
    const char* name = "";
    const char* artist = "";
    const char* album = "";
    const char* trackNo = "";
    int64 length = 0;
};

class SongOrder : public TrackTest {
  protected:
    std::unique_ptr<PlayListItem> Make(const Song& song) {
        entry_ref ref = RefOf(MakeFile("song.mp3"));
        auto item = std::make_unique<PlayListItem>(&ref);
        BrindleMetaData& data = item->MetaData();
        CopyText(data.mSongname, song.name);
        CopyText(data.mArtist, song.artist);
        CopyText(data.mAlbum, song.album);
        CopyText(data.mTrackNo, song.trackNo);
        data.mLengthUsec = song.length;
        return item;
    }
    // -1, 0 or 1.
    int Compare(const Song& first, const Song& second, long key) {
        const int order = PlayListItem::CompareFunc(Make(first).get(), Make(second).get(), key);
        return (order > 0) - (order < 0);
    }
};

TEST_F(SongOrder, IsThatOfTheColumn) {
    const struct {
        const char* what;
        long key;
        Song first;
        Song second;
        int order;
    } cases[] = {
        {"covers are all alike", 0, {.name = "a", .album = "a"}, {.name = "b", .album = "b"}, 0},
        {"album before number", 1, {.album = "A", .trackNo = "9"}, {.album = "B", .trackNo = "1"}, -1},
        {"number within the album", 1, {.album = "A", .trackNo = "1"}, {.album = "A", .trackNo = "2"}, -1},
        {"numbers are texts", 1, {.album = "A", .trackNo = "10"}, {.album = "A", .trackNo = "9"}, -1},
        {"names do not count", 1, {.name = "b", .album = "A"}, {.name = "a", .album = "A"}, 0},
        {"shorter", 2, {.length = 1000000}, {.length = 2000000}, -1},
        {"longer", 2, {.length = 2000000}, {.length = 1999999}, 1},
        {"equally long", 2, {.name = "a", .length = 7}, {.name = "b", .length = 7}, 0},
        {"35 minutes are more than none", 2, {.length = 2100000000}, {.length = 0}, 1},
        {"36 minutes wrap to less than none", 2, {.length = 2160000000}, {.length = 0}, -1},
        {"72 minutes are as long as their rest", 2, {.length = 4294967296 + 5}, {.length = 5}, 0},
        {"songs", 3, {.name = "Alpha", .artist = "Z"}, {.name = "Beta", .artist = "A"}, -1},
        {"capitals before small letters", 3, {.name = "Zulu"}, {.name = "alpha"}, -1},
        {"bytes above 127 behind letters", 3, {.name = "\xC3\x84rger"}, {.name = "zulu"}, 1},
        {"a beginning before the whole", 3, {.name = "Alpha"}, {.name = "Alpha 2"}, -1},
        {"nothing before something", 3, {.name = ""}, {.name = " "}, -1},
        {"the same song", 3, {.name = "Alpha", .album = "A"}, {.name = "Alpha", .album = "B"}, 0},
        {"artists", 4, {.name = "z", .artist = "A"}, {.name = "a", .artist = "B"}, -1},
        {"albums", 5, {.artist = "Z", .album = "A"}, {.artist = "A", .album = "B"}, -1},
    };
    for (const auto& expected : cases) {
        EXPECT_EQ(Compare(expected.first, expected.second, expected.key), expected.order) << expected.what;
        // Half the range away from each other, two lengths are both the lesser one; none of these is.
        EXPECT_EQ(Compare(expected.second, expected.first, expected.key), -expected.order) << expected.what;
    }
}

TEST_F(SongOrder, PlayTimesDifferByTheLowWordInMicroseconds) {
    const auto first = Make({.length = 0x1'2345'6789});
    const auto second = Make({.length = 0x7'0000'0001});
    EXPECT_EQ(PlayListItem::CompareFunc(first.get(), second.get(), 2), 0x23456788);
    EXPECT_EQ(PlayListItem::CompareFunc(second.get(), first.get(), 2), -0x23456788);
}

TEST_F(SongOrder, ALaterColumnAnswersItsOwnNumber) {
    EXPECT_EQ(PlayListItem::CompareFunc(Make({}).get(), Make({}).get(), 6), 6);
    EXPECT_EQ(PlayListItem::CompareFunc(Make({}).get(), Make({}).get(), 40), 40);
}

TEST_F(SongOrder, IsThatOfTheTextsOnTheFiles) {
    const auto make = [](const char* name, const char* song, const char* artist, const char* trackNo) {
        const std::string path = MakeFile(name);
        SetText(path, "Audio:Songname", song);
        SetText(path, "Audio:Artist", artist);
        SetText(path, "Audio:Album", "Album");
        SetText(path, "Audio:TrackNo", trackNo);
        entry_ref ref = RefOf(path);
        return std::make_unique<PlayListItem>(&ref);
    };
    const auto first = make("1.mp3", "Zulu", "a", "9");
    const auto second = make("2.mp3", "alpha", "b", "10");
    EXPECT_GT(PlayListItem::CompareFunc(first.get(), second.get(), 1), 0);
    EXPECT_EQ(PlayListItem::CompareFunc(first.get(), second.get(), 2), 0);
    EXPECT_LT(PlayListItem::CompareFunc(first.get(), second.get(), 3), 0);
    EXPECT_LT(PlayListItem::CompareFunc(first.get(), second.get(), 4), 0);
    EXPECT_EQ(PlayListItem::CompareFunc(first.get(), second.get(), 5), 0);
    // A row whose record was asked for compares like any other.
    CopyText(second->MetaData().mArtist, "A");
    EXPECT_GT(PlayListItem::CompareFunc(first.get(), second.get(), 4), 0);
}

} // namespace
