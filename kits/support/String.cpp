#include <String.h>

#include <algorithm>
#include <cstdarg>
#include <cstdio>
#include <cstring>

// How a BString is made, changed and put together. Comparing, finding and replacing: StringSearch.cpp.

namespace {

// The text's length, at most `maxLength`; a negative limit is none.
size_t bounded_length(const char* text, int32 maxLength) {
    if (text == nullptr)
        return 0;
    return maxLength < 0 ? std::strlen(text) : strnlen(text, static_cast<size_t>(maxLength));
}

bool is_inside(size_t length, int32 offset) {
    return offset >= 0 && static_cast<size_t>(offset) <= length;
}

bool is_continuation(char c) {
    return (static_cast<uchar>(c) & 0xC0) == 0x80;
}

bool is_space(char c) {
    return c == ' ' || (c >= '\t' && c <= '\r');
}

bool is_letter(char c) {
    return (c >= 'a' && c <= 'z') || (c >= 'A' && c <= 'Z');
}

char lower(char c) {
    return c >= 'A' && c <= 'Z' ? static_cast<char>(c - 'A' + 'a') : c;
}

char upper(char c) {
    return c >= 'a' && c <= 'z' ? static_cast<char>(c - 'a' + 'A') : c;
}

bool is_in_set(char c, const char* set) {
    return c != '\0' && std::strchr(set, c) != nullptr;
}

} // namespace

BString::BString(const char* text) : BString(text, -1) {}

BString::BString(const char* text, int32 maxLength)
    : mText(text != nullptr ? text : "", bounded_length(text, maxLength)) {}

int32 BString::CountChars() const {
    return static_cast<int32>(
        std::count_if(mText.begin(), mText.end(), [](char c) { return !is_continuation(c); }));
}

int32 BString::CountBytes(int32 fromCharOffset, int32 charCount) const {
    if (fromCharOffset < 0 || charCount <= 0)
        return 0;
    const int64 endChar = int64{fromCharOffset} + charCount;
    int64 character = -1;
    int32 bytes = 0;
    for (const char c : mText) {
        if (!is_continuation(c))
            character++;
        if (character >= fromCharOffset && character < endChar)
            bytes++;
    }
    return bytes;
}

BString& BString::operator=(const char* text) {
    return SetTo(text);
}

BString& BString::operator=(char c) {
    return SetTo(c, 1);
}

BString& BString::SetTo(const char* text) {
    return SetTo(text, -1);
}

BString& BString::SetTo(const char* text, int32 maxLength) {
    // The text may lie in this string.
    mText.assign(std::string(text != nullptr ? text : "", bounded_length(text, maxLength)));
    return *this;
}

BString& BString::SetTo(const BString& other) {
    mText = other.mText;
    return *this;
}

BString& BString::SetTo(const BString& other, int32 maxLength) {
    mText = std::string(other.mText, 0, maxLength < 0 ? std::string::npos : static_cast<size_t>(maxLength));
    return *this;
}

BString& BString::SetTo(char c, int32 count) {
    mText.assign(static_cast<size_t>(std::max(count, 0)), c);
    return *this;
}

BString& BString::SetToFormat(const char* format, ...) {
    va_list arguments;
    va_start(arguments, format);
    const int length = std::vsnprintf(nullptr, 0, format, arguments);
    va_end(arguments);
    if (length < 0)
        return *this;
    // The arguments may point into this string, which therefore changes last.
    std::string text(static_cast<size_t>(length), '\0');
    va_start(arguments, format);
    std::vsnprintf(text.data(), text.size() + 1, format, arguments);
    va_end(arguments);
    mText = std::move(text);
    return *this;
}

BString& BString::Adopt(BString& from) {
    return Adopt(from, -1);
}

BString& BString::Adopt(BString& from, int32 maxLength) {
    if (&from != this) {
        mText = std::move(from.mText);
        from.mText.clear();
    }
    if (maxLength >= 0)
        Truncate(maxLength);
    return *this;
}

BString& BString::CopyInto(BString& into, int32 fromOffset, int32 length) const {
    if (!is_inside(mText.size(), fromOffset) || length < 0)
        into.mText.clear();
    else
        into.mText = mText.substr(static_cast<size_t>(fromOffset), static_cast<size_t>(length));
    return into;
}

void BString::CopyInto(char* into, int32 fromOffset, int32 length) const {
    if (into == nullptr || length <= 0 || !is_inside(mText.size(), fromOffset))
        return;
    const size_t copied = mText.copy(into, static_cast<size_t>(length), static_cast<size_t>(fromOffset));
    if (copied < static_cast<size_t>(length))
        into[copied] = '\0';
}

BString& BString::operator+=(const BString& other) {
    return Append(other);
}

BString& BString::operator+=(const char* text) {
    return Append(text);
}

BString& BString::operator+=(char c) {
    mText.push_back(c);
    return *this;
}

BString& BString::Append(const BString& other) {
    mText.append(other.mText);
    return *this;
}

BString& BString::Append(const char* text) {
    return Append(text, -1);
}

BString& BString::Append(const BString& other, int32 length) {
    return Insert(other, 0, length, Length());
}

BString& BString::Append(const char* text, int32 length) {
    return Insert(text, 0, length, Length());
}

BString& BString::Append(char c, int32 count) {
    return Insert(c, count, Length());
}

BString& BString::Prepend(const char* text) {
    return Insert(text, 0, -1, 0);
}

BString& BString::Prepend(const BString& other) {
    return Insert(other, 0, other.Length(), 0);
}

BString& BString::Prepend(const char* text, int32 length) {
    return Insert(text, 0, length, 0);
}

