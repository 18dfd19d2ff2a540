#include "WindowLoop.h"

#include "TokenTable.h"

#include <Application.h>
#include <OS.h>
#include <Window.h>

#include "host/api/display.h"
#include "host/api/threads.h"

#include <cstdio>
#include <string>

namespace {

// How long a window may take to end when the application has ended already.
constexpr bigtime_t kPatience = 3000000;

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
    host::set_quit_handler([] { be_app_messenger.SendMessage(B_QUIT_REQUESTED); });
    return true;
}

bool WindowLoop::Run() {
    host::run_display();
    return true;
}

void WindowLoop::Quit() {
    QuitAllWindows();
    host::end_display_loop();
}

void WindowLoop::Activate(const std::string&) {
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
