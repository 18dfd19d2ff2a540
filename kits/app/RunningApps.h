// The running applications of all processes, as the roster and messengers look them up. Internal to the app
// kit.
#pragma once

#include "MessengerAddress.h"

#include <Errors.h>

#include <optional>
#include <string>
#include <vector>

struct RunningApp {
    std::string signature;
    // Its executable, an absolute path.
    std::string executable;
    uint32 flags = 0;
    thread_id thread = -1;
    // Where messages for the application go.
    MessengerAddress address;
};

// Any thread. Those that have run longest come first.
std::vector<RunningApp> running_apps();
std::optional<RunningApp> running_app(const char* signature);
std::optional<RunningApp> running_app(team_id team);

// Brings its windows to the front; `token` is the desktop's for what the user has just done, empty for none.
// Errors as BMessenger::SendMessage().
status_t activate_app(const RunningApp& app, const std::string& token);

bool is_same_signature(const char* a, const char* b);
