#include <Application.h>

#include "AppClaim.h"
#include "MainLoop.h"
#include "MessageDelivery.h"
#include "TokenTable.h"
#include "host/api/directories.h"
#include "host/api/termination.h"
#include <MessageQueue.h>
#include <MessageRunner.h>
#include <Roster.h>

#include <algorithm>
#include <cstdio>
#include <cstdlib>
#include <cstring>
#include <strings.h>
#include <vector>

BApplication* be_app = nullptr;

namespace {

MainLoop* sMainLoop = nullptr;

bool IsSignature(const char* signature) {
    constexpr const char* kType = "application/";
    const size_t length = signature != nullptr ? std::strlen(signature) : 0;
    return length > std::strlen(kType) && length < 256 &&
           strncasecmp(signature, kType, std::strlen(kType)) == 0;
}

} // namespace

void set_main_loop(MainLoop* loop) {
    sMainLoop = loop;
}

MainLoop* main_loop() {
    return sMainLoop;
}

BApplication::BApplication(const char* signature) : BLooper("application") {
    Initialise(signature);
    if (mInitStatus == B_OK)
        return;
    std::fprintf(stderr, "BApplication: \"%s\" is no signature, or there is an application already\n",
                 signature != nullptr ? signature : "");
    std::exit(EXIT_FAILURE);
}

BApplication::BApplication(const char* signature, status_t* error) : BLooper("application") {
    Initialise(signature);
    if (error != nullptr)
        *error = mInitStatus;
}

BApplication::BApplication(BMessage* from) : BLooper(from) {
    Initialise(from != nullptr ? from->GetString("mime_sig") : nullptr);
    bigtime_t rate = 0;
    if (from != nullptr && from->FindInt64("_pulse", &rate) == B_OK)
        SetPulseRate(rate);
}

void BApplication::Initialise(const char* signature) {
    mSignature = signature != nullptr ? signature : "";
    if (be_app != nullptr || !IsSignature(signature)) {
        mInitStatus = B_BAD_VALUE;
        return;
    }
    // Not fatal: what needs the directory reports that it is not there.
    (void)host::make_directories(host::config_directory() + "/settings");
    mActivationToken = activation_token();
    be_app = this;
    be_app_messenger = BMessenger(nullptr, this);
    MessageDelivery::SetDefaultReplyTarget(MessageDelivery::AddressOf(be_app_messenger).token);
    PostMessage(B_READY_TO_RUN);
}

BApplication::~BApplication() {
    mPulse.reset();
    if (be_app != this)
        return;
    Lock();
    MessageDelivery::SetDefaultReplyTarget(0);
    be_app_messenger = BMessenger();
    be_app = nullptr;
}

BArchivable* BApplication::Instantiate(BMessage* from) {
    return validate_instantiation(from, "BApplication") ? new BApplication(from) : nullptr;
}

REGISTER_ARCHIVABLE(BApplication);

status_t BApplication::Archive(BMessage* into, bool deep) const {
    status_t status = BLooper::Archive(into, deep);
    if (status == B_OK)
        status = into->AddString("mime_sig", mSignature.c_str());
    return status == B_OK && mPulseRate > 0 ? into->AddInt64("_pulse", mPulseRate) : status;
}

status_t BApplication::InitCheck() const {
    return mInitStatus;
}

thread_id BApplication::Run() {
    if (mInitStatus != B_OK)
        return mInitStatus;
    if (mClaim != nullptr)
        return B_BAD_THREAD_STATE;
    const auto termination = host::watch_for_termination([this] { PostMessage(B_QUIT_REQUESTED); });
    const auto endUnless = [](bool works) {
        if (works)
            return;
        std::fflush(nullptr);
        // Other threads may be in the middle of anything, so nothing is torn down around them.
        std::_Exit(EXIT_FAILURE);
    };
    endUnless(sMainLoop == nullptr || sMainLoop->Prepare());
    mClaim = std::make_unique<AppClaim>(mSignature, mActivationToken);
    const status_t claimed = mClaim->Take(MessageDelivery::AddressOf(be_app_messenger).token);
    if (claimed == B_ALREADY_RUNNING)
        return claimed;
    if (claimed != B_OK)
        std::fprintf(stderr, "%s runs, but other programs cannot find it: %s\n", mSignature.c_str(),
                     strerror(claimed));
    HandleFirst(mClaim->TakeMessages());
    const thread_id thread = StartThread(&BApplication::ThreadEntry);
    if (thread < 0) {
        mClaim->Release();
        return thread;
    }
    mClaim->Confirm(thread);
    endUnless(sMainLoop == nullptr || sMainLoop->Run());
    wait_for_thread(thread, nullptr);
    return thread;
}

// In front of what waits already, B_READY_TO_RUN included.
void BApplication::HandleFirst(MessageList messages) {
    BMessageQueue* const queue = MessageQueue();
    queue->Lock();
    MessageList waiting;
    while (BMessage* message = queue->NextMessage())
        waiting.emplace_back(message);
    for (const std::unique_ptr<BMessage>& message : messages)
        PostMessage(message.get());
    for (std::unique_ptr<BMessage>& message : waiting)
        queue->AddMessage(message.release());
    queue->Unlock();
}

