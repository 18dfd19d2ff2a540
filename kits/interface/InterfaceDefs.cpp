#include <InterfaceDefs.h>

#include <algorithm>

namespace {

// Between `from` at 0 and `to` at 1.
uint8 Mix(uint8 from, uint8 to, float amount) {
    const float mixed =
        static_cast<float>(from) + (static_cast<float>(to) - static_cast<float>(from)) * amount;
    return static_cast<uint8>(std::clamp(mixed + 0.5F, 0.0F, 255.0F));
}

} // namespace

rgb_color ui_color(color_which which) {
    switch (which) {
    case B_PANEL_BACKGROUND_COLOR:
    case B_MENU_BACKGROUND_COLOR:
        return make_color(216, 216, 216);
    case B_WINDOW_TAB_COLOR:
        return make_color(255, 203, 0);
    case B_KEYBOARD_NAVIGATION_COLOR:
        return make_color(0, 0, 229);
    case B_DESKTOP_COLOR:
        return make_color(51, 102, 152);
    case B_MENU_SELECTION_BACKGROUND_COLOR:
        return make_color(160, 160, 160);
    case B_MENU_ITEM_TEXT_COLOR:
    case B_MENU_SELECTED_ITEM_TEXT_COLOR:
        break;
    }
    return make_color(0, 0, 0);
}

rgb_color tint_color(rgb_color color, float tint) {
    if (!(tint >= B_LIGHTEN_MAX_TINT)) {
        tint = B_LIGHTEN_MAX_TINT;
    }
    tint = std::min(tint, B_DARKEN_MAX_TINT);
    const bool lighten = tint < B_NO_TINT;
    const uint8 end = lighten ? 255 : 0;
    const float amount = lighten ? B_NO_TINT - tint : tint - B_NO_TINT;
    return make_color(Mix(color.red, end, amount), Mix(color.green, end, amount),
                      Mix(color.blue, end, amount), color.alpha);
}
