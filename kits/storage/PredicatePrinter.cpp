#include <PredicatePrinter.h>

#include <array>
#include <charconv>
#include <ctype.h>

using host::Predicate;

namespace {

bool IsBare(char c) {
    return isalnum(static_cast<unsigned char>(c)) != 0 || c == ':' || c == '_' || c == '-' || c == '.' ||
           c == '/';
}

// Patterns hold their own backslashes; only the quote is in the way.
std::string QuotedPattern(std::string_view pattern) {
    std::string result = "\"";
    for (size_t i = 0; i < pattern.size(); i++) {
        if (pattern[i] == '\\' && i + 1 < pattern.size())
            result += pattern[i++];
        else if (pattern[i] == '"')
            result += '\\';
        result += pattern[i];
    }
    return result + '"';
}

std::string QuotedLiteral(std::string_view text) {
    std::string result = "\"";
    for (char c : text) {
        if (c == '"' || c == '\\')
            result += '\\';
        result += c;
    }
    return result + '"';
}

std::string PrintedAttribute(const std::string& attribute) {
    bool bare = !attribute.empty();
    for (char c : attribute)
        bare = bare && IsBare(c);
    return bare ? attribute : QuotedLiteral(attribute);
}

template <typename Number>
std::string PrintedNumber(Number number) {
    std::array<char, 64> buffer;
    auto [end, error] = std::to_chars(buffer.data(), buffer.data() + buffer.size(), number);
    return error == std::errc() ? std::string(buffer.data(), end) : std::string("0");
}

std::string PrintedDouble(double number) {
    std::string result = PrintedNumber(number);
    // Without a point or an exponent it would be read as an integer.
    if (result.find_first_of(".e") == std::string::npos)
        result += ".0";
    return result;
}

const char* OperatorText(Predicate::Operator op) {
    switch (op) {
    case Predicate::Operator::not_equal:
        return "!=";
    case Predicate::Operator::less:
        return "<";
    case Predicate::Operator::less_or_equal:
        return "<=";
    case Predicate::Operator::greater:
        return ">";
    case Predicate::Operator::greater_or_equal:
        return ">=";
    default:
        return "==";
    }
}

bool IsOrdering(Predicate::Operator op) {
    return op >= Predicate::Operator::less && op <= Predicate::Operator::greater_or_equal;
}

std::string PrintedValue(const Predicate& comparison) {
    if (const auto* number = std::get_if<std::int64_t>(&comparison.value))
        return PrintedNumber(*number);
    if (const auto* number = std::get_if<std::uint64_t>(&comparison.value))
        return PrintedNumber(*number);
    if (const auto* number = std::get_if<double>(&comparison.value))
        return PrintedDouble(*number);
    std::string mark = comparison.letter_case == Predicate::Case::insensitive ? "~" : "";
    if (IsOrdering(comparison.op))
        return mark + QuotedLiteral(std::get<std::string>(comparison.value));
    return mark + QuotedPattern(PatternFromComparison(comparison));
}

void Print(const Predicate& predicate, std::string& result) {
    result += '(';
    if (predicate.is_comparison()) {
        result += PrintedAttribute(predicate.attribute);
        result += OperatorText(predicate.op);
        result += PrintedValue(predicate);
    } else if (predicate.op == Predicate::Operator::negate) {
        result += '!';
        Print(*predicate.operands[0], result);
    } else {
        Print(*predicate.operands[0], result);
        result += predicate.op == Predicate::Operator::both ? "&&" : "||";
        Print(*predicate.operands[1], result);
    }
    result += ')';
}

} // namespace

std::string PrintPredicate(const Predicate& predicate) {
    std::string result;
    Print(predicate, result);
    return result;
}
