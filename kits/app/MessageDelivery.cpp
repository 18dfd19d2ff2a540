#include "MessageDelivery.h"

#include "MessageCodec.h"
#include "MessageTransport.h"
#include "ReplyBox.h"
#include "TokenTable.h"

#include <atomic>
#include <utility>

namespace {

team_id ThisTeam() {
    static const team_id team = [] {
        team_info info;
        return get_team_info(B_CURRENT_TEAM, &info) == B_OK ? info.team : 0;
    }();
    return team;
}

// Leaves room for the envelope in the largest request.
constexpr uint64 kLargestSentMessage = uint64{64} << 20;

std::atomic<int32> sDefaultReplyToken{0};

// Replies that nobody asked for elsewhere go to the application.
MessengerAddress ReplyAddress(const MessengerAddress& replyTo) {
    const int32 token = sDefaultReplyToken;
    if (replyTo.token != 0 || token == 0)
        return replyTo;
    return {ThisTeam(), token, true};
}

// Whether the target's looper runs in the calling thread, which must not wait for it then.
bool IsThisThread(const MessengerAddress& target) {
    const TokenTable::Target found =
        target.team == ThisTeam() ? TokenTable::Instance().Find(target.token) : TokenTable::Target();
    return found.looper != nullptr && found.looper->thread == current_thread_identity();
}

// A reply box under its token, for as long as somebody waits at it.
class RegisteredReplyBox {
  public:
    // For a reply from that team.
    explicit RegisteredReplyBox(team_id team)
        : box(std::make_shared<ReplyBox>(team)), mToken(TokenTable::Instance().AddReplyBox(box)) {}
    ~RegisteredReplyBox() { TokenTable::Instance().Remove(mToken); }
    RegisteredReplyBox(const RegisteredReplyBox&) = delete;
    RegisteredReplyBox& operator=(const RegisteredReplyBox&) = delete;

    MessengerAddress Address() const { return {ThisTeam(), mToken, false}; }

    const std::shared_ptr<ReplyBox> box;

  private:
    const int32 mToken;
};

} // namespace

bool MessageDelivery::IsThisTeam(team_id team) {
    return team == ThisTeam();
}

void MessageDelivery::SetDefaultReplyTarget(int32 looperToken) {
    sDefaultReplyToken = looperToken;
}

MessengerAddress MessageDelivery::LocalAddress(int32 token, bool preferred) {
    return {ThisTeam(), token, preferred};
}

void MessageDelivery::SetTarget(BMessage& message, int32 token, bool preferred) {
    message.mDelivery.target = {ThisTeam(), token, preferred};
}

void MessageDelivery::SetReplyTo(BMessage& message, const MessengerAddress& replyTo) {
    message.mDelivery.delivered = true;
    message.mDelivery.replyTo = ReplyAddress(replyTo);
}

void MessageDelivery::MarkDropped(BMessage& message, BPoint where, BPoint offset) {
    message.mDelivery.dropped = true;
    message.mDelivery.dropPoint = where;
    message.mDelivery.dropOffset = offset;
}

std::unique_ptr<BMessage> MessageDelivery::Address(const BMessage& message, const MessengerAddress& target,
                                                   const MessengerAddress& replyTo, Waiting waiting) {
    auto copy = std::make_unique<BMessage>(message);
    BMessage::Delivery& delivery = copy->mDelivery;
    delivery.delivered = true;
    delivery.sourceWaiting = waiting == Waiting::forReply;
    delivery.target = target;
    delivery.replyTo = replyTo;
    // A dropped message that is passed on stays one.
    delivery.dropped = message.mDelivery.dropped;
    delivery.dropPoint = message.mDelivery.dropPoint;
    delivery.dropOffset = message.mDelivery.dropOffset;
    return copy;
}

status_t MessageDelivery::SendAddressed(std::unique_ptr<BMessage> message, bigtime_t timeout) {
    const MessengerAddress target = message->mDelivery.target;
    status_t status = B_BAD_PORT_ID;
    if (target.token != 0 && !IsThisTeam(target.team)) {
        status = SendToTeam(*message, timeout);
    } else if (const std::shared_ptr<ReplyBox> box = TokenTable::Instance().FindReplyBox(target.token)) {
        status = box->Put(message);
    } else if (const TokenTable::Target found = TokenTable::Instance().Find(target.token); found.looper) {
        // Null once the looper has taken it, also when that has failed.
        return found.looper->Deliver(std::move(message), timeout);
    }
    // Not taken, or the other process has its own copy: this one does not answer for a handler as it goes
    // away.
    if (message != nullptr)
        message->mDelivery.sourceWaiting = false;
    return status;
}

status_t MessageDelivery::SendToTeam(const BMessage& message, bigtime_t timeout) {
    // The reply, or a messenger in the message, has to find its way back.
    if (const status_t status = MessageTransport::Open(); status != B_OK)
        return status;
    const BMessage::Delivery& delivery = message.mDelivery;
    MessageEnvelope envelope;
    envelope.target = delivery.target.token;
    envelope.targetPreferred = delivery.target.preferred;
    envelope.sourceWaiting = delivery.sourceWaiting;
    envelope.isReply = delivery.isReply;
    envelope.dropped = delivery.dropped;
    envelope.replyTo = delivery.replyTo;
    envelope.dropPoint = delivery.dropPoint;
    envelope.dropOffset = delivery.dropOffset;
    const uint64 size = flattened_message_size(message.mFields);
    uint64 previousSize =
        delivery.previous != nullptr ? flattened_message_size(delivery.previous->mFields) : 0;
    if (size > kLargestSentMessage)
        return B_NO_MEMORY;
    // Rather the reply alone than none.
    if (previousSize > kLargestSentMessage - size)
        previousSize = 0;
    std::vector<char> request = make_request(envelope, size, previousSize);
    flatten_message(message.what, message.mFields, request.data() + kEnvelopeSize);
    if (previousSize > 0)
        flatten_message(delivery.previous->what, delivery.previous->mFields,
                        request.data() + kEnvelopeSize + size);
    return MessageTransport::Send(delivery.target.team, request, timeout);
}

