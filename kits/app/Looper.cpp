#include <Looper.h>

#include "MessageDelivery.h"
#include "TokenTable.h"
#include <Autolock.h>
#include <MessageFilter.h>
#include <Messenger.h>

#include <cstdio>
#include <utility>

BLooper::BLooper(const char* name, int32 priority, int32 portCapacity) : BHandler(name), mPriority(priority) {
    InitialiseLooper(portCapacity);
}

BLooper::BLooper(BMessage* from) : BHandler(from) {
    InitialiseLooper(from != nullptr ? from->GetInt32("_port_cap", B_LOOPER_PORT_DEFAULT_CAPACITY)
                                     : B_LOOPER_PORT_DEFAULT_CAPACITY);
}

void BLooper::InitialiseLooper(int32 portCapacity) {
    mState = std::make_shared<LooperState>(this, mToken,
                                           portCapacity > 0 ? portCapacity : B_LOOPER_PORT_DEFAULT_CAPACITY);
    mState->lock.Lock(B_INFINITE_TIMEOUT);
    LooperTable::Instance().Add(mState);
    AddHandler(this);
}

BLooper::~BLooper() {
    if (mRunCalled && !mTerminating && mState->thread != current_thread_identity())
        std::fprintf(stderr, "BLooper %s: a looper that runs is ended by Quit(), not deleted\n",
                     Name() != nullptr ? Name() : "");
    mState->lock.Lock(B_INFINITE_TIMEOUT);
    // Closed first: who is refused a post must not find a messenger still valid.
    mState->Close();
    LooperTable::Instance().Remove(this);
    mCurrentMessage.reset();
    SetCommonFilterList(nullptr);
    while (mHandlers.CountItems() > 0)
        RemoveHandler(static_cast<BHandler*>(mHandlers.ItemAt(mHandlers.CountItems() - 1)));
    mState->lock.Die();
}

BArchivable* BLooper::Instantiate(BMessage* from) {
    return validate_instantiation(from, "BLooper") ? new BLooper(from) : nullptr;
}

REGISTER_ARCHIVABLE(BLooper);

status_t BLooper::Archive(BMessage* into, bool deep) const {
    return BHandler::Archive(into, deep);
}

status_t BLooper::PostMessage(uint32 command) {
    const BMessage message(command);
    return PostTo(this, message);
}

status_t BLooper::PostMessage(BMessage* message) {
    return message != nullptr ? PostTo(this, *message) : B_BAD_VALUE;
}

status_t BLooper::PostMessage(uint32 command, BHandler* handler, BHandler* replyTo) {
    const BMessage message(command);
    return PostTo(this, message, handler, replyTo);
}

status_t BLooper::PostMessage(BMessage* message, BHandler* handler, BHandler* replyTo) {
    return message != nullptr ? PostTo(this, *message, handler, replyTo) : B_BAD_VALUE;
}

// Static, since the looper may go away at any time: it is only an address here.
status_t BLooper::PostTo(const BLooper* looper, const BMessage& message) {
    const std::shared_ptr<LooperState> state = LooperTable::Instance().Find(looper);
    return state != nullptr ? MessageDelivery::Post(message, *state, state->token, {}) : B_BAD_PORT_ID;
}

