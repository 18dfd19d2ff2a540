// Windows: drawing, input as the display tells it, focus, shortcuts, pulses, and the end.
#include "WindowWithApplication.h"

#include "support/temporary_environment.h"

#include <MessageQueue.h>
#include <gtest/gtest.h>

namespace {

class WindowTest : public testing::Test {
  protected:
    // A window with the views "upper" and "lower", shown.
    NotingWindow* OpenWindow(uint32 viewFlags = B_WILL_DRAW | B_NAVIGABLE) {
        auto* const window = new NotingWindow(BRect(100, 100, 299, 299), mNotes);
        window->AddChild(new NotingView(BRect(0, 0, 199, 99), "upper", mNotes, viewFlags));
        window->AddChild(new NotingView(BRect(0, 100, 199, 199), "lower", mNotes, viewFlags));
        window->Show();
        EXPECT_TRUE(mNotes.WaitFor("lower: draw"));
        return window;
    }
    static void CloseWindow(BWindow* window) {
        ASSERT_TRUE(window->Lock());
        window->Quit();
    }
    static host::PointerInput Pointer(host::PointerInput::Kind kind, double x, double y,
                                      std::uint32_t buttons) {
        host::PointerInput input;
        input.kind = kind;
        input.where = {x, y};
        input.on_screen = {x + 100, y + 100};
        input.buttons = buttons;
        return input;
    }
    static host::KeyInput Key(const std::string& text, std::uint32_t modifiers = 0,
                              host::KeyName name = host::KeyName::none) {
        host::KeyInput input;
        input.text = text;
        input.plain_text = text;
        input.modifiers = modifiers;
        input.name = name;
        return input;
    }
    // What was noted, without the activation that the display may bring at any time.
    std::vector<std::string> Heard() {
        std::vector<std::string> lines = mNotes.Take();
        std::erase_if(lines, [](const std::string& line) { return line.ends_with("active"); });
        return lines;
    }
    static WindowEvents& EventsOf(BWindow* window) { return window->Host()->Events(); }

    test::TemporaryEnvironment mEnvironment;
    Notes mNotes;
};

using Kind = host::PointerInput::Kind;

// The looper may have gone, which the call is made for and the checkers do not know.
__attribute__((noinline, no_sanitize("undefined", "address"))) bool LocksWhatMayBeGone(BLooper* looper) {
    return looper->Lock();
}

} // namespace

TEST_F(WindowTest, ViewsAreDrawnWhenTheWindowIsShown) {
    RunApplication([this] {
        NotingWindow* const window = OpenWindow();
        EXPECT_EQ(mNotes.Count("upper: draw"), 1);
        CloseWindow(window);
        EXPECT_EQ(mNotes.Count("window: gone"), 1);
    });
}

TEST_F(WindowTest, InvalidatingManyTimesDrawsOnce) {
    RunApplication([this] {
        NotingWindow* const window = OpenWindow();
        mNotes.Take();
        ASSERT_TRUE(window->Lock());
        for (int i = 0; i < 100; ++i) {
            window->FindView("upper")->Invalidate(BRect(static_cast<float>(i), 0, 150, 50));
        }
        window->PostMessage('test');
        window->Unlock();
        ASSERT_TRUE(mNotes.WaitFor("upper: draw"));
        ASSERT_TRUE(mNotes.WaitFor("window: test"));
        snooze(50000);
        EXPECT_EQ(mNotes.Count("upper: draw"), 1);
        EXPECT_EQ(mNotes.Count("lower: draw"), 0);
        CloseWindow(window);
    });
}

TEST_F(WindowTest, TheBackgroundIsClearedToTheViewColourBeforeDrawing) {
    RunApplication([this] {
        NotingWindow* const window = OpenWindow();
        ASSERT_TRUE(window->Lock());
        BView* const view = window->FindView("upper");
        view->SetViewColor(10, 20, 30);
        window->UpdateIfNeeded();
        const PixelSurface surface = window->Host()->Surface();
        EXPECT_EQ(reinterpret_cast<const uint32*>(surface.Row(50))[50], 0xff0a141eU);
        EXPECT_EQ(reinterpret_cast<const uint32*>(surface.Row(150))[50], 0xffffffffU);
        window->Quit();
    });
}

