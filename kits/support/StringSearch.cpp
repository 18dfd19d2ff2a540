#include <String.h>

#include <algorithm>
#include <cstring>
#include <string_view>

// How BStrings are compared, searched and replaced in.

namespace {

constexpr size_t kNowhere = std::string_view::npos;

enum class Case { kExact, kAsciiBlind };

char fold(char c) {
    return c >= 'A' && c <= 'Z' ? static_cast<char>(c - 'A' + 'a') : c;
}

bool same_byte(char first, char second, Case letters) {
    return letters == Case::kExact ? first == second : fold(first) == fold(second);
}

std::string_view view(const char* text) {
    return text != nullptr ? std::string_view(text) : std::string_view();
}

std::string_view view(const BString& string) {
    return {string.String(), static_cast<size_t>(string.Length())};
}

std::string_view cut(std::string_view text, int32 length) {
    return text.substr(0, static_cast<size_t>(std::max(length, 0)));
}

int compare(std::string_view first, std::string_view second, Case letters) {
    const size_t common = std::min(first.size(), second.size());
    for (size_t index = 0; index < common; index++) {
        const char a = letters == Case::kExact ? first[index] : fold(first[index]);
        const char b = letters == Case::kExact ? second[index] : fold(second[index]);
        if (a != b)
            return static_cast<uchar>(a) < static_cast<uchar>(b) ? -1 : 1;
    }
    if (first.size() == second.size())
        return 0;
    return first.size() < second.size() ? -1 : 1;
}

bool equal(std::string_view first, std::string_view second, Case letters) {
    return first.size() == second.size() && compare(first, second, letters) == 0;
}

size_t find_first(std::string_view text, std::string_view wanted, size_t from, Case letters) {
    if (letters == Case::kExact)
        return text.find(wanted, from);
    for (size_t at = from; at <= text.size() && text.size() - at >= wanted.size(); at++) {
        if (equal(text.substr(at, wanted.size()), wanted, letters))
            return at;
    }
    return kNowhere;
}

size_t find_last(std::string_view text, std::string_view wanted, size_t end, Case letters) {
    if (wanted.size() > end)
        return kNowhere;
    for (size_t at = end - wanted.size() + 1; at-- > 0;) {
        if (equal(text.substr(at, wanted.size()), wanted, letters))
            return at;
    }
    return kNowhere;
}

int32 first_offset(const BString& string, std::string_view wanted, int32 from, Case letters) {
    if (from < 0 || from > string.Length())
        return B_ERROR;
    const size_t found = find_first(view(string), wanted, static_cast<size_t>(from), letters);
    return found == kNowhere ? B_ERROR : static_cast<int32>(found);
}

int32 last_offset(const BString& string, std::string_view wanted, int32 before, Case letters) {
    if (before < 0)
        return B_ERROR;
    const size_t end = static_cast<size_t>(std::min(before, string.Length()));
    const size_t found = find_last(view(string), wanted, end, letters);
    return found == kNowhere ? B_ERROR : static_cast<int32>(found);
}

void replace_bytes(std::string& text, char from, char to, int32 maxCount, int32 fromOffset, Case letters) {
    if (fromOffset < 0)
        return;
    for (size_t at = static_cast<size_t>(fromOffset); at < text.size() && maxCount > 0; at++) {
        if (same_byte(text[at], from, letters)) {
            text[at] = to;
            maxCount--;
        }
    }
}

void replace_last_byte(std::string& text, char from, char to, Case letters) {
    const auto found =
        std::find_if(text.rbegin(), text.rend(), [=](char c) { return same_byte(c, from, letters); });
    if (found != text.rend())
        *found = to;
}

void replace_texts(std::string& text, const char* from, const char* to, int32 maxCount, int32 fromOffset,
                   Case letters) {
    const std::string_view wanted = view(from);
    if (wanted.empty() || fromOffset < 0 || static_cast<size_t>(fromOffset) > text.size())
        return;
    const std::string_view replacement = view(to);
    std::string result;
    size_t copied = 0;
    size_t at = static_cast<size_t>(fromOffset);
    while (maxCount-- > 0 && (at = find_first(text, wanted, at, letters)) != kNowhere) {
        result.append(text, copied, at - copied).append(replacement);
        at += wanted.size();
        copied = at;
    }
    result.append(text, copied, kNowhere);
    text = std::move(result);
}

void replace_last_text(std::string& text, const char* from, const char* to, Case letters) {
    const std::string_view wanted = view(from);
    if (wanted.empty())
        return;
    const size_t at = find_last(text, wanted, text.size(), letters);
    if (at != kNowhere)
        text = text.substr(0, at).append(view(to)).append(text, at + wanted.size(), kNowhere);
}

} // namespace

int BString::Compare(const BString& other) const {
    return compare(mText, other.mText, Case::kExact);
}

