// Message runners: how many copies they send, how often, and when they end.
#include "SeenMessages.h"

#include <MessageQueue.h>
#include <MessageRunner.h>

#include <functional>
#include <gtest/gtest.h>
#include <memory>

namespace {

constexpr bigtime_t kHour = bigtime_t{3600} * 1000000;

// Waits for something that must happen, however slow the machine is.
bool HappensAtLast(const std::function<bool()>& condition) {
    for (int tries = 0; tries < 60000; tries++) {
        if (condition())
            return true;
        snooze(1000);
    }
    return false;
}

bool HasEnded(const BMessageRunner& runner) {
    return runner.GetInfo(nullptr, nullptr) == B_BAD_VALUE;
}

class MessageRunnerTest : public testing::Test {
  protected:
    void SetUp() override {
        mLooper = new CountingLooper(mSeen);
        mTarget = BMessenger(mLooper);
        mLooper->Run();
    }
    void TearDown() override {
        if (mTarget.LockTarget())
            mLooper->Quit();
    }

    Seen mSeen;
    BLooper* mLooper = nullptr;
    BMessenger mTarget;
    const BMessage mTick = BMessage('tick');
};

} // namespace

TEST_F(MessageRunnerTest, ExactlyAsManyCopiesAreSentAsWereAskedFor) {
    const bigtime_t before = system_time();
    BMessageRunner runner(mTarget, &mTick, 5000, 3);
    EXPECT_EQ(runner.InitCheck(), B_OK);
    ASSERT_TRUE(HappensAtLast([&] { return HasEnded(runner); }));
    EXPECT_GE(system_time() - before, 15000);
    QuitLooper(mLooper);
    EXPECT_EQ(mSeen.messages, 3);
    EXPECT_EQ(mSeen.last, uint32{'tick'});
    EXPECT_EQ(runner.SetCount(1), B_BAD_VALUE);
    EXPECT_EQ(runner.SetInterval(1000), B_BAD_VALUE);
}

TEST_F(MessageRunnerTest, ARunnerWithoutALimitGoesOnUntilItIsDestroyed) {
    auto runner = std::make_unique<BMessageRunner>(mTarget, &mTick, 1000);
    ASSERT_TRUE(HappensAtLast([&] { return mSeen.messages >= 10; }));
    bigtime_t interval = 0;
    int32 count = 0;
    ASSERT_EQ(runner->GetInfo(&interval, &count), B_OK);
    EXPECT_EQ(interval, 1000);
    EXPECT_LT(count, 0);
    runner.reset();
    // A round trip through the queue: what has been sent before is handled then.
    BMessage reply;
    ASSERT_EQ(mTarget.SendMessage('echo', &reply), B_OK);
    const int atTheEnd = mSeen.messages;
    snooze(20000);
    EXPECT_EQ(mSeen.messages, atTheEnd);
}

TEST_F(MessageRunnerTest, ANewIntervalTakesEffectAtOnce) {
    BMessageRunner runner(mTarget, &mTick, kHour, 2);
    EXPECT_EQ(runner.SetInterval(0), B_BAD_VALUE);
    EXPECT_EQ(runner.SetInterval(1000), B_OK);
    ASSERT_TRUE(HappensAtLast([&] { return HasEnded(runner); }));
    QuitLooper(mLooper);
    EXPECT_EQ(mSeen.messages, 2);
}

TEST_F(MessageRunnerTest, ANewCountReplacesTheOneThatIsLeft) {
    BMessageRunner runner(mTarget, &mTick, kHour);
    EXPECT_EQ(runner.SetCount(0), B_BAD_VALUE);
    EXPECT_EQ(runner.SetCount(4), B_OK);
    int32 count = 0;
    ASSERT_EQ(runner.GetInfo(nullptr, &count), B_OK);
    EXPECT_EQ(count, 4);
    ASSERT_EQ(runner.SetInterval(1000), B_OK);
    ASSERT_TRUE(HappensAtLast([&] { return HasEnded(runner); }));
    QuitLooper(mLooper);
    EXPECT_EQ(mSeen.messages, 4);
}

TEST_F(MessageRunnerTest, ARunnerEndsWithItsTarget) {
    BMessageRunner runner(mTarget, &mTick, 1000);
    ASSERT_TRUE(HappensAtLast([&] { return mSeen.messages >= 1; }));
    QuitLooper(mLooper);
    EXPECT_TRUE(HappensAtLast([&] { return HasEnded(runner); }));
}

TEST_F(MessageRunnerTest, WhatCannotBeSentIsRefused) {
    EXPECT_EQ(BMessageRunner(mTarget, nullptr, 1000).InitCheck(), B_BAD_VALUE);
    EXPECT_EQ(BMessageRunner(mTarget, &mTick, 0).InitCheck(), B_BAD_VALUE);
    EXPECT_EQ(BMessageRunner(BMessenger(), &mTick, 1000).InitCheck(), B_BAD_VALUE);
    BMessageRunner nothing(mTarget, &mTick, 1000, 0);
    EXPECT_EQ(nothing.InitCheck(), B_OK);
    EXPECT_TRUE(HasEnded(nothing));
    EXPECT_EQ(BMessageRunner::StartSending(mTarget, nullptr, 1000, 1), B_BAD_VALUE);
}

TEST_F(MessageRunnerTest, StartSendingNeedsNoObject) {
    ASSERT_EQ(BMessageRunner::StartSending(mTarget, &mTick, 1000, 3), B_OK);
    EXPECT_TRUE(HappensAtLast([&] { return mSeen.messages == 3; }));
}

TEST_F(MessageRunnerTest, ManyRunnersKeepTheirOwnCounts) {
    std::vector<std::unique_ptr<BMessageRunner>> runners;
    for (int32 count = 1; count <= 20; count++)
        runners.push_back(std::make_unique<BMessageRunner>(mTarget, &mTick, 1000 + count, count));
    for (const auto& runner : runners)
        ASSERT_TRUE(HappensAtLast([&] { return HasEnded(*runner); }));
    QuitLooper(mLooper);
    EXPECT_EQ(mSeen.messages, 210);
}

TEST(MessageRunnerQueueTest, AFullQueueMissesItsTurnsAndNobodyWaits) {
    Seen seen;
    BLooper* looper = new CountingLooper(seen, 2);
    const BMessage tick('tick');
    BMessageRunner runner(BMessenger(looper), &tick, 1000, 10);
    ASSERT_TRUE(HappensAtLast([&] { return HasEnded(runner); }));
    EXPECT_EQ(looper->MessageQueue()->CountMessages(), 2);
    looper->Quit();
}

TEST(MessageRunnerQueueTest, RepliesGoWhereTheRunnerSays) {
    Seen seen;
    BLooper* looper = new CountingLooper(seen);
    BHandler home;
    looper->AddHandler(&home);
    const BMessage tick('tick');
    BMessageRunner runner(BMessenger(looper), &tick, 1000, 1, BMessenger(&home));
    ASSERT_TRUE(HappensAtLast([&] { return HasEnded(runner); }));
    const BMessage* sent = looper->MessageQueue()->FindMessage(int32{0});
    ASSERT_NE(sent, nullptr);
    EXPECT_TRUE(sent->ReturnAddress() == BMessenger(&home));
    looper->Quit();
}
