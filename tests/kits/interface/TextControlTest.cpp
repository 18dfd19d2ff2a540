#include <TextControl.h>
#include <TextView.h>

#include "MessageCatcher.h"
#include "ViewStage.h"

#include <gtest/gtest.h>

namespace {

class Fields : public ::testing::Test {
  protected:
    void SetUp() override {
        mField->SetTarget(mCatcher.Messenger());
        mField->SetModificationMessage(new BMessage('modi'));
        mStage.Add(mOther);
        mStage.Add(mField);
        mInput = mField->TextView();
        mStage.Redraw();
    }
    void Focus(BView* view) {
        mStage.Locked([&] { view->MakeFocus(); });
    }
    std::vector<uint32> Sent() {
        std::vector<uint32> codes;
        for (const BMessage& message : mCatcher.Take()) {
            codes.push_back(message.what);
        }
        return codes;
    }

    typedef std::vector<uint32> Codes;

    MessageCatcher mCatcher;
    ViewStage mStage{200, 60};
    BView* const mOther = new BView(BRect(150, 0, 199, 20), "other", 0, B_WILL_DRAW);
    BTextControl* const mField =
        new BTextControl(BRect(10, 10, 109, 14), "field", "Label", "text", new BMessage('invo'));
    BTextView* mInput = nullptr; // belongs to the field
};

TEST_F(Fields, AreAsHighAsTheirFontNeeds) {
    EXPECT_GE(mField->Bounds().Height(), 17);
    EXPECT_LE(mField->Bounds().Height(), 24);
    EXPECT_EQ(mField->Bounds().Width(), 99);
    EXPECT_EQ(mField->Divider(), 49);
    EXPECT_EQ(mInput->Frame().left, 53);
    mStage.Locked([&] { mField->SetDivider(0); });
    EXPECT_EQ(mInput->Frame().left, 4);
    EXPECT_EQ(mInput->Frame().right, 95);
    const BTextControl bare(BRect(0, 0, 99, 9), "field", nullptr, nullptr, nullptr);
    EXPECT_EQ(bare.Divider(), 0);
    EXPECT_STREQ(bare.Text(), "");
}

TEST_F(Fields, AreDrawnWithLabelFrameAndText) {
    EXPECT_GT(mStage.CountOther(0xFFFFFF, BRect(10, 10, 50, 28)), 20) << "the label";
    EXPECT_EQ(mStage.At(59, 10), 0x989898U);
    EXPECT_EQ(mStage.At(60, 11), 0x606060U);
    EXPECT_LT(mStage.Darkest(BRect(63, 13, 90, 26)), 0x20U) << "the text";
    Focus(mField);
    mStage.Redraw();
    EXPECT_EQ(mStage.At(60, 11), 0x0000E5U);
    EXPECT_TRUE(mInput->IsFocus());
    EXPECT_GT(mStage.CountOf(0xB2CAEC, BRect(63, 13, 90, 26)), 20) << "all of it is selected";
    mStage.Locked([&] { mField->SetEnabled(false); });
    mStage.Redraw();
    EXPECT_EQ(mStage.At(60, 11), 0xA0A0A0U);
    EXPECT_EQ(mStage.At(100, 20), 0xECECECU);
    EXPECT_GE(mStage.Darkest(BRect(63, 13, 90, 26)), 0x80U) << "grey text";
    EXPECT_FALSE(mInput->IsFocus());
}

TEST_F(Fields, ReturnInvokesAndSelectsAll) {
    Focus(mField);
    mStage.Key(mInput, "n");
    EXPECT_EQ(Sent(), (Codes{'modi'}));
    mStage.Key(mInput, "e");
    mStage.Key(mInput, B_RETURN);
    EXPECT_EQ(Sent(), (Codes{'modi', 'invo'}));
    EXPECT_STREQ(mField->Text(), "ne");
    int32 from = -1;
    int32 to = -1;
    mInput->GetSelection(&from, &to);
    EXPECT_EQ(from, 0);
    EXPECT_EQ(to, 2);
    mStage.Key(mInput, B_RETURN);
    EXPECT_EQ(Sent(), (Codes{'invo'})) << "the same once more";
    Focus(mOther);
    EXPECT_EQ(Sent(), (Codes{})) << "nothing has changed since";
}

TEST_F(Fields, LeavingAChangedFieldInvokes) {
    Focus(mField);
    Focus(mOther);
    EXPECT_EQ(Sent(), (Codes{}));
    Focus(mField);
    mStage.Key(mInput, "x");
    Focus(mOther);
    EXPECT_EQ(Sent(), (Codes{'modi', 'invo'}));
    mStage.Locked([&] { mField->SetText("program"); });
    Focus(mField);
    Focus(mOther);
    EXPECT_EQ(Sent(), (Codes{})) << "the program's own change";
}

TEST_F(Fields, HoldOneLine) {
    Focus(mField);
    mStage.Key(mInput, B_DELETE);
    mStage.Key(mInput, "a");
    mStage.Key(mInput, B_TAB);
    mStage.Key(mInput, B_ESCAPE);
    mStage.Key(mInput, B_DOWN_ARROW);
    mStage.Key(mInput, "b");
    EXPECT_STREQ(mField->Text(), "ab");
    for (int i = 0; i < 40; ++i) {
        mStage.Key(mInput, "w");
    }
    mStage.Locked([&] {
        EXPECT_EQ(mInput->CountLines(), 1);
        EXPECT_EQ(mInput->Bounds().top, 0);
        EXPECT_GT(mInput->Bounds().left, 100) << "scrolled to the caret";
    });
    mStage.Key(mInput, B_HOME);
    mStage.Locked([&] { EXPECT_EQ(mInput->Bounds().left, 0); });
}

TEST_F(Fields, TheKeyboardFindsTheTextViewOnly) {
    EXPECT_EQ(mField->Flags() & B_NAVIGABLE, 0U);
    EXPECT_EQ(mInput->Flags() & B_NAVIGABLE, uint32{B_NAVIGABLE});
    mStage.Locked([&] { mField->SetEnabled(false); });
    EXPECT_EQ(mInput->Flags() & B_NAVIGABLE, 0U);
    mStage.Key(mInput, "x");
    mStage.Key(mInput, B_RETURN);
    EXPECT_EQ(Sent(), (Codes{}));
    EXPECT_STREQ(mField->Text(), "text");
}

TEST_F(Fields, GrowWithTheirFrameAndFont) {
    mStage.Locked([&] {
        mField->ResizeBy(30, 0);
        EXPECT_EQ(mInput->Frame().right, 125);
        EXPECT_EQ(mInput->TextRect().Width(), mInput->Bounds().Width());
        const float height = mField->Bounds().Height();
        BFont large;
        large.SetSize(24);
        mField->SetFont(&large);
        EXPECT_GT(mField->Bounds().Height(), height + 8);
        EXPECT_EQ(mInput->Frame().bottom, mField->Bounds().bottom - 2);
    });
}

TEST(TextControl, ArchivesAndComesBack) {
    BTextControl field(BRect(0, 0, 99, 20), "field", "Label", "text", new BMessage('invo'));
    field.SetDivider(30);
    field.SetAlignment(B_ALIGN_RIGHT, B_ALIGN_CENTER);
    field.SetModificationMessage(new BMessage('modi'));
    BMessage archive;
    ASSERT_EQ(field.Archive(&archive), B_OK);
    const BTextControl back(&archive);
    EXPECT_STREQ(back.Text(), "text");
    EXPECT_STREQ(back.Label(), "Label");
    EXPECT_EQ(back.Divider(), 30);
    alignment label = B_ALIGN_LEFT;
    alignment text = B_ALIGN_LEFT;
    back.GetAlignment(&label, &text);
    EXPECT_EQ(label, B_ALIGN_RIGHT);
    EXPECT_EQ(text, B_ALIGN_CENTER);
    ASSERT_NE(back.ModificationMessage(), nullptr);
    EXPECT_EQ(back.ModificationMessage()->what, 'modi');
    EXPECT_EQ(back.CountChildren(), 1);
}

} // namespace
