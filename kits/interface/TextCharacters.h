// Where a caret may stand in UTF-8 of unknown quality, and where words begin and end.
#pragma once

#include <SupportDefs.h>

#include <string_view>

// Offsets are bytes, 0 to the text's length. A character here is what a user takes for one: a code point with
// the marks and joined code points that follow it; a byte that is not part of valid UTF-8 is one of its own.

// The ends of the text answer themselves.
size_t next_character(std::string_view text, size_t offset);
size_t previous_character(std::string_view text, size_t offset);
// The offset itself, or the beginning of the code point that it lies inside of.
size_t code_point_boundary(std::string_view text, size_t offset);

// To the right: over what is no word, then to the word's end. To the left: the other way round.
size_t next_word_end(std::string_view text, size_t offset);
size_t previous_word_start(std::string_view text, size_t offset);

// The run of like characters (of words, blanks, or others) around the character behind the offset, or before
// it at the end of a line.
struct TextRange {
    size_t from = 0;
    size_t to = 0;
};
TextRange word_around(std::string_view text, size_t offset);

// The code point that begins at the offset; a byte that begins none is U+FFFD.
uint32 code_point_at(std::string_view text, size_t offset);
