// ControlLook: colours, frames, marks and labels of all controls, menus and alerts.
#pragma once

#include <InterfaceDefs.h>
#include <Rect.h>

class BFont;
class BView;

// What a control is like while it is drawn. Pressed and focused mean nothing to a disabled control.
struct ControlState {
    bool enabled = true;
    bool focused = false;
    bool pressed = false;
    bool isDefault = false;  // a button that Return presses
    bool isSelected = false; // a menu item under the pointer
};

// Draws on one view, in its coordinates, and puts back the view's colours, pen and mode when it goes. Every
// rectangle includes its edges. What draws a frame answers the rectangle inside it. Only for a view that this
// thread may draw on; does not own it.
class ControlLook {
  public:
    static constexpr rgb_color kPanel = {216, 216, 216, 255};
    static constexpr rgb_color kPressedPanel = {176, 176, 176, 255};
    static constexpr rgb_color kShine = {255, 255, 255, 255};
    static constexpr rgb_color kShadow = {152, 152, 152, 255};
    static constexpr rgb_color kDarkFrame = {96, 96, 96, 255};
    static constexpr rgb_color kDisabledFrame = {160, 160, 160, 255};
    static constexpr rgb_color kFocus = {0, 0, 229, 255};
    static constexpr rgb_color kText = {0, 0, 0, 255};
    static constexpr rgb_color kDisabledText = {128, 128, 128, 255};
    static constexpr rgb_color kDocument = {255, 255, 255, 255};
    static constexpr rgb_color kDisabledDocument = {236, 236, 236, 255};
    static constexpr rgb_color kSelectedText = {178, 202, 236, 255};         // behind text, focused
    static constexpr rgb_color kInactiveSelectedText = {216, 216, 216, 255}; // behind text, not focused
    static constexpr rgb_color kSelectedRow = {178, 178, 178, 255};          // behind a list's row
    static constexpr rgb_color kSelectedMenuItem = {160, 160, 160, 255};     // behind a menu's item
    static constexpr rgb_color kScrollBarTrough = {184, 184, 184, 255};

    // How far FieldFrame() and ButtonFrame() reach inwards.
    static constexpr float kFieldFrameWidth = 2;
    static constexpr float kButtonFrameWidth = 3;

    enum class Bevel { Raised, Sunken };
    enum class Direction { Left, Right, Up, Down };

    explicit ControlLook(BView* view);
    ~ControlLook();
    ControlLook(const ControlLook&) = delete;
    ControlLook& operator=(const ControlLook&) = delete;

    void Fill(BRect rect, rgb_color color);
    // One pixel wide.
    BRect Frame(BRect rect, rgb_color color);
    BRect Bevelled(BRect rect, Bevel bevel);
    // Sunken, two pixels wide: around text fields and lists; with the focus colour when focused.
    BRect FieldFrame(BRect rect, ControlState state);
    // Three pixels wide, with the face filled. Focus is shown by a line inside it.
    BRect ButtonFrame(BRect rect, ControlState state);
    // One line across, dark above light: menus' separators. `y` is the upper one.
    void Separator(float left, float right, float y);

    // A text of one line within the rectangle, in the middle of its height, cut with an ellipsis where it is
    // too wide. The view's font is used.
    void Label(const char* text, BRect rect, alignment align, ControlState state) {
        LabelInColor(text, rect, align, TextColor(state));
    }
    void LabelInColor(const char* text, BRect rect, alignment align, rgb_color color);
    // A filled triangle in the middle of the rectangle.
    void Arrow(BRect rect, Direction direction, ControlState state);
    // A tick in the middle of the rectangle.
    void CheckMark(BRect rect, ControlState state);
    // A ring that fills the square, with a dot when it is on.
    void RoundMark(BRect square, bool on, ControlState state);

    static rgb_color TextColor(ControlState state) { return state.enabled ? kText : kDisabledText; }
    // The baseline, a whole number, that puts a line of this font into the middle of the rectangle's height.
    static float Baseline(const BFont& font, BRect rect);
    // Pixels that a line of this font is high, from its top to its bottom.
    static float LineHeight(const BFont& font);

  private:
    BView* const mView;
    const rgb_color mHigh;
    const rgb_color mLow;
    const drawing_mode mMode;
    const float mPenSize;
    const BPoint mPen;
};
