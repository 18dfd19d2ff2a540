#pragma once

#include <cstddef>
#include <cstdint>
#include <string>

// What the system knows about this process and its threads. Every function here may be called from any
// thread.

namespace host {

/// A thread's number in the system. The system gives it to another thread once the first has ended.
using native_thread = std::int32_t;

native_thread current_native_thread();
std::int32_t current_process();

/// The name that the system's tools show; it is cut to 15 bytes. False when the thread has ended.
bool set_thread_name(native_thread thread, const char* name);
/// Empty when the thread has ended.
std::string thread_name(native_thread thread);

enum class io_class { normal, idle };

/// How a thread competes with others: niceness from -20 (urgent) to 19, and its turn at the disk.
struct thread_schedule {
    int niceness = 0;
    io_class io = io_class::normal;
};

/// The niceness that this process was started with, as far as its first caller can see.
int process_niceness();

/// False when the system refused either part; the other one is applied all the same. Making a thread more
/// urgent than it is needs a privilege that desktop programs do not have.
bool set_thread_schedule(native_thread thread, thread_schedule schedule);

/// Processor time used, in microseconds; zeros for a thread that has ended.
struct thread_times {
    std::int64_t user = 0;
    std::int64_t kernel = 0;
};
thread_times processor_times(native_thread thread);

/// Ends the calling thread, which was not made by the kits, unwinding its stack.
[[noreturn]] void end_calling_thread();

/// Nanoseconds since the machine was started, without the time it slept. Never goes back.
std::int64_t uptime_nanoseconds();
/// Microseconds since 1970-01-01 00:00 UTC.
std::int64_t wall_clock_microseconds();
/// Waits until uptime_nanoseconds() has reached `time`, whatever signals arrive.
void sleep_until(std::int64_t time);

/// The greatest time between the two presses of a double click, in microseconds: 500000 until the windowing
/// part has told what the desktop has set.
std::int64_t double_click_time();
void set_double_click_time(std::int64_t microseconds);

struct system_facts {
    std::int64_t boot_time = 0;   ///< wall clock, microseconds
    std::uint32_t processors = 1; ///< on line
    std::uint64_t memory_bytes = 0;
    std::uint64_t free_memory_bytes = 0; ///< free, or caches that can be dropped at once
    std::string kernel_name;
};
system_facts describe_system();

/// This process's command line, arguments separated by spaces; `argument_count` receives their number.
std::string command_line(int& argument_count);
std::uint32_t user_id();
std::uint32_t group_id();

/// True when standard error is a terminal.
bool standard_error_is_terminal();

} // namespace host
