#pragma once

#include "host/api/thread_safety.h"
#include <functional>
#include <string>
#include <thread>

namespace host {

/// A piece of work that is done in a thread of its own at idle priority, never twice at a time. Any thread.
class BackgroundTask {
  public:
    /// `name` is the thread's.
    BackgroundTask(std::string name, std::function<void()> work)
        : name_(std::move(name)), work_(std::move(work)) {}
    /// As stop().
    ~BackgroundTask() { stop(); }
    BackgroundTask(const BackgroundTask&) = delete;
    BackgroundTask& operator=(const BackgroundTask&) = delete;

    /// The work is done from its beginning after this call: where it is under way, once more when that ends.
    void start();
    /// Waits for the work under way, and makes start() do nothing from now on.
    void stop();

  private:
    void run();

    const std::string name_;
    const std::function<void()> work_;
    Mutex mutex_;
    std::thread thread_ GUARDED_BY(mutex_);
    bool runs_ GUARDED_BY(mutex_) = false;
    bool wanted_ GUARDED_BY(mutex_) = false;
    bool stopped_ GUARDED_BY(mutex_) = false;
};

} // namespace host
