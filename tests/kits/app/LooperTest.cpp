// Loopers: their queue, their handlers, their lock and their end.
#include <Autolock.h>
#include <Looper.h>
#include <MessageFilter.h>
#include <MessageQueue.h>
#include <Messenger.h>

#include <atomic>
#include <gtest/gtest.h>
#include <string>
#include <thread>
#include <vector>

namespace {

// What a looper or handler has seen, for the thread of the test.
struct Seen {
    std::atomic<int> messages{0};
    std::atomic<int> destroyed{0};
    std::atomic<thread_id> thread{0};
};

class CountingLooper : public BLooper {
  public:
    explicit CountingLooper(Seen& seen, int32 capacity = B_LOOPER_PORT_DEFAULT_CAPACITY)
        : BLooper("counting", B_NORMAL_PRIORITY, capacity), mSeen(seen) {}
    ~CountingLooper() override { mSeen.destroyed++; }
    void MessageReceived(BMessage* message) override {
        mSeen.thread = find_thread(nullptr);
        mSeen.messages++;
        if (message->what == 'quit') {
            Quit();
            ADD_FAILURE() << "Quit() came back to the looper's own thread";
        }
        if (message->what == 'echo') {
            BMessage reply('echo');
            reply.AddInt32("value", message->GetInt32("value", 0) + 1);
            message->SendReply(&reply);
        }
        if (message->what == 'slow')
            snooze(300000);
        if (message->what == 'none')
            BLooper::MessageReceived(message);
    }

  private:
    Seen& mSeen;
};

class CountingHandler : public BHandler {
  public:
    CountingHandler(Seen& seen, const char* name = "counter") : BHandler(name), mSeen(seen) {}
    void MessageReceived(BMessage*) override {
        mSeen.thread = find_thread(nullptr);
        mSeen.messages++;
    }

  private:
    Seen& mSeen;
};

// Loopers may be asked these when they are gone; the sanitizer would look into them at the call.
#define ASKS_A_LOOPER_THAT_MAY_BE_GONE __attribute__((noinline, no_sanitize("undefined", "address")))
ASKS_A_LOOPER_THAT_MAY_BE_GONE bool Locks(BLooper* looper) {
    return looper->Lock();
}
ASKS_A_LOOPER_THAT_MAY_BE_GONE bool IsLocked(BLooper* looper) {
    return looper->IsLocked();
}
ASKS_A_LOOPER_THAT_MAY_BE_GONE void Unlock(BLooper* looper) {
    looper->Unlock();
}
ASKS_A_LOOPER_THAT_MAY_BE_GONE status_t Post(BLooper* looper, uint32 command) {
    return looper->PostMessage(command);
}

void QuitLooper(BLooper* looper) {
    ASSERT_TRUE(looper->Lock());
    looper->Quit();
}

} // namespace

TEST(LooperTest, ANewLooperIsLockedByItsMaker) {
    Seen seen;
    BLooper* looper = new CountingLooper(seen);
    EXPECT_TRUE(looper->IsLocked());
    EXPECT_EQ(looper->CountLocks(), 1);
    EXPECT_EQ(looper->LockingThread(), find_thread(nullptr));
    EXPECT_EQ(looper->Thread(), 0);
    looper->Quit();
    EXPECT_EQ(seen.destroyed, 1);
}

TEST(LooperTest, RunGivesTheMakersLockUp) {
    Seen seen;
    BLooper* looper = new CountingLooper(seen);
    const thread_id thread = looper->Run();
    EXPECT_GT(thread, 0);
    EXPECT_EQ(looper->Thread(), thread);
    EXPECT_FALSE(looper->IsLocked());
    EXPECT_EQ(BLooper::LooperForThread(thread), looper);
    QuitLooper(looper);
    EXPECT_EQ(seen.destroyed, 1);
    EXPECT_EQ(BLooper::LooperForThread(thread), nullptr);
}

TEST(LooperTest, MessagesAreHandledInTheLoopersThreadBeforeAQuitFromOutside) {
    Seen seen;
    BLooper* looper = new CountingLooper(seen);
    for (int count = 0; count < 1000; count++)
        ASSERT_EQ(looper->PostMessage('work'), B_OK);
    const thread_id thread = looper->Run();
    QuitLooper(looper);
    EXPECT_EQ(seen.messages, 1000);
    EXPECT_EQ(seen.thread, thread);
}

TEST(LooperTest, QuitInTheOwnThreadDeletesTheLooperAndEndsTheThread) {
    Seen seen;
    BLooper* looper = new CountingLooper(seen);
    const thread_id thread = looper->Run();
    ASSERT_EQ(looper->PostMessage('quit'), B_OK);
    wait_for_thread(thread, nullptr);
    EXPECT_EQ(seen.destroyed, 1);
    EXPECT_EQ(seen.messages, 1);
}

