#pragma once

#include "host/api/result.h"
#include <array>
#include <cstddef>
#include <span>
#include <string>

namespace host {

using Sha256 = std::array<std::byte, 32>;

/// ENOTSUP where the system's cryptographic library refuses to compute it.
Result<Sha256> sha256(std::span<const std::byte> data);

/// 64 lower-case hexadecimal digits.
std::string to_hexadecimal(const Sha256& hash);

} // namespace host
