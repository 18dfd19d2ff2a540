#include "soundplay/SoundplayScripter.h"

#include "soundplay/ScriptMessage.h"

#include <OS.h>
#include <Roster.h>

#include <cstdio>
#include <mutex>
#include <new>
#include <vector>

namespace {

constexpr bigtime_t kPlayersTime = 1'000'000;
constexpr bigtime_t kReplyTimeout = 3'000'000;
constexpr int32 kPortCapacity = 4;
constexpr int32 kUsualLayers = 20;

// What callers may hold on to when its layer or the scripter has gone. Any thread.
class LeftBehind {
  public:
    static LeftBehind& Instance() {
        static LeftBehind leftBehind;
        return leftBehind;
    }
    BMessenger* Add(std::unique_ptr<BMessenger> messenger) {
        const std::lock_guard lock(mMutex);
        return mMessengers.emplace_back(std::move(messenger)).get();
    }
    void Add(std::unique_ptr<sptrackinfo> layer) {
        const std::lock_guard lock(mMutex);
        mLayers.push_back(std::move(layer));
    }

  private:
    std::mutex mMutex;
    std::vector<std::unique_ptr<BMessenger>> mMessengers;
    std::vector<std::unique_ptr<sptrackinfo>> mLayers;
};

} // namespace

SoundplayScripter::SoundplayScripter() : mLayers(std::make_unique<BList>(kUsualLayers)) {
    BList teams;
    be_roster->GetAppList(kSoundPlaySignature, &teams);
    if (teams.IsEmpty()) {
        mQuitAtEnd = true;
        return;
    }
    // The line is not ended.
    printf("SoundPlay already running, establishing connection...");
    mMessenger.reset(new (std::nothrow) BMessenger(kSoundPlaySignature, -1));
    mConnected = mMessenger != nullptr;
    if (!mConnected)
        printf("SoundplayScripter::SoundplayScripter() SP running, but not running anymore ? Connection "
               "failed.\n");
}

SoundplayScripter::~SoundplayScripter() {
    if (mQuitAtEnd)
        QuitSoundPlay();
    for (int32 index = 0; index < mLayers->CountItems(); index++)
        LeftBehind::Instance().Add(
            std::unique_ptr<sptrackinfo>(static_cast<sptrackinfo*>(mLayers->ItemAt(index))));
}

void SoundplayScripter::StartSoundPlay() {
    if (mConnected)
        return;
    entry_ref ref;
    status_t result = be_roster->FindApp(kSoundPlaySignature, &ref);
    if (result >= B_OK)
        result = be_roster->Launch(&ref);
    if (result == B_ALREADY_RUNNING) {
        printf("Soundplay already ran...\n");
        BuildConnection();
        mQuitAtEnd = false;
    } else if (result >= B_OK) {
        snooze(kPlayersTime);
        BuildConnection();
        mQuitAtEnd = true;
    } else {
        printf("Error %ld while launching SoundPlay\n", static_cast<long>(result));
        mQuitAtEnd = false;
    }
}

void SoundplayScripter::BuildConnection() {
    // Whether it is valid is not asked, on purpose: who sends finds out.
    mMessenger.reset(new (std::nothrow) BMessenger(kSoundPlaySignature, -1));
    mConnected = mMessenger != nullptr;
    if (!mConnected) {
        printf("ERROR: Can't build a connection to SoundPlay\n");
        return;
    }
    printf("Soundplay connection succeeded\n");
    BMessage minimize(B_MINIMIZE);
    minimize.AddBool("minimize", true);
    minimize.AddInt64("when", real_time_clock_usecs());
    mMessenger->SendMessage(&minimize);
}

void SoundplayScripter::QuitSoundPlay() {
    if (!mConnected)
        return;
    if (mMessenger == nullptr) {
        printf("SoundplayScripter::QuitSoundPlay(): No messenger\n");
        return;
    }
    mMessenger->SendMessage(B_QUIT_REQUESTED);
    snooze(kPlayersTime);
    // Connected it stays, so that a new layer does not start the player again.
    mMessenger.reset();
}