TEST_F(WindowTest, ScrollingMovesPixelsAndDrawsOnlyWhatIsNew) {
    RunApplication([this] {
        NotingWindow* const window = OpenWindow();
        ASSERT_TRUE(window->Lock());
        BView* const view = window->FindView("upper");
        view->SetHighColor(200, 0, 0);
        view->FillRect(BRect(0, 40, 199, 40));
        view->ScrollBy(0, 30);
        EXPECT_EQ(window->Host()->NeedsUpdate(), true);
        const PixelSurface surface = window->Host()->Surface();
        EXPECT_EQ(reinterpret_cast<const uint32*>(surface.Row(10))[50], 0xffc80000U);
        window->UpdateIfNeeded();
        EXPECT_EQ(reinterpret_cast<const uint32*>(surface.Row(10))[50], 0xffc80000U);
        window->Quit();
    });
}

TEST_F(WindowTest, TheMouseGoesToTheViewUnderIt) {
    RunApplication([this] {
        NotingWindow* const window = OpenWindow();
        mNotes.Take();
        host::PointerInput press = Pointer(Kind::pressed, 20, 130, 1);
        press.clicks = 2;
        EventsOf(window).pointer(Pointer(Kind::moved, 10, 10, 0));
        ASSERT_TRUE(mNotes.WaitFor("upper: moved 0"));
        EventsOf(window).pointer(Pointer(Kind::moved, 20, 130, 0));
        EventsOf(window).pointer(press);
        EventsOf(window).pointer(Pointer(Kind::released, 20, 130, 0));
        ASSERT_TRUE(mNotes.WaitFor("lower: up"));
        EXPECT_EQ(Heard(), (std::vector<std::string>{"upper: moved 0", "upper: moved 2", "lower: moved 0",
                                                     "lower: down 20,30 buttons 1 clicks 2", "lower: up"}));
        CloseWindow(window);
    });
}

TEST_F(WindowTest, MovesThatNobodyHasSeenYetDoNotPileUp) {
    RunApplication([this] {
        NotingWindow* const window = OpenWindow();
        // What the display tells of the window itself has come by then, and does not part the moves.
        ASSERT_TRUE(mNotes.WaitFor("window: active"));
        window->PostMessage('test');
        ASSERT_TRUE(mNotes.WaitFor("window: test"));
        mNotes.Take();
        ASSERT_TRUE(window->Lock());
        for (int i = 0; i < 500; ++i) {
            EventsOf(window).pointer(Pointer(Kind::moved, i % 200, 10, 0));
        }
        EXPECT_LE(window->MessageQueue()->CountMessages(), 3);
        window->Unlock();
        ASSERT_TRUE(mNotes.WaitFor("upper: moved 0"));
        CloseWindow(window);
    });
}

TEST_F(WindowTest, GetMouseTakesTheMessagesThatWait) {
    RunApplication([this] {
        NotingWindow* const window = OpenWindow();
        mNotes.Take();
        window->work = [window] {
            EventsOf(window).pointer(Pointer(Kind::moved, 33, 44, 1));
            EventsOf(window).pointer(Pointer(Kind::released, 35, 46, 0));
            BView* const view = window->FindView("upper");
            BPoint where;
            uint32 buttons = 0;
            view->GetMouse(&where, &buttons, true);
            EXPECT_EQ(where, BPoint(33, 44));
            EXPECT_EQ(buttons, 1U);
            view->GetMouse(&where, &buttons, true);
            EXPECT_EQ(where, BPoint(35, 46));
            EXPECT_EQ(buttons, 0U);
        };
        window->PostMessage('work');
        ASSERT_TRUE(mNotes.WaitFor("window: worked"));
        snooze(50000);
        EXPECT_EQ(mNotes.Count("upper: up"), 0) << "what GetMouse() has taken does not come again";
        CloseWindow(window);
    });
}

