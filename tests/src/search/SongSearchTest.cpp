// What the find window lists for a text.
#include "FindWindowStage.h"

#include "indexing/FileIndexListItem.h"
#include "indexing/VolumeJobs.h"
#include "metadata/BrindleMetaData.h"
#include "search/SongQuery.h"
#include "support/captured_output.h"

#include <Query.h>
#include <String.h>
#include <TextView.h>
#include <Volume.h>

#include <algorithm>
#include <cstdlib>

namespace {

class SongSearch : public FindWindowStage {};

TEST_F(SongSearch, LooksIntoSongArtistAlbumAndNumberAndNothingElse) {
    Write(MakeFile("1.mp3"), "Audio:Songname", "has Needle");
    Write(MakeFile("2.mp3"), "Audio:Artist", "Needles");
    Write(MakeFile("3.mp3"), "Audio:Album", "The Needle");
    // Numbers have no index of their own; files are known by the other attributes.
    Write(MakeSong("4.mp3", "Haystack"), "Audio:TrackNo", "Needle");
    Write(MakeFile("5.mp3"), "Audio:Disc", "Needle");
    Write(MakeFile("6.mp3"), "Audio:Version", "Needle");
    MakeSong("Needle.mp3", "Haystack");
    Open();
    Names found = Find("Needle");
    std::sort(found.begin(), found.end());
    EXPECT_EQ(found, (Names{"1.mp3", "2.mp3", "3.mp3", "4.mp3"}));
}

TEST_F(SongSearch, AsksForSongArtistAlbumAndNumberInThisOrder) {
    BQuery query;
    PushSongsContaining(query, "a*b");
    BString condition;
    ASSERT_EQ(query.GetPredicate(&condition), B_OK);
    EXPECT_STREQ(condition.String(), "((Audio:Songname==\"*a\\*b*\")||((Audio:Artist==\"*a\\*b*\")||"
                                     "((Audio:Album==\"*a\\*b*\")||(Audio:TrackNo==\"*a\\*b*\"))))");
}

TEST_F(SongSearch, ASongIsListedOnceThoughAllOfItMatches) {
    const std::string path = MakeSong("a.mp3", "Echo");
    Write(path, "Audio:Artist", "Echo");
    Write(path, "Audio:Album", "Echo Echo");
    Open();
    EXPECT_EQ(Find("Echo"), Names{"a.mp3"});
}

TEST_F(SongSearch, TakesTheTextAsItIs) {
    const std::string names[] = {"plain song",    "Plain Song",    "with 'single'", "with \"double\"",
                                 "star * here",   "which ?",       "a [bracket]",   "back\\slash",
                                 "B\xC3\xBCrger", "bad \xFF byte", " blanks ",      "100% (live) && more"};
    for (size_t i = 0; i < std::size(names); ++i)
        MakeSong("song" + std::to_string(i) + ".mp3", names[i]);
    Open();
    const struct {
        const char* text;
        Names found;
    } cases[] = {
        {"plain song", {"song0.mp3"}},
        {"Plain", {"song1.mp3"}},
        {"'", {"song2.mp3"}},
        {"'single'", {"song2.mp3"}},
        {"\"", {"song3.mp3"}},
        {"\"double\"", {"song3.mp3"}},
        {"*", {"song4.mp3"}},
        {"s*r", {}},
        {"?", {"song5.mp3"}},
        {"plain?song", {}},
        {"[bracket]", {"song6.mp3"}},
        {"[a-z]", {}},
        {"\\", {"song7.mp3"}},
        {"k\\s", {"song7.mp3"}},
        {"\xC3\xBC", {"song8.mp3"}},
        {"\xBC", {"song8.mp3"}},
        {"\xFF", {"song9.mp3"}},
        {"d \xFF b", {"song9.mp3"}},
        {"\xFE", {}},
        {" blanks ", {"song10.mp3"}},
        {"  blanks", {}},
        {"(live) && m", {"song11.mp3"}},
        {"%", {"song11.mp3"}},
        {"nowhere", {}},
    };
    for (const auto& expected : cases)
        EXPECT_EQ(Find(expected.text), expected.found) << expected.text;
}

TEST_F(SongSearch, AnEmptyTextFindsWhateverHasOneOfTheFour) {
    MakeSong("1.mp3", "x");
    Write(MakeFile("2.mp3"), "Audio:Album", "");
    Write(MakeFile("3.mp3"), "Audio:Disc", "CD1");
    Write(Volume() + "/3.mp3", "Audio:TrackNo", "");
    Write(MakeFile("4.mp3"), "Audio:Disc", "CD1");
    MakeFile("5.mp3");
    Open();
    Names found = Find("");
    std::sort(found.begin(), found.end());
    EXPECT_EQ(found, (Names{"1.mp3", "2.mp3", "3.mp3"}));
}

TEST_F(SongSearch, GoesThroughTheVolumesInTheirOrder) {
    MakeSong("music.mp3", "Where");
    const std::string second = TestVolumes::Instance().Second() + "/second.mp3";
    std::ofstream(second) << "not music";
    Write(second, "Audio:Songname", "Where");
    Open();
    EXPECT_EQ(Find("Where"), (Names{"music.mp3", "second.mp3"}));
}

TEST_F(SongSearch, ASecondSearchTakesTheFirstOnesPlace) {
    MakeSong("1.mp3", "One");
    MakeSong("2.mp3", "Two");
    Open();
    EXPECT_EQ(Find("One"), Names{"1.mp3"});
    EXPECT_EQ(Find("Two"), Names{"2.mp3"});
    EXPECT_EQ(Find("Two"), Names{"2.mp3"});
    EXPECT_EQ(Find("Three"), Names{});
}

TEST_F(SongSearch, TheFieldsTextIsSearchedForWhenTheMessageComes) {
    MakeSong("1.mp3", "One");
    Open();
    WithWindow([&] { Field()->SetText("One"); });
    EXPECT_EQ(Rows(), Names{}) << "not as one types";
    Post(BMessage(700));
    EXPECT_EQ(Rows(), Names{"1.mp3"});
}

TEST_F(SongSearch, ReturnOrLeavingTheChangedFieldSearches) {
    MakeSong("1.mp3", "One");
    MakeSong("2.mp3", "Two");
    Open();
    const auto type = [&](const std::string& keys) {
        WithWindow([&] {
            for (const char key : keys)
                Field()->TextView()->KeyDown(&key, 1);
        });
        Settle();
    };
    type("One");
    EXPECT_EQ(Rows(), Names{}) << "not as one types";
    type("\n");
    EXPECT_EQ(Rows(), Names{"1.mp3"});
    // Return has selected the text, which is typed over.
    type("Two");
    EXPECT_EQ(Rows(), Names{"1.mp3"});
    WithWindow([&] { mWindow->List()->MakeFocus(); });
    Settle();
    EXPECT_EQ(Rows(), Names{"2.mp3"});
}

TEST_F(SongSearch, LeavingAnUnchangedFieldSearchesNothing) {
    MakeSong("1.mp3", "One");
    Open();
    ASSERT_EQ(Find("One"), Names{"1.mp3"});
    WithWindow([&] { mWindow->List()->MakeFocus(); });
    Settle();
    EXPECT_EQ(Rows(), Names{"1.mp3"}) << "the empty text is not searched for";
    MakeSong("2.mp3", "One too");
    WithWindow([&] { Field()->MakeFocus(); });
    WithWindow([&] { mWindow->List()->MakeFocus(); });
    Settle();
    EXPECT_EQ(Rows(), Names{"1.mp3"});
}

TEST_F(SongSearch, WhatChangesLaterIsSeenByTheNextSearchAlone) {
    const std::string path = MakeSong("1.mp3", "One");
    Open();
    ASSERT_EQ(Find("One"), Names{"1.mp3"});
    CapturedOutput output;
    MakeSong("2.mp3", "One too");
    Settle();
    EXPECT_EQ(Rows(), Names{"1.mp3"});
    EXPECT_EQ(output.text(), "") << "the query has ended before its target was set";
    Names found = Find("One");
    std::sort(found.begin(), found.end());
    EXPECT_EQ(found, (Names{"1.mp3", "2.mp3"}));
}

TEST_F(SongSearch, AHitThatVanishesBeforeItsRowIsMadeIsARowWithoutTexts) {
    const std::string path = MakeSong("gone.mp3", "Gone");
    entry_ref ref = RefOf(path);
    Open();
    std::filesystem::remove(path);
    WithWindow([&] {
        mWindow->AddToList(&ref);
        ASSERT_EQ(mWindow->List()->CountItems(), 1);
        auto* const row = static_cast<PlayListItem*>(mWindow->List()->ItemAt(0));
        EXPECT_STREQ(row->MetaData().mSongname, "");
        EXPECT_FALSE(row->MetaData().mIsValid);
    });
    EXPECT_EQ(Find("Gone"), Names{}) << "and is not found again";
}

TEST_F(SongSearch, AVolumeWithoutQueriesIsPassedOverThoughItAnswers) {
    MakeSong("1.mp3", "Here");
    const std::string before = getenv("XDG_DATA_HOME");
    setenv("XDG_DATA_HOME", "/proc/nowhere", 1);
    BVolume volume(RefOf(TestVolumes::Instance().Music() + "/1.mp3").device);
    EXPECT_TRUE(volume.KnowsAttr());
    EXPECT_FALSE(volume.KnowsQuery()) << "there is no place for an index";
    Open();
    EXPECT_EQ(Find("Here"), Names{});
    BQuery query;
    query.SetVolume(&volume);
    PushSongsContaining(query, "Here");
    EXPECT_EQ(query.Fetch(), B_OK);
    entry_ref ref;
    EXPECT_EQ(query.GetNextRef(&ref), B_OK);
    EXPECT_STREQ(ref.name, "1.mp3");
    EXPECT_EQ(query.GetNextRef(&ref), B_ENTRY_NOT_FOUND);
    setenv("XDG_DATA_HOME", before.c_str(), 1);
}

TEST_F(SongSearch, AVolumeWithoutAttributesHasNoSongs) {
    BVolume volume(RefOf(TestVolumes::Instance().WithoutAttributes() + "/net").device);
    EXPECT_FALSE(volume.KnowsQuery());
    BQuery query;
    query.SetVolume(&volume);
    PushSongsContaining(query, "");
    EXPECT_EQ(query.Fetch(), B_OK);
    entry_ref ref;
    EXPECT_EQ(query.GetNextRef(&ref), B_ENTRY_NOT_FOUND);
}

TEST_F(SongSearch, AVolumeThatHasGoneEndsSilently) {
    MakeSong("1.mp3", "Stays");
    const std::string& passing = TestVolumes::Instance().Passing();
    std::ofstream(passing + "/passing.mp3") << "not music";
    Write(passing + "/passing.mp3", "Audio:Songname", "Stays not");
    Open();
    ASSERT_EQ(Find("Stays"), (Names{"1.mp3", "passing.mp3"}));
    std::filesystem::remove_all(passing);
    CapturedOutput output;
    EXPECT_EQ(Find("Stays"), Names{"1.mp3"});
    EXPECT_EQ(output.text(), "");
    std::filesystem::create_directory(passing);
}

TEST_F(SongSearch, AVolumeThatComesLaterIsSearchedByTheNextWindow) {
    const std::string& passing = TestVolumes::Instance().Passing();
    std::filesystem::remove_all(passing);
    MakeSong("1.mp3", "Here");
    Open();
    std::filesystem::create_directory(passing);
    mApp->CreateIndices(MakeItem(passing)->Entry().volume.get());
    std::ofstream(passing + "/later.mp3") << "not music";
    Write(passing + "/later.mp3", "Audio:Songname", "Here later");
    EXPECT_EQ(Find("Here"), Names{"1.mp3"});

    mApp->FindWindowSlot().Close();
    Open();
    EXPECT_EQ(Find("Here"), (Names{"1.mp3", "later.mp3"}));
    std::filesystem::remove(passing + "/later.mp3");
}

TEST_F(SongSearch, WorksWhileAJobTagsTheSameVolume) {
    constexpr int kFiles = 400;
    for (int i = 0; i < kFiles; ++i)
        MakeFile(std::to_string(i % 20) + "/Artist - Tune " + std::to_string(i) + ".mp3");
    Open();
    const std::unique_ptr<FileIndexListItem> job = MakeItem(Volume());
    job->IndexAttributes();
    size_t most = 0;
    while (!job->IsDone()) {
        const size_t found = Find("Tune").size();
        EXPECT_GE(found, most) << "what was found once is found again";
        EXPECT_LE(found, static_cast<size_t>(kFiles));
        most = found;
    }
    EXPECT_EQ(Find("Tune").size(), static_cast<size_t>(kFiles));
}

} // namespace
