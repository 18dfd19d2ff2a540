#include <Locker.h>

#include <chrono>

namespace {

using Clock = std::chrono::steady_clock;

bigtime_t microseconds_left(Clock::time_point start) {
    return std::chrono::duration_cast<std::chrono::microseconds>(Clock::time_point::max() - start).count();
}

} // namespace

BLocker::BLocker() : BLocker("some BLocker") {}

BLocker::BLocker(const char* name) : mName(name != nullptr ? name : "") {}

BLocker::BLocker(bool) : BLocker() {}

BLocker::BLocker(const char* name, bool) : BLocker(name) {}

BLocker::~BLocker() = default;

status_t BLocker::InitCheck() const {
    return B_OK;
}

bool BLocker::Lock() {
    return LockWithTimeout(INT64_MAX) == B_OK;
}

status_t BLocker::LockWithTimeout(bigtime_t timeout) {
    const thread_id self = current_thread_identity();
    if (mOwner.load(std::memory_order_relaxed) == self) {
        mDepth.fetch_add(1, std::memory_order_relaxed);
        return B_OK;
    }

    GuardLock guard(mMutex);
    if (mOwner.load(std::memory_order_relaxed) != 0) {
        if (timeout <= 0)
            return B_WOULD_BLOCK;
        const Clock::time_point start = Clock::now();
        // A time-out beyond the clock's range is as good as none.
        const bool forEver = timeout > microseconds_left(start);
        const Clock::time_point deadline = forEver ? start : start + std::chrono::microseconds(timeout);
        mWaiting++;
        std::cv_status waited = std::cv_status::no_timeout;
        while (mOwner.load(std::memory_order_relaxed) != 0 && waited == std::cv_status::no_timeout) {
            if (forEver)
                mReleased.wait(guard.Native());
            else
                waited = mReleased.wait_until(guard.Native(), deadline);
        }
        mWaiting--;
        if (mOwner.load(std::memory_order_relaxed) != 0)
            return B_TIMED_OUT;
    }
    mOwner.store(self, std::memory_order_relaxed);
    mDepth.store(1, std::memory_order_relaxed);
    return B_OK;
}

void BLocker::Unlock() {
    if (mOwner.load(std::memory_order_relaxed) != current_thread_identity())
        return;
    if (mDepth.fetch_sub(1, std::memory_order_relaxed) > 1)
        return;
    // Notified under the mutex: once it is free, the next owner may destroy the locker.
    GuardLock guard(mMutex);
    mOwner.store(0, std::memory_order_relaxed);
    if (mWaiting > 0)
        mReleased.notify_one();
}

thread_id BLocker::LockingThread() const {
    const thread_id owner = mOwner.load(std::memory_order_relaxed);
    return owner != 0 ? owner : B_ERROR;
}

bool BLocker::IsLocked() const {
    return mOwner.load(std::memory_order_relaxed) == current_thread_identity();
}

int32 BLocker::CountLocks() const {
    return mDepth.load(std::memory_order_relaxed);
}

int32 BLocker::CountLockRequests() const {
    GuardLock guard(mMutex);
    return mDepth.load(std::memory_order_relaxed) + mWaiting;
}

sem_id BLocker::Sem() const {
    return B_BAD_SEM_ID;
}
