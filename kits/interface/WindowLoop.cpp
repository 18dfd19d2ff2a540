#include "WindowLoop.h"

#include "TokenTable.h"
#include "WindowHost.h"

#include <Application.h>
#include <OS.h>
#include <Window.h>

#include "host/api/display.h"
#include "host/api/threads.h"

#include <algorithm>
#include <chrono>
#include <cstdio>
#include <string>
#include <vector>

namespace {

// How long a window may take to end when the application has ended already.
constexpr bigtime_t kPatience = 3000000;

// How long the application may take to end when its display has gone.
constexpr bigtime_t kLongPatience = 10000000;

// How long a window is waited for that is to come to the front.
constexpr bigtime_t kShortPatience = 200000;

// Windows that the application has left open end with it. They are not asked.
void QuitAllWindows() {
    for (const std::shared_ptr<LooperState>& state : LooperTable::Instance().All()) {
        if (!state->IsOpen() || state->looper == be_app || state->lock.Lock(kPatience) != B_OK) {
            continue;
        }
        auto* const window = state->IsOpen() ? dynamic_cast<BWindow*>(state->looper) : nullptr;
        if (window != nullptr) {
            window->Quit();
        } else {
            state->lock.Unlock();
        }
    }
}

// Static, so that it is there before the application is.
WindowLoop sWindowLoop;

} // namespace

WindowLoop::WindowLoop() {
    set_main_loop(this);
    host::expect_display();
}

void WindowLoop::Connect() {
    if (!host::display_connected() && host::current_native_thread() == host::current_process()) {
        std::string problem;
        // Without a display the window stays unseen; Run() tells.
        (void)host::connect_display(&problem);
    }
}

bool WindowLoop::Prepare() {
    std::string problem;
    if (!host::connect_display(&problem)) {
        std::fprintf(stderr, "%s\n", problem.c_str());
        return false;
    }
    host::set_save_handler([] { be_app_messenger.SendMessage(_SAVE_STATE_); });
    host::set_quit_handler([] { be_app_messenger.SendMessage(B_QUIT_REQUESTED); });
    host::set_loss_handler([this] { EndApplication(); });
    GuardLock guard(mMutex);
    mQuits = false;
    return true;
}

bool WindowLoop::Run() {
    host::run_display();
    return true;
}

void WindowLoop::Quit() {
    QuitAllWindows();
    host::end_display_loop();
    GuardLock guard(mMutex);
    mQuits = true;
    mQuitCalled.notify_all();
}

// The application is asked as the system asks it, and then goes here: main(), which has made it, has no turn
// any more.
void WindowLoop::EndApplication() {
    BApplication* const application = be_app;
    if (application == nullptr) {
        return;
    }
    const thread_id thread = application->Thread();
    (void)be_app_messenger.SendMessage(B_QUIT_REQUESTED);
    if (!WaitForQuit(kLongPatience)) {
        return;
    }
    wait_for_thread(thread, nullptr);
    application->~BApplication();
}

bool WindowLoop::WaitForQuit(bigtime_t timeout) {
    const auto deadline = std::chrono::steady_clock::now() + std::chrono::microseconds(timeout);
    GuardLock guard(mMutex);
    while (!mQuits && mQuitCalled.wait_until(guard.Native(), deadline) != std::cv_status::timeout) {
    }
    return mQuits;
}

bool WindowLoop::CloseWindows() {
    std::vector<std::shared_ptr<LooperState>> all = LooperTable::Instance().All();
    std::reverse(all.begin(), all.end());
    for (const std::shared_ptr<LooperState>& state : all) {
        const bigtime_t patience = state->thread == 0 ? 0 : B_INFINITE_TIMEOUT;
        if (!state->IsOpen() || state->looper == be_app || state->lock.Lock(patience) != B_OK) {
            continue;
        }
        auto* const window = state->IsOpen() ? dynamic_cast<BWindow*>(state->looper) : nullptr;
        if (window == nullptr || window->Host()->Traits().IsPopUp()) {
            state->lock.Unlock();
            continue;
        }
        if (!window->QuitRequested()) {
            state->lock.Unlock();
            return false;
        }
        if (state->IsOpen()) {
            window->Quit();
        }
    }
    return true;
}

void WindowLoop::Activate(const std::string& token) {
    host::take_activation_token(token);
    for (const std::shared_ptr<LooperState>& state : LooperTable::Instance().All()) {
        if (!state->IsOpen() || state->looper == be_app || state->lock.Lock(kShortPatience) != B_OK) {
            continue;
        }
        if (auto* const window = state->IsOpen() ? dynamic_cast<BWindow*>(state->looper) : nullptr) {
            window->Activate(true);
        }
        state->lock.Unlock();
    }
}
