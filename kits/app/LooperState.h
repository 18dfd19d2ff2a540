// What of a looper outlives it: its lock, its queue and its thread's number. Internal to the app kit.
#pragma once

#include "LooperLock.h"
#include <MessageQueue.h>

#include <atomic>
#include <memory>

class BLooper;

// Shared by the looper and everyone who is about to lock it or post to it, so that neither ever touches a
// looper that is gone. Any thread.
class LooperState {
  public:
    LooperState(BLooper* owner, int32 ownerToken, int32 queueCapacity)
        : looper(owner), token(ownerToken), capacity(queueCapacity) {}

    // Queues the message however many wait already: what is posted is never lost. B_BAD_PORT_ID once the
    // looper is going away.
    status_t Post(std::unique_ptr<BMessage> message);
    // First waits for the queue to fall below its capacity. B_TIMED_OUT or B_WOULD_BLOCK (time-out of 0) when
    // it does not; B_BAD_PORT_ID.
    status_t Deliver(std::unique_ptr<BMessage> message, bigtime_t timeout);
    // Without waiting: B_WOULD_BLOCK, B_BAD_PORT_ID. The message is the caller's still unless it succeeds.
    status_t DeliverNow(std::unique_ptr<BMessage>& message);
    // Waits for a message and takes it; null once closed. For the looper's own thread.
    std::unique_ptr<BMessage> WaitForMessage();
    // Refuses messages from now on, wakes everyone who waits and deletes the messages that are left.
    void Close();
    bool IsOpen() const { return !mClosed; }

    // Valid while the lock is held and IsOpen().
    BLooper* const looper;
    // The looper's own, as a handler.
    const int32 token;
    // The number of queued messages from which on a delivery with a time-out waits.
    const int32 capacity;
    LooperLock lock;
    BMessageQueue queue;
    // 0 until the looper runs.
    std::atomic<thread_id> thread{0};

  private:
    void Ring();

    // Changed with the queue locked, so that no message slips in behind the last one.
    std::atomic<bool> mClosed{false};
    GuardMutex mBellMutex;
    std::condition_variable mArrived;
    std::condition_variable mRoom;
    uint64 mArrivals GUARDED_BY(mBellMutex) = 0;
    uint64 mDepartures GUARDED_BY(mBellMutex) = 0;
    bool mLooperSleeps GUARDED_BY(mBellMutex) = false;
    int32 mSendersWaiting GUARDED_BY(mBellMutex) = 0;
};
