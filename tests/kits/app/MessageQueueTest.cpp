#include <MessageQueue.h>

#include <gtest/gtest.h>
#include <memory>
#include <thread>

namespace {

int sLiving = 0;

class CountedMessage : public BMessage {
  public:
    explicit CountedMessage(uint32 code) : BMessage(code) { sLiving++; }
    ~CountedMessage() override { sLiving--; }
};

} // namespace

TEST(MessageQueueTest, TheFirstMessageInIsTheFirstOut) {
    BMessageQueue queue;
    EXPECT_TRUE(queue.IsEmpty());
    EXPECT_EQ(queue.NextMessage(), nullptr);
    for (uint32 code = 1; code <= 3; code++)
        queue.AddMessage(new BMessage(code));
    EXPECT_EQ(queue.CountMessages(), 3);
    for (uint32 code = 1; code <= 3; code++) {
        const std::unique_ptr<BMessage> message(queue.NextMessage());
        ASSERT_NE(message, nullptr);
        EXPECT_EQ(message->what, code);
    }
    EXPECT_TRUE(queue.IsEmpty());
}

TEST(MessageQueueTest, MessagesAreFoundByPlaceAndByCode) {
    BMessageQueue queue;
    for (const uint32 code : {7U, 8U, 7U})
        queue.AddMessage(new BMessage(code));
    BMessage* const first = queue.FindMessage(int32{0});
    BMessage* const last = queue.FindMessage(int32{2});
    EXPECT_EQ(queue.FindMessage(int32{3}), nullptr);
    EXPECT_EQ(queue.FindMessage(int32{-1}), nullptr);
    EXPECT_EQ(queue.FindMessage(uint32{7}, 0), first);
    EXPECT_EQ(queue.FindMessage(uint32{7}, 1), last);
    EXPECT_EQ(queue.FindMessage(uint32{7}, 2), nullptr);
    EXPECT_EQ(queue.FindMessage(uint32{9}, 0), nullptr);
    EXPECT_TRUE(queue.IsNextMessage(first));
    EXPECT_FALSE(queue.IsNextMessage(last));
}

TEST(MessageQueueTest, ARemovedMessageIsTheCallersAndTheOthersGoWithTheQueue) {
    {
        BMessageQueue queue;
        auto* const kept = new CountedMessage(1);
        queue.AddMessage(kept);
        queue.AddMessage(new CountedMessage(2));
        queue.RemoveMessage(kept);
        EXPECT_EQ(sLiving, 2);
        EXPECT_EQ(queue.CountMessages(), 1);
        queue.RemoveMessage(kept);
        EXPECT_EQ(queue.CountMessages(), 1);
        delete kept;
        EXPECT_EQ(sLiving, 1);
    }
    EXPECT_EQ(sLiving, 0);
}

TEST(MessageQueueTest, TwoThreadsPassMessagesInOrder) {
    BMessageQueue queue;
    constexpr uint32 kCount = 20000;
    std::thread sender([&queue] {
        for (uint32 code = 0; code < kCount; code++)
            queue.AddMessage(new BMessage(code));
    });
    for (uint32 code = 0; code < kCount;) {
        const std::unique_ptr<BMessage> message(queue.NextMessage());
        if (message == nullptr) {
            std::this_thread::yield();
            continue;
        }
        ASSERT_EQ(message->what, code);
        code++;
    }
    sender.join();
    EXPECT_TRUE(queue.IsEmpty());
}
