#include <Button.h>
#include <StringView.h>

#include "ControlLook.h"
#include "MessageCatcher.h"
#include "ViewStage.h"

#include <gtest/gtest.h>

namespace {

class Buttons : public ::testing::Test {
  protected:
    void SetUp() override {
        mButton->SetTarget(mCatcher.Messenger());
        mStage.Add(mButton);
        mStage.Redraw();
    }
    void SetEnabled(bool enabled) {
        mStage.Locked([&] { mButton->SetEnabled(enabled); });
    }
    int32 Value() {
        int32 value = -1;
        mStage.Locked([&] { value = mButton->Value(); });
        return value;
    }

    MessageCatcher mCatcher;
    ViewStage mStage{100, 40};
    BButton* const mButton = new BButton(BRect(10, 10, 89, 33), "ok", "OK", new BMessage('push'));
};

TEST_F(Buttons, AreDrawnWithFrameFaceAndLabel) {
    EXPECT_EQ(mStage.At(10, 10), 0x606060U);
    EXPECT_EQ(mStage.At(89, 33), 0x606060U);
    EXPECT_EQ(mStage.At(12, 12), 0xFFFFFFU);
    EXPECT_EQ(mStage.At(87, 31), 0x989898U);
    EXPECT_EQ(mStage.At(20, 20), 0xD8D8D8U);
    EXPECT_GT(mStage.CountOther(0xD8D8D8, BRect(40, 14, 59, 29)), 30) << "the label, in the middle";
    EXPECT_LT(mStage.Darkest(BRect(40, 14, 59, 29)), 0x20U);
    EXPECT_EQ(mStage.CountOther(0xD8D8D8, BRect(14, 14, 30, 29)), 0);
    EXPECT_EQ(mStage.At(9, 9), 0xFFFFFFU) << "nothing outside";
}

TEST_F(Buttons, SendTheirMessageWhenClicked) {
    mStage.MouseDown(mButton, BPoint(5, 5));
    EXPECT_EQ(Value(), B_CONTROL_ON);
    EXPECT_EQ(mCatcher.Count(), 0U);
    mStage.Redraw();
    EXPECT_EQ(mStage.At(20, 20), 0xB0B0B0U) << "pressed";
    mStage.MouseUp(mButton, BPoint(5, 5));
    EXPECT_EQ(Value(), B_CONTROL_OFF);
    mStage.Redraw();
    EXPECT_EQ(mStage.At(20, 20), 0xD8D8D8U);
    const std::vector<BMessage> sent = mCatcher.Take();
    ASSERT_EQ(sent.size(), 1U);
    EXPECT_EQ(sent[0].what, 'push');
    int32 value = -1;
    void* source = nullptr;
    EXPECT_EQ(sent[0].FindInt32("be:value", &value), B_OK);
    EXPECT_EQ(value, 0);
    EXPECT_EQ(sent[0].FindPointer("source", &source), B_OK);
    EXPECT_EQ(source, static_cast<BButton*>(mButton));
    EXPECT_TRUE(sent[0].HasInt64("when"));
    EXPECT_TRUE(sent[0].HasMessenger("be:sender"));
}

TEST_F(Buttons, DoNothingWhenThePointerLeavesBeforeTheRelease) {
    mStage.MouseDown(mButton, BPoint(5, 5));
    mStage.MouseMoved(mButton, BPoint(5, 50));
    EXPECT_EQ(Value(), B_CONTROL_OFF);
    mStage.MouseMoved(mButton, BPoint(5, 6));
    EXPECT_EQ(Value(), B_CONTROL_ON);
    mStage.MouseUp(mButton, BPoint(5, 50));
    EXPECT_EQ(mCatcher.Count(), 0U);
    mStage.MouseMoved(mButton, BPoint(5, 6));
    EXPECT_EQ(Value(), B_CONTROL_OFF) << "the button is up";
}

TEST_F(Buttons, ArePressedBySpaceAndReturnAlone) {
    mStage.Key(mButton, B_SPACE);
    mStage.Key(mButton, B_RETURN);
    mStage.Key(mButton, 'x');
    EXPECT_EQ(mCatcher.Count(), 2U);
}

TEST_F(Buttons, ThatAreDisabledTakeNothing) {
    SetEnabled(false);
    mStage.Redraw();
    EXPECT_EQ(mStage.At(10, 10), 0xA0A0A0U);
    EXPECT_GT(mStage.CountOther(0xD8D8D8, BRect(40, 14, 59, 29)), 30);
    EXPECT_EQ(mStage.Darkest(BRect(10, 10, 89, 33)), 0x80U) << "a grey label";
    mStage.Click(mButton, BPoint(5, 5));
    mStage.Key(mButton, B_RETURN);
    EXPECT_EQ(mCatcher.Count(), 0U);
}

TEST_F(Buttons, ThatAreDisabledCannotHaveTheFocus) {
    mStage.Locked([&] {
        mButton->MakeFocus();
        mButton->SetEnabled(false);
        EXPECT_FALSE(mButton->IsFocus());
        EXPECT_EQ(mButton->Flags() & B_NAVIGABLE, 0U);
        mButton->SetEnabled(true);
        EXPECT_EQ(mButton->Flags() & B_NAVIGABLE, uint32{B_NAVIGABLE});
        mButton->SetFlags(mButton->Flags() & ~B_NAVIGABLE);
        mButton->SetEnabled(false);
        mButton->SetEnabled(true);
        EXPECT_EQ(mButton->Flags() & B_NAVIGABLE, 0U) << "it never could";
    });
}

TEST_F(Buttons, ShowThatTheyHaveTheFocus) {
    EXPECT_EQ(mStage.CountOf(0x0000E5, BRect(10, 10, 89, 33)), 0);
    mStage.Locked([&] { mButton->MakeFocus(); });
    mStage.Redraw();
    EXPECT_EQ(mStage.At(14, 14), 0x0000E5U);
    mStage.Locked([&] { mButton->MakeFocus(false); });
    mStage.Redraw();
    EXPECT_EQ(mStage.CountOf(0x0000E5, BRect(10, 10, 89, 33)), 0);
}

TEST_F(Buttons, ThatAreTheDefaultHaveAThickFrame) {
    EXPECT_EQ(mStage.At(11, 11), 0xD8D8D8U);
    mStage.Locked([&] { mButton->MakeDefault(true); });
    mStage.Redraw();
    EXPECT_EQ(mStage.At(11, 11), 0x606060U);
    EXPECT_EQ(mButton->Frame(), BRect(10, 10, 89, 33));
}

TEST_F(Buttons, AreDrawnAgainOnlyWhenSomethingChanges) {
    mStage.Locked([&] {
        mButton->SetLabel("OK");
        mButton->SetValue(B_CONTROL_OFF);
        mButton->SetEnabled(true);
    });
    EXPECT_TRUE(mStage.Damage().Frame() == BRect() || !mStage.Damage().Frame().IsValid());
    mStage.Locked([&] { mButton->SetLabel("Cancel"); });
    EXPECT_EQ(mStage.Damage().Frame(), BRect(10, 10, 89, 33));
}

TEST_F(Buttons, AnswerScripts) {
    BMessage get(B_GET_PROPERTY);
    get.AddSpecifier("Label");
    BMessage reply;
    ASSERT_EQ(BMessenger(mButton).SendMessage(&get, &reply), B_OK);
    EXPECT_STREQ(reply.GetString("result", ""), "OK");
    BMessage set(B_SET_PROPERTY);
    set.AddSpecifier("Enabled");
    set.AddBool("data", false);
    ASSERT_EQ(BMessenger(mButton).SendMessage(&set, &reply), B_OK);
    EXPECT_EQ(reply.GetInt32("error", -1), B_OK);
    mStage.Locked([&] { EXPECT_FALSE(mButton->IsEnabled()); });
}

TEST_F(Buttons, PreferASizeForTheirLabel) {
    float width = 0;
    float height = 0;
    mStage.Locked([&] { mButton->GetPreferredSize(&width, &height); });
    EXPECT_EQ(width, 75);
    EXPECT_GE(height, 19);
    EXPECT_LE(height, 28);
    float longer = 0;
    mStage.Locked([&] {
        mButton->SetLabel("a label that is longer than most");
        mButton->GetPreferredSize(&longer, &height);
    });
    EXPECT_GT(longer, 150);
}

TEST(Control, ArchivesAndComesBack) {
    BButton button(BRect(1, 2, 30, 20), "name", "label", new BMessage('abcd'));
    button.SetEnabled(false);
    button.SetValue(7);
    button.MakeDefault(true);
    BMessage archive;
    ASSERT_EQ(button.Archive(&archive), B_OK);
    const std::unique_ptr<BArchivable> object(instantiate_object(&archive));
    auto* const back = dynamic_cast<BButton*>(object.get());
    ASSERT_NE(back, nullptr);
    EXPECT_STREQ(back->Label(), "label");
    EXPECT_FALSE(back->IsEnabled());
    EXPECT_TRUE(back->IsDefault());
    EXPECT_EQ(back->Value(), 7);
    EXPECT_EQ(back->Command(), 'abcd');
    EXPECT_EQ(back->Frame(), BRect(1, 2, 30, 20));
}

TEST(Control, TellsThoseWhoWatchIt) {
    MessageCatcher watcher;
    BControl control(BRect(0, 0, 9, 9), "name", nullptr, nullptr, 0, 0);
    EXPECT_EQ(control.Label(), nullptr);
    control.StartWatching(watcher.Messenger(), B_CONTROL_INVOKED);
    EXPECT_EQ(control.Invoke(), B_BAD_VALUE) << "no message of its own";
    EXPECT_EQ(watcher.Count(), 1U);
}

TEST(StringView, DrawsItsTextInItsColour) {
    ViewStage stage(100, 20);
    auto* const view = new BStringView(BRect(0, 0, 99, 19), "text", "Hello");
    view->SetHighColor(255, 0, 0);
    stage.Add(view);
    stage.Redraw();
    EXPECT_GT(stage.CountOf(0xFF0000, BRect(0, 0, 49, 19)), 5);
    EXPECT_EQ(stage.CountOf(0xFFFFFF, BRect(50, 0, 99, 19)), 50 * 20);
    stage.Locked([&] { view->SetAlignment(B_ALIGN_RIGHT); });
    stage.Redraw();
    EXPECT_EQ(stage.CountOf(0xFFFFFF, BRect(0, 0, 49, 19)), 50 * 20);
    stage.Locked([&] { view->SetText(nullptr); });
    stage.Redraw();
    EXPECT_EQ(stage.CountOf(0xFFFFFF, BRect(0, 0, 99, 19)), 100 * 20);
    EXPECT_STREQ(view->Text(), "");
}

} // namespace
