// Windows under a window manager.
#include "desktop/WindowOnDesktop.h"

#include "PopUpHost.h"
#include "support/program.h"

#include <Roster.h>
#include <Screen.h>
#include <csignal>

namespace {

constexpr rgb_color kBlue = {10, 20, 200, 255};
constexpr rgb_color kOrange = {240, 140, 10, 255};

class WindowTest : public WindowOnDesktop {};

} // namespace

TEST_F(WindowTest, ItsPixelsAreShownWhereItsFrameIs) {
    RunApplication([this] {
        BWindow* const window = Open(BRect(300, 200, 599, 399), "Shown", MakeView(), kBlue);
        EXPECT_TRUE(TheDesktop().becomes(450, 300, 0x0a14c8));
        const BRect frame = FrameOf(window);
        const auto left = static_cast<int>(frame.left);
        const auto top = static_cast<int>(frame.top);
        EXPECT_EQ(TheDesktop().pixel(left, top), 0x0a14c8U);
        EXPECT_NE(TheDesktop().pixel(left - 1, top), 0x0a14c8U);
        EXPECT_EQ(TheDesktop().pixel(left + 299, top + 199), 0x0a14c8U);
        EXPECT_NE(TheDesktop().pixel(left + 299, top + 200), 0x0a14c8U);
        Close(window);
    });
}

TEST_F(WindowTest, ASavedFrameIsRestoredExactly) {
    RunApplication([this] {
        BWindow* window = Open(BRect(150, 160, 449, 359), "First", MakeView(), kBlue);
        snooze(300000);
        const BRect saved = FrameOf(window);
        Close(window);
        EXPECT_EQ(saved.Width(), 299);
        EXPECT_EQ(saved.Height(), 199);
        auto* const second = new NotingWindow(BRect(0, 0, 99, 99), mNotes);
        second->SetTitle("Second");
        second->MoveTo(saved.LeftTop());
        second->ResizeTo(saved.Width(), saved.Height());
        second->Show();
        ASSERT_NE(TheDesktop().window("Second"), "");
        snooze(500000);
        EXPECT_EQ(FrameOf(second), saved);
        Close(second);
    });
}

TEST_F(WindowTest, TenRestartsDoNotMoveIt) {
    RunApplication([this] {
        BRect saved(150, 160, 449, 359);
        for (int start = 0; start < 10; ++start) {
            BWindow* const window = Open(saved, "Again", MakeView(), kBlue);
            snooze(200000);
            const BRect frame = FrameOf(window);
            EXPECT_EQ(frame, BRect(150, 160, 449, 359)) << "start " << start;
            saved = frame;
            Close(window);
            mNotes.Take();
        }
    });
}

TEST_F(WindowTest, ATitleIsNotLeftAboveTheScreenAndStaysWhereItWasPut) {
    RunApplication([this] {
        BRect saved(0, 0, 299, 199);
        BRect first;
        for (int start = 0; start < 10; ++start) {
            BWindow* const window = Open(saved, "Top", MakeView(), kBlue);
            snooze(300000);
            ASSERT_TRUE(window->Lock());
            const BRect around = window->DecoratorFrame();
            saved = window->Frame();
            window->Unlock();
            EXPECT_EQ(around.top, 0) << "start " << start;
            EXPECT_GT(saved.top, 8) << "there is a title";
            first = start == 0 ? saved : first;
            EXPECT_EQ(saved, first) << "start " << start;
            Close(window);
            mNotes.Take();
        }
        EXPECT_EQ(first.Width(), 299);
        EXPECT_EQ(first.Height(), 199);
    });
}

TEST_F(WindowTest, AnEmptyTitleShowsNoOtherName) {
    RunApplication([this] {
        auto* const window = new NotingWindow(BRect(300, 200, 599, 399), mNotes);
        window->SetTitle("");
        window->Show();
        ASSERT_TRUE(mNotes.WaitFor("window: active"));
        EXPECT_EQ(TheDesktop().tool({"getactivewindow", "getwindowname"}), " ");
        Close(window);
    });
}

