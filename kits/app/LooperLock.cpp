#include "LooperLock.h"

#include <algorithm>
#include <chrono>

status_t LooperLock::Lock(bigtime_t timeout) {
    const thread_id caller = current_thread_identity();
    if (Owner() == caller) {
        mDepth.fetch_add(1, std::memory_order_relaxed);
        return B_OK;
    }
    GuardLock guard(mMutex);
    if (Owner() != 0 && !mDead && timeout <= 0)
        return B_WOULD_BLOCK;
    // A century is as good as for ever and does not overflow the clock.
    constexpr bigtime_t kForEver = bigtime_t{100} * 365 * 24 * 3600 * 1000000;
    const auto deadline =
        std::chrono::steady_clock::now() + std::chrono::microseconds(std::min(timeout, kForEver));
    while (Owner() != 0 && !mDead) {
        mWaiting++;
        std::cv_status waited = std::cv_status::no_timeout;
        if (timeout >= kForEver)
            mReleased.wait(guard.Native());
        else
            waited = mReleased.wait_until(guard.Native(), deadline);
        mWaiting--;
        if (waited == std::cv_status::timeout && Owner() != 0 && !mDead)
            return B_TIMED_OUT;
    }
    if (mDead)
        return B_BAD_VALUE;
    mOwner.store(caller, std::memory_order_relaxed);
    mDepth.store(1, std::memory_order_relaxed);
    return B_OK;
}

void LooperLock::Unlock() {
    if (!IsOwner())
        return;
    if (mDepth.fetch_sub(1, std::memory_order_relaxed) > 1)
        return;
    GuardLock guard(mMutex);
    mOwner.store(0, std::memory_order_relaxed);
    if (mWaiting > 0)
        mReleased.notify_one();
}

void LooperLock::Die() {
    GuardLock guard(mMutex);
    mDead = true;
    mOwner.store(0, std::memory_order_relaxed);
    mDepth.store(0, std::memory_order_relaxed);
    mReleased.notify_all();
}

int32 LooperLock::CountLocks() const {
    return mDepth.load(std::memory_order_relaxed);
}

int32 LooperLock::CountLockRequests() const {
    GuardLock guard(mMutex);
    return CountLocks() + mWaiting;
}