int BString::Compare(const char* text) const {
    return compare(mText, view(text), Case::kExact);
}

int BString::Compare(const BString& other, int32 length) const {
    return compare(cut(mText, length), cut(other.mText, length), Case::kExact);
}

int BString::Compare(const char* text, int32 length) const {
    return compare(cut(mText, length), cut(view(text), length), Case::kExact);
}

int BString::ICompare(const BString& other) const {
    return compare(mText, other.mText, Case::kAsciiBlind);
}

int BString::ICompare(const char* text) const {
    return compare(mText, view(text), Case::kAsciiBlind);
}

int BString::ICompare(const BString& other, int32 length) const {
    return compare(cut(mText, length), cut(other.mText, length), Case::kAsciiBlind);
}

int BString::ICompare(const char* text, int32 length) const {
    return compare(cut(mText, length), cut(view(text), length), Case::kAsciiBlind);
}

int32 BString::FindFirst(const BString& text) const {
    return first_offset(*this, text.mText, 0, Case::kExact);
}

int32 BString::FindFirst(const char* text) const {
    return FindFirst(text, 0);
}

int32 BString::FindFirst(const BString& text, int32 fromOffset) const {
    return first_offset(*this, text.mText, fromOffset, Case::kExact);
}

int32 BString::FindFirst(const char* text, int32 fromOffset) const {
    return text == nullptr ? B_BAD_VALUE : first_offset(*this, text, fromOffset, Case::kExact);
}

int32 BString::FindFirst(char c) const {
    return FindFirst(c, 0);
}

int32 BString::FindFirst(char c, int32 fromOffset) const {
    return first_offset(*this, {&c, 1}, fromOffset, Case::kExact);
}

int32 BString::FindLast(const BString& text) const {
    return last_offset(*this, text.mText, Length(), Case::kExact);
}

int32 BString::FindLast(const char* text) const {
    return FindLast(text, Length());
}

int32 BString::FindLast(const BString& text, int32 beforeOffset) const {
    return last_offset(*this, text.mText, beforeOffset, Case::kExact);
}

int32 BString::FindLast(const char* text, int32 beforeOffset) const {
    return text == nullptr ? B_BAD_VALUE : last_offset(*this, text, beforeOffset, Case::kExact);
}

int32 BString::FindLast(char c) const {
    return last_offset(*this, {&c, 1}, Length(), Case::kExact);
}

int32 BString::FindLast(char c, int32 atOrBeforeOffset) const {
    return atOrBeforeOffset < 0 || atOrBeforeOffset >= Length()
               ? B_ERROR
               : last_offset(*this, {&c, 1}, atOrBeforeOffset + 1, Case::kExact);
}

int32 BString::IFindFirst(const BString& text) const {
    return first_offset(*this, text.mText, 0, Case::kAsciiBlind);
}

int32 BString::IFindFirst(const char* text) const {
    return IFindFirst(text, 0);
}

int32 BString::IFindFirst(const BString& text, int32 fromOffset) const {
    return first_offset(*this, text.mText, fromOffset, Case::kAsciiBlind);
}

int32 BString::IFindFirst(const char* text, int32 fromOffset) const {
    return text == nullptr ? B_BAD_VALUE : first_offset(*this, text, fromOffset, Case::kAsciiBlind);
}

int32 BString::IFindLast(const BString& text) const {
    return last_offset(*this, text.mText, Length(), Case::kAsciiBlind);
}

int32 BString::IFindLast(const char* text) const {
    return IFindLast(text, Length());
}

int32 BString::IFindLast(const BString& text, int32 beforeOffset) const {
    return last_offset(*this, text.mText, beforeOffset, Case::kAsciiBlind);
}

int32 BString::IFindLast(const char* text, int32 beforeOffset) const {
    return text == nullptr ? B_BAD_VALUE : last_offset(*this, text, beforeOffset, Case::kAsciiBlind);
}

bool BString::StartsWith(const BString& text) const {
    return view(*this).starts_with(text.mText);
}

bool BString::StartsWith(const char* text) const {
    return text != nullptr && view(*this).starts_with(text);
}

bool BString::IStartsWith(const BString& text) const {
    return equal(cut(mText, text.Length()), text.mText, Case::kAsciiBlind);
}

bool BString::IStartsWith(const char* text) const {
    return text != nullptr && equal(view(*this).substr(0, std::strlen(text)), text, Case::kAsciiBlind);
}

bool BString::EndsWith(const BString& text) const {
    return view(*this).ends_with(text.mText);
}

bool BString::EndsWith(const char* text) const {
    return text != nullptr && view(*this).ends_with(text);
}

bool BString::IEndsWith(const BString& text) const {
    return IEndsWith(text.String());
}

bool BString::IEndsWith(const char* text) const {
    const std::string_view wanted = view(text);
    return text != nullptr && wanted.size() <= mText.size() &&
           equal(view(*this).substr(mText.size() - wanted.size()), wanted, Case::kAsciiBlind);
}

