// Menus and alerts in real windows, with input as the display would tell it.
#include "MenuBarWindow.h"

#include "support/temporary_environment.h"

#include <Button.h>
#include <Invoker.h>

#include <gtest/gtest.h>

namespace {

using Kind = host::PointerInput::Kind;
using host::KeyName;

class MenuUseTest : public testing::Test {
  protected:
    MenuBarWindow* OpenWindow() {
        auto* const window = new MenuBarWindow(mNotes);
        mWindowEvents = window->Host()->SharedEvents();
        window->Show();
        EXPECT_TRUE(mNotes.WaitFor("view: draw"));
        mNotes.Take();
        return window;
    }
    static void CloseWindow(BWindow* window) {
        ASSERT_TRUE(window->Lock());
        window->Quit();
    }
    // How many windows there are, those of menus included.
    static bool WaitForWindows(int32 count) {
        for (int i = 0; i < 2000; ++i) {
            if (be_app->CountLoopers() == count + 1) {
                return true;
            }
            snooze(5000);
        }
        return false;
    }
    // What the display tells the window that shows the menu of, once it does; null when it does not come.
    static std::shared_ptr<WindowEvents> EventsOf(const BMenu& menu) {
        for (int i = 0; i < 2000; ++i) {
            if (auto* const window = static_cast<BWindow*>(menu.Looper()); window != nullptr) {
                return window->Host()->SharedEvents();
            }
            snooze(5000);
        }
        return nullptr;
    }
    static std::shared_ptr<WindowEvents> EventsOf(const std::atomic<BAlert*>& alert) {
        for (int i = 0; i < 2000; ++i) {
            if (alert != nullptr) {
                return alert.load()->Host()->SharedEvents();
            }
            snooze(5000);
        }
        return nullptr;
    }
    static host::PointerInput Pointer(Kind kind, double x, double y, std::uint32_t buttons) {
        host::PointerInput input;
        input.kind = kind;
        input.on_screen = {x, y};
        input.where = {x - 100, y - 100};
        input.buttons = buttons;
        return input;
    }
    static host::KeyInput Key(const std::string& text, KeyName name = KeyName::none,
                              std::uint32_t modifiers = 0) {
        host::KeyInput input;
        input.text = text;
        input.plain_text = text;
        input.name = name;
        input.modifiers = modifiers;
        return input;
    }
    // Pressed and let go.
    static void PressAlt(WindowEvents& events) {
        host::KeyInput alt = Key("", KeyName::alt, host::alt_modifier);
        events.key(alt);
        alt.pressed = false;
        alt.modifiers = 0;
        events.key(alt);
    }
    void PressFileTitle() { mWindowEvents->pointer(Pointer(Kind::pressed, 115, 110, 1)); }

    test::TemporaryEnvironment mEnvironment;
    Notes mNotes;
    std::shared_ptr<WindowEvents> mWindowEvents;
};

} // namespace

TEST_F(MenuUseTest, PressDragReleaseSendsTheItemsMessageToTheWindow) {
    RunWithDisplay([this] {
        MenuBarWindow* const window = OpenWindow();
        PressFileTitle();
        const std::shared_ptr<WindowEvents> menu = EventsOf(*window->file);
        ASSERT_NE(nullptr, menu);

        menu->pointer(Pointer(Kind::moved, 130, 132, 1));
        menu->pointer(Pointer(Kind::released, 131, 133, 0));

        EXPECT_TRUE(mNotes.WaitFor("open index 0"));
        EXPECT_TRUE(WaitForWindows(1));
        EXPECT_EQ(mNotes.Count("beginning"), 1);
        EXPECT_EQ(mNotes.Count("ended"), 1);
        CloseWindow(window);
    });
}

TEST_F(MenuUseTest, AWindowDrawsOnWhileItsMenuIsOpen) {
    RunWithDisplay([this] {
        MenuBarWindow* const window = OpenWindow();
        PressFileTitle();
        const std::shared_ptr<WindowEvents> menu = EventsOf(*window->file);
        ASSERT_NE(nullptr, menu);

        ASSERT_TRUE(window->Lock());
        window->FindView("view")->Invalidate();
        window->Unlock();

        EXPECT_TRUE(mNotes.WaitFor("view: draw"));
        menu->popups_dismissed();
        EXPECT_TRUE(mNotes.WaitFor("ended"));
        CloseWindow(window);
    });
}

