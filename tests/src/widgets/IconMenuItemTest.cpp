#include "widgets/IconMenuItem.h"

#include "support/captured_output.h"
#include "support/temporary_environment.h"

#include <Application.h>
#include <Bitmap.h>
#include <Menu.h>
#include <Messenger.h>
#include <Roster.h>

#include <gtest/gtest.h>

#include <filesystem>
#include <thread>

namespace {

// In a home of its own, so that nothing of the user's is started or changed.
class IconMenuItemTest : public testing::Test {
  protected:
    std::string MakeFile(const std::string& name) {
        const std::string path = mEnvironment.root() + "/" + name;
        test::write_file(path, "song");
        return path;
    }

    test::TemporaryEnvironment mEnvironment;
};

uint32 PixelAt(const BBitmap& bitmap, int32 x, int32 y) {
    const auto* const row = static_cast<const uint8*>(bitmap.Bits()) + y * bitmap.BytesPerRow();
    return reinterpret_cast<const uint32*>(row)[x] & 0xFFFFFF;
}

// How many pixels of the rectangle differ from the menu's ground.
int CountInked(const BBitmap& bitmap, int32 left, int32 top, int32 right, int32 bottom) {
    int count = 0;
    for (int32 y = top; y <= bottom; ++y) {
        for (int32 x = left; x <= right; ++x)
            count += PixelAt(bitmap, x, y) != 0xD8D8D8;
    }
    return count;
}

// The menu's picture, with its left top corner at (0, 0).
std::unique_ptr<BBitmap> PictureOf(BMenu* menu) {
    float width = 0;
    float height = 0;
    menu->GetPreferredSize(&width, &height);
    auto picture = std::make_unique<BBitmap>(BRect(0, 0, width, height), B_RGB32, true);
    picture->Lock();
    picture->AddChild(menu);
    menu->SetHighColor(menu->ViewColor());
    menu->FillRect(menu->Bounds());
    menu->Draw(menu->Bounds());
    picture->RemoveChild(menu);
    picture->Unlock();
    return picture;
}

// An application of Tracker's signature that notes the refs it gets, and then ends.
class StandInTracker : public BApplication {
  public:
    StandInTracker() : BApplication("application/x-vnd.Be-TRAK") {}
    void RefsReceived(BMessage* message) override {
        message->FindRef("refs", &ref);
        PostMessage(B_QUIT_REQUESTED);
    }
    entry_ref ref;
};

} // namespace

TEST_F(IconMenuItemTest, ShowsTheEntrysName) {
    const BEntry entry(MakeFile("Song.mp3").c_str());

    const IconMenuItem item(&entry);

    EXPECT_STREQ("Song.mp3", item.Label());
    EXPECT_EQ(nullptr, item.Message());
    BEntry copy;
    item.GetEntry(&copy);
    EXPECT_EQ(entry, copy);
}

TEST_F(IconMenuItemTest, AnEntryWhoseNameReadsAsADotIsTheDesktop) {
    const BEntry root("/");

    const IconMenuItem item(&root);

    EXPECT_STREQ("Desktop", item.Label());
}

TEST_F(IconMenuItemTest, ShowingTheDesktopOnlyPrintsALine) {
    const BEntry root("/");
    IconMenuItem item(&root);
    CapturedOutput output;

    item.ShowInTracker();

    EXPECT_EQ("Hiding all windows... (TODO)\n", output.text());
}

TEST_F(IconMenuItemTest, AFileThatHasNoIconIsReportedAndStillAnItem) {
    const std::string path = MakeFile("gone.mp3");
    const BEntry entry(path.c_str());
    std::filesystem::remove(path);
    CapturedOutput output;

    const IconMenuItem item(&entry);

    EXPECT_EQ("Error getting icon: No such file or folder\n", output.text());
    EXPECT_STREQ("gone.mp3", item.Label());
}

TEST_F(IconMenuItemTest, AFileWithAnIconIsNotReported) {
    const BEntry entry(MakeFile("Song.mp3").c_str());
    CapturedOutput output;

    const IconMenuItem item(&entry);

    EXPECT_EQ("", output.text());
}

