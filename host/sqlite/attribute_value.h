#pragma once

#include <cstddef>
#include <cstdint>
#include <span>
#include <string_view>

namespace host {

/// The value of one attribute as comparisons see it. Borrows the text.
struct AttributeValue {
    enum class Kind { none, text, signed_integer, unsigned_integer, real };
    Kind kind = Kind::none;
    std::string_view text;
    std::int64_t signed_integer = 0;
    std::uint64_t unsigned_integer = 0;
    double real = 0;

    static AttributeValue of_text(std::string_view text);
    static AttributeValue of_integer(std::int64_t value);
};

/// Reads an attribute's bytes by its type code. Text ends before its first zero byte, or with its bytes. Kind
/// none: the type is neither text nor number, or the number's size is wrong.
AttributeValue attribute_value(std::uint32_t type, std::span<const std::byte> bytes);

/// The kind that values of this type have; none for types that cannot be compared.
AttributeValue::Kind kind_of_type(std::uint32_t type);

/// Exact comparison of numbers of any two kinds: negative, 0, positive; 2 when either is not a number (NaN).
int compare_numbers(const AttributeValue& left, const AttributeValue& right);

} // namespace host
