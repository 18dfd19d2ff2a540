#include <String.h>
#include <TextSearch.h>

#include <algorithm>

// How parts of BStrings are replaced.

using namespace text_search;

namespace {

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
