#include "host/api/termination.h"

#include <atomic>
#include <chrono>
#include <csignal>
#include <gtest/gtest.h>
#include <thread>
#include <unistd.h>

namespace {

bool wait_for(const std::atomic<int>& count, int wanted) {
    const auto limit = std::chrono::steady_clock::now() + std::chrono::seconds(20);
    while (count < wanted && std::chrono::steady_clock::now() < limit)
        std::this_thread::sleep_for(std::chrono::milliseconds(1));
    return count == wanted;
}

} // namespace

TEST(termination_test, each_kind_of_request_is_told_once) {
    for (const int signal : {SIGTERM, SIGINT, SIGHUP}) {
        std::atomic<int> asked = 0;
        const auto watch = host::watch_for_termination([&] { ++asked; });
        ASSERT_NE(watch, nullptr);
        ASSERT_EQ(kill(getpid(), signal), 0);
        EXPECT_TRUE(wait_for(asked, 1)) << signal;
    }
}

TEST(termination_test, different_kinds_are_told_apart) {
    std::atomic<int> asked = 0;
    const auto watch = host::watch_for_termination([&] { ++asked; });
    ASSERT_EQ(kill(getpid(), SIGTERM), 0);
    EXPECT_TRUE(wait_for(asked, 1));
    ASSERT_EQ(kill(getpid(), SIGINT), 0);
    EXPECT_TRUE(wait_for(asked, 2));
}

TEST(termination_test, a_second_request_ends_the_process) {
    EXPECT_EXIT(
        {
            std::atomic<int> asked = 0;
            const auto watch = host::watch_for_termination([&] { ++asked; });
            (void)kill(getpid(), SIGTERM);
            (void)wait_for(asked, 1);
            (void)kill(getpid(), SIGTERM);
            std::this_thread::sleep_for(std::chrono::seconds(20));
        },
        testing::KilledBySignal(SIGTERM), "");
}

TEST(termination_test, without_a_watch_a_request_ends_the_process) {
    EXPECT_EXIT(
        {
            {
                const auto watch = host::watch_for_termination([] {});
            }
            (void)kill(getpid(), SIGTERM);
            std::this_thread::sleep_for(std::chrono::seconds(20));
        },
        testing::KilledBySignal(SIGTERM), "");
}

TEST(termination_test, what_was_ignored_stays_ignored) {
    struct sigaction before = {};
    struct sigaction ignore = {};
    ignore.sa_handler = SIG_IGN;
    ASSERT_EQ(sigaction(SIGHUP, &ignore, &before), 0);
    {
        std::atomic<int> asked = 0;
        const auto watch = host::watch_for_termination([&] { ++asked; });
        ASSERT_EQ(kill(getpid(), SIGHUP), 0);
        ASSERT_EQ(kill(getpid(), SIGTERM), 0);
        EXPECT_TRUE(wait_for(asked, 1));
    }
    ASSERT_EQ(sigaction(SIGHUP, &before, nullptr), 0);
}

TEST(termination_test, there_is_one_watch_at_a_time) {
    auto watch = host::watch_for_termination([] {});
    ASSERT_NE(watch, nullptr);
    EXPECT_EQ(host::watch_for_termination([] {}), nullptr);
    watch.reset();
    EXPECT_NE(host::watch_for_termination([] {}), nullptr);
}

TEST(termination_test, watches_come_and_go) {
    for (int i = 0; i < 1000; ++i) {
        std::atomic<int> asked = 0;
        const auto watch = host::watch_for_termination([&] { ++asked; });
        if (i % 2)
            (void)kill(getpid(), SIGTERM);
    }
}
