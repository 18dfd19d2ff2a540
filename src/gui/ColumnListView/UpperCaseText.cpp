#include "gui/ColumnListView/UpperCaseText.h"

#include <string.h>

char* ToUpperStr(const char* text) {
    if (text == nullptr) {
        return nullptr;
    }
    const size_t length = strlen(text);
    char* const copy = new char[length + 1];
    for (size_t i = 0; i <= length; ++i) {
        copy[i] = static_cast<char>(ToUpperByte(static_cast<unsigned char>(text[i])));
    }
    return copy;
}

int CompareInUpperCase(const char* a, const char* b) {
    const auto* first = reinterpret_cast<const unsigned char*>(a);
    const auto* second = reinterpret_cast<const unsigned char*>(b);
    while (*first != 0 && ToUpperByte(*first) == ToUpperByte(*second)) {
        ++first;
        ++second;
    }
    return ToUpperByte(*first) - ToUpperByte(*second);
}
