// HintedMenu: a menu that finds its items by the numbers they carry.
#pragma once

#include <Menu.h>

// Every item must be a HintedMenuItem; that is not checked.
class HintedMenu : public BMenu {
  public:
    explicit HintedMenu(const char* title);
    ~HintedMenu() override;

    // The first item with that hint, or null.
    BMenuItem* FindItemHint(int32 hint) const;
};
