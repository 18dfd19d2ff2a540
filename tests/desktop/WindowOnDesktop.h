// What the tests on a desktop have in common: one screen for the program, windows with one view each.
#pragma once

#include "kits/interface/WindowWithApplication.h"
#include "support/desktop.h"
#include "support/temporary_environment.h"

#include <gtest/gtest.h>

// The screen of the whole program, made at the first call.
test::Desktop& TheDesktop();

// Every test has surroundings of its own, and an application whose `body` runs beside the main thread.
class WindowOnDesktop : public testing::Test {
  protected:
    void SetUp() override { ASSERT_TRUE(TheDesktop().works()); }
    // A window with one view, of that colour, whose name is "view"; shown and drawn.
    NotingWindow* Open(BRect frame, const char* title, NotingView* view, rgb_color color, uint32 flags = 0,
                       window_type type = B_TITLED_WINDOW) {
        auto* const window = new NotingWindow(frame, mNotes, flags, type);
        window->SetTitle(title);
        view->ResizeTo(frame.Width(), frame.Height());
        view->SetViewColor(color);
        window->AddChild(view);
        window->Show();
        EXPECT_NE(TheDesktop().window(title), "");
        EXPECT_TRUE(mNotes.WaitFor("view: draw"));
        return window;
    }
    NotingView* MakeView(uint32 flags = B_WILL_DRAW | B_NAVIGABLE) {
        return new NotingView(BRect(0, 0, 9, 9), "view", mNotes, flags);
    }
    static BRect FrameOf(BWindow* window) {
        const BAutolock lock(window);
        return window->Frame();
    }
    static void Close(BWindow* window) {
        ASSERT_TRUE(window->Lock());
        window->Quit();
    }

    test::TemporaryEnvironment mEnvironment;
    Notes mNotes;
};
