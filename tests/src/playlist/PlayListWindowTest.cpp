// The playlist window without a display. The application object does not run here, so that what it is sent
// can be looked at.
#include "playlist/PlayListWindow.h"

#include "TrackVolume.h"
#include "app/QuirnelApp.h"
#include "playlist/PlayListView.h"

#include <Menu.h>
#include <MenuBar.h>
#include <MenuItem.h>
#include <MessageQueue.h>

#include <memory>

namespace {

class PlayListWindowTest : public TrackTest {
  protected:
    PlayListWindowTest() {
        TestVolumes::Instance();
        mApp = std::make_unique<QuirnelApp>();
        brindle_app = mApp.get();
    }
    ~PlayListWindowTest() override {
        mApp->PlayListWindowSlot().Close();
        mApp.reset();
        brindle_app = nullptr;
    }
    void Open(BMessage* settings = nullptr) { mWindow = new PlayListWindow(settings); }
    template <typename Use>
    void WithWindow(Use use) {
        bool used = false;
        mApp->PlayListWindowSlot().UseLocked([&](BWindow*) {
            use();
            used = true;
        });
        ASSERT_TRUE(used);
    }
    void Post(uint32 what) {
        mWindow->PostMessage(what);
        BMessage reply;
        EXPECT_EQ(BMessenger(mWindow).SendMessage('sync', &reply), B_OK);
    }
    const BMessage* SentToApp(uint32 what) const { return mApp->MessageQueue()->FindMessage(what, 0); }

