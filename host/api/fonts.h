// Fonts and text: measuring it and turning it into coverage masks.
//
// Thread rule: every function may be called from any thread, any number of them at once.
//
// The desktop's fonts need a graphical application object. When the process has none, the first call here
// makes one without a display (the "offscreen" platform) and keeps it until the process ends. So a program
// that will open windows makes its own graphical application object, on its main thread, before anything
// measures or draws text; and a program that never touches text never gets one. Where the process already
// runs an application object without graphics, text is measured by a rule of thumb and drawn as nothing:
// fonts_available() tells.
//
// Widths and masks of the texts asked for lately are kept, up to a few megabytes, so that a list that is
// drawn again costs only the copying of pixels.
//
// Text is UTF-8; what is not valid UTF-8 is shown as replacement characters, control characters as blanks.
// Sizes, widths and heights are logical pixels.
#pragma once

#include <cstddef>
#include <cstdint>
#include <memory>
#include <string>
#include <string_view>
#include <vector>

namespace host {

// The families that the desktop's settings choose; anything else is a family's own name.
inline constexpr std::string_view default_sans_family = "";
inline constexpr std::string_view default_fixed_family = "*fixed*";

struct FontSpec {
    std::string family; // default_sans_family, default_fixed_family or a name
    float size = 12.0F; // logical pixels; rounded to whole ones, kept within 1 .. 1000
    int weight = 400;   // 100 thin .. 400 regular .. 700 bold .. 900 black
    bool italic = false;
    bool antialiased = true;

    bool operator==(const FontSpec&) const = default;
};

// Distances from the baseline, all positive.
struct FontHeight {
    float ascent = 0;
    float descent = 0;
    float leading = 0;
};

struct FontStyle {
    std::string name; // as the font file calls it: "Book", "Bold Oblique"
    int weight = 400;
    bool italic = false;
};

// The pixels that a text touches: one coverage byte a pixel, 0 nothing .. 255 all.
struct TextMask {
    int left = 0; // device pixels from the text's origin (on the baseline) to the mask's first column
    int top = 0;  // device pixels from the baseline to the mask's first row; negative above it
    int width = 0;
    int height = 0;
    std::vector<std::uint8_t> coverage; // width x height, row after row without padding
};

// The part of the text worth having, in device pixels from its origin; right and bottom are outside.
struct TextWindow {
    int left = 0;
    int top = 0;
    int right = 0;
    int bottom = 0;
};

[[nodiscard]] bool fonts_available();

[[nodiscard]] FontHeight font_height(const FontSpec& font);

// How far the pen moves when the text is drawn.
[[nodiscard]] float text_width(const FontSpec& font, std::string_view text);

// For each code point of the text (an invalid byte counts as one), the pen's advance over it. The first code
// point of a cluster (a letter with its combining marks) carries the whole cluster's advance.
[[nodiscard]] std::vector<float> text_advances(const FontSpec& font, std::string_view text);

// Draws the text with `scale` device pixels for one logical pixel (clamped to 0.25 .. 16). The mask holds at
// least what of the text lies within the window, which must not be larger than 16384 pixels on a side; null
// where nothing of the text is inked.
[[nodiscard]] std::shared_ptr<const TextMask> render_text(const FontSpec& font, std::string_view text,
                                                          double scale, TextWindow window);

// Names of the installed families, sorted, each once.
[[nodiscard]] std::vector<std::string> font_families();

// A family's styles; empty for a family that is not installed.
[[nodiscard]] std::vector<FontStyle> font_styles(std::string_view family);

[[nodiscard]] bool family_is_fixed_width(std::string_view family);

// The installed family that stands behind default_sans_family or default_fixed_family; other names come back
// as they are.
[[nodiscard]] std::string resolve_family(std::string_view family);

} // namespace host
