// The indexer window closed in every way at once, again and again, with jobs at work.
#include "indexing/FileIndexWindow.h"

#include "VolumeJobs.h"
#include "app/QuirnelApp.h"
#include "indexing/UnattendedJobs.h"

#include "support/random_seed.h"

#include <Messenger.h>

#include <random>
#include <thread>

namespace {

class ClosingRace : public TrackTest {
  protected:
    ClosingRace() {
        TestVolumes::Instance();
        for (int i = 0; i < 200; ++i)
            MakeFile(std::to_string(i % 5) + "/Artist - " + std::to_string(i) + ".mp3");
        mApp = std::make_unique<QuirnelApp>();
        brindle_app = mApp.get();
    }
    ~ClosingRace() override {
        mApp.reset();
        brindle_app = nullptr;
    }

    // A window with a job at work, or just about to be.
    BMessenger OpenAtWork() {
        auto* const window = new FileIndexWindow(nullptr);
        BMessenger messenger;
        mApp->IndexWindowSlot().UseLocked([&](BWindow*) { messenger = BMessenger(window); });
        messenger.SendMessage(mRandom() % 2 ? MSG_INDEX_START : MSG_INDEX_STRIP);
        snooze(static_cast<bigtime_t>(mRandom() % 4000));
        return messenger;
    }
    bool Gone(const BMessenger& window) {
        return WaitUntil([&] { return !window.IsValid(); });
    }

    std::mt19937_64 mRandom{RandomSeed()};
    std::unique_ptr<QuirnelApp> mApp;
};

constexpr int kRounds = 350;

TEST_F(ClosingRace, ByItsCloseBox) {
    for (int i = 0; i < kRounds; ++i) {
        const BMessenger window = OpenAtWork();
        window.SendMessage(B_QUIT_REQUESTED);
        ASSERT_TRUE(Gone(window));
        ASSERT_TRUE(mApp->IndexWindowSlot().IsEmpty());
        ASSERT_EQ(mApp->JobsWithoutWindow().Count(), 0);
    }
}

TEST_F(ClosingRace, ByTheApplication) {
    for (int i = 0; i < kRounds; ++i) {
        const BMessenger window = OpenAtWork();
        mApp->IndexWindowSlot().Close();
        ASSERT_FALSE(window.IsValid());
        ASSERT_TRUE(mApp->IndexWindowSlot().IsEmpty());
    }
    EXPECT_TRUE(WaitUntil([&] { return mApp->JobsWithoutWindow().Count() == 0; }));
}

TEST_F(ClosingRace, ByBothAtOnceWhileTheSettingsAreSaved) {
    for (int i = 0; i < kRounds; ++i) {
        const BMessenger window = OpenAtWork();
        std::thread closeBox([&] { window.SendMessage(B_QUIT_REQUESTED); });
        std::thread others([&] {
            for (const uint32 code : {MSG_INDEX_STOP, MSG_INDEX_START, MSG_INDEX_SELECTION})
                window.SendMessage(code);
            mApp->MaybeQuit();
        });
        BMessage settings;
        mApp->SavePreferences(&settings);
        if (mRandom() % 2)
            mApp->IndexWindowSlot().Activate();
        mApp->IndexWindowSlot().Close();
        ASSERT_TRUE(mApp->IndexWindowSlot().IsEmpty());
        closeBox.join();
        others.join();
        ASSERT_TRUE(Gone(window));
        ASSERT_TRUE(mApp->IndexWindowSlot().IsEmpty());
    }
}

} // namespace
