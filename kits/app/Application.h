// BApplication: the looper that stands for the whole program.
#pragma once

#include <Looper.h>
#include <Messenger.h>

#include <vector>

class AppClaim;
class BList;
class BMessageRunner;
struct app_info;

// One for each program, made in main() before all other loopers and deleted there after Run(); Quit() does
// not delete it. Making it also makes the directory for settings.
class BApplication : public BLooper {
  public:
    // A MIME type "application/x-vnd....". Without a valid one (`error` then receives B_BAD_VALUE) the
    // program is told so on standard error and ended; with `error` it goes on with an object that cannot
    // Run().
    explicit BApplication(const char* signature);
    BApplication(const char* signature, status_t* error);
    explicit BApplication(BMessage* from);
    ~BApplication() override;

    static BArchivable* Instantiate(BMessage* from);
    status_t Archive(BMessage* into, bool deep = true) const override;
    status_t InitCheck() const;

    // The application's messages are handled in a thread of their own until Quit(); this thread runs the
    // main loop (MainLoop.h) or waits. Returns that thread's id when all is over. Meanwhile a request of the
    // system to end the program (SIGTERM, SIGINT, SIGHUP) becomes a B_QUIT_REQUESTED, a second one ends it.
    // From here to the end of the loop it is a running application (Roster.h), which other processes find by
    // its signature. Where it may run only once and another one runs, that one is given this one's arguments
    // and messages and brought to the front, and the answer is B_ALREADY_RUNNING at once, no hook having been
    // called: main() then simply ends. Of two that start at the same moment exactly one runs.
    thread_id Run() override;
    // Ends Run(), in any thread.
    void Quit() override;
    // Asks the windows, the last made first: each one that agrees (BWindow::QuitRequested()) is closed; one
    // that refuses keeps itself, the others that are left, and the application. Meanwhile the application is
    // not locked.
    bool QuitRequested() override;

    // Hooks, called in the application's thread.
    // First of all come the command line, when there are arguments in it, and the messages that it was
    // launched with; then ReadyToRun().
    virtual void ReadyToRun();
    // The program's name and the arguments, also of a later start that was handed over to this one. The
    // message at hand, B_ARGV_RECEIVED, holds "argc" (int32), "argv" and "cwd" (strings: the arguments, the
    // directory that relative names in them start from).
    virtual void ArgvReceived(int32 argc, char** argv);
    virtual void RefsReceived(BMessage* message);
    // True when a window of the program gets the focus, and when a program without a main loop is activated
    // by another (BRoster::ActivateApp()) or started again.
    virtual void AppActivated(bool active);
    virtual void AboutRequested();
    // The desktop's session may be about to end: what is to outlive the program belongs on disk now. A
    // session that does end asks with B_QUIT_REQUESTED as well; one that goes on lets the program run on.
    virtual void SaveStateRequested();
    // Every SetPulseRate() microseconds; 0, as at first, for never, also for a pulse that waits in the queue.
    virtual void Pulse();
    void SetPulseRate(bigtime_t rate);

    void MessageReceived(BMessage* message) override;
    void DispatchMessage(BMessage* message, BHandler* handler) override;
    BHandler* ResolveSpecifier(BMessage* message, int32 index, BMessage* specifier, int32 form,
                               const char* property) override;
    status_t GetSupportedSuites(BMessage* data) override;

    // All loopers of the program, the application first. A looper may be gone before the caller looks at it.
    int32 CountLoopers() const;
    BLooper* LooperAt(int32 index) const;
    // True until ReadyToRun() is called.
    bool IsLaunching() const;
    const char* Signature() const;
    bool HasSignature(const char* signature) const;
    status_t GetAppInfo(app_info* info) const;

  private:
    void Initialise(const char* signature);
    static int32 ThreadEntry(void* application);
    void HandleFirst(std::vector<std::unique_ptr<BMessage>> messages);

    std::string mSignature;
    // The desktop's, for the windows' coming to the front; read before anybody else takes it.
    std::string mActivationToken;
    // This process as a running application; null before Run().
    std::unique_ptr<AppClaim> mClaim;
    status_t mInitStatus = B_OK;
    std::atomic<bool> mReadyToRunCalled{false};
    bigtime_t mPulseRate = 0;
    std::unique_ptr<BMessageRunner> mPulse;
};

// The program's application; null while there is none.
extern BApplication* be_app;