TEST_F(MenuUseTest, AltLeadsToTheBarAndArrowsAndEnterChoose) {
    RunWithDisplay([this] {
        MenuBarWindow* const window = OpenWindow();
        PressAlt(*mWindowEvents);
        ASSERT_TRUE(mNotes.WaitFor("beginning"));

        mWindowEvents->key(Key("", KeyName::down));
        const std::shared_ptr<WindowEvents> menu = EventsOf(*window->file);
        ASSERT_NE(nullptr, menu);
        menu->key(Key("", KeyName::down));
        menu->key(Key("\n", KeyName::enter));

        EXPECT_TRUE(mNotes.WaitFor("clos index 2"));
        EXPECT_TRUE(WaitForWindows(1));
        CloseWindow(window);
    });
}

TEST_F(MenuUseTest, EscapeClosesTheMenuAndThenLeavesTheBar) {
    RunWithDisplay([this] {
        MenuBarWindow* const window = OpenWindow();
        mWindowEvents->key(Key("f", KeyName::none, host::alt_modifier));
        const std::shared_ptr<WindowEvents> menu = EventsOf(*window->file);
        ASSERT_NE(nullptr, menu);

        menu->key(Key("\x1b", KeyName::escape));
        EXPECT_TRUE(WaitForWindows(1));
        EXPECT_EQ(mNotes.Count("ended"), 0);
        mWindowEvents->key(Key("\x1b", KeyName::escape));

        EXPECT_TRUE(mNotes.WaitFor("ended"));
        CloseWindow(window);
    });
}

TEST_F(MenuUseTest, ALetterWithAltOpensTheMenuAndAnotherChooses) {
    RunWithDisplay([this] {
        MenuBarWindow* const window = OpenWindow();
        mWindowEvents->key(Key("e", KeyName::none, host::alt_modifier));
        const std::shared_ptr<WindowEvents> menu = EventsOf(*window->edit);
        ASSERT_NE(nullptr, menu);

        menu->key(Key("u"));

        EXPECT_TRUE(mNotes.WaitFor("undo index 0"));
        CloseWindow(window);
    });
}

TEST_F(MenuUseTest, ShortcutsInvokeItemsAndThoseOfDisabledOnesDoNothing) {
    RunWithDisplay([this] {
        MenuBarWindow* const window = OpenWindow();

        mWindowEvents->key(Key("p", KeyName::none, host::control_modifier));
        mWindowEvents->key(Key("o", KeyName::none, host::control_modifier));

        EXPECT_TRUE(mNotes.WaitFor("open index 0"));
        EXPECT_EQ(mNotes.Count("prnt index 1"), 0);
        EXPECT_EQ(mNotes.Count("beginning"), 2);
        CloseWindow(window);
    });
}

TEST_F(MenuUseTest, AWindowMayCloseWhileItsMenuIsOpen) {
    RunWithDisplay([this] {
        MenuBarWindow* const window = OpenWindow();
        PressFileTitle();
        const std::shared_ptr<WindowEvents> menu = EventsOf(*window->file);
        ASSERT_NE(nullptr, menu);

        CloseWindow(window);

        EXPECT_TRUE(WaitForWindows(0));
        EXPECT_EQ(mNotes.Count("window: gone"), 1);
    });
}

TEST_F(MenuUseTest, RemovingTheOpenMenuClosesIt) {
    RunWithDisplay([this] {
        MenuBarWindow* const window = OpenWindow();
        PressFileTitle();
        const std::shared_ptr<WindowEvents> menu = EventsOf(*window->file);
        ASSERT_NE(nullptr, menu);

        ASSERT_TRUE(window->Lock());
        delete window->bar->RemoveItem(int32{0});
        window->Unlock();

        EXPECT_TRUE(mNotes.WaitFor("ended"));
        EXPECT_TRUE(WaitForWindows(1));
        CloseWindow(window);
    });
}

