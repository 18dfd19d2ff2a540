// What an input method is working on, in a text view.
#include "ViewStage.h"

#include <TextView.h>

#include <algorithm>
#include <gtest/gtest.h>

namespace {

class Composing : public ::testing::Test {
  protected:
    void SetUp() override {
        mStage.Add(mView);
        mStage.Locked([&] {
            mView->SetText("ab WW");
            mView->MakeFocus();
            mView->Select(3, 3);
        });
    }
    void Compose(const char* text, int32 caret = 0) {
        BMessage message(B_INPUT_METHOD_EVENT);
        message.AddInt32("be:opcode", B_INPUT_METHOD_CHANGED);
        message.AddString("be:string", text);
        message.AddInt32("be:selection", caret);
        mStage.Send(mView, message);
        mStage.Redraw();
    }
    std::string Text() {
        std::string text;
        mStage.Locked([&] { text = mView->Text(); });
        return text;
    }
    // The longest line of black pixels from left to right, and how far right anything is black.
    int Underline() {
        int longest = 0;
        for (int32 y = 0; y < 30; ++y) {
            int run = 0;
            for (int32 x = 0; x < 200; ++x) {
                run = mStage.At(x, y) == 0 ? run + 1 : 0;
                longest = std::max(longest, run);
            }
        }
        return longest;
    }
    int RightEnd() {
        int end = 0;
        for (int32 y = 0; y < 30; ++y) {
            for (int32 x = end; x < 200; ++x) {
                end = mStage.At(x, y) < 0x808080 ? std::max(end, x) : end;
            }
        }
        return end;
    }

    ViewStage mStage{200, 60};
    BTextView* const mView = new BTextView(BRect(0, 0, 199, 59), "text", BRect(5, 5, 194, 54), B_FOLLOW_ALL);
};

} // namespace

TEST_F(Composing, ItIsShownUnderlinedAndIsNoPartOfTheText) {
    mStage.Redraw();
    const int plain = Underline();
    const int end = RightEnd();
    const int width = static_cast<int>(mView->StringWidth("composed"));

    Compose("composed");

    EXPECT_EQ(Text(), "ab WW");
    EXPECT_LT(plain, width / 2);
    EXPECT_GE(Underline(), width);
    EXPECT_LE(Underline(), width + 2);
    EXPECT_NEAR(RightEnd(), end + width, 2) << "what follows makes room";
    Compose("");
    EXPECT_EQ(Underline(), plain);
    EXPECT_EQ(RightEnd(), end);
}

TEST_F(Composing, WhatIsFinishedTakesItsPlace) {
    Compose("\u304b");
    Compose("\u304b\u306a", 6);
    Compose("");
    mStage.Key(mView, "\u4eee");
    mStage.Key(mView, "\u540d");
    EXPECT_EQ(Text(), "ab \u4eee\u540dWW");
    mStage.Locked([&] { mView->Undo(nullptr); });
    EXPECT_EQ(Text(), "ab WW");
}

TEST_F(Composing, ItEndsWithTheFocusAPressOrAnotherText) {
    mStage.Redraw();
    const int plain = Underline();
    const std::function<void()> endings[] = {
        [this] { mStage.Locked([&] { mView->MakeFocus(false); }); },
        [this] { mStage.Click(mView, BPoint(100, 40)); },
        [this] { mStage.Locked([&] { mView->SetText("ab WW"); }); },
    };
    for (const auto& end : endings) {
        mStage.Locked([&] { mView->MakeFocus(); });
        Compose("composed");
        EXPECT_GT(Underline(), plain);
        end();
        mStage.Redraw();
        EXPECT_LE(Underline(), plain);
    }
}

TEST_F(Composing, WhatCannotBeEditedShowsNone) {
    mStage.Locked([&] { mView->MakeEditable(false); });
    mStage.Redraw();
    const int plain = Underline();
    Compose("composed");
    EXPECT_EQ(Underline(), plain);
}
