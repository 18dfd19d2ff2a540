// Menus and alerts on a desktop: real pop-ups, a real pointer and real keys.
#include "desktop/WindowOnDesktop.h"

#include "kits/interface/MenuBarWindow.h"

namespace {

constexpr std::uint32_t kMenuGround = 0xd8d8d8;
constexpr std::uint32_t kSelection = 0xa0a0a0;
constexpr std::uint32_t kView = 0xffffff;

class MenuTest : public WindowOnDesktop {
  protected:
    MenuBarWindow* OpenWithMenus() {
        auto* const window = new MenuBarWindow(mNotes);
        window->SetTitle("Menus");
        window->Show();
        EXPECT_NE(TheDesktop().window("Menus"), "");
        EXPECT_TRUE(mNotes.WaitFor("view: draw"));
        EXPECT_TRUE(mNotes.WaitFor("window: active"));
        TheDesktop().move_pointer(900, 700);
        // The window manager has put its frame around it by then.
        snooze(300000);
        const BRect frame = FrameOf(window);
        mLeft = static_cast<int>(frame.left);
        mTop = static_cast<int>(frame.top);
        return window;
    }
    // Points of the window's content. The titles "File" and "Edit"; "Open" and "Close" of the first menu,
    // which lies below its title, and a place in the menu that is no text.
    struct Place {
        int x;
        int y;
    };
    Place FileTitle() const { return {mLeft + 15, mTop + 10}; }
    Place EditTitle() const { return {mLeft + 55, mTop + 10}; }
    Place Open() const { return {mLeft + 10, mTop + 30}; }
    Place Close() const { return {mLeft + 10, mTop + 66}; }
    static void Point(Place place) { TheDesktop().move_pointer(place.x, place.y); }
    static bool Becomes(Place place, std::uint32_t color) {
        return TheDesktop().becomes(place.x, place.y, color);
    }
    static void CloseWindow(BWindow* window) { WindowOnDesktop::Close(window); }

    int mLeft = 0;
    int mTop = 0;
};

} // namespace

TEST_F(MenuTest, PressDragReleaseChooses) {
    RunWithDisplay([this] {
        BWindow* const window = OpenWithMenus();
        Point(FileTitle());
        TheDesktop().press();
        EXPECT_TRUE(Becomes(Open(), kMenuGround));
        Point(Close());
        EXPECT_TRUE(Becomes(Close(), kSelection));

        TheDesktop().release();

        EXPECT_TRUE(mNotes.WaitFor("clos index 2"));
        EXPECT_TRUE(Becomes(Close(), kView));
        CloseWindow(window);
    });
}

TEST_F(MenuTest, ClickAndClickChoosesAndPointingOpensTheNextMenu) {
    RunWithDisplay([this] {
        BWindow* const window = OpenWithMenus();
        TheDesktop().click(EditTitle().x, EditTitle().y);
        EXPECT_TRUE(Becomes({EditTitle().x, mTop + 3}, kSelection));
        Point(FileTitle());
        EXPECT_TRUE(Becomes(Open(), kMenuGround));

        TheDesktop().click(Open().x, Open().y);

        EXPECT_TRUE(mNotes.WaitFor("open index 0"));
        EXPECT_TRUE(Becomes(Open(), kView));
        CloseWindow(window);
    });
}

TEST_F(MenuTest, AnOpenMenuGrowsWithItsLabels) {
    RunWithDisplay([this] {
        auto* const window = OpenWithMenus();
        TheDesktop().click(FileTitle().x, FileTitle().y);
        EXPECT_TRUE(Becomes(Open(), kMenuGround));
        const Place beside = {mLeft + 250, mTop + 30};
        EXPECT_EQ(TheDesktop().pixel(beside.x, beside.y), kView);

        ASSERT_TRUE(window->Lock());
        window->file->ItemAt(2)->SetLabel("Close this window and forget everything that has been in it");
        window->Unlock();

        EXPECT_TRUE(Becomes(beside, kMenuGround));
        TheDesktop().click(mLeft + 250, Close().y);
        EXPECT_TRUE(mNotes.WaitFor("clos index 2"));
        CloseWindow(window);
    });
}

TEST_F(MenuTest, AMenuCanBeShownWithoutAnybodyChoosing) {
    struct ShownMenu : public BMenu {
        ShownMenu() : BMenu("shown") { AddItem(new BMenuItem("an item", nullptr)); }
        using BMenu::Hide;
        using BMenu::Show;
        BPoint ScreenLocation() override { return {700, 500}; }
    };
    RunWithDisplay([] {
        ShownMenu menu;
        EXPECT_EQ(TheDesktop().pixel(704, 504), 0x000000U);
        menu.Show(true);
        EXPECT_TRUE(TheDesktop().becomes(704, 504, kSelection));
        menu.Hide();
        EXPECT_TRUE(TheDesktop().becomes(704, 504, 0x000000));
        menu.Show();
        EXPECT_TRUE(TheDesktop().becomes(704, 504, kMenuGround));
    });
}