TEST_F(WindowTest, KeysGoToTheFocusAndTabMovesIt) {
    RunApplication([this] {
        NotingWindow* const window = OpenWindow();
        mNotes.Take();
        EventsOf(window).key(Key("\t", 0, host::KeyName::tab));
        ASSERT_TRUE(mNotes.WaitFor("upper: focus"));
        EventsOf(window).key(Key("a"));
        ASSERT_TRUE(mNotes.WaitFor("upper: key a"));
        EventsOf(window).key(Key("\t", 0, host::KeyName::tab));
        ASSERT_TRUE(mNotes.WaitFor("lower: focus"));
        EXPECT_EQ(mNotes.Count("upper: no focus"), 1);
        EventsOf(window).key(Key("\t", host::shift_modifier, host::KeyName::tab));
        ASSERT_TRUE(mNotes.WaitFor("upper: focus", 2));
        CloseWindow(window);
    });
}

TEST_F(WindowTest, ShortcutsComeBeforeTheFocus) {
    RunApplication([this] {
        NotingWindow* const window = OpenWindow();
        ASSERT_TRUE(window->Lock());
        window->FindView("upper")->MakeFocus();
        window->AddShortcut('f', B_COMMAND_KEY, new BMessage('test'));
        window->Unlock();
        mNotes.Take();
        EventsOf(window).key(Key("f", host::control_modifier));
        EXPECT_TRUE(mNotes.WaitFor("window: test"));
        EventsOf(window).key(Key("a", host::control_modifier));
        EXPECT_TRUE(mNotes.WaitFor("upper: select all"));
        EventsOf(window).key(Key("k", host::control_modifier));
        EXPECT_TRUE(mNotes.WaitFor("upper: key k"));
        EXPECT_EQ(mNotes.Count("upper: key f"), 0);
        EventsOf(window).key(Key("w", host::control_modifier));
        EXPECT_TRUE(mNotes.WaitFor("window: gone"));
        EXPECT_EQ(mNotes.Count("window: quit requested"), 1);
    });
}

TEST_F(WindowTest, TheFrameStaysWithinTheLimitsAndTheHooksHearOfIt) {
    RunApplication([this] {
        NotingWindow* const window = OpenWindow(B_WILL_DRAW | B_FRAME_EVENTS);
        mNotes.Take();
        ASSERT_TRUE(window->Lock());
        window->SetSizeLimits(150, 1000000, 100, 400);
        window->MoveTo(20, 30);
        window->ResizeTo(50, 5000);
        EXPECT_EQ(window->Frame(), BRect(20, 30, 170, 430));
        EXPECT_EQ(window->FindView("upper")->Bounds(), BRect(0, 0, 150, 300));
        window->Unlock();
        EXPECT_TRUE(mNotes.WaitFor("window: moved 20,30"));
        EXPECT_TRUE(mNotes.WaitFor("window: resized 150x400"));
        ASSERT_TRUE(window->Lock());
        EXPECT_EQ(window->Frame(), BRect(20, 30, 170, 430)) << "the display leaves it as it was wanted";
        window->Quit();
    });
}

TEST_F(WindowTest, PulsesComeOnlyToWhoNeedsThemAndNeverPileUp) {
    RunApplication([this] {
        NotingWindow* const window = OpenWindow(B_WILL_DRAW);
        ASSERT_TRUE(window->Lock());
        window->SetPulseRate(10000);
        window->FindView("upper")->SetFlags(B_WILL_DRAW | B_PULSE_NEEDED);
        window->Unlock();
        EXPECT_TRUE(mNotes.WaitFor("upper: pulse", 5));
        EXPECT_EQ(mNotes.Count("lower: pulse"), 0);
        // When the window has no time for half a second.
        ASSERT_TRUE(window->Lock());
        snooze(500000);
        int32 waiting = 0;
        while (window->MessageQueue()->FindMessage(B_PULSE, waiting) != nullptr) {
            ++waiting;
        }
        EXPECT_LE(waiting, 1);
        window->Quit();
    });
}

