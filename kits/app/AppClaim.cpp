#include "AppClaim.h"

#include "LaunchFlags.h"
#include "MessageDelivery.h"
#include "MessageTransport.h"
#include "host/api/processes.h"
#include "host/api/running_applications.h"
#include <Roster.h>

#include <cstdio>

namespace {

constexpr bigtime_t kSecond = 1'000'000;
constexpr bigtime_t kPatience = 5 * kSecond;
// How long an application that is about to end is waited for.
constexpr bigtime_t kLongestEnd = 10 * kSecond;
constexpr bigtime_t kPause = 20'000;

std::unique_ptr<BMessage> CommandLineMessage() {
    const std::vector<std::string> arguments = host::command_line_arguments();
    if (arguments.size() < 2)
        return nullptr;
    auto message = std::make_unique<BMessage>(B_ARGV_RECEIVED);
    message->AddInt32("argc", static_cast<int32>(arguments.size()));
    for (const std::string& argument : arguments)
        message->AddString("argv", argument.c_str());
    message->AddString("cwd", host::current_directory().c_str());
    return message;
}

} // namespace

std::string activation_token() {
    std::string token = host::environment_variable("XDG_ACTIVATION_TOKEN");
    return !token.empty() ? token : host::environment_variable("DESKTOP_STARTUP_ID");
}

status_t AppClaim::Take(int32 looper) {
    mLooper = looper;
    mFlags = launch_flags(mSignature);
    if (const status_t status = MessageTransport::Open(); status != B_OK)
        return status;
    mMessages = mLauncher.TakeMessages();
    if (std::unique_ptr<BMessage> line = CommandLineMessage())
        mMessages.insert(mMessages.begin(), std::move(line));
    for (const bigtime_t end = system_time() + kLongestEnd;;) {
        RunningApp other;
        const status_t registered = Register(&other);
        if (registered != B_ALREADY_RUNNING)
            return registered;
        const status_t handed = HandOver(other);
        if (handed == B_OK) {
            mLauncher.Report(other.address.team);
            return B_ALREADY_RUNNING;
        }
        if (system_time() > end) {
            std::fprintf(stderr, "%s runs already, as process %d, but does not answer\n", mSignature.c_str(),
                         other.address.team);
            return B_ALREADY_RUNNING;
        }
        // It may be ending, and then this one runs.
        snooze(kPause);
    }
}

// B_ALREADY_RUNNING when `other` stands in the way.
status_t AppClaim::Register(RunningApp* other) {
    host::Instances instances = host::Instances::any;
    switch (mFlags & B_LAUNCH_MASK) {
    case B_SINGLE_LAUNCH:
        instances = host::Instances::one_per_executable;
        break;
    case B_EXCLUSIVE_LAUNCH:
        instances = host::Instances::one_per_signature;
        break;
    default:
        break;
    }
    host::RunningApplication application;
    application.signature = mSignature;
    application.executable = host::executable_path();
    application.flags = mFlags;
    application.token = mLooper;
    host::RunningApplication blocking;
    GuardLock guard(mMutex);
    const host::Status status = host::register_application(application, instances, blocking);
    mRegistered = status.ok();
    if (status.error() != EEXIST)
        return status_from_errno(status.error());
    other->signature = blocking.signature;
    other->executable = blocking.executable;
    other->flags = blocking.flags;
    other->address = {blocking.process, blocking.token, true};
    return B_ALREADY_RUNNING;
}

status_t AppClaim::HandOver(const RunningApp& other) {
    const BMessenger application = MessageDelivery::MessengerTo(other.address);
    while (!mMessages.empty()) {
        const status_t status = application.SendMessage(mMessages.front().get(), BMessenger(), kPatience);
        if (status != B_OK)
            return status;
        mMessages.erase(mMessages.begin());
        mHandedOver = true;
    }
    BMessage again(B_SILENT_RELAUNCH);
    if (!mHandedOver) {
        const status_t status = application.SendMessage(&again, BMessenger(), kPatience);
        if (status != B_OK)
            return status;
    }
    mHandedOver = true;
    return (other.flags & B_BACKGROUND_APP) != 0 ? B_OK : activate_app(other, mActivationToken);
}

void AppClaim::Confirm(thread_id thread) {
    {
        GuardLock guard(mMutex);
        // Failing, it leaves the thread unknown to others.
        if (mRegistered)
            (void)host::set_application_thread(thread);
    }
    mLauncher.Report(MessageDelivery::LocalAddress(0, false).team);
}

void AppClaim::Release() {
    GuardLock guard(mMutex);
    if (mRegistered)
        host::unregister_application();
    mRegistered = false;
}
