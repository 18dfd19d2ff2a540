#pragma once

#include "event_thread.h"
#include "frame.h"
#include "host/api/local_transport.h"
#include <atomic>
#include <map>
#include <mutex>

namespace host {

inline constexpr std::size_t most_peers = 256;
inline constexpr std::size_t most_peers_of_one_process = 8;

/// A listening socket and the processes that have connected to it: reads their requests, asks the receiver,
/// and writes the answers. Limits on count, size and time keep a broken peer from doing harm; it only loses
/// its connection. Works in the event thread; start() and stop() from any thread.
class LocalPeers : public std::enable_shared_from_this<LocalPeers> {
  public:
    LocalPeers(Descriptor listening, LocalReceiver& receiver);

    Status start();
    /// Takes no new connections; those that there are stay until the other side leaves.
    void stop();
    /// For a process that is about to end, as a request just now may have asked it to: whoever sent what is
    /// being read hears that it has arrived. A second at most.
    void finish_answers();

    static void set_frame_time_limit(std::int64_t nanoseconds);

  private:
    struct Peer {
        Descriptor socket;
        std::int32_t process = 0;
        EventThread::Watch watch = 0;
        FrameReader reader;
        std::int64_t frame_began = 0; ///< uptime; 0 between frames
        std::vector<char> unsent;
    };

    void accept_peers();
    void add(Descriptor socket);
    void serve(std::uint64_t id, std::uint32_t events);
    bool read_requests(Peer& peer);
    bool take_frames(Peer& peer, std::span<const char> bytes);
    bool send_answers(Peer& peer);
    void drop(std::uint64_t id);
    void drop_stalled();
    void watch_for_stalls();

    const Descriptor listening_;
    LocalReceiver& receiver_;
    std::atomic<EventThread::Watch> listening_watch_{0};
    /// Held by the event thread from the reading of requests until they are answered.
    std::timed_mutex answering_;
    // The event thread's alone.
    std::map<std::uint64_t, Peer> peers_;
    std::uint64_t next_ = 1;
    bool watches_for_stalls_ = false;
};

} // namespace host
