// Writes and reads the flattened form of messages, docs/messages.md. Internal to the kits.
#pragma once

#include "MessageFields.h"

#include <optional>

inline constexpr size_t kMessageHeaderSize = 16;
// A message inside a message inside ...: this many at most, the outermost one counted.
inline constexpr int32 kMaxMessageDepth = 64;

// The size of the form; more than kMaxMessageSize when the message is too large to have one.
uint64 flattened_message_size(const MessageFields& fields);

// Writes exactly flattened_message_size() bytes, which must not be more than kMaxMessageSize.
void flatten_message(uint32 what, const MessageFields& fields, char* buffer);

// The total size that a header of kMessageHeaderSize bytes promises, between that and kMaxMessageSize.
// Nothing is known about the bytes behind it. B_NOT_A_MESSAGE or B_BAD_DATA.
status_t read_message_header(const char* header, size_t* totalSize);

// Reads a form that takes the whole buffer. On failure (B_NOT_A_MESSAGE, B_BAD_DATA) nothing is changed.
status_t unflatten_message(std::span<const char> form, uint32* what, MessageFields* fields);

// How many messages deep the form is, 1 when none is nested; nothing when it is malformed or deeper than
// kMaxMessageDepth.
std::optional<int32> message_depth(std::span<const char> form);
