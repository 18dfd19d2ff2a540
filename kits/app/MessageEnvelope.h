// What a request to another process holds: a message and how it is to be delivered. Internal to the app kit.
#pragma once

#include "MessengerAddress.h"
#include <Point.h>

#include <optional>
#include <span>
#include <vector>

// The format is described in docs/messages.md, "Between processes". The forms of messages in it are not
// looked at here. A plain value.
struct MessageEnvelope {
    enum class Operation : uint8 {
        deliver = 1,
        // Whether the target is there; nothing is delivered.
        ask = 2,
    };

    Operation operation = Operation::deliver;
    int32 target = 0;
    bool targetPreferred = false;
    bool sourceWaiting = false;
    bool isReply = false;
    bool dropped = false;
    MessengerAddress replyTo;
    BPoint dropPoint;
    BPoint dropOffset;
    // The flattened message, and the one that it replies to (empty for none). They point into the request.
    std::span<const char> message;
    std::span<const char> previous;
};

inline constexpr size_t kEnvelopeSize = 40;

// An envelope with room behind it: for a message of `messageSize` bytes at kEnvelopeSize, then for one of
// `previousSize`. The spans of the envelope are not used.
std::vector<char> make_request(const MessageEnvelope& envelope, size_t messageSize, size_t previousSize);

// Any bytes. Nothing unless they are a whole request.
std::optional<MessageEnvelope> read_request(std::span<const char> request);
