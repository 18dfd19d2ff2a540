#include "AlertLayout.h"

#include "Utf8Text.h"

#include <algorithm>
#include <cmath>

namespace {

constexpr float kLeastWidth = 300;
constexpr float kMargin = 12;
constexpr float kStripeWidth = 30;
constexpr float kIconSide = 31;
constexpr float kIconLeft = 14;
constexpr float kTextLeftOfIcon = 58;
constexpr float kButtonGap = 10;
constexpr float kOffsetGap = 40;
constexpr float kUsualButtonWidth = 75;

// The bytes of the longest beginning of the word that fits; one character at least.
size_t FittingPart(std::string_view word, float width,
                   const std::function<float(std::string_view)>& widthOf) {
    size_t length = utf8_char_length(word);
    while (length < word.size()) {
        const size_t longer = length + utf8_char_length(word.substr(length));
        if (widthOf(word.substr(0, longer)) > width) {
            break;
        }
        length = longer;
    }
    return length;
}

void WrapParagraph(std::string_view paragraph, float width,
                   const std::function<float(std::string_view)>& widthOf, std::vector<std::string>& lines) {
    while (widthOf(paragraph) > width) {
        size_t end = 0;
        // The last space at which what comes before it fits.
        for (size_t space = paragraph.find(' '); space != std::string_view::npos;
             space = paragraph.find(' ', space + 1)) {
            if (widthOf(paragraph.substr(0, space)) > width) {
                break;
            }
            end = space;
        }
        if (end == 0) {
            const size_t part = FittingPart(paragraph, width, widthOf);
            if (part >= paragraph.size()) {
                break;
            }
            lines.emplace_back(paragraph.substr(0, part));
            paragraph.remove_prefix(part);
        } else {
            lines.emplace_back(paragraph.substr(0, end));
            paragraph.remove_prefix(end + 1);
        }
    }
    lines.emplace_back(paragraph);
}

std::vector<float> ButtonWidths(const AlertContents& contents) {
    std::vector<float> widths = contents.labelWidths;
    if (contents.width == B_WIDTH_AS_USUAL) {
        for (float& width : widths) {
            width = std::max(width, kUsualButtonWidth);
        }
    } else if (contents.width == B_WIDTH_FROM_WIDEST && !widths.empty()) {
        widths.assign(widths.size(), *std::max_element(widths.begin(), widths.end()));
    }
    return widths;
}

float GapBehind(size_t button, const AlertContents& contents) {
    const bool offset = contents.offsetFirst && contents.labelWidths.size() == 3 && button == 0;
    return offset ? kOffsetGap : kButtonGap;
}

} // namespace

std::vector<std::string> wrapped_lines(std::string_view text, float width,
                                       const std::function<float(std::string_view)>& widthOf) {
    std::vector<std::string> lines;
    for (;;) {
        const size_t end = text.find('\n');
        WrapParagraph(text.substr(0, end), width, widthOf, lines);
        if (end == std::string_view::npos) {
            return lines;
        }
        text.remove_prefix(end + 1);
    }
}

AlertLayout lay_out_alert(const AlertContents& contents) {
    const float textLeft = contents.hasIcon ? kTextLeftOfIcon : kMargin;
    const std::vector<float> widths = ButtonWidths(contents);
    float buttonsWidth = 0;
    for (size_t i = 0; i < widths.size(); ++i) {
        buttonsWidth += std::ceil(widths[i]) + (i + 1 < widths.size() ? GapBehind(i, contents) : 0);
    }
    const float buttonsLeft = contents.hasIcon ? kStripeWidth + kMargin : kMargin;
    const float width = std::max({kLeastWidth, textLeft + std::ceil(contents.textWidth) + kMargin,
                                  buttonsLeft + buttonsWidth + kMargin});

    AlertLayout layout;
    layout.text = BRect(textLeft, kMargin, textLeft + std::ceil(contents.textWidth),
                        kMargin + std::ceil(contents.textHeight));
    float contentBottom = layout.text.bottom;
    if (contents.hasIcon) {
        layout.icon = BRect(kIconLeft, kMargin, kIconLeft + kIconSide, kMargin + kIconSide);
        contentBottom = std::max(contentBottom, layout.icon.bottom);
    }
    const float buttonsTop = contentBottom + kMargin;
    float right = width - kMargin;
    layout.buttons.resize(widths.size());
    for (size_t i = widths.size(); i > 0; --i) {
        const float left = right - std::ceil(widths[i - 1]);
        layout.buttons[i - 1] = BRect(left, buttonsTop, right, buttonsTop + contents.buttonHeight);
        right = left - (i > 1 ? GapBehind(i - 2, contents) : 0);
    }
    const float bottom = widths.empty() ? buttonsTop : buttonsTop + contents.buttonHeight + kMargin;
    layout.bounds = BRect(0, 0, width, bottom);
    if (contents.hasIcon) {
        layout.stripe = BRect(0, 0, kStripeWidth, bottom);
    }
    return layout;
}
