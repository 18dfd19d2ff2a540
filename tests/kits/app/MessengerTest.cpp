// Messengers: whom they reach, how long they wait, and what they know of a target that goes away.
#include "SeenMessages.h"

#include <MessageQueue.h>
#include <Messenger.h>

#include <gtest/gtest.h>
#include <memory>
#include <thread>

TEST(MessengerTest, BothTimeOutsEndASynchronousSend) {
    Seen seen;
    BLooper* looper = new CountingLooper(seen, 1);
    const BMessenger messenger(looper);
    BMessage request('echo');
    BMessage reply;
    // Not running yet: the first send finds room but no answer, the next one finds the queue full.
    std::thread([&] {
        EXPECT_EQ(messenger.SendMessage(&request, &reply, B_INFINITE_TIMEOUT, 20000), B_TIMED_OUT);
        EXPECT_EQ(messenger.SendMessage(&request, &reply, 20000, B_INFINITE_TIMEOUT), B_TIMED_OUT);
        EXPECT_EQ(messenger.SendMessage(&request, BMessenger(), 0), B_WOULD_BLOCK);
        EXPECT_EQ(looper->PostMessage(&request), B_OK);
    }).join();
    EXPECT_EQ(looper->MessageQueue()->CountMessages(), 2);
    looper->Quit();
}

TEST(MessengerTest, ALooperCannotWaitForItsOwnReply) {
    class Narcissus : public BLooper {
      public:
        explicit Narcissus(std::atomic<status_t>& status) : mStatus(status) {}
        void MessageReceived(BMessage*) override {
            BMessage reply;
            mStatus = BMessenger(this).SendMessage('echo', &reply);
        }

      private:
        std::atomic<status_t>& mStatus;
    };
    std::atomic<status_t> status{B_OK};
    BLooper* looper = new Narcissus(status);
    looper->Run();
    looper->PostMessage('call');
    QuitLooper(looper);
    EXPECT_EQ(status, B_MESSAGE_TO_SELF);
}

TEST(MessengerTest, ATargetIsKnownFromItsHandlerOrItsLooper) {
    Seen seen;
    BHandler handler;
    status_t result = B_OK;
    EXPECT_FALSE(BMessenger(&handler, nullptr, &result).IsValid());
    EXPECT_EQ(result, B_BAD_HANDLER);
    EXPECT_FALSE(BMessenger(nullptr, nullptr, &result).IsValid());
    EXPECT_EQ(result, B_BAD_VALUE);

    BLooper* looper = new CountingLooper(seen);
    BLooper* other = new CountingLooper(seen);
    looper->AddHandler(&handler);
    EXPECT_FALSE(BMessenger(&handler, other, &result).IsValid());
    EXPECT_EQ(result, B_MISMATCHED_VALUES);
    const BMessenger toHandler(&handler, looper, &result);
    EXPECT_EQ(result, B_OK);
    BLooper* found = nullptr;
    EXPECT_EQ(toHandler.Target(&found), &handler);
    EXPECT_EQ(found, looper);
    const BMessenger toPreferred(nullptr, looper);
    EXPECT_TRUE(toPreferred.IsValid());
    EXPECT_EQ(toPreferred.Target(&found), nullptr);
    EXPECT_EQ(found, looper);
    looper->Quit();
    other->Quit();
}

TEST(MessengerTest, AMessengerWithoutATargetReachesNobody) {
    const BMessenger nobody;
    EXPECT_FALSE(nobody.IsValid());
    EXPECT_FALSE(nobody.IsTargetLocal());
    EXPECT_FALSE(nobody.LockTarget());
    EXPECT_EQ(nobody.LockTargetWithTimeout(0), B_BAD_VALUE);
    EXPECT_EQ(nobody.Target(nullptr), nullptr);
    EXPECT_EQ(nobody.SendMessage('work'), B_BAD_PORT_ID);
    BMessage reply;
    EXPECT_EQ(nobody.SendMessage('work', &reply), B_BAD_PORT_ID);
    EXPECT_EQ(nobody.SendMessage(static_cast<BMessage*>(nullptr)), B_BAD_VALUE);
}

TEST(MessengerTest, MessengersToTheSameTargetAreEqual) {
    Seen seen;
    BHandler handler;
    BLooper* looper = new CountingLooper(seen);
    looper->AddHandler(&handler);
    const BMessenger one(&handler);
    const BMessenger same(&handler, looper);
    const BMessenger toLooper(looper);
    const BMessenger toPreferred(nullptr, looper);
    EXPECT_TRUE(one == same);
    EXPECT_EQ(one.HashValue(), same.HashValue());
    EXPECT_FALSE(one < same);
    EXPECT_FALSE(same < one);
    EXPECT_TRUE(one != toLooper);
    EXPECT_TRUE(toLooper != toPreferred);
    EXPECT_TRUE((one < toLooper) != (toLooper < one));
    EXPECT_TRUE(BMessenger() == BMessenger());
    BMessenger copy(one);
    EXPECT_TRUE(copy == one);
    copy = toLooper;
    EXPECT_TRUE(copy == toLooper);

    // A messenger that travelled in a message is the same one.
    BMessage carrier;
    carrier.AddMessenger("m", one);
    BMessenger carried;
    ASSERT_EQ(carrier.FindMessenger("m", &carried), B_OK);
    EXPECT_TRUE(carried == one);
    looper->Quit();
    EXPECT_TRUE(one == same);
    EXPECT_FALSE(one.IsValid());
}

