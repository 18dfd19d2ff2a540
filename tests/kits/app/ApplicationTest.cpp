// The application: its start, its messages and its end.
#include "MainLoop.h"
#include "SeenMessages.h"
#include "support/temporary_environment.h"

#include <Application.h>
#include <MessageQueue.h>

#include <algorithm>
#include <condition_variable>
#include <csignal>
#include <filesystem>
#include <gtest/gtest.h>
#include <mutex>
#include <string>
#include <string_view>
#include <thread>
#include <unistd.h>
#include <vector>

namespace {

constexpr const char* kSignature = "application/x-vnd.Test-Application";

// Writes down which hooks were called; 'quit' ends it from inside.
class TestApplication : public BApplication {
  public:
    TestApplication() : BApplication(kSignature) {}
    void ReadyToRun() override { Note("ready"); }
    void ArgvReceived(int32 argc, char** argv) override {
        // The test's own command line, when it has arguments.
        if (std::string_view(argv[0]).ends_with("test_kits_app"))
            return;
        for (int32 index = 0; index < argc; index++)
            Note(argv[index]);
        EXPECT_EQ(argv[argc], nullptr);
    }
    void RefsReceived(BMessage* message) override {
        entry_ref ref;
        EXPECT_EQ(message->FindRef("refs", &ref), B_OK);
        Note("refs");
    }
    void AppActivated(bool active) override { Note(active ? "active" : "inactive"); }
    void AboutRequested() override { Note("about"); }
    void SaveStateRequested() override { Note("save"); }
    void Pulse() override {
        Note("pulse");
        if (std::count(calls.begin(), calls.end(), "pulse") == 3)
            PostMessage(B_QUIT_REQUESTED);
    }
    bool QuitRequested() override {
        Note("quit requested");
        return mayQuit;
    }
    void MessageReceived(BMessage* message) override {
        thread = find_thread(nullptr);
        switch (message->what) {
        case 'work':
            Note("work");
            break;
        case 'term':
            kill(getpid(), SIGTERM);
            break;
        case 'quit':
            Note("quit");
            Quit();
            break;
        default:
            BApplication::MessageReceived(message);
        }
    }

    std::vector<std::string> calls;
    bool mayQuit = true;
    thread_id thread = 0;

  private:
    void Note(const char* call) { calls.push_back(call); }
};

// Waits in the main thread, as a window system's loop does.
class WaitingLoop : public MainLoop {
  public:
    bool Run() override {
        thread = find_thread(nullptr);
        std::unique_lock lock(mMutex);
        mChanged.wait(lock, [this] { return mQuit; });
        return true;
    }
    void Quit() override {
        std::lock_guard lock(mMutex);
        mQuit = true;
        mChanged.notify_all();
    }

    thread_id thread = 0;

  private:
    std::mutex mMutex;
    std::condition_variable mChanged;
    bool mQuit = false;
};

class LoopWithoutDisplay : public MainLoop {
  public:
    bool Run() override { return false; }
    void Quit() override {}
};

class ApplicationTest : public testing::Test {
  protected:
    void TearDown() override { set_main_loop(nullptr); }

    test::TemporaryEnvironment mEnvironment;
};

using Calls = std::vector<std::string>;

} // namespace

TEST_F(ApplicationTest, AnApplicationThatNeverRunsGoesAwayQuietly) {
    {
        TestApplication application;
        EXPECT_EQ(be_app, &application);
        EXPECT_TRUE(be_app_messenger.IsValid());
        EXPECT_EQ(application.InitCheck(), B_OK);
        EXPECT_TRUE(application.IsLaunching());
        EXPECT_STREQ(application.Signature(), "application/x-vnd.Test-Application");
        EXPECT_TRUE(application.HasSignature("application/x-vnd.TEST-application"));
        application.PostMessage('work');
    }
    EXPECT_EQ(be_app, nullptr);
    EXPECT_FALSE(be_app_messenger.IsValid());
}

TEST_F(ApplicationTest, MakingOneMakesTheSettingsDirectory) {
    mEnvironment.set("XDG_CONFIG_HOME", mEnvironment.root() + "/config");
    EXPECT_FALSE(std::filesystem::exists(mEnvironment.root() + "/config/bekits/settings"));
    TestApplication application;
    EXPECT_TRUE(std::filesystem::is_directory(mEnvironment.root() + "/config/bekits/settings"));
}

