// How long an ..._etc() call may wait. Internal to this kit.
#pragma once

#include <OS.h>
#include <ThreadSafety.h>

#include <chrono>
#include <condition_variable>

// Made at the start of the call from its flags and time-out. Belongs to the calling thread.
class WaitLimit {
  public:
    WaitLimit(uint32 flags, bigtime_t timeout);

    // Waits for a notification. False when the time is over, and Expired() then says what the call answers.
    // The caller looks at its condition again in either case.
    bool Wait(std::condition_variable& condition, GuardLock& guard);

    // B_WOULD_BLOCK when the call was not to wait at all, else B_TIMED_OUT.
    status_t Expired() const { return mMayWait ? B_TIMED_OUT : B_WOULD_BLOCK; }

  private:
    using Clock = std::chrono::steady_clock;

    bool mForEver = true;
    bool mMayWait = true;
    Clock::time_point mDeadline;
};
