#include <String.h>

#include <cstdio>

// How values become text: the << operators of BString.

BString& BString::operator<<(const char* text) {
    return Append(text);
}

BString& BString::operator<<(const BString& text) {
    return Append(text);
}

BString& BString::operator<<(char c) {
    return *this += c;
}

BString& BString::operator<<(bool value) {
    return Append(value ? "true" : "false");
}

BString& BString::operator<<(int value) {
    mText += std::to_string(value);
    return *this;
}

BString& BString::operator<<(unsigned int value) {
    mText += std::to_string(value);
    return *this;
}

BString& BString::operator<<(long value) {
    mText += std::to_string(value);
    return *this;
}

BString& BString::operator<<(unsigned long value) {
    mText += std::to_string(value);
    return *this;
}

BString& BString::operator<<(long long value) {
    mText += std::to_string(value);
    return *this;
}

BString& BString::operator<<(unsigned long long value) {
    mText += std::to_string(value);
    return *this;
}

BString& BString::operator<<(float value) {
    return *this << static_cast<double>(value);
}

BString& BString::operator<<(double value) {
    // The greatest double has 309 digits before the point.
    char text[320];
    std::snprintf(text, sizeof(text), "%.2f", value);
    return Append(text);
}
