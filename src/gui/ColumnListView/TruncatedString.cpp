#include "gui/ColumnListView/TruncatedString.h"

#include <Font.h>

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

// Letters stand beside each other: those before the cut say how wide it is at least.
int FirstThatMayFitInAscii(const char* full, int length, float width) {
    const float size = be_plain_font->Size();
    const float slack = size / 2;
    std::vector<float> advances(static_cast<size_t>(length));
    be_plain_font->GetEscapements(full, length, advances.data());
    float least = -slack;
    for (int i = 1; i < length; ++i) {
        least += advances[static_cast<size_t>(i - 1)] * size;
        if (least > width) {
            return i - 1;
        }
    }
    return length - 1;
}

// In other scripts letters join or change places, but a longer beginning is hardly ever the narrower one.
int FirstThatMayFit(const char* full, int length, float width) {
    const float slack = 2 * be_plain_font->Size();
    int first = 0;
    int last = length - 1;
    while (first < last) {
        int middle = (first + last + 1) / 2;
        while (middle > first && !StartsCharacter(full[middle])) {
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
    if (length == 0 || !(be_plain_font->StringWidth(out) > width)) {
        return;
    }
    const auto bytes = static_cast<int>(length);
    int i = IsAscii(full) ? FirstThatMayFitInAscii(full, bytes, width) : FirstThatMayFit(full, bytes, width);
    do {
        ShortenTo(out, i);
    } while (i >= -2 && be_plain_font->StringWidth(out) > width);
}
