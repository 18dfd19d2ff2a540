// Constants of windows, views, keys and controls.
#pragma once

#include <GraphicsDefs.h>
#include <SupportDefs.h>

// Character codes of keys that print nothing.
enum {
    B_BACKSPACE = 0x08,
    B_RETURN = 0x0a,
    B_ENTER = 0x0a,
    B_SPACE = 0x20,
    B_TAB = 0x09,
    B_ESCAPE = 0x1b,
    B_SUBSTITUTE = 0x1a,
    B_LEFT_ARROW = 0x1c,
    B_RIGHT_ARROW = 0x1d,
    B_UP_ARROW = 0x1e,
    B_DOWN_ARROW = 0x1f,
    B_INSERT = 0x05,
    B_DELETE = 0x7f,
    B_HOME = 0x01,
    B_END = 0x04,
    B_PAGE_UP = 0x0b,
    B_PAGE_DOWN = 0x0c,
    B_FUNCTION_KEY = 0x10
};

// Key codes behind B_FUNCTION_KEY.
enum {
    B_F1_KEY = 0x02,
    B_F2_KEY = 0x03,
    B_F3_KEY = 0x04,
    B_F4_KEY = 0x05,
    B_F5_KEY = 0x06,
    B_F6_KEY = 0x07,
    B_F7_KEY = 0x08,
    B_F8_KEY = 0x09,
    B_F9_KEY = 0x0a,
    B_F10_KEY = 0x0b,
    B_F11_KEY = 0x0c,
    B_F12_KEY = 0x0d,
    B_PRINT_KEY = 0x0e,
    B_SCROLL_KEY = 0x0f,
    B_PAUSE_KEY = 0x10
};

// Bits of the modifier keys.
enum {
    B_SHIFT_KEY = 0x00000001,
    B_COMMAND_KEY = 0x00000002,
    B_CONTROL_KEY = 0x00000004,
    B_CAPS_LOCK = 0x00000008,
    B_SCROLL_LOCK = 0x00000010,
    B_NUM_LOCK = 0x00000020,
    B_OPTION_KEY = 0x00000040,
    B_MENU_KEY = 0x00000080,
    B_LEFT_SHIFT_KEY = 0x00000100,
    B_RIGHT_SHIFT_KEY = 0x00000200,
    B_LEFT_COMMAND_KEY = 0x00000400,
    B_RIGHT_COMMAND_KEY = 0x00000800,
    B_LEFT_CONTROL_KEY = 0x00001000,
    B_RIGHT_CONTROL_KEY = 0x00002000,
    B_LEFT_OPTION_KEY = 0x00004000,
    B_RIGHT_OPTION_KEY = 0x00008000
};

enum { B_PRIMARY_MOUSE_BUTTON = 0x01, B_SECONDARY_MOUSE_BUTTON = 0x02, B_TERTIARY_MOUSE_BUTTON = 0x04 };

// What BView::MouseMoved() is told about the pointer.
enum { B_ENTERED_VIEW = 0, B_INSIDE_VIEW, B_EXITED_VIEW, B_OUTSIDE_VIEW };

typedef struct key_info {
    uint32 modifiers;
    uint8 key_states[16]; // a bit for each key number, most significant first
} key_info;

// The modifier keys held, as of the last event that any window of the program has had. Any thread. Control
// counts as B_CONTROL_KEY and B_COMMAND_KEY, Alt as B_OPTION_KEY, the key with the logo as B_MENU_KEY.
uint32 modifiers();
// The modifiers are filled in; single keys are not known to a program on this desktop, their states are 0.
status_t get_key_info(key_info* info);

// The greatest time between the two presses of a double click, in microseconds.
status_t get_click_speed(bigtime_t* speed);
status_t set_click_speed(bigtime_t speed);

// Event masks and their options for BView::SetMouseEventMask() and SetEventMask().
enum { B_POINTER_EVENTS = 0x00000001, B_KEYBOARD_EVENTS = 0x00000002 };
enum {
    B_LOCK_WINDOW_FOCUS = 0x00000001,
    B_SUSPEND_VIEW_FOCUS = 0x00000002,
    B_NO_POINTER_HISTORY = 0x00000004
};

enum { B_TRACK_WHOLE_RECT, B_TRACK_RECT_CORNER };

enum mouse_mode { B_NORMAL_MOUSE = 0, B_CLICK_TO_FOCUS_MOUSE = -1, B_FOCUS_FOLLOWS_MOUSE = 1 };

// The parts of a font that BView::SetFont() takes over.
enum {
    B_FONT_FAMILY_AND_STYLE = 0x00000001,
    B_FONT_SIZE = 0x00000002,
    B_FONT_SHEAR = 0x00000004,
    B_FONT_ROTATION = 0x00000008,
    B_FONT_SPACING = 0x00000010,
    B_FONT_ENCODING = 0x00000020,
    B_FONT_FACE = 0x00000040,
    B_FONT_FLAGS = 0x00000080,
    B_FONT_ALL = 0x000000FF
};

// View flags.
inline constexpr uint32 B_FULL_UPDATE_ON_RESIZE = 0x80000000U;
inline constexpr uint32 B_WILL_DRAW = 0x20000000U;
inline constexpr uint32 B_PULSE_NEEDED = 0x10000000U;
inline constexpr uint32 B_NAVIGABLE_JUMP = 0x08000000U;
inline constexpr uint32 B_FRAME_EVENTS = 0x04000000U;
inline constexpr uint32 B_NAVIGABLE = 0x02000000U;
inline constexpr uint32 B_SUBPIXEL_PRECISE = 0x01000000U;
inline constexpr uint32 B_DRAW_ON_CHILDREN = 0x00800000U;
// "be:opcode" of a B_INPUT_METHOD_EVENT, which goes to the focus view: with B_INPUT_METHOD_CHANGED, the text
// that an input method is working on is "be:string", empty when there is none any more, and its caret stands
// at byte "be:selection" (int32). What is finished comes as keys.
inline constexpr int32 B_INPUT_METHOD_CHANGED = 2;
inline constexpr uint32 B_INPUT_METHOD_AWARE = 0x00400000U;

