#include <TextView.h>

#include <Clipboard.h>
#include <ScrollBar.h>
#include <ScrollView.h>

#include "ViewStage.h"

#include <gtest/gtest.h>

namespace {

class CountingText : public BTextView {
  public:
    using BTextView::BTextView;
    int changes = 0;

  protected:
    void UserChangedText() override { ++changes; }
};

// A text view of 200 x 100 pixels with the focus.
class Texts : public ::testing::Test {
  protected:
    void SetUp() override {
        mStage.Add(mView);
        mStage.Locked([&] { mView->MakeFocus(); });
    }
    void SetText(const char* text) {
        mStage.Locked([&] { mView->SetText(text); });
    }
    std::string Text() {
        std::string text;
        mStage.Locked([&] { text = mView->Text(); });
        return text;
    }
    std::pair<int32, int32> Selection() {
        std::pair<int32, int32> range;
        mStage.Locked([&] { mView->GetSelection(&range.first, &range.second); });
        return range;
    }
    void Select(int32 from, int32 to) {
        mStage.Locked([&] { mView->Select(from, to); });
    }
    BPoint PointAt(int32 offset) {
        BPoint point;
        mStage.Locked([&] { point = mView->PointAt(offset); });
        return point + BPoint(0, 3);
    }
    void Command(uint32 what) {
        BMessage message(what);
        BMessage done(B_MOUSE_UP);
        BMessenger(mView).SendMessage(&message);
        mStage.Send(mView, done);
    }

    typedef std::pair<int32, int32> Range;

