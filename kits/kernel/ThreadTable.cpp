#include <CopyText.h>
#include <ThreadTable.h>

#include <algorithm>
#include <cstring>

namespace {

constexpr size_t kMaxUnobserved = 256;
// What is added to the process's own niceness, up to the greatest there is.
constexpr int kLowNiceness = 10;
constexpr int kGreatestNiceness = 19;

thread_local ThreadRecord* tRecord = nullptr;
thread_local bool tEnding = false;

void end_current_thread(ThreadRecord& record, status_t exitStatus) {
    while (!record.exitHooks.empty()) {
        const ThreadRecord::ExitHook hook = record.exitHooks.back();
        record.exitHooks.pop_back();
        hook.function(hook.data);
    }
    tEnding = true;
    tRecord = nullptr;
    ThreadTable::Get().End(record, exitStatus);
}

// Holds the record of a thread that the kits did not make, and notices the thread's end.
struct Attachment {
    std::shared_ptr<ThreadRecord> record;

    ~Attachment() {
        if (record != nullptr)
            end_current_thread(*record, B_OK);
    }
};

thread_local Attachment tAttachment;

} // namespace

ThreadRecord::ThreadRecord(thread_id threadId, const char* threadName, int32 threadPriority)
    : id(threadId), priority(threadPriority) {
    CopyText(name, threadName);
}

bool ThreadRecord::IsCalled(const char* wanted) const {
    GuardLock guard(mutex);
    return std::strcmp(name, wanted) == 0;
}

void ThreadRecord::Describe(thread_info& info) const {
    info = {};
    info.thread = id;
    info.team = host::current_process();
    info.sem = -1;
    GuardLock guard(mutex);
    CopyText(info.name, name);
    info.priority = priority;
    if (state == State::kSpawned)
        info.state = B_THREAD_SUSPENDED;
    else
        info.state = receiving ? B_THREAD_RECEIVING : B_THREAD_RUNNING;
    if (native != 0) {
        const host::thread_times times = host::processor_times(native);
        info.user_time = times.user;
        info.kernel_time = times.kernel;
    }
}

ThreadTable& ThreadTable::Get() {
    static ThreadTable* const table = new ThreadTable;
    return *table;
}

void ThreadTable::Add(std::shared_ptr<ThreadRecord> record) {
    GuardLock guard(mMutex);
    const thread_id id = record->id;
    mThreads.emplace(id, std::move(record));
}

std::shared_ptr<ThreadRecord> ThreadTable::Find(thread_id id) const {
    GuardLock guard(mMutex);
    const auto found = mThreads.find(id);
    return found != mThreads.end() ? found->second : nullptr;
}

std::shared_ptr<ThreadRecord> ThreadTable::FindByName(const char* name) const {
    GuardLock guard(mMutex);
    for (const auto& [id, record] : mThreads) {
        if (record->IsCalled(name))
            return record;
    }
    return nullptr;
}

std::shared_ptr<ThreadRecord> ThreadTable::FindAfter(thread_id id) const {
    GuardLock guard(mMutex);
    const auto found = mThreads.upper_bound(id);
    return found != mThreads.end() ? found->second : nullptr;
}

uint32 ThreadTable::Count() const {
    GuardLock guard(mMutex);
    return static_cast<uint32>(mThreads.size());
}

std::shared_ptr<ThreadRecord> ThreadTable::FindToWaitFor(thread_id id, status_t& exitStatus,
                                                         bool& unobserved) {
    unobserved = false;
    GuardLock guard(mMutex);
    const auto found = mThreads.find(id);
    if (found != mThreads.end()) {
        GuardLock recordGuard(found->second->mutex);
        found->second->waiting++;
        return found->second;
    }
    for (auto ended = mUnobserved.begin(); ended != mUnobserved.end(); ++ended) {
        if (ended->id == id) {
            exitStatus = ended->exitStatus;
            unobserved = true;
            mUnobserved.erase(ended);
            break;
        }
    }
    return nullptr;
}

void ThreadTable::End(ThreadRecord& record, status_t exitStatus) {
    GuardLock guard(mMutex);
    GuardLock recordGuard(record.mutex);
    EndLocked(record, exitStatus);
}

bool ThreadTable::EndBeforeStart(ThreadRecord& record, status_t exitStatus) {
    GuardLock guard(mMutex);
    GuardLock recordGuard(record.mutex);
    if (record.state != ThreadRecord::State::kSpawned)
        return false;
    EndLocked(record, exitStatus);
    return true;
}

void ThreadTable::EndLocked(ThreadRecord& record, status_t exitStatus) {
    record.state = ThreadRecord::State::kEnded;
    record.exitStatus = exitStatus;
    record.slotFull.store(false, std::memory_order_release);
    record.slotBytes.clear();
    if (record.waiting == 0) {
        if (record.handle.joinable())
            record.handle.detach();
        if (record.function != nullptr) {
            mUnobserved.push_back({record.id, exitStatus});
            if (mUnobserved.size() > kMaxUnobserved)
                mUnobserved.pop_front();
        }
    }
    record.changed.notify_all();
    mThreads.erase(record.id);
}

ThreadRecord* current_thread_record() {
    if (tRecord == nullptr && !tEnding) {
        const host::native_thread native = host::current_native_thread();
        auto record = std::make_shared<ThreadRecord>(current_thread_identity(),
                                                     host::thread_name(native).c_str(), B_NORMAL_PRIORITY);
        {
            GuardLock guard(record->mutex);
            record->state = ThreadRecord::State::kRunning;
            record->native = native;
        }
        ThreadTable::Get().Add(record);
        tRecord = record.get();
        tAttachment.record = std::move(record);
    }
    return tRecord;
}

ThreadRecord* known_current_thread_record() {
    return tRecord;
}

void run_thread(const std::shared_ptr<ThreadRecord>& record) {
    adopt_thread_identity(record->id);
    tRecord = record.get();
    {
        GuardLock guard(record->mutex);
        record->native = host::current_native_thread();
        host::set_thread_name(record->native, record->name);
        apply_priority(record->native, record->priority);
    }
    status_t exitStatus = B_OK;
    try {
        exitStatus = record->function(record->data);
    } catch (const ThreadExit& exit) {
        exitStatus = exit.status;
    }
    end_current_thread(*record, exitStatus);
}

void apply_priority(host::native_thread native, int32 priority) {
    host::thread_schedule schedule;
    schedule.niceness = host::process_niceness();
    if (priority < B_NORMAL_PRIORITY) {
        schedule.niceness = priority <= B_IDLE_PRIORITY
                                ? kGreatestNiceness
                                : std::min(schedule.niceness + kLowNiceness, kGreatestNiceness);
        schedule.io = host::io_class::idle;
    }
    // A refusal leaves the thread as it was, which is all that a plain user can have.
    static_cast<void>(host::set_thread_schedule(native, schedule));
}
