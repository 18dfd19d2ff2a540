#include "MenuLayout.h"

#include <algorithm>
#include <cmath>

namespace {

constexpr float kShortcutGap = 18;

// An empty menu still has a place that can be seen.
constexpr float kEmptySide = 15;

} // namespace

// Frames hold both their edges, so each begins a pixel after the one before it.

MenuLayout lay_out_column(const std::vector<MenuItemExtent>& items, const MenuMargins& margins,
                          float minimumWidth) {
    MenuLayout layout;
    float widest = 0;
    float widestShortcut = 0;
    for (const MenuItemExtent& item : items) {
        widest = std::max(widest, std::ceil(item.width));
        widestShortcut = std::max(widestShortcut, std::ceil(item.shortcutWidth));
    }
    layout.shortcutLeft = margins.left + widest + kShortcutGap;
    const float contents = widestShortcut > 0 ? layout.shortcutLeft + widestShortcut : margins.left + widest;
    const float width = std::max(contents + margins.right, minimumWidth);
    // Where the menu is wider than it must be, shortcuts keep to its right side.
    if (widestShortcut > 0) {
        layout.shortcutLeft = width - margins.right - widestShortcut;
    }
    float top = 0;
    for (const MenuItemExtent& item : items) {
        const float bottom = top + margins.top + std::ceil(item.height) + margins.bottom;
        layout.frames.emplace_back(0.0F, top, width, bottom);
        top = bottom + 1;
    }
    layout.bounds = items.empty() ? BRect(0, 0, std::max(kEmptySide, minimumWidth), kEmptySide)
                                  : BRect(0, 0, width, top - 1);
    return layout;
}

MenuLayout lay_out_row(const std::vector<MenuItemExtent>& items, const MenuMargins& margins) {
    MenuLayout layout;
    float highest = 0;
    for (const MenuItemExtent& item : items) {
        highest = std::max(highest, std::ceil(item.height));
    }
    const float bottom = margins.top + highest + margins.bottom;
    float left = 0;
    for (const MenuItemExtent& item : items) {
        const float right = left + margins.left + std::ceil(item.width) + margins.right;
        layout.frames.emplace_back(left, 0.0F, right, bottom);
        left = right + 1;
    }
    layout.bounds = items.empty() ? BRect(0, 0, kEmptySide, kEmptySide) : BRect(0, 0, left - 1, bottom);
    return layout;
}

MenuLayout lay_out_matrix(const std::vector<BRect>& frames, float width, float height) {
    MenuLayout layout;
    layout.frames = frames;
    layout.bounds = BRect(0, 0, width, height);
    for (const BRect& frame : frames) {
        layout.bounds.right = std::max(layout.bounds.right, frame.right);
        layout.bounds.bottom = std::max(layout.bounds.bottom, frame.bottom);
    }
    return layout;
}
