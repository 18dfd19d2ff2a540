#include "AttributeText.h"

#include <Message.h>
#include <TypeConstants.h>
#include <array>
#include <cstring>
#include <optional>

namespace {

template <typename Number>
std::optional<Number> As(const std::string& value) {
    if (value.size() != sizeof(Number))
        return std::nullopt;
    Number number;
    std::memcpy(&number, value.data(), sizeof(number));
    return number;
}

std::optional<std::int64_t> Integer(type_code type, const std::string& value) {
    switch (type) {
    case B_BOOL_TYPE:
    case B_UINT8_TYPE:
        return As<std::uint8_t>(value);
    case B_INT8_TYPE:
        return As<std::int8_t>(value);
    case B_INT16_TYPE:
        return As<std::int16_t>(value);
    case B_UINT16_TYPE:
        return As<std::uint16_t>(value);
    case B_INT32_TYPE:
        return As<std::int32_t>(value);
    case B_UINT32_TYPE:
        return As<std::uint32_t>(value);
    case B_INT64_TYPE:
    case B_TIME_TYPE:
        return As<std::int64_t>(value);
    default:
        return std::nullopt;
    }
}

std::optional<double> Real(type_code type, const std::string& value) {
    if (type == B_FLOAT_TYPE)
        return As<float>(value);
    if (type == B_DOUBLE_TYPE)
        return As<double>(value);
    return std::nullopt;
}

bool IsText(type_code type) {
    return type == B_STRING_TYPE || type == B_MIME_STRING_TYPE;
}

std::string UpToTerminator(const std::string& value) {
    return value.substr(0, value.find('\0'));
}

} // namespace

std::string TypeCodeText(type_code type) {
    std::string text;
    bool printable = true;
    for (int shift = 24; shift >= 0; shift -= 8) {
        const char character = static_cast<char>((type >> shift) & 0xFF);
        printable = printable && character > 0x20 && character < 0x7F;
        text += character;
    }
    if (printable)
        return text;
    std::array<char, 12> digits{};
    std::snprintf(digits.data(), digits.size(), "%08x", static_cast<unsigned>(type));
    return digits.data();
}

std::string AttributeValueText(type_code type, const std::string& value) {
    if (IsText(type))
        return "\"" + Printable(UpToTerminator(value)) + "\"";
    if (const auto integer = Integer(type, value))
        return std::to_string(*integer);
    if (const auto real = Real(type, value)) {
        std::array<char, 40> digits{};
        std::snprintf(digits.data(), digits.size(), "%g", *real);
        return digits.data();
    }
    BMessage message;
    if (!value.empty() && message.Unflatten(value.data(), value.size()) == B_OK)
        return "a message of " + std::to_string(message.CountNames(B_ANY_TYPE)) + " fields";
    constexpr std::size_t kShown = 16;
    std::string text;
    for (std::size_t at = 0; at < value.size() && at < kShown; ++at) {
        std::array<char, 4> digits{};
        std::snprintf(digits.data(), digits.size(), "%02x ",
                      static_cast<unsigned>(static_cast<unsigned char>(value[at])));
        text += digits.data();
    }
    if (value.size() > kShown)
        text += "...";
    else if (!text.empty())
        text.pop_back();
    return text;
}

void AddAttributeValue(JsonObject& object, type_code type, const std::string& value) {
    if (IsText(type))
        object.Bytes("value", UpToTerminator(value));
    else if (const auto integer = Integer(type, value))
        object.Number("value", *integer);
    else if (const auto real = Real(type, value))
        object.Real("value", *real);
    else
        object.Hex("value_hex", value);
}
