#include <OS.h>

#include <atomic>
#include <cstring>
#include <gtest/gtest.h>
#include <string>
#include <thread>

namespace {

// Receives once, and answers the code.
int32 receive_one(void* data) {
    char text[16] = {};
    thread_id sender = 0;
    const int32 code = receive_data(&sender, text, sizeof(text));
    if (data != nullptr)
        *static_cast<std::string*>(data) = std::string(text) + (sender > 0 ? "!" : "?");
    return code;
}

// The shape of a job: works until a message waits, and never reads it.
int32 poll_until_told(void* data) {
    auto* rounds = static_cast<std::atomic<int>*>(data);
    const thread_id self = find_thread(nullptr);
    while (!has_data(self))
        rounds->fetch_add(1);
    return 0;
}

} // namespace

TEST(ThreadDataTest, AMessageCarriesCodeBytesAndSender) {
    std::string text;
    const thread_id thread = spawn_thread(receive_one, "receiver", B_NORMAL_PRIORITY, &text);
    EXPECT_EQ(has_data(thread), 0);
    EXPECT_EQ(send_data(thread, 712, "hello", 6), B_OK);
    EXPECT_EQ(has_data(thread), 1);
    status_t code = 0;
    EXPECT_EQ(wait_for_thread(thread, &code), B_OK);
    EXPECT_EQ(code, 712);
    EXPECT_EQ(text, "hello!");
}

TEST(ThreadDataTest, OnlyAsMuchAsAskedForIsCopied) {
    const thread_id self = find_thread(nullptr);
    EXPECT_EQ(send_data(self, 1, "abcdef", 6), B_OK);
    char text[4] = {'x', 'x', 'x', 'x'};
    thread_id sender = 0;
    EXPECT_EQ(receive_data(&sender, text, 3), 1);
    EXPECT_EQ(std::memcmp(text, "abcx", 4), 0);
    EXPECT_EQ(sender, self);
    EXPECT_EQ(has_data(self), 0);
    EXPECT_EQ(send_data(self, -2, "abc", 3), B_OK);
    EXPECT_EQ(receive_data(nullptr, nullptr, 0), -2);
}

TEST(ThreadDataTest, ASenderWaitsWhileTheSlotIsFull) {
    const auto twice = [](void*) -> int32 {
        snooze(5000);
        const int32 first = receive_data(nullptr, nullptr, 0);
        return first * 10 + receive_data(nullptr, nullptr, 0);
    };
    const thread_id thread = spawn_thread(twice, "two messages", B_NORMAL_PRIORITY, nullptr);
    resume_thread(thread);
    EXPECT_EQ(send_data(thread, 1, nullptr, 0), B_OK);
    EXPECT_EQ(send_data(thread, 2, nullptr, 0), B_OK);
    status_t status = 0;
    EXPECT_EQ(wait_for_thread(thread, &status), B_OK);
    EXPECT_EQ(status, 12);
}

TEST(ThreadDataTest, AWaitingSenderWakesWhenTheReceiverEnds) {
    std::atomic<bool> end{false};
    const auto body = [](void* data) -> int32 {
        while (!static_cast<std::atomic<bool>*>(data)->load())
            snooze(200);
        return 0;
    };
    const thread_id thread = spawn_thread(body, "deaf", B_NORMAL_PRIORITY, &end);
    resume_thread(thread);
    EXPECT_EQ(send_data(thread, 1, nullptr, 0), B_OK);
    status_t second = B_OK;
    std::thread sender([&second, thread] { second = send_data(thread, 2, "lost", 4); });
    snooze(10000);
    end = true;
    sender.join();
    EXPECT_EQ(second, B_BAD_THREAD_ID);
    wait_for_thread(thread, nullptr);
}

TEST(ThreadDataTest, AThreadThatWasKilledUnstartedWakesItsSenders) {
    const thread_id thread = spawn_thread(receive_one, "never", B_NORMAL_PRIORITY, nullptr);
    EXPECT_EQ(send_data(thread, 1, nullptr, 0), B_OK);
    status_t second = B_OK;
    std::thread sender([&second, thread] { second = send_data(thread, 2, nullptr, 0); });
    snooze(3000);
    EXPECT_EQ(kill_thread(thread), B_OK);
    sender.join();
    EXPECT_EQ(second, B_BAD_THREAD_ID);
}

TEST(ThreadDataTest, NobodyElseCouldEmptyTheSendersOwnSlot) {
    const thread_id self = find_thread(nullptr);
    EXPECT_EQ(send_data(self, 1, nullptr, 0), B_OK);
    EXPECT_EQ(send_data(self, 2, nullptr, 0), B_WOULD_BLOCK);
    EXPECT_EQ(receive_data(nullptr, nullptr, 0), 1);
}

TEST(ThreadDataTest, AMessageStopsAThreadThatPolls) {
    std::atomic<int> rounds{0};
    const thread_id thread = spawn_thread(poll_until_told, "polling", B_LOW_PRIORITY, &rounds);
    resume_thread(thread);
    while (rounds < 100)
        snooze(100);
    EXPECT_EQ(send_data(thread, 712, nullptr, 0), B_OK);
    EXPECT_EQ(wait_for_thread(thread, nullptr), B_OK);
    EXPECT_GE(rounds, 100);
    EXPECT_EQ(send_data(thread, 712, nullptr, 0), B_BAD_THREAD_ID);
}

TEST(ThreadDataTest, AReceivingThreadIsShownSo) {
    const thread_id thread = spawn_thread(receive_one, "shown", B_NORMAL_PRIORITY, nullptr);
    resume_thread(thread);
    thread_info info;
    do {
        snooze(200);
        ASSERT_EQ(get_thread_info(thread, &info), B_OK);
    } while (info.state != B_THREAD_RECEIVING);
    EXPECT_EQ(send_data(thread, 5, nullptr, 0), B_OK);
    status_t status = 0;
    EXPECT_EQ(wait_for_thread(thread, &status), B_OK);
    EXPECT_EQ(status, 5);
}

TEST(ThreadDataTest, RefusesWhatMakesNoSense) {
    EXPECT_EQ(send_data(find_thread(nullptr), 1, nullptr, 4), B_BAD_VALUE);
    EXPECT_EQ(send_data(find_thread(nullptr), 1, "", SIZE_MAX), B_NO_MEMORY);
    EXPECT_EQ(send_data(0, 1, nullptr, 0), B_BAD_THREAD_ID);
    EXPECT_EQ(send_data(INT32_MAX, 1, nullptr, 0), B_BAD_THREAD_ID);
    EXPECT_EQ(has_data(0), B_BAD_THREAD_ID);
    EXPECT_EQ(has_data(-1), B_BAD_THREAD_ID);
    EXPECT_EQ(has_data(INT32_MAX), B_BAD_THREAD_ID);
    EXPECT_EQ(has_data(find_thread(nullptr)), 0);
}
