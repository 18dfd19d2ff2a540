#include <Locker.h>

#include <gtest/gtest.h>
#include <thread>
#include <vector>

namespace {

template <typename Function>
void in_another_thread(Function function) {
    std::thread(function).join();
}

} // namespace

TEST(LockerTest, AFreeLockerHasNoOwner) {
    const BLocker locker("free");
    EXPECT_EQ(locker.InitCheck(), B_OK);
    EXPECT_FALSE(locker.IsLocked());
    EXPECT_EQ(locker.CountLocks(), 0);
    EXPECT_EQ(locker.CountLockRequests(), 0);
    EXPECT_EQ(locker.LockingThread(), B_ERROR);
    EXPECT_EQ(locker.Sem(), B_BAD_SEM_ID);
}

TEST(LockerTest, TheOwnerMayLockAgain) {
    BLocker locker;
    EXPECT_TRUE(locker.Lock());
    EXPECT_TRUE(locker.Lock());
    EXPECT_EQ(locker.LockWithTimeout(0), B_OK);
    EXPECT_EQ(locker.CountLocks(), 3);
    EXPECT_EQ(locker.LockingThread(), current_thread_identity());
    locker.Unlock();
    locker.Unlock();
    EXPECT_TRUE(locker.IsLocked());
    locker.Unlock();
    EXPECT_FALSE(locker.IsLocked());
    EXPECT_EQ(locker.CountLocks(), 0);
}

TEST(LockerTest, OthersCannotTakeOrReleaseIt) {
    BLocker locker;
    locker.Lock();
    in_another_thread([&locker] {
        EXPECT_FALSE(locker.IsLocked());
        EXPECT_EQ(locker.LockWithTimeout(0), B_WOULD_BLOCK);
        EXPECT_EQ(locker.LockWithTimeout(-1), B_WOULD_BLOCK);
        EXPECT_EQ(locker.LockWithTimeout(2000), B_TIMED_OUT);
        locker.Unlock();
    });
    EXPECT_EQ(locker.CountLocks(), 1);
    EXPECT_EQ(locker.CountLockRequests(), 1);
    locker.Unlock();
    in_another_thread([&locker] {
        EXPECT_EQ(locker.LockWithTimeout(0), B_OK);
        locker.Unlock();
    });
}

TEST(LockerTest, AWaitingThreadGetsItWhenItIsReleased) {
    BLocker locker;
    locker.Lock();
    bool reached = false;
    std::thread waiting([&] {
        locker.LockWithTimeout(INT64_MAX - 1) == B_OK ? reached = true : reached = false;
        locker.Unlock();
    });
    while (locker.CountLockRequests() < 2)
        std::this_thread::yield();
    EXPECT_FALSE(reached);
    locker.Unlock();
    waiting.join();
    EXPECT_TRUE(reached);
}

TEST(LockerTest, NeverTwoOwnersAtOnce) {
    BLocker locker;
    int counter = 0;
    std::vector<std::thread> threads;
    for (int thread = 0; thread < 4; thread++) {
        threads.emplace_back([&locker, &counter] {
            for (int round = 0; round < 2000; round++) {
                locker.Lock();
                locker.Lock();
                counter++;
                locker.Unlock();
                locker.Unlock();
            }
        });
    }
    for (std::thread& thread : threads)
        thread.join();
    EXPECT_EQ(counter, 8000);
}

TEST(LockerTest, ThreadNumbersAreUniqueAndLasting) {
    const thread_id own = current_thread_identity();
    EXPECT_GT(own, 0);
    EXPECT_EQ(current_thread_identity(), own);
    thread_id other = 0;
    in_another_thread([&other] { other = current_thread_identity(); });
    EXPECT_NE(other, own);
    thread_id adopted = 0;
    const thread_id reserved = reserve_thread_identity();
    in_another_thread([&adopted, reserved] {
        adopt_thread_identity(reserved);
        adopted = current_thread_identity();
    });
    EXPECT_EQ(adopted, reserved);
    EXPECT_NE(adopted, other);
}
