#include "MessageTransport.h"

#include "MessageDelivery.h"
#include "TokenTable.h"
#include "host/api/local_transport.h"
#include "host/api/threads.h"

#include <algorithm>

namespace {

constexpr bigtime_t kSecond = 1'000'000;
// For the way there and back, which every send takes.
constexpr bigtime_t kLeastPatience = kSecond / 5;
constexpr bigtime_t kForEver = bigtime_t{100} * 365 * 24 * 3600 * kSecond;
// Between two tries to find room in a full queue.
constexpr bigtime_t kShortestPause = 500;
constexpr bigtime_t kLongestPause = 20'000;

// Called in the transport's thread, which must not wait.
class Receiver : public host::LocalReceiver {
  public:
    static Receiver& Instance() {
        static Receiver* const receiver = new Receiver;
        return *receiver;
    }

    std::int32_t received(std::int32_t, std::span<const char> request) override {
        const std::optional<MessageEnvelope> envelope = read_request(request);
        if (!envelope)
            return B_BAD_DATA;
        if (envelope->operation == MessageEnvelope::Operation::ask)
            return MessageDelivery::HasTarget(envelope->target) ? B_OK : B_BAD_PORT_ID;
        return MessageDelivery::Receive(*envelope);
    }

    void gone(std::int32_t process) override {
        TokenTable::Instance().FailReplyBoxes(process, B_BAD_PORT_ID);
    }
};

// In nanoseconds of uptime.
std::int64_t DeadlineAfter(bigtime_t timeout) {
    return host::uptime_nanoseconds() + std::clamp(timeout, bigtime_t{0}, kForEver) * 1000;
}

status_t StatusOf(int error) {
    switch (error) {
    case ESRCH:
        return B_BAD_TEAM_ID;
    case ECONNRESET:
        return B_BAD_PORT_ID;
    case ETIMEDOUT:
        return B_TIMED_OUT;
    case EMSGSIZE:
        return B_NO_MEMORY;
    case EDEADLK:
        return B_WOULD_BLOCK;
    default:
        return status_from_errno(error);
    }
}

} // namespace

status_t MessageTransport::Open() {
    return status_from_errno(host::open_local_transport(Receiver::Instance()).error());
}

status_t MessageTransport::Send(team_id team, std::span<const char> request, bigtime_t timeout) {
    if (request.size() > host::largest_local_request)
        return B_NO_MEMORY;
    const std::int64_t room = DeadlineAfter(timeout);
    const std::int64_t answer = DeadlineAfter(std::max(timeout, kLeastPatience));
    for (bigtime_t pause = kShortestPause;; pause = std::min(pause * 2, kLongestPause)) {
        const host::Result<std::int32_t> sent = host::send_local_request(team, request, answer);
        if (!sent)
            return StatusOf(sent.error());
        if (*sent != B_WOULD_BLOCK)
            return *sent;
        const std::int64_t now = host::uptime_nanoseconds();
        if (now >= room)
            return timeout > 0 ? B_TIMED_OUT : B_WOULD_BLOCK;
        host::sleep_until(std::min(now + pause * 1000, room));
    }
}

bool MessageTransport::IsThere(const MessengerAddress& target) {
    MessageEnvelope envelope;
    envelope.operation = MessageEnvelope::Operation::ask;
    envelope.target = target.token;
    envelope.targetPreferred = target.preferred;
    const status_t status = Send(target.team, make_request(envelope, 0, 0), kSecond);
    return status == B_OK || status == B_TIMED_OUT;
}
