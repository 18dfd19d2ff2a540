// Where the items of a menu lie. Plain arithmetic: measures and draws nothing.
#pragma once

#include <Rect.h>

#include <vector>

// What a menu leaves free around the content of each item.
struct MenuMargins {
    float left = 0;
    float top = 0;
    float right = 0;
    float bottom = 0;
};

// The size of an item's content, and the width of its shortcut's text, 0 when it has none.
struct MenuItemExtent {
    float width = 0;
    float height = 0;
    float shortcutWidth = 0;
};

// In the menu's coordinates. `frames` has one rectangle for each item, `bounds` begins at (0, 0) and holds
// them all, `shortcutLeft` is where the texts of shortcuts begin in every frame.
struct MenuLayout {
    std::vector<BRect> frames;
    BRect bounds;
    float shortcutLeft = 0;
};

// Items one below the other, all as wide as the widest and at least `minimumWidth`. Shortcuts stand in a
// column of their own to the right of all contents.
MenuLayout lay_out_column(const std::vector<MenuItemExtent>& items, const MenuMargins& margins,
                          float minimumWidth = 0);

// Items side by side, all as high as the highest.
MenuLayout lay_out_row(const std::vector<MenuItemExtent>& items, const MenuMargins& margins);

// Items where they were put, on a ground of `width` x `height` that grows with them.
MenuLayout lay_out_matrix(const std::vector<BRect>& frames, float width, float height);
