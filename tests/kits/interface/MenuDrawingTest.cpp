// Menus as they look: drawn into a bitmap.
#include "PixelPicture.h"

#include <Bitmap.h>
#include <Menu.h>
#include <MenuBar.h>
#include <MenuItem.h>

#include <gtest/gtest.h>
#include <memory>

namespace {

constexpr uint32 kGround = 0xD8D8D8;
constexpr uint32 kSelection = 0xA0A0A0;
constexpr uint32 kGrey = 0x808080;

class SelectableItem : public BMenuItem {
  public:
    using BMenuItem::BMenuItem;
    using BMenuItem::ContentLocation;
};

// A menu on a bitmap that is as large as the menu.
class DrawnMenu {
  public:
    explicit DrawnMenu(BMenu* menu) : mMenu(menu) {
        float width = 0;
        float height = 0;
        menu->GetPreferredSize(&width, &height);
        mBitmap = std::make_unique<BBitmap>(BRect(0, 0, width, height), B_RGB32, true);
        mBitmap->Lock();
        mBitmap->AddChild(menu);
        Redraw();
    }
    ~DrawnMenu() {
        mBitmap->RemoveChild(mMenu);
        mBitmap->Unlock();
    }
    void Redraw() {
        mMenu->SetHighColor(mMenu->ViewColor());
        mMenu->FillRect(mMenu->Bounds());
        mMenu->Draw(mMenu->Bounds());
    }
    uint32 At(int32 x, int32 y) const {
        return reinterpret_cast<const uint32*>(mBitmap->Surface().Row(y))[x] & 0xFFFFFF;
    }
    // Pixels of the rectangle that are not of this colour.
    int CountOthers(BRect rect, uint32 color) const {
        int count = 0;
        for (auto y = static_cast<int32>(rect.top); y <= static_cast<int32>(rect.bottom); ++y) {
            for (auto x = static_cast<int32>(rect.left); x <= static_cast<int32>(rect.right); ++x) {
                count += At(x, y) != color;
            }
        }
        return count;
    }
    // The darkest grey in the rectangle.
    uint32 Darkest(BRect rect) const {
        uint32 darkest = 0xFF;
        for (auto y = static_cast<int32>(rect.top); y <= static_cast<int32>(rect.bottom); ++y) {
            for (auto x = static_cast<int32>(rect.left); x <= static_cast<int32>(rect.right); ++x) {
                darkest = std::min(darkest, At(x, y) & 0xFF);
            }
        }
        return darkest;
    }

  private:
    BMenu* const mMenu;
    std::unique_ptr<BBitmap> mBitmap;
};

BRect LeftOf(BRect frame, float width) {
    return {frame.left, frame.top, frame.left + width - 1, frame.bottom};
}

BRect RightOf(BRect frame, float width) {
    return {frame.right - width + 1, frame.top, frame.right, frame.bottom};
}

} // namespace

TEST(MenuDrawing, AnItemDrawsItsLabelBetweenFreeMargins) {
    BMenu menu("File");
    menu.AddItem(new BMenuItem("Open", nullptr));
    const DrawnMenu drawn(&menu);
    const BRect frame = menu.ItemAt(0)->Frame();

    EXPECT_EQ(0, drawn.CountOthers(LeftOf(frame, 13), kGround));
    EXPECT_EQ(0, drawn.CountOthers(RightOf(frame, 19), kGround));
    EXPECT_GT(drawn.CountOthers(frame, kGround), 30);
    EXPECT_LT(drawn.Darkest(frame), 0x20U);
}

TEST(MenuDrawing, ADisabledItemIsGrey) {
    BMenu menu("File");
    menu.AddItem(new BMenuItem("Open", nullptr));
    menu.ItemAt(0)->SetEnabled(false);
    const DrawnMenu drawn(&menu);

    EXPECT_GT(drawn.CountOthers(menu.ItemAt(0)->Frame(), kGround), 30);
    EXPECT_EQ(kGrey & 0xFF, drawn.Darkest(menu.ItemAt(0)->Frame()));
}

TEST(MenuDrawing, AMarkedItemHasAMarkLeftOfItsLabel) {
    BMenu menu("View");
    menu.AddItem(new BMenuItem("Large", nullptr));
    menu.AddItem(new BMenuItem("Large", nullptr));
    menu.ItemAt(1)->SetMarked(true);
    const DrawnMenu drawn(&menu);

    EXPECT_EQ(0, drawn.CountOthers(LeftOf(menu.ItemAt(0)->Frame(), 13), kGround));
    EXPECT_GT(drawn.CountOthers(LeftOf(menu.ItemAt(1)->Frame(), 13), kGround), 5);
}

TEST(MenuDrawing, AnItemWithASubmenuHasAnArrow) {
    BMenu menu("File");
    menu.AddItem(new BMenuItem("Recent", nullptr));
    menu.AddItem(new BMenu("Recent"));
    const DrawnMenu drawn(&menu);

    EXPECT_EQ(0, drawn.CountOthers(RightOf(menu.ItemAt(0)->Frame(), 18), kGround));
    EXPECT_GT(drawn.CountOthers(RightOf(menu.ItemAt(1)->Frame(), 18), kGround), 5);
}

