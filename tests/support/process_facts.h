#pragma once

#include <cstdint>
#include <map>
#include <string>

namespace test {

/// Bytes of memory that a process has in use now; 0 for one that is gone.
std::int64_t resident_bytes(int process);

/// For each thread of a process, by number and name, how often it has given up its processor to wait.
using WaitCounts = std::map<std::string, std::int64_t>;
WaitCounts wait_counts(int process);

} // namespace test
