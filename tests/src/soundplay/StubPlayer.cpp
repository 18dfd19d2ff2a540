// A stand-in for the player. What it is sent becomes lines in the file that TEST_PLAYER_LOG names: who got it
// ("player" or "layer"), the code in hexadecimal, the fields in their order.
// TEST_PLAYER_MODE: "answers" with a messenger, "gone" with one of a layer that has ended, "nameless" without
// one, "silent" not at all.
#include <Application.h>
#include <Messenger.h>
#include <OS.h>

#include <cstdio>
#include <cstdlib>
#include <fcntl.h>
#include <string>
#include <unistd.h>

namespace {

void Log(const std::string& text) {
    const int file = open(std::getenv("TEST_PLAYER_LOG"), O_WRONLY | O_APPEND | O_CREAT | O_CLOEXEC, 0600);
    const std::string line = text + "\n";
    (void)!write(file, line.data(), line.size());
    close(file);
}

std::string ValueOf(const BMessage& message, const char* name, type_code type) {
    switch (type) {
    case B_INT32_TYPE:
        return "int32 " + std::to_string(message.GetInt32(name, -1));
    case B_INT64_TYPE:
        // A time of day in microseconds: after the year 2020, or not.
        return message.GetInt64(name, -1) > 1'577'836'800'000'000 ? "int64 now" : "int64 ?";
    case B_BOOL_TYPE:
        return message.GetBool(name, false) ? "bool true" : "bool false";
    case B_STRING_TYPE:
        return std::string("string ") + message.GetString(name, "");
    case B_DOUBLE_TYPE: {
        char text[64];
        std::snprintf(text, sizeof(text), "double %.17g", message.GetDouble(name, -1));
        return text;
    }
    case B_REF_TYPE: {
        entry_ref ref;
        message.FindRef(name, &ref);
        return std::string("ref ") + (ref.name != nullptr ? ref.name : "");
    }
    default:
        return "?";
    }
}

void LogMessage(const char* receiver, const BMessage& message) {
    char code[16];
    std::snprintf(code, sizeof(code), " %08x", message.what);
    std::string line = receiver + std::string(code) + (message.IsSourceWaiting() ? " waiting" : "");
    char* name = nullptr;
    type_code type = 0;
    int32 count = 0;
    for (int32 index = 0; message.GetInfo(B_ANY_TYPE, index, &name, &type, &count) == B_OK; index++)
        line +=
            std::string(" ") + name + "=" + ValueOf(message, name, type) + (count == 1 ? "" : " and more");
    Log(line);
}

class Layer : public BLooper {
  public:
    void MessageReceived(BMessage* message) override { LogMessage("layer", *message); }
};

class Player : public BApplication {
  public:
    Player() : BApplication("application/x-marcone-soundplay") {}

    void ReadyToRun() override { Log("ready"); }
    bool QuitRequested() override {
        Log("quit");
        return true;
    }
    void MessageReceived(BMessage* message) override {
        if (message->what != 'abra' && message->what != B_MINIMIZE) {
            BApplication::MessageReceived(message);
            return;
        }
        LogMessage("player", *message);
        const std::string mode = std::getenv("TEST_PLAYER_MODE");
        if (message->what != 'abra')
            return;
        if (mode == "silent") {
            // The sender waits in vain.
            (void)DetachCurrentMessage();
            return;
        }
        BMessage reply(B_REPLY);
        reply.AddString("something", "else");
        if (mode == "answers" || mode == "gone") {
            auto* const layer = new Layer;
            layer->Run();
            reply.AddMessenger("messenger", BMessenger(layer));
            if (mode == "gone" && layer->Lock())
                layer->Quit();
        }
        message->SendReply(&reply);
    }
};

} // namespace

int main() {
    Player player;
    player.Run();
    Log("ended");
    return 0;
}
