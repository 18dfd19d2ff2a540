// MenuPane: the place of an open menu on the screen, and how far it is scrolled. Plain arithmetic.
#pragma once

#include <Rect.h>

// Around the items lies a border; a menu that is higher than its place has a strip with an arrow above and
// below the items, which scroll between them. The menu bar is a pane without border. All in screen
// coordinates unless it says "in the menu", whose origin is the first item's left top corner.
class MenuPane {
  public:
    static constexpr float kBorder = 2;
    static constexpr float kStripHeight = 13;

    enum class Border { Drawn, None };
    enum class Zone { Outside, Border, ScrollUp, ScrollDown, Items };

    MenuPane() = default;
    // `contentHeight` is bottom - top of all items together.
    MenuPane(BRect frame, float contentHeight, Border border = Border::Drawn);

    // What a menu needs around its content for all of it to show: twice the border more.
    static float OuterSide(float contentSide) { return contentSide + 2 * kBorder; }

    BRect Frame() const { return mFrame; }
    bool Scrolls() const;
    // Where items can be seen.
    BRect ItemArea() const;
    // Not valid unless Scrolls().
    BRect UpStrip() const;
    BRect DownStrip() const;
    // How many pixels of the content lie above ItemArea().
    float Offset() const { return mOffset; }
    float GreatestOffset() const;

    Zone ZoneAt(BPoint where) const;
    BPoint ToMenu(BPoint where) const;
    BRect ToScreen(BRect inTheMenu) const;

    // Positive shows what lies below. False when nothing has moved.
    bool ScrollBy(float distance);
    // Scrolls as little as it takes to show a rectangle of the menu.
    bool Reveal(BRect inTheMenu);

  private:
    float InnerHeight() const;

    BRect mFrame;
    float mContentHeight = 0;
    float mBorder = 0;
    float mOffset = 0;
};
