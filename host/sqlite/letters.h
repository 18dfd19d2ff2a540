#pragma once

#include <cstdint>
#include <string>
#include <string_view>

namespace host {

/// Takes the next character off the front of UTF-8 text. A byte that is no valid UTF-8 comes back as
/// kInvalidByte + its value, so that it differs from every character. The text must not be empty.
char32_t take_character(std::string_view& text);
inline constexpr char32_t kInvalidByte = 0x110000;

/// Lower case of one character, whatever the program's locale.
char32_t lower(char32_t character);

/// Every character of the text lowered; bytes that are no UTF-8 stay as they are.
std::string lowered(std::string_view text);
/// The same into a buffer whose memory is used again.
void lower_into(std::string_view text, std::string& result);

} // namespace host
