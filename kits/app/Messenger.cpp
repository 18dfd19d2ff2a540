#include <Messenger.h>

#include "MessageDelivery.h"
#include "MessageTransport.h"
#include "RunningApps.h"
#include "TokenTable.h"
#include <Looper.h>

BMessenger be_app_messenger;

BMessenger::BMessenger() = default;

BMessenger::BMessenger(const char* signature, team_id team, status_t* result) {
    const status_t status = SetTo(signature, team);
    if (result != nullptr)
        *result = status;
}

BMessenger::BMessenger(const BHandler* handler, const BLooper* looper, status_t* result) {
    const status_t status = SetTo(handler, looper);
    if (result != nullptr)
        *result = status;
}

status_t BMessenger::SetTo(const char* signature, team_id team) {
    mAddress = MessengerAddress();
    if (signature == nullptr && team < 0)
        return B_BAD_VALUE;
    const std::optional<RunningApp> app = team >= 0 ? running_app(team) : running_app(signature);
    if (!app)
        return team >= 0 ? B_BAD_TEAM_ID : B_ERROR;
    if (signature != nullptr && !is_same_signature(signature, app->signature.c_str()))
        return B_MISMATCHED_VALUES;
    mAddress = app->address;
    return B_OK;
}

status_t BMessenger::SetTo(const BHandler* handler, const BLooper* looper) {
    mAddress = MessengerAddress();
    if (handler == nullptr && looper == nullptr)
        return B_BAD_VALUE;
    if (handler == nullptr) {
        const std::shared_ptr<LooperState> state = LooperTable::Instance().Find(looper);
        if (state == nullptr)
            return B_BAD_VALUE;
        mAddress = MessageDelivery::LocalAddress(state->token, true);
        return B_OK;
    }
    const BLooper* owner = handler->Looper();
    if (looper != nullptr && owner != looper)
        return B_MISMATCHED_VALUES;
    if (owner == nullptr)
        return B_BAD_HANDLER;
    mAddress = MessageDelivery::LocalAddress(handler->mToken, false);
    return B_OK;
}

bool BMessenger::IsTargetLocal() const {
    return mAddress.token != 0 && MessageDelivery::IsThisTeam(mAddress.team);
}

BHandler* BMessenger::Target(BLooper** looper) const {
    const TokenTable::Target found =
        IsTargetLocal() ? TokenTable::Instance().Find(mAddress.token) : TokenTable::Target();
    if (looper != nullptr)
        *looper = found.looper != nullptr ? found.looper->looper : nullptr;
    return mAddress.preferred ? nullptr : found.handler;
}

bool BMessenger::LockTarget() const {
    return LockTargetWithTimeout(B_INFINITE_TIMEOUT) == B_OK;
}

status_t BMessenger::LockTargetWithTimeout(bigtime_t timeout) const {
    if (!IsTargetLocal())
        return B_BAD_VALUE;
    const TokenTable::Target found = TokenTable::Instance().Find(mAddress.token);
    if (found.looper == nullptr)
        return B_BAD_VALUE;
    const status_t status = found.looper->lock.Lock(timeout);
    if (status != B_OK)
        return status;
    // It may have left, or changed its looper, before the lock was there.
    if (TokenTable::Instance().Find(mAddress.token).looper == found.looper)
        return B_OK;
    found.looper->lock.Unlock();
    return B_BAD_VALUE;
}

status_t BMessenger::SendMessage(uint32 command, BHandler* replyTo) const {
    BMessage message(command);
    return SendMessage(&message, replyTo);
}

status_t BMessenger::SendMessage(BMessage* message, BHandler* replyTo, bigtime_t timeout) const {
    return SendMessage(message, BMessenger(replyTo), timeout);
}

status_t BMessenger::SendMessage(BMessage* message, BMessenger replyTo, bigtime_t timeout) const {
    return message != nullptr ? MessageDelivery::Send(*message, mAddress, replyTo.mAddress, timeout)
                              : B_BAD_VALUE;
}

status_t BMessenger::SendMessage(uint32 command, BMessage* reply) const {
    BMessage message(command);
    return SendMessage(&message, reply);
}

status_t BMessenger::SendMessage(BMessage* message, BMessage* reply, bigtime_t deliveryTimeout,
                                 bigtime_t replyTimeout) const {
    return message != nullptr
               ? MessageDelivery::SendAndWait(*message, mAddress, reply, deliveryTimeout, replyTimeout)
               : B_BAD_VALUE;
}

bool BMessenger::IsValid() const {
    if (mAddress.token == 0)
        return false;
    return IsTargetLocal() ? MessageDelivery::HasTarget(mAddress.token) : MessageTransport::IsThere(mAddress);
}

team_id BMessenger::Team() const {
    return mAddress.team;
}

uint32 BMessenger::HashValue() const {
    return static_cast<uint32>(mAddress.token) * 2654435761u ^ static_cast<uint32>(mAddress.team) ^
           (mAddress.preferred ? 1u : 0u);
}

bool operator<(const BMessenger& a, const BMessenger& b) {
    const MessengerAddress left = MessageDelivery::AddressOf(a);
    const MessengerAddress right = MessageDelivery::AddressOf(b);
    if (left.team != right.team)
        return left.team < right.team;
    return left.token != right.token ? left.token < right.token : left.preferred < right.preferred;
}