status_t MessageDelivery::Receive(const MessageEnvelope& envelope) {
    auto message = std::make_unique<BMessage>();
    if (message->Unflatten(envelope.message.data(), envelope.message.size()) != B_OK)
        return B_BAD_DATA;
    BMessage::Delivery& delivery = message->mDelivery;
    if (!envelope.previous.empty()) {
        auto previous = std::make_shared<BMessage>();
        if (previous->Unflatten(envelope.previous.data(), envelope.previous.size()) != B_OK)
            return B_BAD_DATA;
        delivery.previous = std::move(previous);
    }
    delivery.delivered = true;
    delivery.target = LocalAddress(envelope.target, envelope.targetPreferred);
    delivery.replyTo = envelope.replyTo;
    delivery.isReply = envelope.isReply;
    delivery.dropped = envelope.dropped;
    delivery.dropPoint = envelope.dropPoint;
    delivery.dropOffset = envelope.dropOffset;
    delivery.sourceWaiting = envelope.sourceWaiting;
    status_t status = B_BAD_PORT_ID;
    if (const std::shared_ptr<ReplyBox> box = TokenTable::Instance().FindReplyBox(envelope.target))
        status = box->Put(message);
    else if (const TokenTable::Target found = TokenTable::Instance().Find(envelope.target); found.looper)
        status = found.looper->DeliverNow(message);
    // Not taken, it owes nobody a reply: the sender hears of it here and now.
    if (message != nullptr)
        message->mDelivery.sourceWaiting = false;
    return status;
}

bool MessageDelivery::HasTarget(int32 token) {
    const TokenTable& table = TokenTable::Instance();
    const std::shared_ptr<LooperState> looper = table.Find(token).looper;
    return looper != nullptr ? looper->IsOpen() : table.FindReplyBox(token) != nullptr;
}

status_t MessageDelivery::Send(const BMessage& message, const MessengerAddress& target,
                               const MessengerAddress& replyTo, bigtime_t timeout) {
    return SendAddressed(Address(message, target, ReplyAddress(replyTo), Waiting::none), timeout);
}

status_t MessageDelivery::Post(const BMessage& message, LooperState& looper, int32 target,
                               const MessengerAddress& replyTo) {
    const MessengerAddress address{ThisTeam(), target, target == 0};
    return looper.Post(Address(message, address, ReplyAddress(replyTo), Waiting::none));
}

// Sends a message whose replies go to `waiting`, and waits there.
status_t MessageDelivery::Exchange(std::unique_ptr<BMessage> message, ReplyBox& waiting, BMessage* reply,
                                   bigtime_t sendTimeout, bigtime_t replyTimeout) {
    std::unique_ptr<BMessage> answer;
    status_t status = SendAddressed(std::move(message), sendTimeout);
    if (status == B_OK)
        status = waiting.Wait(replyTimeout, &answer);
    if (status == B_OK)
        *reply = std::move(*answer);
    return status;
}

status_t MessageDelivery::SendAndWait(const BMessage& message, const MessengerAddress& target,
                                      BMessage* reply, bigtime_t deliveryTimeout, bigtime_t replyTimeout) {
    if (reply == nullptr)
        return B_BAD_VALUE;
    if (IsThisThread(target))
        return B_MESSAGE_TO_SELF;
    RegisteredReplyBox waiting(target.team);
    return Exchange(Address(message, target, waiting.Address(), Waiting::forReply), *waiting.box, reply,
                    deliveryTimeout, replyTimeout);
}

// B_OK when the request can be replied to (again).
status_t MessageDelivery::MayReply(const BMessage& request) {
    if (!request.mDelivery.delivered || request.mDelivery.replyTo.token == 0)
        return B_BAD_REPLY;
    return request.mDelivery.sourceWaiting && request.mDelivery.replied ? B_DUPLICATE_REPLY : B_OK;
}

std::unique_ptr<BMessage> MessageDelivery::AddressReply(BMessage& request, const BMessage& reply,
                                                        const MessengerAddress& replyTo, Waiting waiting) {
    std::unique_ptr<BMessage> copy = Address(reply, request.mDelivery.replyTo, replyTo, waiting);
    copy->mDelivery.isReply = true;
    copy->mDelivery.previous = std::make_shared<const BMessage>(request);
    request.mDelivery.replied = true;
    return copy;
}

status_t MessageDelivery::Reply(BMessage& request, const BMessage& reply, const MessengerAddress& replyTo,
                                bigtime_t timeout) {
    const status_t status = MayReply(request);
    if (status != B_OK)
        return status;
    return SendAddressed(AddressReply(request, reply, ReplyAddress(replyTo), Waiting::none), timeout);
}

status_t MessageDelivery::ReplyAndWait(BMessage& request, const BMessage& reply, BMessage* replyToReply,
                                       bigtime_t sendTimeout, bigtime_t replyTimeout) {
    const status_t status = MayReply(request);
    if (status != B_OK)
        return status;
    if (IsThisThread(request.mDelivery.replyTo))
        return B_MESSAGE_TO_SELF;
    RegisteredReplyBox waiting(request.mDelivery.replyTo.team);
    return Exchange(AddressReply(request, reply, waiting.Address(), Waiting::forReply), *waiting.box,
                    replyToReply, sendTimeout, replyTimeout);
}
