#pragma once

#include <cstdint>
#include <ctime>
#include <filesystem>
#include <fstream>
#include <map>
#include <string>
#include <system_error>

namespace bench {

/// Processor time that this process has used so far, kernel included, apart by the names of its threads. What
/// threads that have ended used is under `kEnded`. Seconds.
class ThreadTimes {
  public:
    static constexpr const char* kEnded = "ended";

    static ThreadTimes Now() {
        ThreadTimes times;
        timespec all{};
        clock_gettime(CLOCK_PROCESS_CPUTIME_ID, &all);
        double ended = static_cast<double>(all.tv_sec) + 1e-9 * static_cast<double>(all.tv_nsec);
        std::error_code error;
        for (const auto& task : std::filesystem::directory_iterator("/proc/self/task", error)) {
            std::string name;
            double nanoseconds = 0;
            std::getline(std::ifstream(task.path() / "comm"), name);
            std::ifstream(task.path() / "schedstat") >> nanoseconds;
            times.mSeconds[name] += nanoseconds * 1e-9;
            ended -= nanoseconds * 1e-9;
        }
        times.mSeconds[kEnded] = ended;
        return times;
    }

    /// A thread of this name is there.
    bool Has(const std::string& name) const { return mSeconds.contains(name); }
    double Of(const std::string& name) const {
        const auto found = mSeconds.find(name);
        return found == mSeconds.end() ? 0.0 : found->second;
    }

  private:
    std::map<std::string, double> mSeconds;
};

} // namespace bench
