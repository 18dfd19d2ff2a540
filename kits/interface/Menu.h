// BMenu: a list of items to choose from, shown in a window of its own while it is open.
#pragma once

#include <InterfaceDefs.h>
#include <List.h>
#include <View.h>

#include <functional>
#include <memory>
#include <vector>

class BMenu;
class BMenuBar;
class BMenuItem;
class BMessenger;
class MenuWindows;
struct MenuItemExtent;
struct MenuMargins;

enum menu_layout { B_ITEMS_IN_ROW = 0, B_ITEMS_IN_COLUMN, B_ITEMS_IN_MATRIX };

// How menus look.
struct menu_info {
    float font_size;
    font_family f_family;
    font_style f_style;
    rgb_color background_color;
    int32 separator;
    bool click_to_open;
    bool triggers_always_shown;
};

// Any thread. Menus that are made afterwards look so. B_BAD_VALUE for null.
status_t get_menu_info(menu_info* info);
status_t set_menu_info(const menu_info* info);

// Asked again and again while the menu is open; true closes it without a choice.
typedef bool (*menu_tracking_hook)(BMenu* menu, void* state);

// Owns its items, and they their submenus. A menu that is not a menu bar belongs to no window while it is
// closed. While it is open its view lies in a window of the kit's own.
//
// Thread rule: a menu below a menu bar is guarded by the lock of the bar's window, whether it is open or not;
// changing it while it is open may be done under that lock. Any other menu is its owner's until Go() or
// Track() is called, and again after they have returned or the asynchronous menu has closed.
//
// A menu that is higher than the screen scrolls.
class BMenu : public BView {
  public:
    explicit BMenu(const char* title, menu_layout layout = B_ITEMS_IN_COLUMN);
    // Items lie where they are told to, on a ground of that size.
    BMenu(const char* title, float width, float height);
    explicit BMenu(BMessage* archive);
    ~BMenu() override;

    static BArchivable* Instantiate(BMessage* archive);
    // Adds "_layout" (int32), where they differ from a new menu's "_rsize_to_fit", "_disable", "_radio",
    // "_trig_disabled" and "_dyn_label" (bool) and "_maxwidth" (float); deep, the items' archives "_items"
    // and, of a matrix, their frames "_i_frames".
    status_t Archive(BMessage* archive, bool deep = true) const override;

    void AttachedToWindow() override;
    void DetachedFromWindow() override;
    void AllAttached() override;
    void AllDetached() override;

    // The menu owns what was added. False, and no change, for null, for an item that is in a menu already,
    // and for an index that is negative or past the end.
    bool AddItem(BMenuItem* item);
    bool AddItem(BMenuItem* item, int32 index);
    // In a matrix.
    bool AddItem(BMenuItem* item, BRect frame);
    // An item that opens `menu`.
    bool AddItem(BMenu* menu);
    bool AddItem(BMenu* menu, int32 index);
    bool AddItem(BMenu* menu, BRect frame);
    // All items of a list, which stays the caller's.
    bool AddList(BList* items, int32 index);
    bool AddSeparatorItem();
    // What was removed is the caller's again. The one that takes a menu deletes the item around it.
    bool RemoveItem(BMenuItem* item);
    BMenuItem* RemoveItem(int32 index);
    bool RemoveItems(int32 index, int32 count, bool deleteItems = false);
    bool RemoveItem(BMenu* menu);

    BMenuItem* ItemAt(int32 index) const;
    BMenu* SubmenuAt(int32 index) const;
    int32 CountItems() const;
    int32 IndexOf(BMenuItem* item) const;
    int32 IndexOf(BMenu* menu) const;
    // The first item of that command or label, here or in submenus; null when there is none.
    BMenuItem* FindItem(uint32 command) const;
    BMenuItem* FindItem(const char* label) const;
    BMenuItem* FindMarked() const;

    // For the items of this menu, not of submenus; the first error ends it.
    virtual status_t SetTargetForItems(BHandler* target);
    virtual status_t SetTargetForItems(BMessenger target);
    virtual void SetEnabled(bool enabled);
    // At most one item is marked, the first one of those that are, and choosing one marks it.
    virtual void SetRadioMode(bool radioMode);
    virtual void SetTriggersEnabled(bool enabled);
    // Labels are cut to this width; 0, as at first, for no limit.
    virtual void SetMaxContentWidth(float maxWidth);
    // The item that this menu hangs from shows the label of the item that is marked here.
    void SetLabelFromMarked(bool labelFromMarked);
    bool IsLabelFromMarked() const { return mLabelFromMarked; }
    // False also when the menu hangs from a disabled item.
    bool IsEnabled() const;
    bool IsRadioMode() const { return mRadioMode; }
    bool AreTriggersEnabled() const { return mTriggersEnabled; }
    float MaxContentWidth() const { return mMaxContentWidth; }

