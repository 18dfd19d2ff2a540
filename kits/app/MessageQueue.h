// BMessageQueue: messages that wait, first in, first out.
#pragma once

#include <Locker.h>
#include <Message.h>

#include <deque>

// Any thread; each call locks the queue for itself. Lock() holds it over several calls, the indices and
// pointers found stay right until Unlock().
// The queue owns its messages, deletes those that are left when it goes away, and gives up a message that is
// removed.
class BMessageQueue {
  public:
    BMessageQueue();
    virtual ~BMessageQueue();
    BMessageQueue(const BMessageQueue&) = delete;
    BMessageQueue& operator=(const BMessageQueue&) = delete;

    void AddMessage(BMessage* message);
    // Without effect when the message is not in the queue.
    void RemoveMessage(BMessage* message);
    int32 CountMessages() const;
    bool IsEmpty() const;
    // The message at `index`, or null.
    BMessage* FindMessage(int32 index) const;
    // The message of that code with `index` others of it before it, or null.
    BMessage* FindMessage(uint32 code, int32 index = 0) const;
    bool Lock();
    void Unlock();
    bool IsLocked() const;
    // Takes the oldest message out; null when there is none.
    BMessage* NextMessage();
    bool IsNextMessage(const BMessage* message) const;

  private:
    // Guards mMessages; recursive, which the thread-safety analysis cannot follow.
    mutable BLocker mLock;
    std::deque<BMessage*> mMessages;
};
