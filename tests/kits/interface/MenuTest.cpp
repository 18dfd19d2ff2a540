// Menus and their items as what they hold and say; how they are opened is another matter.
#include <Archivable.h>
#include <Bitmap.h>
#include <Looper.h>
#include <Menu.h>
#include <MenuItem.h>
#include <MessageQueue.h>

#include <gtest/gtest.h>
#include <memory>

namespace {

BMenuItem* Item(const char* label, uint32 command = 0, char shortcut = 0, uint32 modifiers = 0) {
    return new BMenuItem(label, command == 0 ? nullptr : new BMessage(command), shortcut, modifiers);
}

status_t Invoke(BMenuItem* item) {
    return static_cast<BInvoker*>(item)->Invoke(nullptr);
}

// Holds back what is sent to it.
class Mailbox {
  public:
    Mailbox() { mLooper->AddHandler(&handler); }
    ~Mailbox() { mLooper->Quit(); }
    int32 Count() const { return mLooper->MessageQueue()->CountMessages(); }
    const BMessage& At(int32 index) const { return *mLooper->MessageQueue()->FindMessage(index); }

  private:
    BLooper* const mLooper = new BLooper;

  public:
    BHandler handler;
};

} // namespace

TEST(Menu, ItemsKeepTheirOrder) {
    BMenu menu("File");
    BMenuItem* const open = Item("Open");
    BMenuItem* const close = Item("Close");
    BMenuItem* const print = Item("Print");

    EXPECT_TRUE(menu.AddItem(open));
    EXPECT_TRUE(menu.AddItem(close));
    EXPECT_TRUE(menu.AddItem(print, 1));
    EXPECT_TRUE(menu.AddSeparatorItem());

    EXPECT_EQ(4, menu.CountItems());
    EXPECT_EQ(open, menu.ItemAt(0));
    EXPECT_EQ(print, menu.ItemAt(1));
    EXPECT_EQ(close, menu.ItemAt(2));
    EXPECT_EQ(2, menu.IndexOf(close));
    EXPECT_EQ(nullptr, menu.ItemAt(4));
    EXPECT_EQ(nullptr, menu.ItemAt(-1));
    EXPECT_EQ(&menu, print->Menu());
    EXPECT_STREQ("File", menu.Name());
}

TEST(Menu, RefusesWhatCannotBeAdded) {
    BMenu menu("File");
    BMenu other("Other");
    BMenuItem* const item = Item("Open");
    menu.AddItem(item);

    EXPECT_FALSE(menu.AddItem(static_cast<BMenuItem*>(nullptr)));
    EXPECT_FALSE(other.AddItem(item));
    EXPECT_FALSE(menu.AddItem(static_cast<BMenu*>(nullptr)));
    const std::unique_ptr<BMenuItem> spare(Item("Spare"));
    EXPECT_FALSE(menu.AddItem(spare.get(), 2));
    EXPECT_FALSE(menu.AddItem(spare.get(), -1));
    EXPECT_FALSE(menu.AddItem(spare.get(), BRect(0, 0, 10, 10)));
    EXPECT_EQ(1, menu.CountItems());
}

TEST(Menu, RemovedItemsAreTheCallersAgain) {
    BMenu menu("File");
    BMenuItem* const open = Item("Open");
    BMenuItem* const close = Item("Close");
    menu.AddItem(open);
    menu.AddItem(close);

    EXPECT_TRUE(menu.RemoveItem(open));
    EXPECT_FALSE(menu.RemoveItem(open));
    EXPECT_EQ(nullptr, open->Menu());
    EXPECT_EQ(close, menu.RemoveItem(int32{0}));
    EXPECT_EQ(nullptr, menu.RemoveItem(int32{0}));
    EXPECT_EQ(0, menu.CountItems());
    delete open;
    delete close;
}

TEST(Menu, ARangeOfItemsIsRemovedAndDeletedAtOnce) {
    BMenu menu("File");
    for (const char* label : {"a", "b", "c", "d"}) {
        menu.AddItem(Item(label));
    }

    EXPECT_FALSE(menu.RemoveItems(2, 3, true));
    EXPECT_TRUE(menu.RemoveItems(1, 2, true));

    ASSERT_EQ(2, menu.CountItems());
    EXPECT_STREQ("d", menu.ItemAt(1)->Label());
}

TEST(Menu, AListOfItemsIsAddedInItsOrder) {
    BMenu menu("File");
    menu.AddItem(Item("last"));
    BList list;
    list.AddItem(Item("first"));
    list.AddItem(Item("second"));

    EXPECT_TRUE(menu.AddList(&list, 0));

    EXPECT_STREQ("first", menu.ItemAt(0)->Label());
    EXPECT_STREQ("second", menu.ItemAt(1)->Label());
    EXPECT_STREQ("last", menu.ItemAt(2)->Label());
}

