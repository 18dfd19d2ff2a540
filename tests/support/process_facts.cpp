#include "support/process_facts.h"

#include <cstdlib>
#include <filesystem>
#include <fstream>

namespace test {
namespace {

/// The number behind a field of a status file.
std::int64_t status_number(const std::filesystem::path& file, const std::string& field) {
    std::ifstream status(file);
    for (std::string line; std::getline(status, line);) {
        if (line.starts_with(field + ":"))
            return std::strtoll(line.c_str() + field.size() + 1, nullptr, 10);
    }
    return 0;
}

} // namespace

std::int64_t resident_bytes(int process) {
    return status_number("/proc/" + std::to_string(process) + "/status", "VmRSS") * 1024;
}

WaitCounts wait_counts(int process) {
    WaitCounts counts;
    std::error_code gone;
    for (const auto& task :
         std::filesystem::directory_iterator("/proc/" + std::to_string(process) + "/task", gone)) {
        std::string name;
        std::getline(std::ifstream(task.path() / "comm"), name);
        counts[task.path().filename().string() + " " + name] =
            status_number(task.path() / "status", "voluntary_ctxt_switches");
    }
    return counts;
}

} // namespace test
