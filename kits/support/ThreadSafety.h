// Names the guard of shared members, checked by clang's thread-safety analysis and empty for other compilers,
// with a mutex and a scoped lock that the analysis understands (the standard library's carry no marks).
#pragma once

#include <condition_variable>
#include <mutex>

#if defined(__clang__)
#define KIT_THREAD_ATTRIBUTE(x) __attribute__((x))
#else
#define KIT_THREAD_ATTRIBUTE(x)
#endif

#ifndef GUARDED_BY
#define GUARDED_BY(x) KIT_THREAD_ATTRIBUTE(guarded_by(x))
#endif
#ifndef PT_GUARDED_BY
#define PT_GUARDED_BY(x) KIT_THREAD_ATTRIBUTE(pt_guarded_by(x))
#endif
#ifndef REQUIRES
#define REQUIRES(...) KIT_THREAD_ATTRIBUTE(requires_capability(__VA_ARGS__))
#endif
#ifndef EXCLUDES
#define EXCLUDES(...) KIT_THREAD_ATTRIBUTE(locks_excluded(__VA_ARGS__))
#endif
#ifndef ACQUIRE
#define ACQUIRE(...) KIT_THREAD_ATTRIBUTE(acquire_capability(__VA_ARGS__))
#endif
#ifndef RELEASE
#define RELEASE(...) KIT_THREAD_ATTRIBUTE(release_capability(__VA_ARGS__))
#endif
#ifndef TRY_ACQUIRE
#define TRY_ACQUIRE(...) KIT_THREAD_ATTRIBUTE(try_acquire_capability(__VA_ARGS__))
#endif
#ifndef CAPABILITY
#define CAPABILITY(x) KIT_THREAD_ATTRIBUTE(capability(x))
#endif
#ifndef SCOPED_CAPABILITY
#define SCOPED_CAPABILITY KIT_THREAD_ATTRIBUTE(scoped_lockable)
#endif
#ifndef NO_THREAD_SAFETY_ANALYSIS
#define NO_THREAD_SAFETY_ANALYSIS KIT_THREAD_ATTRIBUTE(no_thread_safety_analysis)
#endif

// A plain, non-recursive mutex to be named in GUARDED_BY.
class CAPABILITY("mutex") GuardMutex {
  public:
    GuardMutex() = default;
    GuardMutex(const GuardMutex&) = delete;
    GuardMutex& operator=(const GuardMutex&) = delete;

    void lock() ACQUIRE() { mMutex.lock(); }
    void unlock() RELEASE() { mMutex.unlock(); }
    bool try_lock() TRY_ACQUIRE(true) { return mMutex.try_lock(); }

  private:
    friend class GuardLock;
    std::mutex mMutex;
};

// Holds a GuardMutex for a scope. Native() is for waiting on a std::condition_variable; write the wait as a
// loop around the condition (a lambda would be analysed without the lock).
class SCOPED_CAPABILITY GuardLock {
  public:
    explicit GuardLock(GuardMutex& mutex) ACQUIRE(mutex) : mLock(mutex.mMutex) {}
    ~GuardLock() RELEASE() = default;
    GuardLock(const GuardLock&) = delete;
    GuardLock& operator=(const GuardLock&) = delete;

    // Give the mutex up before the scope ends, and take it again.
    void Unlock() RELEASE() { mLock.unlock(); }
    void Lock() ACQUIRE() { mLock.lock(); }

    std::unique_lock<std::mutex>& Native() { return mLock; }

  private:
    std::unique_lock<std::mutex> mLock;
};
