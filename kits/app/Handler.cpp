#include <Handler.h>

#include "ObserverList.h"
#include "TokenTable.h"
#include <Looper.h>
#include <MessageFilter.h>
#include <Messenger.h>
#include <PropertyInfo.h>

namespace {

constexpr const char* kNameField = "_name";
constexpr const char* kSuite = "suite/vnd.Be-handler";

const property_info kProperties[] = {
    {"Suites", {B_GET_PROPERTY, 0}, {B_DIRECT_SPECIFIER, 0}, "", 0, {B_STRING_TYPE}},
    {"Messenger", {B_GET_PROPERTY, 0}, {B_DIRECT_SPECIFIER, 0}, "", 0, {B_MESSENGER_TYPE}},
    {"InternalName", {B_GET_PROPERTY, 0}, {B_DIRECT_SPECIFIER, 0}, "", 0, {B_STRING_TYPE}},
    {nullptr, {0}, {0}, nullptr, 0, {0}},
};

} // namespace

BHandler::BHandler(const char* name) : mToken(TokenTable::Instance().AddHandler(this)) {
    SetName(name);
}

BHandler::BHandler(BMessage* from) : BArchivable(from), mToken(TokenTable::Instance().AddHandler(this)) {
    SetName(from != nullptr ? from->GetString(kNameField) : nullptr);
}

BHandler::~BHandler() {
    if (BLooper* looper = Looper(); looper != nullptr && looper != this)
        looper->RemoveHandler(this);
    TokenTable::Instance().Remove(mToken);
    SetFilterList(nullptr);
}

BArchivable* BHandler::Instantiate(BMessage* from) {
    return validate_instantiation(from, "BHandler") ? new BHandler(from) : nullptr;
}

REGISTER_ARCHIVABLE(BHandler);

status_t BHandler::Archive(BMessage* into, bool deep) const {
    const status_t status = BArchivable::Archive(into, deep);
    return status == B_OK && mHasName ? into->AddString(kNameField, mName.c_str()) : status;
}

void BHandler::MessageReceived(BMessage* message) {
    BMessage reply(B_REPLY);
    BMessage specifier;
    const char* property = nullptr;
    status_t status = B_BAD_SCRIPT_SYNTAX;
    if (message->what == B_GET_SUPPORTED_SUITES) {
        status = GetSupportedSuites(&reply);
    } else if (message->what == B_GET_PROPERTY &&
               message->GetCurrentSpecifier(nullptr, &specifier, nullptr, &property) == B_OK) {
        const std::string_view name(property);
        if (name == "Suites")
            status = GetSupportedSuites(&reply);
        else if (name == "Messenger")
            status = reply.AddMessenger("result", BMessenger(this));
        else if (name == "InternalName")
            status = reply.AddString("result", mName.c_str());
    }
    if (status == B_OK) {
        reply.AddInt32("error", B_OK);
        message->SendReply(&reply);
        return;
    }
    if (mNextHandler != nullptr) {
        mNextHandler->MessageReceived(message);
        return;
    }
    if (message->IsSourceWaiting() || message->HasSpecifiers()) {
        reply.what = B_MESSAGE_NOT_UNDERSTOOD;
        reply.AddInt32("error", B_BAD_SCRIPT_SYNTAX);
        reply.AddString("message", "Didn't understand the message");
        message->SendReply(&reply);
    }
}

BLooper* BHandler::Looper() const {
    return mLooper.load(std::memory_order_acquire);
}

void BHandler::SetLooper(BLooper* looper, std::shared_ptr<LooperState> state) {
    mLooper.store(looper, std::memory_order_release);
    TokenTable::Instance().SetLooper(mToken, std::move(state));
    for (int32 index = 0; mFilters != nullptr && index < mFilters->CountItems(); index++)
        static_cast<BMessageFilter*>(mFilters->ItemAt(index))->mLooper = looper;
}

void BHandler::SetName(const char* name) {
    mHasName = name != nullptr;
    mName = name != nullptr ? name : "";
}

const char* BHandler::Name() const {
    return mHasName ? mName.c_str() : nullptr;
}

void BHandler::SetNextHandler(BHandler* handler) {
    if (handler != nullptr && handler->Looper() != Looper())
        return;
    mNextHandler = handler;
}

