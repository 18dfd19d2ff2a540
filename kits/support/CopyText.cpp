#include <CopyText.h>

#include <cstring>

bool CopyText(char* field, size_t fieldSize, const char* text) {
    if (text == nullptr)
        text = "";
    // One byte more than can be copied is enough to see that the text does not fit.
    return CopyText(field, fieldSize, text, fieldSize == 0 ? 1 : fieldSize);
}

bool CopyText(char* field, size_t fieldSize, const char* text, size_t length) {
    const size_t textLength = text == nullptr ? 0 : strnlen(text, length);
    if (fieldSize == 0)
        return textLength == 0;
    const bool fits = textLength < fieldSize;
    const size_t copied = fits ? textLength : fieldSize - 1;
    if (copied > 0)
        memcpy(field, text, copied);
    field[copied] = '\0';
    return fits;
}
