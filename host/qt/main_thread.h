// What other threads ask the main thread to do.
#pragma once

#include "host/api/thread_safety.h"

#include <deque>
#include <functional>

namespace host {

// A queue of tasks, carried out in order by the thread that runs Qt's events. Any thread may add; tasks that
// come before there is an application object wait for it.
class MainThread {
  public:
    static MainThread& instance();

    void add(std::function<void()> task) EXCLUDES(mutex_);
    // On the main thread, once the application object is there: tasks run from now on.
    void start() EXCLUDES(mutex_);
    // Whether this is that thread; false before start().
    bool is_current() const;

  private:
    class Bell;

    void carry_out() EXCLUDES(mutex_);

    Mutex mutex_;
    std::deque<std::function<void()>> tasks_ GUARDED_BY(mutex_);
    // Never deleted: threads may add tasks until the process ends.
    Bell* bell_ GUARDED_BY(mutex_) = nullptr;
    bool rung_ GUARDED_BY(mutex_) = false;
};

} // namespace host
