// What is known about every thread of the process. Internal to this kit.
#pragma once

#include <OS.h>
#include <ThreadSafety.h>

#include "host/api/threads.h"

#include <atomic>
#include <deque>
#include <map>
#include <memory>
#include <thread>
#include <vector>

// One thread. Lock order: the table's mutex, then a record's.
struct ThreadRecord : std::enable_shared_from_this<ThreadRecord> {
    enum class State { kSpawned, kRunning, kEnded };

    struct ExitHook {
        void (*function)(void*);
        void* data;
    };

    ThreadRecord(thread_id threadId, const char* threadName, int32 threadPriority);

    const thread_id id;
    // Null for a thread that spawn_thread() did not make.
    thread_func function = nullptr;
    void* data = nullptr;

    // Whether the slot is full; written under the mutex, read without it.
    std::atomic<bool> slotFull{false};

    // Only the thread itself uses them.
    std::vector<ExitHook> exitHooks;

    mutable GuardMutex mutex;
    // Notified when the slot or the state changes and when the thread has been joined.
    std::condition_variable changed;
    State state GUARDED_BY(mutex) = State::kSpawned;
    char name[B_OS_NAME_LENGTH] GUARDED_BY(mutex);
    int32 priority GUARDED_BY(mutex);
    // 0 until the thread runs.
    host::native_thread native GUARDED_BY(mutex) = 0;
    std::thread handle GUARDED_BY(mutex);
    bool joined GUARDED_BY(mutex) = false;
    status_t exitStatus GUARDED_BY(mutex) = B_OK;
    // How many threads wait for the end. Once one does, it is for the waiting ones to join the thread.
    int32 waiting GUARDED_BY(mutex) = 0;
    bool receiving GUARDED_BY(mutex) = false;
    thread_id slotSender GUARDED_BY(mutex) = 0;
    int32 slotCode GUARDED_BY(mutex) = 0;
    std::vector<char> slotBytes GUARDED_BY(mutex);

    // True when that is the name.
    bool IsCalled(const char* wanted) const;
    void Describe(thread_info& info) const;
};

// All threads that have not ended, and the exit statuses of the last ones that ended while nobody waited. Any
// thread.
class ThreadTable {
  public:
    // Never destroyed: threads may end after the process has begun to.
    static ThreadTable& Get();

    void Add(std::shared_ptr<ThreadRecord> record);
    // Null for a thread that is unknown or has ended.
    std::shared_ptr<ThreadRecord> Find(thread_id id) const;
    std::shared_ptr<ThreadRecord> FindByName(const char* name) const;
    // The first with an id greater than this one.
    std::shared_ptr<ThreadRecord> FindAfter(thread_id id) const;
    uint32 Count() const;

    // As Find(), and counts the caller among those who wait. Where it answers null, `unobserved` tells
    // whether `exitStatus` is that of a thread that had ended before anybody waited, told only this once.
    std::shared_ptr<ThreadRecord> FindToWaitFor(thread_id id, status_t& exitStatus, bool& unobserved);

    // Marks the thread as ended, wakes everyone at it and takes it out, in one step.
    void End(ThreadRecord& record, status_t exitStatus);
    // The same for a thread that was never started. False when it was.
    bool EndBeforeStart(ThreadRecord& record, status_t exitStatus);

  private:
    struct Ended {
        thread_id id;
        status_t exitStatus;
    };

    void EndLocked(ThreadRecord& record, status_t exitStatus) REQUIRES(mMutex) REQUIRES(record.mutex);

    mutable GuardMutex mMutex;
    std::map<thread_id, std::shared_ptr<ThreadRecord>> mThreads GUARDED_BY(mMutex);
    std::deque<Ended> mUnobserved GUARDED_BY(mMutex);
};

// The calling thread's record, made when it has none yet. Null once the thread is ending, when nothing more
// can be sent to it.
ThreadRecord* current_thread_record();
// The same, but null when there is none yet.
ThreadRecord* known_current_thread_record();

// What a started thread runs.
void run_thread(const std::shared_ptr<ThreadRecord>& record);

// Thrown by exit_thread() through a spawned thread's function to run_thread().
struct ThreadExit {
    status_t status;
};

// Applies a priority to a running thread, as far as the system lets it.
void apply_priority(host::native_thread native, int32 priority);