TEST(Menu, ASubmenuHangsFromAnItemOfItsName) {
    BMenu menu("File");
    BMenu* const recent = new BMenu("Recent");

    EXPECT_TRUE(menu.AddItem(recent));

    EXPECT_EQ(recent, menu.SubmenuAt(0));
    EXPECT_STREQ("Recent", menu.ItemAt(0)->Label());
    EXPECT_EQ(menu.ItemAt(0), recent->Superitem());
    EXPECT_EQ(&menu, recent->Supermenu());
    EXPECT_EQ(0, menu.IndexOf(recent));
    EXPECT_FALSE(menu.AddItem(recent));
}

TEST(Menu, ARemovedSubmenuIsTheCallersAndItsItemIsGone) {
    BMenu menu("File");
    auto recent = std::make_unique<BMenu>("Recent");
    menu.AddItem(recent.get());

    EXPECT_TRUE(menu.RemoveItem(recent.get()));

    EXPECT_EQ(nullptr, recent->Superitem());
    EXPECT_EQ(0, menu.CountItems());
}

TEST(Menu, ItemsAreFoundByCommandAndLabelInSubmenusToo) {
    BMenu menu("File");
    BMenu* const recent = new BMenu("Recent");
    recent->AddItem(Item("song.mp3", 'song'));
    menu.AddItem(recent);
    menu.AddItem(Item("Close", 'clos'));

    EXPECT_STREQ("song.mp3", menu.FindItem('song')->Label());
    EXPECT_EQ(menu.ItemAt(1), menu.FindItem('clos'));
    EXPECT_EQ(recent->ItemAt(0), menu.FindItem("song.mp3"));
    EXPECT_EQ(nullptr, menu.FindItem('none'));
    EXPECT_EQ(nullptr, menu.FindItem("none"));
}

TEST(Menu, AnItemWithoutAMessageIsNotFoundByCommandZero) {
    BMenu menu("File");
    menu.AddItem(Item("nothing"));
    menu.AddSeparatorItem();

    EXPECT_EQ(nullptr, menu.FindItem(uint32{0}));
}

TEST(Menu, WithoutRadioModeAnyNumberOfItemsIsMarked) {
    BMenu menu("View");
    menu.AddItem(Item("a"));
    menu.AddItem(Item("b"));

    menu.ItemAt(0)->SetMarked(true);
    menu.ItemAt(1)->SetMarked(true);

    EXPECT_TRUE(menu.ItemAt(0)->IsMarked());
    EXPECT_EQ(menu.ItemAt(0), menu.FindMarked());
    menu.ItemAt(0)->SetMarked(false);
    EXPECT_EQ(menu.ItemAt(1), menu.FindMarked());
}

TEST(Menu, InRadioModeMarkingOneUnmarksTheOthers) {
    BMenu menu("View");
    menu.SetRadioMode(true);
    menu.AddItem(Item("a"));
    menu.AddItem(Item("b"));

    menu.ItemAt(0)->SetMarked(true);
    menu.ItemAt(1)->SetMarked(true);

    EXPECT_FALSE(menu.ItemAt(0)->IsMarked());
    EXPECT_EQ(menu.ItemAt(1), menu.FindMarked());
}

TEST(Menu, TheMarkedItemsLabelIsShownByTheItemThatTheMenuHangsFrom) {
    BMenu bar("bar", B_ITEMS_IN_ROW);
    BMenu* const sizes = new BMenu("Sizes");
    sizes->SetLabelFromMarked(true);
    sizes->AddItem(Item("Small"));
    sizes->AddItem(Item("Large"));
    bar.AddItem(sizes);
    EXPECT_TRUE(sizes->IsRadioMode());
    EXPECT_STREQ("Sizes", bar.ItemAt(0)->Label());

    sizes->ItemAt(1)->SetMarked(true);

    EXPECT_STREQ("Large", bar.ItemAt(0)->Label());
}

TEST(Menu, AMenuThatIsAlreadyMarkedGivesItsItemThatLabelFromTheStart) {
    BMenu bar("bar", B_ITEMS_IN_ROW);
    BMenu* const sizes = new BMenu("Sizes");
    sizes->SetLabelFromMarked(true);
    sizes->AddItem(Item("Small"));
    sizes->ItemAt(0)->SetMarked(true);

    bar.AddItem(sizes);

    EXPECT_STREQ("Small", bar.ItemAt(0)->Label());
}

