// Where the text, the icon and the buttons of an alert lie. Plain arithmetic: measures and draws nothing.
#pragma once

#include <InterfaceDefs.h>
#include <Rect.h>

#include <functional>
#include <string>
#include <string_view>
#include <vector>

// Lines as wide as `width` at most, broken between words, within a word only where it alone is wider. A line
// break in the text is kept; the space at which a line is broken is not. At least one line.
std::vector<std::string> wrapped_lines(std::string_view text, float width,
                                       const std::function<float(std::string_view)>& widthOf);

struct AlertContents {
    bool hasIcon = false;
    float textWidth = 0;            // of the widest line
    float textHeight = 0;           // of all lines
    std::vector<float> labelWidths; // one for each button: what it needs to show its label
    float buttonHeight = 0;         // bottom - top
    button_width width = B_WIDTH_AS_USUAL;
    bool offsetFirst = false;
};

// In the alert's coordinates.
struct AlertLayout {
    BRect bounds;
    BRect stripe; // behind the icon; not valid without one
    BRect icon;
    BRect text;
    std::vector<BRect> buttons;
};

// The widest that lines of an alert's text should be.
inline constexpr float kAlertTextWidth = 380;

AlertLayout lay_out_alert(const AlertContents& contents);
