#include <WaitLimit.h>

WaitLimit::WaitLimit(uint32 flags, bigtime_t timeout) {
    if ((flags & (B_RELATIVE_TIMEOUT | B_ABSOLUTE_TIMEOUT)) == 0 || timeout == B_INFINITE_TIMEOUT)
        return;
    // The clock counts in nanoseconds: what lies beyond its range is as good as for ever.
    const Clock::time_point start = (flags & B_ABSOLUTE_TIMEOUT) != 0 ? Clock::time_point() : Clock::now();
    if (timeout >
        std::chrono::duration_cast<std::chrono::microseconds>(Clock::time_point::max() - start).count())
        return;
    mForEver = false;
    mMayWait = timeout > 0;
    mDeadline = start + std::chrono::microseconds(max_c(timeout, 0));
}

bool WaitLimit::Wait(std::condition_variable& condition, GuardLock& guard) {
    if (mForEver) {
        condition.wait(guard.Native());
        return true;
    }
    return mMayWait && condition.wait_until(guard.Native(), mDeadline) == std::cv_status::no_timeout;
}