TEST_F(IconMenuItemTest, IsFortyPixelsWiderAndFourHigherThanItsLabelNeeds) {
    const BEntry entry(MakeFile("Song.mp3").c_str());
    BMenu menu("popup");
    menu.AddItem(new IconMenuItem(&entry));
    BMenu plain("popup");
    plain.AddItem(new BMenuItem("Song.mp3", nullptr));

    EXPECT_EQ(plain.ItemAt(0)->Frame().Width() + 40, menu.ItemAt(0)->Frame().Width());
    EXPECT_EQ(plain.ItemAt(0)->Frame().Height() + 4, menu.ItemAt(0)->Frame().Height());
}

TEST_F(IconMenuItemTest, DrawsTheIconLeftOfTheLabel) {
    const BEntry entry(MakeFile("Song.mp3").c_str());
    BMenu menu("popup");
    menu.AddItem(new IconMenuItem(&entry));

    const std::unique_ptr<BBitmap> picture = PictureOf(&menu);

    const auto bottom = static_cast<int32>(menu.Bounds().bottom);
    const auto right = static_cast<int32>(menu.Bounds().right);
    EXPECT_EQ(0, CountInked(*picture, 0, 0, 13, bottom));
    EXPECT_EQ(0, CountInked(*picture, 14, 0, 30, 3));
    EXPECT_GT(CountInked(*picture, 14, 4, 30, 20), 40);
    EXPECT_EQ(0, CountInked(*picture, 31, 0, 33, bottom));
    EXPECT_GT(CountInked(*picture, 34, 0, right, bottom), 40);
}

TEST_F(IconMenuItemTest, ADisabledItemIsDrawnWithTheSameIcon) {
    const BEntry entry(MakeFile("Song.mp3").c_str());
    BMenu menu("popup");
    menu.AddItem(new IconMenuItem(&entry));
    const std::unique_ptr<BBitmap> enabled = PictureOf(&menu);
    menu.ItemAt(0)->SetEnabled(false);

    const std::unique_ptr<BBitmap> disabled = PictureOf(&menu);

    for (int32 y = 4; y <= 20; ++y) {
        for (int32 x = 14; x <= 30; ++x)
            ASSERT_EQ(PixelAt(*enabled, x, y), PixelAt(*disabled, x, y)) << x << " " << y;
    }
}

TEST_F(IconMenuItemTest, ShowingAFileSendsItsRefToTracker) {
    const BEntry entry(MakeFile("Song.mp3").c_str());
    entry_ref ref;
    ASSERT_EQ(B_OK, entry.GetRef(&ref));
    IconMenuItem item(&entry);
    StandInTracker tracker;

    std::thread user([&item, &tracker] {
        while (tracker.IsLaunching())
            snooze(1000);
        item.ShowInTracker();
    });
    tracker.Run();
    user.join();

    EXPECT_EQ(ref, tracker.ref);
}

TEST_F(IconMenuItemTest, ShowingAFileStartsTrackerWhereItDoesNotRun) {
    // A program that notes what it gets is installed in Tracker's place.
    const std::string records = mEnvironment.home() + "/.local/share/bekits/applications";
    std::filesystem::create_directories(records);
    test::write_file(records + "/application,x-vnd.be-trak.app",
                     "[Application]\nSignature=application/x-vnd.Be-TRAK\nExecutable=" +
                         std::string(TEST_PEER) + "\nLaunch=exclusive\n");
    const std::string log = mEnvironment.root() + "/log";
    mEnvironment.set("TEST_PEER_LOG", log);
    mEnvironment.set("TEST_PEER_SIGNATURE", "application/x-vnd.Be-TRAK");
    const auto logs = [&log](const std::string& text) {
        for (int i = 0; i < 1000 && test::read_file(log).find(text + "\n") == std::string::npos; ++i)
            snooze(20000);
        return test::read_file(log).find(text + "\n") != std::string::npos;
    };
    const BEntry entry(MakeFile("Song.mp3").c_str());
    IconMenuItem item(&entry);
    ASSERT_FALSE(be_roster->IsRunning("application/x-vnd.Be-TRAK"));

    item.ShowInTracker();

    EXPECT_TRUE(logs("refs Song.mp3"));
    BMessenger("application/x-vnd.Be-TRAK").SendMessage(B_QUIT_REQUESTED);
    EXPECT_TRUE(logs("ended"));
}
