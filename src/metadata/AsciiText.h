// Character classes and numbers of the C locale, whatever locale the process has set. Bytes from 0x80 on
// belong to no class. Any thread.
#pragma once

#include <SupportDefs.h>

constexpr bool IsAsciiLower(char character) {
    return character >= 'a' && character <= 'z';
}

constexpr char ToAsciiLower(char character) {
    return character >= 'A' && character <= 'Z' ? static_cast<char>(character - 'A' + 'a') : character;
}

constexpr bool IsAsciiSpace(char character) {
    return character == ' ' || (character >= '\t' && character <= '\r');
}

// The number that `text` begins with, after blanks and one sign; 0 when there is none. A number beyond 64
// bits stops at their limit, and of the result the low 32 bits count.
int32 ParseAsciiNumber(const char* text);
