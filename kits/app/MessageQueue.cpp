#include <Autolock.h>
#include <MessageQueue.h>

#include <algorithm>

BMessageQueue::BMessageQueue() : mLock("message queue") {}

BMessageQueue::~BMessageQueue() {
    while (BMessage* message = NextMessage())
        delete message;
}

void BMessageQueue::AddMessage(BMessage* message) {
    if (message == nullptr)
        return;
    BAutolock lock(mLock);
    mMessages.push_back(message);
}

void BMessageQueue::RemoveMessage(BMessage* message) {
    BAutolock lock(mLock);
    const auto found = std::find(mMessages.begin(), mMessages.end(), message);
    if (found != mMessages.end())
        mMessages.erase(found);
}

int32 BMessageQueue::CountMessages() const {
    BAutolock lock(mLock);
    return static_cast<int32>(mMessages.size());
}

bool BMessageQueue::IsEmpty() const {
    return CountMessages() == 0;
}

BMessage* BMessageQueue::FindMessage(int32 index) const {
    BAutolock lock(mLock);
    if (index < 0 || static_cast<size_t>(index) >= mMessages.size())
        return nullptr;
    return mMessages[static_cast<size_t>(index)];
}

BMessage* BMessageQueue::FindMessage(uint32 code, int32 index) const {
    BAutolock lock(mLock);
    if (index < 0)
        return nullptr;
    for (BMessage* message : mMessages) {
        if (message->what == code && index-- == 0)
            return message;
    }
    return nullptr;
}

bool BMessageQueue::Lock() {
    return mLock.Lock();
}

void BMessageQueue::Unlock() {
    mLock.Unlock();
}

bool BMessageQueue::IsLocked() const {
    return mLock.IsLocked();
}

BMessage* BMessageQueue::NextMessage() {
    BAutolock lock(mLock);
    if (mMessages.empty())
        return nullptr;
    BMessage* message = mMessages.front();
    mMessages.pop_front();
    return message;
}

bool BMessageQueue::IsNextMessage(const BMessage* message) const {
    BAutolock lock(mLock);
    return !mMessages.empty() && mMessages.front() == message;
}
