#include "host/api/termination.h"

#include "host/linux/descriptor.h"
#include <array>
#include <atomic>
#include <cerrno>
#include <csignal>
#include <cstdint>
#include <sys/eventfd.h>
#include <thread>
#include <unistd.h>
#include <utility>

namespace host {

namespace {

constexpr std::array kSignals = {SIGTERM, SIGINT, SIGHUP};
constexpr std::uint64_t kAsked = 1;
// Larger than all requests that can come before the handlers are gone.
constexpr std::uint64_t kEnd = std::uint64_t{1} << 32;

// What the handler writes to; -1 while there is no watch.
std::atomic<int> watched_event{-1};
static_assert(std::atomic<int>::is_always_lock_free, "it is used in a signal handler");

void note(int signal) {
    const int saved_error = errno;
    (void)!::write(watched_event.load(), &kAsked, sizeof(kAsked));
    std::signal(signal, SIG_DFL);
    errno = saved_error;
}

class TerminationWatch {
  public:
    TerminationWatch(Descriptor event, std::function<void()> asked)
        : event_(std::move(event)), asked_(std::move(asked)) {
        for (std::size_t i = 0; i < kSignals.size(); ++i)
            install(kSignals[i], previous_[i]);
        thread_ = std::thread([this] { run(); });
    }
    ~TerminationWatch() {
        for (std::size_t i = 0; i < kSignals.size(); ++i)
            ::sigaction(kSignals[i], &previous_[i], nullptr);
        (void)!::write(event_.get(), &kEnd, sizeof(kEnd));
        thread_.join();
        watched_event = -1;
    }
    TerminationWatch(const TerminationWatch&) = delete;
    TerminationWatch& operator=(const TerminationWatch&) = delete;

  private:
    static void install(int signal, struct sigaction& previous) {
        ::sigaction(signal, nullptr, &previous);
        if (previous.sa_handler == SIG_IGN)
            return;
        struct sigaction action = {};
        action.sa_handler = note;
        action.sa_flags = SA_RESTART;
        ::sigaction(signal, &action, nullptr);
    }

    void run() {
        std::uint64_t value = 0;
        for (;;) {
            const ssize_t size = ::read(event_.get(), &value, sizeof(value));
            if (size < 0 && errno == EINTR)
                continue;
            if (size != sizeof(value) || value >= kEnd)
                return;
            asked_();
        }
    }

    const Descriptor event_;
    const std::function<void()> asked_;
    std::array<struct sigaction, kSignals.size()> previous_ = {};
    std::thread thread_;
};

} // namespace

std::shared_ptr<void> watch_for_termination(std::function<void()> asked) {
    Descriptor event(::eventfd(0, EFD_CLOEXEC));
    int none = -1;
    if (!event.valid() || !watched_event.compare_exchange_strong(none, event.get()))
        return nullptr;
    return std::make_shared<TerminationWatch>(std::move(event), std::move(asked));
}

} // namespace host
