#include "MessageDelivery.h"

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
    RegisteredReplyBox()
        : box(std::make_shared<ReplyBox>()), mToken(TokenTable::Instance().AddReplyBox(box)) {}
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
        status = B_BAD_TEAM_ID;
    } else if (const std::shared_ptr<ReplyBox> box = TokenTable::Instance().FindReplyBox(target.token)) {
        return box->Put(std::move(message));
    } else if (const TokenTable::Target found = TokenTable::Instance().Find(target.token); found.looper) {
        // Null once the looper has taken it, also when that has failed.
        return found.looper->Deliver(std::move(message), timeout);
    }
    // It never left, so it does not answer for its handler as it goes away.
    message->mDelivery.sourceWaiting = false;
    return status;
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
    RegisteredReplyBox waiting;
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
    RegisteredReplyBox waiting;
    return Exchange(AddressReply(request, reply, waiting.Address(), Waiting::forReply), *waiting.box,
                    replyToReply, sendTimeout, replyTimeout);
}
