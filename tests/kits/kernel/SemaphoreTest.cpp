#include <OS.h>

#include <atomic>
#include <gtest/gtest.h>
#include <thread>
#include <vector>

namespace {

int32 count_of(sem_id sem) {
    int32 count = -1000;
    EXPECT_EQ(get_sem_count(sem, &count), B_OK);
    return count;
}

void wait_for_count(sem_id sem, int32 wanted) {
    for (int attempt = 0; attempt < 100000 && count_of(sem) != wanted; attempt++)
        snooze(200);
    ASSERT_EQ(count_of(sem), wanted);
}

} // namespace

TEST(SemaphoreTest, CountsDownAndUp) {
    const sem_id sem = create_sem(2, "two");
    ASSERT_GT(sem, 0);
    EXPECT_EQ(acquire_sem(sem), B_OK);
    EXPECT_EQ(acquire_sem(sem), B_OK);
    EXPECT_EQ(count_of(sem), 0);
    EXPECT_EQ(release_sem_etc(sem, 3, 0), B_OK);
    EXPECT_EQ(count_of(sem), 3);
    EXPECT_EQ(acquire_sem_etc(sem, 3, 0, 0), B_OK);
    EXPECT_EQ(delete_sem(sem), B_OK);
}

TEST(SemaphoreTest, TimeOuts) {
    const sem_id sem = create_sem(0, "empty");
    EXPECT_EQ(acquire_sem_etc(sem, 1, B_RELATIVE_TIMEOUT, 0), B_WOULD_BLOCK);
    EXPECT_EQ(acquire_sem_etc(sem, 1, B_RELATIVE_TIMEOUT, -1), B_WOULD_BLOCK);
    const bigtime_t start = system_time();
    EXPECT_EQ(acquire_sem_etc(sem, 1, B_TIMEOUT, 3000), B_TIMED_OUT);
    EXPECT_GE(system_time() - start, 3000);
    EXPECT_EQ(acquire_sem_etc(sem, 1, B_ABSOLUTE_TIMEOUT, system_time() + 2000), B_TIMED_OUT);
    EXPECT_EQ(acquire_sem_etc(sem, 1, B_ABSOLUTE_TIMEOUT, 1), B_TIMED_OUT);
    EXPECT_EQ(count_of(sem), 0);
    release_sem(sem);
    EXPECT_EQ(acquire_sem_etc(sem, 1, B_RELATIVE_TIMEOUT, 0), B_OK);
    delete_sem(sem);
}

TEST(SemaphoreTest, AnEndlessTimeOutIsNone) {
    const sem_id sem = create_sem(0, "endless");
    std::atomic<int> acquired{0};
    std::thread first(
        [&] { acquired += acquire_sem_etc(sem, 1, B_RELATIVE_TIMEOUT, B_INFINITE_TIMEOUT) == B_OK; });
    std::thread second(
        [&] { acquired += acquire_sem_etc(sem, 1, B_RELATIVE_TIMEOUT, INT64_MAX - 7) == B_OK; });
    wait_for_count(sem, -2);
    EXPECT_EQ(release_sem_etc(sem, 2, 0), B_OK);
    first.join();
    second.join();
    EXPECT_EQ(acquired, 2);
    delete_sem(sem);
}

TEST(SemaphoreTest, DeletingWakesThoseWhoWait) {
    const sem_id sem = create_sem(0, "doomed");
    status_t answer = B_OK;
    std::thread waiting([&] { answer = acquire_sem(sem); });
    wait_for_count(sem, -1);
    EXPECT_EQ(delete_sem(sem), B_OK);
    waiting.join();
    EXPECT_EQ(answer, B_BAD_SEM_ID);
}

