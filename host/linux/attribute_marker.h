#pragma once

#include "host/linux/sha256.h"
#include <array>
#include <cstddef>
#include <cstdint>
#include <optional>
#include <span>

namespace host {

/// What an extended attribute holds in place of a value that has spilled into a blob: type and size of the
/// value and the SHA-256 of its bytes. Layout: docs/attributes.md.
struct AttributeMarker {
    /// Stands where a plain value has its type. A value that a caller gives this type is always spilled, so
    /// that no plain value ever begins with it.
    static constexpr std::uint32_t kReservedType = 0x00626c62; // zero byte, "blb"
    static constexpr std::size_t kSize = 52;
    using Bytes = std::array<std::byte, kSize>;

    std::uint32_t type = 0;
    std::uint64_t size = 0; ///< bytes of the value, without its type
    Sha256 hash = {};

    bool operator==(const AttributeMarker&) const = default;

    Bytes encode() const;
    /// Nothing for anything but a whole, well-formed marker of the known version.
    static std::optional<AttributeMarker> decode(std::span<const std::byte> bytes);
};

/// Four bytes, most significant first.
std::uint32_t load_big_endian(const std::byte* bytes);
void store_big_endian(std::uint32_t value, std::byte* bytes);

} // namespace host