TEST(Menu, WhatHangsFromSomethingDisabledIsDisabled) {
    BMenu menu("File");
    BMenu* const recent = new BMenu("Recent");
    recent->AddItem(Item("song"));
    menu.AddItem(recent);
    EXPECT_TRUE(recent->ItemAt(0)->IsEnabled());

    menu.ItemAt(0)->SetEnabled(false);
    EXPECT_FALSE(recent->IsEnabled());
    EXPECT_FALSE(recent->ItemAt(0)->IsEnabled());

    menu.ItemAt(0)->SetEnabled(true);
    recent->SetEnabled(false);
    EXPECT_FALSE(menu.ItemAt(0)->IsEnabled());
    EXPECT_FALSE(recent->ItemAt(0)->IsEnabled());

    recent->SetEnabled(true);
    menu.SetEnabled(false);
    EXPECT_FALSE(recent->ItemAt(0)->IsEnabled());
}

TEST(Menu, SeparatorsCannotBeEnabled) {
    BSeparatorItem separator;

    separator.SetEnabled(true);

    EXPECT_FALSE(separator.IsEnabled());
}

TEST(Menu, ShortcutsAlwaysHaveTheCommandKey) {
    const std::unique_ptr<BMenuItem> item(Item("Find", 'find', 'F', B_SHIFT_KEY));
    uint32 modifiers = 0;

    EXPECT_EQ('F', item->Shortcut(&modifiers));
    EXPECT_EQ(uint32{B_SHIFT_KEY | B_COMMAND_KEY}, modifiers);

    item->SetShortcut(0, 0);
    EXPECT_EQ(0, item->Shortcut(&modifiers));
    EXPECT_EQ(0U, modifiers);
}

TEST(Menu, ChoosingAnItemSendsItsMessageWithTimeSourceAndIndex) {
    Mailbox box;
    BMenu menu("File");
    menu.AddItem(Item("Open", 'open'));
    menu.AddItem(Item("Close", 'clos'));
    EXPECT_EQ(B_OK, menu.SetTargetForItems(&box.handler));
    const bigtime_t before = system_time();

    EXPECT_EQ(B_OK, Invoke(menu.ItemAt(1)));

    ASSERT_EQ(1, box.Count());
    const BMessage& sent = box.At(0);
    EXPECT_EQ(uint32{'clos'}, sent.what);
    EXPECT_EQ(1, sent.GetInt32("index", -1));
    EXPECT_EQ(menu.ItemAt(1), sent.GetPointer("source"));
    EXPECT_GE(sent.GetInt64("when", 0), before);
    EXPECT_TRUE(menu.ItemAt(1)->Message()->IsEmpty());
}

TEST(Menu, FieldsOfAnEarlierChoiceAreReplaced) {
    Mailbox box;
    BMenu menu("File");
    menu.AddItem(Item("Open", 'open'));
    menu.SetTargetForItems(&box.handler);
    menu.ItemAt(0)->Message()->AddInt32("index", 77);
    menu.ItemAt(0)->Message()->AddInt32("own", 5);

    Invoke(menu.ItemAt(0));

    EXPECT_EQ(0, box.At(0).GetInt32("index", -1));
    EXPECT_FALSE(box.At(0).HasInt32("index", 1));
    EXPECT_EQ(5, box.At(0).GetInt32("own", 0));
}

TEST(Menu, ADisabledItemSendsNothing) {
    Mailbox box;
    BMenu menu("File");
    menu.AddItem(Item("Open", 'open'));
    menu.SetTargetForItems(&box.handler);
    menu.ItemAt(0)->SetEnabled(false);

    EXPECT_EQ(B_NOT_ALLOWED, Invoke(menu.ItemAt(0)));

    EXPECT_EQ(0, box.Count());
}

TEST(Menu, ChoosingInRadioModeMarksTheItem) {
    BMenu menu("View");
    menu.SetRadioMode(true);
    menu.AddItem(Item("a"));
    menu.AddItem(Item("b"));
    menu.ItemAt(0)->SetMarked(true);

    // Without a message there is nothing to send, but the mark moves all the same.
    EXPECT_EQ(B_BAD_VALUE, Invoke(menu.ItemAt(1)));

    EXPECT_EQ(menu.ItemAt(1), menu.FindMarked());
}

TEST(Menu, TargetsAreSetForThisMenusItemsOnly) {
    Mailbox box;
    BMenu menu("File");
    BMenu* const recent = new BMenu("Recent");
    recent->AddItem(Item("song", 'song'));
    menu.AddItem(Item("Open", 'open'));
    menu.AddItem(recent);

    menu.SetTargetForItems(BMessenger(&box.handler));

    EXPECT_EQ(&box.handler, menu.ItemAt(0)->Target());
    EXPECT_EQ(nullptr, recent->ItemAt(0)->Target());
}

