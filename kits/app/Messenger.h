// BMessenger: the address of a handler or looper that messages are sent to.
#pragma once

#include <Message.h>

class BHandler;
class BLooper;

// A small value that never dangles: it names its target by a number that is not given out twice, and a target
// that has gone away makes it invalid. Copies may be used by any thread; one object by one thread at a time.
//
// The target may lie in another process of the same user: a messenger that comes in a message from there, or
// the application of a signature. A messenger that travels in a message names the same target where it
// arrives.
class BMessenger {
  public:
    BMessenger();
    // The running application of that signature, or of that team, or of both (see BRoster for when one runs).
    // `result`, when given, receives B_OK, B_BAD_VALUE for neither signature nor team, B_ERROR when no such
    // application runs, B_BAD_TEAM_ID when the team is no running application, or B_MISMATCHED_VALUES when it
    // is another one.
    explicit BMessenger(const char* signature, team_id team = -1, status_t* result = nullptr);
    // The handler; with a null handler the looper's preferred handler at the time a message arrives. With
    // both, the handler must belong to the looper, else B_MISMATCHED_VALUES. B_BAD_HANDLER for a handler
    // without a looper, B_BAD_VALUE when both are null.
    BMessenger(const BHandler* handler, const BLooper* looper = nullptr, status_t* result = nullptr);
    BMessenger(const BMessenger& other) = default;
    ~BMessenger() = default;
    BMessenger& operator=(const BMessenger& other) = default;

    bool IsTargetLocal() const;
    // The handler and its looper as they are now; both may be gone before the caller looks at them unless it
    // holds the looper's lock. Null handler for a preferred one.
    BHandler* Target(BLooper** looper) const;
    // Locks the target's looper, so that the target stays. False when it is gone.
    bool LockTarget() const;
    // B_OK, B_TIMED_OUT, or B_BAD_VALUE when the target is gone.
    status_t LockTargetWithTimeout(bigtime_t timeout) const;

    // Asynchronous: the reply goes to `replyTo`, or to the application when that is null. The time-out, in
    // microseconds, is for a looper whose queue is full (see BLooper). B_BAD_PORT_ID when the target is gone,
    // B_TIMED_OUT, or B_WOULD_BLOCK with a time-out of 0.
    // To another process: returns when the message is in the target's queue. B_BAD_TEAM_ID when that process
    // is gone, B_BAD_PORT_ID also when it goes before it has answered for the message; B_NO_MEMORY for a
    // message of more than 64 MB; B_TIMED_OUT when it does not answer, and then it may still get the message
    // later. A sender is patient for 200 ms at least, however short its time-out.
    status_t SendMessage(uint32 command, BHandler* replyTo = nullptr) const;
    status_t SendMessage(BMessage* message, BHandler* replyTo = nullptr,
                         bigtime_t timeout = B_INFINITE_TIMEOUT) const;
    status_t SendMessage(BMessage* message, BMessenger replyTo, bigtime_t timeout = B_INFINITE_TIMEOUT) const;
    // Synchronous: waits for the reply, which replaces the contents of `reply`. When the target's handler
    // goes away or does not answer, that reply is B_NO_REPLY or B_MESSAGE_NOT_UNDERSTOOD. B_TIMED_OUT for
    // either time-out; B_MESSAGE_TO_SELF in the target's own thread, which would wait for ever; B_BAD_PORT_ID
    // when the target's process ends before it has replied.
    status_t SendMessage(uint32 command, BMessage* reply) const;
    status_t SendMessage(BMessage* message, BMessage* reply, bigtime_t deliveryTimeout = B_INFINITE_TIMEOUT,
                         bigtime_t replyTimeout = B_INFINITE_TIMEOUT) const;

    // Points it at the application of that signature, or of the team; see the constructor.
    status_t SetTo(const char* signature, team_id team = -1);
    status_t SetTo(const BHandler* handler, const BLooper* looper = nullptr);

    // Whether the target was there a moment ago. One in a process that lives but does not answer counts.
    bool IsValid() const;
    team_id Team() const;
    uint32 HashValue() const;

    bool operator==(const BMessenger& other) const { return mAddress == other.mAddress; }
    bool operator!=(const BMessenger& other) const { return !(*this == other); }

  private:
    friend class MessageDelivery;
    explicit BMessenger(const MessengerAddress& address) : mAddress(address) {}

    MessengerAddress mAddress;
};

// Orders messengers in some way that stays the same while the program runs.
bool operator<(const BMessenger& a, const BMessenger& b);

// The application's preferred handler; not valid while there is no application.
extern BMessenger be_app_messenger;
