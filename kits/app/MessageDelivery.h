// Brings messages to their targets. Internal to the kits.
#pragma once

#include "LooperState.h"
#include <Messenger.h>

class ReplyBox;
struct MessageEnvelope;

// The one place that turns an address into a queue, and the one that writes how a message was delivered.
// Addresses of this process are resolved through the TokenTable and the message is copied, not flattened.
// SendAddressed(), through which every message passes that does not come by Post(), hands those for other
// teams to the MessageTransport, flattened; there Receive() takes them up. Any thread.
class MessageDelivery {
  public:
    enum class Waiting { none, forReply };

    // Queues a copy. As BMessenger::SendMessage(); B_BAD_PORT_ID when the target is gone.
    static status_t Send(const BMessage& message, const MessengerAddress& target,
                         const MessengerAddress& replyTo, bigtime_t timeout);
    // Queues a copy behind all others, never waiting. `target` 0 is the looper's preferred handler.
    static status_t Post(const BMessage& message, LooperState& looper, int32 target,
                         const MessengerAddress& replyTo);
    static status_t SendAndWait(const BMessage& message, const MessengerAddress& target, BMessage* reply,
                                bigtime_t deliveryTimeout, bigtime_t replyTimeout);
    static status_t Reply(BMessage& request, const BMessage& reply, const MessengerAddress& replyTo,
                          bigtime_t timeout);
    static status_t ReplyAndWait(BMessage& request, const BMessage& reply, BMessage* replyToReply,
                                 bigtime_t sendTimeout, bigtime_t replyTimeout);

    // What another process has sent, in the transport's thread: does not wait for room in a queue
    // (B_WOULD_BLOCK). B_BAD_PORT_ID for a target that is not there, B_BAD_DATA for what is no message.
    static status_t Receive(const MessageEnvelope& envelope);
    // Whether messages to the target find somebody, in this process.
    static bool HasTarget(int32 token);

    static bool IsThisTeam(team_id team);
    static MessengerAddress LocalAddress(int32 token, bool preferred);
    // The looper that gets replies to messages without a return address; 0 for none.
    static void SetDefaultReplyTarget(int32 looperToken);
    static MessengerAddress AddressOf(const BMessenger& messenger) { return messenger.mAddress; }
    static BMessenger MessengerTo(const MessengerAddress& address) { return BMessenger(address); }

    // Whom a queued message is for.
    static const MessengerAddress& TargetOf(const BMessage& message) { return message.mDelivery.target; }
    static void SetTarget(BMessage& message, int32 token, bool preferred);
    // Makes it a delivered message whose replies go there, or without an address to the application.
    static void SetReplyTo(BMessage& message, const MessengerAddress& replyTo);
    // Makes it a message that was dropped there, see BMessage::DropPoint().
    static void MarkDropped(BMessage& message, BPoint where, BPoint offset);

  private:
    static std::unique_ptr<BMessage> Address(const BMessage& message, const MessengerAddress& target,
                                             const MessengerAddress& replyTo, Waiting waiting);
    // To the target that Address() has written into the message.
    static status_t SendAddressed(std::unique_ptr<BMessage> message, bigtime_t timeout);
    static status_t SendToTeam(const BMessage& message, bigtime_t timeout);
    static status_t Exchange(std::unique_ptr<BMessage> message, ReplyBox& waiting, BMessage* reply,
                             bigtime_t sendTimeout, bigtime_t replyTimeout);
    static status_t MayReply(const BMessage& request);
    // Marks the request as replied to.
    static std::unique_ptr<BMessage> AddressReply(BMessage& request, const BMessage& reply,
                                                  const MessengerAddress& replyTo, Waiting waiting);
};
