// BMenuItem: one line of a menu; BSeparatorItem: a line between others.
#pragma once

#include <Archivable.h>
#include <InterfaceDefs.h>
#include <Invoker.h>
#include <Rect.h>

#include <string>

class BFont;
class BMenu;
class BMenuBar;
class BWindow;

// A label, a message that is sent when the item is chosen, perhaps a submenu. Belongs to the menu that it was
// added to, and owns its message and its submenu.
//
// Thread rule: as the menu's own, see Menu.h. The drawing hooks are called by the thread that draws the menu.
//
// Target: an item without one gets the window of the menu bar that it comes into.
class BMenuItem : public BArchivable, public BInvoker {
  public:
    // `shortcut` is pressed together with B_COMMAND_KEY, which need not be named, and the other `modifiers`.
    BMenuItem(const char* label, BMessage* message, char shortcut = 0, uint32 modifiers = 0);
    // An item that opens a menu; the label is the menu's name.
    explicit BMenuItem(BMenu* menu, BMessage* message = nullptr);
    explicit BMenuItem(BMessage* archive);
    ~BMenuItem() override;

    static BArchivable* Instantiate(BMessage* archive);
    // Adds "_label", where they differ from a new item's "_disable" and "_marked" (bool), "_user_trig" and
    // "_shortcut" with "_mods" (int32), "_msg", and deep the submenu's archive "_submenu".
    status_t Archive(BMessage* archive, bool deep = true) const override;

    virtual void SetLabel(const char* label);
    virtual void SetEnabled(bool enabled);
    // In a menu in radio mode, marking one unmarks the others.
    virtual void SetMarked(bool marked);
    // A letter of the label to choose the item with, in any case; 0 lets the menu pick one.
    virtual void SetTrigger(char trigger);
    // 0 takes the shortcut away.
    virtual void SetShortcut(char shortcut, uint32 modifiers);

    const char* Label() const;
    // False also when the menu that the item is in, or one above it, is disabled.
    bool IsEnabled() const;
    bool IsMarked() const;
    // As it was set.
    char Trigger() const;
    char Shortcut(uint32* modifiers = nullptr) const;

    BMenu* Submenu() const;
    // The menu that the item is in, or null.
    BMenu* Menu() const;
    // In the menu's coordinates; all margins included.
    BRect Frame() const;

  protected:
    // The size of what DrawContent() draws, without the menu's margins.
    virtual void GetContentSize(float* width, float* height);
    // Writes the label, cut to at most `maxWidth`, into a buffer that holds the label and four bytes more.
    virtual void TruncateLabel(float maxWidth, char* newLabel);
    // Draws the content with the pen at ContentLocation(); the high colour is the text's.
    virtual void DrawContent();
    // Draws the item in its frame: the selection, the content, mark, shortcut and arrow.
    virtual void Draw();
    // Called when the item becomes selected or is no longer; has it drawn again.
    virtual void Highlight(bool on);
    bool IsSelected() const;
    // The left top corner of the content, in the menu's coordinates.
    BPoint ContentLocation() const;

    // Sends the message with "when" (system_time()), "source" (pointer, this item) and "index" (int32, the
    // item's in its menu) added; in radio mode marks the item first. Does nothing while disabled.
    status_t Invoke(BMessage* message = nullptr) override;

  private:
    friend class BMenu;
    friend class BMenuBar;
    friend class MenuSession;
    friend class MenuTracker;

    void SetSubmenu(BMenu* menu);
    // Tells the menu that the item's size has changed, or only its looks.
    void SizeChanged();
    void LooksChanged();
    // The item and all below it now belong to a menu bar of this window, or no longer.
    void Install(BMenuBar* bar);
    void Uninstall();
    void Select(bool selected);
    std::string ShortcutText() const;
    void DrawSigns();
    void DrawTriggerLine();

    std::string mLabel;
    std::unique_ptr<BMenu> mSubmenu;
    BMenu* mMenu = nullptr;
    // The bar that it has come into, and the window that this item sends to only because of that.
    BMenuBar* mBar = nullptr;
    bool mTargetsWindow = false;
    BRect mFrame;
    char mTrigger = 0;
    // The letter that chooses the item, and its byte in the label, as the menu has picked them.
    char mChosenTrigger = 0;
    int32 mTriggerPosition = -1;
    char mShortcut = 0;
    uint32 mModifiers = 0;
    bool mEnabled = true;
    bool mMarked = false;
    bool mSelected = false;
};

// Cannot be enabled, selected or chosen.
class BSeparatorItem : public BMenuItem {
  public:
    BSeparatorItem();
    explicit BSeparatorItem(BMessage* archive);
    ~BSeparatorItem() override;

    static BArchivable* Instantiate(BMessage* archive);
    status_t Archive(BMessage* archive, bool deep = true) const override;
    // Without effect.
    void SetEnabled(bool enabled) override;

  protected:
    void GetContentSize(float* width, float* height) override;
    void Draw() override;
};
