// TextLayout: breaks a text into lines and knows where on its line every character stands.
#pragma once

#include <SupportDefs.h>

#include <functional>
#include <string_view>
#include <vector>

// How wide lines may become, and what characters measure.
struct TextLayoutRules {
    // For each code point (an invalid byte counts as one) how far it moves the pen.
    std::function<std::vector<float>(std::string_view)> advances;
    // 0 and less: lines end at line feeds only. Otherwise also before a word that does not fit, or inside one
    // that fits on no line; blanks at the end of a line may stand out.
    float wrapWidth = 0;
    float tabWidth = 28;
};

// Offsets are bytes, distances pixels from the line's beginning. There is always one line; a line feed
// belongs to no line's width and ends the line it stands on. Laying out walks through the whole text.
class TextLayout {
  public:
    TextLayout();

    void LayOut(std::string_view text, const TextLayoutRules& rules);

    int32 CountLines() const { return static_cast<int32>(mLines.size()); }
    // Where a line is broken without a line feed, the offset between two lines is on the second.
    int32 LineAt(int32 offset) const;
    int32 StartOf(int32 line) const { return mLines[static_cast<size_t>(line)].start; }
    // Behind the last character, before the line feed.
    int32 EndOf(int32 line) const { return mLines[static_cast<size_t>(line)].end; }
    // Whether a line feed, or the text's end, ends it.
    bool EndsParagraph(int32 line) const { return mLines[static_cast<size_t>(line)].endsParagraph; }
    float WidthOf(int32 line) const { return mLines[static_cast<size_t>(line)].width; }
    float WidestLine() const;

    // Of an offset on its line; inside a character, its beginning's.
    float XAt(int32 offset) const;
    // The offset on that line that is nearest to the position.
    int32 OffsetAt(int32 line, float x, std::string_view text) const;

  private:
    struct Line {
        int32 start = 0;
        int32 end = 0;
        float width = 0;
        bool endsParagraph = true;
    };

    // Lays out what lies between two line feeds.
    void AddParagraph(std::string_view text, int32 start, int32 end, const TextLayoutRules& rules);

    std::vector<Line> mLines;
    std::vector<float> mX; // for each byte, and the text's end
};
