#pragma once

#include "descriptor.h"
#include "event_thread.h"
#include "frame.h"
#include "host/api/result.h"
#include "host/api/thread_safety.h"
#include <condition_variable>
#include <cstdint>
#include <memory>
#include <optional>
#include <span>
#include <unordered_map>

namespace host {

/// A connection to another process: requests go out, answers come in. Kept by its process's number until the
/// other side leaves, and shared by all threads that send there; each frame goes out whole, in the order in
/// which the threads come. Any thread.
class OutgoingConnection : public std::enable_shared_from_this<OutgoingConnection> {
  public:
    /// The kept connection, or a new one. Errors as send_local_request().
    static Result<std::shared_ptr<OutgoingConnection>> to(std::int32_t process, std::int64_t deadline);

    explicit OutgoingConnection(Descriptor socket, std::int32_t process)
        : socket_(std::move(socket)), process_(process) {}
    OutgoingConnection(const OutgoingConnection&) = delete;
    OutgoingConnection& operator=(const OutgoingConnection&) = delete;

    /// As send_local_request(). EPIPE when the connection has ended before any byte of the request was
    /// written: nothing has happened yet.
    Result<std::int32_t> request(std::span<const char> body, std::int64_t deadline) EXCLUDES(mutex_);

  private:
    struct Written {
        std::size_t bytes = 0;
        int error = 0; ///< 0 when all is written
    };

    static Result<std::shared_ptr<OutgoingConnection>> connect(std::int32_t process, std::int64_t deadline);
    bool keep();
    Status begin_writing(std::int64_t deadline) EXCLUDES(mutex_);
    Status flush_remainder(std::int64_t deadline);
    Written write(std::span<const char> head, std::span<const char> body, std::int64_t deadline);
    void end_writing() EXCLUDES(mutex_);
    Result<std::int32_t> wait_for_answer(std::uint32_t sequence, std::int64_t deadline) EXCLUDES(mutex_);
    void read_answers();
    void take_answer() EXCLUDES(mutex_);
    void end() EXCLUDES(mutex_);

    const Descriptor socket_;
    const std::int32_t process_;
    // Set before the event thread knows of it, then never changed.
    EventThread::Watch watch_ = 0;
    // The event thread's alone.
    FrameReader reader_;
    // The writing thread's alone: the rest of a frame whose sender lost patience in its middle. It goes out
    // before any other.
    std::vector<char> remainder_;

    Mutex mutex_;
    std::condition_variable_any changed_;
    bool writing_ GUARDED_BY(mutex_) = false;
    bool ended_ GUARDED_BY(mutex_) = false;
    std::uint32_t next_sequence_ GUARDED_BY(mutex_) = 1;
    /// By sequence number; empty until the answer has come.
    std::unordered_map<std::uint32_t, std::optional<std::int32_t>> answers_ GUARDED_BY(mutex_);
};

} // namespace host
