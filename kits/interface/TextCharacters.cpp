#include "TextCharacters.h"

#include "Utf8Text.h"

#include <algorithm>

namespace {

constexpr uint32 kReplacement = 0xFFFD;
constexpr uint32 kJoiner = 0x200D;

enum class CharacterClass { Blank, Word, Other };

bool IsWithin(uint32 code, uint32 first, uint32 last) {
    return code >= first && code <= last;
}

// Marks, variation selectors and modifiers, which stand on or change the code point before them.
bool IsAttached(uint32 code) {
    return IsWithin(code, 0x0300, 0x036F) || IsWithin(code, 0x0483, 0x0489) ||
           IsWithin(code, 0x0591, 0x05BD) || IsWithin(code, 0x064B, 0x065F) ||
           IsWithin(code, 0x1AB0, 0x1AFF) || IsWithin(code, 0x1DC0, 0x1DFF) ||
           IsWithin(code, 0x20D0, 0x20FF) || IsWithin(code, 0x3099, 0x309A) ||
           IsWithin(code, 0xFE00, 0xFE0F) || IsWithin(code, 0xFE20, 0xFE2F) ||
           IsWithin(code, 0x1F3FB, 0x1F3FF) || code == kJoiner;
}

size_t PreviousCodePoint(std::string_view text, size_t offset) {
    for (size_t length = std::min<size_t>(4, offset); length > 1; --length) {
        if (utf8_char_length(text.substr(offset - length)) == length) {
            return offset - length;
        }
    }
    return offset - 1;
}

CharacterClass ClassOf(uint32 code) {
    if (code == ' ' || code == '\t' || code == '\n' || code == 0xA0 || IsWithin(code, 0x2000, 0x200A) ||
        code == 0x3000) {
        return CharacterClass::Blank;
    }
    const bool isAsciiWord = IsWithin(code, '0', '9') || IsWithin(code, 'A', 'Z') ||
                             IsWithin(code, 'a', 'z') || code == '_' || code == '\'';
    const bool isPunctuation = code < 0x80 || IsWithin(code, 0xA1, 0xBF) || IsWithin(code, 0x2010, 0x2E7F) ||
                               IsWithin(code, 0x3001, 0x3004);
    return isAsciiWord || !isPunctuation ? CharacterClass::Word : CharacterClass::Other;
}

CharacterClass ClassBehind(std::string_view text, size_t offset) {
    return ClassOf(code_point_at(text, offset));
}

CharacterClass ClassBefore(std::string_view text, size_t offset) {
    return ClassBehind(text, previous_character(text, offset));
}

} // namespace

uint32 code_point_at(std::string_view text, size_t offset) {
    const std::string_view rest = text.substr(offset);
    const size_t length = utf8_char_length(rest);
    const auto byte = [&](size_t i) { return static_cast<uint32>(static_cast<uint8>(rest[i])); };
    if (length == 1) {
        return byte(0) < 0x80 ? byte(0) : kReplacement;
    }
    uint32 code = byte(0) & (0x7FU >> length);
    for (size_t i = 1; i < length; ++i) {
        code = (code << 6) | (byte(i) & 0x3FU);
    }
    return code;
}

size_t next_character(std::string_view text, size_t offset) {
    if (offset >= text.size()) {
        return text.size();
    }
    bool joined = false;
    size_t end = offset + utf8_char_length(text.substr(offset));
    while (end < text.size()) {
        const uint32 code = code_point_at(text, end);
        if (!joined && !IsAttached(code)) {
            break;
        }
        joined = code == kJoiner;
        end += utf8_char_length(text.substr(end));
    }
    return end;
}

size_t previous_character(std::string_view text, size_t offset) {
    if (offset == 0) {
        return 0;
    }
    size_t start = PreviousCodePoint(text, offset);
    while (start > 0) {
        const size_t before = PreviousCodePoint(text, start);
        if (!IsAttached(code_point_at(text, start)) && code_point_at(text, before) != kJoiner) {
            break;
        }
        start = before;
    }
    return start;
}

size_t code_point_boundary(std::string_view text, size_t offset) {
    offset = std::min(offset, text.size());
    for (size_t back = 1; back <= std::min<size_t>(3, offset); ++back) {
        if (utf8_char_length(text.substr(offset - back)) > back) {
            return offset - back;
        }
    }
    return offset;
}

size_t next_word_end(std::string_view text, size_t offset) {
    while (offset < text.size() && ClassBehind(text, offset) != CharacterClass::Word) {
        offset = next_character(text, offset);
    }
    while (offset < text.size() && ClassBehind(text, offset) == CharacterClass::Word) {
        offset = next_character(text, offset);
    }
    return offset;
}

size_t previous_word_start(std::string_view text, size_t offset) {
    while (offset > 0 && ClassBefore(text, offset) != CharacterClass::Word) {
        offset = previous_character(text, offset);
    }
    while (offset > 0 && ClassBefore(text, offset) == CharacterClass::Word) {
        offset = previous_character(text, offset);
    }
    return offset;
}

TextRange word_around(std::string_view text, size_t offset) {
    if (text.empty()) {
        return {};
    }
    const bool atLineEnd = offset >= text.size() || text[offset] == '\n';
    if (atLineEnd && offset > 0 && text[offset - 1] != '\n') {
        offset = previous_character(text, offset);
    }
    if (offset >= text.size() || text[offset] == '\n') {
        return {offset, offset};
    }
    const CharacterClass kind = ClassBehind(text, offset);
    TextRange range{offset, offset};
    while (range.from > 0 && text[range.from - 1] != '\n' && ClassBefore(text, range.from) == kind) {
        range.from = previous_character(text, range.from);
    }
    while (range.to < text.size() && text[range.to] != '\n' && ClassBehind(text, range.to) == kind) {
        range.to = next_character(text, range.to);
    }
    return range;
}
