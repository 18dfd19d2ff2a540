// The find window: what it consists of, its messages, and how it goes.
#include "FindWindowStage.h"

#include "support/captured_output.h"

#include <Menu.h>
#include <MenuBar.h>
#include <MenuItem.h>
#include <NodeMonitor.h>
#include <Query.h>
#include <TextView.h>

namespace {

class FindWindowTest : public FindWindowStage {};

TEST_F(FindWindowTest, TellsTheApplicationOfItself) {
    EXPECT_TRUE(mApp->FindWindowSlot().IsEmpty());
    Open();
    WithWindow([&] {
        EXPECT_STREQ(mWindow->Title(), "Find song");
        EXPECT_EQ(mWindow->Type(), B_DOCUMENT_WINDOW);
        EXPECT_EQ(mWindow->Flags(), 0u);
        EXPECT_FALSE(mWindow->IsHidden());
        EXPECT_EQ(mWindow->Frame(), BRect(300, 30, 750, 230));
    });
}

TEST_F(FindWindowTest, HoldsAMenuBarAFieldAndAListInFrontOfDarkBlue) {
    Open();
    WithWindow([&] {
        const BView* const back = mWindow->FindView("back");
        ASSERT_NE(back, nullptr);
        EXPECT_EQ(back->Frame(), BRect(0, 0, 450, 200));
        EXPECT_EQ(back->ViewColor(), (rgb_color{34, 34, 119, 255}));
        ASSERT_NE(mWindow->FindView("menubar"), nullptr);
        EXPECT_EQ(mWindow->FindView("menubar")->Frame().LeftTop(), BPoint(0, 0));

        BTextControl* const field = Field();
        ASSERT_NE(field, nullptr);
        EXPECT_EQ(field->Frame().LeftTop(), BPoint(5, 25));
        EXPECT_EQ(field->Frame().right, 240);
        EXPECT_EQ(field->Label(), nullptr);
        EXPECT_STREQ(field->Text(), "");
        EXPECT_EQ(field->Command(), 700u);
        EXPECT_EQ(field->Divider(), 0);
        EXPECT_EQ(field->ResizingMode() & 0xFFFFu, B_FOLLOW_LEFT | B_FOLLOW_RIGHT);
        EXPECT_TRUE(field->TextView()->IsFocus());

        const BRect list = mWindow->List()->ConvertToScreen(mWindow->List()->Bounds());
        EXPECT_EQ(list.RightBottom(), BPoint(300 + 436, 30 + 186));
        EXPECT_EQ(list.left, 300);
        EXPECT_GT(list.top, 30 + 48 + 14);

        // The bar spans the window, the field keeps its width.
        mWindow->ResizeBy(100, 50);
        EXPECT_EQ(mWindow->FindView("menubar")->Frame().right, 550);
        EXPECT_EQ(field->Frame().right, 240);
    });
}

TEST_F(FindWindowTest, HasTheFileMenu) {
    Open();
    WithWindow([&] {
        const auto* const bar = dynamic_cast<BMenuBar*>(mWindow->FindView("menubar"));
        ASSERT_EQ(bar->CountItems(), 1);
        const BMenu* const file = bar->SubmenuAt(0);
        ASSERT_EQ(file->CountItems(), 4);
        EXPECT_EQ(file->ItemAt(0)->Command(), 105u);
        EXPECT_EQ(file->ItemAt(1)->Command(), 107u);
        EXPECT_STREQ(file->ItemAt(3)->Label(), "Close");
        EXPECT_EQ(file->ItemAt(3)->Command(), 106u);
    });
}

TEST_F(FindWindowTest, PassesTheApplicationsCodesOnButNotItsOwn) {
    Open();
    for (const uint32 code : {101u, 102u, 103u, 107u}) {
        Post(BMessage(code));
        EXPECT_NE(SentToApp(code), nullptr) << code;
    }
    for (const uint32 code : {100u, 104u, 105u, 108u, 700u, 705u}) {
        Post(BMessage(code));
        EXPECT_EQ(SentToApp(code), nullptr) << code;
    }
}

TEST_F(FindWindowTest, SaysWhichWindowIsToClose) {
    Open();
    Post(BMessage(106));
    const BMessage* const message = SentToApp(106);
    ASSERT_NE(message, nullptr);
    EXPECT_EQ(message->GetPointer("winptr"), mWindow);
}

TEST_F(FindWindowTest, ItsCloseBoxEndsTheApplicationWhenNoIndexerIsOpen) {
    Open();
    mWindow->PostMessage(B_QUIT_REQUESTED);
    for (int i = 0; i < 2000 && mApp->CountLoopers() > 1; ++i)
        snooze(5000);
    EXPECT_TRUE(mApp->FindWindowSlot().IsEmpty());
    EXPECT_NE(SentToApp(B_QUIT_REQUESTED), nullptr);
}

TEST_F(FindWindowTest, NewsOfVolumesAndQueriesArePrintedAndChangeNothing) {
    MakeSong("a.mp3", "Alpha");
    Open();
    ASSERT_EQ(Find("Alpha"), Names{"a.mp3"});
    BMessage update(B_QUERY_UPDATE);
    update.AddString("name", "new.mp3");
    update.AddInt32("opcode", 1);
    CapturedOutput output;
    Post(BMessage(6));
    Post(BMessage(7));
    Post(update);
    Post(BMessage(B_QUERY_UPDATE));
    EXPECT_EQ(output.text(), "B_DEVICE_MOUNTED recv'd\n"
                             "B_DEVICE_UNMOUNTED recv'd\n"
                             "B_QUERY_UPDATE recv'd 'new.mp3'\n"
                             "B_QUERY_UPDATE recv'd ''\n");
    EXPECT_EQ(Rows(), Names{"a.mp3"});
}

TEST_F(FindWindowTest, ANodeMonitorsMessageIsNotTakenForItsOpcode) {
    Open();
    BMessage news(B_NODE_MONITOR);
    news.AddInt32("opcode", B_DEVICE_MOUNTED);
    CapturedOutput output;
    Post(news);
    EXPECT_EQ(output.text(), "");
}

TEST_F(FindWindowTest, SettingsAreItsFrame) {
    Open();
    BMessage saved;
    WithWindow([&] {
        mWindow->SavePreferences(&saved);
        mWindow->SavePreferences(nullptr);
        mWindow->LoadPreferences(nullptr);
        EXPECT_EQ(mWindow->Frame(), BRect(300, 30, 750, 230));
    });
    EXPECT_EQ(saved.CountNames(B_FLOAT_TYPE), 4);
    EXPECT_EQ(saved.GetFloat("winX", -1), 300);
    EXPECT_EQ(saved.GetFloat("winY", -1), 30);
    EXPECT_EQ(saved.GetFloat("winWidth", -1), 450);
    EXPECT_EQ(saved.GetFloat("winHeight", -1), 200);
}

// Without a display no frame lies on the screen.
TEST_F(FindWindowTest, AFrameOffTheScreenIsReplaced) {
    BMessage settings;
    settings.AddFloat("winX", 5000);
    Open(&settings);
    WithWindow([&] { EXPECT_EQ(mWindow->Frame(), BRect(0, 0, 400, 150)); });
}

} // namespace
