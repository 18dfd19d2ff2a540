#pragma once

#include "host/api/predicate.h"
#include <cstddef>
#include <string_view>
#include <utility>
#include <vector>

namespace host {

/// A compiled wildcard pattern: `*` any text, `?` one character, `[abc]`, `[a-z]`, `[^a-z]` or `[!a-z]` one
/// character of (or not of) a set, `\` before a character that is meant literally. A `[` without its `]` is
/// literal. The pattern must cover the whole text. Immutable; any thread.
///
/// Time is at most text length times pattern length: only the last `*` is ever taken up again.
class Wildcard {
  public:
    Wildcard(std::string_view pattern, Predicate::Case letter_case);

    bool matches(std::string_view text) const;

  private:
    enum class Kind { character, any_character, any_text, set };
    struct Token {
        Kind kind = Kind::character;
        char32_t character = 0;
        bool inverted = false;
        std::vector<std::pair<char32_t, char32_t>> ranges;
    };

    bool parse_set(std::string_view& pattern);
    char32_t folded(char32_t character) const;
    bool token_takes(const Token& token, char32_t character) const;

    Predicate::Case letter_case_ = Predicate::Case::sensitive;
    std::vector<Token> tokens_;
};

} // namespace host
