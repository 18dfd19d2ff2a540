// The program in a desktop's session: a log-out, one that is taken back, a session that is only saved.
#include "desktop/IndexerOnDesktop.h"
#include "support/session_manager.h"

#include <X11/SM/SM.h>

namespace {

class ProgramInSession : public Indexer {
  protected:
    void SetUp() override {
        Indexer::SetUp();
        ASSERT_TRUE(mScreen && mSession.works());
        StartWithFrame(211, 133, 450, 200);
        ASSERT_TRUE(Comes([&] { return mSession.clients() == 1; }));
        std::filesystem::remove(SettingsPath());
    }
    // The frame that is in the settings once they have been written.
    static BRect FrameThatIsSaved() {
        EXPECT_TRUE(Comes([] { return std::filesystem::exists(SettingsPath()); }));
        return SavedFrame();
    }

    // First the screen: its window manager would join the session.
    const bool mScreen = Desktop().works();
    test::SessionManager mSession;
};

TEST_F(ProgramInSession, LoggingOutSavesTheSettingsAndEndsTheProgramWithItsJobs) {
    MakeFiles(3000);
    Click(kIndex);
    ASSERT_TRUE(Comes([] { return CountTagged() > 0; }));
    ASSERT_TRUE(mSession.begin_log_out());
    EXPECT_EQ(FrameThatIsSaved(), BRect(211, 133, 661, 333)) << "saved before the session is gone";
    mSession.finish_log_out();
    ASSERT_TRUE(Comes([&] { return !mProgram->running(); }));
    const std::string said = WaitForEnd();
    EXPECT_TRUE(said.ends_with("Bye !\n")) << said;
    EXPECT_EQ(SavedFrame(), BRect(211, 133, 661, 333));
    EXPECT_TRUE(Comes([&] { return mSession.clients() == 0; }));
}

TEST_F(ProgramInSession, ALogOutThatIsTakenBackLetsItRunOn) {
    ASSERT_TRUE(mSession.begin_log_out());
    EXPECT_EQ(FrameThatIsSaved(), BRect(211, 133, 661, 333));
    mSession.cancel_log_out();
    usleep(500000);
    EXPECT_TRUE(mProgram->running());
    EXPECT_EQ(CountWindows(), 1);
    EXPECT_EQ(mSession.clients(), 1);
    // The next one is taken like the first.
    std::filesystem::remove(SettingsPath());
    ASSERT_TRUE(mSession.begin_log_out());
    EXPECT_EQ(FrameThatIsSaved(), BRect(211, 133, 661, 333));
    mSession.finish_log_out();
    EXPECT_TRUE(WaitForEnd().ends_with("Bye !\n"));
}

TEST_F(ProgramInSession, ASessionThatIsOnlySavedLetsItRunOn) {
    ASSERT_TRUE(mSession.save());
    EXPECT_EQ(FrameThatIsSaved(), BRect(211, 133, 661, 333));
    usleep(500000);
    EXPECT_TRUE(mProgram->running());
    EXPECT_EQ(CountWindows(), 1);
    EXPECT_TRUE(End().ends_with("Bye !\n"));
}

TEST_F(ProgramInSession, TheSessionIsAskedNotToStartItByItself) {
    ASSERT_TRUE(mSession.save());
    EXPECT_TRUE(Comes([&] { return mSession.restart_style() == SmRestartNever; }))
        << mSession.restart_style();
    End();
}

} // namespace
