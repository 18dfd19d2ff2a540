#include "local_peers.h"

#include "host/api/threads.h"

#include <algorithm>
#include <array>
#include <chrono>
#include <cstring>
#include <sys/epoll.h>
#include <sys/socket.h>
#include <unistd.h>

namespace host {

namespace {

constexpr std::int64_t second = 1'000'000'000;
std::atomic<std::int64_t> frame_time_limit{30 * second};

// One peer that writes without end does not keep the others from being read.
constexpr int reads_at_a_time = 16;

} // namespace

LocalPeers::LocalPeers(Descriptor listening, LocalReceiver& receiver)
    : listening_(std::move(listening)), receiver_(receiver) {}

void LocalPeers::set_frame_time_limit(std::int64_t nanoseconds) {
    frame_time_limit = nanoseconds;
}

Status LocalPeers::start() {
    listening_watch_ = EventThread::instance().watch(
        listening_.get(), EPOLLIN, [self = shared_from_this()](std::uint32_t) { self->accept_peers(); });
    return listening_watch_ != 0 ? Status() : Status(errno);
}

void LocalPeers::stop() {
    EventThread::instance().forget(listening_watch_.exchange(0), listening_.get());
    ::shutdown(listening_.get(), SHUT_RDWR);
}

void LocalPeers::finish_answers() {
    if (!EventThread::is_current() && answering_.try_lock_for(std::chrono::seconds(1)))
        answering_.unlock();
}

void LocalPeers::accept_peers() {
    for (;;) {
        Descriptor socket(::accept4(listening_.get(), nullptr, nullptr, SOCK_NONBLOCK | SOCK_CLOEXEC));
        if (socket.valid()) {
            add(std::move(socket));
            continue;
        }
        if (errno == EINTR || errno == ECONNABORTED)
            continue;
        if (errno == EMFILE || errno == ENFILE || errno == ENOBUFS || errno == ENOMEM) {
            // They go on waiting in the queue until there is room.
            const EventThread::Watch watch = listening_watch_;
            EventThread::instance().change(watch, listening_.get(), 0);
            EventThread::instance().call_at(
                uptime_nanoseconds() + second / 10, [self = shared_from_this(), watch] {
                    EventThread::instance().change(watch, self->listening_.get(), EPOLLIN);
                });
        }
        return;
    }
}

void LocalPeers::add(Descriptor socket) {
    ucred credentials = {};
    socklen_t size = sizeof(credentials);
    if (::getsockopt(socket.get(), SOL_SOCKET, SO_PEERCRED, &credentials, &size) != 0 ||
        credentials.uid != ::geteuid())
        return;
    const auto of_this_process = std::count_if(peers_.begin(), peers_.end(), [&](const auto& known) {
        return known.second.process == credentials.pid;
    });
    if (peers_.size() >= most_peers || static_cast<std::size_t>(of_this_process) >= most_peers_of_one_process)
        return;
    const std::uint64_t id = next_++;
    Peer& peer = peers_[id];
    peer.socket = std::move(socket);
    peer.process = credentials.pid;
    peer.watch = EventThread::instance().watch(
        peer.socket.get(), EPOLLIN,
        [self = shared_from_this(), id](std::uint32_t events) { self->serve(id, events); });
    if (peer.watch == 0)
        peers_.erase(id);
}

void LocalPeers::serve(std::uint64_t id, std::uint32_t events) {
    const auto found = peers_.find(id);
    if (found == peers_.end())
        return;
    const std::lock_guard answering(answering_);
    Peer& peer = found->second;
    bool stays = (events & EPOLLERR) == 0;
    if (stays && !peer.unsent.empty())
        stays = send_answers(peer);
    if (stays && peer.unsent.empty() && (events & (EPOLLIN | EPOLLHUP)) != 0)
        stays = read_requests(peer);
    if (!stays)
        drop(id);
}

bool LocalPeers::read_requests(Peer& peer) {
    static std::array<char, std::size_t{64} * 1024> buffer;
    for (int turn = 0; turn < reads_at_a_time; ++turn) {
        const ssize_t count = ::recv(peer.socket.get(), buffer.data(), buffer.size(), MSG_DONTWAIT);
        if (count < 0)
            return errno == EAGAIN || errno == EINTR;
        if (count == 0)
            return false;
        if (!take_frames(peer, {buffer.data(), static_cast<std::size_t>(count)}) || !send_answers(peer))
            return false;
        // Who does not take its answers is not read either.
        if (!peer.unsent.empty() || static_cast<std::size_t>(count) < buffer.size())
            return true;
    }
    return true;
}

bool LocalPeers::take_frames(Peer& peer, std::span<const char> bytes) {
    while (!bytes.empty()) {
        const FrameReader::State state = peer.reader.take(bytes);
        if (state == FrameReader::State::needs_more)
            break;
        if (state == FrameReader::State::broken || peer.reader.header().kind != FrameKind::request)
            return false;
        peer.frame_began = 0;
        const std::int32_t status = receiver_.received(peer.process, peer.reader.body());
        char answer[frame_header_size + answer_body_size];
        write_frame_header({FrameKind::answer, peer.reader.header().sequence, answer_body_size}, answer);
        std::memcpy(answer + frame_header_size, &status, sizeof(status));
        peer.unsent.insert(peer.unsent.end(), answer, answer + sizeof(answer));
    }
    if (peer.reader.within_frame() && peer.frame_began == 0) {
        peer.frame_began = uptime_nanoseconds();
        watch_for_stalls();
    }
    return true;
}

bool LocalPeers::send_answers(Peer& peer) {
    if (peer.unsent.empty())
        return true;
    const ssize_t count =
        ::send(peer.socket.get(), peer.unsent.data(), peer.unsent.size(), MSG_DONTWAIT | MSG_NOSIGNAL);
    if (count < 0 && errno != EAGAIN && errno != EINTR)
        return false;
    if (count > 0)
        peer.unsent.erase(peer.unsent.begin(), peer.unsent.begin() + count);
    EventThread::instance().change(peer.watch, peer.socket.get(), peer.unsent.empty() ? EPOLLIN : EPOLLOUT);
    return true;
}

void LocalPeers::drop(std::uint64_t id) {
    const auto found = peers_.find(id);
    EventThread::instance().forget(found->second.watch, found->second.socket.get());
    peers_.erase(found);
}

void LocalPeers::watch_for_stalls() {
    if (watches_for_stalls_)
        return;
    watches_for_stalls_ = true;
    EventThread::instance().call_at(uptime_nanoseconds() + frame_time_limit,
                                    [self = shared_from_this()] { self->drop_stalled(); });
}

void LocalPeers::drop_stalled() {
    watches_for_stalls_ = false;
    const std::int64_t oldest = uptime_nanoseconds() - frame_time_limit;
    std::vector<std::uint64_t> stalled;
    bool others = false;
    for (const auto& [id, peer] : peers_) {
        if (peer.frame_began != 0 && peer.frame_began <= oldest)
            stalled.push_back(id);
        else if (peer.frame_began != 0)
            others = true;
    }
    for (const std::uint64_t id : stalled)
        drop(id);
    if (others)
        watch_for_stalls();
}

} // namespace host
