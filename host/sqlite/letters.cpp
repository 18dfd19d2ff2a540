#include "host/sqlite/letters.h"
#include <cwctype>
#include <locale.h>
#include <wctype.h>

namespace host {
namespace {

locale_t unicode_locale() {
    static const locale_t locale = newlocale(LC_CTYPE_MASK, "C.UTF-8", nullptr);
    return locale;
}

void append_character(char32_t character, std::string& result) {
    const auto put = [&result](char32_t byte) { result.push_back(static_cast<char>(byte)); };
    if (character >= kInvalidByte) {
        put(character - kInvalidByte);
    } else if (character < 0x80) {
        put(character);
    } else if (character < 0x800) {
        put(0xc0 | character >> 6);
        put(0x80 | (character & 0x3f));
    } else if (character < 0x10000) {
        put(0xe0 | character >> 12);
        put(0x80 | (character >> 6 & 0x3f));
        put(0x80 | (character & 0x3f));
    } else {
        put(0xf0 | character >> 18);
        put(0x80 | (character >> 12 & 0x3f));
        put(0x80 | (character >> 6 & 0x3f));
        put(0x80 | (character & 0x3f));
    }
}

} // namespace

char32_t take_character(std::string_view& text) {
    const auto byte = [&text](std::size_t i) { return static_cast<unsigned char>(text[i]); };
    const unsigned char first = byte(0);
    std::size_t length = 1;
    char32_t character = first;
    char32_t smallest = 0;
    if (first >= 0xc2 && first < 0xe0) {
        length = 2;
        character = first & 0x1fU;
        smallest = 0x80;
    } else if (first >= 0xe0 && first < 0xf0) {
        length = 3;
        character = first & 0x0fU;
        smallest = 0x800;
    } else if (first >= 0xf0 && first < 0xf5) {
        length = 4;
        character = first & 0x07U;
        smallest = 0x10000;
    } else if (first >= 0x80) {
        text.remove_prefix(1);
        return kInvalidByte + first;
    }
    bool valid = text.size() >= length;
    for (std::size_t i = 1; valid && i < length; ++i) {
        valid = (byte(i) & 0xc0U) == 0x80;
        character = character << 6 | (byte(i) & 0x3fU);
    }
    if (!valid || character < smallest || character > 0x10ffff ||
        (character >= 0xd800 && character < 0xe000)) {
        text.remove_prefix(1);
        return kInvalidByte + first;
    }
    text.remove_prefix(length);
    return character;
}

char32_t lower(char32_t character) {
    if (character < 0x80)
        return character >= 'A' && character <= 'Z' ? character + 32 : character;
    const locale_t locale = unicode_locale();
    if (character >= kInvalidByte || locale == nullptr)
        return character;
    return static_cast<char32_t>(towlower_l(static_cast<wint_t>(character), locale));
}

void lower_into(std::string_view text, std::string& result) {
    result.clear();
    while (!text.empty()) {
        const auto first = static_cast<unsigned char>(text.front());
        if (first < 0x80) {
            result.push_back(first >= 'A' && first <= 'Z' ? static_cast<char>(first + 32) : text.front());
            text.remove_prefix(1);
        } else {
            append_character(lower(take_character(text)), result);
        }
    }
}

std::string lowered(std::string_view text) {
    std::string result;
    lower_into(text, result);
    return result;
}

} // namespace host