TEST(SemaphoreTest, TheFirstToComeIsTheFirstServed) {
    const sem_id sem = create_sem(0, "queue");
    std::vector<int> order;
    std::thread greedy([&] {
        EXPECT_EQ(acquire_sem_etc(sem, 2, 0, 0), B_OK);
        order.push_back(1);
        release_sem(sem);
    });
    wait_for_count(sem, -2);
    std::thread modest([&] {
        EXPECT_EQ(acquire_sem(sem), B_OK);
        order.push_back(2);
    });
    wait_for_count(sem, -3);
    release_sem(sem);
    snooze(2000);
    EXPECT_EQ(count_of(sem), -2);
    release_sem(sem);
    greedy.join();
    modest.join();
    EXPECT_EQ(order, (std::vector<int>{1, 2}));
    delete_sem(sem);
}

TEST(SemaphoreTest, WhoGivesUpLetsTheNextOnePass) {
    const sem_id sem = create_sem(1, "impatient");
    status_t greedy = B_OK;
    std::thread first([&] { greedy = acquire_sem_etc(sem, 5, B_RELATIVE_TIMEOUT, 300000); });
    wait_for_count(sem, -4);
    EXPECT_EQ(acquire_sem(sem), B_OK);
    first.join();
    EXPECT_EQ(greedy, B_TIMED_OUT);
    EXPECT_EQ(count_of(sem), 0);
    delete_sem(sem);
}

TEST(SemaphoreTest, ReleaseFlags) {
    const sem_id sem = create_sem(0, "flags");
    EXPECT_EQ(release_sem_etc(sem, 4, B_RELEASE_IF_WAITING_ONLY), B_OK);
    EXPECT_EQ(count_of(sem), 0);
    EXPECT_EQ(release_sem_etc(sem, 0, B_RELEASE_ALL), B_OK);
    EXPECT_EQ(count_of(sem), 0);
    std::vector<std::thread> waiting;
    for (int thread = 0; thread < 3; thread++)
        waiting.emplace_back([sem] { EXPECT_EQ(acquire_sem(sem), B_OK); });
    wait_for_count(sem, -3);
    EXPECT_EQ(release_sem_etc(sem, 0, B_RELEASE_ALL), B_OK);
    for (std::thread& thread : waiting)
        thread.join();
    EXPECT_EQ(count_of(sem), 0);
    delete_sem(sem);
}

TEST(SemaphoreTest, RefusesWhatMakesNoSense) {
    EXPECT_EQ(create_sem(-1, "negative"), B_BAD_VALUE);
    const sem_id sem = create_sem(1, nullptr);
    EXPECT_EQ(acquire_sem_etc(sem, 0, 0, 0), B_BAD_VALUE);
    EXPECT_EQ(release_sem_etc(sem, 0, 0), B_BAD_VALUE);
    EXPECT_EQ(release_sem_etc(sem, -1, 0), B_BAD_VALUE);
    EXPECT_EQ(release_sem_etc(sem, INT32_MAX, 0), B_BAD_VALUE);
    EXPECT_EQ(get_sem_count(sem, nullptr), B_BAD_VALUE);
    EXPECT_EQ(get_sem_info(sem, nullptr), B_BAD_VALUE);
    delete_sem(sem);
    int32 count = 0;
    sem_info info;
    EXPECT_EQ(acquire_sem(sem), B_BAD_SEM_ID);
    EXPECT_EQ(release_sem(sem), B_BAD_SEM_ID);
    EXPECT_EQ(delete_sem(sem), B_BAD_SEM_ID);
    EXPECT_EQ(get_sem_count(sem, &count), B_BAD_SEM_ID);
    EXPECT_EQ(get_sem_info(sem, &info), B_BAD_SEM_ID);
    EXPECT_EQ(acquire_sem(0), B_BAD_SEM_ID);
    EXPECT_EQ(acquire_sem(-1), B_BAD_SEM_ID);
}

TEST(SemaphoreTest, TellsAboutItself) {
    const sem_id sem = create_sem(3, "a name that is longer than thirty-one bytes");
    acquire_sem(sem);
    sem_info info;
    ASSERT_EQ(get_sem_info(sem, &info), B_OK);
    EXPECT_STREQ(info.name, "a name that is longer than thir");
    EXPECT_EQ(info.sem, sem);
    EXPECT_EQ(info.count, 2);
    EXPECT_EQ(info.latest_holder, find_thread(nullptr));
    delete_sem(sem);
}
