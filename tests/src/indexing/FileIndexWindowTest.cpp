// The indexer window's rows, buttons and messages. What is seen and clicked is tested in tests/desktop.
#include "IndexerWindow.h"

#include <Menu.h>
#include <MenuBar.h>
#include <MenuItem.h>

#include <string>
#include <vector>

namespace {

TEST_F(IndexerWindow, TellsTheApplicationOfItself) {
    EXPECT_TRUE(mApp->IndexWindowSlot().IsEmpty());
    Open();
    WithWindow([&] {
        EXPECT_STREQ(mWindow->Title(), "Indexer");
        EXPECT_EQ(mWindow->Type(), B_TITLED_WINDOW);
        EXPECT_FALSE(mWindow->IsHidden());
        EXPECT_EQ(mWindow->PulseRate(), 200000);
        EXPECT_EQ(mWindow->Frame(), BRect(100, 100, 550, 300));
    });
}

TEST_F(IndexerWindow, ListsThePersistentVolumesInTheirOrder) {
    Open();
    WithWindow([&] {
        std::vector<std::string> names;
        for (int32 i = 0; i < List()->CountItems(); ++i) {
            char name[B_FILE_NAME_LENGTH];
            ASSERT_EQ(Row(i)->Entry().volume->GetName(name), B_OK);
            names.push_back(name);
            EXPECT_TRUE(Row(i)->Entry().query);
            EXPECT_EQ(Row(i)->Entry().knowsQuery, std::string(name) != "class");
        }
        names.resize(5);
        EXPECT_EQ(names,
                  (std::vector<std::string>{"Music", "Second", "Passing",
                                            "Everything that was ever recorded in the old barn", "class"}));
        EXPECT_EQ(List()->ListType(), B_SINGLE_SELECTION_LIST);
        EXPECT_EQ(List()->SelectionCommand(), 709u);
        EXPECT_EQ(List()->CurrentSelection(), 0);
        EXPECT_TRUE(List()->IsFocus());
    });
}

TEST_F(IndexerWindow, HasFourButtonsInARowAtTheBottom) {
    Open();
    WithWindow([&] {
        const struct {
            const char *name, *label;
            uint32 command;
        } buttons[] = {
            {"stat", "Status", 710}, {"strip", "Strip", 711}, {"stop", "Stop", 712}, {"index", "Index", 713}};
        float right = 7;
        for (const auto& expected : buttons) {
            BButton* const button = Button(expected.name);
            ASSERT_NE(button, nullptr);
            EXPECT_STREQ(button->Label(), expected.label);
            EXPECT_EQ(button->Command(), expected.command);
            EXPECT_GE(button->Frame().left, right) << "they do not overlap";
            EXPECT_EQ(button->Frame().bottom, 193);
            EXPECT_EQ(button->Frame().top, Button("stat")->Frame().top);
            right = button->Frame().right + 1;
            float width = 0;
            float height = 0;
            button->GetPreferredSize(&width, &height);
            EXPECT_GE(button->Frame().Width(), width) << "the label fits";
        }
        EXPECT_LE(right, 444);
    });
}

TEST_F(IndexerWindow, TheListGrowsWithTheWindowAndTheButtonsStayBelow) {
    Open();
    WithWindow([&] {
        const BRect list = List()->Bounds();
        const BRect button = Button("index")->Frame();
        mWindow->ResizeBy(100, 50);
        EXPECT_EQ(List()->Bounds().Width(), list.Width() + 100);
        EXPECT_EQ(List()->Bounds().Height(), list.Height() + 50);
        EXPECT_EQ(Button("index")->Frame(), button.OffsetByCopy(0, 50));
    });
}

TEST_F(IndexerWindow, IsNeverSmallerThanItOpened) {
    Open();
    WithWindow([&] {
        float minWidth = 0;
        float maxWidth = 0;
        float minHeight = 0;
        float maxHeight = 0;
        mWindow->GetSizeLimits(&minWidth, &maxWidth, &minHeight, &maxHeight);
        EXPECT_EQ(minWidth, 450);
        EXPECT_EQ(minHeight, 200);
        EXPECT_EQ(maxWidth, 1000000);
        EXPECT_EQ(maxHeight, 1000000);
        mWindow->ResizeTo(10, 10);
        EXPECT_EQ(mWindow->Bounds(), BRect(0, 0, 450, 200));
    });
}

TEST_F(IndexerWindow, HasTheFileMenuOfAllWindows) {
    Open();
    WithWindow([&] {
        auto* const bar = dynamic_cast<BMenuBar*>(mWindow->FindView("menubar"));
        ASSERT_NE(bar, nullptr);
        ASSERT_EQ(bar->CountItems(), 1);
        BMenu* const menu = bar->SubmenuAt(0);
        EXPECT_STREQ(menu->Name(), "File");
        ASSERT_EQ(menu->CountItems(), 4);
        EXPECT_STREQ(menu->ItemAt(0)->Label(), "Find song...");
        EXPECT_EQ(menu->ItemAt(0)->Command(), 105u);
        EXPECT_EQ(menu->ItemAt(0)->Shortcut(), 'F');
        EXPECT_STREQ(menu->ItemAt(1)->Label(), "File indexer, disks...");
        EXPECT_EQ(menu->ItemAt(1)->Command(), 107u);
        EXPECT_EQ(menu->ItemAt(1)->Shortcut(), 'D');
        EXPECT_NE(dynamic_cast<BSeparatorItem*>(menu->ItemAt(2)), nullptr);
        EXPECT_STREQ(menu->ItemAt(3)->Label(), "Close");
        EXPECT_EQ(menu->ItemAt(3)->Command(), 108u);
        EXPECT_EQ(menu->ItemAt(3)->Shortcut(), 'W');
    });
}

TEST_F(IndexerWindow, ButtonsFollowTheSelectedRow) {
    Open();
    EXPECT_EQ(Enabled(), "strip index ");
    Select(kUnsupportedRow);
    EXPECT_EQ(Enabled(), "");
    Select(kSecondRow);
    EXPECT_EQ(Enabled(), "strip index ");
}

TEST_F(IndexerWindow, ButtonsStayAsTheyAreWithoutASelection) {
    Open();
    WithWindow([&] { List()->DeselectAll(); });
    Settle();
    EXPECT_EQ(Enabled(), "strip index ");
    for (const uint32 code : {710, 711, 712, 713})
        Post(code);
    EXPECT_EQ(Enabled(), "strip index ");
    WithWindow([&] {
        for (int32 i = 0; i < List()->CountItems(); ++i) {
            EXPECT_EQ(Row(i)->State(), kJobNeverStarted);
            EXPECT_EQ(Row(i)->Thread(), 0);
        }
    });
}

TEST_F(IndexerWindow, TheListGetsTheKeyboardOfAButtonThatIsDisabled) {
    Open();
    WithWindow([&] { Button("index")->MakeFocus(); });
    Select(kSecondRow);
    WithWindow([&] { EXPECT_TRUE(Button("index")->IsFocus()) << "it is still enabled"; });
    Post(710);
    WithWindow([&] {
        EXPECT_TRUE(List()->IsFocus());
        Button("stop")->MakeFocus();
    });
    Post(712);
    WithWindow([&] { EXPECT_TRUE(List()->IsFocus()); });
}

TEST_F(IndexerWindow, IndexesAndStripsTheSelectedVolume) {
    MakeFiles(3);
    Open();
    Post(713);
    ASSERT_TRUE(WaitUntil([&] { return Row(kMusicRow)->IsDone(); }));
    EXPECT_EQ(CountTagged(), 3);
    EXPECT_EQ(Enabled(), "stop ") << "until the next pulse";
    Pulse();
    EXPECT_EQ(Enabled(), "strip index ");
    EXPECT_FALSE(Row(kMusicRow)->IsDone());
    EXPECT_EQ(StatusTextOf(*Row(kMusicRow)), "Indexed 3 files");

    Post(711);
    ASSERT_TRUE(WaitUntil([&] { return Row(kMusicRow)->IsDone(); }));
    EXPECT_EQ(CountTagged(), 0);
    EXPECT_EQ(StatusTextOf(*Row(kMusicRow)), "Striped 3 files");
    EXPECT_EQ(Row(kSecondRow)->State(), kJobNeverStarted);
}

TEST_F(IndexerWindow, StopsTheSelectedJob) {
    Open();
    Post(710);
    EXPECT_EQ(Enabled(), "stop ");
    Post(712);
    EXPECT_EQ(Enabled(), "strip index ");
    EXPECT_EQ(StatusTextOf(*Row(kMusicRow)), "Cancelled.");
}

TEST_F(IndexerWindow, ASecondPressThatComesTooSoonStartsNoSecondJob) {
    Open();
    Post(710);
    const thread_id thread = Row(kMusicRow)->Thread();
    Post(713);
    EXPECT_EQ(Row(kMusicRow)->Thread(), thread);
    EXPECT_EQ(Row(kMusicRow)->State(), kJobStatus);
    Post(712);
}

TEST_F(IndexerWindow, ButtonsAreThoseOfTheSelectedRowWhileAnotherWorks) {
    Open();
    Post(710);
    Select(kSecondRow);
    EXPECT_EQ(Enabled(), "strip index ");
    Pulse();
    EXPECT_EQ(Enabled(), "strip index ") << "a job at work changes no button";
    Select(kUnsupportedRow);
    EXPECT_EQ(Enabled(), "");
    Select(kMusicRow);
    EXPECT_EQ(Enabled(), "stop ");
    Post(712);
}

TEST_F(IndexerWindow, ButtonsFollowTheRowWhoseJobEndsWhicheverIsSelected) {
    Open();
    Post(713);
    ASSERT_TRUE(WaitUntil([&] { return Row(kMusicRow)->IsDone(); }));
    Select(kUnsupportedRow);
    EXPECT_EQ(Enabled(), "");
    Pulse();
    EXPECT_EQ(Enabled(), "strip index ");
    Select(kSecondRow);
    Select(kUnsupportedRow);
    Pulse();
    EXPECT_EQ(Enabled(), "") << "a job's end is told once";
}

TEST_F(IndexerWindow, PassesTheApplicationsCodesOn) {
    Open();
    for (const uint32 code : {101, 102, 103, 105, 107, 108}) {
        Post(code);
        EXPECT_EQ(CountSentToApp(code), 1) << code;
    }
    for (const uint32 code : {100, 104, 106, 700}) {
        Post(code);
        EXPECT_EQ(CountSentToApp(code), 0) << code;
    }
}

TEST_F(IndexerWindow, SettingsAreItsFrame) {
    Open();
    BMessage saved;
    WithWindow([&] {
        mWindow->SavePreferences(&saved);
        mWindow->SavePreferences(nullptr);
        mWindow->LoadPreferences(nullptr);
        EXPECT_EQ(mWindow->Frame(), BRect(100, 100, 550, 300));
    });
    EXPECT_EQ(saved.CountNames(B_FLOAT_TYPE), 4);
    EXPECT_EQ(saved.GetFloat("winX", -1), 100);
    EXPECT_EQ(saved.GetFloat("winY", -1), 100);
    EXPECT_EQ(saved.GetFloat("winWidth", -1), 450);
    EXPECT_EQ(saved.GetFloat("winHeight", -1), 200);
}

// Without a display no frame lies on the screen.
TEST_F(IndexerWindow, AFrameOffTheScreenIsReplaced) {
    BMessage settings;
    settings.AddFloat("winX", 5000);
    Open(&settings);
    WithWindow([&] { EXPECT_EQ(mWindow->Frame(), BRect(0, 0, 400, 150)); });
}

} // namespace
