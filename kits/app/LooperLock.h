// The lock of a looper, which outlives it. Internal to the app kit.
#pragma once

#include <OS.h>
#include <ThreadSafety.h>

#include <atomic>

// Recursive, knows its owner, and can die: from then on it can never be taken, and threads that wait for it
// give up. Any thread.
class LooperLock {
  public:
    // B_OK; B_BAD_VALUE when the lock is or becomes dead; B_TIMED_OUT, or B_WOULD_BLOCK for a time-out of 0
    // or less.
    status_t Lock(bigtime_t timeout);
    // Without effect when the calling thread is not the owner.
    void Unlock();
    void Die();

    // 0 when nobody holds it.
    thread_id Owner() const { return mOwner.load(std::memory_order_relaxed); }
    bool IsOwner() const { return Owner() == current_thread_identity(); }
    // The owner's locks, and those together with the threads that wait.
    int32 CountLocks() const;
    int32 CountLockRequests() const;

  private:
    mutable GuardMutex mMutex;
    std::condition_variable mReleased;
    bool mDead GUARDED_BY(mMutex) = false;
    int32 mWaiting GUARDED_BY(mMutex) = 0;
    // Written under mMutex. Only the owner itself can find its own number here, so it may look without the
    // mutex.
    std::atomic<thread_id> mOwner{0};
    // Written by the owner alone.
    std::atomic<int32> mDepth{0};
};
