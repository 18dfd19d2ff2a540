// Pop-up windows: what menus are shown in. Internal to the kit.
#pragma once

#include <Window.h>

// A pop-up is a BWindow made with B_NO_BORDER_WINDOW_LOOK and kPopUpWindowFeel. It has no border, is not
// managed by the window manager, stands above everything and never becomes the active window: the window that
// was active stays so. Make it hidden, MoveTo() and ResizeTo() its place, Show() it; Hide() it or Quit() it
// to end it.
//
// While pop-ups are shown they form a stack, the last one shown on top, and the pointer and the keyboard
// belong to them:
// - The pointer within a pop-up goes to that pop-up (the newest one where they overlap), as with any window,
//   also with a button held since before it was shown; so a press in a menu bar, dragged into the menu and
//   let go there, gives the menu B_MOUSE_MOVED and B_MOUSE_UP.
// - The pointer outside of all of them goes to the bottom pop-up alone, as kOutsidePopUps. That includes the
//   program's own windows: the menu bar asks for its place on the screen (ConvertFromScreen) to see whether
//   the pointer is over one of its titles. No other window hears of it; a press outside is swallowed.
// - Keys go to the newest pop-up: to its focus view if it has one, else to the window (DispatchMessage,
//   B_KEY_DOWN for MessageReceived). No shortcuts and no keyboard navigation apply there.
// - kPopUpsDismissed is posted to the bottom pop-up when the pop-ups should go: another program became
// active,
//   or the desktop has closed them. The menu hides its windows upon it, as upon a press outside.
// GetMouse() and modifiers() work as ever, in the pop-up's views as well as in other views.
inline constexpr window_feel kPopUpWindowFeel = static_cast<window_feel>(1025);

// Fields: "kind" int32 (B_MOUSE_DOWN, B_MOUSE_MOVED or B_MOUSE_UP), "screen_where" BPoint, "buttons" int32,
// "modifiers" int32, "clicks" int32 (of a press), "when" int64. Posted to the window, its default handler.
inline constexpr uint32 kOutsidePopUps = 'PUot';
inline constexpr uint32 kPopUpsDismissed = 'PUds';

// What a BMenuBar has to do with its window. BMenuBar derives from it and announces itself with
// BWindow::SetKeyMenuBar(); calls come in the window's thread.
class KeyMenuTarget {
  public:
    virtual ~KeyMenuTarget() = default;
    // Alt was pressed and let go alone, or F10: open the first menu for the keyboard.
    virtual void OpenByKey() = 0;
    // Alt and this character. False when no menu's title has it.
    virtual bool OpenByCharacter(const char* bytes, int32 count) = 0;
    // A key was pressed with B_COMMAND_KEY (Control). Invokes the item of any of the bar's menus that has
    // this shortcut: `key` a character in upper case, or a code as B_DELETE; `modifiers` of B_COMMAND_KEY,
    // B_SHIFT_KEY, B_OPTION_KEY alone. True when there is one, also a disabled one. So items do not have to
    // register with the window.
    virtual bool InvokeShortcut(uint32 key, uint32 modifiers) = 0;
};
