#include "ErrorLine.h"

#include <cstdio>

void SayError(const char* program, const std::string& text) {
    std::fprintf(stderr, "%s: %s\n", program, text.c_str());
}

std::string PrintableName(const std::string& name) {
    constexpr char kDigits[] = "0123456789abcdef";
    std::string text;
    for (const char letter : name) {
        const auto byte = static_cast<unsigned char>(letter);
        if (byte >= ' ' && byte != 0x7f)
            text += letter;
        else
            text += std::string("\\x") + kDigits[byte >> 4] + kDigits[byte & 15];
    }
    return text;
}
