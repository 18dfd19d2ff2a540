#include <Roster.h>

#include <Application.h>
#include <CopyText.h>

#include <cstdint>

namespace {

const BRoster sRoster;

} // namespace

const BRoster* be_roster = &sRoster;

BRoster::BRoster() = default;

BRoster::~BRoster() = default;

bool BRoster::IsRunning(const char* signature) const {
    return TeamFor(signature) >= 0;
}

team_id BRoster::TeamFor(const char* signature) const {
    return be_app != nullptr && be_app->HasSignature(signature) ? be_app->Team() : B_ERROR;
}

void BRoster::GetAppList(BList* teams) const {
    if (teams != nullptr && be_app != nullptr)
        teams->AddItem(reinterpret_cast<void*>(static_cast<intptr_t>(be_app->Team())));
}

void BRoster::GetAppList(const char* signature, BList* teams) const {
    if (IsRunning(signature))
        GetAppList(teams);
}

status_t BRoster::GetAppInfo(const char* signature, app_info* info) const {
    if (signature == nullptr || info == nullptr)
        return B_BAD_VALUE;
    const team_id team = TeamFor(signature);
    return team >= 0 ? GetRunningAppInfo(team, info) : B_ERROR;
}

status_t BRoster::GetRunningAppInfo(team_id team, app_info* info) const {
    if (info == nullptr)
        return B_BAD_VALUE;
    if (be_app == nullptr || be_app->Team() != team)
        return B_BAD_TEAM_ID;
    *info = app_info();
    info->thread = be_app->Thread() > 0 ? be_app->Thread() : -1;
    info->team = team;
    CopyText(info->signature, be_app->Signature());
    return B_OK;
}

status_t BRoster::Broadcast(BMessage* message) const {
    return Broadcast(message, BMessenger());
}

status_t BRoster::Broadcast(BMessage* message, BMessenger replyTo) const {
    return be_app != nullptr ? be_app_messenger.SendMessage(message, replyTo, 0) : B_OK;
}
