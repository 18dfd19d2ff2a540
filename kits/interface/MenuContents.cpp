// The part of BMenu that holds its items.
#include <Menu.h>

#include "LooperHold.h"

#include <MenuBar.h>
#include <MenuItem.h>

#include <algorithm>
#include <cstring>

bool BMenu::InsertItem(BMenuItem* item, int32 index) {
    const LooperHold hold(this);
    if (item == nullptr || item->mMenu != nullptr || index < 0 || index > CountItems()) {
        return false;
    }
    mItems.emplace(mItems.begin() + index, item);
    item->mMenu = this;
    if (mBar != nullptr) {
        item->Install(mBar);
    }
    if (item->IsMarked()) {
        ItemMarked(item);
    }
    InvalidateLayout();
    return true;
}

bool BMenu::AddItem(BMenuItem* item) {
    return InsertItem(item, CountItems());
}

bool BMenu::AddItem(BMenuItem* item, int32 index) {
    return InsertItem(item, index);
}

bool BMenu::AddItem(BMenuItem* item, BRect frame) {
    if (item == nullptr || item->mMenu != nullptr || mLayout != B_ITEMS_IN_MATRIX) {
        return false;
    }
    item->mFrame = frame;
    return InsertItem(item, CountItems());
}

bool BMenu::AddItem(BMenu* menu) {
    return AddItem(menu, CountItems());
}

bool BMenu::AddItem(BMenu* menu, int32 index) {
    if (menu == nullptr || menu->mSuperitem != nullptr || index < 0 || index > CountItems()) {
        return false;
    }
    return InsertItem(new BMenuItem(menu), index);
}

bool BMenu::AddItem(BMenu* menu, BRect frame) {
    if (menu == nullptr || menu->mSuperitem != nullptr || mLayout != B_ITEMS_IN_MATRIX) {
        return false;
    }
    return AddItem(new BMenuItem(menu), frame);
}

bool BMenu::AddList(BList* items, int32 index) {
    if (items == nullptr || index < 0 || index > CountItems()) {
        return false;
    }
    bool all = true;
    for (int32 i = 0; i < items->CountItems(); ++i) {
        const bool added = InsertItem(static_cast<BMenuItem*>(items->ItemAt(i)), index);
        index += added ? 1 : 0;
        all = all && added;
    }
    return all;
}

bool BMenu::AddSeparatorItem() {
    return AddItem(new BSeparatorItem);
}

BMenuItem* BMenu::RemoveItem(int32 index) {
    const LooperHold hold(this);
    if (index < 0 || index >= CountItems()) {
        return nullptr;
    }
    const auto place = mItems.begin() + index;
    BMenuItem* const item = place->get();
    if (mSelected == item) {
        SelectItem(nullptr);
    }
    item->Uninstall();
    // Released only now: what is asked of the item above looks for it here.
    (void)place->release();
    mItems.erase(place);
    item->mMenu = nullptr;
    InvalidateLayout();
    return item;
}

bool BMenu::RemoveItem(BMenuItem* item) {
    return item != nullptr && RemoveItem(IndexOf(item)) == item;
}

bool BMenu::RemoveItem(BMenu* menu) {
    const std::unique_ptr<BMenuItem> item(RemoveItem(IndexOf(menu)));
    if (item == nullptr) {
        return false;
    }
    menu->mSuperitem = nullptr;
    (void)item->mSubmenu.release();
    return true;
}

bool BMenu::RemoveItems(int32 index, int32 count, bool deleteItems) {
    if (index < 0 || count < 0 || index > CountItems() - count) {
        return false;
    }
    for (int32 i = 0; i < count; ++i) {
        BMenuItem* const item = RemoveItem(index);
        if (deleteItems) {
            delete item;
        }
    }
    return true;
}

BMenuItem* BMenu::ItemAt(int32 index) const {
    return index < 0 || index >= CountItems() ? nullptr : mItems[static_cast<size_t>(index)].get();
}

BMenu* BMenu::SubmenuAt(int32 index) const {
    const BMenuItem* const item = ItemAt(index);
    return item == nullptr ? nullptr : item->Submenu();
}

int32 BMenu::CountItems() const {
    return static_cast<int32>(mItems.size());
}

int32 BMenu::IndexOf(BMenuItem* item) const {
    for (int32 i = 0; i < CountItems(); ++i) {
        if (ItemAt(i) == item) {
            return i;
        }
    }
    return -1;
}

int32 BMenu::IndexOf(BMenu* menu) const {
    for (int32 i = 0; menu != nullptr && i < CountItems(); ++i) {
        if (SubmenuAt(i) == menu) {
            return i;
        }
    }
    return -1;
}

BMenuItem* BMenu::FindItem(uint32 command) const {
    for (const std::unique_ptr<BMenuItem>& item : mItems) {
        if (item->Message() != nullptr && item->Command() == command) {
            return item.get();
        }
        if (item->Submenu() != nullptr) {
            if (BMenuItem* const found = item->Submenu()->FindItem(command); found != nullptr) {
                return found;
            }
        }
    }
    return nullptr;
}

BMenuItem* BMenu::FindItem(const char* label) const {
    for (const std::unique_ptr<BMenuItem>& item : mItems) {
        if (label != nullptr && std::strcmp(item->Label(), label) == 0) {
            return item.get();
        }
        if (item->Submenu() != nullptr) {
            if (BMenuItem* const found = item->Submenu()->FindItem(label); found != nullptr) {
                return found;
            }
        }
    }
    return nullptr;
}

BMenuItem* BMenu::FindMarked() const {
    for (const std::unique_ptr<BMenuItem>& item : mItems) {
        if (item->IsMarked()) {
            return item.get();
        }
    }
    return nullptr;
}

status_t BMenu::SetTargetForItems(BHandler* target) {
    status_t status = B_OK;
    for (int32 i = 0; status == B_OK && i < CountItems(); ++i) {
        status = ItemAt(i)->SetTarget(target);
    }
    return status;
}

status_t BMenu::SetTargetForItems(BMessenger target) {
    status_t status = B_OK;
    for (int32 i = 0; status == B_OK && i < CountItems(); ++i) {
        status = ItemAt(i)->SetTarget(target);
    }
    return status;
}

void BMenu::Install(BMenuBar* bar) {
    mBar = bar;
    for (const std::unique_ptr<BMenuItem>& item : mItems) {
        item->Install(bar);
    }
}

void BMenu::Uninstall() {
    mBar = nullptr;
    for (const std::unique_ptr<BMenuItem>& item : mItems) {
        item->Uninstall();
    }
}
