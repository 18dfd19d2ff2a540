// BPopUpMenu: a menu that opens anywhere on the screen.
#pragma once

#include <Menu.h>

#include <atomic>

// In radio mode and with its label from the marked item, unless told otherwise. Until it has closed, nobody
// but the menu itself touches it or its items.
class BPopUpMenu : public BMenu {
  public:
    explicit BPopUpMenu(const char* title, bool radioMode = true, bool labelFromMarked = true,
                        menu_layout layout = B_ITEMS_IN_COLUMN);
    explicit BPopUpMenu(BMessage* archive);
    ~BPopUpMenu() override;

    static BArchivable* Instantiate(BMessage* archive);

    // Opens the menu with its left top corner at `where` (screen coordinates).
    //
    // Synchronously (`async` false) it returns when the menu has closed: the item that was chosen, or null.
    // Called in a window's thread, which holds the window's lock, it has the window's updates drawn
    // meanwhile. Asynchronously it returns null at once, and a thread of the menu's own does the rest. Null,
    // too, when the menu is open already or there is no display.
    //
    // With `deliversMessage` the chosen item is invoked; in radio mode it is marked in any case.
    //
    // While a mouse button is held it chooses where it is let go, and another press is not needed. Let go
    // where it was pressed, inside `clickToOpen`, or anywhere with `openAnyway`, it leaves the menu open; let
    // go elsewhere outside it closes the menu.
    BMenuItem* Go(BPoint where, bool deliversMessage = false, bool openAnyway = false, bool async = false);
    BMenuItem* Go(BPoint where, bool deliversMessage, bool openAnyway, BRect clickToOpen, bool async = false);

    // The menu deletes itself after an asynchronous Go().
    void SetAsyncAutoDestruct(bool autoDestruct) { mAutoDestruct = autoDestruct; }
    bool AsyncAutoDestruct() const { return mAutoDestruct; }

  protected:
    // Where Go() was told to open it; one that hangs from an item opens where any menu does.
    BPoint ScreenLocation() override;

  private:
    struct Opening;
    BMenuItem* Start(const Opening& opening, bool async);
    BMenuItem* Run(const Opening& opening);
    static int32 ThreadEntry(void* opening);

    BPoint mWhere;
    std::atomic<bool> mOpen{false};
    bool mAutoDestruct = false;
};