BString& BString::ReplaceFirst(char replaceThis, char withThis) {
    return Replace(replaceThis, withThis, 1);
}

BString& BString::ReplaceLast(char replaceThis, char withThis) {
    replace_last_byte(mText, replaceThis, withThis, Case::kExact);
    return *this;
}

BString& BString::ReplaceAll(char replaceThis, char withThis, int32 fromOffset) {
    return Replace(replaceThis, withThis, INT32_MAX, fromOffset);
}

BString& BString::Replace(char replaceThis, char withThis, int32 maxReplaceCount, int32 fromOffset) {
    replace_bytes(mText, replaceThis, withThis, maxReplaceCount, fromOffset, Case::kExact);
    return *this;
}

BString& BString::ReplaceFirst(const char* replaceThis, const char* withThis) {
    return Replace(replaceThis, withThis, 1);
}

BString& BString::ReplaceLast(const char* replaceThis, const char* withThis) {
    replace_last_text(mText, replaceThis, withThis, Case::kExact);
    return *this;
}

BString& BString::ReplaceAll(const char* replaceThis, const char* withThis, int32 fromOffset) {
    return Replace(replaceThis, withThis, INT32_MAX, fromOffset);
}

BString& BString::Replace(const char* replaceThis, const char* withThis, int32 maxReplaceCount,
                          int32 fromOffset) {
    replace_texts(mText, replaceThis, withThis, maxReplaceCount, fromOffset, Case::kExact);
    return *this;
}

BString& BString::IReplaceFirst(char replaceThis, char withThis) {
    return IReplace(replaceThis, withThis, 1);
}

BString& BString::IReplaceLast(char replaceThis, char withThis) {
    replace_last_byte(mText, replaceThis, withThis, Case::kAsciiBlind);
    return *this;
}

BString& BString::IReplaceAll(char replaceThis, char withThis, int32 fromOffset) {
    return IReplace(replaceThis, withThis, INT32_MAX, fromOffset);
}

BString& BString::IReplace(char replaceThis, char withThis, int32 maxReplaceCount, int32 fromOffset) {
    replace_bytes(mText, replaceThis, withThis, maxReplaceCount, fromOffset, Case::kAsciiBlind);
    return *this;
}

BString& BString::IReplaceFirst(const char* replaceThis, const char* withThis) {
    return IReplace(replaceThis, withThis, 1);
}

BString& BString::IReplaceLast(const char* replaceThis, const char* withThis) {
    replace_last_text(mText, replaceThis, withThis, Case::kAsciiBlind);
    return *this;
}

BString& BString::IReplaceAll(const char* replaceThis, const char* withThis, int32 fromOffset) {
    return IReplace(replaceThis, withThis, INT32_MAX, fromOffset);
}

BString& BString::IReplace(const char* replaceThis, const char* withThis, int32 maxReplaceCount,
                           int32 fromOffset) {
    replace_texts(mText, replaceThis, withThis, maxReplaceCount, fromOffset, Case::kAsciiBlind);
    return *this;
}

BString& BString::ReplaceSet(const char* setOfBytes, char with) {
    for (size_t at = 0; (at = mText.find_first_of(view(setOfBytes), at)) != kNowhere; at++)
        mText[at] = with;
    return *this;
}

BString& BString::ReplaceSet(const char* setOfBytes, const char* with) {
    const std::string_view set = view(setOfBytes);
    std::string result;
    size_t copied = 0;
    size_t at = 0;
    while ((at = mText.find_first_of(set, copied)) != kNowhere) {
        result.append(mText, copied, at - copied).append(view(with));
        copied = std::min(mText.find_first_not_of(set, at), mText.size());
    }
    result.append(mText, copied, kNowhere);
    mText = std::move(result);
    return *this;
}

bool operator<(const char* text, const BString& string) {
    return string > text;
}

bool operator<=(const char* text, const BString& string) {
    return string >= text;
}

bool operator==(const char* text, const BString& string) {
    return string == text;
}

bool operator>(const char* text, const BString& string) {
    return string < text;
}

bool operator>=(const char* text, const BString& string) {
    return string <= text;
}

bool operator!=(const char* text, const BString& string) {
    return string != text;
}

BString operator+(const BString& first, const BString& second) {
    return BString(first).Append(second);
}

BString operator+(const BString& first, const char* second) {
    return BString(first).Append(second);
}

BString operator+(const char* first, const BString& second) {
    return BString(first).Append(second);
}

int Compare(const BString& first, const BString& second) {
    return first.Compare(second);
}

int ICompare(const BString& first, const BString& second) {
    return first.ICompare(second);
}

int Compare(const BString* first, const BString* second) {
    return first->Compare(*second);
}

int ICompare(const BString* first, const BString* second) {
    return first->ICompare(*second);
}