TEST(MenuDrawing, ShortcutsBeginInOneColumn) {
    BMenu menu("File");
    menu.AddItem(new BMenuItem("Open", nullptr, 'L'));
    menu.AddItem(new BMenuItem("Something long", nullptr, 'L'));
    const DrawnMenu drawn(&menu);
    const BRect first = menu.ItemAt(0)->Frame();
    const BRect second = menu.ItemAt(1)->Frame();

    const float left = 14 + menu.StringWidth("Something long") + 4;
    for (auto x = static_cast<int32>(left); x <= static_cast<int32>(first.right); ++x) {
        for (int32 y = 0; y <= static_cast<int32>(first.Height()); ++y) {
            ASSERT_EQ(drawn.At(x, y), drawn.At(x, y + static_cast<int32>(second.top)));
        }
    }
    EXPECT_GT(drawn.CountOthers(BRect(left, first.top, first.right, first.bottom), kGround), 30);
}

TEST(MenuDrawing, ASeparatorIsADarkLineAboveALightOne) {
    BMenu menu("File");
    menu.AddItem(new BMenuItem("Open", nullptr));
    menu.AddSeparatorItem();
    const DrawnMenu drawn(&menu);
    const BRect frame = menu.ItemAt(1)->Frame();
    const auto y = static_cast<int32>((frame.top + frame.bottom) / 2);

    EXPECT_EQ(0x989898U, drawn.At(20, y));
    EXPECT_EQ(0xFFFFFFU, drawn.At(20, y + 1));
    EXPECT_EQ(kGround, drawn.At(20, y - 1));
}

TEST(MenuDrawing, AnItemThatIsLongerThanTheMenuAllowsIsCut) {
    BMenu menu("File");
    menu.SetMaxContentWidth(60);
    menu.AddItem(new BMenuItem("a label that is much longer than that", nullptr));
    const DrawnMenu drawn(&menu);
    const BRect frame = menu.ItemAt(0)->Frame();

    EXPECT_EQ(0, drawn.CountOthers(RightOf(frame, 19), kGround));
    EXPECT_GT(drawn.CountOthers(frame, kGround), 60);
}

TEST(MenuDrawing, TheContentBeginsBehindTheMargins) {
    BMenu menu("File");
    menu.AddItem(new SelectableItem("Open", nullptr));
    menu.AddItem(new SelectableItem("Close", nullptr));

    EXPECT_EQ(BPoint(14, menu.ItemAt(1)->Frame().top + 2),
              static_cast<SelectableItem*>(menu.ItemAt(1))->ContentLocation());
}

TEST(MenuDrawing, ABarIsHighEnoughForItsTitlesAndALineBelowThem) {
    auto* const bar = new BMenuBar(BRect(0, 0, 300, 20), "menubar");
    bar->AddItem(new BMenu("File"));
    bar->AddItem(new BMenu("Edit"));
    BBitmap picture(BRect(0, 0, 299, 99), B_RGB32, true);
    ASSERT_TRUE(picture.Lock());
    auto* const back = new BView(picture.Bounds(), "back", B_FOLLOW_ALL, B_WILL_DRAW);
    picture.AddChild(back);
    back->AddChild(bar);

    EXPECT_EQ(BRect(0, 0, 299, 20), bar->Frame());
    EXPECT_EQ(19, bar->ItemAt(0)->Frame().bottom);
    bar->Draw(bar->Bounds());
    const auto* const lowest = reinterpret_cast<const uint32*>(picture.Surface().Row(20));
    EXPECT_EQ(0x989898U, lowest[150] & 0xFFFFFF);
    picture.Unlock();
}

TEST(MenuDrawing, ABarThatFollowsOneSideIsAsWideAsItsTitles) {
    BMenuBar bar(BRect(0, 0, 300, 20), "menubar", B_FOLLOW_LEFT | B_FOLLOW_TOP);
    bar.AddItem(new BMenu("File"));

    bar.ResizeToPreferred();

    EXPECT_EQ(bar.ItemAt(0)->Frame().right, bar.Bounds().right);
}

TEST(MenuDrawing, ABarIsArchivedWithItsBorderAndMenus) {
    BMenuBar bar(BRect(0, 0, 300, 20), "menubar");
    bar.SetBorder(B_BORDER_EACH_ITEM);
    bar.AddItem(new BMenu("File"));
    BMessage archive;

    ASSERT_EQ(B_OK, bar.Archive(&archive));
    const std::unique_ptr<BArchivable> object(instantiate_object(&archive));
    auto* const copy = dynamic_cast<BMenuBar*>(object.get());

    ASSERT_NE(nullptr, copy);
    EXPECT_EQ(B_BORDER_EACH_ITEM, copy->Border());
    ASSERT_NE(nullptr, copy->SubmenuAt(0));
    EXPECT_STREQ("File", copy->SubmenuAt(0)->Name());
}
