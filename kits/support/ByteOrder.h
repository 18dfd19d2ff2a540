// Conversions between this host's byte order and the little-endian and big-endian ones.
#pragma once

#include <SupportDefs.h>
#include <TypeConstants.h>

#include <bit>

typedef enum {
    B_SWAP_HOST_TO_LENDIAN,
    B_SWAP_HOST_TO_BENDIAN,
    B_SWAP_LENDIAN_TO_HOST,
    B_SWAP_BENDIAN_TO_HOST,
    B_SWAP_ALWAYS
} swap_action;

// Swaps an array of `length` bytes of the given type in place, when the action asks for it on this host.
// B_BAD_VALUE when the length is not a multiple of the type's size, B_BAD_TYPE for a type that has no byte
// order.
status_t swap_data(type_code type, void* data, size_t length, swap_action action);

// True for the types that swap_data() takes.
bool is_type_swapped(type_code type);

constexpr uint16 B_SWAP_INT16(uint16 value) {
    return static_cast<uint16>((value << 8) | (value >> 8));
}
constexpr uint32 B_SWAP_INT32(uint32 value) {
    return __builtin_bswap32(value);
}
constexpr uint64 B_SWAP_INT64(uint64 value) {
    return __builtin_bswap64(value);
}
constexpr float B_SWAP_FLOAT(float value) {
    return std::bit_cast<float>(B_SWAP_INT32(std::bit_cast<uint32>(value)));
}
constexpr double B_SWAP_DOUBLE(double value) {
    return std::bit_cast<double>(B_SWAP_INT64(std::bit_cast<uint64>(value)));
}

inline constexpr bool B_HOST_IS_LENDIAN = std::endian::native == std::endian::little;
inline constexpr bool B_HOST_IS_BENDIAN = !B_HOST_IS_LENDIAN;

constexpr uint16 B_HOST_TO_LENDIAN_INT16(uint16 value) {
    return B_HOST_IS_LENDIAN ? value : B_SWAP_INT16(value);
}
constexpr uint32 B_HOST_TO_LENDIAN_INT32(uint32 value) {
    return B_HOST_IS_LENDIAN ? value : B_SWAP_INT32(value);
}
constexpr uint64 B_HOST_TO_LENDIAN_INT64(uint64 value) {
    return B_HOST_IS_LENDIAN ? value : B_SWAP_INT64(value);
}
constexpr uint16 B_HOST_TO_BENDIAN_INT16(uint16 value) {
    return B_HOST_IS_LENDIAN ? B_SWAP_INT16(value) : value;
}
constexpr uint32 B_HOST_TO_BENDIAN_INT32(uint32 value) {
    return B_HOST_IS_LENDIAN ? B_SWAP_INT32(value) : value;
}
constexpr uint64 B_HOST_TO_BENDIAN_INT64(uint64 value) {
    return B_HOST_IS_LENDIAN ? B_SWAP_INT64(value) : value;
}
constexpr uint16 B_LENDIAN_TO_HOST_INT16(uint16 value) {
    return B_HOST_TO_LENDIAN_INT16(value);
}
constexpr uint32 B_LENDIAN_TO_HOST_INT32(uint32 value) {
    return B_HOST_TO_LENDIAN_INT32(value);
}
constexpr uint64 B_LENDIAN_TO_HOST_INT64(uint64 value) {
    return B_HOST_TO_LENDIAN_INT64(value);
}
constexpr uint16 B_BENDIAN_TO_HOST_INT16(uint16 value) {
    return B_HOST_TO_BENDIAN_INT16(value);
}
constexpr uint32 B_BENDIAN_TO_HOST_INT32(uint32 value) {
    return B_HOST_TO_BENDIAN_INT32(value);
}
constexpr uint64 B_BENDIAN_TO_HOST_INT64(uint64 value) {
    return B_HOST_TO_BENDIAN_INT64(value);
}
