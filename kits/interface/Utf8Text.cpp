#include "Utf8Text.h"

size_t utf8_char_length(std::string_view text) {
    const auto byte = [&](size_t i) { return static_cast<uint8>(text[i]); };
    const uint8 first = byte(0);
    size_t length = 1;
    if (first >= 0xC2 && first <= 0xDF) {
        length = 2;
    } else if (first >= 0xE0 && first <= 0xEF) {
        length = 3;
    } else if (first >= 0xF0 && first <= 0xF4) {
        length = 4;
    }
    if (length == 1 || text.size() < length) {
        return 1;
    }
    for (size_t i = 1; i < length; ++i) {
        if ((byte(i) & 0xC0) != 0x80) {
            return 1;
        }
    }
    const uint8 second = byte(1);
    const bool overlong = (first == 0xE0 && second < 0xA0) || (first == 0xF0 && second < 0x90);
    const bool surrogate = first == 0xED && second >= 0xA0;
    const bool tooHigh = first == 0xF4 && second >= 0x90;
    return overlong || surrogate || tooHigh ? 1 : length;
}

size_t utf8_count_chars(std::string_view text) {
    size_t count = 0;
    while (!text.empty()) {
        text.remove_prefix(utf8_char_length(text));
        ++count;
    }
    return count;
}