BString& BString::Prepend(const BString& other, int32 length) {
    return Insert(other, 0, length, 0);
}

BString& BString::Prepend(char c, int32 count) {
    return Insert(c, count, 0);
}

BString& BString::Insert(const char* text, int32 position) {
    return Insert(text, 0, -1, position);
}

BString& BString::Insert(const char* text, int32 length, int32 position) {
    return Insert(text, 0, length, position);
}

BString& BString::Insert(const char* text, int32 fromOffset, int32 length, int32 position) {
    if (text == nullptr || fromOffset < 0 || !is_inside(mText.size(), position))
        return *this;
    const size_t skipped = strnlen(text, static_cast<size_t>(fromOffset));
    if (skipped < static_cast<size_t>(fromOffset))
        return *this;
    // The text may lie in this string.
    const std::string inserted(text + skipped, bounded_length(text + skipped, length));
    mText.insert(static_cast<size_t>(position), inserted);
    return *this;
}

BString& BString::Insert(const BString& other, int32 position) {
    return Insert(other, 0, other.Length(), position);
}

BString& BString::Insert(const BString& other, int32 length, int32 position) {
    return Insert(other, 0, length, position);
}

BString& BString::Insert(const BString& other, int32 fromOffset, int32 length, int32 position) {
    if (!is_inside(other.mText.size(), fromOffset) || !is_inside(mText.size(), position))
        return *this;
    const size_t count = length < 0 ? std::string::npos : static_cast<size_t>(length);
    const std::string inserted = other.mText.substr(static_cast<size_t>(fromOffset), count);
    mText.insert(static_cast<size_t>(position), inserted);
    return *this;
}

BString& BString::Insert(char c, int32 count, int32 position) {
    if (count > 0 && is_inside(mText.size(), position))
        mText.insert(static_cast<size_t>(position), static_cast<size_t>(count), c);
    return *this;
}

BString& BString::Truncate(int32 newLength, bool) {
    if (newLength < Length())
        mText.resize(static_cast<size_t>(std::max(newLength, 0)));
    return *this;
}

BString& BString::Remove(int32 from, int32 length) {
    if (length > 0 && is_inside(mText.size(), from))
        mText.erase(static_cast<size_t>(from), static_cast<size_t>(length));
    return *this;
}

BString& BString::RemoveFirst(const BString& text) {
    return RemoveFirst(text.String());
}

BString& BString::RemoveLast(const BString& text) {
    return RemoveLast(text.String());
}

BString& BString::RemoveAll(const BString& text) {
    return RemoveAll(text.String());
}

BString& BString::RemoveFirst(const char* text) {
    return ReplaceFirst(text, "");
}

BString& BString::RemoveLast(const char* text) {
    return ReplaceLast(text, "");
}

BString& BString::RemoveAll(const char* text) {
    return ReplaceAll(text, "");
}

BString& BString::RemoveSet(const char* setOfBytes) {
    return ReplaceSet(setOfBytes, "");
}

BString& BString::MoveInto(BString& into, int32 from, int32 length) {
    const BString source(*this);
    Remove(from, length);
    source.CopyInto(into, from, length);
    return into;
}

void BString::MoveInto(char* into, int32 from, int32 length) {
    CopyInto(into, from, length);
    Remove(from, length);
}

char BString::ByteAt(int32 index) const {
    return index < 0 || index >= Length() ? '\0' : mText[static_cast<size_t>(index)];
}

char* BString::LockBuffer(int32 maxLength) {
    if (maxLength > Length())
        mText.resize(static_cast<size_t>(maxLength), '\0');
    return mText.data();
}

BString& BString::UnlockBuffer(int32 length) {
    if (length < 0)
        mText.resize(std::strlen(mText.c_str()));
    else
        Truncate(length);
    return *this;
}

BString& BString::ToLower() {
    std::transform(mText.begin(), mText.end(), mText.begin(), lower);
    return *this;
}

BString& BString::ToUpper() {
    std::transform(mText.begin(), mText.end(), mText.begin(), upper);
    return *this;
}

BString& BString::Capitalize() {
    ToLower();
    if (!mText.empty())
        mText[0] = upper(mText[0]);
    return *this;
}

BString& BString::CapitalizeEachWord() {
    bool insideWord = false;
    for (char& c : mText) {
        c = insideWord ? lower(c) : upper(c);
        insideWord = is_letter(c);
    }
    return *this;
}

BString& BString::CharacterEscape(const char* original, const char* setOfBytesToEscape, char escapeWith) {
    std::string escaped;
    for (const char* c = original != nullptr ? original : ""; *c != '\0'; c++) {
        if (setOfBytesToEscape != nullptr && is_in_set(*c, setOfBytesToEscape))
            escaped.push_back(escapeWith);
        escaped.push_back(*c);
    }
    mText = std::move(escaped);
    return *this;
}

BString& BString::CharacterEscape(const char* setOfBytesToEscape, char escapeWith) {
    return CharacterEscape(String(), setOfBytesToEscape, escapeWith);
}

BString& BString::CharacterDeescape(const char* original, char escapeChar) {
    std::string plain;
    for (const char* c = original != nullptr ? original : ""; *c != '\0'; c++) {
        if (*c == escapeChar && c[1] != '\0')
            c++;
        plain.push_back(*c);
    }
    mText = std::move(plain);
    return *this;
}

BString& BString::CharacterDeescape(char escapeChar) {
    return CharacterDeescape(String(), escapeChar);
}

BString& BString::Trim() {
    const auto first = std::find_if_not(mText.begin(), mText.end(), is_space);
    const auto last = std::find_if_not(mText.rbegin(), std::make_reverse_iterator(first), is_space).base();
    mText = std::string(first, last);
    return *this;
}