    ViewStage mStage{200, 100};
    CountingText* const mView =
        new CountingText(BRect(0, 0, 199, 99), "text", BRect(5, 5, 194, 94), B_FOLLOW_ALL);
};

TEST_F(Texts, TypingInsertsAtTheCaret) {
    for (const char* key : {"a", "b", "\u00e4", "\u20ac"}) {
        mStage.Key(mView, key);
    }
    EXPECT_EQ(Text(), "ab\u00e4\u20ac");
    EXPECT_EQ(Selection(), (Range{7, 7}));
    mStage.Key(mView, B_LEFT_ARROW);
    EXPECT_EQ(Selection(), (Range{4, 4})) << "never inside a character";
    mStage.Key(mView, B_LEFT_ARROW);
    mStage.Key(mView, "X");
    EXPECT_EQ(Text(), "abX\u00e4\u20ac");
    mStage.Key(mView, B_RETURN);
    mStage.Key(mView, B_TAB);
    EXPECT_EQ(Text(), "abX\n\t\u00e4\u20ac");
    EXPECT_EQ(mView->changes, 7);
    mStage.Key(mView, B_ESCAPE);
    mStage.Key(mView, "q", B_COMMAND_KEY);
    EXPECT_EQ(mView->changes, 7);
}

TEST_F(Texts, ErasingTakesCharactersWordsAndSelections) {
    SetText("one two\u20ac");
    Select(10, 10);
    mStage.Key(mView, B_BACKSPACE);
    EXPECT_EQ(Text(), "one two");
    mStage.Key(mView, B_BACKSPACE, B_CONTROL_KEY);
    EXPECT_EQ(Text(), "one ");
    mStage.Key(mView, B_HOME);
    mStage.Key(mView, B_BACKSPACE);
    EXPECT_EQ(Text(), "one ");
    mStage.Key(mView, B_DELETE);
    EXPECT_EQ(Text(), "ne ");
    Select(1, 3);
    mStage.Key(mView, B_DELETE);
    EXPECT_EQ(Text(), "n");
    mStage.Key(mView, B_END);
    mStage.Key(mView, B_DELETE);
    EXPECT_EQ(Text(), "n");
    mStage.Key(mView, B_HOME);
    mStage.Key(mView, B_DELETE, B_CONTROL_KEY);
    EXPECT_EQ(Text(), "");
}

TEST_F(Texts, BytesThatAreNoUtf8AreKeptAndCanBeEdited) {
    SetText("a\xFF\xFE"
            "b");
    EXPECT_EQ(Text(), "a\xFF\xFE"
                      "b");
    mStage.Key(mView, B_RIGHT_ARROW);
    mStage.Key(mView, B_RIGHT_ARROW);
    EXPECT_EQ(Selection(), (Range{2, 2}));
    mStage.Key(mView, "\u00e4");
    EXPECT_EQ(Text(), "a\xFF\u00e4\xFE"
                      "b");
    mStage.Redraw();
    EXPECT_GT(mStage.CountOther(0xFFFFFF, BRect(5, 5, 60, 20)), 30);
    mStage.Locked([&] {
        mView->SetText("x\u20acy");
        mView->Select(2, 3);
    });
    EXPECT_EQ(Selection(), (Range{1, 1})) << "offsets inside a character are its beginning";
}

TEST_F(Texts, TheMouseSetsTheCaretAndSelects) {
    SetText("one two three\nfour");
    mStage.Click(mView, PointAt(5));
    EXPECT_EQ(Selection(), (Range{5, 5}));
    mStage.Click(mView, PointAt(9), B_SHIFT_KEY);
    EXPECT_EQ(Selection(), (Range{5, 9}));
    mStage.Click(mView, PointAt(1), B_SHIFT_KEY);
    EXPECT_EQ(Selection(), (Range{1, 5}));
    mStage.Click(mView, PointAt(5), 0, 2);
    EXPECT_EQ(Selection(), (Range{4, 7}));
    mStage.Click(mView, PointAt(5), 0, 3);
    EXPECT_EQ(Selection(), (Range{0, 14}));
    mStage.MouseDown(mView, PointAt(5), 0, 2);
    mStage.MouseMoved(mView, PointAt(9));
    EXPECT_EQ(Selection(), (Range{4, 13})) << "by words";
    mStage.MouseMoved(mView, PointAt(1));
    EXPECT_EQ(Selection(), (Range{0, 7}));
    mStage.MouseUp(mView, PointAt(1));
    mStage.MouseMoved(mView, PointAt(9));
    EXPECT_EQ(Selection(), (Range{0, 7})) << "the button is up";
    mStage.MouseDown(mView, PointAt(2));
    mStage.MouseMoved(mView, PointAt(16));
    mStage.MouseUp(mView, PointAt(16));
    EXPECT_EQ(Selection(), (Range{2, 16}));
    mStage.Click(mView, BPoint(190, 90));
    EXPECT_EQ(Selection(), (Range{18, 18})) << "below the text is its last line";
}

TEST_F(Texts, CutCopyAndPasteExchangePlainText) {
    BClipboard clipboard("test of text views");
    ASSERT_TRUE(clipboard.Lock());
    clipboard.Clear();
    clipboard.Commit();
    clipboard.Unlock();
    SetText("one two three");
    mStage.Locked([&] {
        EXPECT_FALSE(mView->AcceptsPaste(&clipboard));
        mView->Select(4, 7);
        mView->Copy(&clipboard);
        EXPECT_TRUE(mView->AcceptsPaste(&clipboard));
        mView->Select(0, 0);
        mView->Paste(&clipboard);
    });
    EXPECT_EQ(Text(), "twoone two three");
    EXPECT_EQ(Selection(), (Range{3, 3}));
    mStage.Locked([&] {
        mView->Select(3, 7);
        mView->Cut(&clipboard);
        mView->SelectAll();
        mView->Paste(&clipboard);
    });
    EXPECT_EQ(Text(), "one ");
    mStage.Locked([&] {
        mView->SelectAll();
        mView->MakeEditable(false);
        mView->Cut(&clipboard);
        mView->Paste(&clipboard);
        EXPECT_FALSE(mView->AcceptsPaste(&clipboard));
    });
    mStage.Key(mView, "x");
    mStage.Key(mView, B_DELETE);
    EXPECT_EQ(Text(), "one ") << "not editable";
    mStage.Locked([&] {
        mView->HideTyping(true);
        mView->SetText("secret");
        mView->SelectAll();
        mView->Copy(&clipboard);
        mView->MakeEditable(true);
        mView->HideTyping(false);
        mView->Paste(&clipboard);
    });
    EXPECT_EQ(Text(), "one ") << "a hidden text is not copied";
}

TEST_F(Texts, UndoTakesChangesBackOneByOne) {
    for (const char* key : {"a", "b", "c"}) {
        mStage.Key(mView, key);
    }
    mStage.Key(mView, B_LEFT_ARROW);
    mStage.Key(mView, "x");
    mStage.Key(mView, B_BACKSPACE);
    mStage.Key(mView, B_BACKSPACE);
    EXPECT_EQ(Text(), "ac");
    bool isRedo = true;
    mStage.Locked([&] { EXPECT_EQ(mView->UndoState(&isRedo), B_UNDO_TYPING); });
    EXPECT_FALSE(isRedo);
    Command(B_UNDO);
    EXPECT_EQ(Text(), "abxc");
    Command(B_UNDO);
    EXPECT_EQ(Text(), "abc");
    Command(B_UNDO);
    EXPECT_EQ(Text(), "");
    Command(B_UNDO);
    EXPECT_EQ(Text(), "");
    Command(B_REDO);
    EXPECT_EQ(Text(), "abc");
    EXPECT_EQ(Selection(), (Range{3, 3}));
    Command(B_UNDO);
    mStage.Key(mView, "y", B_CONTROL_KEY | B_COMMAND_KEY);
    EXPECT_EQ(Text(), "abc");
    Command(B_UNDO);
    mStage.Key(mView, "z", B_CONTROL_KEY | B_COMMAND_KEY | B_SHIFT_KEY);
    EXPECT_EQ(Text(), "abc");
    SetText("new");
    Command(B_UNDO);
    EXPECT_EQ(Text(), "new") << "what the program has set is not undone";
    Command(B_SELECT_ALL);
    EXPECT_EQ(Selection(), (Range{0, 3}));
}

TEST_F(Texts, EnteredTextObeysTheLimits) {
    mStage.Locked([&] {
        mView->SetMaxBytes(5);
        mView->DisallowChar('x');
        mView->DisallowChar('\n');
    });
    for (const char* key : {"a", "x", "\u20ac", "\u00e4", "b", "c"}) {
        mStage.Key(mView, key);
    }
    EXPECT_EQ(Text(), "a\u20acb") << "no half characters";
    BMessage drop(B_SIMPLE_DATA);
    mStage.Locked([&] {
        mView->SetMaxBytes(100);
        mView->SetText("");
        BClipboard clipboard("test of limits");
        clipboard.Lock();
        clipboard.Clear();
        clipboard.Data()->AddData("text/plain", B_MIME_TYPE, "1x\n2\x01", 5);
        clipboard.Commit();
        clipboard.Unlock();
        mView->Paste(&clipboard);
        EXPECT_STREQ(mView->Text(), "1 2");
        mView->SetText("a\u20acz");
        mView->SetMaxBytes(3);
        EXPECT_STREQ(mView->Text(), "a");
    });
}

TEST_F(Texts, LinesAreKnownByOffsetAndPoint) {
    SetText("one\ntwo");
    mStage.Locked([&] {
        EXPECT_EQ(mView->CountLines(), 2);
        EXPECT_EQ(mView->LineAt(int32{3}), 0);
        EXPECT_EQ(mView->LineAt(int32{4}), 1);
        EXPECT_EQ(mView->OffsetAt(int32{1}), 4);
        EXPECT_EQ(mView->OffsetAt(int32{9}), 7);
        const float height = mView->LineHeight();
        EXPECT_EQ(mView->PointAt(4), BPoint(5, 5 + height));
        EXPECT_EQ(mView->OffsetAt(BPoint(0, 5 + height)), 4);
        EXPECT_EQ(mView->LineAt(BPoint(0, -50)), 0);
        EXPECT_EQ(mView->TextHeight(0, 1), 2 * height);
        EXPECT_EQ(mView->ByteAt(5), 'w');
        EXPECT_EQ(mView->ByteAt(7), 0);
        char part[10];
        mView->GetText(2, 3, part);
        EXPECT_STREQ(part, "e\nt");
        mView->GoToLine(1);
        EXPECT_EQ(mView->CurrentLine(), 1);
        BRegion region;
        mView->GetTextRegion(0, 3, &region);
        EXPECT_EQ(region.Frame().left, 5);
        EXPECT_EQ(region.Frame().Height(), height - 1);
        mView->SetTextRect(BRect(5, 5, 6, 94));
        EXPECT_EQ(mView->CountLines(), 6) << "wrapped";
        mView->SetWordWrap(false);
        EXPECT_EQ(mView->CountLines(), 2);
    });
}

TEST_F(Texts, TheCaretBlinksWhileTheViewHasTheFocus) {
    const auto pulse = [this] {
        mStage.Locked([&] { mView->Pulse(); });
        mStage.Redraw();
    };
    const bigtime_t moved = system_time();
    SetText("");
    mStage.Redraw();
    EXPECT_GE(mStage.CountOf(0x000000, BRect(5, 5, 5, 25)), 12);
    pulse();
    const bool hasJustMoved = system_time() - moved < 500000;
    EXPECT_TRUE(!hasJustMoved || mStage.CountOf(0x000000, BRect(5, 5, 5, 25)) >= 12);
    for (int pulses = 0; pulses < 200 && mStage.CountOf(0x000000, BRect(0, 0, 199, 99)) != 0; ++pulses) {
        snooze(50000);
        pulse();
    }
    EXPECT_EQ(mStage.CountOf(0x000000, BRect(0, 0, 199, 99)), 0);
    mStage.Key(mView, B_HOME);
    mStage.Key(mView, "i");
    mStage.Redraw();
    EXPECT_GE(mStage.CountOf(0x000000, BRect(5, 5, 20, 25)), 12);
    mStage.Locked([&] {
        mView->SetText("");
        mView->MakeFocus(false);
    });
    mStage.Redraw();
    EXPECT_EQ(mStage.CountOf(0x000000, BRect(0, 0, 199, 99)), 0);
}

TEST_F(Texts, TheSelectionIsDrawnBehindTheText) {
    SetText("iiiiiiii");
    Select(0, 8);
    mStage.Redraw();
    EXPECT_GT(mStage.CountOf(0xB2CAEC, BRect(5, 5, 25, 18)), 50);
    EXPECT_EQ(mStage.CountOf(0xB2CAEC, BRect(100, 5, 199, 99)), 0);
    mStage.Locked([&] { mView->MakeFocus(false); });
    mStage.Redraw();
    EXPECT_EQ(mStage.CountOf(0xB2CAEC, BRect(0, 0, 199, 99)), 0);
    EXPECT_GT(mStage.CountOf(0xD8D8D8, BRect(5, 5, 25, 18)), 50);
}

TEST_F(Texts, AlignmentMovesTheLines) {
    SetText("x");
    mStage.Locked([&] {
        EXPECT_EQ(mView->PointAt(0).x, 5);
        mView->SetAlignment(B_ALIGN_RIGHT);
        EXPECT_NEAR(mView->PointAt(1).x, 195, 0.01);
        mView->SetAlignment(B_ALIGN_CENTER);
        EXPECT_NEAR(mView->PointAt(0).x, 96, 5);
        EXPECT_EQ(mView->OffsetAt(BPoint(mView->PointAt(1).x, 6)), 1);
    });
}

TEST(TextView, ScrollsToTheCaret) {
    ViewStage stage(150, 80);
    auto* const view = new BTextView(BRect(0, 0, 99, 49), "text", BRect(3, 3, 96, 46), B_FOLLOW_ALL);
    stage.Add(new BScrollView("scroll", view, B_FOLLOW_ALL, 0, true, true));
    stage.Locked([&] {
        view->MakeFocus();
        view->SetWordWrap(false);
        view->SetText("1\n2\n3\n4\n5\n6\n7\n8\na long line that does not fit into the view");
    });
    stage.Key(view, B_END, B_CONTROL_KEY);
    stage.Locked([&] {
        const BPoint caret = view->PointAt(view->TextLength());
        EXPECT_TRUE(view->Bounds().Contains(caret));
        EXPECT_TRUE(view->Bounds().Contains(caret + BPoint(0, view->LineHeight() - 1)));
        EXPECT_GT(view->ScrollBar(B_VERTICAL)->Value(), 50);
        EXPECT_GT(view->ScrollBar(B_HORIZONTAL)->Value(), 50);
    });
    stage.Key(view, B_HOME, B_CONTROL_KEY);
    stage.Locked([&] { EXPECT_TRUE(view->Bounds().Contains(view->PointAt(0))); });
}

TEST(TextView, ArchivesAndComesBack) {
    BTextView view(BRect(0, 0, 99, 49), "text", BRect(3, 3, 96, 46), B_FOLLOW_ALL);
    view.SetText("some text");
    view.Select(2, 4);
    view.SetAlignment(B_ALIGN_CENTER);
    view.SetMaxBytes(50);
    view.MakeEditable(false);
    view.SetWordWrap(false);
    BMessage archive;
    ASSERT_EQ(view.Archive(&archive), B_OK);
    const BTextView back(&archive);
    EXPECT_STREQ(back.Text(), "some text");
    int32 from = 0;
    int32 to = 0;
    back.GetSelection(&from, &to);
    EXPECT_EQ(from, 2);
    EXPECT_EQ(to, 4);
    EXPECT_EQ(back.Alignment(), B_ALIGN_CENTER);
    EXPECT_EQ(back.MaxBytes(), 50);
    EXPECT_FALSE(back.IsEditable());
    EXPECT_TRUE(back.IsSelectable());
    EXPECT_FALSE(back.DoesWordWrap());
    EXPECT_EQ(back.TextRect(), BRect(3, 3, 96, 46));
}

} // namespace
