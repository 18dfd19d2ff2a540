// BLocker: a recursive lock that knows its owner.
#pragma once

#include <SupportDefs.h>
#include <ThreadIdentity.h>
#include <ThreadSafety.h>

#include <atomic>
#include <string>

typedef int32 sem_id;

// A lock that its owner may take again and must release as often. Any thread; must not be destroyed while
// a thread holds it or waits for it.
class BLocker {
  public:
    BLocker();
    explicit BLocker(const char* name);
    // The style is accepted for the sake of the API; every locker costs nothing but its own memory here.
    explicit BLocker(bool benaphoreStyle);
    BLocker(const char* name, bool benaphoreStyle);
    virtual ~BLocker();
    BLocker(const BLocker&) = delete;
    BLocker& operator=(const BLocker&) = delete;

    // Always B_OK.
    status_t InitCheck() const;

    // Waits until the calling thread is the owner. Always true.
    bool Lock();
    // B_OK when the calling thread is now the owner; B_TIMED_OUT after `timeout` microseconds, or
    // B_WOULD_BLOCK when the time-out is 0 or less. B_INFINITE_TIMEOUT waits for ever.
    [[nodiscard]] status_t LockWithTimeout(bigtime_t timeout);
    // Gives one Lock() back. Without effect when the calling thread is not the owner.
    void Unlock();

    // The owner, or B_ERROR when nobody is.
    thread_id LockingThread() const;
    // True when the calling thread is the owner.
    bool IsLocked() const;
    // How often the owner holds it; 0 when nobody does.
    int32 CountLocks() const;
    // Owner's locks and waiting threads together.
    int32 CountLockRequests() const;
    // There is no semaphore behind a locker on this host: always B_BAD_SEM_ID.
    sem_id Sem() const;

  private:
    const std::string mName;
    mutable GuardMutex mMutex;
    std::condition_variable mReleased;
    int32 mWaiting GUARDED_BY(mMutex) = 0;
    // Written under mMutex. Only the owner itself can find its own number here, so it may look without the
    // mutex.
    std::atomic<thread_id> mOwner{0};
    // Written by the owner alone.
    std::atomic<int32> mDepth{0};
};
