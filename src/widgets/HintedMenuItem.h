// HintedMenuItem: a menu item that carries a number to be found by.
#pragma once

#include <MenuItem.h>

class HintedMenuItem : public BMenuItem {
  public:
    HintedMenuItem(const char* label, BMessage* message, int32 hint, char shortcut, uint32 modifiers);
    ~HintedMenuItem() override;

    int32 GetHint() const { return mHint; }

  private:
    int32 mHint;
};
