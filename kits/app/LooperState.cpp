#include "LooperState.h"

#include <algorithm>
#include <chrono>

status_t LooperState::Post(std::unique_ptr<BMessage> message) {
    queue.Lock();
    if (mClosed) {
        queue.Unlock();
        return B_BAD_PORT_ID;
    }
    queue.AddMessage(message.release());
    queue.Unlock();
    Ring();
    return B_OK;
}

status_t LooperState::Deliver(std::unique_ptr<BMessage> message, bigtime_t timeout) {
    constexpr bigtime_t kForEver = bigtime_t{100} * 365 * 24 * 3600 * 1000000;
    const auto deadline = std::chrono::steady_clock::now() +
                          std::chrono::microseconds(std::clamp(timeout, bigtime_t{0}, kForEver));
    // The looper's own thread is the one that makes room; it must not wait for itself.
    while (!mClosed && thread != current_thread_identity()) {
        uint64 departures = 0;
        {
            GuardLock guard(mBellMutex);
            departures = mDepartures;
        }
        // Not under the bell's mutex: whoever holds the queue may be ringing.
        if (queue.CountMessages() < capacity)
            break;
        if (timeout <= 0)
            return B_WOULD_BLOCK;
        GuardLock guard(mBellMutex);
        mSendersWaiting++;
        std::cv_status waited = std::cv_status::no_timeout;
        while (departures == mDepartures && waited == std::cv_status::no_timeout)
            waited = mRoom.wait_until(guard.Native(), deadline);
        mSendersWaiting--;
        if (departures == mDepartures)
            return B_TIMED_OUT;
    }
    return Post(std::move(message));
}

status_t LooperState::DeliverNow(std::unique_ptr<BMessage>& message) {
    queue.Lock();
    status_t status = B_OK;
    if (mClosed)
        status = B_BAD_PORT_ID;
    else if (queue.CountMessages() >= capacity)
        status = B_WOULD_BLOCK;
    else
        queue.AddMessage(message.release());
    queue.Unlock();
    if (status == B_OK)
        Ring();
    return status;
}

void LooperState::Ring() {
    GuardLock guard(mBellMutex);
    mArrivals++;
    const bool sleeps = mLooperSleeps;
    guard.Unlock();
    // After the mutex is free: the looper would wake only to wait for it.
    if (sleeps)
        mArrived.notify_one();
}

std::unique_ptr<BMessage> LooperState::WaitForMessage() {
    for (;;) {
        uint64 arrivals = 0;
        {
            GuardLock guard(mBellMutex);
            arrivals = mArrivals;
        }
        if (std::unique_ptr<BMessage> message{queue.NextMessage()}) {
            GuardLock guard(mBellMutex);
            mDepartures++;
            if (mSendersWaiting > 0)
                mRoom.notify_all();
            return message;
        }
        if (mClosed)
            return nullptr;
        GuardLock guard(mBellMutex);
        mLooperSleeps = true;
        while (mArrivals == arrivals)
            mArrived.wait(guard.Native());
        mLooperSleeps = false;
    }
}

void LooperState::Close() {
    queue.Lock();
    mClosed = true;
    queue.Unlock();
    // Outside the locks: a message that goes away may answer a sender who waits.
    while (BMessage* message = queue.NextMessage())
        delete message;
    GuardLock guard(mBellMutex);
    mArrivals++;
    mDepartures++;
    mArrived.notify_all();
    mRoom.notify_all();
}
