// MenuPaneView: what surrounds the items of an open menu: the border and the strips that scroll.
#pragma once

#include "MenuPane.h"

#include <View.h>

class BMenu;

// Fills its window or bitmap, whose left top corner is that of the pane's frame. The menu is lent to it until
// ReleaseMenu().
class MenuPaneView : public BView {
  public:
    MenuPaneView(BMenu* menu, const MenuPane& pane);
    ~MenuPaneView() override;

    void SetPane(const MenuPane& pane);
    void ReleaseMenu();

    void Draw(BRect updateRect) override;

  private:
    BRect InView(BRect onScreen) const { return onScreen.OffsetByCopy(B_ORIGIN - mPane.Frame().LeftTop()); }
    void DrawStrip(BRect strip, bool up, bool enabled);

    BMenu* mMenu;
    BView* const mItemArea; // a child, which cuts the menu off where it is scrolled
    MenuPane mPane;
};
