// MenuFieldBar and MenuFieldItem: the one title of a menu field, and the bar that it lies in.
#pragma once

#include <MenuBar.h>
#include <MenuItem.h>

class BMenuField;

// Covers the field's menu part. Never becomes the window's key menu bar.
class MenuFieldBar : public BMenuBar {
  public:
    MenuFieldBar(BRect frame, BMenuField* field);

    void AttachedToWindow() override;
    void DrawBackground(BRect /*updateRect*/) override {}
    void MouseDown(BPoint where) override;

  private:
    BMenuField* const mField;
};

// Fills the bar and draws the field's frame, text and arrow.
class MenuFieldItem : public BMenuItem {
  public:
    MenuFieldItem(BMenu* menu, BMenuField* field);

  protected:
    void GetContentSize(float* width, float* height) override;
    void Draw() override;

  private:
    BMenuField* const mField;
};