status_t BLooper::PostTo(const BLooper* looper, const BMessage& message, BHandler* handler,
                         BHandler* replyTo) {
    const std::shared_ptr<LooperState> state = LooperTable::Instance().Find(looper);
    if (state == nullptr)
        return B_BAD_PORT_ID;
    if (handler != nullptr && handler->Looper() != looper)
        return B_MISMATCHED_VALUES;
    return MessageDelivery::Post(message, *state, handler != nullptr ? handler->mToken : 0,
                                 MessageDelivery::AddressOf(BMessenger(replyTo)));
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

void BLooper::MessageReceived(BMessage* message) {
    BMessage specifier;
    const char* property = nullptr;
    if (message->what == B_COUNT_PROPERTIES &&
        message->GetCurrentSpecifier(nullptr, &specifier, nullptr, &property) == B_OK &&
        std::string_view(property) == "Handler") {
        BMessage reply(B_REPLY);
        reply.AddInt32("result", CountHandlers());
        reply.AddInt32("error", B_OK);
        message->SendReply(&reply);
        return;
    }
    BHandler::MessageReceived(message);
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

BMessageQueue* BLooper::MessageQueue() const {
    return &mState->queue;
}

bool BLooper::IsMessageWaiting() const {
    return !mState->queue.IsEmpty();
}

void BLooper::AddHandler(BHandler* handler) {
    if (handler == nullptr || handler->Looper() != nullptr)
        return;
    AssertLocked();
    mHandlers.AddItem(handler);
    handler->SetLooper(this, mState);
    if (handler != this)
        handler->SetNextHandler(this);
}

bool BLooper::RemoveHandler(BHandler* handler) {
    if (handler == nullptr || handler->Looper() != this)
        return false;
    AssertLocked();
    if (!mHandlers.RemoveItem(handler))
        return false;
    if (mPreferred == handler)
        mPreferred = nullptr;
    handler->SetNextHandler(nullptr);
    handler->SetLooper(nullptr, nullptr);
    return true;
}

int32 BLooper::CountHandlers() const {
    return mHandlers.CountItems();
}

BHandler* BLooper::HandlerAt(int32 index) const {
    return static_cast<BHandler*>(mHandlers.ItemAt(index));
}

int32 BLooper::IndexOf(BHandler* handler) const {
    return mHandlers.IndexOf(handler);
}

BHandler* BLooper::PreferredHandler() const {
    return mPreferred;
}

void BLooper::SetPreferredHandler(BHandler* handler) {
    mPreferred = handler != nullptr && handler->Looper() == this ? handler : nullptr;
}

thread_id BLooper::Run() {
    return StartThread(&BLooper::ThreadEntry);
}

thread_id BLooper::StartThread(thread_func entry) {
    AssertLocked();
    if (mRunCalled)
        return B_BAD_THREAD_STATE;
    const thread_id thread = spawn_thread(entry, Name() != nullptr ? Name() : "looper", mPriority, this);
    if (thread < 0)
        return thread;
    mState->thread = thread;
    mRunCalled = true;
    const status_t status = resume_thread(thread);
    if (status != B_OK) {
        kill_thread(thread);
        mState->thread = 0;
        mRunCalled = false;
        return status;
    }
    // From here on the looper may be gone.
    Unlock();
    return thread;
}

int32 BLooper::ThreadEntry(void* data) {
    BLooper* looper = static_cast<BLooper*>(data);
    looper->Loop();
    looper->Lock();
    delete looper;
    return 0;
}

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
            handler = Filtered(current, handler);
        if (handler != nullptr && handler->Looper() == this)
            DispatchMessage(current, handler);
        message = std::move(mCurrentMessage);
        ends = mTerminating;
        state->lock.Unlock();
    }
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

void BLooper::Quit() {
    const std::shared_ptr<LooperState> state = LooperTable::Instance().Find(this);
    if (state == nullptr)
        return;
    if (!state->lock.IsOwner()) {
        std::fprintf(stderr, "BLooper: a looper must be locked before Quit()\n");
        if (state->lock.Lock(B_INFINITE_TIMEOUT) != B_OK)
            return;
    }
    if (!mRunCalled) {
        delete this;
        return;
    }
    if (state->thread == current_thread_identity()) {
        mTerminating = true;
        delete this;
        exit_thread(B_OK);
    }
    const thread_id thread = state->thread;
    BMessage quit(_QUIT_);
    MessageDelivery::Post(quit, *state, mToken, {});
    while (state->lock.IsOwner())
        state->lock.Unlock();
    wait_for_thread(thread, nullptr);
}

bool BLooper::QuitRequested() {
    return true;
}

// These are asked about loopers that may be gone, so they go by the address and never look at the object, nor
// call each other on it.
bool BLooper::Lock() {
    const std::shared_ptr<LooperState> state = LooperTable::Instance().Find(this);
    return state != nullptr && state->lock.Lock(B_INFINITE_TIMEOUT) == B_OK;
}

status_t BLooper::LockWithTimeout(bigtime_t timeout) {
    const std::shared_ptr<LooperState> state = LooperTable::Instance().Find(this);
    return state != nullptr ? state->lock.Lock(timeout) : B_BAD_VALUE;
}

void BLooper::Unlock() {
    if (const std::shared_ptr<LooperState> state = LooperTable::Instance().Find(this))
        state->lock.Unlock();
}

bool BLooper::IsLocked() const {
    const std::shared_ptr<LooperState> state = LooperTable::Instance().Find(this);
    return state != nullptr && state->lock.IsOwner();
}

thread_id BLooper::Thread() const {
    const std::shared_ptr<LooperState> state = LooperTable::Instance().Find(this);
    return state != nullptr ? state->thread.load() : B_BAD_THREAD_ID;
}

team_id BLooper::Team() const {
    return MessageDelivery::LocalAddress(0, false).team;
}

BLooper* BLooper::LooperForThread(thread_id thread) {
    const std::shared_ptr<LooperState> state = LooperTable::Instance().FindByThread(thread);
    return state != nullptr && thread > 0 ? state->looper : nullptr;
}

thread_id BLooper::LockingThread() const {
    const thread_id owner = mState->lock.Owner();
    return owner != 0 ? owner : B_ERROR;
}

int32 BLooper::CountLocks() const {
    return mState->lock.CountLocks();
}

int32 BLooper::CountLockRequests() const {
    return mState->lock.CountLockRequests();
}

sem_id BLooper::Sem() const {
    // There is no semaphore behind the lock on this host.
    return B_BAD_SEM_ID;
}

BHandler* BLooper::ResolveSpecifier(BMessage* message, int32 index, BMessage* specifier, int32 form,
                                    const char* property) {
    if (std::string_view(property) != "Handler")
        return BHandler::ResolveSpecifier(message, index, specifier, form, property);
    if (message->what == B_COUNT_PROPERTIES)
        return this;
    BHandler* found = nullptr;
    if (form == B_INDEX_SPECIFIER) {
        found = HandlerAt(specifier->GetInt32("index", -1));
    } else if (form == B_NAME_SPECIFIER) {
        const std::string_view name = specifier->GetString(B_PROPERTY_NAME_ENTRY, "");
        for (int32 candidate = 0; candidate < CountHandlers() && found == nullptr; candidate++) {
            const char* handlerName = HandlerAt(candidate)->Name();
            if (handlerName != nullptr && name == handlerName)
                found = HandlerAt(candidate);
        }
    }
    if (found != nullptr) {
        message->PopSpecifier();
        return found;
    }
    BMessage reply(B_MESSAGE_NOT_UNDERSTOOD);
    reply.AddInt32("error", B_NAME_NOT_FOUND);
    message->SendReply(&reply);
    return nullptr;
}

status_t BLooper::GetSupportedSuites(BMessage* data) {
    const status_t status = data != nullptr ? data->AddString("suites", "suite/vnd.Be-looper") : B_BAD_VALUE;
    return status == B_OK ? BHandler::GetSupportedSuites(data) : status;
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

void BLooper::AssertLocked() const {
    if (!mState->lock.IsOwner())
        debugger("The looper must be locked.");
}
