// Comparing and searching bytes: what BString's methods of that kind are made of.
#pragma once

#include <cstddef>
#include <string_view>

class BString;

// Plain functions on bytes, for any thread. Bytes compare as unsigned numbers.
namespace text_search {

// Answered where there is nothing to be found.
inline constexpr size_t kNowhere = std::string_view::npos;

// With kAsciiBlind the ASCII letters of either case are the same.
enum class Case { kExact, kAsciiBlind };

// A null text is an empty one. What is seen lives as long as the argument.
std::string_view view(const char* text);
std::string_view view(const BString& string);

bool same_byte(char first, char second, Case letters);
// -1, 0 or 1; of two texts that agree as far as the shorter one goes that one comes first.
int compare(std::string_view first, std::string_view second, Case letters);
bool equal(std::string_view first, std::string_view second, Case letters);

// Where `wanted` begins, at `from` or after it. An empty text is found at `from`.
size_t find_first(std::string_view text, std::string_view wanted, size_t from, Case letters);
// The last place where `wanted` begins and ends at or before `end`, which lies within the text.
size_t find_last(std::string_view text, std::string_view wanted, size_t end, Case letters);

} // namespace text_search