    std::unique_ptr<QuirnelApp> mApp;
    PlayListWindow* mWindow = nullptr;
};

TEST_F(PlayListWindowTest, TellsTheApplicationOfItself) {
    EXPECT_TRUE(mApp->PlayListWindowSlot().IsEmpty());
    Open();
    WithWindow([&] {
        EXPECT_STREQ(mWindow->Title(), "Playlist");
        EXPECT_EQ(mWindow->Type(), B_DOCUMENT_WINDOW);
        EXPECT_EQ(mWindow->Flags(), 0u);
        EXPECT_FALSE(mWindow->IsHidden());
        EXPECT_EQ(mWindow->PulseRate(), 40000);
        EXPECT_EQ(mWindow->Frame(), BRect(300, 30, 600, 230));
    });
}

TEST_F(PlayListWindowTest, HoldsAMenuBarAndTheListInFrontOfDarkBlue) {
    Open();
    WithWindow([&] {
        const BView* const back = mWindow->FindView("back");
        ASSERT_NE(back, nullptr);
        EXPECT_EQ(back->Frame(), BRect(0, 0, 300, 200));
        EXPECT_EQ(back->ViewColor(), (rgb_color{34, 34, 119, 255}));
        const BView* const menuBar = mWindow->FindView("menubar");
        ASSERT_NE(menuBar, nullptr);
        EXPECT_EQ(menuBar->Frame().LeftTop(), BPoint(0, 0));
        EXPECT_EQ(menuBar->Parent(), back);

        EXPECT_EQ(mWindow->FindView("playlist"), mWindow->List());
        EXPECT_TRUE(mWindow->List()->IsFocus());
        // Header and list together, without the bars.
        const BRect list = mWindow->List()->ConvertToScreen(mWindow->List()->Bounds());
        EXPECT_EQ(list.RightBottom(), BPoint(300 + 286, 30 + 186));
        EXPECT_EQ(list.left, 300);
        EXPECT_GT(list.top, 30 + 20 + 14);

        mWindow->ResizeBy(100, 50);
        EXPECT_EQ(mWindow->List()->ConvertToScreen(mWindow->List()->Bounds()).RightBottom(),
                  list.RightBottom() + BPoint(100, 50));
        EXPECT_EQ(back->Frame(), BRect(0, 0, 400, 250));
        EXPECT_EQ(menuBar->Frame().right, 400);
    });
}

TEST_F(PlayListWindowTest, HasTheFileMenu) {
    Open();
    WithWindow([&] {
        const auto* const bar = dynamic_cast<BMenuBar*>(mWindow->FindView("menubar"));
        ASSERT_EQ(bar->CountItems(), 1);
        const BMenu* const file = bar->SubmenuAt(0);
        EXPECT_STREQ(bar->ItemAt(0)->Label(), "File");
        ASSERT_EQ(file->CountItems(), 4);
        const struct {
            const char* label;
            uint32 code;
            char shortcut;
        } items[] = {{"Find song...", 105, 'F'},
                     {"File indexer, disks...", 107, 'D'},
                     {nullptr, 0, 0},
                     {"Close", 104, 'W'}};
        for (int32 i = 0; i < 4; ++i) {
            if (items[i].label == nullptr)
                continue;
            uint32 modifiers = 0;
            EXPECT_STREQ(file->ItemAt(i)->Label(), items[i].label);
            EXPECT_EQ(file->ItemAt(i)->Command(), items[i].code);
            EXPECT_EQ(file->ItemAt(i)->Shortcut(&modifiers), items[i].shortcut);
        }
    });
}

TEST_F(PlayListWindowTest, PassesTheApplicationsCodesOn) {
    Open();
    for (const uint32 code : {102u, 103u, 105u, 107u}) {
        Post(code);
        EXPECT_NE(SentToApp(code), nullptr) << code;
    }
    for (const uint32 code : {100u, 101u, 106u, 108u, 700u, 705u, 708u}) {
        Post(code);
        EXPECT_EQ(SentToApp(code), nullptr) << code;
    }
}

TEST_F(PlayListWindowTest, SaysWhichWindowIsToClose) {
    Open();
    Post(104);
    const BMessage* const message = SentToApp(104);
    ASSERT_NE(message, nullptr);
    EXPECT_EQ(message->GetPointer("winptr"), mWindow);
}

TEST_F(PlayListWindowTest, ItsCloseBoxLeavesTheApplicationRunningThoughNoOtherWindowIsOpen) {
    Open();
    mWindow->PostMessage(B_QUIT_REQUESTED);
    for (int i = 0; i < 2000 && mApp->CountLoopers() > 1; ++i)
        snooze(5000);
    EXPECT_EQ(mApp->CountLoopers(), 1) << "the window is gone";
    EXPECT_TRUE(mApp->PlayListWindowSlot().IsEmpty());
    EXPECT_EQ(SentToApp(B_QUIT_REQUESTED), nullptr) << "and nobody was asked to end";
}

TEST_F(PlayListWindowTest, TheNextWindowIsEmpty) {
    entry_ref ref = RefOf(MakeFile("song.mp3"));
    Open();
    WithWindow([&] {
        mWindow->List()->AddToList(&ref);
        EXPECT_EQ(mWindow->List()->CountItems(), 1);
    });
    mApp->PlayListWindowSlot().Close();
    Open();
    WithWindow([&] { EXPECT_EQ(mWindow->List()->CountItems(), 0); });
}

TEST_F(PlayListWindowTest, SettingsAreItsFrame) {
    Open();
    BMessage saved;
    WithWindow([&] {
        mWindow->SavePreferences(&saved);
        mWindow->SavePreferences(nullptr);
        mWindow->LoadPreferences(nullptr);
        EXPECT_EQ(mWindow->Frame(), BRect(300, 30, 600, 230));
    });
    EXPECT_EQ(saved.CountNames(B_FLOAT_TYPE), 4);
    EXPECT_EQ(saved.GetFloat("winX", -1), 300);
    EXPECT_EQ(saved.GetFloat("winY", -1), 30);
    EXPECT_EQ(saved.GetFloat("winWidth", -1), 300);
    EXPECT_EQ(saved.GetFloat("winHeight", -1), 200);
}

// Without a display no frame lies on the screen.
TEST_F(PlayListWindowTest, AFrameOffTheScreenIsReplaced) {
    BMessage settings;
    settings.AddFloat("winX", 5000);
    Open(&settings);
    WithWindow([&] { EXPECT_EQ(mWindow->Frame(), BRect(0, 0, 400, 150)); });
}

} // namespace
