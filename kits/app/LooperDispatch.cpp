// BLooper: a message's way from the queue through filters to its handler.
#include <Looper.h>

#include "MessageDelivery.h"
#include "TokenTable.h"
#include <Autolock.h>
#include <MessageFilter.h>

#include <utility>

void BLooper::Loop() {
    // A handler may end this thread by Quit(), which deletes the looper: nothing below may look at it after
    // DispatchMessage() except when that has returned.
    const std::shared_ptr<LooperState> state = mState;
    bool ends = false;
    while (!ends) {
        std::unique_ptr<BMessage> message = state->WaitForMessage();
        if (message == nullptr || state->lock.Lock(B_INFINITE_TIMEOUT) != B_OK)
            return;
        BMessage* current = message.get();
        mCurrentMessage = std::move(message);
        BHandler* handler = TargetOf(*current);
        if (handler != nullptr && current->HasSpecifiers())
            handler = ResolveTarget(current, handler);
        if (handler != nullptr)
            handler = HandlerFor(current, handler);
        if (handler != nullptr)
            handler = Filtered(current, handler);
        if (handler != nullptr && handler->Looper() == this)
            DispatchMessage(current, handler);
        message = std::move(mCurrentMessage);
        ends = mTerminating;
        // A handler that has locked once too often shall not lock everybody else out for good.
        while (state->lock.IsOwner())
            state->lock.Unlock();
    }
}

BHandler* BLooper::HandlerFor(BMessage* /*message*/, BHandler* target) {
    return target;
}

// The handler that the message was sent to, or null when it has gone or moved to another looper meanwhile.
BHandler* BLooper::TargetOf(const BMessage& message) {
    const MessengerAddress& target = MessageDelivery::TargetOf(message);
    if (target.preferred || target.token == 0)
        return mPreferred != nullptr ? mPreferred : this;
    const TokenTable::Target found = TokenTable::Instance().Find(target.token);
    return found.looper == mState ? found.handler : nullptr;
}

// Follows the message's specifiers from handler to handler. Null when one of them has answered it.
BHandler* BLooper::ResolveTarget(BMessage* message, BHandler* target) {
    for (;;) {
        int32 index = 0;
        int32 form = 0;
        BMessage specifier;
        const char* property = nullptr;
        if (message->GetCurrentSpecifier(&index, &specifier, &form, &property) != B_OK)
            return target;
        BHandler* next = target->ResolveSpecifier(message, index, &specifier, form, property);
        if (next == nullptr || next == target || next->Looper() != this)
            return next;
        target = next;
    }
}

BHandler* BLooper::Filtered(BMessage* message, BHandler* target) {
    if (!PassesFilters(mCommonFilters.get(), message, &target))
        return nullptr;
    // A filter may name another handler, whose own filters then have their say.
    for (BHandler* previous = nullptr; target != previous && target != nullptr;) {
        previous = target;
        if (!PassesFilters(target->FilterList(), message, &target))
            return nullptr;
    }
    return target;
}

bool BLooper::PassesFilters(BList* filters, BMessage* message, BHandler** target) {
    for (int32 index = 0; filters != nullptr && index < filters->CountItems(); index++) {
        BMessageFilter* filter = static_cast<BMessageFilter*>(filters->ItemAt(index));
        if (filter->Takes(*message) && filter->Run(message, target) == B_SKIP_MESSAGE)
            return false;
    }
    return true;
}

void BLooper::DispatchMessage(BMessage* message, BHandler* handler) {
    if (handler == this && message->what == _QUIT_) {
        EndLoop();
        return;
    }
    if (handler != this || message->what != B_QUIT_REQUESTED) {
        handler->MessageReceived(message);
        return;
    }
    const bool quits = QuitRequested();
    if (message->IsSourceWaiting()) {
        BMessage reply(B_REPLY);
        reply.AddBool("result", quits);
        reply.AddInt32("thread", Thread());
        message->SendReply(&reply);
    }
    if (quits)
        Quit();
}

BMessage* BLooper::CurrentMessage() const {
    return mCurrentMessage.get();
}

BMessage* BLooper::DetachCurrentMessage() {
    return mCurrentMessage.release();
}

void BLooper::DispatchExternalMessage(BMessage* message, BHandler* handler, bool& detached) {
    BAutolock lock(this);
    std::unique_ptr<BMessage> outer = std::exchange(mCurrentMessage, std::unique_ptr<BMessage>(message));
    DispatchMessage(message, handler != nullptr ? handler : this);
    detached = mCurrentMessage == nullptr;
    // Not detached, it stays the caller's.
    (void)mCurrentMessage.release();
    mCurrentMessage = std::move(outer);
}

void BLooper::AddCommonFilter(BMessageFilter* filter) {
    if (filter == nullptr)
        return;
    AssertLocked();
    if (mCommonFilters == nullptr)
        mCommonFilters = std::make_unique<BList>();
    filter->mLooper = this;
    mCommonFilters->AddItem(filter);
}

bool BLooper::RemoveCommonFilter(BMessageFilter* filter) {
    AssertLocked();
    if (mCommonFilters == nullptr || !mCommonFilters->RemoveItem(filter))
        return false;
    filter->mLooper = nullptr;
    return true;
}

void BLooper::SetCommonFilterList(BList* filters) {
    AssertLocked();
    if (filters == mCommonFilters.get())
        return;
    for (int32 index = 0; mCommonFilters != nullptr && index < mCommonFilters->CountItems(); index++)
        delete static_cast<BMessageFilter*>(mCommonFilters->ItemAt(index));
    mCommonFilters.reset(filters);
    for (int32 index = 0; mCommonFilters != nullptr && index < mCommonFilters->CountItems(); index++)
        static_cast<BMessageFilter*>(mCommonFilters->ItemAt(index))->mLooper = this;
}

BList* BLooper::CommonFilterList() const {
    return mCommonFilters.get();
}
