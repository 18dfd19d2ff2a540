#include <Looper.h>

#include "MessageDelivery.h"
#include "TokenTable.h"
#include <Messenger.h>

#include <cstdio>

namespace {

constexpr const char* kCapacityField = "_port_cap";

} // namespace

BLooper::BLooper(const char* name, int32 priority, int32 portCapacity) : BHandler(name), mPriority(priority) {
    InitialiseLooper(portCapacity);
}

BLooper::BLooper(BMessage* from) : BHandler(from) {
    InitialiseLooper(from != nullptr ? from->GetInt32(kCapacityField, B_LOOPER_PORT_DEFAULT_CAPACITY)
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
    const status_t status = BHandler::Archive(into, deep);
    if (status != B_OK || mState->capacity == B_LOOPER_PORT_DEFAULT_CAPACITY)
        return status;
    return into->AddInt32(kCapacityField, mState->capacity);
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

void BLooper::AssertLocked() const {
    if (!mState->lock.IsOwner())
        debugger("The looper must be locked.");
}