    // What this menu hangs from; null for a menu bar and for a menu that is opened by itself.
    BMenu* Supermenu() const;
    BMenuItem* Superitem() const { return mSuperitem; }

    void Draw(BRect updateRect) override;
    // Fills what lies behind the items.
    virtual void DrawBackground(BRect updateRect);
    void MessageReceived(BMessage* message) override;
    void GetPreferredSize(float* width, float* height) override;
    void ResizeToPreferred() override;
    void FrameMoved(BPoint newPosition) override;
    void FrameResized(float newWidth, float newHeight) override;
    void MakeFocus(bool focus = true) override;
    // Has the items measured and placed again.
    virtual void InvalidateLayout();

    void SetTrackingHook(menu_tracking_hook hook, void* state);

    // For menus whose items are found out when they open. Called with B_INITIAL_ADD, then, as long as the
    // answer is true, with B_PROCESSING; the menu opens after that. When the user goes away from the item
    // that it hangs from, or leaves menus, it is called once more with B_ABORT, and the menu does not open.
    // The bar's window is locked meanwhile.
    enum add_state { B_INITIAL_ADD, B_PROCESSING, B_ABORT };
    virtual bool AddDynamicItem(add_state state);

  protected:
    BMenu(BRect frame, const char* name, uint32 resizingMode, uint32 flags, menu_layout layout,
          bool resizeToFit);

    void SetItemMargins(float left, float top, float right, float bottom);
    void GetItemMargins(float* left, float* top, float* right, float* bottom) const;
    menu_layout Layout() const { return mLayout; }
    // Opens the menu at ScreenLocation() and returns the item that was chosen, without invoking it, or null.
    // With `startOpened` it stays open when the mouse button is released inside `clickToOpen` (screen
    // coordinates) or, without one, where it was opened.
    BMenuItem* Track(bool startOpened = false, BRect* clickToOpen = nullptr);
    // Opens the menu at ScreenLocation(), for the owner to close again: nobody follows the pointer or the
    // keys, which the open menu keeps from all other windows. Without effect when it has no items, or without
    // a display. In a menu that lies in a window already, they show and hide it like any view.
    void Show() override;
    void Show(bool selectFirst);
    void Hide() override;
    // Where the left top corner of the menu is wanted, in screen coordinates. The menu is moved from there as
    // far as it takes to lie on the screen.
    virtual BPoint ScreenLocation();

  private:
    friend class BMenuItem;
    friend class BMenuBar;
    friend class BPopUpMenu;
    friend class BSeparatorItem;
    friend class MenuTracker;
    friend class MenuSession;
    friend class MenuWindow;

    void Initialise();
    void TakeArchive(const BMessage& archive);
    bool InsertItem(BMenuItem* item, int32 index);
    // Measures and places the items unless that is up to date.
    void LayoutItems();
    // For the sizes of items in this menu's font, in order.
    std::vector<MenuItemExtent> MeasuredItems();
    void ChooseTriggers();
    void ItemMarked(BMenuItem* item);
    // Null selects none.
    void SelectItem(BMenuItem* item);
    // Shows or hides the lines under the letters that choose items.
    void ShowTriggers(bool show);
    // By the frames of the last layout.
    BMenuItem* ItemUnder(BPoint where) const;
    // Calls AddDynamicItem() until it is done. False when it was not, as the user has left.
    bool AddDynamicItems(const std::function<bool()>& userLeaves);
    // The items and those below them now belong to a menu bar in this window, or no longer.
    void Install(BMenuBar* bar);
    void Uninstall();

    menu_layout mLayout = B_ITEMS_IN_COLUMN;
    bool mResizeToFit = true;
    bool mEnabled = true;
    bool mRadioMode = false;
    bool mLabelFromMarked = false;
    bool mTriggersEnabled = true;
    bool mTriggersShown = false;
    bool mLayoutValid = false;
    float mMaxContentWidth = 0;
    float mMatrixWidth = 0;
    float mMatrixHeight = 0;
    float mShortcutLeft = 0;
    // Width and height of all items together.
    BPoint mContentSize;
    std::unique_ptr<MenuMargins> mMargins;
    std::vector<std::unique_ptr<BMenuItem>> mItems;
    BMenuItem* mSuperitem = nullptr;
    BMenuItem* mSelected = nullptr;
    BMenuBar* mBar = nullptr;
    // Where the menu opens unless ScreenLocation() says otherwise.
    BPoint mUsualLocation;
    menu_tracking_hook mTrackingHook = nullptr;
    void* mTrackingState = nullptr;
    // Between Show() and Hide().
    std::unique_ptr<MenuWindows> mShownAlone;
};
