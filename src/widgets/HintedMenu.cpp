#include "widgets/HintedMenu.h"

#include "widgets/HintedMenuItem.h"

HintedMenu::HintedMenu(const char* title) : BMenu(title, B_ITEMS_IN_COLUMN) {}

HintedMenu::~HintedMenu() = default;

BMenuItem* HintedMenu::FindItemHint(int32 hint) const {
    for (int32 index = 0; index < CountItems(); ++index) {
        auto* const item = static_cast<HintedMenuItem*>(ItemAt(index));
        if (item->GetHint() == hint)
            return item;
    }
    return nullptr;
}