TEST_F(WindowTest, AWindowThatNobodyNeedsSleeps) {
    RunApplication([this] {
        NotingWindow* const window = OpenWindow(B_WILL_DRAW);
        // Its opening may last: a second without a message comes, or the window never sleeps.
        int before = -1;
        for (int seconds = 0; seconds < 20 && window->Dispatched() != before; ++seconds) {
            before = window->Dispatched();
            snooze(1000000);
        }
        EXPECT_EQ(window->Dispatched(), before);
        CloseWindow(window);
    });
}

TEST_F(WindowTest, ALockThatIsNotGivenBackEndsWithItsMessage) {
    class Greedy : public NotingView {
      public:
        using NotingView::NotingView;
        void Pulse() override {
            Window()->Lock();
            Note("greedy");
        }
    };
    RunApplication([this] {
        auto* const window = new NotingWindow(BRect(0, 0, 99, 99), mNotes);
        window->AddChild(new Greedy(BRect(0, 0, 99, 99), "greedy", mNotes, B_PULSE_NEEDED));
        window->SetPulseRate(10000);
        window->Show();
        ASSERT_TRUE(mNotes.WaitFor("greedy: greedy", 3));
        ASSERT_EQ(window->LockWithTimeout(2000000), B_OK);
        window->Quit();
    });
}

TEST_F(WindowTest, TwoSidesMayCloseTheSameWindow) {
    RunApplication([this] {
        for (int i = 0; i < 100; ++i) {
            auto* const window = new NotingWindow(BRect(0, 0, 99, 99), mNotes);
            window->AddChild(new NotingView(BRect(0, 0, 99, 99), "view", mNotes));
            const std::shared_ptr<WindowEvents> events = window->Host()->SharedEvents();
            window->Show();
            std::thread closeBox([&] { events->close_requested(); });
            std::thread menu([&] {
                if (LocksWhatMayBeGone(window)) {
                    window->Close();
                }
            });
            closeBox.join();
            menu.join();
            EXPECT_TRUE(mNotes.WaitFor("window: gone", i + 1));
        }
    });
}

TEST_F(WindowTest, TheApplicationEndsWithAWindowOpen) {
    RunApplication([this] { OpenWindow(); });
    EXPECT_EQ(mNotes.Count("window: gone"), 1);
    EXPECT_EQ(mNotes.Count("window: quit requested"), 1);
}

TEST_F(WindowTest, AWindowMayEndTheApplication) {
    BApplication application("application/x-vnd.Test-Windows");
    auto* const window = new NotingWindow(BRect(0, 0, 99, 99), mNotes, B_QUIT_ON_WINDOW_CLOSE);
    window->Show();
    window->PostMessage(B_QUIT_REQUESTED);
    application.Run();
    EXPECT_EQ(mNotes.Count("window: gone"), 1);
}

TEST_F(WindowTest, ADroppedMessageFollowsTheButton) {
    RunApplication([this] {
        NotingWindow* const window = OpenWindow();
        mNotes.Take();
        host::DataFormats text;
        text.set("text/plain", "words");
        host::DragInput drag;
        drag.kind = host::DragInput::Kind::entered;
        drag.where = {20, 20};
        drag.buttons = 1;
        drag.data = std::make_shared<const host::DataFormats>(text);
        EventsOf(window).drag(drag);
        ASSERT_TRUE(mNotes.WaitFor("upper: moved 0 dragging"));
        drag.kind = host::DragInput::Kind::dropped;
        drag.where = {20, 120};
        drag.buttons = 0;
        EventsOf(window).drag(drag);
        ASSERT_TRUE(mNotes.WaitFor("lower: dropped"));
        EXPECT_EQ(Heard(),
                  (std::vector<std::string>{"upper: moved 0 dragging", "upper: moved 2 dragging",
                                            "lower: moved 0 dragging", "lower: up", "lower: dropped"}));
        CloseWindow(window);
    });
}
