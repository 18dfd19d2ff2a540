#include "MenuPaneView.h"

#include "ControlLook.h"

#include <Menu.h>

MenuPaneView::MenuPaneView(BMenu* menu, const MenuPane& pane)
    : BView(pane.Frame().OffsetToCopy(B_ORIGIN), "menu pane", B_FOLLOW_ALL, B_WILL_DRAW), mMenu(menu),
      mItemArea(new BView(BRect(0, 0, 0, 0), "items", B_FOLLOW_NONE, 0)) {
    SetViewColor(menu->ViewColor());
    mItemArea->SetViewColor(B_TRANSPARENT_COLOR);
    AddChild(mItemArea);
    mItemArea->AddChild(menu);
    SetPane(pane);
}

MenuPaneView::~MenuPaneView() {
    ReleaseMenu();
}

void MenuPaneView::SetPane(const MenuPane& pane) {
    mPane = pane;
    const BRect area = InView(pane.ItemArea());
    mItemArea->MoveTo(area.LeftTop());
    mItemArea->ResizeTo(area.Width(), area.Height());
    if (mMenu != nullptr) {
        mMenu->MoveTo(0, -pane.Offset());
    }
    Invalidate(InView(pane.UpStrip()));
    Invalidate(InView(pane.DownStrip()));
}

void MenuPaneView::ReleaseMenu() {
    if (mMenu != nullptr) {
        mItemArea->RemoveChild(mMenu);
        mMenu->MoveTo(B_ORIGIN);
        mMenu = nullptr;
    }
}

void MenuPaneView::Draw(BRect /*updateRect*/) {
    {
        ControlLook look(this);
        look.Bevelled(look.Frame(Bounds(), ControlLook::kDarkFrame), ControlLook::Bevel::Raised);
    }
    if (mPane.Scrolls()) {
        DrawStrip(InView(mPane.UpStrip()), true, mPane.Offset() > 0);
        DrawStrip(InView(mPane.DownStrip()), false, mPane.Offset() < mPane.GreatestOffset());
    }
}

void MenuPaneView::DrawStrip(BRect strip, bool up, bool enabled) {
    ControlState state;
    state.enabled = enabled;
    ControlLook(this).Arrow(strip, up ? ControlLook::Direction::Up : ControlLook::Direction::Down, state);
}