BHandler* BHandler::NextHandler() const {
    return mNextHandler;
}

void BHandler::AddFilter(BMessageFilter* filter) {
    if (filter == nullptr)
        return;
    if (mFilters == nullptr)
        mFilters = std::make_unique<BList>();
    filter->mLooper = Looper();
    mFilters->AddItem(filter);
}

bool BHandler::RemoveFilter(BMessageFilter* filter) {
    if (mFilters == nullptr || !mFilters->RemoveItem(filter))
        return false;
    filter->mLooper = nullptr;
    return true;
}

void BHandler::SetFilterList(BList* filters) {
    if (filters == mFilters.get())
        return;
    for (int32 index = 0; mFilters != nullptr && index < mFilters->CountItems(); index++)
        delete static_cast<BMessageFilter*>(mFilters->ItemAt(index));
    mFilters.reset(filters);
    for (int32 index = 0; mFilters != nullptr && index < mFilters->CountItems(); index++)
        static_cast<BMessageFilter*>(mFilters->ItemAt(index))->mLooper = Looper();
}

BList* BHandler::FilterList() {
    return mFilters.get();
}

bool BHandler::LockLooper() {
    return LockLooperWithTimeout(B_INFINITE_TIMEOUT) == B_OK;
}

status_t BHandler::LockLooperWithTimeout(bigtime_t timeout) {
    BLooper* looper = Looper();
    if (looper == nullptr)
        return B_BAD_VALUE;
    const status_t status = looper->LockWithTimeout(timeout);
    if (status != B_OK)
        return status;
    if (looper == Looper())
        return B_OK;
    looper->Unlock();
    return B_MISMATCHED_VALUES;
}

void BHandler::UnlockLooper() {
    if (BLooper* looper = Looper())
        looper->Unlock();
}

BHandler* BHandler::ResolveSpecifier(BMessage* message, int32 index, BMessage* specifier, int32 form,
                                     const char* property) {
    BPropertyInfo info(const_cast<property_info*>(kProperties));
    if (info.FindMatch(message, index, specifier, form, property) >= 0)
        return this;
    BMessage reply(B_MESSAGE_NOT_UNDERSTOOD);
    reply.AddInt32("error", B_BAD_SCRIPT_SYNTAX);
    reply.AddString("message", "Didn't understand the specifier(s)");
    message->SendReply(&reply);
    return nullptr;
}

status_t BHandler::GetSupportedSuites(BMessage* data) {
    if (data == nullptr)
        return B_BAD_VALUE;
    BPropertyInfo info(const_cast<property_info*>(kProperties));
    status_t status = data->AddString("suites", kSuite);
    if (status == B_OK)
        status = data->AddFlat("messages", &info);
    return status;
}

ObserverList& BHandler::Observers() {
    if (mObservers == nullptr)
        mObservers = std::make_unique<ObserverList>();
    return *mObservers;
}

status_t BHandler::StartWatching(BMessenger target, uint32 what) {
    return Observers().Add(target, what);
}

status_t BHandler::StartWatchingAll(BMessenger target) {
    return StartWatching(target, B_OBSERVER_OBSERVE_ALL);
}

status_t BHandler::StopWatching(BMessenger target, uint32 what) {
    return Observers().Remove(target, what);
}

status_t BHandler::StopWatchingAll(BMessenger target) {
    return StopWatching(target, B_OBSERVER_OBSERVE_ALL);
}

status_t BHandler::StartWatching(BHandler* observer, uint32 what) {
    return StartWatching(BMessenger(observer), what);
}

status_t BHandler::StartWatchingAll(BHandler* observer) {
    return StartWatching(observer, B_OBSERVER_OBSERVE_ALL);
}

status_t BHandler::StopWatching(BHandler* observer, uint32 what) {
    return StopWatching(BMessenger(observer), what);
}

status_t BHandler::StopWatchingAll(BHandler* observer) {
    return StopWatching(observer, B_OBSERVER_OBSERVE_ALL);
}

void BHandler::SendNotices(uint32 what, const BMessage* notice) {
    if (mObservers != nullptr)
        mObservers->Send(what, notice);
}

bool BHandler::IsWatched() const {
    return mObservers != nullptr && !mObservers->IsEmpty();
}
