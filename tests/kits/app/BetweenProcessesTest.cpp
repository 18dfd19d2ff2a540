// Messages between processes: there and back, and what happens when the other side is not as it should be.
#include "PeerProgram.h"

#include <Application.h>
#include <Looper.h>

#include <atomic>
#include <chrono>
#include <condition_variable>
#include <csignal>
#include <mutex>
#include <thread>

namespace {

constexpr const char* kPeer = "application/x-vnd.Test-Peer";
constexpr bigtime_t kSecond = 1'000'000;

class BetweenProcessesTest : public test::PeerTest {
  protected:
    BetweenProcessesTest() : PeerTest(kPeer) {}
};

using test::Eventually;
using test::PeerProgram;

// Keeps copies of what it gets.
class Collector : public BLooper {
  public:
    Collector() : BLooper("collector") { Run(); }
    void MessageReceived(BMessage* message) override {
        std::lock_guard guard(mMutex);
        mWasReply = message->IsReply();
        mPrevious = message->Previous() != nullptr ? *message->Previous() : BMessage();
        mMessages.push_back(*message);
        mArrived.notify_all();
    }
    // Empty when none comes within ten seconds.
    BMessage Next() {
        std::unique_lock guard(mMutex);
        mArrived.wait_for(guard, std::chrono::seconds(10), [this] { return !mMessages.empty(); });
        if (mMessages.empty())
            return BMessage();
        BMessage message = mMessages.front();
        mMessages.erase(mMessages.begin());
        return message;
    }
    bool WasReply() {
        std::lock_guard guard(mMutex);
        return mWasReply;
    }
    uint32 PreviousCode() {
        std::lock_guard guard(mMutex);
        return mPrevious.what;
    }

  private:
    std::mutex mMutex;
    std::condition_variable mArrived;
    std::vector<BMessage> mMessages;
    BMessage mPrevious;
    bool mWasReply = false;
};

// Ended when the test is.
struct CollectorOwner {
    Collector* const looper = new Collector;
    ~CollectorOwner() {
        looper->Lock();
        looper->Quit();
    }
    Collector* operator->() const { return looper; }
};

} // namespace

TEST_F(BetweenProcessesTest, AMessageWithItsFieldsComesBackAsTheReply) {
    PeerProgram peer(kPeer);
    EXPECT_FALSE(peer.Messenger().IsTargetLocal());
    EXPECT_TRUE(peer.Messenger().IsValid());
    EXPECT_NE(peer.Team(), getpid());
    BMessage message('echo');
    message.AddString("text", "caf\xe9 'x'\n");
    message.AddInt64("number", -5);
    BMessage reply;
    ASSERT_EQ(peer.Messenger().SendMessage(&message, &reply), B_OK);
    EXPECT_EQ(reply.what, uint32{'back'});
    EXPECT_STREQ(reply.GetString("text"), "caf\xe9 'x'\n");
    EXPECT_EQ(reply.GetInt64("number", 0), -5);
    EXPECT_EQ(reply.GetInt32("team", 0), peer.Team());
    EXPECT_TRUE(reply.GetBool("remote", false));
    EXPECT_TRUE(reply.IsSourceRemote());
}

TEST_F(BetweenProcessesTest, AnAsynchronousReplyReachesTheHandlerThatWasNamed) {
    PeerProgram peer(kPeer);
    CollectorOwner collector;
    BMessage message('echo');
    message.AddInt32("number", 7);
    ASSERT_EQ(peer.Messenger().SendMessage(&message, collector.looper), B_OK);
    const BMessage reply = collector->Next();
    EXPECT_EQ(reply.what, uint32{'back'});
    EXPECT_EQ(reply.GetInt32("number", 0), 7);
    EXPECT_TRUE(collector->WasReply());
    EXPECT_EQ(collector->PreviousCode(), uint32{'echo'});
}

TEST_F(BetweenProcessesTest, AMessengerThatTravelsNamesTheSameTarget) {
    PeerProgram peer(kPeer);
    CollectorOwner collector;
    BMessage message('pass');
    message.AddMessenger("target", BMessenger(collector.looper));
    BMessage reply;
    ASSERT_EQ(peer.Messenger().SendMessage(&message, &reply), B_OK);
    EXPECT_EQ(reply.GetInt32("status", B_ERROR), B_OK);
    const BMessage passed = collector->Next();
    EXPECT_EQ(passed.what, uint32{'pass'});
    EXPECT_FALSE(passed.GetBool("local", true));
    EXPECT_TRUE(passed.GetBool("valid", false));
    BMessenger me;
    ASSERT_EQ(reply.FindMessenger("me", &me), B_OK);
    EXPECT_EQ(me.Team(), peer.Team());
    EXPECT_TRUE(me.IsValid());
    // The one by the signature points at whichever handler the application prefers.
    EXPECT_FALSE(me == peer.Messenger());
    BMessage again('echo');
    EXPECT_EQ(me.SendMessage(&again, &reply), B_OK);
}

