#include <CopyText.h>
#include <IdTable.h>
#include <KernelCounts.h>
#include <OS.h>
#include <WaitLimit.h>

#include "host/api/threads.h"

#include <algorithm>
#include <list>

namespace {

// A thread in the queue. It lives on that thread's stack; everything is guarded by the semaphore's mutex.
struct Request {
    explicit Request(int32 wanted) : count(wanted) {}

    const int32 count;
    bool granted = false;
    std::condition_variable decided;
};

struct Semaphore {
    char name[B_OS_NAME_LENGTH] = {};
    mutable GuardMutex mutex;
    int32 available GUARDED_BY(mutex) = 0;
    bool deleted GUARDED_BY(mutex) = false;
    thread_id latestHolder GUARDED_BY(mutex) = 0;
    std::list<Request*> queue GUARDED_BY(mutex);

    int32 Wanted() const REQUIRES(mutex) {
        int32 wanted = 0;
        for (const Request* request : queue)
            wanted += request->count;
        return wanted;
    }

    // What an outsider sees: negative when more is wanted than there is.
    int32 Count() const REQUIRES(mutex) { return available - Wanted(); }

    // Serves the queue from its head for as long as there is enough for the next one.
    void Grant() REQUIRES(mutex) {
        while (!queue.empty() && queue.front()->count <= available) {
            Request* const request = queue.front();
            queue.pop_front();
            available -= request->count;
            request->granted = true;
            request->decided.notify_one();
        }
    }
};

// Never destroyed: threads may use it while the process ends.
IdTable<Semaphore>& semaphores() {
    static IdTable<Semaphore>* const table = new IdTable<Semaphore>;
    return *table;
}

} // namespace

sem_id create_sem(int32 count, const char* name) {
    if (count < 0)
        return B_BAD_VALUE;
    auto semaphore = std::make_shared<Semaphore>();
    CopyText(semaphore->name, name);
    {
        GuardLock guard(semaphore->mutex);
        semaphore->available = count;
    }
    return semaphores().Add(std::move(semaphore));
}

status_t delete_sem(sem_id sem) {
    const std::shared_ptr<Semaphore> semaphore = semaphores().Remove(sem);
    if (semaphore == nullptr)
        return B_BAD_SEM_ID;
    GuardLock guard(semaphore->mutex);
    semaphore->deleted = true;
    for (Request* request : semaphore->queue)
        request->decided.notify_one();
    return B_OK;
}

status_t acquire_sem(sem_id sem) {
    return acquire_sem_etc(sem, 1, 0, 0);
}

status_t acquire_sem_etc(sem_id sem, int32 count, uint32 flags, bigtime_t timeout) {
    if (count < 1)
        return B_BAD_VALUE;
    const std::shared_ptr<Semaphore> semaphore = semaphores().Find(sem);
    if (semaphore == nullptr)
        return B_BAD_SEM_ID;
    WaitLimit limit(flags, timeout);
    Request request(count);
    GuardLock guard(semaphore->mutex);
    const auto place = semaphore->queue.insert(semaphore->queue.end(), &request);
    semaphore->Grant();
    bool mayWait = true;
    while (!request.granted && !semaphore->deleted && mayWait)
        mayWait = limit.Wait(request.decided, guard);
    if (request.granted) {
        semaphore->latestHolder = current_thread_identity();
        return B_OK;
    }
    semaphore->queue.erase(place);
    if (semaphore->deleted)
        return B_BAD_SEM_ID;
    // The one behind may have waited only for its turn.
    semaphore->Grant();
    return limit.Expired();
}

status_t release_sem(sem_id sem) {
    return release_sem_etc(sem, 1, 0);
}

status_t release_sem_etc(sem_id sem, int32 count, uint32 flags) {
    const bool all = (flags & B_RELEASE_ALL) != 0;
    if (count < 0 || (count == 0) != all)
        return B_BAD_VALUE;
    const std::shared_ptr<Semaphore> semaphore = semaphores().Find(sem);
    if (semaphore == nullptr)
        return B_BAD_SEM_ID;
    GuardLock guard(semaphore->mutex);
    const int32 missing = std::max(0, -semaphore->Count());
    if (all)
        count = missing;
    else if ((flags & B_RELEASE_IF_WAITING_ONLY) != 0)
        count = std::min(count, missing);
    if (count > INT32_MAX - semaphore->available)
        return B_BAD_VALUE;
    semaphore->available += count;
    semaphore->Grant();
    return B_OK;
}

status_t get_sem_count(sem_id sem, int32* count) {
    if (count == nullptr)
        return B_BAD_VALUE;
    const std::shared_ptr<Semaphore> semaphore = semaphores().Find(sem);
    if (semaphore == nullptr)
        return B_BAD_SEM_ID;
    GuardLock guard(semaphore->mutex);
    *count = semaphore->Count();
    return B_OK;
}

status_t get_sem_info(sem_id sem, sem_info* info) {
    if (info == nullptr)
        return B_BAD_VALUE;
    const std::shared_ptr<Semaphore> semaphore = semaphores().Find(sem);
    if (semaphore == nullptr)
        return B_BAD_SEM_ID;
    *info = {};
    info->sem = sem;
    info->team = host::current_process();
    CopyText(info->name, semaphore->name);
    GuardLock guard(semaphore->mutex);
    info->count = semaphore->Count();
    info->latest_holder = semaphore->latestHolder;
    return B_OK;
}

uint32 count_semaphores() {
    return semaphores().Count();
}
