#pragma once

#include <mutex>

// Names for clang's thread-safety analysis; other compilers see nothing.

#if defined(__clang__)
#define HOST_THREAD_ANNOTATION(x) __attribute__((x))
#else
#define HOST_THREAD_ANNOTATION(x)
#endif

#ifndef GUARDED_BY
#define GUARDED_BY(mutex) HOST_THREAD_ANNOTATION(guarded_by(mutex))
#endif
#ifndef REQUIRES
#define REQUIRES(...) HOST_THREAD_ANNOTATION(requires_capability(__VA_ARGS__))
#endif
#ifndef EXCLUDES
#define EXCLUDES(...) HOST_THREAD_ANNOTATION(locks_excluded(__VA_ARGS__))
#endif

namespace host {

/// A std::mutex that the analysis knows; GUARDED_BY takes no other.
class HOST_THREAD_ANNOTATION(capability("mutex")) Mutex {
  public:
    void lock() HOST_THREAD_ANNOTATION(acquire_capability()) { mutex_.lock(); }
    void unlock() HOST_THREAD_ANNOTATION(release_capability()) { mutex_.unlock(); }
    bool try_lock() HOST_THREAD_ANNOTATION(try_acquire_capability(true)) { return mutex_.try_lock(); }

  private:
    std::mutex mutex_;
};

/// Holds a Mutex for a scope; may be released early and taken again, and serves
/// std::condition_variable_any::wait.
class HOST_THREAD_ANNOTATION(scoped_lockable) MutexLock {
  public:
    explicit MutexLock(Mutex& mutex) HOST_THREAD_ANNOTATION(acquire_capability(mutex)) : mutex_(mutex) {
        mutex_.lock();
    }
    ~MutexLock() HOST_THREAD_ANNOTATION(release_capability()) {
        if (held_)
            mutex_.unlock();
    }
    MutexLock(const MutexLock&) = delete;
    MutexLock& operator=(const MutexLock&) = delete;

    void lock() HOST_THREAD_ANNOTATION(acquire_capability()) {
        mutex_.lock();
        held_ = true;
    }
    void unlock() HOST_THREAD_ANNOTATION(release_capability()) {
        held_ = false;
        mutex_.unlock();
    }

  private:
    Mutex& mutex_;
    bool held_ = true;
};

} // namespace host