TEST_F(MenuUseTest, ItemsOfAnOpenMenuMayChange) {
    RunWithDisplay([this] {
        MenuBarWindow* const window = OpenWindow();
        PressFileTitle();
        const std::shared_ptr<WindowEvents> menu = EventsOf(*window->file);
        ASSERT_NE(nullptr, menu);

        for (int i = 0; i < 50; ++i) {
            ASSERT_TRUE(window->Lock());
            window->file->ItemAt(1)->SetEnabled(i % 2 == 0);
            window->file->ItemAt(0)->SetMarked(i % 2 == 0);
            window->Unlock();
        }

        menu->popups_dismissed();
        EXPECT_TRUE(mNotes.WaitFor("ended"));
        CloseWindow(window);
    });
}

TEST_F(MenuUseTest, APopUpInAWindowsThreadReturnsTheChosenItemAndTheWindowDrawsMeanwhile) {
    RunWithDisplay([this] {
        MenuBarWindow* const window = OpenWindow();
        window->PostMessage(kOpenPopUp);
        const std::shared_ptr<WindowEvents> menu = EventsOf(window->popUp);
        ASSERT_NE(nullptr, menu);
        EXPECT_TRUE(mNotes.WaitFor("view: draw"));

        menu->pointer(Pointer(Kind::moved, 230, 228, 0));
        menu->pointer(Pointer(Kind::pressed, 230, 228, 1));
        menu->pointer(Pointer(Kind::released, 230, 228, 0));

        EXPECT_TRUE(mNotes.WaitFor("chose Second"));
        EXPECT_TRUE(WaitForWindows(1));
        CloseWindow(window);
    });
}

TEST_F(MenuUseTest, APopUpIsLeftByEscapeByAPressOutsideAndWhenItIsDismissed) {
    RunWithDisplay([this] {
        MenuBarWindow* const window = OpenWindow();
        for (int way = 0; way < 3; ++way) {
            window->PostMessage(kOpenPopUp);
            const std::shared_ptr<WindowEvents> menu = EventsOf(window->popUp);
            ASSERT_NE(nullptr, menu);
            if (way == 0) {
                menu->key(Key("\x1b", KeyName::escape));
            } else if (way == 1) {
                host::PointerInput outside = Pointer(Kind::pressed, 700, 500, 1);
                outside.outside_popups = true;
                menu->pointer(outside);
            } else {
                menu->popups_dismissed();
            }
            EXPECT_TRUE(mNotes.WaitFor("chose nothing", way + 1));
            EXPECT_TRUE(WaitForWindows(1));
        }
        CloseWindow(window);
    });
}

TEST_F(MenuUseTest, APopUpOpensInAThreadWithoutAWindowToo) {
    RunWithDisplay([] {
        BPopUpMenu menu("popup");
        menu.AddItem(new BMenuItem("Only", nullptr));
        std::thread user([&menu] {
            const std::shared_ptr<WindowEvents> events = EventsOf(menu);
            ASSERT_NE(nullptr, events);
            events->key(Key("", KeyName::down));
            events->key(Key("\n", KeyName::enter));
        });

        EXPECT_EQ(menu.ItemAt(0), menu.Go(BPoint(10, 10)));

        user.join();
    });
}

namespace {

class GoneMenu : public BPopUpMenu {
  public:
    explicit GoneMenu(Notes& notes) : BPopUpMenu("popup", false, false), mNotes(notes) {
        AddItem(new BMenuItem("Only", new BMessage('only')));
    }
    ~GoneMenu() override { mNotes.Add("menu gone"); }

  private:
    Notes& mNotes;
};

} // namespace

TEST_F(MenuUseTest, AnAsynchronousPopUpDeliversAndDeletesItself) {
    RunWithDisplay([this] {
        MenuBarWindow* const window = OpenWindow();
        auto* const menu = new GoneMenu(mNotes);
        menu->SetTargetForItems(window);
        menu->SetAsyncAutoDestruct(true);

        EXPECT_EQ(nullptr, menu->Go(BPoint(10, 10), true, true, true));
        const std::shared_ptr<WindowEvents> events = EventsOf(*menu);
        ASSERT_NE(nullptr, events);
        events->key(Key("o"));

        EXPECT_TRUE(mNotes.WaitFor("only index 0"));
        EXPECT_TRUE(mNotes.WaitFor("menu gone"));
        CloseWindow(window);
    });
}

