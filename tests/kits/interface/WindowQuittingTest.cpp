// The end of an application whose windows have a say in it, and which of its windows is the active one.
#include "WindowWithApplication.h"

#include "PopUpHost.h"
#include "support/temporary_environment.h"

#include <gtest/gtest.h>

namespace {

class NamedWindow : public BWindow {
  public:
    NamedWindow(const char* name, Notes& notes, window_look look = B_TITLED_WINDOW_LOOK,
                window_feel feel = B_NORMAL_WINDOW_FEEL)
        : BWindow(BRect(100, 100, 199, 199), name, look, feel, 0), mNotes(notes) {}
    ~NamedWindow() override { mNotes.Add(std::string(Name()) + " gone"); }
    bool QuitRequested() override {
        if (locksApplication && be_app->Lock()) {
            be_app->Unlock();
        }
        mNotes.Add(std::string(Name()) + (agrees ? " agrees" : " refuses"));
        return agrees;
    }
    void WindowActivated(bool active) override {
        mNotes.Add(std::string(Name()) + (active ? " active" : " inactive"));
    }

    std::atomic<bool> agrees{true};
    bool locksApplication = false;

  private:
    Notes& mNotes;
};

class WindowQuittingTest : public testing::Test {
  protected:
    NamedWindow* Open(const char* name) {
        auto* const window = new NamedWindow(name, mNotes);
        window->Show();
        return window;
    }
    static void Close(BWindow* window) {
        ASSERT_TRUE(window->Lock());
        window->Quit();
    }
    std::vector<std::string> HeardOfQuitting() {
        std::vector<std::string> lines = mNotes.Take();
        std::erase_if(lines, [](const std::string& line) { return line.ends_with("active"); });
        return lines;
    }

    test::TemporaryEnvironment mEnvironment;
    Notes mNotes;
};

} // namespace

TEST_F(WindowQuittingTest, EveryWindowIsAskedTheLastOneFirst) {
    RunApplication([this] {
        Open("first");
        Open("second");
    });
    EXPECT_EQ(HeardOfQuitting(),
              (std::vector<std::string>{"second agrees", "second gone", "first agrees", "first gone"}));
}

TEST_F(WindowQuittingTest, AWindowThatRefusesKeepsTheApplicationRunning) {
    RunApplication([this] {
        Open("first");
        NamedWindow* const second = Open("second");
        Open("third");
        second->agrees = false;
        BMessage reply;
        ASSERT_EQ(be_app_messenger.SendMessage(B_QUIT_REQUESTED, &reply), B_OK);
        EXPECT_FALSE(reply.GetBool("result", true));
        EXPECT_EQ(HeardOfQuitting(),
                  (std::vector<std::string>{"third agrees", "third gone", "second refuses"}));
        second->agrees = true;
    });
    EXPECT_EQ(HeardOfQuitting(),
              (std::vector<std::string>{"second agrees", "second gone", "first agrees", "first gone"}));
}

TEST_F(WindowQuittingTest, AWindowMayLockTheApplicationWhileItIsAsked) {
    RunApplication([this] { Open("only")->locksApplication = true; });
    EXPECT_EQ(HeardOfQuitting(), (std::vector<std::string>{"only agrees", "only gone"}));
}

TEST_F(WindowQuittingTest, AnApplicationThatDecidesItselfAsksNobody) {
    class Decided : public BApplication {
      public:
        Decided() : BApplication("application/x-vnd.Test-Decided") {}
        bool QuitRequested() override { return true; }
    } application;
    std::thread worker([&] {
        Open("left open");
        application.PostMessage(B_QUIT_REQUESTED);
    });
    application.Run();
    worker.join();
    EXPECT_EQ(HeardOfQuitting(), (std::vector<std::string>{"left open gone"}));
}

// The display of this test gives each window the focus that is shown, pop-ups too.
TEST_F(WindowQuittingTest, TheActiveWindowHearsOfAnotherOneAlsoWhenAPopUpHadTheFocusBetween) {
    RunApplication([this] {
        NamedWindow* const first = Open("first");
        ASSERT_TRUE(mNotes.WaitFor("first active"));
        auto* const popUp = new NamedWindow("pop-up", mNotes, B_NO_BORDER_WINDOW_LOOK, kPopUpWindowFeel);
        popUp->Show();
        ASSERT_TRUE(popUp->Lock());
        popUp->Sync();
        popUp->Unlock();
        EXPECT_EQ(mNotes.Count("first inactive"), 0) << "to the program it is still the active one";
        NamedWindow* const second = Open("second");
        EXPECT_TRUE(mNotes.WaitFor("second active"));
        EXPECT_TRUE(mNotes.WaitFor("first inactive"));
        EXPECT_EQ(mNotes.Count("first inactive"), 1);
        EXPECT_EQ(mNotes.Count("pop-up active"), 0);
        Close(second);
        Close(popUp);
        Close(first);
    });
}
