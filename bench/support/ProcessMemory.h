#pragma once

#include <cstdlib>
#include <fstream>
#include <malloc.h>
#include <string>

namespace bench {

/// A field of /proc/self/status, in bytes: "VmRSS", "VmHWM".
inline double StatusBytes(const std::string& field) {
    std::ifstream status("/proc/self/status");
    for (std::string line; std::getline(status, line);) {
        if (line.rfind(field + ":", 0) == 0)
            return std::strtod(line.c_str() + field.size() + 1, nullptr) * 1024;
    }
    return 0;
}

inline double ResidentBytes() {
    return StatusBytes("VmRSS");
}

/// Allocated and not freed, the allocator's own share included; what it holds in reserve is not.
inline double AllocatedBytes() {
    const struct mallinfo2 info = mallinfo2();
    return static_cast<double>(info.uordblks + info.hblkhd);
}

} // namespace bench
