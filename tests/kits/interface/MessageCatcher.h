// A looper that keeps what is sent to it.
#pragma once

#include <Looper.h>
#include <Message.h>
#include <Messenger.h>

#include <mutex>
#include <vector>

class MessageCatcher {
  public:
    MessageCatcher() : mLooper(new Catcher(this)), mMessenger(nullptr, mLooper) { mLooper->Run(); }
    ~MessageCatcher() {
        mLooper->Lock();
        mLooper->Quit();
    }
    BMessenger Messenger() const { return mMessenger; }
    // All that was sent before this call, and forgets it.
    std::vector<BMessage> Take() {
        // An answer comes after everything that was queued before.
        BMessage reply;
        mMessenger.SendMessage(kAsk, &reply);
        const std::lock_guard<std::mutex> lock(mMutex);
        std::vector<BMessage> taken;
        taken.swap(mMessages);
        return taken;
    }
    // Only how many.
    size_t Count() { return Take().size(); }

  private:
    static constexpr uint32 kAsk = 'ask?';
    class Catcher : public BLooper {
      public:
        explicit Catcher(MessageCatcher* owner) : BLooper("catcher"), mOwner(owner) {}
        void MessageReceived(BMessage* message) override {
            if (message->what == kAsk) {
                message->SendReply(B_REPLY);
                return;
            }
            const std::lock_guard<std::mutex> lock(mOwner->mMutex);
            mOwner->mMessages.push_back(*message);
        }

      private:
        MessageCatcher* const mOwner;
    };

    BLooper* const mLooper; // deletes itself
    BMessenger mMessenger;
    std::mutex mMutex;
    std::vector<BMessage> mMessages;
};
