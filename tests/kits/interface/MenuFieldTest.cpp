// Menu fields as they show themselves; what pointer and keys do with them needs a screen.
#include "ViewStage.h"

#include <MenuBar.h>
#include <MenuField.h>
#include <MenuItem.h>
#include <PopUpMenu.h>

#include <gtest/gtest.h>

namespace {

class MenuFields : public ::testing::Test {
  protected:
    MenuFields() {
        for (const char* label : {"Red", "Green", "Blue"}) {
            mMenu->AddItem(new BMenuItem(label, nullptr));
        }
        mMenu->ItemAt(1)->SetMarked(true);
        mField = new BMenuField(BRect(0, 0, 199, 10), "field", "Colour:", mMenu);
        mStage.Add(mField);
        mStage.Redraw();
    }

    ViewStage mStage{200, 40};
    BPopUpMenu* const mMenu = new BPopUpMenu("colours");
    BMenuField* mField = nullptr;
};

} // namespace

TEST_F(MenuFields, ItShowsTheItemThatIsMarked) {
    EXPECT_STREQ(mField->MenuItem()->Label(), "Green");
    mStage.Locked([&] { mMenu->ItemAt(2)->SetMarked(true); });
    EXPECT_STREQ(mField->MenuItem()->Label(), "Blue");
    EXPECT_EQ(mField->Menu(), mMenu);
    EXPECT_EQ(mField->MenuBar()->SubmenuAt(0), mMenu);
}

TEST_F(MenuFields, APlainMenuShowsItsName) {
    BMenuField field(BRect(0, 0, 99, 20), "field", nullptr, new BMenu("File"));
    EXPECT_STREQ(field.MenuItem()->Label(), "File");
    EXPECT_EQ(field.Divider(), 0);
}

TEST_F(MenuFields, TheFieldLiesRightOfTheDividerAndIsAsWideAsItNeeds) {
    EXPECT_EQ(mField->Divider(), 99);
    EXPECT_EQ(mField->MenuBar()->Frame().left, 99);
    EXPECT_LT(mField->MenuBar()->Frame().right, 199);
    EXPECT_EQ(mField->MenuBar()->Frame().bottom, mField->Bounds().bottom);
    mStage.Locked([&] {
        mField->SetDivider(50);
        mMenu->AddItem(new BMenuItem("a colour whose name has no end and does not fit", nullptr));
        mMenu->ItemAt(3)->SetMarked(true);
        mField->ResizeTo(199, 20);
    });
    EXPECT_EQ(mField->MenuBar()->Frame().left, 50);
    mStage.Locked([&] { mField->ResizeTo(149, 20); });
    EXPECT_EQ(mField->MenuBar()->Frame().right, 149) << "but not beyond the view";
}

TEST_F(MenuFields, ItIsDrawnInTheLookOfTheControls) {
    const auto left = static_cast<int32>(mField->Divider());
    EXPECT_EQ(mStage.At(left, 5), 0x606060U) << "the frame";
    mStage.Locked([&] { mField->MakeFocus(); });
    mStage.Redraw();
    const BRect bar = mField->MenuBar()->Frame();
    EXPECT_GT(mStage.CountOf(0x0000E5, bar), 50) << "the focus";
    mStage.Locked([&] { mField->SetEnabled(false); });
    mStage.Redraw();
    EXPECT_FALSE(mField->IsFocus());
    EXPECT_EQ(mStage.At(left, 5), 0xA0A0A0U);
    EXPECT_EQ(mStage.CountOf(0x000000, BRect(0, 0, 199, 30)), 0) << "no text is black";
    EXPECT_FALSE(mField->MenuItem()->IsEnabled());
}
