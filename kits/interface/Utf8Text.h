// Walking through UTF-8 of unknown quality, character by character.
#pragma once

#include <SupportDefs.h>

#include <string_view>

// The bytes of the first character of a text that is not empty. A byte that does not begin a valid character
// is one of its own, as it is when the text is measured and drawn.
size_t utf8_char_length(std::string_view text);

size_t utf8_count_chars(std::string_view text);
