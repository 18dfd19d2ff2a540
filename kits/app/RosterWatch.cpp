// BRoster: telling about applications that begin and end.
#include <Roster.h>

#include "AppFiles.h"
#include "MessageDelivery.h"
#include "host/api/running_applications.h"
#include <ThreadSafety.h>

#include <algorithm>
#include <vector>

namespace {

struct Watcher {
    BMessenger target;
    uint32 events = 0;
};

struct Watchers {
    static Watchers& Instance() {
        static Watchers* const watchers = new Watchers;
        return *watchers;
    }

    GuardMutex mutex;
    std::vector<Watcher> all GUARDED_BY(mutex);
};

// In the transport's thread: never waits for room in a queue, so a target that does not take its messages
// misses some. Only targets of this process are told.
void Tell(const host::RunningApplication& application, bool runs) {
    BMessage message(runs ? B_SOME_APP_LAUNCHED : B_SOME_APP_QUIT);
    message.AddString("be:signature", application.signature.c_str());
    message.AddInt32("be:team", application.process);
    message.AddInt32("be:thread", application.thread);
    message.AddInt32("be:flags", static_cast<int32>(application.flags));
    entry_ref ref;
    if (ref_of_path(application.executable, &ref))
        message.AddRef("be:ref", &ref);
    std::vector<Watcher> told;
    {
        GuardLock guard(Watchers::Instance().mutex);
        told = Watchers::Instance().all;
    }
    const uint32 event = runs ? B_REQUEST_LAUNCHED : B_REQUEST_QUIT;
    for (const Watcher& watcher : told) {
        if ((watcher.events & event) != 0)
            watcher.target.SendMessage(&message, BMessenger(), 0);
    }
}

} // namespace

status_t BRoster::StartWatching(BMessenger target, uint32 events) const {
    if (events == 0 || (events & ~(B_REQUEST_LAUNCHED | B_REQUEST_QUIT)) != 0 || !target.IsTargetLocal())
        return B_BAD_VALUE;
    Watchers& watchers = Watchers::Instance();
    {
        GuardLock guard(watchers.mutex);
        std::erase_if(watchers.all, [&](const Watcher& watcher) { return watcher.target == target; });
        watchers.all.push_back({target, events});
    }
    return status_from_errno(host::watch_running_applications(&Tell).error());
}

status_t BRoster::StopWatching(BMessenger target) const {
    Watchers& watchers = Watchers::Instance();
    bool last = false;
    {
        GuardLock guard(watchers.mutex);
        if (std::erase_if(watchers.all, [&](const Watcher& watcher) { return watcher.target == target; }) ==
            0)
            return B_BAD_VALUE;
        last = watchers.all.empty();
    }
    return last ? status_from_errno(host::watch_running_applications({}).error()) : B_OK;
}