TEST(MessengerTest, AnotherTeamIsNotValid) {
    status_t result = B_OK;
    const team_id parent = 1; // the system's first process is not this one
    const BMessenger other("application/x-vnd.test-elsewhere", parent, &result);
    EXPECT_EQ(result, B_BAD_TEAM_ID);
    EXPECT_FALSE(other.IsValid());
    const BMessenger absent("application/x-vnd.test-elsewhere", -1, &result);
    EXPECT_EQ(result, B_ERROR);
    EXPECT_FALSE(absent.IsValid());
    EXPECT_EQ(BMessenger().SetTo(static_cast<const char*>(nullptr)), B_BAD_VALUE);
}

TEST(MessengerTest, LockTargetHoldsTheLooperAndGivesUpInTime) {
    Seen seen;
    BLooper* looper = new CountingLooper(seen);
    const BMessenger messenger(looper);
    std::thread([&] {
        EXPECT_EQ(messenger.LockTargetWithTimeout(0), B_WOULD_BLOCK);
        EXPECT_EQ(messenger.LockTargetWithTimeout(20000), B_TIMED_OUT);
    }).join();
    looper->Run();
    EXPECT_TRUE(messenger.LockTarget());
    EXPECT_TRUE(looper->IsLocked());
    EXPECT_EQ(messenger.LockTargetWithTimeout(0), B_OK);
    EXPECT_EQ(looper->CountLocks(), 2);
    looper->Quit();
    EXPECT_FALSE(messenger.LockTarget());
    EXPECT_EQ(messenger.LockTargetWithTimeout(1000), B_BAD_VALUE);
}

TEST(MessengerTest, WhoWaitsForATargetThatGoesAwayIsTold) {
    Seen seen;
    BLooper* looper = new CountingLooper(seen);
    auto handler = std::make_unique<CountingHandler>(seen);
    looper->AddHandler(handler.get());
    const BMessenger messenger(handler.get());
    status_t status = B_OK;
    std::thread waiting([&] { status = messenger.LockTargetWithTimeout(B_INFINITE_TIMEOUT); });
    while (looper->CountLockRequests() < 2)
        std::this_thread::yield();
    // The looper stays; only the handler goes.
    handler.reset();
    EXPECT_FALSE(messenger.IsValid());
    looper->Unlock();
    waiting.join();
    EXPECT_EQ(status, B_BAD_VALUE);
    EXPECT_EQ(messenger.SendMessage('work'), B_BAD_PORT_ID);
    ASSERT_TRUE(looper->Lock());
    looper->Quit();
}

TEST(MessengerTest, AMessengerFollowsItsHandlerToAnotherLooper) {
    Seen seen;
    Seen looperSeen;
    CountingHandler handler(seen);
    BLooper* first = new CountingLooper(looperSeen);
    BLooper* second = new CountingLooper(looperSeen);
    first->AddHandler(&handler);
    const BMessenger messenger(&handler);
    first->RemoveHandler(&handler);
    EXPECT_FALSE(messenger.IsValid());
    second->AddHandler(&handler);
    EXPECT_TRUE(messenger.IsValid());
    ASSERT_EQ(messenger.SendMessage('work'), B_OK);
    first->Quit();
    second->Run();
    QuitLooper(second);
    EXPECT_EQ(seen.messages, 1);
}

TEST(MessengerTest, ASendWaitsForRoomInAFullQueue) {
    Seen seen;
    BLooper* looper = new CountingLooper(seen, 2);
    const BMessenger messenger(looper);
    status_t status = B_ERROR;
    std::thread sender([&] {
        for (int count = 0; count < 50; count++) {
            status = messenger.SendMessage('work');
            EXPECT_LE(looper->MessageQueue()->CountMessages(), 2);
        }
    });
    looper->Run();
    sender.join();
    EXPECT_EQ(status, B_OK);
    QuitLooper(looper);
    EXPECT_EQ(seen.messages, 50);
}

TEST(MessengerTest, ASenderWhoWaitsForRoomHearsWhenTheLooperGoesAway) {
    Seen seen;
    BLooper* looper = new CountingLooper(seen, 1);
    const BMessenger messenger(looper);
    ASSERT_EQ(messenger.SendMessage('work'), B_OK);
    std::atomic<bool> begun{false};
    status_t status = B_OK;
    std::thread sender([&] {
        begun = true;
        status = messenger.SendMessage('work');
    });
    while (!begun)
        std::this_thread::yield();
    // Most likely it waits then; if not, it hears the same.
    snooze(20000);
    looper->Quit();
    sender.join();
    EXPECT_EQ(status, B_BAD_PORT_ID);
}

TEST(MessengerTest, ARefusedMessageIsStillTheSenders) {
    Seen seen;
    BLooper* looper = new CountingLooper(seen, 1);
    const BMessenger messenger(looper);
    BMessage message('work');
    message.AddInt32("value", 5);
    ASSERT_EQ(messenger.SendMessage(&message), B_OK);
    EXPECT_EQ(messenger.SendMessage(&message, BMessenger(), 0), B_WOULD_BLOCK);
    EXPECT_EQ(messenger.SendMessage(&message, BMessenger(), 1000), B_TIMED_OUT);
    EXPECT_EQ(message.GetInt32("value", 0), 5);
    EXPECT_FALSE(message.WasDelivered());
    looper->Quit();
}
