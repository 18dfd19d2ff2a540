#include "display_text.h"

namespace host {

namespace {

constexpr char32_t replacement = 0xFFFD;

// The code point at the start of `rest` and its length; an invalid start is one replacement character.
struct Decoded {
    char32_t code_point = replacement;
    std::size_t length = 1;
};

Decoded decode(std::string_view rest) {
    const auto byte = [&](std::size_t i) { return static_cast<unsigned char>(rest[i]); };
    const unsigned char first = byte(0);
    if (first < 0x80) {
        return {first, 1};
    }
    std::size_t length = 0;
    char32_t value = 0;
    char32_t smallest = 0;
    if (first >= 0xC2 && first <= 0xDF) {
        length = 2;
        value = first & 0x1FU;
        smallest = 0x80;
    } else if (first >= 0xE0 && first <= 0xEF) {
        length = 3;
        value = first & 0x0FU;
        smallest = 0x800;
    } else if (first >= 0xF0 && first <= 0xF4) {
        length = 4;
        value = first & 0x07U;
        smallest = 0x10000;
    } else {
        return {};
    }
    if (rest.size() < length) {
        return {};
    }
    for (std::size_t i = 1; i < length; ++i) {
        if ((byte(i) & 0xC0U) != 0x80U) {
            return {};
        }
        value = (value << 6) | (byte(i) & 0x3FU);
    }
    if (value < smallest || value > 0x10FFFF || (value >= 0xD800 && value <= 0xDFFF)) {
        return {};
    }
    return {value, length};
}

bool is_control(char32_t c) {
    return c < 0x20 || (c >= 0x7F && c < 0xA0) || c == 0x2028 || c == 0x2029;
}

} // namespace

DisplayText display_text(std::string_view utf8) {
    DisplayText result;
    result.text.reserve(static_cast<qsizetype>(utf8.size()));
    result.starts.reserve(utf8.size());
    while (!utf8.empty()) {
        Decoded next = decode(utf8);
        utf8.remove_prefix(next.length);
        if (is_control(next.code_point)) {
            next.code_point = U' ';
        }
        result.starts.push_back(static_cast<int>(result.text.size()));
        if (next.code_point < 0x10000) {
            result.text.append(QChar(static_cast<char16_t>(next.code_point)));
        } else {
            result.text.append(QChar(QChar::highSurrogate(next.code_point)));
            result.text.append(QChar(QChar::lowSurrogate(next.code_point)));
        }
    }
    return result;
}

} // namespace host
