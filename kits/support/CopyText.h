// The one way to fill a fixed-size character field.
#pragma once

#include <cstddef>

// Copies at most `fieldSize - 1` bytes of `text` into `field` and always terminates it. True when all of the
// text fitted. A null text counts as empty; a field of size 0 is left alone and nothing but an empty text
// fits it. Bytes are cut wherever the field ends, also inside a UTF-8 character. The two must not overlap.
bool CopyText(char* field, size_t fieldSize, const char* text);

// The same for a text of `length` bytes that need not be terminated; it ends at a zero byte, if there is one.
bool CopyText(char* field, size_t fieldSize, const char* text, size_t length);

template <size_t kFieldSize>
bool CopyText(char (&field)[kFieldSize], const char* text) {
    return CopyText(field, kFieldSize, text);
}
