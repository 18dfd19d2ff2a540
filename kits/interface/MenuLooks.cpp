// The part of BMenu that measures, places and draws its items.
#include <Menu.h>

#include "ControlLook.h"
#include "LooperHold.h"
#include "MenuLayout.h"
#include "MenuTriggers.h"
#include "MenuWindow.h"

#include <MenuItem.h>

#include <algorithm>

void BMenu::SetItemMargins(float left, float top, float right, float bottom) {
    *mMargins = {left, top, right, bottom};
    InvalidateLayout();
}

void BMenu::GetItemMargins(float* left, float* top, float* right, float* bottom) const {
    const std::pair<float*, float> wanted[] = {
        {left, mMargins->left}, {top, mMargins->top}, {right, mMargins->right}, {bottom, mMargins->bottom}};
    for (const auto& [pointer, value] : wanted) {
        if (pointer != nullptr) {
            *pointer = value;
        }
    }
}

void BMenu::InvalidateLayout() {
    const LooperHold hold(this);
    mLayoutValid = false;
    if (Host() != nullptr) {
        LayoutItems();
        Invalidate();
        if (auto* const window = dynamic_cast<MenuWindow*>(Window()); window != nullptr) {
            window->MenuChanged();
        }
    }
}

std::vector<MenuItemExtent> BMenu::MeasuredItems() {
    std::vector<MenuItemExtent> extents;
    for (const std::unique_ptr<BMenuItem>& item : mItems) {
        MenuItemExtent extent;
        item->GetContentSize(&extent.width, &extent.height);
        if (mMaxContentWidth > 0) {
            extent.width = std::min(extent.width, mMaxContentWidth);
        }
        if (item->mShortcut != 0) {
            extent.shortcutWidth = StringWidth(item->ShortcutText().c_str());
        }
        extents.push_back(extent);
    }
    return extents;
}

void BMenu::LayoutItems() {
    if (mLayoutValid) {
        return;
    }
    // First, so that hooks that ask for frames while they are measured do not come back here.
    mLayoutValid = true;
    ChooseTriggers();
    MenuLayout layout;
    switch (mLayout) {
    case B_ITEMS_IN_ROW:
        layout = lay_out_row(MeasuredItems(), *mMargins);
        break;
    case B_ITEMS_IN_COLUMN:
        layout = lay_out_column(MeasuredItems(), *mMargins);
        break;
    case B_ITEMS_IN_MATRIX: {
        std::vector<BRect> frames;
        for (const std::unique_ptr<BMenuItem>& item : mItems) {
            frames.push_back(item->mFrame);
        }
        layout = lay_out_matrix(frames, mMatrixWidth, mMatrixHeight);
        break;
    }
    }
    for (size_t i = 0; i < mItems.size(); ++i) {
        mItems[i]->mFrame = layout.frames[i];
    }
    mShortcutLeft = layout.shortcutLeft;
    mContentSize = layout.bounds.RightBottom();
    if (mResizeToFit) {
        ResizeToPreferred();
    }
}

void BMenu::ChooseTriggers() {
    std::vector<MenuTriggerWish> wishes;
    for (const std::unique_ptr<BMenuItem>& item : mItems) {
        wishes.push_back({item->mLabel, item->mTrigger});
    }
    const std::vector<MenuTrigger> triggers = choose_triggers(wishes);
    for (size_t i = 0; i < mItems.size(); ++i) {
        mItems[i]->mChosenTrigger = mTriggersEnabled ? triggers[i].letter : '\0';
        mItems[i]->mTriggerPosition = mTriggersEnabled ? triggers[i].position : -1;
    }
}

void BMenu::GetPreferredSize(float* width, float* height) {
    LayoutItems();
    if (width != nullptr) {
        *width = mContentSize.x;
    }
    if (height != nullptr) {
        *height = mContentSize.y;
    }
}

void BMenu::ResizeToPreferred() {
    BView::ResizeToPreferred();
}

void BMenu::DrawBackground(BRect /*updateRect*/) {}

void BMenu::Draw(BRect updateRect) {
    LayoutItems();
    DrawBackground(updateRect);
    for (const std::unique_ptr<BMenuItem>& item : mItems) {
        if (item->mFrame.Intersects(updateRect)) {
            item->Draw();
        }
    }
}

void BMenu::SelectItem(BMenuItem* item) {
    const LooperHold hold(this);
    if (item == mSelected) {
        return;
    }
    BMenuItem* const before = mSelected;
    mSelected = item;
    if (before != nullptr) {
        before->Select(false);
    }
    if (item != nullptr) {
        item->Select(true);
    }
}

void BMenu::ShowTriggers(bool show) {
    const LooperHold hold(this);
    if (show != mTriggersShown) {
        mTriggersShown = show;
        Invalidate();
    }
}

BMenuItem* BMenu::ItemUnder(BPoint where) const {
    for (const std::unique_ptr<BMenuItem>& item : mItems) {
        if (item->mFrame.Contains(where)) {
            return item.get();
        }
    }
    return nullptr;
}
