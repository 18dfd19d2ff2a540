// BLooper: a thread that takes messages from a queue and hands them to its handlers.
#pragma once

#include <Handler.h>
#include <OS.h>

class BMessageQueue;
class LooperState;

inline constexpr int32 B_LOOPER_PORT_DEFAULT_CAPACITY = 200;

// A handler itself, and the default one for messages to the looper.
//
// Life: made with new, locked by the thread that makes it. Run() starts its thread and gives that lock up;
// from then on it is ended by Quit() or a B_QUIT_REQUESTED message and deletes itself. Never on the stack,
// never deleted by others once it runs (BApplication is the exception). Handlers that were added are not
// deleted with it, filters are. Threads: hooks and handlers run in the looper's thread with the looper
// locked. PostMessage(), Lock(), LockWithTimeout(), Unlock(), IsLocked(), Thread() and messengers may be used
// by any thread, also while the looper goes away: Lock() then fails, PostMessage() answers B_BAD_PORT_ID.
// Everything else wants the lock. Queue: PostMessage() always finds room. `portCapacity` is the number of
// waiting messages from which on BMessenger::SendMessage() waits for its time-out.
class BLooper : public BHandler {
  public:
    explicit BLooper(const char* name = nullptr, int32 priority = B_NORMAL_PRIORITY,
                     int32 portCapacity = B_LOOPER_PORT_DEFAULT_CAPACITY);
    explicit BLooper(BMessage* from);
    // Before Run(), or from Quit() only.
    ~BLooper() override;

    static BArchivable* Instantiate(BMessage* from);
    status_t Archive(BMessage* into, bool deep = true) const override;

    // The handler must belong to this looper, B_MISMATCHED_VALUES otherwise; with a null handler the
    // preferred one gets the message when it arrives. Without `replyTo` replies go to the application.
    status_t PostMessage(uint32 command);
    status_t PostMessage(BMessage* message);
    status_t PostMessage(uint32 command, BHandler* handler, BHandler* replyTo = nullptr);
    status_t PostMessage(BMessage* message, BHandler* handler, BHandler* replyTo = nullptr);

    virtual void DispatchMessage(BMessage* message, BHandler* handler);
    void MessageReceived(BMessage* message) override;
    // The message being dispatched; it is deleted afterwards unless DetachCurrentMessage() gave it to the
    // caller.
    BMessage* CurrentMessage() const;
    BMessage* DetachCurrentMessage();
    void DispatchExternalMessage(BMessage* message, BHandler* handler, bool& detached);
    BMessageQueue* MessageQueue() const;
    bool IsMessageWaiting() const;

    void AddHandler(BHandler* handler);
    bool RemoveHandler(BHandler* handler);
    // The looper itself is the handler at index 0.
    int32 CountHandlers() const;
    BHandler* HandlerAt(int32 index) const;
    int32 IndexOf(BHandler* handler) const;
    BHandler* PreferredHandler() const;
    void SetPreferredHandler(BHandler* handler);

    // The thread's id; or a negative status when it cannot be started, B_BAD_THREAD_STATE when it runs.
    virtual thread_id Run();
    // Wants the looper locked. Before Run() it deletes the looper. In the looper's own thread it deletes the
    // looper and ends the thread: it does not return. In any other thread the messages already queued are
    // handled first, and it returns when the looper is gone; all of the caller's locks are given up.
    virtual void Quit();
    // Asked for B_QUIT_REQUESTED; true lets the looper Quit().
    virtual bool QuitRequested();

    bool Lock();
    void Unlock();
    bool IsLocked() const;
    // B_OK, B_TIMED_OUT, B_WOULD_BLOCK (time-out of 0), or B_BAD_VALUE when the looper is gone.
    status_t LockWithTimeout(bigtime_t timeout);
    // 0 before Run().
    thread_id Thread() const;
    team_id Team() const;
    static BLooper* LooperForThread(thread_id thread);
    // The owner, or -1.
    thread_id LockingThread() const;
    int32 CountLocks() const;
    int32 CountLockRequests() const;
    sem_id Sem() const;

    BHandler* ResolveSpecifier(BMessage* message, int32 index, BMessage* specifier, int32 form,
                               const char* property) override;
    status_t GetSupportedSuites(BMessage* data) override;

    // Common filters see every message before its handler's own filters do.
    virtual void AddCommonFilter(BMessageFilter* filter);
    virtual bool RemoveCommonFilter(BMessageFilter* filter);
    virtual void SetCommonFilterList(BList* filters);
    BList* CommonFilterList() const;

  protected:
    // Handles messages until the looper is to end. Runs unlocked in the looper's thread.
    void Loop();
    // Ends Loop() after the message at hand.
    void EndLoop() { mTerminating = true; }
    bool IsRunning() const { return mRunCalled; }
    // Who gets a message that was found to be for `target`; asked before the filters. Loopers that stand for
    // many handlers, as a window for its views, choose here. Null drops the message.
    virtual BHandler* HandlerFor(BMessage* message, BHandler* target);
    // Starts `entry(this)` as the looper's thread and gives up the constructor's lock.
    thread_id StartThread(thread_func entry);

  private:
    friend class BMessenger;
    void InitialiseLooper(int32 portCapacity);
    static int32 ThreadEntry(void* looper);
    static status_t PostTo(const BLooper* looper, const BMessage& message);
    static status_t PostTo(const BLooper* looper, const BMessage& message, BHandler* handler,
                           BHandler* replyTo);
    BHandler* TargetOf(const BMessage& message);
    BHandler* ResolveTarget(BMessage* message, BHandler* target);
    BHandler* Filtered(BMessage* message, BHandler* target);
    // False when a filter has ended the message's way.
    static bool PassesFilters(BList* filters, BMessage* message, BHandler** target);
    void AssertLocked() const;

    int32 mPriority = B_NORMAL_PRIORITY;
    std::shared_ptr<LooperState> mState;
    std::unique_ptr<BMessage> mCurrentMessage;
    BList mHandlers;
    BHandler* mPreferred = nullptr;
    std::unique_ptr<BList> mCommonFilters;
    bool mRunCalled = false;
    bool mTerminating = false;
};
