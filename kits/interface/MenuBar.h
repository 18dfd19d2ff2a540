// BMenuBar: the row of menus along the top of a window.
#pragma once

#include "PopUpHost.h"

#include <Menu.h>

#include <memory>

class MenuBarSession;

enum menu_bar_border { B_BORDER_FRAME, B_BORDER_CONTENTS, B_BORDER_EACH_ITEM };

// A menu that lies open in a window. By mouse: press, drag and release, or click and click. By keyboard: Alt
// alone, or F10, goes to the bar and back; Alt with a letter opens the menu of that trigger; then arrows,
// Enter, Escape and triggers. That is so in the bar that is the window's key menu bar, which the first one to
// be attached becomes.
//
// Items without a target get the window as theirs; the shortcuts of all items of the key menu bar work in the
// window. The window's MenusBeginning() and MenusEnded() are called around each use, in its thread.
class BMenuBar : public BMenu, public KeyMenuTarget {
  public:
    // With `resizeToFit` the bar takes the height of its items, and its parent's width when it follows both
    // sides, else that of its items.
    BMenuBar(BRect frame, const char* name, uint32 resizingMode = B_FOLLOW_LEFT_RIGHT | B_FOLLOW_TOP,
             menu_layout layout = B_ITEMS_IN_ROW, bool resizeToFit = true);
    explicit BMenuBar(BMessage* archive);
    ~BMenuBar() override;

    static BArchivable* Instantiate(BMessage* archive);
    // Adds "_border" (int32) where it is not B_BORDER_FRAME.
    status_t Archive(BMessage* archive, bool deep = true) const override;

    virtual void SetBorder(menu_bar_border border);
    menu_bar_border Border() const { return mBorder; }

    void Draw(BRect updateRect) override;
    void DrawBackground(BRect updateRect) override;
    void AttachedToWindow() override;
    void DetachedFromWindow() override;
    void MessageReceived(BMessage* message) override;
    void MouseDown(BPoint where) override;
    void MouseUp(BPoint where) override;
    void MouseMoved(BPoint where, uint32 code, const BMessage* dragMessage) override;
    void WindowActivated(bool active) override;
    void FrameResized(float newWidth, float newHeight) override;
    void ResizeToPreferred() override;
    void GetPreferredSize(float* width, float* height) override;
    void InvalidateLayout() override;
    void Show() override;
    void Hide() override;

    void OpenByKey() override;
    bool OpenByCharacter(const char* bytes, int32 count) override;
    bool InvokeShortcut(uint32 key, uint32 modifiers) override;

  private:
    friend class BMenu;
    friend class BMenuItem;
    friend class BMenuField;
    class InputFilter;

    // Begins it with the title selected, or null for none; see MenuTracker for the ways.
    void StartByMouse(BMenuItem* title, BPoint where);
    void StartByKey(BMenuItem* title, bool open);
    std::shared_ptr<MenuBarSession> NewSession();
    void FollowSession(const std::shared_ptr<MenuBarSession>& session);
    void SessionOver();
    void AbandonSession();
    // The item goes out of the bar or a menu below it.
    void ItemLeaves(BMenuItem* item);
    BMenuItem* FirstTitle() const;

    menu_bar_border mBorder = B_BORDER_FRAME;
    std::shared_ptr<MenuBarSession> mSession;
    // While it is attached to a window; the window's common filter.
    std::unique_ptr<InputFilter> mFilter;
};