TEST_F(MenuUseTest, AnAlertReturnsTheButtonThatWasPressedAndTheWindowDrawsMeanwhile) {
    RunWithDisplay([this] {
        MenuBarWindow* const window = OpenWindow();
        window->PostMessage(kAsk);
        std::shared_ptr<WindowEvents> alert = EventsOf(window->alert);
        ASSERT_NE(nullptr, alert);
        EXPECT_TRUE(mNotes.WaitFor("view: draw"));

        alert->key(Key("\n", KeyName::enter));
        EXPECT_TRUE(mNotes.WaitFor("answer 1"));
        EXPECT_TRUE(WaitForWindows(1));

        window->PostMessage(kAsk);
        alert = EventsOf(window->alert);
        ASSERT_NE(nullptr, alert);
        alert->key(Key("", KeyName::left));
        alert->key(Key("\n", KeyName::enter));
        EXPECT_TRUE(mNotes.WaitFor("answer 0"));
        CloseWindow(window);
    });
}

TEST_F(MenuUseTest, EscapePressesTheButtonThatItIsTheShortcutOf) {
    RunWithDisplay([this] {
        auto* const alert =
            new BAlert("Ask", "Really?", "Cancel", "Yes", nullptr, B_WIDTH_FROM_WIDEST, B_STOP_ALERT);
        alert->SetShortcut(0, B_ESCAPE);
        EXPECT_EQ(B_ESCAPE, alert->Shortcut(0));
        const std::shared_ptr<WindowEvents> events = alert->Host()->SharedEvents();
        std::thread user([&events] { events->key(Key("\x1b", KeyName::escape)); });

        EXPECT_EQ(0, alert->Go());

        user.join();
        EXPECT_TRUE(WaitForWindows(0));
    });
}

TEST_F(MenuUseTest, WithoutAShortcutEscapeMeansNothingToAnAlert) {
    RunWithDisplay([this] {
        auto* const alert = new BAlert("Ask", "Really?", "Cancel", "Yes");
        const std::shared_ptr<WindowEvents> events = alert->Host()->SharedEvents();
        std::thread user([&events] {
            events->key(Key("\x1b", KeyName::escape));
            events->key(Key(" "));
        });

        EXPECT_EQ(1, alert->Go());

        user.join();
    });
}

TEST_F(MenuUseTest, AnAlertThatIsClosedFromOutsideAnswersAnError) {
    RunWithDisplay([this] {
        auto* const alert = new BAlert("Ask", "Really?", "Yes");
        std::thread other([alert] { alert->PostMessage(B_QUIT_REQUESTED); });

        EXPECT_EQ(B_ERROR, alert->Go());

        other.join();
    });
}

TEST_F(MenuUseTest, AnAlertThatNobodyWaitsForSendsItsAnswer) {
    RunWithDisplay([this] {
        NotingWindow* const window = OpenWindow();
        auto* const message = new BMessage('answ');
        message->AddPointer("source", nullptr);
        BInvoker invoker(message, window);
        auto* const alert = new BAlert("Ask", "Really?", "");
        const std::shared_ptr<WindowEvents> events = alert->Host()->SharedEvents();

        EXPECT_EQ(B_OK, alert->Go(&invoker));
        events->key(Key(" "));

        EXPECT_TRUE(mNotes.WaitFor("answ index -1"));
        EXPECT_TRUE(WaitForWindows(1));
        CloseWindow(window);
    });
}

TEST_F(MenuUseTest, AnAlertIsArchivedWithItsTextsAndKeys) {
    RunWithDisplay([] {
        auto* const alert = new BAlert("Ask", "Really?", "Cancel", "Yes", nullptr, B_WIDTH_FROM_LABEL,
                                       B_OFFSET_SPACING, B_IDEA_ALERT);
        alert->SetShortcut(0, B_ESCAPE);
        BMessage archive;
        ASSERT_EQ(B_OK, alert->Archive(&archive));
        alert->Quit();

        auto* const copy = dynamic_cast<BAlert*>(instantiate_object(&archive));

        ASSERT_NE(nullptr, copy);
        EXPECT_STREQ("Ask", copy->Title());
        EXPECT_STREQ("Cancel", copy->ButtonAt(0)->Label());
        EXPECT_STREQ("Yes", copy->ButtonAt(1)->Label());
        EXPECT_EQ(nullptr, copy->ButtonAt(2));
        EXPECT_EQ(B_ESCAPE, copy->Shortcut(0));
        EXPECT_EQ(copy->ButtonAt(1), copy->DefaultButton());
        copy->Quit();
    });
}