TEST(LooperTest, AQuitRequestEndsTheLooper) {
    Seen seen;
    BLooper* looper = new CountingLooper(seen);
    const thread_id thread = looper->Run();
    ASSERT_EQ(looper->PostMessage(B_QUIT_REQUESTED), B_OK);
    wait_for_thread(thread, nullptr);
    EXPECT_EQ(seen.destroyed, 1);
}

TEST(LooperTest, ALooperThatIsGoneTakesNoLockAndNoMessage) {
    Seen seen;
    BLooper* looper = new CountingLooper(seen);
    const BMessenger messenger(nullptr, looper);
    const thread_id thread = looper->Run();
    EXPECT_TRUE(messenger.IsValid());
    looper->PostMessage(B_QUIT_REQUESTED);
    wait_for_thread(thread, nullptr);
    EXPECT_FALSE(Locks(looper));
    EXPECT_EQ(Post(looper, 'work'), B_BAD_PORT_ID);
    EXPECT_FALSE(IsLocked(looper));
    EXPECT_FALSE(messenger.IsValid());
    EXPECT_FALSE(messenger.LockTarget());
    EXPECT_EQ(messenger.SendMessage('work'), B_BAD_PORT_ID);
}

TEST(LooperTest, AThreadThatWaitsForADyingLoopersLockGivesUp) {
    Seen seen;
    BLooper* looper = new CountingLooper(seen);
    std::atomic<int> result{-1};
    std::thread waiting([&] { result = Locks(looper) ? 1 : 0; });
    while (looper->CountLockRequests() < 2)
        std::this_thread::yield();
    looper->Quit();
    waiting.join();
    EXPECT_EQ(result, 0);
}

TEST(LooperTest, LockWithTimeoutGivesUpInTime) {
    Seen seen;
    BLooper* looper = new CountingLooper(seen);
    std::thread([&] {
        EXPECT_EQ(looper->LockWithTimeout(0), B_WOULD_BLOCK);
        EXPECT_EQ(looper->LockWithTimeout(20000), B_TIMED_OUT);
    }).join();
    EXPECT_EQ(looper->LockWithTimeout(0), B_OK);
    EXPECT_EQ(looper->CountLocks(), 2);
    looper->Unlock();
    looper->Quit();
}

TEST(LooperTest, AMessageForAHandlerReachesItAndNobodyElse) {
    Seen looperSeen;
    Seen handlerSeen;
    CountingHandler handler(handlerSeen);
    BLooper* looper = new CountingLooper(looperSeen);
    looper->AddHandler(&handler);
    EXPECT_EQ(handler.Looper(), looper);
    EXPECT_EQ(handler.NextHandler(), looper);
    EXPECT_EQ(looper->CountHandlers(), 2);
    EXPECT_EQ(looper->IndexOf(&handler), 1);
    looper->PostMessage('work', &handler);
    looper->SetPreferredHandler(&handler);
    looper->PostMessage('work', nullptr);
    looper->PostMessage('work');
    looper->Run();
    QuitLooper(looper);
    EXPECT_EQ(handlerSeen.messages, 2);
    EXPECT_EQ(looperSeen.messages, 1);
    EXPECT_EQ(handler.Looper(), nullptr);
}

TEST(LooperTest, AMessageForAHandlerThatHasGoneIsDropped) {
    Seen looperSeen;
    Seen handlerSeen;
    BLooper* looper = new CountingLooper(looperSeen);
    {
        CountingHandler handler(handlerSeen);
        looper->AddHandler(&handler);
        looper->PostMessage('work', &handler);
    }
    EXPECT_EQ(looper->CountHandlers(), 1);
    looper->Run();
    QuitLooper(looper);
    EXPECT_EQ(handlerSeen.messages, 0);
    EXPECT_EQ(looperSeen.messages, 0);
}

TEST(LooperTest, AHandlerOfAnotherLooperIsRefused) {
    Seen seen;
    CountingHandler handler(seen);
    BLooper* looper = new CountingLooper(seen);
    EXPECT_EQ(looper->PostMessage('work', &handler), B_MISMATCHED_VALUES);
    looper->Quit();
}

TEST(LooperTest, ACommonFilterStopsAMessage) {
    Seen seen;
    BLooper* looper = new CountingLooper(seen);
    looper->AddCommonFilter(
        new BMessageFilter('skip', [](BMessage*, BHandler**, BMessageFilter*) { return B_SKIP_MESSAGE; }));
    looper->PostMessage('skip');
    looper->PostMessage('work');
    looper->Run();
    QuitLooper(looper);
    EXPECT_EQ(seen.messages, 1);
}

