#pragma once

#include <cstdint>
#include <cstdio>
#include <cstdlib>
#include <random>

/// The seed of a random test: QUIRNEL_TEST_SEED when that is set, else a fresh one. Printed, so that a
/// failure can be repeated.
inline std::uint64_t RandomSeed() {
    const char* given = std::getenv("QUIRNEL_TEST_SEED");
    const std::uint64_t seed = given ? std::strtoull(given, nullptr, 0) : std::random_device{}();
    std::printf("QUIRNEL_TEST_SEED=%llu\n", static_cast<unsigned long long>(seed));
    return seed;
}
