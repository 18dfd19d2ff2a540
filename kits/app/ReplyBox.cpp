#include "ReplyBox.h"

#include <algorithm>
#include <chrono>
#include <utility>

status_t ReplyBox::Put(std::unique_ptr<BMessage>& reply) {
    GuardLock guard(mMutex);
    if (mReply != nullptr || mFailure != B_OK)
        return B_DUPLICATE_REPLY;
    mReply = std::move(reply);
    mArrived.notify_one();
    return B_OK;
}

void ReplyBox::Fail(status_t status) {
    GuardLock guard(mMutex);
    mFailure = status;
    mArrived.notify_one();
}

status_t ReplyBox::Wait(bigtime_t timeout, std::unique_ptr<BMessage>* reply) {
    constexpr bigtime_t kForEver = bigtime_t{100} * 365 * 24 * 3600 * 1000000;
    const auto deadline = std::chrono::steady_clock::now() +
                          std::chrono::microseconds(std::clamp(timeout, bigtime_t{0}, kForEver));
    GuardLock guard(mMutex);
    std::cv_status waited = std::cv_status::no_timeout;
    while (mReply == nullptr && mFailure == B_OK && waited == std::cv_status::no_timeout)
        waited = mArrived.wait_until(guard.Native(), deadline);
    if (mReply == nullptr)
        return mFailure != B_OK ? mFailure : B_TIMED_OUT;
    *reply = std::move(mReply);
    return B_OK;
}
