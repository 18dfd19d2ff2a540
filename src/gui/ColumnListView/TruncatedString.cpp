#include "gui/ColumnListView/TruncatedString.h"

#include <Font.h>

#include <algorithm>
#include <string.h>
#include <vector>

namespace {

bool StartsCharacter(char byte) {
    return (static_cast<unsigned char>(byte) & 0xC0) != 0x80;
}

// The rule itself, once: keeps the first i bytes and puts the ellipsis behind them.
void ShortenTo(char* out, int& i) {
    while (i > 0 && out[i - 1] == ' ') {
        --i;
    }
    if (i > 0 || (i == 0 && out[0] == ' ')) {
        out[i] = '.';
    }
    if (i > -1) {
        out[i + 1] = '.';
    }
    if (i > -2) {
        out[i + 2] = '.';
    }
    out[i + 3] = '\0';
    --i;
}

// Measuring is what costs here, so what cannot fit is not measured. The two functions answer the first place
// for the ellipsis that needs a look; `slack` allows for what shaping does where a text is cut.

// Letters stand beside each other: those before the cut say how wide it is at least. Answers `length` when
// the whole text may fit. Only as many letters are looked at as a width takes when all of them are narrow.
int FirstThatMayFitInAscii(const char* full, int length, float width) {
    constexpr float kNarrowLetter = 0.25F;
    const float size = be_plain_font->Size();
    const float slack = size / 2;
    const float narrow = std::clamp((width + slack) / (size * kNarrowLetter), 0.0F, 10000.0F);
    for (int looked = std::min(length, static_cast<int>(narrow) + 2);; looked = length) {
        std::vector<float> advances(static_cast<size_t>(looked));
        be_plain_font->GetEscapements(full, looked, advances.data());
        float least = -slack;
        for (int i = 1; i <= looked; ++i) {
            least += advances[static_cast<size_t>(i - 1)] * size;
            if (least > width) {
                return i - 1;
            }
        }
        if (looked == length) {
            return length;
        }
    }
}

// In other scripts letters join or change places, but a longer beginning is hardly ever the narrower one.
// Answers `length` when the whole text may fit.
int FirstThatMayFit(const char* full, int length, float width) {
    const float slack = 2 * be_plain_font->Size();
    int first = 0;
    int last = length;
    while (first < last) {
        int middle = (first + last + 1) / 2;
        while (middle > first && full[middle] != '\0' && !StartsCharacter(full[middle])) {
            --middle;
        }
        if (middle == first) {
            break;
        }
        if (be_plain_font->StringWidth(full, middle) - slack > width) {
            last = middle - 1;
        } else {
            first = middle;
        }
    }
    return last;
}

bool IsAscii(const char* text) {
    while (*text != '\0' && (static_cast<unsigned char>(*text) & 0x80) == 0) {
        ++text;
    }
    return *text == '\0';
}

} // namespace

void GetTruncatedString(const char* full, char* out, float width) {
    const size_t length = strlen(full);
    memcpy(out, full, length + 1);
    const auto bytes = static_cast<int>(length);
    int i = IsAscii(full) ? FirstThatMayFitInAscii(full, bytes, width) : FirstThatMayFit(full, bytes, width);
    if (i == bytes) {
        if (bytes == 0 || !(be_plain_font->StringWidth(out) > width)) {
            return;
        }
        --i;
    }
    do {
        ShortenTo(out, i);
    } while (i >= -2 && be_plain_font->StringWidth(out) > width);
}
