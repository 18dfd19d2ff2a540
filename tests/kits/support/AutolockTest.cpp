#include <Autolock.h>

#include <gtest/gtest.h>

namespace {

// What a looper looks like to a lock: it may refuse.
struct Refusing {
    bool Lock() { return false; }
    void Unlock() { unlocked = true; }
    bool unlocked = false;
};

} // namespace

TEST(AutolockTest, HoldsTheLockForTheScope) {
    BLocker locker;
    {
        const BAutolock lock(locker);
        EXPECT_TRUE(lock.IsLocked());
        EXPECT_TRUE(locker.IsLocked());
        const BAutolock again(&locker);
        EXPECT_EQ(locker.CountLocks(), 2);
    }
    EXPECT_FALSE(locker.IsLocked());
}

TEST(AutolockTest, CanBeUnlockedEarlyAndLockedAgain) {
    BLocker locker;
    BAutolock lock(locker);
    lock.Unlock();
    EXPECT_FALSE(locker.IsLocked());
    EXPECT_FALSE(lock.IsLocked());
    lock.Unlock();
    EXPECT_TRUE(lock.Lock());
    EXPECT_TRUE(lock.Lock());
    EXPECT_EQ(locker.CountLocks(), 1);
}

TEST(AutolockTest, SaysWhenTheTargetRefuses) {
    Refusing target;
    {
        const BAutolock lock(&target);
        EXPECT_FALSE(lock.IsLocked());
    }
    EXPECT_FALSE(target.unlocked);
    const BAutolock nothing(static_cast<BLocker*>(nullptr));
    EXPECT_FALSE(nothing.IsLocked());
}
