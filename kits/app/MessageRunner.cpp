#include <MessageRunner.h>

#include <ThreadSafety.h>

#include <algorithm>
#include <chrono>
#include <map>
#include <utility>

namespace {

struct Job {
    BMessenger target;
    BMessage message;
    BMessenger replyTo;
    bigtime_t interval = 0;
    int32 count = -1;
    bigtime_t due = 0;
};

// All jobs and the thread that serves them. The thread is started with the first job and ends with the last.
class RunnerService {
  public:
    static RunnerService& Instance() {
        static RunnerService* const service = new RunnerService;
        return *service;
    }

    // The job's id, or a negative status.
    int32 Add(const Job& job) {
        GuardLock guard(mMutex);
        const int32 id = mNext++;
        mJobs[id] = job;
        if (!mServing) {
            const thread_id thread = spawn_thread(&Serve, "message runners", B_NORMAL_PRIORITY, this);
            if (thread < 0 || resume_thread(thread) != B_OK) {
                mJobs.erase(id);
                return B_NO_MORE_THREADS;
            }
            mServing = true;
        }
        mChanged.notify_one();
        return id;
    }

    void Remove(int32 id) {
        GuardLock guard(mMutex);
        mJobs.erase(id);
        mChanged.notify_one();
    }

    template <typename Change>
    status_t Modify(int32 id, Change change) {
        GuardLock guard(mMutex);
        const auto found = mJobs.find(id);
        if (found == mJobs.end())
            return B_BAD_VALUE;
        change(found->second);
        mChanged.notify_one();
        return B_OK;
    }

  private:
    static int32 Serve(void* data) {
        RunnerService* service = static_cast<RunnerService*>(data);
        GuardLock guard(service->mMutex);
        while (!service->mJobs.empty()) {
            const auto next =
                std::min_element(service->mJobs.begin(), service->mJobs.end(),
                                 [](const auto& a, const auto& b) { return a.second.due < b.second.due; });
            const bigtime_t wait = next->second.due - system_time();
            if (wait > 0) {
                constexpr bigtime_t kLongest = bigtime_t{3600} * 1000000;
                service->mChanged.wait_for(guard.Native(),
                                           std::chrono::microseconds(std::min(wait, kLongest)));
                continue;
            }
            service->Send(next);
        }
        service->mServing = false;
        return 0;
    }

    // Sends with the mutex held, so that nothing is sent once Remove() has returned; a full queue skips a
    // turn instead of waiting.
    void Send(std::map<int32, Job>::iterator next) REQUIRES(mMutex) {
        Job& job = next->second;
        const status_t status = job.target.SendMessage(&job.message, job.replyTo, 0);
        if (job.count > 0)
            job.count--;
        // Turns that were missed are not made up for.
        job.due = std::max(job.due + job.interval, system_time());
        if (status == B_BAD_PORT_ID || job.count == 0)
            mJobs.erase(next);
    }

    GuardMutex mMutex;
    std::condition_variable mChanged;
    bool mServing GUARDED_BY(mMutex) = false;
    int32 mNext GUARDED_BY(mMutex) = 1;
    std::map<int32, Job> mJobs GUARDED_BY(mMutex);
};

int32 StartJob(const BMessenger& target, const BMessage* message, bigtime_t interval, int32 count,
               const BMessenger& replyTo) {
    if (message == nullptr || !target.IsValid() || interval <= 0)
        return B_BAD_VALUE;
    if (count == 0)
        return 0;
    return RunnerService::Instance().Add(
        {target, *message, replyTo, interval, count, system_time() + interval});
}

} // namespace

BMessageRunner::BMessageRunner(BMessenger target, const BMessage* message, bigtime_t interval, int32 count)
    : BMessageRunner(target, message, interval, count, BMessenger()) {}

BMessageRunner::BMessageRunner(BMessenger target, const BMessage* message, bigtime_t interval, int32 count,
                               BMessenger replyTo)
    : mId(StartJob(target, message, interval, count, replyTo)), mInitStatus(mId < 0 ? mId : B_OK) {}

BMessageRunner::~BMessageRunner() {
    if (mId > 0)
        RunnerService::Instance().Remove(mId);
}

status_t BMessageRunner::StartSending(BMessenger target, const BMessage* message, bigtime_t interval,
                                      int32 count) {
    const int32 id = StartJob(target, message, interval, count, BMessenger());
    return id < 0 ? id : B_OK;
}

status_t BMessageRunner::InitCheck() const {
    return mInitStatus;
}

status_t BMessageRunner::SetInterval(bigtime_t interval) {
    if (interval <= 0)
        return B_BAD_VALUE;
    return RunnerService::Instance().Modify(mId, [interval](Job& job) {
        job.interval = interval;
        job.due = system_time() + interval;
    });
}

status_t BMessageRunner::SetCount(int32 count) {
    if (count == 0)
        return B_BAD_VALUE;
    return RunnerService::Instance().Modify(mId, [count](Job& job) { job.count = count; });
}

status_t BMessageRunner::GetInfo(bigtime_t* interval, int32* count) const {
    return RunnerService::Instance().Modify(mId, [interval, count](const Job& job) {
        if (interval != nullptr)
            *interval = job.interval;
        if (count != nullptr)
            *count = job.count;
    });
}
