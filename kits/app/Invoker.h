// BInvoker: keeps a message and a target, and sends the one to the other.
#pragma once

#include <Messenger.h>

class BHandler;
class BLooper;

// Owns the message. One thread at a time, in practice the window's.
class BInvoker {
  public:
    BInvoker();
    BInvoker(BMessage* message, const BHandler* handler, const BLooper* looper = nullptr);
    BInvoker(BMessage* message, BMessenger target);
    virtual ~BInvoker();
    BInvoker(const BInvoker&) = delete;
    BInvoker& operator=(const BInvoker&) = delete;

    // Takes the message over and deletes the one before.
    virtual status_t SetMessage(BMessage* message);
    BMessage* Message() const;
    // The message's `what`, 0 when there is none.
    uint32 Command() const;

    // As BMessenger::SetTo().
    virtual status_t SetTarget(const BHandler* handler, const BLooper* looper = nullptr);
    virtual status_t SetTarget(BMessenger target);
    bool IsTargetLocal() const;
    BHandler* Target(BLooper** looper = nullptr) const;
    BMessenger Messenger() const;

    // Null, as at first, for the application.
    virtual status_t SetHandlerForReply(BHandler* handler);
    BHandler* HandlerForReply() const;

    // Sends a copy of `message`, or of the kept one when it is null, with "when" (system_time()) and, for
    // kinds other than B_CONTROL_INVOKED, "be:kind". B_BAD_VALUE when there is neither.
    virtual status_t Invoke(BMessage* message = nullptr);
    status_t InvokeNotify(BMessage* message, uint32 kind = B_CONTROL_INVOKED);
    // How long Invoke() may wait for a full queue.
    status_t SetTimeout(bigtime_t timeout);
    bigtime_t Timeout() const;

  protected:
    // The kind that is being invoked; `notify` receives whether InvokeNotify() was called.
    uint32 InvokeKind(bool* notify = nullptr);
    void BeginInvokeNotify(uint32 kind = B_CONTROL_INVOKED);
    void EndInvokeNotify();

  private:
    std::unique_ptr<BMessage> mMessage;
    BMessenger mMessenger;
    BHandler* mReplyTo = nullptr;
    bigtime_t mTimeout = B_INFINITE_TIMEOUT;
    uint32 mNotifyKind = 0;
};
