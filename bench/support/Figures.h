#pragma once

#include <algorithm>
#include <chrono>
#include <cstdio>
#include <ctime>
#include <string>
#include <vector>

/// What every benchmark shares: a clock, medians, and one way of printing a figure beside its limit or peer.
namespace bench {

class Stopwatch {
  public:
    double Seconds() const {
        return std::chrono::duration<double>(std::chrono::steady_clock::now() - mStart).count();
    }

  private:
    std::chrono::steady_clock::time_point mStart = std::chrono::steady_clock::now();
};

/// Counts the processor time of the thread that made it and asks it: what its work costs, whatever else the
/// machine does meanwhile.
class ProcessorStopwatch {
  public:
    double Seconds() const { return Now() - mStart; }

  private:
    static double Now() {
        timespec now{};
        clock_gettime(CLOCK_THREAD_CPUTIME_ID, &now);
        return static_cast<double>(now.tv_sec) + 1e-9 * static_cast<double>(now.tv_nsec);
    }
    double mStart = Now();
};

inline double Median(std::vector<double> values) {
    std::sort(values.begin(), values.end());
    const std::size_t middle = values.size() / 2;
    return values.size() % 2 == 1 ? values[middle] : (values[middle - 1] + values[middle]) / 2;
}

enum class Better { higher, lower };

/// One line: what, figure, what it is compared with, their ratio, the ratio that must be reached, and whether
/// it is. Answers whether it is.
inline bool Report(const std::string& what, double figure, const std::string& unit, const std::string& peer,
                   double other, double limit, Better better) {
    const double ratio = other > 0 ? figure / other : 0;
    const bool reached = better == Better::higher ? ratio >= limit : ratio <= limit;
    std::printf("%-44s %12.1f %-10s %-34s %12.1f  ratio %8.2f  %s %-8.2f %s\n", what.c_str(), figure,
                unit.c_str(), peer.c_str(), other, ratio, better == Better::higher ? ">=" : "<=", limit,
                reached ? "reached" : "MISSED");
    std::fflush(stdout);
    return reached;
}

} // namespace bench
