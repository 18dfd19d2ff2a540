#include "RunningApps.h"

#include "MessageDelivery.h"
#include "host/api/running_applications.h"

#include <strings.h>

std::vector<RunningApp> running_apps() {
    std::vector<RunningApp> apps;
    for (const host::RunningApplication& application : host::running_applications())
        apps.push_back({application.signature,
                        application.executable,
                        application.flags,
                        application.thread > 0 ? application.thread : -1,
                        {application.process, application.token, true}});
    return apps;
}

std::optional<RunningApp> running_app(const char* signature) {
    for (RunningApp& app : running_apps()) {
        if (is_same_signature(signature, app.signature.c_str()))
            return std::move(app);
    }
    return std::nullopt;
}

std::optional<RunningApp> running_app(team_id team) {
    for (RunningApp& app : running_apps()) {
        if (app.address.team == team)
            return std::move(app);
    }
    return std::nullopt;
}

status_t activate_app(const RunningApp& app, const std::string& token) {
    constexpr bigtime_t kPatience = 5'000'000;
    BMessage activate(_ACTIVATE_APP_);
    if (!token.empty())
        activate.AddString("token", token.c_str());
    return MessageDelivery::MessengerTo(app.address).SendMessage(&activate, BMessenger(), kPatience);
}

bool is_same_signature(const char* a, const char* b) {
    return a != nullptr && b != nullptr && strcasecmp(a, b) == 0;
}