// Resizing modes: for each edge of a view, the edge of its parent that it keeps its distance to. Four
// hexadecimal digits: top, left, bottom, right.
inline constexpr uint32 _VIEW_TOP_ = 1;
inline constexpr uint32 _VIEW_LEFT_ = 2;
inline constexpr uint32 _VIEW_BOTTOM_ = 3;
inline constexpr uint32 _VIEW_RIGHT_ = 4;
inline constexpr uint32 _VIEW_CENTER_ = 5;

inline constexpr uint32 _rule_(uint32 top, uint32 left, uint32 bottom, uint32 right) {
    return (top << 12) | (left << 8) | (bottom << 4) | right;
}

inline constexpr uint32 B_FOLLOW_NONE = 0;
inline constexpr uint32 B_FOLLOW_ALL_SIDES = _rule_(_VIEW_TOP_, _VIEW_LEFT_, _VIEW_BOTTOM_, _VIEW_RIGHT_);
inline constexpr uint32 B_FOLLOW_ALL = B_FOLLOW_ALL_SIDES;
inline constexpr uint32 B_FOLLOW_LEFT = _rule_(0, _VIEW_LEFT_, 0, _VIEW_LEFT_);
inline constexpr uint32 B_FOLLOW_RIGHT = _rule_(0, _VIEW_RIGHT_, 0, _VIEW_RIGHT_);
inline constexpr uint32 B_FOLLOW_LEFT_RIGHT = _rule_(0, _VIEW_LEFT_, 0, _VIEW_RIGHT_);
inline constexpr uint32 B_FOLLOW_H_CENTER = _rule_(0, _VIEW_CENTER_, 0, _VIEW_CENTER_);
inline constexpr uint32 B_FOLLOW_TOP = _rule_(_VIEW_TOP_, 0, _VIEW_TOP_, 0);
inline constexpr uint32 B_FOLLOW_BOTTOM = _rule_(_VIEW_BOTTOM_, 0, _VIEW_BOTTOM_, 0);
inline constexpr uint32 B_FOLLOW_TOP_BOTTOM = _rule_(_VIEW_TOP_, 0, _VIEW_BOTTOM_, 0);
inline constexpr uint32 B_FOLLOW_V_CENTER = _rule_(_VIEW_CENTER_, 0, _VIEW_CENTER_, 0);

enum orientation { B_HORIZONTAL, B_VERTICAL };

enum button_width { B_WIDTH_AS_USUAL, B_WIDTH_FROM_WIDEST, B_WIDTH_FROM_LABEL };

enum alignment { B_ALIGN_LEFT, B_ALIGN_RIGHT, B_ALIGN_CENTER };

enum border_style { B_PLAIN_BORDER, B_FANCY_BORDER, B_NO_BORDER };

enum join_mode { B_ROUND_JOIN = 0, B_MITER_JOIN, B_BEVEL_JOIN, B_BUTT_JOIN, B_SQUARE_JOIN };

enum cap_mode { B_ROUND_CAP = B_ROUND_JOIN, B_BUTT_CAP = B_BUTT_JOIN, B_SQUARE_CAP = B_SQUARE_JOIN };

inline constexpr float B_DEFAULT_MITER_LIMIT = 10.0F;

inline constexpr float B_V_SCROLL_BAR_WIDTH = 14.0F;
inline constexpr float B_H_SCROLL_BAR_HEIGHT = 14.0F;

// The colours of the interface.
enum color_which {
    B_PANEL_BACKGROUND_COLOR = 1,
    B_MENU_BACKGROUND_COLOR = 2,
    B_WINDOW_TAB_COLOR = 3,
    B_KEYBOARD_NAVIGATION_COLOR = 4,
    B_DESKTOP_COLOR = 5,
    B_MENU_SELECTION_BACKGROUND_COLOR = 6,
    B_MENU_ITEM_TEXT_COLOR = 7,
    B_MENU_SELECTED_ITEM_TEXT_COLOR = 8
};

// Black for a number that is none of these. Any thread.
rgb_color ui_color(color_which which);

// Tints: below 1 towards white, above 1 towards black.
inline constexpr float B_LIGHTEN_MAX_TINT = 0.0F;
inline constexpr float B_LIGHTEN_2_TINT = 0.385F;
inline constexpr float B_LIGHTEN_1_TINT = 0.590F;
inline constexpr float B_NO_TINT = 1.0F;
inline constexpr float B_DARKEN_1_TINT = 1.147F;
inline constexpr float B_DARKEN_2_TINT = 1.295F;
inline constexpr float B_DARKEN_3_TINT = 1.407F;
inline constexpr float B_DARKEN_4_TINT = 1.555F;
inline constexpr float B_DARKEN_MAX_TINT = 2.0F;
inline constexpr float B_DISABLED_LABEL_TINT = B_DARKEN_3_TINT;
inline constexpr float B_HIGHLIGHT_BACKGROUND_TINT = B_DARKEN_2_TINT;
inline constexpr float B_DISABLED_MARK_TINT = B_LIGHTEN_2_TINT;

// The colour at this tint; its alpha stays.
rgb_color tint_color(rgb_color color, float tint);

// The colours behind B_CMAP8 pixels, one table for the life of the program. Any thread.
const color_map* system_colors();
