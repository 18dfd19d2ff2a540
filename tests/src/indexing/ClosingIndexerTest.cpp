// How the indexer window goes, and what becomes of its jobs.
#include "IndexerWindow.h"

#include <filesystem>
#include <memory>

namespace {

TEST_F(IndexerWindow, TheCloseBoxStopsAllJobsAndAsksTheApplicationToQuit) {
    MakeFiles(4000);
    Open();
    Post(713);
    ASSERT_TRUE(WaitUntil([&] { return Row(kMusicRow)->FileCount() > 0; }));
    Select(kSecondRow);
    Post(710);

    mWindow->PostMessage(B_QUIT_REQUESTED);
    ASSERT_TRUE(WaitUntil([&] { return CountSentToApp(B_QUIT_REQUESTED) == 1; }));

    EXPECT_TRUE(mApp->IndexWindowSlot().IsEmpty());
    EXPECT_EQ(mApp->JobsWithoutWindow().Count(), 0);
    const int tagged = CountTagged();
    EXPECT_LT(tagged, 4000);
    snooze(50000);
    EXPECT_EQ(CountTagged(), tagged) << "nothing goes on";
}

TEST_F(IndexerWindow, TheCloseBoxWaitsForAnEraseJobToStop) {
    MakeFiles(4000);
    for (const auto& entry : std::filesystem::recursive_directory_iterator(Volume())) {
        if (entry.is_regular_file())
            SetText(entry.path(), "Audio:Songname", "Song");
    }
    Open();
    Post(711);
    ASSERT_TRUE(WaitUntil([&] { return Row(kMusicRow)->FileCount() > 0; }));

    mWindow->PostMessage(B_QUIT_REQUESTED);
    ASSERT_TRUE(WaitUntil([&] { return CountSentToApp(B_QUIT_REQUESTED) == 1; }));

    EXPECT_TRUE(mApp->IndexWindowSlot().IsEmpty());
    const int tagged = CountTagged();
    EXPECT_GT(tagged, 0);
    EXPECT_LT(tagged, 4000);
    snooze(50000);
    EXPECT_EQ(CountTagged(), tagged) << "nothing goes on";
}

TEST_F(IndexerWindow, ClosedByTheApplicationItsJobsGoOn) {
    MakeFiles(1000);
    Open();
    Post(713);
    ASSERT_TRUE(WaitUntil([&] { return Row(kMusicRow)->FileCount() > 0; }));

    mApp->IndexWindowSlot().Close();

    EXPECT_TRUE(mApp->IndexWindowSlot().IsEmpty());
    EXPECT_EQ(CountSentToApp(B_QUIT_REQUESTED), 0) << "the window was not asked";
    EXPECT_EQ(mApp->JobsWithoutWindow().Count(), 1);
    ASSERT_TRUE(WaitUntil([&] { return mApp->JobsWithoutWindow().Count() == 0; }));
    EXPECT_EQ(CountTagged(), 1000);
}

TEST_F(IndexerWindow, TheApplicationsEndStopsJobsThatGoOn) {
    MakeFiles(4000);
    Open();
    Post(713);
    ASSERT_TRUE(WaitUntil([&] { return Row(kMusicRow)->FileCount() > 0; }));
    mApp->IndexWindowSlot().Close();

    mApp.reset();

    EXPECT_LT(CountTagged(), 4000);
    mApp = std::make_unique<QuirnelApp>();
    brindle_app = mApp.get();
}

TEST_F(IndexerWindow, TheNextWindowKnowsNothingOfAJobThatGoesOn) {
    MakeFiles(2000);
    Open();
    Post(713);
    ASSERT_TRUE(WaitUntil([&] { return Row(kMusicRow)->FileCount() > 0; }));
    mApp->IndexWindowSlot().Close();

    Open();

    EXPECT_EQ(Row(kMusicRow)->State(), kJobNeverStarted);
    EXPECT_EQ(Enabled(), "strip index ");
}

} // namespace