int32 BApplication::ThreadEntry(void* data) {
    BApplication* application = static_cast<BApplication*>(data);
    application->Loop();
    application->mClaim->Release();
    if (sMainLoop != nullptr)
        sMainLoop->Quit();
    return 0;
}

void BApplication::Quit() {
    if (!IsRunning()) {
        delete this;
        return;
    }
    if (Thread() == current_thread_identity())
        EndLoop();
    else
        BLooper::PostMessage(_QUIT_, this);
}

bool BApplication::QuitRequested() {
    if (sMainLoop == nullptr)
        return BLooper::QuitRequested();
    // A window that is asked may want to lock the application.
    const int32 locks = IsLocked() ? CountLocks() : 0;
    for (int32 i = 0; i < locks; ++i)
        Unlock();
    const bool closed = sMainLoop->CloseWindows();
    for (int32 i = 0; i < locks; ++i)
        Lock();
    return closed;
}

void BApplication::ReadyToRun() {}

void BApplication::ArgvReceived(int32, char**) {}

void BApplication::RefsReceived(BMessage*) {}

void BApplication::AppActivated(bool) {}

void BApplication::AboutRequested() {}

void BApplication::SaveStateRequested() {}
void BApplication::Pulse() {}

void BApplication::SetPulseRate(bigtime_t rate) {
    mPulse.reset();
    mPulseRate = std::max(rate, bigtime_t{0});
    if (mPulseRate == 0)
        return;
    BMessage pulse(B_PULSE);
    mPulse = std::make_unique<BMessageRunner>(BMessenger(this), &pulse, rate);
}

void BApplication::MessageReceived(BMessage* message) {
    // Started again: its windows are brought to the front by a message of its own.
    if (message->what == B_SILENT_RELAUNCH)
        return;
    BMessage specifier;
    const char* property = nullptr;
    if (message->what == B_GET_PROPERTY &&
        message->GetCurrentSpecifier(nullptr, &specifier, nullptr, &property) == B_OK &&
        std::string_view(property) == "Name") {
        BMessage reply(B_REPLY);
        reply.AddString("result", mSignature.c_str());
        reply.AddInt32("error", B_OK);
        message->SendReply(&reply);
        return;
    }
    BLooper::MessageReceived(message);
}

void BApplication::DispatchMessage(BMessage* message, BHandler* handler) {
    if (handler != this) {
        BLooper::DispatchMessage(message, handler);
        return;
    }
    switch (message->what) {
    case B_READY_TO_RUN:
        if (!mReadyToRunCalled.exchange(true))
            ReadyToRun();
        break;
    case B_ARGV_RECEIVED: {
        std::vector<char*> arguments;
        const char* argument = nullptr;
        for (int32 index = 0; message->FindString("argv", index, &argument) == B_OK; index++)
            arguments.push_back(const_cast<char*>(argument));
        const int32 count = static_cast<int32>(arguments.size());
        arguments.push_back(nullptr);
        ArgvReceived(count, arguments.data());
        break;
    }
    case B_REFS_RECEIVED:
        RefsReceived(message);
        break;
    case B_ABOUT_REQUESTED:
        AboutRequested();
        break;
    case B_PULSE:
        // One that was on its way when the rate was set to none.
        if (mPulseRate > 0)
            Pulse();
        break;
    case _SAVE_STATE_:
        SaveStateRequested();
        break;
    case _ACTIVATE_APP_:
        // Windows tell by themselves when they have got the focus.
        if (sMainLoop != nullptr)
            sMainLoop->Activate(message->GetString("token", ""));
        else
            AppActivated(true);
        break;
    case B_APP_ACTIVATED:
        AppActivated(message->GetBool("active", false));
        break;
    default:
        BLooper::DispatchMessage(message, handler);
    }
}

BHandler* BApplication::ResolveSpecifier(BMessage* message, int32 index, BMessage* specifier, int32 form,
                                         const char* property) {
    if (message->what == B_GET_PROPERTY && std::string_view(property) == "Name")
        return this;
    return BLooper::ResolveSpecifier(message, index, specifier, form, property);
}

status_t BApplication::GetSupportedSuites(BMessage* data) {
    const status_t status =
        data != nullptr ? data->AddString("suites", "suite/vnd.Be-application") : B_BAD_VALUE;
    return status == B_OK ? BLooper::GetSupportedSuites(data) : status;
}

int32 BApplication::CountLoopers() const {
    return static_cast<int32>(LooperTable::Instance().All().size());
}

BLooper* BApplication::LooperAt(int32 index) const {
    const auto all = LooperTable::Instance().All();
    return index >= 0 && static_cast<size_t>(index) < all.size() ? all[static_cast<size_t>(index)]->looper
                                                                 : nullptr;
}

bool BApplication::IsLaunching() const {
    return !mReadyToRunCalled;
}

const char* BApplication::Signature() const {
    return mSignature.c_str();
}

bool BApplication::HasSignature(const char* signature) const {
    return signature != nullptr && strcasecmp(signature, mSignature.c_str()) == 0;
}

status_t BApplication::GetAppInfo(app_info* info) const {
    return be_roster->GetRunningAppInfo(Team(), info);
}
