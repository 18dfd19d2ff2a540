#include <Invoker.h>

#include <Handler.h>

BInvoker::BInvoker() = default;

BInvoker::BInvoker(BMessage* message, const BHandler* handler, const BLooper* looper)
    : mMessage(message), mMessenger(handler, looper) {}

BInvoker::BInvoker(BMessage* message, BMessenger target) : mMessage(message), mMessenger(target) {}

BInvoker::~BInvoker() = default;

status_t BInvoker::SetMessage(BMessage* message) {
    if (message != mMessage.get())
        mMessage.reset(message);
    return B_OK;
}

BMessage* BInvoker::Message() const {
    return mMessage.get();
}

uint32 BInvoker::Command() const {
    return mMessage != nullptr ? mMessage->what : 0;
}

status_t BInvoker::SetTarget(const BHandler* handler, const BLooper* looper) {
    return mMessenger.SetTo(handler, looper);
}

status_t BInvoker::SetTarget(BMessenger target) {
    mMessenger = target;
    return B_OK;
}

bool BInvoker::IsTargetLocal() const {
    return mMessenger.IsTargetLocal();
}

BHandler* BInvoker::Target(BLooper** looper) const {
    return mMessenger.Target(looper);
}

BMessenger BInvoker::Messenger() const {
    return mMessenger;
}

status_t BInvoker::SetHandlerForReply(BHandler* handler) {
    mReplyTo = handler;
    return B_OK;
}

BHandler* BInvoker::HandlerForReply() const {
    return mReplyTo;
}

status_t BInvoker::Invoke(BMessage* message) {
    const BMessage* source = message != nullptr ? message : mMessage.get();
    if (source == nullptr)
        return B_BAD_VALUE;
    BMessage copy(*source);
    copy.RemoveName("when");
    copy.AddInt64("when", system_time());
    if (mNotifyKind != 0 && mNotifyKind != B_CONTROL_INVOKED)
        copy.AddUInt32("be:kind", mNotifyKind);
    return mMessenger.SendMessage(&copy, mReplyTo, mTimeout);
}

status_t BInvoker::InvokeNotify(BMessage* message, uint32 kind) {
    BeginInvokeNotify(kind);
    const status_t status = Invoke(message);
    EndInvokeNotify();
    return status;
}

status_t BInvoker::SetTimeout(bigtime_t timeout) {
    mTimeout = timeout;
    return B_OK;
}

bigtime_t BInvoker::Timeout() const {
    return mTimeout;
}

uint32 BInvoker::InvokeKind(bool* notify) {
    if (notify != nullptr)
        *notify = mNotifyKind != 0;
    return mNotifyKind != 0 ? mNotifyKind : uint32{B_CONTROL_INVOKED};
}

void BInvoker::BeginInvokeNotify(uint32 kind) {
    mNotifyKind = kind;
}

void BInvoker::EndInvokeNotify() {
    mNotifyKind = 0;
}
