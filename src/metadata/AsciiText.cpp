#include "metadata/AsciiText.h"

#include <limits>

int32 ParseAsciiNumber(const char* text) {
    while (IsAsciiSpace(*text))
        ++text;
    const bool negative = *text == '-';
    if (negative || *text == '+')
        ++text;

    // Built up below zero, since the smallest number has no positive counterpart.
    int64 value = 0;
    for (; *text >= '0' && *text <= '9'; ++text) {
        const int64 digit = *text - '0';
        if (__builtin_mul_overflow(value, int64{10}, &value) ||
            __builtin_sub_overflow(value, digit, &value)) {
            value = std::numeric_limits<int64>::min();
            break;
        }
    }
    if (!negative)
        value = value == std::numeric_limits<int64>::min() ? std::numeric_limits<int64>::max() : -value;
    return static_cast<int32>(value);
}
