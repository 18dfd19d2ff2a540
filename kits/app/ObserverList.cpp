#include "ObserverList.h"

#include <Handler.h>

#include <algorithm>

status_t ObserverList::Add(const BMessenger& observer, uint32 what) {
    if (!observer.IsValid())
        return B_BAD_HANDLER;
    std::vector<BMessenger>& watching = mObservers[what];
    if (std::find(watching.begin(), watching.end(), observer) == watching.end())
        watching.push_back(observer);
    return B_OK;
}

status_t ObserverList::Remove(const BMessenger& observer, uint32 what) {
    const auto found = mObservers.find(what);
    if (found == mObservers.end() || std::erase(found->second, observer) == 0)
        return B_NAME_NOT_FOUND;
    if (found->second.empty())
        mObservers.erase(found);
    return B_OK;
}

void ObserverList::Send(uint32 what, const BMessage* notice) {
    BMessage message = notice != nullptr ? *notice : BMessage();
    message.AddInt32(B_OBSERVE_ORIGINAL_WHAT, static_cast<int32>(message.what));
    message.AddInt32(B_OBSERVE_WHAT_CHANGE, static_cast<int32>(what));
    message.what = B_OBSERVER_NOTICE_CHANGE;
    SendTo(what, message);
    SendTo(B_OBSERVER_OBSERVE_ALL, message);
}

void ObserverList::SendTo(uint32 key, const BMessage& message) {
    const auto found = mObservers.find(key);
    if (found == mObservers.end())
        return;
    BMessage copy(message);
    std::erase_if(found->second, [&copy](const BMessenger& observer) {
        return observer.SendMessage(&copy, BMessenger(), 0) == B_BAD_PORT_ID;
    });
    if (found->second.empty())
        mObservers.erase(found);
}
