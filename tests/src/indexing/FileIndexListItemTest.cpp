#include "indexing/FileIndexListItem.h"

#include "VolumeJobs.h"

#include "support/captured_output.h"

#include <Bitmap.h>
#include <Node.h>

#include <sys/mount.h>
#include <unistd.h>

#include <cstring>
#include <memory>
#include <string>
#include <vector>

namespace {

class VolumeJob : public TrackTest {
  protected:
    std::unique_ptr<FileIndexListItem> mItem = MakeItem(Volume());
};

TEST_F(VolumeJob, ARowBeginsIdle) {
    EXPECT_FALSE(mItem->IsRunning());
    EXPECT_FALSE(mItem->IsDone());
    EXPECT_TRUE(mItem->IsSupported());
    EXPECT_EQ(mItem->Progress(), 0.0f);
    EXPECT_EQ(mItem->State(), 712);
    EXPECT_EQ(mItem->FileCount(), 0);
    EXPECT_EQ(mItem->Thread(), 0);
    EXPECT_EQ(StatusTextOf(*mItem), "");
    EXPECT_EQ(mItem->OutlineLevel(), 0u);
    EXPECT_TRUE(mItem->IsExpanded());
    const uint8 stripes[8] = {0xC7, 0x8F, 0x1F, 0x3E, 0x7C, 0xF8, 0xF1, 0xE3};
    EXPECT_EQ(memcmp(mItem->StripePattern().data, stripes, 8), 0);
}

TEST_F(VolumeJob, ARowShowsTheIconOfTheVolumesRoot) {
    ASSERT_NE(mItem->Icon(), nullptr);
    EXPECT_EQ(mItem->Icon()->Bounds(), BRect(0, 0, 15, 15));
    EXPECT_EQ(mItem->Icon()->ColorSpace(), B_CMAP8);
}

TEST_F(VolumeJob, AVolumeWithoutAttributesIsNotSupported) {
    const auto item = MakeItem(TestVolumes::Instance().WithoutAttributes());
    ASSERT_NE(item, nullptr);
    EXPECT_FALSE(item->IsSupported());
}

TEST_F(VolumeJob, IndexOfAnEmptyVolumeEndsWithNoFile) {
    RunToEnd(*mItem, &FileIndexListItem::IndexAttributes);

    EXPECT_FALSE(mItem->IsRunning());
    EXPECT_EQ(mItem->Progress(), 1.0f);
    EXPECT_EQ(mItem->State(), 713);
    EXPECT_EQ(StatusTextOf(*mItem), "Indexed 0 files");
}

TEST_F(VolumeJob, EraseOfAVolumeWithoutMP3FilesEndsWithNoFile) {
    MakeFile("notes.txt");

    RunToEnd(*mItem, &FileIndexListItem::EraseAttributes);

    EXPECT_FALSE(mItem->IsRunning());
    EXPECT_EQ(mItem->Progress(), 1.0f);
    EXPECT_EQ(mItem->State(), 711);
    EXPECT_EQ(StatusTextOf(*mItem), "Striped 0 files");
}

// A job that is over at once must still be seen as over.
TEST_F(VolumeJob, ShortJobsAreNeverLeftRunning) {
    for (int i = 0; i < 300; ++i) {
        RunToEnd(*mItem, i % 2 ? &FileIndexListItem::IndexAttributes : &FileIndexListItem::EraseAttributes);
        ASSERT_FALSE(mItem->IsRunning());
        mItem->ClearDone();
    }
}

TEST_F(VolumeJob, IndexTagsFilesByTheirExactEndings) {
    const std::string small = MakeFile("Artist - Album/01 - Song.mp3");
    const std::string capital = MakeFile("deep/er/Artist - Song.MP3");
    const std::string mixed = MakeFile("Artist - Song.Mp3");
    const std::string otherMixed = MakeFile("Artist - Song.mP3");
    const std::string text = MakeFile("Artist - Song.mp3.txt");
    const std::string bare = MakeFile(".mp3");

    RunToEnd(*mItem, &FileIndexListItem::IndexAttributes);

    EXPECT_EQ(mItem->FileCount(), 3);
    EXPECT_EQ(StatusTextOf(*mItem), "Indexed 3 files");
    EXPECT_EQ(Text(small, "Audio:Songname"), "Song");
    EXPECT_EQ(Text(small, "Audio:Album"), "Album");
    EXPECT_EQ(Text(capital, "Audio:Artist"), "Artist ");
    EXPECT_EQ(Text(bare, "Audio:Songname"), "");
    EXPECT_TRUE(AttributeNames(mixed).empty());
    EXPECT_TRUE(AttributeNames(otherMixed).empty());
    EXPECT_TRUE(AttributeNames(text).empty());
}

TEST_F(VolumeJob, IndexOnlyReadsFilesThatHaveASongname) {
    const std::string path = MakeFile("Artist - Album/01 - Song.mp3");
    SetText(path, "Audio:Songname", "Other");

    RunToEnd(*mItem, &FileIndexListItem::IndexAttributes);

    EXPECT_EQ(mItem->FileCount(), 1);
    EXPECT_EQ(AttributeNames(path), std::vector<std::string>{"Audio:Songname"});
    EXPECT_EQ(Text(path, "Audio:Songname"), "Other");
}

TEST_F(VolumeJob, NothingOfOneFileReachesTheNext) {
    MakeFile("Band - Record/CD1 - 07 - Title.mp3");
    const std::string plain = MakeFile("Other/Plain.mp3");

    RunToEnd(*mItem, &FileIndexListItem::IndexAttributes);

    EXPECT_EQ(Text(plain, "Audio:Artist"), "");
    EXPECT_EQ(Text(plain, "Audio:Album"), "");
    EXPECT_EQ(Text(plain, "Audio:TrackNo"), "");
    EXPECT_EQ(Text(plain, "Audio:Disc"), "");
}

TEST_F(VolumeJob, EraseRemovesTheMusicAttributesAndNoOthers) {
    const std::string path = MakeFile("Song.mp3");
    const std::string mixed = MakeFile("Song.Mp3");
    for (const char* name : {"Audio:Songname", "Audio:Artist", "Audio:Album", "Audio:TrackNo", "Audio:Disc",
                             "Audio:Version", "Audio:Length", "Audio:LengthUsec", "Audio:Samplerate",
                             "Video:Framerate", "Audio:Bitrate", "Audio:Channels", "Media:Encoder",
                             "Media:CoverImage", "Media:CoverColor", "Media:64x64CoverImage", "Audio:Other"})
        SetText(path, name, "x");
    SetText(mixed, "Audio:Songname", "x");

    RunToEnd(*mItem, &FileIndexListItem::EraseAttributes);

    EXPECT_EQ(StatusTextOf(*mItem), "Striped 1 files");
    EXPECT_EQ(AttributeNames(path), (std::vector<std::string>{"Audio:Other", "Media:64x64CoverImage"}));
    EXPECT_EQ(AttributeNames(mixed), std::vector<std::string>{"Audio:Songname"});
}

TEST_F(VolumeJob, RemovingFromAFileWithoutAttributesIsIgnored) {
    const std::string path = MakeFile("Song.mp3");
    const entry_ref ref = RefOf(path);
    BNode node(&ref);
    BNode none;

    mItem->RemoveAttributes(&node);
    mItem->RemoveAttributes(&none);

    EXPECT_TRUE(AttributeNames(path).empty());
}

TEST_F(VolumeJob, OneJobFollowsTheOther) {
    const std::string path = MakeFile("Artist - Song.mp3");
    RunToEnd(*mItem, &FileIndexListItem::IndexAttributes);
    EXPECT_EQ(Text(path, "Audio:Songname"), "Song");

    RunToEnd(*mItem, &FileIndexListItem::EraseAttributes);
    EXPECT_TRUE(AttributeNames(path).empty());

    RunToEnd(*mItem, &FileIndexListItem::IndexAttributes);
    EXPECT_EQ(Text(path, "Audio:Songname"), "Song");
    EXPECT_EQ(mItem->FileCount(), 1);
}

TEST_F(VolumeJob, JobsStayOnTheirVolume) {
    const std::string other = TestVolumes::Instance().Second() + "/Artist - Song.mp3";
    std::ofstream(other) << "not music";

    RunToEnd(*mItem, &FileIndexListItem::IndexAttributes);

    EXPECT_EQ(mItem->FileCount(), 0);
    EXPECT_TRUE(AttributeNames(other).empty());
}

TEST_F(VolumeJob, TwoVolumesWorkAtOnce) {
    const auto second = MakeItem(TestVolumes::Instance().Second());
    MakeFile("Artist - Song.mp3");
    std::ofstream(TestVolumes::Instance().Second() + "/Artist - Song.mp3") << "not music";

    mItem->IndexAttributes();
    second->IndexAttributes();

    EXPECT_TRUE(WaitUntil([&] { return mItem->IsDone() && second->IsDone(); }));
    EXPECT_EQ(mItem->FileCount(), 1);
    EXPECT_EQ(second->FileCount(), 1);
}

TEST_F(VolumeJob, LinksCountButAreNotFollowed) {
    const std::string target = MakeFile("target.txt");
    ASSERT_EQ(symlink(target.c_str(), (Volume() + "/Artist - Song.mp3").c_str()), 0);
    ASSERT_EQ(symlink("nowhere", (Volume() + "/dangling.mp3").c_str()), 0);
    ASSERT_EQ(symlink(".", (Volume() + "/loop.mp3").c_str()), 0);

    RunToEnd(*mItem, &FileIndexListItem::IndexAttributes);
    EXPECT_EQ(mItem->FileCount(), 3);
    EXPECT_TRUE(AttributeNames(target).empty());

    SetText(target, "Audio:Songname", "kept");
    RunToEnd(*mItem, &FileIndexListItem::EraseAttributes);
    EXPECT_EQ(mItem->FileCount(), 3);
    EXPECT_EQ(Text(target, "Audio:Songname"), "kept");
}

TEST_F(VolumeJob, UnusualNamesAreTagged) {
    const std::string longest = MakeFile(std::string(251, 'n') + ".mp3");
    const std::string line = MakeFile("Line\nbreak/Art\nist - So\nng.mp3");
    const std::string bytes = MakeFile("\xFF\xFE/\x80 and so on.mp3");

    RunToEnd(*mItem, &FileIndexListItem::IndexAttributes);

    EXPECT_EQ(mItem->FileCount(), 3);
    EXPECT_EQ(Text(longest, "Audio:Songname"), std::string(251, 'n'));
    EXPECT_EQ(Text(line, "Audio:Artist"), "Art\nist ");
    EXPECT_EQ(Text(line, "Audio:Songname"), "So\nng");
    EXPECT_EQ(Text(bytes, "Audio:Songname"), "\x80 and so on");
}

TEST_F(VolumeJob, JobsSayNothing) {
    MakeFile("Artist - Song.mp3");

    CapturedOutput output;
    RunToEnd(*mItem, &FileIndexListItem::IndexAttributes);
    RunToEnd(*mItem, &FileIndexListItem::EraseAttributes);

    EXPECT_EQ(output.text(), "");
}

TEST_F(VolumeJob, AFinishedJobsThreadIdIsKeptUntilItIsCancelled) {
    RunToEnd(*mItem, &FileIndexListItem::IndexAttributes);
    EXPECT_NE(mItem->Thread(), 0);

    mItem->CancelScan();

    EXPECT_EQ(mItem->Thread(), 0);
    EXPECT_TRUE(mItem->IsDone());
    EXPECT_FALSE(mItem->IsRunning());
    EXPECT_EQ(mItem->State(), 714);
    EXPECT_EQ(StatusTextOf(*mItem), "Cancelled.");
}

TEST_F(VolumeJob, CancellingAnIdleRowMarksIt) {
    mItem->CancelScan();

    EXPECT_EQ(mItem->State(), 714);
    EXPECT_FALSE(mItem->IsRunning());
    EXPECT_FALSE(mItem->IsDone());
    EXPECT_EQ(StatusTextOf(*mItem), "Cancelled.");

    mItem->CancelScan();
    EXPECT_EQ(StatusTextOf(*mItem), "Cancelled.");
}

TEST_F(VolumeJob, ARowCanWorkAgainAfterACancel) {
    MakeFile("Artist - Song.mp3");
    mItem->CancelScan();

    RunToEnd(*mItem, &FileIndexListItem::IndexAttributes);

    EXPECT_EQ(StatusTextOf(*mItem), "Indexed 1 files");
}

TEST_F(VolumeJob, TheStatusJobMovesTheProgressToItsEnd) {
    mItem->StatAttributes();
    EXPECT_TRUE(mItem->IsRunning());
    EXPECT_FALSE(mItem->IsDone());
    EXPECT_EQ(mItem->State(), 710);
    EXPECT_EQ(StatusTextOf(*mItem), "Getting status...");
    EXPECT_TRUE(WaitUntil([&] { return mItem->Progress() > 0.0f; }));
    EXPECT_LT(mItem->Progress(), 1.0f);

    EXPECT_TRUE(WaitUntil([&] { return mItem->IsDone(); }));

    EXPECT_FALSE(mItem->IsRunning());
    EXPECT_EQ(mItem->Progress(), 1.0f);
    EXPECT_EQ(StatusTextOf(*mItem), "Got status");
}

TEST_F(VolumeJob, TheStatusJobCanBeCancelled) {
    mItem->StatAttributes();
    EXPECT_TRUE(WaitUntil([&] { return mItem->Progress() > 0.0f; }));

    mItem->CancelScan();

    EXPECT_FALSE(mItem->IsRunning());
    EXPECT_EQ(mItem->Thread(), 0);
    EXPECT_LT(mItem->Progress(), 1.0f);
    EXPECT_EQ(StatusTextOf(*mItem), "Cancelled.");
    // It has stopped: nothing moves any more.
    const float progress = mItem->Progress();
    snooze(30000);
    EXPECT_EQ(mItem->Progress(), progress);
}

TEST_F(VolumeJob, JobsRunOnNamedThreadsOfLowPriority) {
    mItem->StatAttributes();
    thread_info info;
    ASSERT_EQ(get_thread_info(mItem->Thread(), &info), B_OK);
    EXPECT_STREQ(info.name, "attr_stat");
    EXPECT_EQ(info.priority, 5);
    mItem->CancelScan();
}

TEST_F(VolumeJob, DestroyingARowEndsItsJob) {
    mItem->StatAttributes();
    const thread_id thread = mItem->Thread();

    mItem.reset();

    EXPECT_NE(has_data(thread), 0);
}

TEST_F(VolumeJob, CancellingAnIndexStopsItWithinAFile) {
    constexpr int kFiles = 3000;
    for (int i = 0; i < kFiles; ++i)
        MakeFile(std::to_string(i % 10) + "/Artist - " + std::to_string(i) + ".mp3");

    mItem->IndexAttributes();
    EXPECT_TRUE(WaitUntil([&] { return mItem->FileCount() > 0; }));
    mItem->CancelScan();

    const int32 count = mItem->FileCount();
    EXPECT_GT(count, 0);
    EXPECT_LT(count, kFiles);
    EXPECT_FALSE(mItem->IsRunning());
    EXPECT_EQ(mItem->Progress(), -1.0f);
    int tagged = 0;
    for (int i = 0; i < kFiles; ++i) {
        const std::string path =
            Volume() + "/" + std::to_string(i % 10) + "/Artist - " + std::to_string(i) + ".mp3";
        tagged += RawAttribute(path, "Audio:Songname").has_value();
    }
    EXPECT_EQ(tagged, count);
}

} // namespace
