// Loopers that go away under the eyes of many threads.
#include "SeenMessages.h"

#include <Messenger.h>

#include <atomic>
#include <gtest/gtest.h>
#include <thread>
#include <vector>

TEST(LooperRaceTest, ManyThreadsMayUseALooperThatQuits) {
    constexpr int kRounds = 1000;
    constexpr int kThreads = 3;
    for (int round = 0; round < kRounds; round++) {
        Seen seen;
        BLooper* looper = new CountingLooper(seen);
        const BMessenger messenger(looper);
        looper->Run();
        std::atomic<int> accepted{0};
        std::vector<std::thread> threads;
        for (int index = 0; index < kThreads; index++) {
            threads.emplace_back([&, index] {
                for (;;) {
                    const status_t status = index == 0 ? Post(looper, 'work') : messenger.SendMessage('work');
                    if (status != B_OK) {
                        EXPECT_EQ(status, B_BAD_PORT_ID);
                        break;
                    }
                    accepted++;
                    if (index == 2) {
                        BMessage reply;
                        const status_t sent = messenger.SendMessage('echo', &reply);
                        EXPECT_TRUE(sent == B_OK || sent == B_BAD_PORT_ID);
                        if (messenger.LockTarget())
                            Unlock(looper);
                    }
                }
                EXPECT_FALSE(messenger.IsValid());
                EXPECT_FALSE(Locks(looper));
            });
        }
        while (accepted < 3)
            std::this_thread::yield();
        // Every other round the looper ends itself.
        if (round % 2 == 0) {
            ASSERT_TRUE(looper->Lock());
            looper->Quit();
        } else {
            Post(looper, 'quit');
        }
        for (std::thread& thread : threads)
            thread.join();
        ASSERT_EQ(seen.destroyed, 1);
    }
}

// Handlers come and go in a looper that runs, while messages are on their way to them.
TEST(LooperRaceTest, HandlersMayLeaveWhileMessagesAreOnTheirWay) {
    constexpr int kRounds = 300;
    Seen looperSeen;
    BLooper* looper = new CountingLooper(looperSeen);
    looper->Run();
    for (int round = 0; round < kRounds; round++) {
        Seen seen;
        auto handler = std::make_unique<CountingHandler>(seen);
        ASSERT_TRUE(looper->Lock());
        looper->AddHandler(handler.get());
        const BMessenger messenger(handler.get());
        looper->Unlock();
        std::atomic<int> sent{0};
        std::thread sender([&] {
            while (messenger.SendMessage('work') == B_OK)
                sent++;
        });
        while (sent < 5)
            std::this_thread::yield();
        ASSERT_TRUE(looper->Lock());
        handler.reset();
        const int atTheEnd = seen.messages;
        looper->Unlock();
        sender.join();
        EXPECT_FALSE(messenger.IsValid());
        EXPECT_FALSE(messenger.LockTarget());
        EXPECT_EQ(seen.messages, atTheEnd);
        EXPECT_EQ(looperSeen.messages, 0);
    }
    QuitLooper(looper);
}