TEST_F(ApplicationTest, ReadyToRunComesBeforeMessagesPostedBeforeRun) {
    TestApplication application;
    ASSERT_EQ(application.PostMessage('work'), B_OK);
    ASSERT_EQ(be_app_messenger.SendMessage('work'), B_OK);
    ASSERT_EQ(application.PostMessage(B_QUIT_REQUESTED), B_OK);
    const thread_id thread = application.Run();
    EXPECT_GT(thread, 0);
    EXPECT_EQ(application.thread, thread);
    EXPECT_FALSE(application.IsLaunching());
    EXPECT_EQ(application.calls, (Calls{"ready", "work", "work", "quit requested"}));
}

TEST_F(ApplicationTest, QuitFromInsideEndsRunAfterTheMessageAtHand) {
    TestApplication application;
    application.PostMessage('quit');
    application.PostMessage('work');
    application.Run();
    EXPECT_EQ(application.calls, (Calls{"ready", "quit"}));
}

TEST_F(ApplicationTest, ARequestToEndTheProgramAsksTheApplication) {
    TestApplication application;
    application.PostMessage('term');
    application.Run();
    EXPECT_EQ(application.calls, (Calls{"ready", "quit requested"}));
}

TEST_F(ApplicationTest, QuitFromAnotherThreadEndsRunBehindTheQueuedMessages) {
    TestApplication application;
    std::thread other([&] {
        BMessage reply;
        EXPECT_EQ(be_app_messenger.SendMessage('none', &reply), B_OK);
        EXPECT_EQ(reply.what, uint32{B_MESSAGE_NOT_UNDERSTOOD});
        ASSERT_TRUE(application.Lock());
        application.PostMessage('work');
        application.Quit();
        application.Unlock();
    });
    application.Run();
    other.join();
    EXPECT_EQ(application.calls, (Calls{"ready", "work"}));
}

TEST_F(ApplicationTest, ARefusedQuitRequestLetsItRunOn) {
    TestApplication application;
    application.mayQuit = false;
    application.PostMessage(B_QUIT_REQUESTED);
    application.PostMessage('work');
    application.PostMessage('quit');
    application.Run();
    EXPECT_EQ(application.calls, (Calls{"ready", "quit requested", "work", "quit"}));
}

TEST_F(ApplicationTest, SystemMessagesCallTheirHooks) {
    TestApplication application;
    BMessage arguments(B_ARGV_RECEIVED);
    arguments.AddString("argv", "program");
    arguments.AddString("argv", "file");
    arguments.AddInt32("argc", 2);
    application.PostMessage(&arguments);
    BMessage refs(B_REFS_RECEIVED);
    const entry_ref ref(1, 2, "song.mp3");
    refs.AddRef("refs", &ref);
    application.PostMessage(&refs);
    BMessage activated(B_APP_ACTIVATED);
    activated.AddBool("active", true);
    application.PostMessage(&activated);
    application.PostMessage(B_ABOUT_REQUESTED);
    application.PostMessage(_SAVE_STATE_);
    application.PostMessage('quit');
    application.Run();
    EXPECT_EQ(application.calls,
              (Calls{"ready", "program", "file", "refs", "active", "about", "save", "quit"}));
}

TEST_F(ApplicationTest, PulseComesAgainAndAgainUntilTheEnd) {
    TestApplication application;
    application.SetPulseRate(1000);
    application.Run();
    EXPECT_GE(std::count(application.calls.begin(), application.calls.end(), "pulse"), 3);
}

TEST_F(ApplicationTest, WithoutAPulseRateThereIsNoPulseAlsoNoneThatWaited) {
    TestApplication application;
    application.SetPulseRate(1000);
    while (application.MessageQueue()->FindMessage(uint32{B_PULSE}) == nullptr)
        snooze(100);
    application.SetPulseRate(0);
    application.PostMessage('quit');
    application.Run();
    EXPECT_EQ(std::count(application.calls.begin(), application.calls.end(), "pulse"), 0);
}

