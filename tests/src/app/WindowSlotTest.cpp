// The application's places for its windows, and the codes that open and close what is in them. Windows of no
// kind stand in for the find window and the playlist window. No application runs here, so that what it sends
// itself can be looked at.
#include "app/WindowSlot.h"

#include "TrackVolume.h"
#include "app/AppMessages.h"
#include "app/QuirnelApp.h"

#include "support/captured_output.h"

#include <File.h>
#include <Message.h>
#include <MessageQueue.h>
#include <Window.h>

#include <memory>

namespace {

class ApplicationsWindows : public TrackTest {
  protected:
    ApplicationsWindows() {
        TestVolumes::Instance();
        mApp = std::make_unique<QuirnelApp>();
        brindle_app = mApp.get();
    }
    ~ApplicationsWindows() override {
        for (WindowSlot* slot :
             {&mApp->IndexWindowSlot(), &mApp->FindWindowSlot(), &mApp->PlayListWindowSlot()})
            slot->Close();
        mApp.reset();
        brindle_app = nullptr;
    }

    static BWindow* StandIn(WindowSlot& slot) {
        auto* const window = new BWindow(BRect(100, 100, 199, 199), "Stand-in", B_TITLED_WINDOW, 0);
        slot.Fill(window);
        window->Show();
        return window;
    }
    void Receive(uint32 what) {
        BMessage message(what);
        mApp->MessageReceived(&message);
    }
    // How often the application has asked itself to quit.
    int QuitRequests() const {
        int count = 0;
        while (mApp->MessageQueue()->FindMessage(B_QUIT_REQUESTED, count) != nullptr)
            ++count;
        return count;
    }

    std::unique_ptr<QuirnelApp> mApp;
};

TEST_F(ApplicationsWindows, ClosingWhatIsNotOpenDoesNothingButAskWhetherToQuit) {
    Receive(104);
    EXPECT_EQ(QuitRequests(), 0) << "the playlist window does not count";
    Receive(106);
    EXPECT_EQ(QuitRequests(), 1);
    Receive(108);
    EXPECT_EQ(QuitRequests(), 2);
}

TEST_F(ApplicationsWindows, TheProgramRunsUntilBothMainWindowsAreClosed) {
    StandIn(mApp->PlayListWindowSlot());
    StandIn(mApp->FindWindowSlot());
    StandIn(mApp->IndexWindowSlot());

    Receive(106);
    EXPECT_TRUE(mApp->FindWindowSlot().IsEmpty());
    EXPECT_FALSE(mApp->IndexWindowSlot().IsEmpty());
    EXPECT_EQ(QuitRequests(), 0);
    mApp->MaybeQuit();
    EXPECT_EQ(QuitRequests(), 0);

    Receive(108);
    EXPECT_TRUE(mApp->IndexWindowSlot().IsEmpty());
    EXPECT_FALSE(mApp->PlayListWindowSlot().IsEmpty());
    EXPECT_EQ(QuitRequests(), 1) << "the playlist window does not keep the program";
    mApp->MaybeQuit();
    EXPECT_EQ(QuitRequests(), 2);
}

TEST_F(ApplicationsWindows, TheIndexersCloseLeavesTheFindWindowAndTheProgram) {
    StandIn(mApp->FindWindowSlot());
    Receive(107);
    ASSERT_FALSE(mApp->IndexWindowSlot().IsEmpty());

    Receive(108);

    EXPECT_TRUE(mApp->IndexWindowSlot().IsEmpty());
    EXPECT_FALSE(mApp->FindWindowSlot().IsEmpty());
    EXPECT_EQ(QuitRequests(), 0);
}

TEST_F(ApplicationsWindows, TheIndexersCloseBoxLeavesTheFindWindowAndTheProgram) {
    StandIn(mApp->FindWindowSlot());
    Receive(107);
    BMessenger indexer;
    mApp->IndexWindowSlot().UseLocked([&](BWindow* window) { indexer = BMessenger(window); });

    indexer.SendMessage(B_QUIT_REQUESTED);
    for (int i = 0; i < 2000 && indexer.IsValid(); ++i)
        snooze(10000);

    EXPECT_FALSE(indexer.IsValid());
    EXPECT_TRUE(mApp->IndexWindowSlot().IsEmpty());
    EXPECT_EQ(QuitRequests(), 0);
}

TEST_F(ApplicationsWindows, ClosingThePlaylistWindowNeverEndsTheProgram) {
    StandIn(mApp->PlayListWindowSlot());
    Receive(104);
    EXPECT_TRUE(mApp->PlayListWindowSlot().IsEmpty());
    EXPECT_EQ(QuitRequests(), 0);
}

TEST_F(ApplicationsWindows, AWindowThatIsOpenIsNotOpenedAgain) {
    StandIn(mApp->PlayListWindowSlot());
    StandIn(mApp->FindWindowSlot());
    BWindow* const indexer = StandIn(mApp->IndexWindowSlot());
    CapturedOutput output;

    for (const uint32 code : {103, 105, 107})
        Receive(code);

    EXPECT_EQ(output.text(), "");
    BWindow* found = nullptr;
    mApp->IndexWindowSlot().UseLocked([&](BWindow* window) { found = window; });
    EXPECT_EQ(found, indexer);
}

TEST_F(ApplicationsWindows, CodesThatAreReservedOrNoneDoNothing) {
    CapturedOutput output;
    for (const uint32 code : {0, 100, 101, 102, 109, 700, 709, 714})
        Receive(code);
    EXPECT_EQ(output.text(), "");
    EXPECT_EQ(QuitRequests(), 0);
    EXPECT_TRUE(mApp->IndexWindowSlot().IsEmpty());
}

TEST_F(ApplicationsWindows, QuittingClosesTheMainWindowsAndLeavesThePlaylist) {
    StandIn(mApp->PlayListWindowSlot());
    Receive(107);

    EXPECT_TRUE(mApp->QuitRequested());

    EXPECT_TRUE(mApp->IndexWindowSlot().IsEmpty());
    EXPECT_FALSE(mApp->PlayListWindowSlot().IsEmpty());
}

TEST_F(ApplicationsWindows, AWindowThatCannotBeLockedIsNotClosedAndItsSlotIsEmptyAllTheSame) {
    WindowSlot slot;
    BWindow* const window = StandIn(slot);
    ASSERT_TRUE(window->Lock());
    window->Quit();
    ASSERT_FALSE(slot.IsEmpty()) << "it has gone without a word";

    EXPECT_FALSE(slot.Activate());
    bool used = false;
    slot.UseLocked([&](BWindow*) { used = true; });
    EXPECT_FALSE(used);
    slot.Close();
    EXPECT_TRUE(slot.IsEmpty());
}

TEST_F(ApplicationsWindows, OnlyItsOwnWindowEmptiesASlot) {
    WindowSlot slot;
    BWindow* const window = StandIn(slot);
    WindowSlot other;
    BWindow* const stranger = StandIn(other);

    slot.Empty(stranger);
    EXPECT_FALSE(slot.IsEmpty());
    slot.Empty(window);
    EXPECT_TRUE(slot.IsEmpty());
    slot.Close();
    other.Close();
    ASSERT_TRUE(window->Lock());
    window->Quit();
}

} // namespace
