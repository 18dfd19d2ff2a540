#include <OS.h>

#include <atomic>
#include <cstdlib>
#include <gtest/gtest.h>
#include <random>
#include <thread>
#include <vector>

// What must hold whoever comes first. Meant to be run under ThreadSanitizer too.

namespace {

unsigned seed() {
    const char* given = std::getenv("QUIRNEL_TEST_SEED");
    const unsigned chosen =
        given != nullptr ? static_cast<unsigned>(std::strtoul(given, nullptr, 10)) : std::random_device()();
    std::printf("QUIRNEL_TEST_SEED=%u\n", chosen);
    return chosen;
}

int32 poll_until_told(void*) {
    const thread_id self = find_thread(nullptr);
    int32 rounds = 0;
    while (!has_data(self) && rounds < INT32_MAX)
        rounds++;
    return 9;
}

int32 return_at_once(void*) {
    return 9;
}

} // namespace

TEST(ThreadRacesTest, CancellingAJobWorksAtEveryMomentOfItsLife) {
    std::mt19937 random(seed());
    for (int round = 0; round < 300; round++) {
        const bool polls = random() % 2 == 0;
        const thread_id job =
            spawn_thread(polls ? poll_until_told : return_at_once, "job", B_LOW_PRIORITY, nullptr);
        ASSERT_GT(job, 0);
        ASSERT_EQ(resume_thread(job), B_OK);
        if (random() % 3 == 0)
            snooze(static_cast<bigtime_t>(random() % 300));
        const status_t sent = send_data(job, 712, nullptr, 0);
        ASSERT_TRUE(sent == B_OK || (!polls && sent == B_BAD_THREAD_ID)) << sent;
        status_t status = 0;
        ASSERT_EQ(wait_for_thread(job, &status), B_OK);
        ASSERT_EQ(status, 9);
        ASSERT_EQ(wait_for_thread(job, &status), B_BAD_THREAD_ID);
        ASSERT_EQ(send_data(job, 712, nullptr, 0), B_BAD_THREAD_ID);
    }
}

TEST(ThreadRacesTest, EveryWaitingThreadSeesTheEndOrThatItIsOver) {
    for (int round = 0; round < 60; round++) {
        const thread_id thread = spawn_thread(return_at_once, "short", B_NORMAL_PRIORITY, nullptr);
        std::atomic<int> seen{0};
        std::atomic<int> late{0};
        std::vector<std::thread> waiting;
        for (int number = 0; number < 4; number++) {
            waiting.emplace_back([&] {
                status_t status = 0;
                const status_t answer = wait_for_thread(thread, &status);
                if (answer == B_OK && status == 9)
                    seen++;
                else if (answer == B_BAD_THREAD_ID)
                    late++;
            });
        }
        for (std::thread& waiter : waiting)
            waiter.join();
        EXPECT_GE(seen, 1);
        EXPECT_EQ(seen + late, 4);
    }
}

TEST(ThreadRacesTest, SendersRacingAThreadsEndAllComeBack) {
    for (int round = 0; round < 60; round++) {
        const auto receive_three = [](void*) -> int32 {
            int32 sum = 0;
            for (int number = 0; number < 3; number++)
                sum += receive_data(nullptr, nullptr, 0);
            return sum;
        };
        const thread_id thread = spawn_thread(receive_three, "three", B_NORMAL_PRIORITY, nullptr);
        resume_thread(thread);
        std::atomic<int> delivered{0};
        std::atomic<int> refused{0};
        std::vector<std::thread> senders;
        for (int number = 0; number < 6; number++) {
            senders.emplace_back([&] {
                const status_t answer = send_data(thread, 1, "bytes", 5);
                if (answer == B_OK)
                    delivered++;
                else if (answer == B_BAD_THREAD_ID)
                    refused++;
            });
        }
        for (std::thread& sender : senders)
            sender.join();
        status_t status = 0;
        EXPECT_EQ(wait_for_thread(thread, &status), B_OK);
        EXPECT_EQ(status, 3);
        // The slot may take one message more that nobody reads.
        EXPECT_GE(delivered, 3);
        EXPECT_LE(delivered, 4);
        EXPECT_EQ(delivered + refused, 6);
    }
}

TEST(ThreadRacesTest, TheTableHoldsWhileThreadsComeAndGo) {
    std::atomic<bool> end{false};
    std::thread observer([&end] {
        while (!end) {
            int32 cookie = 0;
            thread_info info;
            while (get_next_thread_info(0, &cookie, &info) == B_OK) {
                set_thread_priority(info.thread, B_NORMAL_PRIORITY);
                has_data(info.thread);
            }
            static_cast<void>(find_thread("no such thread"));
        }
    });
    std::vector<std::thread> makers;
    for (int maker = 0; maker < 3; maker++) {
        makers.emplace_back([maker] {
            for (int round = 0; round < 60; round++) {
                const thread_id thread = spawn_thread(return_at_once, "mayfly", B_NORMAL_PRIORITY, nullptr);
                rename_thread(thread, "renamed");
                if (maker == 0 && round % 2 == 0)
                    EXPECT_EQ(kill_thread(thread), B_OK);
                else if (maker == 1)
                    EXPECT_EQ(resume_thread(thread), B_OK);
                else
                    EXPECT_EQ(wait_for_thread(thread, nullptr), B_OK);
            }
        });
    }
    for (std::thread& maker : makers)
        maker.join();
    end = true;
    observer.join();
}

TEST(ThreadRacesTest, PortsLoseAndInventNothing) {
    const port_id port = create_port(3, "busy");
    std::atomic<int64> sum{0};
    std::vector<std::thread> threads;
    for (int writer = 0; writer < 3; writer++) {
        threads.emplace_back([port] {
            for (int32 number = 1; number <= 300; number++)
                EXPECT_EQ(write_port(port, number, &number, sizeof(number)), B_OK);
        });
    }
    for (int reader = 0; reader < 2; reader++) {
        threads.emplace_back([port, &sum] {
            for (int number = 0; number < 450; number++) {
                int32 code = 0;
                int32 value = 0;
                EXPECT_EQ(read_port(port, &code, &value, sizeof(value)), 4);
                EXPECT_EQ(code, value);
                sum += value;
            }
        });
    }
    for (std::thread& thread : threads)
        thread.join();
    EXPECT_EQ(sum, 135450);
    EXPECT_EQ(port_count(port), 0);
    delete_port(port);
}

TEST(ThreadRacesTest, ASemaphoreGuardsLikeALock) {
    const sem_id sem = create_sem(1, "guard");
    int counter = 0;
    std::vector<std::thread> threads;
    for (int thread = 0; thread < 4; thread++) {
        threads.emplace_back([sem, &counter] {
            for (int round = 0; round < 500; round++) {
                while (acquire_sem_etc(sem, 1, B_RELATIVE_TIMEOUT, 100) != B_OK) {
                }
                counter++;
                release_sem(sem);
            }
        });
    }
    for (std::thread& thread : threads)
        thread.join();
    EXPECT_EQ(counter, 2000);
    delete_sem(sem);
}
