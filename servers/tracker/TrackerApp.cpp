#include "TrackerApp.h"

#include "Opener.h"
#include <Message.h>
#include <MessageQueue.h>
#include <OS.h>

#include <algorithm>
#include <memory>
#include <vector>

namespace {

std::vector<entry_ref> RefsIn(const BMessage& message, const char* field) {
    std::vector<entry_ref> refs;
    entry_ref ref;
    for (int32 index = 0; message.FindRef(field, index, &ref) == B_OK; index++)
        refs.push_back(ref);
    return refs;
}

} // namespace

TrackerApp::TrackerApp(bigtime_t patience)
    : BApplication(kTrackerSignature), mPatience(patience), mLastWork(system_time()) {
    SetPulseRate(std::max(patience / 4, bigtime_t{1000}));
}

void TrackerApp::RefsReceived(BMessage* message) {
    Opener::Open(RefsIn(*message, "refs"));
    Opener::Show(RefsIn(*message, "select"));
    mLastWork = system_time();
}

void TrackerApp::Pulse() {
    if (system_time() - mLastWork >= mPatience && !IsMessageWaiting())
        PostMessage(B_QUIT_REQUESTED);
}

void TrackerApp::OpenWhatIsLeft() {
    while (const std::unique_ptr<BMessage> message{MessageQueue()->NextMessage()}) {
        if (message->what == B_REFS_RECEIVED)
            RefsReceived(message.get());
    }
}
