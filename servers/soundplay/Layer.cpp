#include "Layer.h"

#include "ErrorLine.h"
#include "LayerMessages.h"
#include "host/api/file_system.h"
#include <Errors.h>
#include <Message.h>

#include <cstdio>

namespace {

void Say(const std::string& text) {
    SayError("soundplay", text);
}

const char* TextOf(host::PlayerState state) {
    switch (state) {
    case host::PlayerState::empty:
        return "empty";
    case host::PlayerState::loading:
        return "loading";
    case host::PlayerState::playing:
        return "playing";
    case host::PlayerState::halted:
        return "halted";
    case host::PlayerState::ended:
        return "ended";
    case host::PlayerState::failed:
        break;
    }
    return "failed";
}

const char* TextOf(host::PlayerFailure failure) {
    switch (failure) {
    case host::PlayerFailure::unreadable:
        return "cannot be read";
    case host::PlayerFailure::not_sound:
        return "holds no sound that can be played";
    case host::PlayerFailure::no_output:
        return "cannot be heard: there is no sound output";
    case host::PlayerFailure::none:
    case host::PlayerFailure::other:
        break;
    }
    return "cannot be played";
}

// Links are followed. Empty when there is no such file.
std::string PathOf(const entry_ref& ref) {
    host::FileSystem& files = host::file_system();
    const auto path = files.path_of({ref.device, ref.directory, ref.name != nullptr ? ref.name : ""});
    return path ? *path : std::string();
}

host::Result<host::NodeStat> StatOf(const std::string& path) {
    const auto target = host::file_system().entry_of(path, host::Follow::yes);
    return target ? host::file_system().stat(*target) : host::Result<host::NodeStat>(target.status());
}

} // namespace

Layer::Layer(int32 number, const std::string& name, team_id client, std::unique_ptr<host::Player> player)
    : mNumber(number), mClient(client), mName(name), mPlayer(std::move(player)) {}

void Layer::MessageReceived(BMessage* message) {
    if (message->what != kLayerCommand || HasEnded()) {
        BHandler::MessageReceived(message);
        return;
    }
    BMessage reply(B_REPLY);
    switch (message->GetInt32("command", 0)) {
    case kDeleteLayer:
        mPlayer.reset();
        reply.AddInt32("status", B_OK);
        break;
    case kSetValues:
        reply.AddInt32("status", SetValues(*message));
        break;
    case kGetValues:
        AddValues(&reply);
        // Also to a sender who does not wait.
        message->SendReply(&reply, static_cast<BHandler*>(nullptr), 0);
        return;
    default:
        // Not the player's either, which the message would go on to.
        reply.what = B_MESSAGE_NOT_UNDERSTOOD;
    }
    if (message->IsSourceWaiting())
        message->SendReply(&reply);
}

status_t Layer::SetValues(const BMessage& message) {
    status_t status = B_OK;
    entry_ref ref;
    if (message.FindRef("newref", &ref) == B_OK)
        Play(ref);
    double value = 0;
    if (message.FindDouble("pitch", &value) == B_OK && !mPlayer->set_pitch(value)) {
        Refuse("pitch", value);
        status = B_BAD_VALUE;
    }
    if (message.FindDouble("abspos", &value) == B_OK && !mPlayer->seek(value)) {
        Refuse("position", value);
        status = B_BAD_VALUE;
    }
    if (message.FindDouble("volume", &value) == B_OK && !mPlayer->set_volume(value)) {
        Refuse("volume", value);
        status = B_BAD_VALUE;
    }
    return status;
}

void Layer::Play(const entry_ref& ref) {
    mError.clear();
    mName = ref.name != nullptr ? ref.name : "";
    mPath = PathOf(ref);
    const auto stat = StatOf(mPath);
    // Only a file is opened: to open a pipe can last for ever.
    if (mPath.empty() || !stat)
        Fail("is not there");
    else if (stat->kind != host::NodeKind::file)
        Fail("is no file");
    else if (!mPlayer->load(mPath))
        Fail("cannot be played: no memory");
}

void Layer::Look() {
    if (!HasEnded())
        LookAt(mPlayer->values());
}

void Layer::LookAt(const host::PlayerValues& values) {
    if (mError.empty() && values.state == host::PlayerState::failed)
        Fail(TextOf(values.failure));
}

void Layer::Fail(const std::string& why) {
    mError = why;
    mPlayer->unload();
    Say(PrintableName(Name()) + ": " + why);
}

void Layer::Refuse(const char* what, double value) {
    char text[64];
    std::snprintf(text, sizeof(text), "%g", value);
    Say("layer " + std::to_string(mNumber) + ": cannot take the " + what + " " + text);
}

std::string Layer::Name() const {
    return mPath.empty() ? mName : mPath;
}

void Layer::AddValues(BMessage* reply) {
    const host::PlayerValues values = mPlayer->values();
    // What the reply says has been said here.
    LookAt(values);
    reply->AddInt32("layer", mNumber);
    reply->AddString("name", mName.c_str());
    reply->AddString("path", mPath.c_str());
    reply->AddString("state", mError.empty() ? TextOf(values.state) : "failed");
    reply->AddString("error", mError.c_str());
    reply->AddDouble("pitch", values.pitch);
    reply->AddDouble("position", values.position);
    reply->AddDouble("length", values.length);
    reply->AddDouble("volume", values.volume);
}
