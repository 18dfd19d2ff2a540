// ToUpperStr: a copy of a text in capitals; comparing texts as if they were such copies.
#pragma once

// Of the ASCII letters alone; other bytes stay as they are.
constexpr unsigned char ToUpperByte(unsigned char byte) {
    return byte >= 'a' && byte <= 'z' ? static_cast<unsigned char>(byte - 'a' + 'A') : byte;
}

// The copy is the caller's to delete[]. Null for null.
char* ToUpperStr(const char* text);

// What strcmp() answers, in its sign, for the two texts' copies, which it does not make.
int CompareInUpperCase(const char* a, const char* b);
