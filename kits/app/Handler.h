// BHandler: takes messages that a looper hands to it.
#pragma once

#include <Archivable.h>
#include <List.h>

#include <atomic>
#include <memory>
#include <string>

class BLooper;
class BMessageFilter;
class BMessenger;
class ObserverList;
class LooperState;

inline constexpr const char* B_OBSERVE_WHAT_CHANGE = "be:observe_change_what";
inline constexpr const char* B_OBSERVE_ORIGINAL_WHAT = "be:observe_orig_what";
inline constexpr uint32 B_OBSERVER_OBSERVE_ALL = 0xffffffff;

// Belongs to at most one looper, whose thread calls its hooks with the looper locked; while it belongs to
// one, every other call wants the looper locked too, except Looper(), LockLooper..., UnlockLooper and making
// a messenger. A handler that goes away takes itself out of its looper (which must be locked then), and
// messages still on their way to it are dropped.
class BHandler : public BArchivable {
  public:
    explicit BHandler(const char* name = nullptr);
    explicit BHandler(BMessage* from);
    ~BHandler() override;
    BHandler(const BHandler&) = delete;
    BHandler& operator=(const BHandler&) = delete;

    static BArchivable* Instantiate(BMessage* from);
    status_t Archive(BMessage* into, bool deep = true) const override;

    // What this class does not know goes to NextHandler(); the last one answers a sender who waits with
    // B_MESSAGE_NOT_UNDERSTOOD.
    virtual void MessageReceived(BMessage* message);

    BLooper* Looper() const;
    void SetName(const char* name);
    // Null when it has none.
    const char* Name() const;
    // The next one must belong to the same looper. A handler that is added to a looper gets the looper.
    virtual void SetNextHandler(BHandler* handler);
    BHandler* NextHandler() const;

    // A filter that is added belongs to the handler; one that is removed to the caller again. The list, like
    // its filters, is the handler's.
    virtual void AddFilter(BMessageFilter* filter);
    virtual bool RemoveFilter(BMessageFilter* filter);
    // Deletes the filters before. Takes the list over.
    virtual void SetFilterList(BList* filters);
    BList* FilterList();

    // False when the handler has no looper, or its looper is going away or changes meanwhile.
    bool LockLooper();
    // B_OK; B_BAD_VALUE, B_MISMATCHED_VALUES, B_TIMED_OUT.
    status_t LockLooperWithTimeout(bigtime_t timeout);
    void UnlockLooper();

    virtual BHandler* ResolveSpecifier(BMessage* message, int32 index, BMessage* specifier, int32 form,
                                       const char* property);
    // Adds the suites' names to "suites" and their properties to "messages".
    virtual status_t GetSupportedSuites(BMessage* data);

    // The target gets a copy of every notice of that code (of all codes) that SendNotices() sends.
    // StopWatching... answers B_NAME_NOT_FOUND when it did not watch.
    status_t StartWatching(BMessenger target, uint32 what);
    status_t StartWatchingAll(BMessenger target);
    status_t StopWatching(BMessenger target, uint32 what);
    status_t StopWatchingAll(BMessenger target);
    status_t StartWatching(BHandler* observer, uint32 what);
    status_t StartWatchingAll(BHandler* observer);
    status_t StopWatching(BHandler* observer, uint32 what);
    status_t StopWatchingAll(BHandler* observer);
    // Sends B_OBSERVER_NOTICE_CHANGE with the fields of `notice`, the code in B_OBSERVE_WHAT_CHANGE and the
    // notice's own `what` in B_OBSERVE_ORIGINAL_WHAT. Never waits for an observer.
    virtual void SendNotices(uint32 what, const BMessage* notice = nullptr);
    bool IsWatched() const;

  private:
    friend class BLooper;
    friend class BMessenger;
    void SetLooper(BLooper* looper, std::shared_ptr<LooperState> state);
    ObserverList& Observers();

    const int32 mToken;
    // Changed with the looper locked; read by anyone who is about to lock it.
    std::atomic<BLooper*> mLooper{nullptr};
    BHandler* mNextHandler = nullptr;
    std::string mName;
    bool mHasName = false;
    std::unique_ptr<BList> mFilters;
    std::unique_ptr<ObserverList> mObservers;
};
