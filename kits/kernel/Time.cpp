#include <OS.h>

#include "host/api/threads.h"

namespace {

constexpr int64 kNanosecondsPerMicrosecond = 1000;

void sleep_until_microseconds(bigtime_t time) {
    int64 nanoseconds = 0;
    if (__builtin_mul_overflow(time, kNanosecondsPerMicrosecond, &nanoseconds))
        nanoseconds = INT64_MAX;
    host::sleep_until(nanoseconds);
}

} // namespace

status_t snooze(bigtime_t microseconds) {
    if (microseconds <= 0)
        return B_OK;
    bigtime_t until = 0;
    if (__builtin_add_overflow(system_time(), microseconds, &until))
        until = B_INFINITE_TIMEOUT;
    // The clock is read in whole microseconds: one more makes sure that all of them pass.
    sleep_until_microseconds(until == B_INFINITE_TIMEOUT ? until : until + 1);
    return B_OK;
}

status_t snooze_until(bigtime_t time, int timeBase) {
    if (timeBase != B_SYSTEM_TIMEBASE)
        return B_BAD_VALUE;
    if (time > 0)
        sleep_until_microseconds(time);
    return B_OK;
}

bigtime_t system_time() {
    return host::uptime_nanoseconds() / kNanosecondsPerMicrosecond;
}

int64 system_time_nsecs() {
    return host::uptime_nanoseconds();
}

uint32 real_time_clock() {
    return static_cast<uint32>(host::wall_clock_microseconds() / 1'000'000);
}

bigtime_t real_time_clock_usecs() {
    return host::wall_clock_microseconds();
}