TEST_F(BetweenProcessesTest, TenThousandMessagesArriveInTheirOrder) {
    PeerProgram peer(kPeer);
    BMessage message('numb');
    for (int32 number = 0; number < 10000; number++) {
        message.MakeEmpty();
        message.AddInt32("number", number);
        ASSERT_EQ(peer.Messenger().SendMessage(&message), B_OK) << number;
    }
    BMessage reply;
    ASSERT_EQ(peer.Messenger().SendMessage('sum?', &reply), B_OK);
    EXPECT_EQ(reply.GetInt32("numbers", 0), 10000);
}

TEST_F(BetweenProcessesTest, ManyThreadsShareTheWay) {
    PeerProgram peer(kPeer);
    std::vector<std::thread> threads;
    std::atomic<int> right{0};
    for (int thread = 0; thread < 4; thread++) {
        threads.emplace_back([&, thread] {
            for (int32 round = 0; round < 100; round++) {
                BMessage message('echo');
                message.AddInt32("number", thread * 1000 + round);
                BMessage reply;
                if (peer.Messenger().SendMessage(&message, &reply) == B_OK &&
                    reply.GetInt32("number", -1) == thread * 1000 + round)
                    right++;
            }
        });
    }
    for (std::thread& thread : threads)
        thread.join();
    EXPECT_EQ(right, 400);
}

TEST_F(BetweenProcessesTest, SeveralMegabytesTravel) {
    PeerProgram peer(kPeer);
    const std::vector<char> bytes(5'000'000, 'x');
    BMessage message('echo');
    message.AddData("bytes", B_RAW_TYPE, bytes.data(), static_cast<ssize_t>(bytes.size()));
    BMessage reply;
    ASSERT_EQ(peer.Messenger().SendMessage(&message, &reply), B_OK);
    const void* data = nullptr;
    ssize_t size = 0;
    ASSERT_EQ(reply.FindData("bytes", B_RAW_TYPE, &data, &size), B_OK);
    EXPECT_EQ(size, 5'000'000);
}

TEST_F(BetweenProcessesTest, AMessageThatIsTooLargeIsRefusedAndHarmsNothing) {
    PeerProgram peer(kPeer);
    {
        const std::vector<char> bytes(65 << 20, 'x');
        BMessage message('echo');
        message.AddData("bytes", B_RAW_TYPE, bytes.data(), static_cast<ssize_t>(bytes.size()));
        EXPECT_EQ(peer.Messenger().SendMessage(&message), B_NO_MEMORY);
    }
    BMessage reply;
    EXPECT_EQ(peer.Messenger().SendMessage('echo', &reply), B_OK);
}

TEST_F(BetweenProcessesTest, APeerThatIsKilledBeforeItRepliesEndsTheWait) {
    PeerProgram peer(kPeer);
    BMessage reply;
    EXPECT_EQ(peer.Messenger().SendMessage('die ', &reply), B_BAD_PORT_ID);
    EXPECT_TRUE(Eventually([&] { return !peer.Process().running(); }));
    EXPECT_FALSE(peer.Messenger().IsValid());
    EXPECT_EQ(peer.Messenger().SendMessage('echo'), B_BAD_TEAM_ID);
    EXPECT_FALSE(be_roster->IsRunning(kPeer));
}

TEST_F(BetweenProcessesTest, AHandlerThatHasGoneIsNoTarget) {
    PeerProgram peer(kPeer);
    BMessage passed('pass');
    {
        CollectorOwner collector;
        passed.AddMessenger("target", BMessenger(collector.looper));
    }
    BMessage reply;
    ASSERT_EQ(peer.Messenger().SendMessage(&passed, &reply), B_OK);
    EXPECT_EQ(reply.GetInt32("status", B_OK), B_BAD_PORT_ID);
}

TEST_F(BetweenProcessesTest, NoReplyInTimeIsTimedOut) {
    PeerProgram peer(kPeer);
    BMessage message('keep');
    BMessage reply;
    const bigtime_t before = system_time();
    EXPECT_EQ(peer.Messenger().SendMessage(&message, &reply, kSecond, kSecond / 10), B_TIMED_OUT);
    EXPECT_GE(system_time() - before, kSecond / 10);
}

