#include "host/sqlite/comparison.h"
#include "host/sqlite/letters.h"
#include <charconv>
#include <cmath>
#include <system_error>

namespace host {
namespace {

template <typename Number>
bool parse(std::string_view text, Number& number) {
    const auto result = std::from_chars(text.data(), text.data() + text.size(), number);
    return result.ec == std::errc() && result.ptr == text.data() + text.size();
}

AttributeValue number_in(std::string_view text) {
    AttributeValue value;
    if (parse(text, value.signed_integer))
        value.kind = AttributeValue::Kind::signed_integer;
    else if (parse(text, value.unsigned_integer))
        value.kind = AttributeValue::Kind::unsigned_integer;
    else if (parse(text, value.real))
        value.kind = AttributeValue::Kind::real;
    return value;
}

template <typename Number>
std::string digits(Number number) {
    char buffer[64];
    const auto result = std::to_chars(buffer, buffer + sizeof buffer, number);
    return {buffer, result.ptr};
}

} // namespace

Comparison::Comparison(const Predicate& predicate)
    : attribute_(predicate.attribute), op_(predicate.op), letter_case_(predicate.letter_case) {
    if (const auto* text = std::get_if<std::string>(&predicate.value)) {
        text_ = text->substr(0, text->find('\0'));
        number_ = number_in(text_);
    } else if (const auto* integer = std::get_if<std::int64_t>(&predicate.value)) {
        number_ = AttributeValue::of_integer(*integer);
        text_ = digits(*integer);
    } else if (const auto* natural = std::get_if<std::uint64_t>(&predicate.value)) {
        number_.kind = AttributeValue::Kind::unsigned_integer;
        number_.unsigned_integer = *natural;
        text_ = digits(*natural);
    } else {
        number_.kind = AttributeValue::Kind::real;
        number_.real = std::get<double>(predicate.value);
        text_ = digits(number_.real);
    }
    if (op_ == Predicate::Operator::matches)
        wildcard_.emplace(text_, letter_case_);
    else if (letter_case_ == Predicate::Case::insensitive)
        text_ = lowered(text_);
}

bool Comparison::ordered(int order) const {
    switch (op_) {
    case Predicate::Operator::equal:
        return order == 0;
    case Predicate::Operator::not_equal:
        return order != 0;
    case Predicate::Operator::less:
        return order < 0;
    case Predicate::Operator::less_or_equal:
        return order <= 0;
    case Predicate::Operator::greater:
        return order > 0;
    case Predicate::Operator::greater_or_equal:
        return order >= 0;
    default:
        return false;
    }
}

bool Comparison::holds_for_folded_text(std::string_view text) const {
    switch (op_) {
    case Predicate::Operator::contains:
        return text.find(text_) != std::string_view::npos;
    case Predicate::Operator::begins_with:
        return text.starts_with(text_);
    case Predicate::Operator::ends_with:
        return text.ends_with(text_);
    default:
        return ordered(text.compare(text_));
    }
}

bool Comparison::holds_for_text(std::string_view text) const {
    if (wildcard_)
        return wildcard_->matches(text);
    if (letter_case_ == Predicate::Case::sensitive)
        return holds_for_folded_text(text);
    static thread_local std::string folded;
    lower_into(text, folded);
    return holds_for_folded_text(folded);
}

bool Comparison::holds(const AttributeValue& value) const {
    if (value.kind == AttributeValue::Kind::none)
        return false;
    if (value.kind == AttributeValue::Kind::text)
        return holds_for_text(value.text);
    if (number_.kind == AttributeValue::Kind::none)
        return op_ == Predicate::Operator::not_equal;
    int order = compare_numbers(value, number_);
    // 0.1 written as a float is not 0.1 as a double: a real number is also equal to what its own precision
    // makes of the other one.
    if (order != 0 && value.kind == AttributeValue::Kind::real &&
        number_.kind == AttributeValue::Kind::real &&
        static_cast<double>(static_cast<float>(value.real)) == value.real &&
        static_cast<float>(value.real) == static_cast<float>(number_.real))
        order = 0;
    if (order == 2)
        return op_ == Predicate::Operator::not_equal;
    return ordered(order);
}

} // namespace host
