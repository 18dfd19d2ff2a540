#include <TextSearch.h>

#include <String.h>

#include <algorithm>

namespace text_search {
namespace {

char fold(char c) {
    return c >= 'A' && c <= 'Z' ? static_cast<char>(c - 'A' + 'a') : c;
}

} // namespace

bool same_byte(char first, char second, Case letters) {
    return letters == Case::kExact ? first == second : fold(first) == fold(second);
}

std::string_view view(const char* text) {
    return text != nullptr ? std::string_view(text) : std::string_view();
}

std::string_view view(const BString& string) {
    return {string.String(), static_cast<size_t>(string.Length())};
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

} // namespace text_search
