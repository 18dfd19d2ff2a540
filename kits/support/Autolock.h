// BAutolock: holds a lock for the length of a scope.
#pragma once

#include <Locker.h>

#include <concepts>

// Anything with the Lock() and Unlock() of BLocker and BLooper. (Loopers are known to a higher kit only.)
template <typename Target>
concept LockableTarget = requires(Target* target) {
    { target->Lock() } -> std::convertible_to<bool>;
    target->Unlock();
};

// Locks in the constructor and unlocks in the destructor. IsLocked() tells whether it worked: a BLocker can
// always be locked, a looper that is going away cannot, nor can a null pointer. The target must outlive the
// lock. Belongs to the thread that made it.
class BAutolock {
  public:
    template <LockableTarget Target>
    explicit BAutolock(Target* target)
        : mTarget(target),
          mLock([](void* lockable) -> bool { return static_cast<Target*>(lockable)->Lock(); }),
          mUnlock([](void* lockable) { static_cast<Target*>(lockable)->Unlock(); }) {
        Lock();
    }
    template <LockableTarget Target>
    explicit BAutolock(Target& target) : BAutolock(&target) {}
    ~BAutolock() { Unlock(); }
    BAutolock(const BAutolock&) = delete;
    BAutolock& operator=(const BAutolock&) = delete;

    bool IsLocked() const { return mLocked; }

    // Takes the lock again after Unlock(); true when it is held, which it may have been already.
    bool Lock() {
        if (!mLocked && mTarget != nullptr)
            mLocked = mLock(mTarget);
        return mLocked;
    }

    // Gives the lock up before the scope ends.
    void Unlock() {
        if (mLocked) {
            mLocked = false;
            mUnlock(mTarget);
        }
    }

  private:
    void* mTarget;
    bool (*mLock)(void*);
    void (*mUnlock)(void*);
    bool mLocked = false;
};
