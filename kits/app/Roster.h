// BRoster: the applications that run and those that can be started.
#pragma once

#include <List.h>
#include <Messenger.h>

inline constexpr size_t kSignatureLength = 256;

// How often an application may run. Single: once for each of its executables; exclusive: once, whatever the
// executable; multiple: as often as it is started. Those two flags aside, B_BACKGROUND_APP is not brought to
// the front when it is started again, and B_ARGV_ONLY is given nothing but its command line when it is
// launched. Which flags an application has stands in its record (docs/applications.md); one without a record
// is B_MULTIPLE_LAUNCH.
enum : uint32 {
    B_SINGLE_LAUNCH = 0x0,
    B_MULTIPLE_LAUNCH = 0x1,
    B_EXCLUSIVE_LAUNCH = 0x2,
    B_LAUNCH_MASK = 0x3,
    B_BACKGROUND_APP = 0x4,
    B_ARGV_ONLY = 0x8,
};

// What StartWatching() tells, and what is asked of it. The messages hold "be:signature" (string), "be:team",
// "be:thread", "be:flags" (int32) and "be:ref" (the executable).
enum : uint32 {
    B_REQUEST_LAUNCHED = 0x1,
    B_REQUEST_QUIT = 0x2,
};
enum : uint32 {
    B_SOME_APP_LAUNCHED = 'BRAS',
    B_SOME_APP_QUIT = 'BRAQ',
};

struct app_info {
    // The application's looper thread, a number of its own process.
    thread_id thread = -1;
    team_id team = -1;
    // Nothing is reached by a port across processes.
    port_id port = -1;
    uint32 flags = B_MULTIPLE_LAUNCH;
    // The executable.
    entry_ref ref;
    char signature[kSignatureLength] = {};
};

// Every application of this user that runs, in whatever process, from the call of BApplication::Run() to the
// end of its loop: an application object that is never run is not among them. A process that was killed is
// not either. Signatures are compared without regard to case. Any thread; needs no BApplication.
//
// Errors: B_BAD_VALUE for null, B_ERROR for a signature or executable that does not run, B_BAD_TEAM_ID for a
// team that is no running application.
class BRoster {
  public:
    BRoster();
    ~BRoster();

    bool IsRunning(const char* signature) const;
    bool IsRunning(const entry_ref* executable) const;
    // The team that has run longest when there are several; B_ERROR.
    team_id TeamFor(const char* signature) const;
    team_id TeamFor(const entry_ref* executable) const;
    // Adds the teams, as numbers in place of pointers, those that have run longest first.
    void GetAppList(BList* teams) const;
    void GetAppList(const char* signature, BList* teams) const;
    status_t GetAppInfo(const char* signature, app_info* info) const;
    status_t GetAppInfo(const entry_ref* executable, app_info* info) const;
    status_t GetRunningAppInfo(team_id team, app_info* info) const;

    // The executable of an application (by its signature), or of the preferred application of a MIME type:
    // the one in the type's record, else the desktop's. Where signatures are looked up is described in
    // docs/applications.md. B_LAUNCH_FAILED_APP_NOT_FOUND when the signature's program is not there,
    // B_LAUNCH_FAILED_NO_PREFERRED_APP when nothing opens the type, B_BAD_VALUE.
    status_t FindApp(const char* mimeType, entry_ref* app) const;
    // The executable that opens this file: itself when it is one. Also B_ENTRY_NOT_FOUND.
    status_t FindApp(const entry_ref* ref, entry_ref* app) const;

    // Starts the application that FindApp() finds. Messages and arguments reach it before ReadyToRun();
    // `args` are those after the program's name, and ArgvReceived() sees the name in front of them. Returns
    // when the application runs, so that it can be sent messages, or has ended. Where it may run only once
    // and does, it gets the messages, or B_ARGV_RECEIVED, or B_SILENT_RELAUNCH without either, and comes to
    // the front: B_ALREADY_RUNNING. `team`, which may be null, receives its team in both cases.
    // Messages are copied. Also B_LAUNCH_FAILED when it could not be started or ended before it ran;
    // B_TIMED_OUT when after ten seconds it does not run although its process lives.
    // A program of the desktop (the preferred one of a type, or an executable without a record) need not be
    // built on the kits and is not waited for: from messages it gets the paths of their "refs".
    status_t Launch(const char* mimeType, const BMessage* message = nullptr, team_id* team = nullptr) const;
    status_t Launch(const char* mimeType, const BList* messages, team_id* team = nullptr) const;
    status_t Launch(const char* mimeType, int argc, const char* const* args, team_id* team = nullptr) const;
    // An executable; or a document, which the application that opens it gets as B_REFS_RECEIVED in front of
    // the messages, or as its last argument.
    status_t Launch(const entry_ref* ref, const BMessage* message = nullptr, team_id* team = nullptr) const;
    status_t Launch(const entry_ref* ref, const BList* messages, team_id* team = nullptr) const;
    status_t Launch(const entry_ref* ref, int argc, const char* const* args, team_id* team = nullptr) const;

    // Asks the application to bring its windows to the front. B_BAD_TEAM_ID.
    status_t ActivateApp(team_id team) const;

    // Tells `target`, which lies in this process, of applications that begin or end from now on. A target
    // whose queue is full misses what happens meanwhile. Called again it replaces the events. B_BAD_VALUE for
    // a target elsewhere, for no event and for one that is none of the above.
    status_t StartWatching(BMessenger target, uint32 events = B_REQUEST_LAUNCHED | B_REQUEST_QUIT) const;
    // B_BAD_VALUE for a target that is not told.
    status_t StopWatching(BMessenger target) const;

    // Sends a copy to the application of this process, if there is one, and to no other process; replies to
    // `replyTo`, or to the application.
    status_t Broadcast(BMessage* message) const;
    status_t Broadcast(BMessage* message, BMessenger replyTo) const;
};

extern const BRoster* be_roster;
