// Loopers: their queue, their handlers, their lock and their end.
#include "SeenMessages.h"

#include <MessageQueue.h>
#include <Messenger.h>

#include <atomic>
#include <gtest/gtest.h>
#include <memory>
#include <thread>

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

TEST(LooperTest, AQuitThatIsRefusedIsAnsweredAndTheLooperGoesOn) {
    class Stubborn : public CountingLooper {
      public:
        using CountingLooper::CountingLooper;
        bool QuitRequested() override { return false; }
    };
    Seen seen;
    BLooper* looper = new Stubborn(seen);
    looper->Run();
    const BMessenger messenger(looper);
    BMessage reply;
    ASSERT_EQ(messenger.SendMessage(B_QUIT_REQUESTED, &reply), B_OK);
    EXPECT_EQ(reply.what, uint32{B_REPLY});
    EXPECT_FALSE(reply.GetBool("result", true));
    EXPECT_TRUE(messenger.IsValid());
    QuitLooper(looper);
    EXPECT_EQ(seen.destroyed, 1);
}

TEST(LooperTest, AnArchiveKeepsNameAndCapacity) {
    Seen seen;
    BLooper* looper = new BLooper("archived", B_NORMAL_PRIORITY, 3);
    BMessage archive;
    ASSERT_EQ(looper->Archive(&archive), B_OK);
    looper->Quit();
    EXPECT_STREQ(archive.GetString("class"), "BLooper");
    EXPECT_EQ(archive.GetInt32("_port_cap", 0), 3);

    auto* again = dynamic_cast<BLooper*>(instantiate_object(&archive));
    ASSERT_NE(again, nullptr);
    EXPECT_STREQ(again->Name(), "archived");
    BMessage work('work');
    const BMessenger messenger(again);
    for (int count = 0; count < 3; count++)
        EXPECT_EQ(messenger.SendMessage(&work, BMessenger(), 0), B_OK);
    EXPECT_EQ(messenger.SendMessage(&work, BMessenger(), 0), B_WOULD_BLOCK);
    again->Quit();
}

TEST(LooperTest, ScriptsCountHandlersAndReachThemByIndexAndName) {
    Seen seen;
    BHandler named("painter");
    BLooper* looper = new CountingLooper(seen);
    looper->AddHandler(&named);
    const BMessenger messenger(looper);
    looper->Run();

    BMessage handler(B_GET_PROPERTY);
    BMessage answer;
    handler.AddSpecifier("InternalName");
    handler.AddSpecifier("Handler", "painter");
    ASSERT_EQ(messenger.SendMessage(&handler, &answer), B_OK);
    EXPECT_STREQ(answer.GetString("result"), "painter");

    BMessage byIndex(B_GET_PROPERTY);
    byIndex.AddSpecifier("InternalName");
    byIndex.AddSpecifier("Handler", 1);
    ASSERT_EQ(messenger.SendMessage(&byIndex, &answer), B_OK);
    EXPECT_STREQ(answer.GetString("result"), "painter");

    BMessage absent(B_GET_PROPERTY);
    absent.AddSpecifier("InternalName");
    absent.AddSpecifier("Handler", "sculptor");
    ASSERT_EQ(messenger.SendMessage(&absent, &answer), B_OK);
    EXPECT_EQ(answer.what, uint32{B_MESSAGE_NOT_UNDERSTOOD});
    EXPECT_EQ(answer.GetInt32("error", 0), B_NAME_NOT_FOUND);

    ASSERT_TRUE(looper->Lock());
    looper->Quit();
}

TEST(LooperTest, ALooperRunsOnce) {
    Seen seen;
    BLooper* looper = new CountingLooper(seen);
    ASSERT_GT(looper->Run(), 0);
    ASSERT_TRUE(looper->Lock());
    EXPECT_EQ(looper->Run(), B_BAD_THREAD_STATE);
    looper->Quit();
}
