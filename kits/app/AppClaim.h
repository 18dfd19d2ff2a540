// How a process becomes a running application, or finds that it need not. Internal to the app kit.
#pragma once

#include "AppLaunch.h"
#include <ThreadSafety.h>

#include <string>

// The desktop's token for what the user has just done, which brings a window to the front. Empty for none.
std::string activation_token();

// This process as a running application, from Take() to Release(). The launcher's messages and the command
// line are fetched, and given to this application or to the one that runs already. One thread, but Release()
// from any.
class AppClaim {
  public:
    AppClaim(std::string signature, std::string activationToken)
        : mSignature(std::move(signature)), mActivationToken(std::move(activationToken)) {}

    // `looper` is the application's token. B_OK; B_ALREADY_RUNNING when it may run only once and another one
    // runs and has been told; B_PERMISSION_DENIED and so on when no other process will find this one, which
    // is no reason not to run.
    status_t Take(int32 looper);
    // What the application handles before anything else, in this order.
    MessageList TakeMessages() { return std::move(mMessages); }
    // Once the looper's thread is known; then the launcher hears that the application runs.
    void Confirm(thread_id thread);
    void Release();

  private:
    status_t Register(RunningApp* other);
    status_t HandOver(const RunningApp& other);

    const std::string mSignature;
    const std::string mActivationToken;
    AppLauncher mLauncher;
    MessageList mMessages;
    bool mHandedOver = false;
    int32 mLooper = 0;
    uint32 mFlags = 0;
    // Keeps a release from being overtaken by the confirmation.
    GuardMutex mMutex;
    bool mRegistered GUARDED_BY(mMutex) = false;
};