TEST(Menu, AMenuIsArchivedWithAllThatHangsFromIt) {
    BMenu menu("View");
    menu.SetRadioMode(true);
    menu.SetMaxContentWidth(120);
    menu.AddItem(Item("Small", 'smal', 'S', B_SHIFT_KEY));
    menu.ItemAt(0)->SetMarked(true);
    menu.ItemAt(0)->SetTrigger('m');
    menu.AddSeparatorItem();
    BMenu* const more = new BMenu("More");
    more->SetEnabled(false);
    more->AddItem(Item("Huge", 'huge'));
    menu.AddItem(more);
    menu.ItemAt(2)->SetEnabled(false);
    BMessage archive;

    ASSERT_EQ(B_OK, menu.Archive(&archive));
    const std::unique_ptr<BArchivable> object(instantiate_object(&archive));
    auto* const copy = dynamic_cast<BMenu*>(object.get());

    ASSERT_NE(nullptr, copy);
    EXPECT_STREQ("View", copy->Name());
    EXPECT_TRUE(copy->IsRadioMode());
    EXPECT_EQ(120, copy->MaxContentWidth());
    ASSERT_EQ(3, copy->CountItems());
    EXPECT_STREQ("Small", copy->ItemAt(0)->Label());
    EXPECT_EQ(uint32{'smal'}, copy->ItemAt(0)->Command());
    EXPECT_TRUE(copy->ItemAt(0)->IsMarked());
    EXPECT_EQ('m', copy->ItemAt(0)->Trigger());
    uint32 modifiers = 0;
    EXPECT_EQ('S', copy->ItemAt(0)->Shortcut(&modifiers));
    EXPECT_EQ(uint32{B_SHIFT_KEY | B_COMMAND_KEY}, modifiers);
    EXPECT_NE(nullptr, dynamic_cast<BSeparatorItem*>(copy->ItemAt(1)));
    ASSERT_NE(nullptr, copy->SubmenuAt(2));
    EXPECT_STREQ("More", copy->ItemAt(2)->Label());
    EXPECT_FALSE(copy->ItemAt(2)->IsEnabled());
    EXPECT_FALSE(copy->SubmenuAt(2)->IsEnabled());
    EXPECT_STREQ("Huge", copy->SubmenuAt(2)->ItemAt(0)->Label());
}

TEST(Menu, AMatrixIsArchivedWithItsFrames) {
    BMenu menu("Colours", 100, 60);
    menu.AddItem(Item("red"), BRect(0, 0, 19, 19));
    menu.AddItem(Item("blue"), BRect(30, 20, 49, 39));
    BMessage archive;

    ASSERT_EQ(B_OK, menu.Archive(&archive));
    const std::unique_ptr<BArchivable> object(instantiate_object(&archive));
    auto* const copy = dynamic_cast<BMenu*>(object.get());

    ASSERT_NE(nullptr, copy);
    ASSERT_EQ(2, copy->CountItems());
    EXPECT_EQ(BRect(30, 20, 49, 39), copy->ItemAt(1)->Frame());
}

TEST(Menu, FramesFollowTheLabels) {
    BMenu menu("File");
    menu.AddItem(Item("Open"));
    menu.AddItem(Item("Close"));
    const float width = menu.ItemAt(0)->Frame().Width();
    EXPECT_EQ(menu.ItemAt(0)->Frame().bottom + 1, menu.ItemAt(1)->Frame().top);

    menu.ItemAt(1)->SetLabel("Close this and everything else");

    EXPECT_GT(menu.ItemAt(0)->Frame().Width(), width);
    EXPECT_EQ(menu.ItemAt(0)->Frame().right, menu.ItemAt(1)->Frame().right);
}

TEST(Menu, TheWidestContentIsLimited) {
    BMenu menu("File");
    menu.AddItem(Item("a label that is much longer than forty pixels"));

    menu.SetMaxContentWidth(40);

    EXPECT_EQ(14 + 40 + 20, menu.ItemAt(0)->Frame().Width());
}

TEST(Menu, TakesThePreferredSizeOfItsItems) {
    BMenu menu("File");
    menu.AddItem(Item("Open"));
    menu.AddItem(Item("Close"));
    float width = 0;
    float height = 0;

    menu.GetPreferredSize(&width, &height);

    EXPECT_EQ(menu.ItemAt(1)->Frame().RightBottom(), BPoint(width, height));
    EXPECT_EQ(BRect(0, 0, width, height), menu.Bounds());
}

TEST(Menu, NewMenusTakeTheLooksThatWereSet) {
    menu_info usual;
    ASSERT_EQ(B_OK, get_menu_info(&usual));
    menu_info large = usual;
    large.font_size = 20;
    EXPECT_EQ(B_BAD_VALUE, set_menu_info(nullptr));
    EXPECT_EQ(B_BAD_VALUE, get_menu_info(nullptr));

    ASSERT_EQ(B_OK, set_menu_info(&large));
    BMenu menu("File");
    set_menu_info(&usual);

    BFont font;
    menu.GetFont(&font);
    EXPECT_EQ(20, font.Size());
}
