#include "outgoing_connection.h"

#include "host/api/threads.h"
#include "local_endpoint.h"
#include "runtime_files.h"

#include <algorithm>
#include <array>
#include <chrono>
#include <climits>
#include <cstring>
#include <poll.h>
#include <sys/epoll.h>
#include <sys/socket.h>
#include <sys/un.h>
#include <unistd.h>

namespace host {

namespace {

constexpr std::int64_t millisecond = 1'000'000;
// A deadline that never comes, but that clocks can still be compared with.
constexpr std::int64_t never = std::int64_t{100} * 365 * 24 * 3600 * 1'000'000'000;

struct Connections {
    Mutex mutex;
    std::unordered_map<std::int32_t, std::shared_ptr<OutgoingConnection>> by_process GUARDED_BY(mutex);
};

Connections& connections() {
    static Connections* const kept = new Connections;
    return *kept;
}

std::chrono::steady_clock::time_point time_point(std::int64_t deadline) {
    return std::chrono::steady_clock::time_point(std::chrono::nanoseconds(std::min(deadline, never)));
}

// False when the deadline has come first.
bool wait_until_writable(const Descriptor& socket, std::int64_t deadline) {
    for (;;) {
        const std::int64_t left = deadline - uptime_nanoseconds();
        if (left <= 0)
            return false;
        pollfd waited = {socket.get(), POLLOUT, 0};
        const std::int64_t milliseconds = (left - 1) / millisecond + 1;
        if (::poll(&waited, 1, static_cast<int>(std::min<std::int64_t>(milliseconds, INT_MAX))) > 0)
            return true;
    }
}

} // namespace

Result<std::shared_ptr<OutgoingConnection>> OutgoingConnection::to(std::int32_t process,
                                                                   std::int64_t deadline) {
    {
        Connections& kept = connections();
        MutexLock lock(kept.mutex);
        const auto found = kept.by_process.find(process);
        if (found != kept.by_process.end())
            return found->second;
    }
    return connect(process, deadline);
}

Result<std::shared_ptr<OutgoingConnection>> OutgoingConnection::connect(std::int32_t process,
                                                                        std::int64_t deadline) {
    const Result<Descriptor> directory = open_runtime_directory();
    if (!directory)
        return Status(ESRCH);
    Descriptor socket(::socket(AF_UNIX, SOCK_STREAM | SOCK_CLOEXEC | SOCK_NONBLOCK, 0));
    if (!socket.valid())
        return Status(errno);
    sockaddr_un address = {};
    address.sun_family = AF_UNIX;
    const std::string path = socket_path(*directory, process);
    std::memcpy(address.sun_path, path.c_str(), path.size() + 1);
    while (::connect(socket.get(), reinterpret_cast<const sockaddr*>(&address), sizeof(address)) != 0) {
        // EAGAIN: many others wait to be accepted there.
        if (errno != EAGAIN && errno != EINTR)
            return Status(errno == EACCES ? EACCES : ESRCH);
        if (uptime_nanoseconds() >= deadline)
            return Status(ETIMEDOUT);
        sleep_until(uptime_nanoseconds() + millisecond);
    }
    ucred credentials = {};
    socklen_t size = sizeof(credentials);
    if (::getsockopt(socket.get(), SOL_SOCKET, SO_PEERCRED, &credentials, &size) != 0 ||
        credentials.uid != ::geteuid())
        return Status(EACCES);
    auto made = std::make_shared<OutgoingConnection>(std::move(socket), process);
    if (!made->keep())
        return Status(ENOMEM);
    return made;
}

bool OutgoingConnection::keep() {
    Connections& kept = connections();
    MutexLock lock(kept.mutex);
    // With the lock held: the event thread cannot end it before it is kept.
    watch_ = EventThread::instance().watch(
        socket_.get(), EPOLLIN, [self = shared_from_this()](std::uint32_t) { self->read_answers(); });
    if (watch_ == 0)
        return false;
    kept.by_process[process_] = shared_from_this();
    return true;
}

Result<std::int32_t> OutgoingConnection::request(std::span<const char> body, std::int64_t deadline) {
    if (const Status begun = begin_writing(deadline); !begun)
        return begun;
    std::uint32_t sequence = 0;
    {
        MutexLock lock(mutex_);
        sequence = next_sequence_++;
        answers_[sequence] = std::nullopt;
    }
    char head[frame_header_size];
    write_frame_header({FrameKind::request, sequence, static_cast<std::uint32_t>(body.size())}, head);
    Written written{0, flush_remainder(deadline).error()};
    if (written.error == 0)
        written = write(head, body, deadline);
    if (written.error == ETIMEDOUT && written.bytes > 0) {
        // Half a frame cannot be taken back.
        const std::size_t of_head = std::min(written.bytes, sizeof(head));
        remainder_.assign(head + of_head, head + sizeof(head));
        remainder_.insert(remainder_.end(),
                          body.begin() + static_cast<std::ptrdiff_t>(written.bytes - of_head), body.end());
    }
    end_writing();
    if (written.error == 0)
        return wait_for_answer(sequence, deadline);
    {
        MutexLock lock(mutex_);
        answers_.erase(sequence);
    }
    if (written.error == ETIMEDOUT)
        return Status(ETIMEDOUT);
    end();
    return Status(written.bytes > 0 ? ECONNRESET : EPIPE);
}

Status OutgoingConnection::begin_writing(std::int64_t deadline) {
    MutexLock lock(mutex_);
    while (writing_ && !ended_) {
        if (changed_.wait_until(lock, time_point(deadline)) == std::cv_status::timeout && writing_)
            return ETIMEDOUT;
    }
    if (ended_)
        return EPIPE;
    writing_ = true;
    return {};
}

void OutgoingConnection::end_writing() {
    MutexLock lock(mutex_);
    writing_ = false;
    changed_.notify_all();
}

Status OutgoingConnection::flush_remainder(std::int64_t deadline) {
    if (remainder_.empty())
        return {};
    const Written written = write(remainder_, {}, deadline);
    remainder_.erase(remainder_.begin(), remainder_.begin() + static_cast<std::ptrdiff_t>(written.bytes));
    return written.error;
}

OutgoingConnection::Written OutgoingConnection::write(std::span<const char> head, std::span<const char> body,
                                                      std::int64_t deadline) {
    Written written;
    const std::size_t total = head.size() + body.size();
    while (written.bytes < total) {
        const std::size_t of_head = std::min(written.bytes, head.size());
        const std::span<const char> rest_of_head = head.subspan(of_head);
        const std::span<const char> rest_of_body = body.subspan(written.bytes - of_head);
        iovec parts[2] = {{const_cast<char*>(rest_of_head.data()), rest_of_head.size()},
                          {const_cast<char*>(rest_of_body.data()), rest_of_body.size()}};
        msghdr message = {};
        message.msg_iov = parts;
        message.msg_iovlen = 2;
        const ssize_t count = ::sendmsg(socket_.get(), &message, MSG_DONTWAIT | MSG_NOSIGNAL);
        if (count >= 0) {
            written.bytes += static_cast<std::size_t>(count);
        } else if (errno == EAGAIN) {
            if (!wait_until_writable(socket_, deadline)) {
                written.error = ETIMEDOUT;
                return written;
            }
        } else if (errno != EINTR) {
            written.error = errno;
            return written;
        }
    }
    return written;
}

Result<std::int32_t> OutgoingConnection::wait_for_answer(std::uint32_t sequence, std::int64_t deadline) {
    MutexLock lock(mutex_);
    std::cv_status waited = std::cv_status::no_timeout;
    while (!answers_[sequence] && !ended_ && waited == std::cv_status::no_timeout)
        waited = changed_.wait_until(lock, time_point(deadline));
    const std::optional<std::int32_t> answer = answers_[sequence];
    answers_.erase(sequence);
    if (answer)
        return *answer;
    return Status(ended_ ? ECONNRESET : ETIMEDOUT);
}

void OutgoingConnection::read_answers() {
    std::array<char, 4096> buffer;
    const ssize_t count = ::recv(socket_.get(), buffer.data(), buffer.size(), MSG_DONTWAIT);
    if (count < 0 && (errno == EAGAIN || errno == EINTR))
        return;
    if (count <= 0) {
        end();
        return;
    }
    std::span<const char> bytes(buffer.data(), static_cast<std::size_t>(count));
    while (!bytes.empty()) {
        const FrameReader::State state = reader_.take(bytes);
        if (state == FrameReader::State::needs_more)
            return;
        if (state == FrameReader::State::broken || reader_.header().kind != FrameKind::answer) {
            end();
            return;
        }
        take_answer();
    }
}

void OutgoingConnection::take_answer() {
    std::int32_t status = 0;
    std::memcpy(&status, reader_.body().data(), sizeof(status));
    MutexLock lock(mutex_);
    const auto waiting = answers_.find(reader_.header().sequence);
    // Who has lost patience meanwhile is not there any more.
    if (waiting == answers_.end())
        return;
    waiting->second = status;
    changed_.notify_all();
}

void OutgoingConnection::end() {
    {
        Connections& kept = connections();
        MutexLock lock(kept.mutex);
        const auto found = kept.by_process.find(process_);
        if (found != kept.by_process.end() && found->second.get() == this)
            kept.by_process.erase(found);
    }
    {
        MutexLock lock(mutex_);
        if (ended_)
            return;
        ended_ = true;
        changed_.notify_all();
    }
    ::shutdown(socket_.get(), SHUT_RDWR);
    EventThread::instance().forget(watch_, socket_.get());
    // Told in the event thread, as everything is.
    EventThread::instance().call_at(0, [process = process_] {
        if (LocalReceiver* receiver = LocalEndpoint::instance().receiver())
            receiver->gone(process);
    });
}

Result<std::int32_t> send_local_request(std::int32_t process, std::span<const char> request,
                                        std::int64_t deadline) {
    if (EventThread::is_current())
        return Status(EDEADLK);
    if (request.size() > largest_local_request)
        return Status(EMSGSIZE);
    if (process <= 0)
        return Status(ESRCH);
    // A kept connection may have ended unnoticed; a fresh one tells whether the process is there.
    for (bool first = true;; first = false) {
        const auto connection = OutgoingConnection::to(process, deadline);
        if (!connection)
            return connection.status();
        const Result<std::int32_t> answer = (*connection)->request(request, deadline);
        if (answer || answer.error() != EPIPE)
            return answer;
        if (!first)
            return Status(ESRCH);
    }
}

} // namespace host