TEST_F(WindowTest, AWindowGoesBehindAnother) {
    RunApplication([this] {
        BWindow* const below = Open(BRect(300, 200, 599, 399), "Below", MakeView(), kBlue);
        BWindow* const above = Open(BRect(350, 250, 649, 449), "Above", MakeView(), kOrange);
        EXPECT_TRUE(TheDesktop().becomes(450, 300, 0xf08c0a));
        ASSERT_TRUE(above->Lock());
        EXPECT_EQ(above->SendBehind(above), B_BAD_VALUE);
        EXPECT_EQ(above->SendBehind(below), B_OK);
        above->Unlock();
        EXPECT_TRUE(TheDesktop().becomes(450, 300, 0x0a14c8));
        Close(above);
        Close(below);
    });
}

TEST_F(WindowTest, TheCloseBoxAsksTheWindow) {
    RunApplication([this] {
        BWindow* const window = Open(BRect(300, 200, 599, 399), "Closing", MakeView(), kBlue);
        snooze(300000);
        ASSERT_TRUE(window->Lock());
        const BRect around = window->DecoratorFrame();
        window->Unlock();
        EXPECT_LT(around.top, 200) << "the title lies above the content";
        TheDesktop().click(static_cast<int>(around.right) - 10, static_cast<int>(around.top) + 10);
        EXPECT_TRUE(mNotes.WaitFor("window: gone"));
        EXPECT_EQ(mNotes.Count("window: quit requested"), 1);
    });
}

TEST_F(WindowTest, SizesDownToOnePixelWhileItDrawsDoNoHarm) {
    RunApplication([this] {
        BWindow* const window = Open(BRect(300, 200, 599, 399), "Shrinking", MakeView(), kBlue);
        const std::string id = TheDesktop().window("Shrinking");
        std::atomic<bool> done{false};
        std::thread drawer([&] {
            while (!done) {
                if (window->Lock()) {
                    window->FindView("view")->Invalidate();
                    window->Unlock();
                }
                snooze(500);
            }
        });
        for (const int side : {1, 700, 2, 33, 1, 500, 1, 301}) {
            TheDesktop().tool({"windowsize", id, std::to_string(side), std::to_string(side)});
        }
        for (int i = 0; i < 300 && FrameOf(window).Width() != 300; ++i) {
            snooze(100000);
        }
        done = true;
        drawer.join();
        EXPECT_EQ(FrameOf(window).Width(), 300);
        EXPECT_EQ(FrameOf(window).Height(), 300);
        const BRect frame = FrameOf(window);
        EXPECT_TRUE(
            TheDesktop().becomes(static_cast<int>(frame.right), static_cast<int>(frame.bottom), 0x0a14c8));
        Close(window);
    });
}

TEST_F(WindowTest, ItIsMinimizedAndComesBack) {
    RunApplication([this] {
        BWindow* const window = Open(BRect(300, 200, 599, 399), "Minimized", MakeView(), kBlue);
        EXPECT_TRUE(TheDesktop().becomes(400, 300, 0x0a14c8));
        ASSERT_TRUE(window->Lock());
        window->Minimize(true);
        window->Unlock();
        EXPECT_TRUE(TheDesktop().becomes(400, 300, 0x000000));
        ASSERT_TRUE(window->Lock());
        EXPECT_TRUE(window->IsMinimized());
        window->Activate(true);
        window->Unlock();
        EXPECT_TRUE(TheDesktop().becomes(400, 300, 0x0a14c8));
        snooze(200000);
        ASSERT_TRUE(window->Lock());
        EXPECT_FALSE(window->IsMinimized());
        window->Quit();
    });
}

TEST_F(WindowTest, ZoomingByTheTitleStaysWithinTheZoomLimits) {
    RunApplication([this] {
        BWindow* const window = Open(BRect(300, 200, 599, 399), "Zooming", MakeView(), kBlue);
        ASSERT_TRUE(window->Lock());
        window->SetZoomLimits(299, 1000000);
        window->Unlock();
        TheDesktop().move_pointer(450, 190);
        TheDesktop().tool({"click", "--repeat", "2", "--delay", "80", "1"});
        for (int i = 0; i < 300 && FrameOf(window).Height() < 900; ++i) {
            snooze(100000);
        }
        snooze(500000);
        EXPECT_EQ(FrameOf(window).Width(), 299);
        EXPECT_EQ(FrameOf(window).left, 300);
        EXPECT_GT(FrameOf(window).Height(), 900);
        Close(window);
    });
}

