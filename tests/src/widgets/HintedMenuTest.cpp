#include "widgets/HintedMenu.h"
#include "widgets/HintedMenuItem.h"

#include <gtest/gtest.h>

TEST(HintedMenu, AnEmptyMenuHasNoItemOfAnyHint) {
    const HintedMenu menu("Playlists");

    EXPECT_EQ(nullptr, menu.FindItemHint(0));
}

TEST(HintedMenu, FindsTheFirstItemOfAHint) {
    HintedMenu menu("Playlists");
    auto* const first = new HintedMenuItem("One", nullptr, 7, 0, 0);
    auto* const second = new HintedMenuItem("Two", nullptr, -3, 0, 0);
    auto* const third = new HintedMenuItem("Three", nullptr, 7, 0, 0);
    for (HintedMenuItem* item : {first, second, third})
        menu.AddItem(item);

    EXPECT_EQ(first, menu.FindItemHint(7));
    EXPECT_EQ(second, menu.FindItemHint(-3));
    EXPECT_EQ(nullptr, menu.FindItemHint(0));
}

TEST(HintedMenu, ItsItemsLieInAColumn) {
    HintedMenu menu("Playlists");
    menu.AddItem(new HintedMenuItem("One", nullptr, 1, 0, 0));
    menu.AddItem(new HintedMenuItem("Two", nullptr, 2, 0, 0));

    EXPECT_STREQ("Playlists", menu.Name());
    EXPECT_EQ(menu.ItemAt(0)->Frame().bottom + 1, menu.ItemAt(1)->Frame().top);
}

TEST(HintedMenu, AnItemIsAMenuItemWithAHint) {
    HintedMenuItem item("One", new BMessage('hint'), 5, 'O', B_SHIFT_KEY);
    uint32 modifiers = 0;

    EXPECT_EQ(5, item.GetHint());
    EXPECT_STREQ("One", item.Label());
    EXPECT_EQ(uint32{'hint'}, item.Command());
    EXPECT_EQ('O', item.Shortcut(&modifiers));
    EXPECT_EQ(uint32{B_SHIFT_KEY | B_COMMAND_KEY}, modifiers);
}
