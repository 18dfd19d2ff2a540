#include "host/linux/attribute_marker.h"

#include "host/linux/attribute_store.h"
#include <algorithm>

namespace host {

namespace {
constexpr std::uint32_t kVersion = 1;
}

std::uint32_t load_big_endian(const std::byte* bytes) {
    std::uint32_t value = 0;
    for (int i = 0; i < 4; ++i)
        value = value << 8 | std::to_integer<std::uint32_t>(bytes[i]);
    return value;
}

void store_big_endian(std::uint32_t value, std::byte* bytes) {
    for (int i = 3; i >= 0; --i, value >>= 8)
        bytes[i] = static_cast<std::byte>(value & 0xff);
}

AttributeMarker::Bytes AttributeMarker::encode() const {
    Bytes bytes = {};
    store_big_endian(kReservedType, &bytes[0]);
    store_big_endian(kVersion, &bytes[4]);
    store_big_endian(type, &bytes[8]);
    store_big_endian(static_cast<std::uint32_t>(size >> 32), &bytes[12]);
    store_big_endian(static_cast<std::uint32_t>(size), &bytes[16]);
    std::copy(hash.begin(), hash.end(), bytes.begin() + 20);
    return bytes;
}

std::optional<AttributeMarker> AttributeMarker::decode(std::span<const std::byte> bytes) {
    if (bytes.size() != kSize || load_big_endian(&bytes[0]) != kReservedType ||
        load_big_endian(&bytes[4]) != kVersion)
        return std::nullopt;
    AttributeMarker marker;
    marker.type = load_big_endian(&bytes[8]);
    marker.size = std::uint64_t{load_big_endian(&bytes[12])} << 32 | load_big_endian(&bytes[16]);
    // No value of that size was ever written: refused here so that nobody sizes a buffer by it.
    if (marker.size > static_cast<std::uint64_t>(kLargestAttribute))
        return std::nullopt;
    std::copy_n(bytes.begin() + 20, marker.hash.size(), marker.hash.begin());
    return marker;
}

} // namespace host