TEST_F(MenuTest, AltArrowsEnterAndEscape) {
    RunWithDisplay([this] {
        BWindow* const window = OpenWithMenus();
        TheDesktop().key("alt");
        EXPECT_TRUE(Becomes({mLeft + 4, mTop + 4}, kSelection));
        TheDesktop().key("Down");
        EXPECT_TRUE(Becomes(Open(), kSelection));
        TheDesktop().key("Escape");
        EXPECT_TRUE(Becomes(Open(), kView));
        TheDesktop().key("Escape");
        EXPECT_TRUE(mNotes.WaitFor("ended"));

        TheDesktop().key("alt+f");
        EXPECT_TRUE(Becomes(Open(), kSelection));
        TheDesktop().key("Down");
        EXPECT_TRUE(Becomes(Close(), kSelection));
        TheDesktop().key("Return");

        EXPECT_TRUE(mNotes.WaitFor("clos index 2"));
        CloseWindow(window);
    });
}

TEST_F(MenuTest, AShortcutChooses) {
    RunWithDisplay([this] {
        BWindow* const window = OpenWithMenus();

        TheDesktop().key("ctrl+o");

        EXPECT_TRUE(mNotes.WaitFor("open index 0"));
        CloseWindow(window);
    });
}

TEST_F(MenuTest, APressElsewhereClosesTheMenuAndIsSwallowed) {
    RunWithDisplay([this] {
        BWindow* const window = OpenWithMenus();
        TheDesktop().click(FileTitle().x, FileTitle().y);
        EXPECT_TRUE(Becomes(Open(), kMenuGround));
        mNotes.Take();

        TheDesktop().click(mLeft + 300, mTop + 200);

        EXPECT_TRUE(mNotes.WaitFor("ended"));
        EXPECT_TRUE(Becomes(Open(), kView));
        snooze(200000);
        for (const std::string& line : mNotes.Take()) {
            EXPECT_EQ(line.find("view: down"), std::string::npos) << line;
        }
        CloseWindow(window);
    });
}

TEST_F(MenuTest, AWindowThatComesToTheFrontClosesTheMenu) {
    RunWithDisplay([this] {
        BWindow* const window = OpenWithMenus();
        TheDesktop().click(FileTitle().x, FileTitle().y);
        EXPECT_TRUE(Becomes(Open(), kMenuGround));

        auto* const other = new NotingWindow(BRect(600, 100, 799, 299), mNotes);
        other->SetTitle("Other");
        other->Show();

        EXPECT_TRUE(mNotes.WaitFor("ended"));
        CloseWindow(other);
        CloseWindow(window);
    });
}

TEST_F(MenuTest, APopUpReturnsWhatIsChosenWhileAnotherWindowDrawsOn) {
    RunWithDisplay([this] {
        BWindow* const window = OpenWithMenus();
        auto* const other = new NotingWindow(BRect(600, 100, 799, 299), mNotes);
        other->SetTitle("Other");
        auto* const view = new NotingView(BRect(0, 0, 199, 199), "other view", mNotes);
        other->AddChild(view);
        other->Show();
        ASSERT_TRUE(mNotes.WaitFor("other view: draw"));
        snooze(300000);

        window->PostMessage(kOpenPopUp);
        EXPECT_TRUE(TheDesktop().becomes(206, 206, kMenuGround));
        ASSERT_TRUE(other->Lock());
        view->SetViewColor(10, 20, 200);
        other->Unlock();
        EXPECT_TRUE(TheDesktop().becomes(static_cast<int>(FrameOf(other).left) + 50, 250, 0x0a14c8));
        TheDesktop().click(208, 228);

        EXPECT_TRUE(mNotes.WaitFor("chose Second"));
        CloseWindow(other);
        CloseWindow(window);
    });
}

TEST_F(MenuTest, AnAlertIsAnsweredByKeys) {
    RunWithDisplay([this] {
        BWindow* const window = OpenWithMenus();
        window->PostMessage(kAsk);
        ASSERT_NE(TheDesktop().window("Ask"), "");
        snooze(500000);

        TheDesktop().key("Left");
        TheDesktop().key("space");

        EXPECT_TRUE(mNotes.WaitFor("answer 0"));
        CloseWindow(window);
    });
}
