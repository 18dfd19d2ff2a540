// Replies: who gets them, who owes them, and what is answered when nobody replies.
#include "SeenMessages.h"

#include <MessageQueue.h>
#include <Messenger.h>

#include <gtest/gtest.h>
#include <thread>

namespace {

// Answers 'ask_' with a question of its own and keeps what it is told.
class Asking : public BLooper {
  public:
    explicit Asking(std::atomic<int32>& told) : BLooper("asking"), mTold(told) {}
    void MessageReceived(BMessage* message) override {
        BMessage question('why_');
        BMessage answer;
        if (message->SendReply(&question, &answer) == B_OK && answer.what == 'bcse')
            mTold = answer.GetInt32("value", 0);
    }

  private:
    std::atomic<int32>& mTold;
};

} // namespace

TEST(MessageReplyTest, ASynchronousSendBringsTheReply) {
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

TEST(MessageReplyTest, AMessageThatNobodyAnswersIsAnsweredForItsHandler) {
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

TEST(MessageReplyTest, ASenderWhoWaitsHearsWhenTheLooperGoesAway) {
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

TEST(MessageReplyTest, AReplyGoesWhereTheSenderSaid) {
    Seen askedSeen;
    Seen replySeen;
    BLooper* asked = new CountingLooper(askedSeen);
    BLooper* home = new CountingLooper(replySeen);
    CountingHandler handler(replySeen);
    home->AddHandler(&handler);
    const BMessenger messenger(asked);
    BMessage request('echo');
    request.AddInt32("value", 1);
    ASSERT_EQ(messenger.SendMessage(&request, &handler), B_OK);
    ASSERT_EQ(asked->PostMessage(&request, asked, home), B_OK);
    asked->Run();
    QuitLooper(asked);
    ASSERT_EQ(home->MessageQueue()->CountMessages(), 2);
    const BMessage* reply = home->MessageQueue()->FindMessage(int32{0});
    EXPECT_EQ(reply->what, uint32{'echo'});
    EXPECT_EQ(reply->GetInt32("value", 0), 2);
    EXPECT_TRUE(reply->IsReply());
    EXPECT_TRUE(reply->WasDelivered());
    EXPECT_FALSE(reply->IsSourceWaiting());
    ASSERT_NE(reply->Previous(), nullptr);
    EXPECT_EQ(reply->Previous()->GetInt32("value", 0), 1);
    home->Run();
    QuitLooper(home);
    EXPECT_EQ(replySeen.messages, 2);
}

TEST(MessageReplyTest, AReplyCanBeRepliedTo) {
    std::atomic<int32> told{0};
    BLooper* looper = new Asking(told);
    looper->Run();
    BMessage reply;
    ASSERT_EQ(BMessenger(looper).SendMessage('ask_', &reply), B_OK);
    EXPECT_EQ(reply.what, uint32{'why_'});
    EXPECT_TRUE(reply.IsSourceWaiting());
    BMessage because('bcse');
    because.AddInt32("value", 42);
    EXPECT_EQ(reply.SendReply(&because), B_OK);
    EXPECT_FALSE(reply.IsSourceWaiting());
    EXPECT_EQ(reply.SendReply(&because), B_DUPLICATE_REPLY);
    QuitLooper(looper);
    EXPECT_EQ(told, 42);
}

TEST(MessageReplyTest, OnlyWhatWasDeliveredAndCanBeAnsweredIsRepliedTo) {
    BMessage own('mine');
    EXPECT_EQ(own.SendReply('rply'), B_BAD_REPLY);
    EXPECT_EQ(own.SendReply(static_cast<BMessage*>(nullptr), BMessenger()), B_BAD_VALUE);
    Seen seen;
    BLooper* looper = new CountingLooper(seen);
    // Without an application there is nobody to whom replies go unasked.
    ASSERT_EQ(looper->PostMessage('work'), B_OK);
    BMessage* posted = looper->MessageQueue()->FindMessage(int32{0});
    EXPECT_TRUE(posted->WasDelivered());
    EXPECT_FALSE(posted->IsSourceRemote());
    EXPECT_EQ(posted->SendReply('rply'), B_BAD_REPLY);
    looper->Quit();
}

TEST(MessageReplyTest, ALooperDoesNotWaitForItsOwnAnswerToAReply) {
    class Selfish : public BLooper {
      public:
        explicit Selfish(std::atomic<status_t>& status) : mStatus(status) {}
        void MessageReceived(BMessage* message) override {
            BMessage answer;
            if (message->what == 'ask_')
                mStatus = message->SendReply('why_', &answer);
        }

      private:
        std::atomic<status_t>& mStatus;
    };
    std::atomic<status_t> status{B_OK};
    BLooper* looper = new Selfish(status);
    ASSERT_EQ(BMessenger(looper).SendMessage('ask_', looper), B_OK);
    looper->Run();
    QuitLooper(looper);
    EXPECT_EQ(status, B_MESSAGE_TO_SELF);
}

TEST(MessageReplyTest, AReplyThatComesTooLateFindsNobody) {
    class Late : public BLooper {
      public:
        explicit Late(std::atomic<status_t>& status) : mStatus(status) {}
        void MessageReceived(BMessage* message) override {
            while (message->ReturnAddress().IsValid())
                snooze(1000);
            mStatus = message->SendReply('late');
        }

      private:
        std::atomic<status_t>& mStatus;
    };
    std::atomic<status_t> status{B_OK};
    BLooper* looper = new Late(status);
    looper->Run();
    BMessage request('ask_');
    BMessage reply('mine');
    EXPECT_EQ(BMessenger(looper).SendMessage(&request, &reply, B_INFINITE_TIMEOUT, 20000), B_TIMED_OUT);
    EXPECT_EQ(reply.what, uint32{'mine'});
    QuitLooper(looper);
    EXPECT_EQ(status, B_BAD_PORT_ID);
}

TEST(MessageReplyTest, AMovedMessageStillOwesTheReply) {
    class Keeper : public BLooper {
      public:
        void MessageReceived(BMessage* message) override {
            mKept = std::move(*message);
            EXPECT_FALSE(message->IsSourceWaiting());
            EXPECT_TRUE(mKept.IsSourceWaiting());
            BMessage reply('kept');
            mKept.SendReply(&reply);
        }

      private:
        BMessage mKept;
    };
    BLooper* looper = new Keeper;
    looper->Run();
    BMessage reply;
    ASSERT_EQ(BMessenger(looper).SendMessage('keep', &reply), B_OK);
    EXPECT_EQ(reply.what, uint32{'kept'});
    QuitLooper(looper);
}

TEST(MessageReplyTest, ADetachedMessageIsAnsweredWhenItIsDeleted) {
    class Keeper : public BLooper {
      public:
        explicit Keeper(std::atomic<BMessage*>& kept) : mKept(kept) {}
        void MessageReceived(BMessage*) override { mKept = DetachCurrentMessage(); }

      private:
        std::atomic<BMessage*>& mKept;
    };
    std::atomic<BMessage*> kept{nullptr};
    BLooper* looper = new Keeper(kept);
    looper->Run();
    BMessage reply;
    status_t status = B_ERROR;
    std::thread sender([&] { status = BMessenger(looper).SendMessage('keep', &reply); });
    while (kept == nullptr)
        std::this_thread::yield();
    delete kept.load();
    sender.join();
    EXPECT_EQ(status, B_OK);
    EXPECT_EQ(reply.what, uint32{B_NO_REPLY});
    QuitLooper(looper);
}
