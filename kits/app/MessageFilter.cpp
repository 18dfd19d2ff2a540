#include <MessageFilter.h>

BMessageFilter::BMessageFilter(uint32 command, filter_hook hook) : mCommand(command), mHook(hook) {}

BMessageFilter::BMessageFilter(message_delivery delivery, message_source source, filter_hook hook)
    : mDelivery(delivery), mSource(source), mAnyCommand(true), mHook(hook) {}

BMessageFilter::BMessageFilter(message_delivery delivery, message_source source, uint32 command,
                               filter_hook hook)
    : mDelivery(delivery), mSource(source), mCommand(command), mHook(hook) {}

BMessageFilter::~BMessageFilter() = default;

filter_result BMessageFilter::Filter(BMessage*, BHandler**) {
    return B_DISPATCH_MESSAGE;
}

bool BMessageFilter::Takes(const BMessage& message) const {
    if (!mAnyCommand && message.what != mCommand)
        return false;
    if (mDelivery != B_ANY_DELIVERY && message.WasDropped() != (mDelivery == B_DROPPED_DELIVERY))
        return false;
    return mSource == B_ANY_SOURCE || message.IsSourceRemote() == (mSource == B_REMOTE_SOURCE);
}

filter_result BMessageFilter::Run(BMessage* message, BHandler** target) {
    return mHook != nullptr ? mHook(message, target, this) : Filter(message, target);
}
