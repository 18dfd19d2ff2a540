// BRoster: the applications that run.
#pragma once

#include <List.h>
#include <Messenger.h>

inline constexpr size_t kSignatureLength = 256;

struct app_info {
    // The application's looper thread, -1 before Run().
    thread_id thread = -1;
    team_id team = -1;
    port_id port = -1;
    uint32 flags = 0;
    // Default until applications are found by their files.
    entry_ref ref;
    char signature[kSignatureLength] = {};
};

// Knows the applications of this process, which is the running one or none; launching and other processes
// come with the transport between processes. Signatures are compared without regard to case. Any thread.
class BRoster {
  public:
    BRoster();
    ~BRoster();

    bool IsRunning(const char* signature) const;
    // The team, or B_ERROR when it does not run.
    team_id TeamFor(const char* signature) const;
    // Adds the teams, as numbers in place of pointers.
    void GetAppList(BList* teams) const;
    void GetAppList(const char* signature, BList* teams) const;
    // B_ERROR when it does not run, B_BAD_TEAM_ID, B_BAD_VALUE for null.
    status_t GetAppInfo(const char* signature, app_info* info) const;
    status_t GetRunningAppInfo(team_id team, app_info* info) const;
    // Sends a copy to every running application; replies to `replyTo`, or to the application.
    status_t Broadcast(BMessage* message) const;
    status_t Broadcast(BMessage* message, BMessenger replyTo) const;
};

extern const BRoster* be_roster;