TEST(LooperTest, AFilterSendsAMessageToAnotherHandler) {
    static BHandler* other = nullptr;
    Seen looperSeen;
    Seen otherSeen;
    CountingHandler handler(otherSeen);
    other = &handler;
    BLooper* looper = new CountingLooper(looperSeen);
    looper->AddHandler(&handler);
    looper->AddFilter(new BMessageFilter('turn', [](BMessage*, BHandler** target, BMessageFilter*) {
        *target = other;
        return B_DISPATCH_MESSAGE;
    }));
    looper->PostMessage('turn');
    looper->Run();
    QuitLooper(looper);
    EXPECT_EQ(looperSeen.messages, 0);
    EXPECT_EQ(otherSeen.messages, 1);
}

TEST(LooperTest, ADetachedMessageBelongsToWhoTookIt) {
    class Keeper : public BLooper {
      public:
        explicit Keeper(std::unique_ptr<BMessage>& kept) : mKept(kept) {}
        void MessageReceived(BMessage* message) override {
            EXPECT_EQ(CurrentMessage(), message);
            mKept.reset(DetachCurrentMessage());
            EXPECT_EQ(CurrentMessage(), nullptr);
        }

      private:
        std::unique_ptr<BMessage>& mKept;
    };
    std::unique_ptr<BMessage> kept;
    BLooper* looper = new Keeper(kept);
    looper->Run();
    looper->PostMessage('keep');
    QuitLooper(looper);
    ASSERT_NE(kept, nullptr);
    EXPECT_EQ(kept->what, uint32{'keep'});
}

TEST(LooperTest, ASynchronousSendBringsTheReply) {
    Seen seen;
    BLooper* looper = new CountingLooper(seen);
    looper->Run();
    const BMessenger messenger(looper);
    BMessage request('echo');
    request.AddInt32("value", 41);
    BMessage reply;
    ASSERT_EQ(messenger.SendMessage(&request, &reply), B_OK);
    EXPECT_EQ(reply.what, uint32{'echo'});
    EXPECT_EQ(reply.GetInt32("value", 0), 42);
    EXPECT_TRUE(reply.IsReply());
    ASSERT_NE(reply.Previous(), nullptr);
    EXPECT_EQ(reply.Previous()->GetInt32("value", 0), 41);
    QuitLooper(looper);
}

TEST(LooperTest, AMessageThatNobodyAnswersIsAnsweredForItsHandler) {
    Seen seen;
    BLooper* looper = new CountingLooper(seen);
    looper->Run();
    const BMessenger messenger(looper);
    BMessage reply;
    ASSERT_EQ(messenger.SendMessage('mute', &reply), B_OK);
    EXPECT_EQ(reply.what, uint32{B_NO_REPLY});
    ASSERT_EQ(messenger.SendMessage('none', &reply), B_OK);
    EXPECT_EQ(reply.what, uint32{B_MESSAGE_NOT_UNDERSTOOD});
    QuitLooper(looper);
}

TEST(LooperTest, BothTimeOutsEndASynchronousSend) {
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

TEST(LooperTest, ASenderWhoWaitsHearsWhenTheLooperGoesAway) {
    Seen seen;
    BLooper* looper = new CountingLooper(seen);
    const BMessenger messenger(looper);
    BMessage reply;
    status_t status = B_ERROR;
    std::thread sender([&] { status = messenger.SendMessage('echo', &reply); });
    while (looper->MessageQueue()->IsEmpty())
        std::this_thread::yield();
    looper->Quit();
    sender.join();
    EXPECT_EQ(status, B_OK);
    EXPECT_EQ(reply.what, uint32{B_NO_REPLY});
}

TEST(LooperTest, ALooperCannotWaitForItsOwnReply) {
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

TEST(LooperTest, ObserversGetNotices) {
    Seen seen;
    BHandler subject;
    CountingHandler observer(seen);
    BLooper* looper = new CountingLooper(seen);
    looper->AddHandler(&subject);
    looper->AddHandler(&observer);
    EXPECT_EQ(subject.StartWatching(&observer, 7), B_OK);
    EXPECT_TRUE(subject.IsWatched());
    subject.SendNotices(7);
    subject.SendNotices(8);
    EXPECT_EQ(looper->MessageQueue()->CountMessages(), 1);
    BMessage* notice = looper->MessageQueue()->FindMessage(int32{0});
    ASSERT_NE(notice, nullptr);
    EXPECT_EQ(notice->what, uint32{B_OBSERVER_NOTICE_CHANGE});
    EXPECT_EQ(notice->GetInt32(B_OBSERVE_WHAT_CHANGE, 0), 7);
    EXPECT_EQ(subject.StopWatching(&observer, 7), B_OK);
    EXPECT_EQ(subject.StopWatching(&observer, 7), B_NAME_NOT_FOUND);
    EXPECT_FALSE(subject.IsWatched());
    looper->Quit();
}

TEST(LooperTest, ManyThreadsMayUseALooperThatQuits) {
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
