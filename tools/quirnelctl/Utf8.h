#pragma once

#include <cstddef>
#include <string_view>

/// Bytes of the valid UTF-8 character (RFC 3629: shortest form, no surrogates, at most U+10FFFF) at the front
/// of a text that is not empty; 0 when there is none.
std::size_t CharacterLength(std::string_view text);

/// Calls `visit(character, true)` for each valid character and `visit(byte, false)` for each byte that
/// belongs to none.
template <typename Visitor>
void ForEachCharacter(std::string_view text, Visitor&& visit) {
    while (!text.empty()) {
        const std::size_t length = CharacterLength(text);
        visit(text.substr(0, length == 0 ? 1 : length), length != 0);
        text.remove_prefix(length == 0 ? 1 : length);
    }
}
