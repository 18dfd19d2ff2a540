// BMenuField: a label, and beside it a menu to choose from.
#pragma once

#include <View.h>

#include <string>

class BMenu;
class BMenuBar;
class BMenuItem;
class MenuFieldBar;

// The label lies left of the divider, the menu's field right of it, which shows the item that is marked when
// the menu's label comes from there, else the menu's name. A press opens the menu below the field; so do
// Space, Return and the Down arrow while the field has the focus. Messages of the items go to the window
// unless they have a target. The field is as high as the font needs, whatever its frame says. Thread rule:
// that of BView; the menu's is that of menus below a menu bar.
class BMenuField : public BView {
  public:
    // The menu is the field's from here on. With a label the divider is in the middle, without one at the
    // left edge. With `fixedSize` the field keeps its width, else it is as wide as what it shows needs, but
    // never reaches beyond the view.
    BMenuField(BRect frame, const char* name, const char* label, BMenu* menu,
               uint32 resizingMode = B_FOLLOW_LEFT | B_FOLLOW_TOP, uint32 flags = B_WILL_DRAW | B_NAVIGABLE);
    BMenuField(BRect frame, const char* name, const char* label, BMenu* menu, bool fixedSize,
               uint32 resizingMode = B_FOLLOW_LEFT | B_FOLLOW_TOP, uint32 flags = B_WILL_DRAW | B_NAVIGABLE);
    ~BMenuField() override;

    void AttachedToWindow() override;
    void Draw(BRect updateRect) override;
    void MouseDown(BPoint where) override;
    void KeyDown(const char* bytes, int32 numBytes) override;
    void MakeFocus(bool focus = true) override;
    void WindowActivated(bool active) override;
    void FrameResized(float newWidth, float newHeight) override;
    void SetFont(const BFont* font, uint32 mask = B_FONT_ALL) override;
    void GetPreferredSize(float* width, float* height) override;

    BMenu* Menu() const { return mMenu; }
    BMenuBar* MenuBar() const;
    // What the menu hangs from.
    BMenuItem* MenuItem() const;

    virtual void SetLabel(const char* label);
    const char* Label() const { return mLabel.c_str(); }
    virtual void SetEnabled(bool enabled);
    bool IsEnabled() const { return mEnabled; }
    // Of the label.
    virtual void SetAlignment(alignment label);
    alignment Alignment() const { return mAlignment; }
    // From the left edge to the field.
    virtual void SetDivider(float position);
    float Divider() const { return mDivider; }
    // The arrow at the field's right side, which is shown at first.
    void ShowPopUpMarker() { SetMarkerShown(true); }
    void HidePopUpMarker() { SetMarkerShown(false); }

  private:
    friend class MenuFieldBar;
    friend class MenuFieldItem;

    void OpenMenu();
    void PlaceBar();
    void SetMarkerShown(bool shown);
    float NeededHeight() const;
    // What the field needs to show this text.
    float FieldWidthFor(const char* text) const;
    BRect FieldRect() const;
    bool ShowsFocus() const;

    std::string mLabel;
    BMenu* const mMenu;           // the item's
    MenuFieldBar* mBar = nullptr; // our child
    float mDivider = 0;
    alignment mAlignment = B_ALIGN_LEFT;
    bool mEnabled = true;
    bool mFixedSize = true;
    bool mMarkerShown = true;
};
