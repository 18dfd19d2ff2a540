// Where a sender waits for the reply to one message. Internal to the app kit.
#pragma once

#include <Message.h>
#include <ThreadSafety.h>

#include <memory>

// Filled once, by any thread; emptied by the one that waits. Found by its token, so that a reply that comes
// too late finds nobody.
class ReplyBox {
  public:
    // For a reply from that team.
    explicit ReplyBox(team_id team) : awaited(team) {}

    // B_DUPLICATE_REPLY when there is a reply already, or none is expected any more; the message is the
    // caller's still then.
    status_t Put(std::unique_ptr<BMessage>& reply);
    // No reply will come: who waits is told `status`, unless a reply is there already.
    void Fail(status_t status);
    // B_TIMED_OUT, what Fail() was given, or B_OK and the reply.
    status_t Wait(bigtime_t timeout, std::unique_ptr<BMessage>* reply);

    const team_id awaited;

  private:
    GuardMutex mMutex;
    std::condition_variable mArrived;
    std::unique_ptr<BMessage> mReply GUARDED_BY(mMutex);
    status_t mFailure GUARDED_BY(mMutex) = B_OK;
};
