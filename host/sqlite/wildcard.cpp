#include "host/sqlite/wildcard.h"
#include "host/sqlite/letters.h"
#include <algorithm>

namespace host {

Wildcard::Wildcard(std::string_view pattern, Predicate::Case letter_case) : letter_case_(letter_case) {
    while (!pattern.empty()) {
        if (pattern.front() == '[') {
            std::string_view rest = pattern.substr(1);
            if (parse_set(rest)) {
                pattern = rest;
                continue;
            }
        }
        char32_t character = take_character(pattern);
        Token token;
        if (character == '*') {
            if (!tokens_.empty() && tokens_.back().kind == Kind::any_text)
                continue;
            token.kind = Kind::any_text;
        } else if (character == '?') {
            token.kind = Kind::any_character;
        } else {
            if (character == '\\' && !pattern.empty())
                character = take_character(pattern);
            token.character = folded(character);
        }
        tokens_.push_back(std::move(token));
    }
}

bool Wildcard::parse_set(std::string_view& pattern) {
    Token token;
    token.kind = Kind::set;
    std::string_view rest = pattern;
    if (!rest.empty() && (rest.front() == '^' || rest.front() == '!')) {
        token.inverted = true;
        rest.remove_prefix(1);
    }
    const auto take = [&rest] {
        char32_t character = take_character(rest);
        if (character == '\\' && !rest.empty())
            character = take_character(rest);
        return character;
    };
    // A ']' that comes first is a member.
    for (bool first = true;; first = false) {
        if (rest.empty())
            return false;
        if (rest.front() == ']' && !first)
            break;
        const char32_t from = take();
        char32_t to = from;
        if (rest.size() >= 2 && rest[0] == '-' && rest[1] != ']') {
            rest.remove_prefix(1);
            to = take();
        }
        token.ranges.emplace_back(from, to);
    }
    rest.remove_prefix(1);
    pattern = rest;
    tokens_.push_back(std::move(token));
    return true;
}

char32_t Wildcard::folded(char32_t character) const {
    return letter_case_ == Predicate::Case::insensitive ? lower(character) : character;
}

bool Wildcard::token_takes(const Token& token, char32_t character) const {
    switch (token.kind) {
    case Kind::character:
        return folded(character) == token.character;
    case Kind::any_character:
        return true;
    case Kind::set: {
        const auto holds = [&token](char32_t candidate) {
            return std::any_of(token.ranges.begin(), token.ranges.end(), [candidate](const auto& range) {
                return range.first <= candidate && candidate <= range.second;
            });
        };
        bool found = holds(character);
        if (!found && letter_case_ == Predicate::Case::insensitive) {
            found = std::any_of(token.ranges.begin(), token.ranges.end(), [&](const auto& range) {
                return lower(range.first) <= lower(character) && lower(character) <= lower(range.second);
            });
        }
        return found != token.inverted;
    }
    case Kind::any_text:
        break;
    }
    return false;
}

bool Wildcard::matches(std::string_view text) const {
    std::size_t token = 0;
    std::size_t star = tokens_.size();
    std::string_view after_star;
    while (!text.empty()) {
        if (token < tokens_.size() && tokens_[token].kind == Kind::any_text) {
            star = token++;
            after_star = text;
            continue;
        }
        std::string_view rest = text;
        const char32_t character = take_character(rest);
        if (token < tokens_.size() && token_takes(tokens_[token], character)) {
            text = rest;
            ++token;
            continue;
        }
        if (star == tokens_.size())
            return false;
        take_character(after_star);
        text = after_star;
        token = star + 1;
    }
    while (token < tokens_.size() && tokens_[token].kind == Kind::any_text)
        ++token;
    return token == tokens_.size();
}

} // namespace host
