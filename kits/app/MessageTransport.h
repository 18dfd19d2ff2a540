// The app kit's end of the transport between processes. Internal to the app kit.
#pragma once

#include "MessageEnvelope.h"
#include <OS.h>

// Any thread.
class MessageTransport {
  public:
    // From now on this process can be sent messages. B_OK also when it could already.
    static status_t Open();

    // Sends a request and waits for its answer: B_OK once the message is in its queue. B_BAD_TEAM_ID,
    // B_BAD_PORT_ID, B_TIMED_OUT, B_WOULD_BLOCK, B_NO_MEMORY as BMessenger::SendMessage().
    static status_t Send(team_id team, std::span<const char> request, bigtime_t timeout);

    // Whether the other process has that target; a process that does not answer within a second counts as
    // having it.
    static bool IsThere(const MessengerAddress& target);
};
