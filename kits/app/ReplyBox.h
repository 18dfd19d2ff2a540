// Where a sender waits for the reply to one message. Internal to the app kit.
#pragma once

#include <Message.h>
#include <ThreadSafety.h>

#include <memory>

// Filled once, by any thread; emptied by the one that waits. Found by its token, so that a reply that comes
// too late finds nobody.
class ReplyBox {
  public:
    // B_DUPLICATE_REPLY when there is a reply already.
    status_t Put(std::unique_ptr<BMessage> reply);
    // B_TIMED_OUT, or B_OK and the reply.
    status_t Wait(bigtime_t timeout, std::unique_ptr<BMessage>* reply);

  private:
    GuardMutex mMutex;
    std::condition_variable mArrived;
    std::unique_ptr<BMessage> mReply GUARDED_BY(mMutex);
};
