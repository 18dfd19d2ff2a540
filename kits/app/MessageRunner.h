// BMessageRunner: sends a message again and again.
#pragma once

#include <Messenger.h>

// Sends copies until the object is destroyed, `count` of them have been sent (negative: no limit), or the
// target is gone. Any thread may make and destroy it; one object by one thread at a time. After destruction
// no further copy is sent. One thread of the kits serves all runners and ends with the last of them.
class BMessageRunner {
  public:
    // The interval is in microseconds, the first copy is sent after one. InitCheck() is B_BAD_VALUE for no
    // message, a target that is not valid or an interval of 0 or less; a count of 0 does nothing.
    BMessageRunner(BMessenger target, const BMessage* message, bigtime_t interval, int32 count = -1);
    BMessageRunner(BMessenger target, const BMessage* message, bigtime_t interval, int32 count,
                   BMessenger replyTo);
    virtual ~BMessageRunner();
    BMessageRunner(const BMessageRunner&) = delete;
    BMessageRunner& operator=(const BMessageRunner&) = delete;

    // Makes a runner that lives until it has sent all its copies.
    static status_t StartSending(BMessenger target, const BMessage* message, bigtime_t interval, int32 count);

    status_t InitCheck() const;
    // Take effect at once, counted from now. B_BAD_VALUE when there is nothing (more) to send.
    status_t SetInterval(bigtime_t interval);
    status_t SetCount(int32 count);
    status_t GetInfo(bigtime_t* interval, int32* count) const;

  private:
    int32 mId = 0;
    status_t mInitStatus;
};
