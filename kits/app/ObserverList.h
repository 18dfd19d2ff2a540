// Who watches a handler, and for what. Internal to the app kit.
#pragma once

#include <Messenger.h>

#include <map>
#include <vector>

// Not synchronised: used with the handler's looper locked.
class ObserverList {
  public:
    status_t Add(const BMessenger& observer, uint32 what);
    // B_NAME_NOT_FOUND when it does not watch for that.
    status_t Remove(const BMessenger& observer, uint32 what);
    // Observers that are gone are forgotten on the way.
    void Send(uint32 what, const BMessage* notice);
    bool IsEmpty() const { return mObservers.empty(); }

  private:
    void SendTo(uint32 key, const BMessage& message);

    std::map<uint32, std::vector<BMessenger>> mObservers;
};
