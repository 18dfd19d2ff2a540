#include "host/sqlite/background_task.h"
#include "host/api/threads.h"

namespace host {

void BackgroundTask::start() {
    MutexLock lock(mutex_);
    if (stopped_)
        return;
    wanted_ = true;
    if (runs_)
        return;
    // It has done its last step under the mutex, so this does not wait.
    if (thread_.joinable())
        thread_.join();
    runs_ = true;
    thread_ = std::thread([this] { run(); });
}

void BackgroundTask::run() {
    (void)set_thread_name(current_native_thread(), name_.c_str());
    (void)set_thread_schedule(current_native_thread(), {process_niceness() + 10, io_class::idle});
    MutexLock lock(mutex_);
    while (wanted_ && !stopped_) {
        wanted_ = false;
        lock.unlock();
        work_();
        lock.lock();
    }
    runs_ = false;
}

void BackgroundTask::stop() {
    std::thread ending;
    MutexLock lock(mutex_);
    stopped_ = true;
    ending.swap(thread_);
    lock.unlock();
    if (ending.joinable())
        ending.join();
}

} // namespace host
