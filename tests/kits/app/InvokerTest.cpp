// Invokers: what they send, to whom, and as which kind.
#include "SeenMessages.h"

#include <Invoker.h>
#include <MessageQueue.h>

#include <gtest/gtest.h>
#include <thread>

namespace {

// Tells what InvokeKind() answers during an invocation.
class TellingInvoker : public BInvoker {
  public:
    using BInvoker::BInvoker;
    status_t Invoke(BMessage* message) override {
        mKind = InvokeKind(&mNotified);
        return BInvoker::Invoke(message);
    }
    uint32 KindNow(bool* notified) { return InvokeKind(notified); }

    uint32 mKind = 0;
    bool mNotified = false;
};

class InvokerTest : public testing::Test {
  protected:
    void SetUp() override {
        mLooper = new CountingLooper(mSeen);
        mLooper->AddHandler(&mHandler);
    }
    void TearDown() override { mLooper->Quit(); }

    const BMessage& Queued(int32 index) { return *mLooper->MessageQueue()->FindMessage(index); }
    int32 CountQueued() { return mLooper->MessageQueue()->CountMessages(); }

    Seen mSeen;
    BHandler mHandler;
    BLooper* mLooper = nullptr;
};

} // namespace

TEST_F(InvokerTest, ANewInvokerHasNothingToSendAndNobodyToSendItTo) {
    BInvoker invoker;
    EXPECT_EQ(invoker.Message(), nullptr);
    EXPECT_EQ(invoker.Command(), 0U);
    EXPECT_FALSE(invoker.Messenger().IsValid());
    EXPECT_EQ(invoker.HandlerForReply(), nullptr);
    EXPECT_EQ(invoker.Timeout(), B_INFINITE_TIMEOUT);
    EXPECT_EQ(invoker.Invoke(), B_BAD_VALUE);
    BMessage message('lost');
    EXPECT_EQ(invoker.Invoke(&message), B_BAD_PORT_ID);
}

TEST_F(InvokerTest, AnInvocationSendsACopyOfTheKeptMessageWithTheTime) {
    auto* message = new BMessage('invk');
    message->AddInt32("value", 5);
    BInvoker invoker(message, &mHandler);
    EXPECT_EQ(invoker.Command(), uint32{'invk'});
    BLooper* looper = nullptr;
    EXPECT_EQ(invoker.Target(&looper), &mHandler);
    EXPECT_EQ(looper, mLooper);
    EXPECT_TRUE(invoker.IsTargetLocal());
    const bigtime_t before = system_time();
    ASSERT_EQ(invoker.Invoke(), B_OK);
    ASSERT_EQ(invoker.Invoke(), B_OK);
    const bigtime_t after = system_time();
    ASSERT_EQ(CountQueued(), 2);
    EXPECT_EQ(Queued(0).what, uint32{'invk'});
    EXPECT_EQ(Queued(0).GetInt32("value", 0), 5);
    EXPECT_GE(Queued(0).GetInt64("when", 0), before);
    EXPECT_LE(Queued(1).GetInt64("when", 0), after);
    EXPECT_FALSE(message->HasInt64("when"));
}

TEST_F(InvokerTest, AnotherMessageMayBeSentInPlaceOfTheKeptOne) {
    BInvoker invoker(new BMessage('kept'), BMessenger(&mHandler));
    BMessage other('othr');
    other.AddInt64("when", 1);
    ASSERT_EQ(invoker.Invoke(&other), B_OK);
    ASSERT_EQ(CountQueued(), 1);
    EXPECT_EQ(Queued(0).what, uint32{'othr'});
    EXPECT_NE(Queued(0).GetInt64("when", 1), 1);
    EXPECT_EQ(invoker.Command(), uint32{'kept'});
}

TEST_F(InvokerTest, AMessageAndATargetCanBeSetAndTakenAway) {
    BInvoker invoker;
    invoker.SetMessage(new BMessage('frst'));
    auto* second = new BMessage('scnd');
    invoker.SetMessage(second);
    EXPECT_EQ(invoker.SetMessage(second), B_OK);
    EXPECT_EQ(invoker.Message(), second);
    EXPECT_EQ(invoker.SetTarget(nullptr, mLooper), B_OK);
    EXPECT_EQ(invoker.Target(), nullptr);
    EXPECT_TRUE(invoker.Messenger() == BMessenger(nullptr, mLooper));
    BHandler stranger;
    EXPECT_EQ(invoker.SetTarget(&stranger), B_BAD_HANDLER);
    EXPECT_FALSE(invoker.Messenger().IsValid());
    EXPECT_EQ(invoker.SetTarget(BMessenger(&mHandler)), B_OK);
    EXPECT_EQ(invoker.Target(), &mHandler);
    invoker.SetMessage(nullptr);
    EXPECT_EQ(invoker.Invoke(), B_BAD_VALUE);
}

TEST_F(InvokerTest, NoticesSayTheirKind) {
    TellingInvoker invoker(new BMessage('kind'), &mHandler);
    ASSERT_EQ(invoker.InvokeNotify(nullptr, B_CONTROL_MODIFIED), B_OK);
    EXPECT_EQ(invoker.mKind, uint32{B_CONTROL_MODIFIED});
    EXPECT_TRUE(invoker.mNotified);
    ASSERT_EQ(invoker.InvokeNotify(nullptr), B_OK);
    EXPECT_EQ(invoker.mKind, uint32{B_CONTROL_INVOKED});
    EXPECT_TRUE(invoker.mNotified);
    ASSERT_EQ(invoker.Invoke(nullptr), B_OK);
    EXPECT_FALSE(invoker.mNotified);
    bool notified = true;
    EXPECT_EQ(invoker.KindNow(&notified), uint32{B_CONTROL_INVOKED});
    EXPECT_FALSE(notified);
    ASSERT_EQ(CountQueued(), 3);
    EXPECT_EQ(Queued(0).GetUInt32("be:kind", 0), uint32{B_CONTROL_MODIFIED});
    EXPECT_FALSE(Queued(1).HasUInt32("be:kind"));
    EXPECT_FALSE(Queued(2).HasUInt32("be:kind"));
}

TEST_F(InvokerTest, RepliesGoToTheHandlerForReplies) {
    BInvoker invoker(new BMessage('call'), &mHandler);
    invoker.SetHandlerForReply(mLooper);
    EXPECT_EQ(invoker.HandlerForReply(), mLooper);
    ASSERT_EQ(invoker.Invoke(), B_OK);
    EXPECT_TRUE(Queued(0).ReturnAddress() == BMessenger(mLooper));
}

TEST(InvokerTimeoutTest, AnInvocationWaitsForAFullQueueAsLongAsItIsTold) {
    Seen seen;
    BLooper* looper = new CountingLooper(seen, 1);
    BInvoker invoker(new BMessage('full'), looper);
    ASSERT_EQ(invoker.SetTimeout(0), B_OK);
    EXPECT_EQ(invoker.Timeout(), 0);
    std::thread([&] {
        EXPECT_EQ(invoker.Invoke(), B_OK);
        EXPECT_EQ(invoker.Invoke(), B_WOULD_BLOCK);
        invoker.SetTimeout(5000);
        EXPECT_EQ(invoker.Invoke(), B_TIMED_OUT);
    }).join();
    looper->Quit();
}
