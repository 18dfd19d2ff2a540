#include <Box.h>
#include <CheckBox.h>
#include <RadioButton.h>

#include "MessageCatcher.h"
#include "ViewStage.h"

#include <gtest/gtest.h>

namespace {

TEST(CheckBox, SwitchesByMouseAndKeys) {
    MessageCatcher catcher;
    ViewStage stage(120, 20);
    auto* const box = new BCheckBox(BRect(0, 0, 119, 19), "box", "Label", new BMessage('swit'));
    box->SetTarget(catcher.Messenger());
    stage.Add(box);
    stage.Redraw();
    EXPECT_EQ(stage.CountOf(0x000000, BRect(3, 5, 11, 13)), 0);
    EXPECT_GT(stage.CountOther(0xFFFFFF, BRect(18, 0, 60, 19)), 20) << "the label";
    stage.Click(box, BPoint(60, 10));
    stage.Redraw();
    EXPECT_GT(stage.CountOf(0x000000, BRect(3, 5, 11, 13)), 8) << "a tick";
    stage.Key(box, B_SPACE);
    stage.Key(box, B_RETURN);
    stage.MouseDown(box, BPoint(5, 5));
    stage.MouseUp(box, BPoint(5, 50));
    std::vector<int32> values;
    for (const BMessage& message : catcher.Take()) {
        values.push_back(message.GetInt32("be:value", -1));
    }
    EXPECT_EQ(values, (std::vector<int32>{1, 0, 1}));
    stage.Locked([&] { box->SetEnabled(false); });
    stage.Click(box, BPoint(5, 5));
    EXPECT_EQ(catcher.Count(), 0U);
}

TEST(RadioButton, OneOfAGroupIsOn) {
    MessageCatcher catcher;
    ViewStage stage(120, 60);
    auto* const group = new BView(BRect(0, 0, 119, 59), "group", B_FOLLOW_NONE, B_WILL_DRAW);
    std::vector<BRadioButton*> buttons;
    for (int i = 0; i < 3; ++i) {
        const auto top = static_cast<float>(20 * i);
        buttons.push_back(
            new BRadioButton(BRect(0, top, 119, top + 19), "radio", "Label", new BMessage('radi')));
        buttons.back()->SetTarget(catcher.Messenger());
        group->AddChild(buttons.back());
    }
    stage.Add(group);
    const auto values = [&] {
        std::string text;
        for (const BRadioButton* button : buttons) {
            text += button->Value() == B_CONTROL_ON ? '1' : '0';
        }
        return text;
    };
    stage.Click(buttons[0], BPoint(5, 5));
    EXPECT_EQ(values(), "100");
    stage.Key(buttons[2], B_SPACE);
    stage.Key(buttons[2], B_SPACE);
    EXPECT_EQ(values(), "001") << "it stays on";
    stage.Locked([&] { buttons[1]->SetValue(B_CONTROL_ON); });
    EXPECT_EQ(values(), "010");
    EXPECT_EQ(catcher.Count(), 3U) << "the program's change is not told";
    stage.Redraw();
    EXPECT_GT(stage.CountOf(0x000000, BRect(4, 24, 11, 35)), 8) << "a dot";
    EXPECT_EQ(stage.CountOf(0x000000, BRect(4, 4, 11, 15)), 0);
}

TEST(Box, FramesWithALabelInItsTopEdge) {
    ViewStage stage(100, 60);
    auto* const box = new BBox(BRect(0, 0, 99, 59), "box");
    stage.Add(box);
    stage.Redraw();
    EXPECT_EQ(box->FrameRect(), BRect(0, 0, 99, 59));
    EXPECT_EQ(stage.At(50, 0), 0x989898U);
    EXPECT_EQ(stage.At(50, 1), 0xFFFFFFU);
    EXPECT_EQ(box->InnerFrame(), BRect(2, 2, 97, 57));
    stage.Locked([&] { box->SetLabel("Label"); });
    stage.Redraw();
    const float top = box->FrameRect().top;
    EXPECT_GE(top, 5);
    EXPECT_LE(top, 10);
    EXPECT_EQ(stage.At(80, static_cast<int32>(top)), 0x989898U);
    EXPECT_LT(stage.Darkest(BRect(10, 0, 45, 15)), 0x20U);
    auto* const view = new BView(BRect(0, 0, 30, 20), "label", 0, 0);
    stage.Locked([&] { EXPECT_EQ(box->SetLabel(view), B_OK); });
    EXPECT_EQ(box->Label(), nullptr);
    EXPECT_EQ(box->LabelView(), view);
    EXPECT_EQ(view->Frame().LeftTop(), BPoint(10, 0));
    EXPECT_EQ(box->FrameRect().top, 10);
    stage.Locked([&] {
        EXPECT_EQ(box->SetLabel(view), B_BAD_VALUE) << "it has a parent";
        box->SetBorder(B_NO_BORDER);
    });
    stage.Redraw();
    EXPECT_EQ(stage.CountOther(0xFFFFFF, BRect(0, 0, 99, 59)), 0);
}

TEST(Box, ArchivesAndComesBack) {
    BBox box(BRect(0, 0, 99, 59), "box", B_FOLLOW_ALL, B_WILL_DRAW, B_PLAIN_BORDER);
    box.SetLabel("Label");
    BMessage archive;
    ASSERT_EQ(box.Archive(&archive), B_OK);
    const BBox back(&archive);
    EXPECT_EQ(back.Border(), B_PLAIN_BORDER);
    EXPECT_STREQ(back.Label(), "Label");
    EXPECT_EQ(back.LabelView(), nullptr);
    BRadioButton radio(BRect(0, 0, 99, 19), "radio", "Radio", new BMessage('radi'));
    radio.SetValue(B_CONTROL_ON);
    BMessage radioArchive;
    ASSERT_EQ(radio.Archive(&radioArchive), B_OK);
    const std::unique_ptr<BArchivable> object(instantiate_object(&radioArchive));
    auto* const radioBack = dynamic_cast<BRadioButton*>(object.get());
    ASSERT_NE(radioBack, nullptr);
    EXPECT_EQ(radioBack->Value(), B_CONTROL_ON);
}

} // namespace
