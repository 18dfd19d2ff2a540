#pragma once

#include "descriptor.h"
#include "host/api/thread_safety.h"
#include <cstdint>
#include <functional>
#include <map>
#include <memory>
#include <unordered_map>

namespace host {

/// The one thread of this process that waits for sockets, ended children and changed directories, and calls
/// whoever watches them. Handlers run in that thread, one at a time, and must not wait for anything. All
/// calls from any thread, handlers included.
class EventThread {
  public:
    /// Started when first asked for; runs until the process ends.
    static EventThread& instance();

    using Handler = std::function<void(std::uint32_t events)>;
    /// A watched descriptor; 0 is none.
    using Watch = std::uint64_t;

    /// `events` as for epoll, level-triggered. The descriptor must stay open until forget(). 0 when the
    /// system refuses.
    Watch watch(int descriptor, std::uint32_t events, Handler handler);
    void change(Watch watch, int descriptor, std::uint32_t events);
    /// The handler is not called any more, save for a call that is under way.
    void forget(Watch watch, int descriptor);

    /// Calls once, at that uptime_nanoseconds() or soon after.
    void call_at(std::int64_t time, std::function<void()> call);

    /// True in the thread itself.
    static bool is_current();

  private:
    EventThread();
    void run();
    void call_due();
    int milliseconds_to_wait();
    void wake();

    const Descriptor epoll_;
    const Descriptor bell_;
    Mutex mutex_;
    Watch next_ GUARDED_BY(mutex_) = 1;
    std::unordered_map<Watch, std::shared_ptr<Handler>> handlers_ GUARDED_BY(mutex_);
    std::multimap<std::int64_t, std::function<void()>> calls_ GUARDED_BY(mutex_);
};

} // namespace host