TEST_F(WindowTest, KeysOfTheDesktopArriveAndControlWCloses) {
    RunApplication([this] {
        BWindow* const window = Open(BRect(300, 200, 599, 399), "Typing", MakeView(), kBlue);
        ASSERT_TRUE(window->Lock());
        window->FindView("view")->MakeFocus();
        window->Unlock();
        EXPECT_TRUE(mNotes.WaitFor("window: active"));
        TheDesktop().tool({"type", "aB"});
        TheDesktop().key("Delete");
        TheDesktop().key("Left");
        EXPECT_TRUE(mNotes.WaitFor("view: key a"));
        EXPECT_TRUE(mNotes.WaitFor("view: key B"));
        EXPECT_TRUE(mNotes.WaitFor("view: key \x7f"));
        EXPECT_TRUE(mNotes.WaitFor("view: key \x1c"));
        TheDesktop().key("ctrl+w");
        EXPECT_TRUE(mNotes.WaitFor("window: gone"));
    });
}

TEST_F(WindowTest, ClicksAreCountedAndButtonsTold) {
    RunApplication([this] {
        BWindow* const window = Open(BRect(300, 200, 599, 399), "Clicking", MakeView(), kBlue);
        TheDesktop().move_pointer(350, 260);
        TheDesktop().tool({"click", "--repeat", "2", "--delay", "60", "1"});
        EXPECT_TRUE(mNotes.WaitFor("view: down 50,60 buttons 1 clicks 1"));
        EXPECT_TRUE(mNotes.WaitFor("view: down 50,60 buttons 1 clicks 2"));
        TheDesktop().click(350, 260, 3);
        EXPECT_TRUE(mNotes.WaitFor("view: down 50,60 buttons 2 clicks 1"));
        Close(window);
    });
}

TEST_F(WindowTest, AMouseDownThatWaitsInALoopSeesTheRelease) {
    class Poller : public NotingView {
      public:
        using NotingView::NotingView;
        void MouseDown(BPoint) override {
            BPoint where;
            uint32 buttons = 1;
            BPoint last;
            while (buttons != 0) {
                snooze(20000);
                last = where;
                GetMouse(&where, &buttons, true);
            }
            Note("released at " + std::to_string(static_cast<int>(where.x)));
        }
    };
    RunApplication([this] {
        auto* const poller = new Poller(BRect(0, 0, 9, 9), "view", mNotes);
        BWindow* const window = Open(BRect(300, 200, 599, 399), "Polling", poller, kBlue);
        TheDesktop().move_pointer(350, 260);
        TheDesktop().press();
        TheDesktop().move_pointer(400, 260);
        snooze(200000);
        TheDesktop().move_pointer(430, 260);
        TheDesktop().release();
        EXPECT_TRUE(mNotes.WaitFor("view: released at 130"));
        EXPECT_EQ(mNotes.Count("view: up"), 0);
        Close(window);
    });
}

