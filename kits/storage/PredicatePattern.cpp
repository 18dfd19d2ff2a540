#include <PredicatePattern.h>

#include <limits>

using host::Predicate;

namespace {

bool IsWildcard(char c) {
    return c == '*' || c == '?' || c == '[';
}

bool NeedsBackslash(char c, bool inBracket) {
    if (inBracket)
        return c == ']' || c == '[' || c == '\\' || c == '^' || c == '!' || c == '-';
    return IsWildcard(c) || c == '\\';
}

// One way to write a pattern: escapes only where they matter, a run of asterisks as one.
std::string Normalized(std::string_view pattern) {
    std::string result;
    bool inBracket = false;
    bool afterAsterisk = false;
    for (size_t i = 0; i < pattern.size(); i++) {
        char c = pattern[i];
        if (c == '\\' && i + 1 < pattern.size()) {
            c = pattern[++i];
            if (NeedsBackslash(c, inBracket))
                result += '\\';
            result += c;
            afterAsterisk = false;
            continue;
        }
        if (inBracket) {
            inBracket = c != ']';
        } else {
            if (c == '*' && afterAsterisk)
                continue;
            inBracket = c == '[';
        }
        afterAsterisk = !inBracket && c == '*';
        result += c;
    }
    return result;
}

bool HasWildcards(std::string_view pattern) {
    for (size_t i = 0; i < pattern.size(); i++) {
        if (pattern[i] == '\\')
            i++;
        else if (IsWildcard(pattern[i]))
            return true;
    }
    return false;
}

// Whether the last byte is an asterisk that stands for itself alone, not behind a backslash.
bool EndsWithAsterisk(std::string_view pattern) {
    if (pattern.empty() || pattern.back() != '*')
        return false;
    size_t backslashes = 0;
    for (size_t i = pattern.size() - 1; i > 0 && pattern[i - 1] == '\\'; i--)
        backslashes++;
    return backslashes % 2 == 0;
}

Predicate CanonicalComparison(const Predicate& comparison) {
    const std::string* text = std::get_if<std::string>(&comparison.value);
    if (text != nullptr) {
        switch (comparison.op) {
        case Predicate::Operator::equal:
        case Predicate::Operator::contains:
        case Predicate::Operator::begins_with:
        case Predicate::Operator::ends_with:
        case Predicate::Operator::matches:
            return ComparisonFromPattern(comparison.attribute, PatternFromComparison(comparison),
                                         comparison.letter_case);
        default:
            return comparison;
        }
    }
    Predicate result = comparison;
    result.letter_case = Predicate::Case::sensitive;
    if (const auto* number = std::get_if<std::uint64_t>(&comparison.value)) {
        if (*number <= static_cast<std::uint64_t>(std::numeric_limits<std::int64_t>::max()))
            result.value = static_cast<std::int64_t>(*number);
    }
    return result;
}

} // namespace

std::string EscapeWildcards(std::string_view literal) {
    std::string result;
    result.reserve(literal.size());
    for (char c : literal) {
        if (NeedsBackslash(c, false))
            result += '\\';
        result += c;
    }
    return result;
}

std::string Unescape(std::string_view text) {
    std::string result;
    result.reserve(text.size());
    for (size_t i = 0; i < text.size(); i++) {
        if (text[i] == '\\' && i + 1 < text.size())
            i++;
        result += text[i];
    }
    return result;
}

bool IsWellFormedPattern(std::string_view pattern) {
    bool inBracket = false;
    size_t inside = 0;
    for (size_t i = 0; i < pattern.size(); i++) {
        char c = pattern[i];
        if (c == '\\') {
            if (++i == pattern.size())
                return false;
            inside++;
        } else if (!inBracket) {
            inBracket = c == '[';
            inside = 0;
        } else if (c == ']') {
            if (inside == 0)
                return false;
            inBracket = false;
        } else if (inside > 0 || (c != '^' && c != '!') || (i > 0 && pattern[i - 1] != '[')) {
            inside++;
        }
    }
    return !inBracket;
}

Predicate ComparisonFromPattern(std::string attribute, std::string_view pattern, Predicate::Case letterCase) {
    Predicate result;
    result.attribute = std::move(attribute);
    result.letter_case = letterCase;

    std::string normalized = Normalized(pattern);
    std::string_view middle = normalized;
    bool openStart = middle.starts_with('*');
    if (openStart)
        middle.remove_prefix(1);
    bool openEnd = EndsWithAsterisk(middle);
    if (openEnd)
        middle.remove_suffix(1);
    if (HasWildcards(middle)) {
        result.op = Predicate::Operator::matches;
        result.value = std::move(normalized);
        return result;
    }
    // A lone asterisk takes any text, as the empty text between two of them does.
    if (openStart && middle.empty())
        openEnd = true;
    if (openEnd && middle.empty())
        openStart = true;
    if (openStart && openEnd)
        result.op = Predicate::Operator::contains;
    else if (openStart)
        result.op = Predicate::Operator::ends_with;
    else if (openEnd)
        result.op = Predicate::Operator::begins_with;
    else
        result.op = Predicate::Operator::equal;
    result.value = Unescape(middle);
    return result;
}

std::string PatternFromComparison(const Predicate& comparison) {
    const std::string* text = std::get_if<std::string>(&comparison.value);
    if (text == nullptr)
        return {};
    switch (comparison.op) {
    case Predicate::Operator::contains:
        return "*" + EscapeWildcards(*text) + "*";
    case Predicate::Operator::begins_with:
        return EscapeWildcards(*text) + "*";
    case Predicate::Operator::ends_with:
        return "*" + EscapeWildcards(*text);
    case Predicate::Operator::matches:
        return *text;
    default:
        return EscapeWildcards(*text);
    }
}

PredicateRef CanonicalPredicate(const PredicateRef& predicate) {
    if (predicate->is_comparison())
        return std::make_shared<const Predicate>(CanonicalComparison(*predicate));
    auto result = std::make_shared<Predicate>();
    result->op = predicate->op;
    for (const PredicateRef& operand : predicate->operands)
        result->operands.push_back(CanonicalPredicate(operand));
    return result;
}

bool PredicatesAreEqual(const Predicate& first, const Predicate& second) {
    if (first.op != second.op)
        return false;
    if (first.is_comparison())
        return first.attribute == second.attribute && first.value == second.value &&
               first.letter_case == second.letter_case;
    if (first.operands.size() != second.operands.size())
        return false;
    for (size_t i = 0; i < first.operands.size(); i++) {
        if (!PredicatesAreEqual(*first.operands[i], *second.operands[i]))
            return false;
    }
    return true;
}
