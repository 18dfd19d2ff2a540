#pragma once

#include "host/api/entry.h"
#include "host/api/predicate.h"
#include <cstdint>
#include <memory>
#include <string>

/// Queries asked of the host itself, without a kit between.
namespace bench {

std::shared_ptr<const host::Predicate> Comparison(const char* attribute, host::Predicate::Operator op,
                                                  const char* text);

struct Answer {
    std::uint64_t hits = 0;
    double first = 0; ///< seconds to the first hit
    double all = 0;   ///< seconds to the end
};

/// Asks and takes every hit.
Answer Ask(host::DeviceId volume, const std::shared_ptr<const host::Predicate>& predicate);

/// Entries of a tree, read by one thread with nothing done to them.
std::uint64_t BareWalk(const std::string& root);

} // namespace bench
