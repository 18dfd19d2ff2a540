#include "event_thread.h"

#include "host/api/threads.h"

#include <algorithm>
#include <array>
#include <csignal>
#include <sys/epoll.h>
#include <sys/eventfd.h>
#include <thread>
#include <unistd.h>
#include <vector>

namespace host {

namespace {

constexpr EventThread::Watch bell_watch = 0;
constexpr std::int64_t nanoseconds_per_millisecond = 1'000'000;

thread_local bool is_event_thread = false;

} // namespace

EventThread& EventThread::instance() {
    // Never destroyed: the thread runs until the very end of the process.
    static EventThread* const thread = new EventThread;
    return *thread;
}

EventThread::EventThread()
    : epoll_(::epoll_create1(EPOLL_CLOEXEC)), bell_(::eventfd(0, EFD_CLOEXEC | EFD_NONBLOCK)) {
    epoll_event event = {};
    event.events = EPOLLIN;
    event.data.u64 = bell_watch;
    ::epoll_ctl(epoll_.get(), EPOLL_CTL_ADD, bell_.get(), &event);
    // Signals are for the threads of the program that expects them; a new thread inherits the mask.
    sigset_t all;
    sigset_t before;
    sigfillset(&all);
    pthread_sigmask(SIG_SETMASK, &all, &before);
    std::thread([this] { run(); }).detach();
    pthread_sigmask(SIG_SETMASK, &before, nullptr);
}

bool EventThread::is_current() {
    return is_event_thread;
}

EventThread::Watch EventThread::watch(int descriptor, std::uint32_t events, Handler handler) {
    MutexLock lock(mutex_);
    const Watch watch = next_++;
    epoll_event event = {};
    event.events = events;
    event.data.u64 = watch;
    if (::epoll_ctl(epoll_.get(), EPOLL_CTL_ADD, descriptor, &event) != 0)
        return 0;
    handlers_[watch] = std::make_shared<Handler>(std::move(handler));
    return watch;
}

void EventThread::change(Watch watch, int descriptor, std::uint32_t events) {
    epoll_event event = {};
    event.events = events;
    event.data.u64 = watch;
    ::epoll_ctl(epoll_.get(), EPOLL_CTL_MOD, descriptor, &event);
}

void EventThread::forget(Watch watch, int descriptor) {
    std::shared_ptr<Handler> forgotten;
    MutexLock lock(mutex_);
    const auto found = handlers_.find(watch);
    if (found == handlers_.end())
        return;
    ::epoll_ctl(epoll_.get(), EPOLL_CTL_DEL, descriptor, nullptr);
    forgotten = std::move(found->second);
    handlers_.erase(found);
    // What the handler held goes away outside the lock.
    lock.unlock();
}

void EventThread::call_at(std::int64_t time, std::function<void()> call) {
    {
        MutexLock lock(mutex_);
        calls_.emplace(time, std::move(call));
    }
    if (!is_current())
        wake();
}

void EventThread::wake() {
    const std::uint64_t one = 1;
    // Only a full counter refuses, and then the thread is being woken already.
    (void)!::write(bell_.get(), &one, sizeof(one));
}

int EventThread::milliseconds_to_wait() {
    MutexLock lock(mutex_);
    if (calls_.empty())
        return -1;
    const std::int64_t left = calls_.begin()->first - uptime_nanoseconds();
    constexpr std::int64_t longest = 3'600'000;
    return static_cast<int>(std::clamp<std::int64_t>(
        (left + nanoseconds_per_millisecond - 1) / nanoseconds_per_millisecond, 0, longest));
}

void EventThread::call_due() {
    std::vector<std::function<void()>> due;
    {
        MutexLock lock(mutex_);
        const auto end = calls_.upper_bound(uptime_nanoseconds());
        for (auto call = calls_.begin(); call != end; ++call)
            due.push_back(std::move(call->second));
        calls_.erase(calls_.begin(), end);
    }
    for (const auto& call : due)
        call();
}

void EventThread::run() {
    is_event_thread = true;
    set_thread_name(current_native_thread(), "transport");
    std::array<epoll_event, 64> events;
    for (;;) {
        const int count = ::epoll_wait(epoll_.get(), events.data(), static_cast<int>(events.size()),
                                       milliseconds_to_wait());
        for (int at = 0; at < count; ++at) {
            const epoll_event& event = events[static_cast<std::size_t>(at)];
            if (event.data.u64 == bell_watch) {
                std::uint64_t rings = 0;
                (void)!::read(bell_.get(), &rings, sizeof(rings));
                continue;
            }
            std::shared_ptr<Handler> handler;
            {
                MutexLock lock(mutex_);
                const auto found = handlers_.find(event.data.u64);
                if (found != handlers_.end())
                    handler = found->second;
            }
            if (handler != nullptr)
                (*handler)(event.events);
        }
        call_due();
    }
}

} // namespace host
