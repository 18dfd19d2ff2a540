#include <String.h>
#include <TextSearch.h>

#include <algorithm>
#include <cstring>

// How BStrings are compared and searched in.

using namespace text_search;

namespace {

std::string_view cut(std::string_view text, int32 length) {
    return text.substr(0, static_cast<size_t>(std::max(length, 0)));
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