TEST_F(BetweenProcessesTest, AHandlerThatDoesNotAnswerIsAnswered) {
    PeerProgram peer(kPeer);
    BMessage message('slow');
    BMessage reply;
    ASSERT_EQ(peer.Messenger().SendMessage(&message, &reply), B_OK);
    EXPECT_EQ(reply.what, B_NO_REPLY);
    ASSERT_EQ(peer.Messenger().SendMessage('huh?', &reply), B_OK);
    EXPECT_EQ(reply.what, B_MESSAGE_NOT_UNDERSTOOD);
}

TEST_F(BetweenProcessesTest, APeerThatIsStoppedHoldsNobodyUpBeyondTheTimeOut) {
    PeerProgram peer(kPeer);
    ASSERT_EQ(peer.Messenger().SendMessage('stop'), B_OK);
    // Too large for what the system keeps between the two: half of it stays here.
    const std::vector<char> bytes(4'000'000, 'x');
    BMessage large('echo');
    large.AddData("bytes", B_RAW_TYPE, bytes.data(), static_cast<ssize_t>(bytes.size()));
    BMessage small('numb');
    small.AddInt32("number", 0);
    const std::string status = "/proc/" + std::to_string(peer.Process().process()) + "/status";
    ASSERT_TRUE(test::Eventually(
        [&] { return test::read_file(status).find("State:\tT (stopped)") != std::string::npos; }));
    const bigtime_t before = system_time();
    EXPECT_EQ(peer.Messenger().SendMessage(&large, BMessenger(), kSecond / 2), B_TIMED_OUT);
    EXPECT_EQ(peer.Messenger().SendMessage(&small, BMessenger(), kSecond / 2), B_TIMED_OUT);
    EXPECT_EQ(peer.Messenger().SendMessage(&small, BMessenger(), 0), B_TIMED_OUT);
    EXPECT_LT(system_time() - before, 5 * kSecond);
    // It lives, so it counts.
    EXPECT_TRUE(peer.Messenger().IsValid());
    peer.Process().signal(SIGCONT);
    // The half frame is completed, and what follows is understood.
    BMessage reply;
    ASSERT_EQ(peer.Messenger().SendMessage('sum?', &reply), B_OK);
    EXPECT_EQ(reply.what, uint32{'sum!'});
}

TEST_F(BetweenProcessesTest, AFullQueueIsWaitedForAndEndsInTimedOut) {
    PeerProgram peer(kPeer);
    BMessage slow('slow');
    slow.AddInt64("time", 2 * kSecond);
    ASSERT_EQ(peer.Messenger().SendMessage(&slow), B_OK);
    BMessage message('numb');
    message.AddInt32("number", 0);
    status_t status = B_OK;
    int32 sent = 0;
    for (; status == B_OK && sent < 1000; sent++)
        status = peer.Messenger().SendMessage(&message, BMessenger(), 0);
    EXPECT_EQ(status, B_WOULD_BLOCK);
    EXPECT_EQ(peer.Messenger().SendMessage(&message, BMessenger(), kSecond / 10), B_TIMED_OUT);
    // There is room again once the slow one is done.
    EXPECT_EQ(peer.Messenger().SendMessage(&message, BMessenger(), 20 * kSecond), B_OK);
}

TEST_F(BetweenProcessesTest, SendersWhoseTargetGoesAwayBetweenHearOfIt) {
    PeerProgram peer(kPeer);
    std::thread killer([&] {
        snooze(kSecond / 5);
        peer.Process().signal(SIGKILL);
    });
    status_t status = B_OK;
    BMessage reply;
    while (status == B_OK)
        status = peer.Messenger().SendMessage('echo', &reply);
    EXPECT_TRUE(status == B_BAD_PORT_ID || status == B_BAD_TEAM_ID) << status;
    killer.join();
}

TEST_F(BetweenProcessesTest, WhatIsNoTeamIsRefused) {
    status_t result = B_OK;
    EXPECT_FALSE(BMessenger(nullptr, 1, &result).IsValid());
    EXPECT_EQ(result, B_BAD_TEAM_ID);
    PeerProgram peer(kPeer);
    BMessenger(kPeer, getpid(), &result);
    EXPECT_EQ(result, B_BAD_TEAM_ID);
    BMessenger("application/x-vnd.Test-Another", peer.Team(), &result);
    EXPECT_EQ(result, B_MISMATCHED_VALUES);
    EXPECT_TRUE(BMessenger(kPeer, peer.Team(), &result) == peer.Messenger());
    EXPECT_EQ(result, B_OK);
}