TEST_F(WindowTest, PopUpsHavePointerAndKeysUntilTheyGo) {
    class PopUp : public NotingWindow {
      public:
        explicit PopUp(Notes& notes)
            : NotingWindow(BRect(350, 250, 449, 349), notes, 0, B_UNTYPED_WINDOW), mOutside(notes) {
            SetLook(B_NO_BORDER_WINDOW_LOOK);
            SetFeel(kPopUpWindowFeel);
        }
        void DispatchMessage(BMessage* message, BHandler* handler) override {
            if (message->what == kOutsidePopUps &&
                message->GetInt32("kind", 0) == static_cast<int32>(B_MOUSE_DOWN)) {
                mOutside.Add("popup: pressed outside");
            }
            if (message->what == B_KEY_DOWN) {
                mOutside.Add(std::string("popup: key ") + message->GetString("bytes", ""));
            }
            NotingWindow::DispatchMessage(message, handler);
        }

      private:
        Notes& mOutside;
    };
    RunApplication([this] {
        BWindow* const window = Open(BRect(300, 200, 599, 399), "Below", MakeView(), kBlue);
        EXPECT_TRUE(mNotes.WaitFor("window: active"));
        auto* const popup = new PopUp(mNotes);
        auto* const inside = new NotingView(BRect(0, 0, 99, 99), "inside", mNotes);
        inside->SetViewColor(kOrange);
        popup->AddChild(inside);
        popup->Show();
        EXPECT_TRUE(TheDesktop().becomes(400, 300, 0xf08c0a));
        EXPECT_EQ(TheDesktop().pixel(350, 250), 0xf08c0aU) << "no border, exactly in its place";
        mNotes.Take();
        TheDesktop().click(400, 300);
        EXPECT_TRUE(mNotes.WaitFor("inside: down 50,50 buttons 1 clicks 1"));
        TheDesktop().click(320, 380);
        EXPECT_TRUE(mNotes.WaitFor("popup: pressed outside", 1));
        TheDesktop().click(900, 900);
        EXPECT_TRUE(mNotes.WaitFor("popup: pressed outside", 2));
        TheDesktop().key("x");
        EXPECT_TRUE(mNotes.WaitFor("popup: key x"));
        for (const std::string& line : mNotes.Take()) {
            EXPECT_NE(line.substr(0, 5), "view:") << line;
            EXPECT_NE(line, "window: inactive");
        }
        ASSERT_TRUE(popup->Lock());
        popup->Quit();
        EXPECT_TRUE(TheDesktop().becomes(400, 300, 0x0a14c8));
        TheDesktop().click(320, 380);
        EXPECT_TRUE(mNotes.WaitFor("view: down 20,180 buttons 1 clicks 1"));
        Close(window);
    });
}

TEST_F(WindowTest, AProgramThatIsActivatedBringsItsWindowsBack) {
    RunApplication([this] {
        BWindow* const window = Open(BRect(300, 200, 599, 399), "Called", MakeView(), kBlue);
        EXPECT_TRUE(TheDesktop().becomes(450, 300, 0x0a14c8));
        ASSERT_TRUE(window->Lock());
        window->Minimize(true);
        window->Unlock();
        EXPECT_TRUE(TheDesktop().becomes(450, 300, 0x000000));
        // As a second start of the program does it.
        EXPECT_EQ(be_roster->ActivateApp(be_app->Team()), B_OK);
        EXPECT_TRUE(TheDesktop().becomes(450, 300, 0x0a14c8));
        Close(window);
    });
}

TEST_F(WindowTest, TheScreenHasTheSizeOfTheDisplay) {
    RunApplication([] {
        EXPECT_EQ(BScreen(B_MAIN_SCREEN_ID).Frame(), BRect(0, 0, 1279, 1023));
        BScreen screen;
        EXPECT_TRUE(screen.IsValid());
        EXPECT_EQ(screen.SetToNext(), B_ERROR);
    });
}

TEST_F(WindowTest, ARequestOfTheSystemToEndIsFollowed) {
    test::Program program(WINDOW_PROGRAM, {});
    ASSERT_NE(TheDesktop().window("Window program"), "");
    program.signal(SIGTERM);
    const test::ProgramResult result = program.wait();
    EXPECT_EQ(result.status, 0) << result.errors;
    EXPECT_EQ(result.signal, 0);
}

TEST_F(WindowTest, WithoutADisplayTheProgramEndsWithOneLine) {
    for (const std::string& setting : {std::string("DISPLAY="), std::string("DISPLAY=:4711")}) {
        const test::ProgramResult result = test::run_program(
            "/usr/bin/env", {"-u", "WAYLAND_DISPLAY", "-u", "QT_QPA_PLATFORM", setting, WINDOW_PROGRAM});
        EXPECT_EQ(result.status, 1) << setting;
        EXPECT_EQ(test::lines_of(result.errors).size(), 1U) << result.errors;
        EXPECT_NE(result.errors.find("display"), std::string::npos) << result.errors;
        EXPECT_EQ(result.output, "");
    }
}
