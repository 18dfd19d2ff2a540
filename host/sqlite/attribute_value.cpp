#include "host/sqlite/attribute_value.h"
#include <cmath>
#include <cstring>

namespace host {
namespace {

constexpr std::uint32_t code(const char (&letters)[5]) {
    std::uint32_t result = 0;
    for (int i = 0; i < 4; ++i)
        result = result << 8 | static_cast<unsigned char>(letters[i]);
    return result;
}

template <typename Number>
Number load(std::span<const std::byte> bytes) {
    Number number{};
    std::memcpy(&number, bytes.data(), sizeof number);
    return number;
}

AttributeValue signed_value(std::span<const std::byte> bytes) {
    AttributeValue value;
    value.kind = AttributeValue::Kind::signed_integer;
    switch (bytes.size()) {
    case 1:
        value.signed_integer = load<std::int8_t>(bytes);
        break;
    case 2:
        value.signed_integer = load<std::int16_t>(bytes);
        break;
    case 4:
        value.signed_integer = load<std::int32_t>(bytes);
        break;
    case 8:
        value.signed_integer = load<std::int64_t>(bytes);
        break;
    default:
        value.kind = AttributeValue::Kind::none;
    }
    return value;
}

AttributeValue unsigned_value(std::span<const std::byte> bytes) {
    AttributeValue value;
    value.kind = AttributeValue::Kind::unsigned_integer;
    switch (bytes.size()) {
    case 1:
        value.unsigned_integer = load<std::uint8_t>(bytes);
        break;
    case 2:
        value.unsigned_integer = load<std::uint16_t>(bytes);
        break;
    case 4:
        value.unsigned_integer = load<std::uint32_t>(bytes);
        break;
    case 8:
        value.unsigned_integer = load<std::uint64_t>(bytes);
        break;
    default:
        value.kind = AttributeValue::Kind::none;
    }
    return value;
}

AttributeValue real_value(std::span<const std::byte> bytes) {
    AttributeValue value;
    value.kind = AttributeValue::Kind::real;
    if (bytes.size() == sizeof(float))
        value.real = static_cast<double>(load<float>(bytes));
    else if (bytes.size() == sizeof(double))
        value.real = load<double>(bytes);
    else
        value.kind = AttributeValue::Kind::none;
    return value;
}

int sign(bool less, bool greater) {
    return less ? -1 : greater ? 1 : 0;
}

/// A double holds no 64-bit integer exactly beyond 2^53, so integers are compared as integers.
int compare_real_with_integer(double real, bool negative, std::uint64_t magnitude) {
    if (std::isnan(real))
        return 2;
    const bool real_negative = real < 0;
    if (real_negative != negative)
        return real_negative ? -1 : 1;
    const double absolute = std::fabs(real);
    constexpr double two_to_64 = 18446744073709551616.0;
    int result = 0;
    if (absolute >= two_to_64) {
        result = 1;
    } else {
        const double whole = std::floor(absolute);
        const auto whole_integer = static_cast<std::uint64_t>(whole);
        result = sign(whole_integer<magnitude, whole_integer> magnitude);
        if (result == 0 && absolute > whole)
            result = 1;
    }
    return negative ? -result : result;
}

bool is_negative(const AttributeValue& value) {
    return value.kind == AttributeValue::Kind::signed_integer && value.signed_integer < 0;
}

std::uint64_t magnitude(const AttributeValue& value) {
    if (value.kind == AttributeValue::Kind::unsigned_integer)
        return value.unsigned_integer;
    const auto bits = static_cast<std::uint64_t>(value.signed_integer);
    return value.signed_integer < 0 ? 0 - bits : bits;
}

} // namespace

AttributeValue AttributeValue::of_text(std::string_view text) {
    AttributeValue value;
    value.kind = Kind::text;
    value.text = text.substr(0, text.find('\0'));
    return value;
}

AttributeValue AttributeValue::of_integer(std::int64_t number) {
    AttributeValue value;
    value.kind = Kind::signed_integer;
    value.signed_integer = number;
    return value;
}

AttributeValue::Kind kind_of_type(std::uint32_t type) {
    switch (type) {
    case code("CSTR"):
    case code("MIMS"):
    case code("CHAR"):
        return AttributeValue::Kind::text;
    case code("BYTE"):
    case code("SHRT"):
    case code("LONG"):
    case code("LLNG"):
    case code("OFFT"):
    case code("SSZT"):
    case code("TIME"):
        return AttributeValue::Kind::signed_integer;
    case code("UBYT"):
    case code("USHT"):
    case code("ULNG"):
    case code("ULLG"):
    case code("SIZT"):
    case code("BOOL"):
        return AttributeValue::Kind::unsigned_integer;
    case code("FLOT"):
    case code("DBLE"):
        return AttributeValue::Kind::real;
    default:
        return AttributeValue::Kind::none;
    }
}

AttributeValue attribute_value(std::uint32_t type, std::span<const std::byte> bytes) {
    switch (kind_of_type(type)) {
    case AttributeValue::Kind::text:
        return AttributeValue::of_text({reinterpret_cast<const char*>(bytes.data()), bytes.size()});
    case AttributeValue::Kind::signed_integer:
        return signed_value(bytes);
    case AttributeValue::Kind::unsigned_integer:
        return unsigned_value(bytes);
    case AttributeValue::Kind::real:
        return real_value(bytes);
    case AttributeValue::Kind::none:
        break;
    }
    return {};
}

int compare_numbers(const AttributeValue& left, const AttributeValue& right) {
    const bool left_real = left.kind == AttributeValue::Kind::real;
    const bool right_real = right.kind == AttributeValue::Kind::real;
    if (left_real && right_real) {
        if (std::isnan(left.real) || std::isnan(right.real))
            return 2;
        return sign(left.real<right.real, left.real> right.real);
    }
    if (left_real)
        return compare_real_with_integer(left.real, is_negative(right), magnitude(right));
    if (right_real) {
        const int result = compare_real_with_integer(right.real, is_negative(left), magnitude(left));
        return result == 2 ? 2 : -result;
    }
    if (is_negative(left) != is_negative(right))
        return is_negative(left) ? -1 : 1;
    const std::uint64_t a = magnitude(left);
    const std::uint64_t b = magnitude(right);
    return is_negative(left) ? sign(a > b, a < b) : sign(a<b, a> b);
}

} // namespace host
