#pragma once

#include "host/api/result.h"
#include <cstdint>
#include <span>

// Requests between processes of one user on this machine, and their answers. What they look like on the way
// and what limits there are: docs/messages.md, "Between processes". Any thread.

namespace host {

inline constexpr std::size_t largest_local_request = (std::size_t{64} << 20) + 4096;

/// Gets what other processes send. Both are called in one thread of the transport's own, which everybody
/// waits for: they return soon, never wait, and send nothing themselves (EDEADLK).
class LocalReceiver {
  public:
    virtual ~LocalReceiver() = default;
    /// The answer goes back to the sender. `request` is only there during the call.
    virtual std::int32_t received(std::int32_t sender_process, std::span<const char> request) = 0;
    /// A process that requests were sent to has ended, or does not talk to this one any more.
    virtual void gone(std::int32_t process) = 0;
};

/// From now on this process can be sent requests; `receiver` is kept until the process ends. Further calls
/// change nothing. EPERM: the runtime directory is not this user's alone.
Status open_local_transport(LocalReceiver& receiver);

/// Sends a request and waits for the answer, until `deadline` (uptime_nanoseconds()).
/// ESRCH: there is no such process, or it cannot be sent to. ECONNRESET: it went before it had answered.
/// ETIMEDOUT: no answer in time; the request may still arrive. EMSGSIZE: more than largest_local_request.
/// EACCES: the process belongs to another user. EDEADLK: called by a receiver.
Result<std::int32_t> send_local_request(std::int32_t process, std::span<const char> request,
                                        std::int64_t deadline);

} // namespace host
