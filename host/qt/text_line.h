// One line of shaped text: its widths, and the pixels that it covers.
//
// Thread rule: a line belongs to the thread that made it.
#pragma once

#include "display_text.h"
#include "host/api/fonts.h"
#include "text_font.h"

#include <QTextLayout>

#include <memory>
#include <string>
#include <string_view>
#include <vector>

namespace host {

class TextLine {
  public:
    TextLine(const FontKey& font, std::string_view text);

    bool is_of(const FontKey& font, std::string_view text) const { return text_ == text && font_ == font; }
    // With trailing blanks.
    float width() const;
    // As text_advances() has them.
    std::vector<float> advances() const;
    // Everything that can be inked, with `scale` device pixels for one logical pixel.
    TextWindow reach(double scale) const;
    // What the text covers within the window, without the empty rows and columns around it; null for nothing.
    // The window is at most 16384 pixels wide and high.
    std::shared_ptr<const TextMask> draw(double scale, TextWindow window) const;

  private:
    FontKey font_;
    std::string text_;
    DisplayText shown_;
    QTextLayout layout_;
    QTextLine line_;
};

// The line that this thread has asked for last is kept, so that a text that is measured and then drawn is
// shaped once. The reference is good until the thread's next call.
const TextLine& text_line(const FontKey& font, std::string_view text);

} // namespace host
