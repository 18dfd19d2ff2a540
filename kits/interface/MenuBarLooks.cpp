// The part of BMenuBar that has a size and draws.
#include <MenuBar.h>

#include "ControlLook.h"

#include <MenuItem.h>
#include <Window.h>

#include <algorithm>

namespace {

// Along the bar's bottom, below the titles.
constexpr float kBottomLine = 1;

} // namespace

void BMenuBar::SetBorder(menu_bar_border border) {
    mBorder = border;
    Invalidate();
}

void BMenuBar::GetPreferredSize(float* width, float* height) {
    BMenu::GetPreferredSize(width, height);
    if (height != nullptr) {
        *height += kBottomLine;
    }
}

void BMenuBar::ResizeToPreferred() {
    float width = 0;
    float height = 0;
    GetPreferredSize(&width, &height);
    const bool followsBothSides = (ResizingMode() & B_FOLLOW_LEFT_RIGHT) == B_FOLLOW_LEFT_RIGHT;
    if (followsBothSides && Parent() != nullptr) {
        width = Parent()->Bounds().right - Frame().left;
    } else if (followsBothSides && Window() != nullptr) {
        width = Window()->Bounds().right - Frame().left;
    } else if (followsBothSides) {
        width = std::max(width, Bounds().Width());
    }
    ResizeTo(width, height);
}

void BMenuBar::InvalidateLayout() {
    BMenu::InvalidateLayout();
}

void BMenuBar::FrameResized(float newWidth, float newHeight) {
    BMenu::FrameResized(newWidth, newHeight);
}

void BMenuBar::DrawBackground(BRect /*updateRect*/) {
    ControlLook look(this);
    const BRect bounds = Bounds();
    switch (mBorder) {
    case B_BORDER_FRAME:
        look.Bevelled(bounds, ControlLook::Bevel::Raised);
        break;
    case B_BORDER_CONTENTS:
        look.Bevelled(BRect(bounds.left, bounds.top, mContentSize.x, bounds.bottom),
                      ControlLook::Bevel::Raised);
        break;
    case B_BORDER_EACH_ITEM:
        for (int32 i = 0; i < CountItems(); ++i) {
            look.Bevelled(ItemAt(i)->Frame(), ControlLook::Bevel::Raised);
        }
        break;
    }
}

void BMenuBar::Draw(BRect updateRect) {
    BMenu::Draw(updateRect);
}
