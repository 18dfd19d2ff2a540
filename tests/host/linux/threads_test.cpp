#include "host/api/threads.h"

#include <csignal>
#include <gtest/gtest.h>
#include <sys/resource.h>
#include <sys/syscall.h>
#include <thread>
#include <unistd.h>

namespace {

int io_priority_class(host::native_thread thread) {
    const long priority = syscall(SYS_ioprio_get, 1, thread);
    return static_cast<int>(priority >> 13);
}

template <typename Function>
void in_a_thread(Function function) {
    std::thread(function).join();
}

} // namespace

TEST(threads_test, numbers_are_those_of_the_system) {
    EXPECT_EQ(host::current_process(), getpid());
    EXPECT_EQ(host::current_native_thread(), getpid());
    in_a_thread([] {
        EXPECT_EQ(host::current_native_thread(), static_cast<host::native_thread>(syscall(SYS_gettid)));
        EXPECT_NE(host::current_native_thread(), getpid());
    });
}

TEST(threads_test, names_are_cut_to_what_the_system_takes) {
    in_a_thread([] {
        const host::native_thread self = host::current_native_thread();
        EXPECT_TRUE(host::set_thread_name(self, "a name of more than fifteen bytes"));
        EXPECT_EQ(host::thread_name(self), "a name of more ");
        EXPECT_TRUE(host::set_thread_name(self, "short %s"));
        EXPECT_EQ(host::thread_name(self), "short %s");
    });
}

TEST(threads_test, a_schedule_holds_for_one_thread_alone) {
    const int own = getpriority(PRIO_PROCESS, 0);
    EXPECT_EQ(host::process_niceness(), own);
    if (own > 12)
        GTEST_SKIP() << "this process runs at niceness " << own << " itself";
    in_a_thread([] {
        const host::native_thread self = host::current_native_thread();
        EXPECT_TRUE(host::set_thread_schedule(self, {.niceness = 13, .io = host::io_class::idle}));
        EXPECT_EQ(getpriority(PRIO_PROCESS, static_cast<id_t>(self)), 13);
        EXPECT_EQ(io_priority_class(self), 3);
    });
    EXPECT_EQ(getpriority(PRIO_PROCESS, 0), own);
    EXPECT_NE(io_priority_class(host::current_native_thread()), 3);
}

TEST(threads_test, an_ended_thread_is_refused) {
    host::native_thread ended = 0;
    in_a_thread([&ended] { ended = host::current_native_thread(); });
    // The system removes a joined thread a moment later.
    for (int attempt = 0; attempt < 10000 && !host::thread_name(ended).empty(); attempt++)
        std::this_thread::sleep_for(std::chrono::milliseconds(1));
    EXPECT_FALSE(host::set_thread_name(ended, "x"));
    EXPECT_EQ(host::thread_name(ended), "");
    EXPECT_FALSE(host::set_thread_schedule(ended, {}));
    EXPECT_EQ(host::processor_times(ended).user, 0);
}

TEST(threads_test, processor_time_grows_with_work) {
    const host::native_thread self = host::current_native_thread();
    // A name with spaces and parentheses must not shift the numbers.
    const std::string name = host::thread_name(self);
    host::set_thread_name(self, "a) b (c 9 9");
    volatile unsigned sum = 0;
    host::thread_times times;
    for (int round = 0; round < 1000 && times.user + times.kernel < 30'000; round++) {
        for (unsigned number = 0; number < 1'000'000; number++)
            sum = sum + number;
        times = host::processor_times(self);
    }
    host::set_thread_name(self, name.c_str());
    EXPECT_GE(times.user + times.kernel, 30'000);
    EXPECT_LT(times.user + times.kernel, 600'000'000);
}

TEST(threads_test, sleeping_goes_on_after_a_signal) {
    struct sigaction ignore {};
    ignore.sa_handler = [](int) {};
    sigaction(SIGUSR1, &ignore, nullptr);
    const pthread_t sleeper = pthread_self();
    std::thread waker([sleeper] {
        for (int count = 0; count < 5; count++) {
            std::this_thread::sleep_for(std::chrono::milliseconds(1));
            pthread_kill(sleeper, SIGUSR1);
        }
    });
    const std::int64_t until = host::uptime_nanoseconds() + 20'000'000;
    host::sleep_until(until);
    EXPECT_GE(host::uptime_nanoseconds(), until);
    waker.join();
}

TEST(threads_test, the_double_click_time_can_be_told) {
    EXPECT_EQ(host::double_click_time(), 500'000);
    host::set_double_click_time(400'000);
    EXPECT_EQ(host::double_click_time(), 400'000);
    host::set_double_click_time(500'000);
}

TEST(threads_test, the_command_line_is_read_whole) {
    int count = 0;
    const std::string line = host::command_line(count);
    EXPECT_GE(count, 1);
    EXPECT_NE(line.find("test_host_threads"), std::string::npos);
}

TEST(threads_test, system_facts_are_plausible) {
    const host::system_facts facts = host::describe_system();
    EXPECT_GE(facts.processors, 1U);
    EXPECT_GT(facts.memory_bytes, facts.free_memory_bytes);
    EXPECT_GT(facts.free_memory_bytes, 0U);
    EXPECT_LT(facts.boot_time, host::wall_clock_microseconds());
    EXPECT_GT(facts.boot_time, 0);
}