TEST_F(ApplicationTest, RepliesThatNobodyAskedForGoToTheApplication) {
    TestApplication application;
    Seen seen;
    BLooper* looper = new CountingLooper(seen);
    const BMessenger messenger(looper);
    looper->Run();
    ASSERT_EQ(messenger.SendMessage('echo'), B_OK);
    QuitLooper(looper);
    const BMessage* reply = application.MessageQueue()->FindMessage(uint32{'echo'});
    ASSERT_NE(reply, nullptr);
    EXPECT_TRUE(reply->IsReply());
}

TEST_F(ApplicationTest, LoopersOfTheProgramAreCounted) {
    TestApplication application;
    const int32 before = application.CountLoopers();
    EXPECT_EQ(application.LooperAt(before - 1), &application);
    Seen seen;
    BLooper* looper = new CountingLooper(seen);
    EXPECT_EQ(application.CountLoopers(), before + 1);
    EXPECT_EQ(application.LooperAt(before), looper);
    EXPECT_EQ(application.LooperAt(before + 1), nullptr);
    EXPECT_EQ(application.LooperAt(-1), nullptr);
    looper->Quit();
    EXPECT_EQ(application.CountLoopers(), before);
}

TEST_F(ApplicationTest, TheMainLoopRunsInTheThreadThatCalledRun) {
    WaitingLoop loop;
    set_main_loop(&loop);
    TestApplication application;
    application.PostMessage('quit');
    const thread_id thread = application.Run();
    EXPECT_EQ(loop.thread, find_thread(nullptr));
    EXPECT_NE(loop.thread, thread);
    EXPECT_EQ(application.calls, (Calls{"ready", "quit"}));
}

TEST_F(ApplicationTest, ANewApplicationMayFollowOneThatIsGone) {
    for (int round = 0; round < 3; round++) {
        TestApplication application;
        application.PostMessage('quit');
        EXPECT_GT(application.Run(), 0);
    }
}

TEST_F(ApplicationTest, WithAStatusABadSignatureIsAnErrorAndNotTheEnd) {
    status_t status = B_OK;
    BApplication application("no signature", &status);
    EXPECT_EQ(status, B_BAD_VALUE);
    EXPECT_EQ(application.InitCheck(), B_BAD_VALUE);
    EXPECT_EQ(application.Run(), B_BAD_VALUE);
    EXPECT_EQ(be_app, nullptr);
}

TEST_F(ApplicationTest, ASecondApplicationIsRefusedAndLeavesTheFirstAlone) {
    TestApplication first;
    {
        status_t status = B_OK;
        BApplication second("application/x-vnd.Test-Second", &status);
        EXPECT_EQ(status, B_BAD_VALUE);
    }
    EXPECT_EQ(be_app, &first);
    EXPECT_TRUE(be_app_messenger.IsValid());
}

TEST_F(ApplicationTest, AnArchiveKeepsSignatureAndPulse) {
    BMessage archive;
    {
        TestApplication application;
        application.SetPulseRate(500000);
        ASSERT_EQ(application.BApplication::Archive(&archive), B_OK);
    }
    EXPECT_STREQ(archive.GetString("mime_sig"), "application/x-vnd.Test-Application");
    EXPECT_EQ(archive.GetInt64("_pulse", 0), 500000);
    BApplication again(&archive);
    EXPECT_STREQ(again.Signature(), "application/x-vnd.Test-Application");
    EXPECT_EQ(again.InitCheck(), B_OK);
}

using ApplicationDeathTest = ApplicationTest;

TEST_F(ApplicationDeathTest, ASecondApplicationStopsTheProgram) {
    GTEST_FLAG_SET(death_test_style, "threadsafe");
    EXPECT_EXIT(
        {
            TestApplication first;
            TestApplication second;
        },
        testing::ExitedWithCode(1), "there is an application already");
}

TEST_F(ApplicationDeathTest, ABadSignatureStopsTheProgram) {
    GTEST_FLAG_SET(death_test_style, "threadsafe");
    EXPECT_EXIT(BApplication("x-vnd.Test"), testing::ExitedWithCode(1), "\"x-vnd.Test\" is no signature");
}

TEST_F(ApplicationDeathTest, AMainLoopThatCannotWorkEndsTheProgram) {
    GTEST_FLAG_SET(death_test_style, "threadsafe");
    EXPECT_EXIT(
        {
            LoopWithoutDisplay loop;
            set_main_loop(&loop);
            TestApplication application;
            application.Run();
        },
        testing::ExitedWithCode(1), "");
}
