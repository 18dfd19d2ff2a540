// Loopers and handlers that count what they see, for the tests of this folder.
#pragma once

#include <Looper.h>

#include <atomic>
#include <gtest/gtest.h>

// What a looper or handler has seen, for the thread of the test.
struct Seen {
    std::atomic<int> messages{0};
    std::atomic<int> destroyed{0};
    std::atomic<thread_id> thread{0};
    std::atomic<uint32> last{0};
};

// 'quit' makes it end itself; 'echo' is answered with "value" plus one; 'none' is not understood; everything
// else goes without an answer.
class CountingLooper : public BLooper {
  public:
    explicit CountingLooper(Seen& seen, int32 capacity = B_LOOPER_PORT_DEFAULT_CAPACITY)
        : BLooper("counting", B_NORMAL_PRIORITY, capacity), mSeen(seen) {}
    ~CountingLooper() override { mSeen.destroyed++; }
    void MessageReceived(BMessage* message) override {
        mSeen.thread = find_thread(nullptr);
        mSeen.last = message->what;
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
        if (message->what == 'none')
            BLooper::MessageReceived(message);
    }

  private:
    Seen& mSeen;
};

class CountingHandler : public BHandler {
  public:
    explicit CountingHandler(Seen& seen, const char* name = "counter") : BHandler(name), mSeen(seen) {}
    void MessageReceived(BMessage* message) override {
        mSeen.thread = find_thread(nullptr);
        mSeen.last = message->what;
        mSeen.messages++;
    }

  private:
    Seen& mSeen;
};

// Loopers may be asked these when they are gone; the sanitizer would look into them at the call.
#define ASKS_A_LOOPER_THAT_MAY_BE_GONE __attribute__((noinline, no_sanitize("undefined", "address")))
ASKS_A_LOOPER_THAT_MAY_BE_GONE inline bool Locks(BLooper* looper) {
    return looper->Lock();
}
ASKS_A_LOOPER_THAT_MAY_BE_GONE inline bool IsLocked(BLooper* looper) {
    return looper->IsLocked();
}
ASKS_A_LOOPER_THAT_MAY_BE_GONE inline void Unlock(BLooper* looper) {
    looper->Unlock();
}
ASKS_A_LOOPER_THAT_MAY_BE_GONE inline status_t Post(BLooper* looper, uint32 command) {
    return looper->PostMessage(command);
}

// Ends a looper that runs; the messages before are handled first.
inline void QuitLooper(BLooper* looper) {
    ASSERT_TRUE(looper->Lock());
    looper->Quit();
}
