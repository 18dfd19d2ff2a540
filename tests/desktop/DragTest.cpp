// Drags within the program, and to and from one that knows nothing of the kits.
#include "desktop/WindowOnDesktop.h"

#include "DragSession.h"
#include "support/program.h"

#include <Entry.h>
#include <csignal>

namespace {

constexpr rgb_color kBlue = {10, 20, 200, 255};

class DragTest : public WindowOnDesktop {
  protected:
    std::string MakeFile(const std::string& leaf) {
        const std::string path = mEnvironment.volume() + "/" + leaf;
        test::write_file(path, "");
        return path;
    }
};

// Drags one file and a number when it is pressed.
class Source : public NotingView {
  public:
    Source(Notes& notes, const std::string& path)
        : NotingView(BRect(0, 0, 9, 9), "view", notes), mPath(path) {}
    void MouseDown(BPoint where) override {
        entry_ref ref;
        EXPECT_EQ(get_ref_for_path(mPath.c_str(), &ref), B_OK);
        BMessage message(B_SIMPLE_DATA);
        message.AddRef("refs", &ref);
        message.AddPointer("self", this);
        DragMessage(&message, BRect(where.x, where.y, where.x + 40, where.y + 20));
    }
    void MessageReceived(BMessage* message) override {
        if (message->what == 'thnk') {
            Note("thanked");
        } else {
            NotingView::MessageReceived(message);
        }
    }

  private:
    const std::string mPath;
};

// Writes down what is dropped on it.
class Target : public NotingView {
  public:
    explicit Target(Notes& notes, const char* name = "target") : NotingView(BRect(0, 0, 9, 9), name, notes) {}
    void MessageReceived(BMessage* message) override {
        if (!message->WasDropped()) {
            NotingView::MessageReceived(message);
            return;
        }
        entry_ref ref;
        for (int32 i = 0; message->FindRef("refs", i, &ref) == B_OK; ++i) {
            Note(std::string("dropped ") + ref.name);
        }
        if (message->GetPointer("self") != nullptr) {
            Note("its pointer is there");
            message->SendReply('thnk');
        }
    }
};

} // namespace

TEST_F(DragTest, FilesOfAnotherProgramArriveAsRefsAfterTheButton) {
    const std::string first = MakeFile("a b\xC3\xA9.mp3");
    const std::string second = MakeFile("second.mp3");
    RunApplication([&] {
        BWindow* const window = Open(BRect(700, 300, 999, 499), "Taking", new Target(mNotes, "view"), kBlue);
        test::Program peer(DRAG_PEER, {"offer", "200", "300", UriOfPath(first), UriOfPath(second)});
        ASSERT_NE(TheDesktop().window("Offering peer"), "");
        mNotes.Take();
        TheDesktop().drag(280, 380, 850, 400);
        EXPECT_TRUE(mNotes.WaitFor("view: dropped second.mp3"));
        const std::vector<std::string> lines = mNotes.Take();
        EXPECT_EQ(std::count(lines.begin(), lines.end(), "view: dropped a b\xC3\xA9.mp3"), 1);
        const auto at = [&](const std::string& line) {
            return std::find(lines.begin(), lines.end(), line) - lines.begin();
        };
        EXPECT_LT(at("view: moved 0 dragging"), at("view: moved 1 dragging"));
        EXPECT_LT(at("view: moved 1 dragging"), at("view: up"));
        EXPECT_LT(at("view: up"), at("view: dropped second.mp3"));
        snooze(300000);
        peer.signal(SIGTERM);
        EXPECT_EQ(peer.wait().output, "ready\nbegan\nended copy\n") << "the files are copied, never moved";
        Close(window);
    });
}

TEST_F(DragTest, AnotherProgramGetsTheFilesAsACopy) {
    const std::string path = MakeFile("song #1.mp3");
    RunApplication([&] {
        BWindow* const window = Open(BRect(700, 300, 999, 499), "Giving", new Source(mNotes, path), kBlue);
        test::Program peer(DRAG_PEER, {"accept", "200", "300"});
        ASSERT_NE(TheDesktop().window("Accepting peer"), "");
        TheDesktop().drag(800, 400, 280, 380);
        snooze(500000);
        peer.signal(SIGTERM);
        const std::vector<std::string> lines = test::lines_of(peer.wait().output);
        ASSERT_GE(lines.size(), 3U);
        EXPECT_NE(lines[1].find("text/uri-list"), std::string::npos) << lines[1];
        EXPECT_EQ(lines[2], "file " + UriOfPath(path));
        EXPECT_TRUE(TheDesktop().becomes(800, 400, 0x0a14c8));
        // The mouse is the window's again.
        mNotes.Take();
        TheDesktop().move_pointer(820, 420);
        EXPECT_TRUE(mNotes.WaitFor("view: moved 0"));
        Close(window);
    });
}

TEST_F(DragTest, BetweenOwnWindowsTheMessageItselfArrivesAndIsRepliedTo) {
    const std::string path = MakeFile("own.mp3");
    RunApplication([&] {
        BWindow* const from = Open(BRect(700, 300, 999, 499), "From", new Source(mNotes, path), kBlue);
        auto* const to = new NotingWindow(BRect(200, 300, 499, 499), mNotes);
        to->SetTitle("To");
        auto* const target = new Target(mNotes);
        target->ResizeTo(299, 199);
        to->AddChild(target);
        to->Show();
        ASSERT_NE(TheDesktop().window("To"), "");
        snooze(300000);
        TheDesktop().drag(800, 400, 300, 400);
        EXPECT_TRUE(mNotes.WaitFor("target: dropped own.mp3"));
        EXPECT_TRUE(mNotes.WaitFor("target: its pointer is there"));
        EXPECT_TRUE(mNotes.WaitFor("view: thanked"));
        EXPECT_EQ(mNotes.Count("target: up"), 1);
        // And once more: nothing is left of the first.
        TheDesktop().drag(800, 400, 300, 420);
        EXPECT_TRUE(mNotes.WaitFor("target: dropped own.mp3", 2));
        Close(to);
        Close(from);
    });
}

TEST_F(DragTest, AWindowMayCloseWhileSomethingIsDraggedFromIt) {
    const std::string path = MakeFile("own.mp3");
    RunApplication([&] {
        BWindow* const window = Open(BRect(700, 300, 999, 499), "Going", new Source(mNotes, path), kBlue);
        TheDesktop().move_pointer(800, 400);
        TheDesktop().press();
        for (int x = 780; x > 500; x -= 20) {
            TheDesktop().move_pointer(x, 400);
        }
        Close(window);
        TheDesktop().release();
        BWindow* const next = Open(BRect(300, 300, 499, 499), "Next", MakeView(), kBlue);
        mNotes.Take();
        TheDesktop().click(350, 350);
        EXPECT_TRUE(mNotes.WaitFor("view: down 50,50 buttons 1 clicks 1"));
        Close(next);
    });
}
