#include "TextLayout.h"

#include "TextCharacters.h"
#include "Utf8Text.h"

#include <algorithm>
#include <cmath>

TextLayout::TextLayout() : mLines(1), mX(1, 0.0F) {}

void TextLayout::LayOut(std::string_view text, const TextLayoutRules& rules) {
    mLines.clear();
    mX.assign(text.size() + 1, 0.0F);
    for (size_t start = 0;;) {
        const size_t end = std::min(text.find('\n', start), text.size());
        AddParagraph(text, static_cast<int32>(start), static_cast<int32>(end), rules);
        if (end == text.size()) {
            return;
        }
        start = end + 1;
    }
}

void TextLayout::AddParagraph(std::string_view text, int32 start, int32 end, const TextLayoutRules& rules) {
    struct Character {
        int32 offset = 0;
        int32 length = 0;
        float advance = 0;
        bool isTab = false;
        bool isBlank = false;
    };
    const std::string_view paragraph =
        text.substr(static_cast<size_t>(start), static_cast<size_t>(end - start));
    const std::vector<float> advances = paragraph.empty() ? std::vector<float>() : rules.advances(paragraph);
    std::vector<Character> characters;
    for (size_t offset = 0; offset < paragraph.size();) {
        const size_t length = utf8_char_length(paragraph.substr(offset));
        const float advance = characters.size() < advances.size() ? advances[characters.size()] : 0.0F;
        const char first = paragraph[offset];
        characters.push_back({start + static_cast<int32>(offset), static_cast<int32>(length), advance,
                              first == '\t', first == '\t' || first == ' '});
        offset += length;
    }
    Line line{start, end, 0, true};
    float x = 0;
    size_t lineFirst = 0; // of the characters
    size_t afterBlank = 0;
    for (size_t i = 0; i < characters.size();) {
        const Character& character = characters[i];
        const float tab = std::max(1.0F, rules.tabWidth);
        const float advance = character.isTab ? tab - std::fmod(x, tab) : character.advance;
        const bool tooWide = rules.wrapWidth > 0 && x + advance > rules.wrapWidth && !character.isBlank;
        if (tooWide && i > lineFirst) {
            const size_t next = afterBlank > lineFirst ? afterBlank : i;
            line.end = characters[next].offset;
            line.width = next == i ? x : mX[static_cast<size_t>(line.end)];
            line.endsParagraph = false;
            mLines.push_back(line);
            line = {characters[next].offset, end, 0, true};
            lineFirst = next;
            afterBlank = next;
            i = next;
            x = 0;
            continue;
        }
        std::fill_n(mX.begin() + character.offset, character.length, x);
        x += advance;
        // What the next character would have here, should the line end before it.
        mX[static_cast<size_t>(character.offset + character.length)] = x;
        ++i;
        if (character.isBlank) {
            afterBlank = i;
        }
    }
    line.width = x;
    mLines.push_back(line);
}

int32 TextLayout::LineAt(int32 offset) const {
    const auto behind = std::upper_bound(mLines.begin(), mLines.end(), offset,
                                         [](int32 wanted, const Line& line) { return wanted < line.start; });
    return std::max(0, static_cast<int32>(behind - mLines.begin()) - 1);
}

float TextLayout::WidestLine() const {
    float widest = 0;
    for (const Line& line : mLines) {
        widest = std::max(widest, line.width);
    }
    return widest;
}

float TextLayout::XAt(int32 offset) const {
    return mX[static_cast<size_t>(std::clamp(offset, 0, static_cast<int32>(mX.size()) - 1))];
}

int32 TextLayout::OffsetAt(int32 line, float x, std::string_view text) const {
    const Line& wanted = mLines[static_cast<size_t>(line)];
    // The end of a broken line is the next one's beginning, so the caret stops before it.
    const int32 end = wanted.endsParagraph || wanted.end == wanted.start
                          ? wanted.end
                          : static_cast<int32>(previous_character(text, static_cast<size_t>(wanted.end)));
    int32 offset = wanted.start;
    while (offset < end) {
        const auto next = static_cast<int32>(next_character(text, static_cast<size_t>(offset)));
        const float right = next >= wanted.end ? wanted.width : XAt(next);
        if (x < (XAt(offset) + right) / 2) {
            break;
        }
        offset = next;
    }
    return std::min(offset, end);
}
