#include <Roster.h>

#include "AppFiles.h"
#include "RunningApps.h"
#include <Application.h>
#include <CopyText.h>

#include <cstdint>

namespace {

const BRoster sRoster;

std::optional<RunningApp> AppOfExecutable(const entry_ref* executable) {
    const std::string path = executable != nullptr ? path_of_ref(*executable) : std::string();
    for (RunningApp& app : running_apps()) {
        if (!path.empty() && app.executable == path)
            return std::move(app);
    }
    return std::nullopt;
}

void Fill(const RunningApp& app, app_info* info) {
    *info = app_info();
    info->thread = app.thread;
    info->team = app.address.team;
    info->flags = app.flags;
    // Its file may have been replaced or removed since it was started.
    (void)ref_of_path(app.executable, &info->ref);
    CopyText(info->signature, app.signature.c_str());
}

void AddTeam(BList* teams, const RunningApp& app) {
    teams->AddItem(reinterpret_cast<void*>(static_cast<intptr_t>(app.address.team)));
}

} // namespace

const BRoster* be_roster = &sRoster;

BRoster::BRoster() = default;

BRoster::~BRoster() = default;

bool BRoster::IsRunning(const char* signature) const {
    return TeamFor(signature) >= 0;
}

bool BRoster::IsRunning(const entry_ref* executable) const {
    return TeamFor(executable) >= 0;
}

team_id BRoster::TeamFor(const char* signature) const {
    const std::optional<RunningApp> app = running_app(signature);
    return app ? app->address.team : B_ERROR;
}

team_id BRoster::TeamFor(const entry_ref* executable) const {
    const std::optional<RunningApp> app = AppOfExecutable(executable);
    return app ? app->address.team : B_ERROR;
}

void BRoster::GetAppList(BList* teams) const {
    if (teams == nullptr)
        return;
    for (const RunningApp& app : running_apps())
        AddTeam(teams, app);
}

void BRoster::GetAppList(const char* signature, BList* teams) const {
    if (teams == nullptr)
        return;
    for (const RunningApp& app : running_apps()) {
        if (is_same_signature(signature, app.signature.c_str()))
            AddTeam(teams, app);
    }
}

status_t BRoster::GetAppInfo(const char* signature, app_info* info) const {
    if (signature == nullptr || info == nullptr)
        return B_BAD_VALUE;
    const std::optional<RunningApp> app = running_app(signature);
    if (!app)
        return B_ERROR;
    Fill(*app, info);
    return B_OK;
}

status_t BRoster::GetAppInfo(const entry_ref* executable, app_info* info) const {
    if (executable == nullptr || info == nullptr)
        return B_BAD_VALUE;
    const std::optional<RunningApp> app = AppOfExecutable(executable);
    if (!app)
        return B_ERROR;
    Fill(*app, info);
    return B_OK;
}

status_t BRoster::GetRunningAppInfo(team_id team, app_info* info) const {
    if (info == nullptr)
        return B_BAD_VALUE;
    const std::optional<RunningApp> app = running_app(team);
    if (!app)
        return B_BAD_TEAM_ID;
    Fill(*app, info);
    return B_OK;
}

status_t BRoster::ActivateApp(team_id team) const {
    const std::optional<RunningApp> app = running_app(team);
    return app ? activate_app(*app, {}) : B_BAD_TEAM_ID;
}

status_t BRoster::Broadcast(BMessage* message) const {
    return Broadcast(message, BMessenger());
}

status_t BRoster::Broadcast(BMessage* message, BMessenger replyTo) const {
    return be_app != nullptr ? be_app_messenger.SendMessage(message, replyTo, 0) : B_OK;
}
