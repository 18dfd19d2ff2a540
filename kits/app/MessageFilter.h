// BMessageFilter: looks at messages before their handler does.
#pragma once

#include <Message.h>

class BHandler;
class BLooper;

class BMessageFilter;

typedef enum { B_SKIP_MESSAGE, B_DISPATCH_MESSAGE } filter_result;
typedef enum { B_ANY_DELIVERY, B_DROPPED_DELIVERY, B_PROGRAMMED_DELIVERY } message_delivery;
typedef enum { B_ANY_SOURCE, B_REMOTE_SOURCE, B_LOCAL_SOURCE } message_source;

// May set `target` to another handler of the same looper. B_SKIP_MESSAGE ends the message's way.
typedef filter_result (*filter_hook)(BMessage* message, BHandler** target, BMessageFilter* filter);

// Runs in the looper's thread, with the looper locked. Belongs to the handler or looper that it was added to.
class BMessageFilter {
  public:
    explicit BMessageFilter(uint32 command, filter_hook hook = nullptr);
    BMessageFilter(message_delivery delivery, message_source source, filter_hook hook = nullptr);
    BMessageFilter(message_delivery delivery, message_source source, uint32 command,
                   filter_hook hook = nullptr);
    virtual ~BMessageFilter();
    BMessageFilter(const BMessageFilter&) = delete;
    BMessageFilter& operator=(const BMessageFilter&) = delete;

    // Called when there is no hook.
    virtual filter_result Filter(BMessage* message, BHandler** target);

    message_delivery MessageDelivery() const { return mDelivery; }
    message_source MessageSource() const { return mSource; }
    uint32 Command() const { return mCommand; }
    bool FiltersAnyCommand() const { return mAnyCommand; }
    // The looper that it works for, or null.
    BLooper* Looper() const { return mLooper; }

  private:
    friend class BHandler;
    friend class BLooper;
    // Whether the message is one that this filter wants to see.
    bool Takes(const BMessage& message) const;
    filter_result Run(BMessage* message, BHandler** target);

    message_delivery mDelivery = B_ANY_DELIVERY;
    message_source mSource = B_ANY_SOURCE;
    bool mAnyCommand = false;
    uint32 mCommand = 0;
    filter_hook mHook;
    BLooper* mLooper = nullptr;
};
