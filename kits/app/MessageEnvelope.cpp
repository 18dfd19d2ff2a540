#include "MessageEnvelope.h"

#include <cstring>

namespace {

enum : uint8 {
    kTargetPreferred = 1,
    kReplyPreferred = 2,
    kSourceWaiting = 4,
    kIsReply = 8,
    kDropped = 16,
    kAllFlags = 31,
};

// The fixed part, as it lies in a request.
struct FlatEnvelope {
    uint8 operation;
    uint8 flags;
    uint16 zero;
    int32 target;
    int32 replyTeam;
    int32 replyToken;
    float points[4];
    uint32 messageSize;
    uint32 previousSize;
};
static_assert(sizeof(FlatEnvelope) == kEnvelopeSize);

} // namespace

std::vector<char> make_request(const MessageEnvelope& envelope, size_t messageSize, size_t previousSize) {
    const auto flag = [](bool set, uint8 bit) { return set ? bit : uint8{0}; };
    FlatEnvelope flat = {};
    flat.operation = static_cast<uint8>(envelope.operation);
    flat.flags = static_cast<uint8>(flag(envelope.targetPreferred, kTargetPreferred) |
                                    flag(envelope.replyTo.preferred, kReplyPreferred) |
                                    flag(envelope.sourceWaiting, kSourceWaiting) |
                                    flag(envelope.isReply, kIsReply) | flag(envelope.dropped, kDropped));
    flat.target = envelope.target;
    flat.replyTeam = envelope.replyTo.team;
    flat.replyToken = envelope.replyTo.token;
    flat.points[0] = envelope.dropPoint.x;
    flat.points[1] = envelope.dropPoint.y;
    flat.points[2] = envelope.dropOffset.x;
    flat.points[3] = envelope.dropOffset.y;
    flat.messageSize = static_cast<uint32>(messageSize);
    flat.previousSize = static_cast<uint32>(previousSize);
    std::vector<char> request(kEnvelopeSize + messageSize + previousSize);
    std::memcpy(request.data(), &flat, sizeof(flat));
    return request;
}

std::optional<MessageEnvelope> read_request(std::span<const char> request) {
    FlatEnvelope flat;
    if (request.size() < sizeof(flat))
        return std::nullopt;
    std::memcpy(&flat, request.data(), sizeof(flat));
    const size_t rest = request.size() - sizeof(flat);
    if ((flat.flags & ~kAllFlags) != 0 || flat.zero != 0 || flat.messageSize > rest ||
        flat.previousSize != rest - flat.messageSize)
        return std::nullopt;
    MessageEnvelope envelope;
    envelope.operation = static_cast<MessageEnvelope::Operation>(flat.operation);
    switch (envelope.operation) {
    case MessageEnvelope::Operation::deliver:
        if (flat.messageSize == 0)
            return std::nullopt;
        break;
    case MessageEnvelope::Operation::ask:
        if (rest != 0)
            return std::nullopt;
        break;
    default:
        return std::nullopt;
    }
    envelope.target = flat.target;
    envelope.targetPreferred = (flat.flags & kTargetPreferred) != 0;
    envelope.sourceWaiting = (flat.flags & kSourceWaiting) != 0;
    envelope.isReply = (flat.flags & kIsReply) != 0;
    envelope.dropped = (flat.flags & kDropped) != 0;
    envelope.replyTo = {flat.replyTeam, flat.replyToken, (flat.flags & kReplyPreferred) != 0};
    envelope.dropPoint = BPoint(flat.points[0], flat.points[1]);
    envelope.dropOffset = BPoint(flat.points[2], flat.points[3]);
    envelope.message = request.subspan(sizeof(flat), flat.messageSize);
    envelope.previous = request.subspan(sizeof(flat) + flat.messageSize);
    return envelope;
}