std::unique_ptr<sptrackinfo> SoundplayScripter::MakeLayer(SoundplayBrindleTrack* track) {
    auto layer = std::make_unique<sptrackinfo>();
    layer->messenger = LeftBehind::Instance().Add(std::make_unique<BMessenger>());
    layer->track = track;
    layer->port = create_port(kPortCapacity, "spport");
    return layer;
}

sptrackinfo* SoundplayScripter::NewLayer(entry_ref* ref, SoundplayBrindleTrack* track) {
    if (!mConnected)
        StartSoundPlay();
    if (!mConnected || mMessenger == nullptr)
        return nullptr;

    std::unique_ptr<sptrackinfo> layer = MakeLayer(track);
    BMessage reply('poep');
    {
        ScriptMessage request(SCRIPTNEWLAYER);
        request.AddString("name", ref->name);
        request.AddInt32("port", layer->port);
        mMessenger->SendMessage(&request, &reply, kReplyTimeout, kReplyTimeout);
    }
    layer->ParseReply(&reply);
    if (reply.FindMessenger("messenger", layer->messenger) == B_OK)
        SetLayerTrack(layer.get(), ref);
    // Also a layer that has no messenger.
    mLayers->AddItem(layer.get());
    return layer.release();
}

sptrackinfo* SoundplayScripter::TakeUpLayer(const BMessenger& messenger) {
    std::unique_ptr<sptrackinfo> layer = MakeLayer(nullptr);
    *layer->messenger = messenger;
    mLayers->AddItem(layer.get());
    return layer.release();
}

status_t SoundplayScripter::Send(const sptrackinfo& layer, ScriptMessage& message) {
    return layer.messenger->SendMessage(&message, static_cast<BHandler*>(nullptr), B_INFINITE_TIMEOUT);
}

void SoundplayScripter::SendValue(const sptrackinfo& layer, const char* name, double value) {
    ScriptMessage message(SCRIPTSETVALUES);
    message.AddDouble(name, value);
    Send(layer, message);
}

void SoundplayScripter::SetLayerTrack(sptrackinfo* layer, entry_ref* ref) {
    ScriptMessage message(SCRIPTSETVALUES);
    message.AddRef("newref", ref);
    if (Send(*layer, message) < B_OK)
        printf("error sending opentrack\n");
}

void SoundplayScripter::DeleteLayer(sptrackinfo* layer) {
    if (!mLayers->HasItem(layer)) {
        printf("SoundplayScripter::DeleteLayer: layer not found\n");
        return;
    }
    ScriptMessage message(SCRIPTDELETELAYER);
    Send(*layer, message);
    mLayers->RemoveItem(layer);
    delete layer;
}

void SoundplayScripter::UpdateLayerInfo(sptrackinfo* layer) {
    if (!mLayers->HasItem(layer)) {
        printf("SoundplayScripter::UpdateLayerInfo: layer not found\n");
        return;
    }
    ScriptMessage message(SCRIPTGETVALUES);
    Send(*layer, message);
    printf("Reply to SCRIPTGETVALUES: \n");
}

void SoundplayScripter::RepitchLayer(sptrackinfo* layer, double pitch) {
    if (mLayers->HasItem(layer))
        SendValue(*layer, "pitch", pitch);
    else
        printf("SoundplayScripter::RepitchLayer: layer not found\n");
}

void SoundplayScripter::SeekLayer(sptrackinfo* layer, double position) {
    if (mLayers->HasItem(layer))
        SendValue(*layer, "abspos", position);
    else
        printf("SoundplayScripter::SeekLayer: layer not found\n");
}

void SoundplayScripter::SetLevel(sptrackinfo* layer, float level) {
    printf("SoundplayScripter::SetLevel(): %f\n", static_cast<double>(level));
    if (mLayers->HasItem(layer))
        SendValue(*layer, "volume", static_cast<double>(level));
    else
        // The text names the other method on purpose.
        printf("SoundplayScripter::SeekLayer: layer not found\n");
}
