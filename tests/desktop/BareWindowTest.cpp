// Windows on a display without a window manager.
#include "desktop/WindowOnDesktop.h"

namespace {

constexpr rgb_color kBlue = {10, 20, 200, 255};

class BareWindowTest : public WindowOnDesktop {};

} // namespace

TEST_F(BareWindowTest, ItIsShownMovedAndHeardOfAllTheSame) {
    RunApplication([this] {
        BWindow* const window = Open(BRect(300, 200, 599, 399), "Bare", MakeView(), kBlue);
        EXPECT_TRUE(TheDesktop().becomes(300, 200, 0x0a14c8));
        EXPECT_EQ(FrameOf(window), BRect(300, 200, 599, 399));
        ASSERT_TRUE(window->Lock());
        window->MoveTo(500, 450);
        window->ResizeTo(199, 99);
        window->Unlock();
        EXPECT_TRUE(TheDesktop().becomes(300, 200, 0x000000));
        EXPECT_TRUE(TheDesktop().becomes(699, 549, 0x0a14c8));
        EXPECT_EQ(FrameOf(window), BRect(500, 450, 699, 549));
        TheDesktop().click(520, 480);
        EXPECT_TRUE(mNotes.WaitFor("view: down 20,30 buttons 1 clicks 1"));
        Close(window);
    });
}

TEST_F(BareWindowTest, AnActivatedWindowGetsTheKeys) {
    RunApplication([this] {
        BWindow* const window = Open(BRect(300, 200, 599, 399), "Keys", MakeView(), kBlue);
        ASSERT_TRUE(window->Lock());
        window->FindView("view")->MakeFocus();
        window->Activate();
        window->Unlock();
        EXPECT_TRUE(mNotes.WaitFor("window: active"));
        TheDesktop().key("q");
        EXPECT_TRUE(mNotes.WaitFor("view: key q"));
        Close(window);
    });
}
