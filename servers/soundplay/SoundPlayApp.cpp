#include "SoundPlayApp.h"

#include "ErrorLine.h"
#include "host/api/running_applications.h"
#include <Message.h>

#include <algorithm>
#include <cerrno>

namespace {

constexpr bigtime_t kLookInterval = 250'000;

const char* TextOf(int error) {
    return error == ENOTSUP  ? "the player was built without libmpv"
           : error == EINVAL ? "there is no such sound output"
                             : "no memory for another layer";
}

} // namespace

SoundPlayApp::SoundPlayApp(const std::string& output, bigtime_t patience)
    : BApplication(kSoundPlaySignature), mOutput(output), mPatience(patience), mLastUse(system_time()) {
    SetPulseRate(kLookInterval);
}

void SoundPlayApp::MessageReceived(BMessage* message) {
    if (message->what == B_MINIMIZE)
        // There is no window.
        return;
    const int32 command = message->what == kLayerCommand ? message->GetInt32("command", 0) : 0;
    if (command == kNewLayer)
        OpenLayer(message);
    else if (command == kGetValues)
        ListLayers(message);
    else
        BApplication::MessageReceived(message);
}

void SoundPlayApp::DispatchMessage(BMessage* message, BHandler* handler) {
    if (message->what == kLayerCommand || message->what == B_MINIMIZE) {
        mLastUse = system_time();
        if (const team_id client = message->ReturnAddress().Team(); client > 0)
            mClients.insert(client);
    }
    BApplication::DispatchMessage(message, handler);
    RemoveEndedLayers();
}

bool SoundPlayApp::QuitRequested() {
    mLayers.clear();
    return true;
}

void SoundPlayApp::Pulse() {
    for (const std::unique_ptr<Layer>& layer : mLayers)
        layer->Look();
    for (auto client = mClients.begin(); client != mClients.end();) {
        if (host::process_lives(*client)) {
            ++client;
            continue;
        }
        EndLayersOf(*client);
        client = mClients.erase(client);
    }
    if (!mClients.empty() || !mLayers.empty())
        mLastUse = system_time();
    else if (system_time() - mLastUse >= mPatience && !IsMessageWaiting())
        PostMessage(B_QUIT_REQUESTED);
}

void SoundPlayApp::OpenLayer(BMessage* request) {
    std::string error;
    Layer* const layer = MakeLayer(request->GetString("name", ""), request->ReturnAddress().Team(), &error);
    BMessage reply(B_REPLY);
    if (layer != nullptr) {
        reply.AddMessenger("messenger", BMessenger(layer));
        reply.AddInt32("layer", layer->Number());
    } else {
        reply.AddString("error", error.c_str());
        SayError("soundplay", error);
    }
    request->SendReply(&reply, static_cast<BHandler*>(nullptr), 0);
}

Layer* SoundPlayApp::MakeLayer(const std::string& name, team_id client, std::string* error) {
    if (mLayers.size() >= kMostLayers) {
        *error = "there are " + std::to_string(kMostLayers) + " layers already";
        return nullptr;
    }
    host::Result<std::unique_ptr<host::Player>> player = host::make_player(mOutput);
    if (!player) {
        *error = TextOf(player.error());
        return nullptr;
    }
    const int32 number = FreeNumber();
    auto layer = std::make_unique<Layer>(number, name, client, *std::move(player));
    AddHandler(layer.get());
    // Numbers run from 1 without a gap up to the free one.
    return mLayers.insert(mLayers.begin() + (number - 1), std::move(layer))->get();
}

int32 SoundPlayApp::FreeNumber() const {
    int32 number = 1;
    for (const std::unique_ptr<Layer>& layer : mLayers) {
        if (layer->Number() != number)
            break;
        number++;
    }
    return number;
}

void SoundPlayApp::ListLayers(BMessage* request) {
    BMessage reply(B_REPLY);
    for (const std::unique_ptr<Layer>& layer : mLayers) {
        reply.AddMessenger("messenger", BMessenger(layer.get()));
        layer->AddValues(&reply);
    }
    request->SendReply(&reply, static_cast<BHandler*>(nullptr), 0);
}

void SoundPlayApp::RemoveEndedLayers() {
    std::erase_if(mLayers, [](const std::unique_ptr<Layer>& layer) { return layer->HasEnded(); });
}

void SoundPlayApp::EndLayersOf(team_id client) {
    std::erase_if(mLayers,
                  [client](const std::unique_ptr<Layer>& layer) { return layer->Client() == client; });
}
