#include "host/api/threads.h"

#include <algorithm>
#include <atomic>
#include <cerrno>
#include <cstdio>
#include <cstdlib>
#include <cstring>
#include <ctime>
#include <fstream>
#include <pthread.h>
#include <sstream>
#include <sys/resource.h>
#include <sys/syscall.h>
#include <sys/utsname.h>
#include <thread>
#include <unistd.h>

namespace host {

namespace {

constexpr std::int64_t kNanosecondsPerSecond = 1'000'000'000;

// The C library has no wrapper for I/O priorities; these are the system call's own numbers.
constexpr int kIoPriorityWhoThread = 1;
constexpr int kIoClassShift = 13;
constexpr int kIoClassNone = 0;
constexpr int kIoClassIdle = 3;

std::atomic<std::int64_t> the_double_click_time{500'000};

std::int64_t nanoseconds(clockid_t clock) {
    timespec now{};
    clock_gettime(clock, &now);
    return now.tv_sec * kNanosecondsPerSecond + now.tv_nsec;
}

std::string task_file(native_thread thread, const char* leaf) {
    return "/proc/self/task/" + std::to_string(thread) + "/" + leaf;
}

} // namespace

native_thread current_native_thread() {
    // Asked often, and the answer never changes within a thread.
    thread_local const native_thread thread = static_cast<native_thread>(syscall(SYS_gettid));
    return thread;
}

std::int32_t current_process() {
    return getpid();
}

bool set_thread_name(native_thread thread, const char* name) {
    std::FILE* file = std::fopen(task_file(thread, "comm").c_str(), "w");
    if (file == nullptr)
        return false;
    // The system takes the first 15 bytes of one write.
    std::setvbuf(file, nullptr, _IOFBF, 64);
    std::fprintf(file, "%.15s", name);
    return std::fclose(file) == 0;
}

std::string thread_name(native_thread thread) {
    std::ifstream file(task_file(thread, "comm"));
    std::string name;
    std::getline(file, name);
    return name;
}

int process_niceness() {
    // Asked for the main thread, once: later it may have been changed.
    static const int niceness = getpriority(PRIO_PROCESS, static_cast<id_t>(getpid()));
    return niceness;
}

bool set_thread_schedule(native_thread thread, thread_schedule schedule) {
    const bool niceness_set = setpriority(PRIO_PROCESS, static_cast<id_t>(thread), schedule.niceness) == 0;
    const int io = (schedule.io == io_class::idle ? kIoClassIdle : kIoClassNone) << kIoClassShift;
    const bool io_set = syscall(SYS_ioprio_set, kIoPriorityWhoThread, thread, io) == 0;
    return niceness_set && io_set;
}

thread_times processor_times(native_thread thread) {
    std::ifstream file(task_file(thread, "stat"));
    std::string line;
    if (!std::getline(file, line))
        return {};
    // The name stands in parentheses and may hold anything; the numbers follow the last one.
    const std::size_t end_of_name = line.rfind(')');
    if (end_of_name == std::string::npos)
        return {};
    std::istringstream fields(line.substr(end_of_name + 1));
    std::string skipped;
    for (int field = 0; field < 11; field++)
        fields >> skipped;
    std::int64_t user_ticks = 0;
    std::int64_t kernel_ticks = 0;
    fields >> user_ticks >> kernel_ticks;
    const std::int64_t microseconds_per_tick = 1'000'000 / sysconf(_SC_CLK_TCK);
    return {user_ticks * microseconds_per_tick, kernel_ticks * microseconds_per_tick};
}

void end_calling_thread() {
    pthread_exit(nullptr);
}

std::int64_t uptime_nanoseconds() {
    return nanoseconds(CLOCK_MONOTONIC);
}

std::int64_t wall_clock_microseconds() {
    return nanoseconds(CLOCK_REALTIME) / 1000;
}

void sleep_until(std::int64_t time) {
    const timespec until{time / kNanosecondsPerSecond, time % kNanosecondsPerSecond};
    while (clock_nanosleep(CLOCK_MONOTONIC, TIMER_ABSTIME, &until, nullptr) == EINTR) {
    }
}

std::int64_t double_click_time() {
    return the_double_click_time.load(std::memory_order_relaxed);
}

void set_double_click_time(std::int64_t microseconds) {
    the_double_click_time.store(microseconds, std::memory_order_relaxed);
}

system_facts describe_system() {
    system_facts facts;
    facts.boot_time = wall_clock_microseconds() - nanoseconds(CLOCK_BOOTTIME) / 1000;
    facts.processors = std::max(1U, std::thread::hardware_concurrency());
    std::ifstream memory("/proc/meminfo");
    std::string line;
    while (std::getline(memory, line)) {
        std::istringstream fields(line);
        std::string name;
        std::uint64_t kilobytes = 0;
        fields >> name >> kilobytes;
        if (name == "MemTotal:")
            facts.memory_bytes = kilobytes * 1024;
        else if (name == "MemAvailable:")
            facts.free_memory_bytes = kilobytes * 1024;
    }
    utsname names{};
    if (uname(&names) == 0)
        facts.kernel_name = std::string(names.sysname) + " " + names.release;
    return facts;
}

std::string command_line(int& argument_count) {
    std::ifstream file("/proc/self/cmdline", std::ios::binary);
    std::ostringstream bytes;
    bytes << file.rdbuf();
    std::string line = bytes.str();
    argument_count = 0;
    for (char& c : line) {
        if (c == '\0') {
            argument_count++;
            c = ' ';
        }
    }
    if (!line.empty() && line.back() == ' ')
        line.pop_back();
    return line;
}

std::uint32_t user_id() {
    return getuid();
}

std::uint32_t group_id() {
    return getgid();
}

bool standard_error_is_terminal() {
    return isatty(STDERR_FILENO) == 1;
}

} // namespace host
