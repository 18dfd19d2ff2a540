// A small application that the tests talk to from another process. Usage: test-peer [ARGUMENT...]
// TEST_PEER_SIGNATURE is its signature.
// Every hook that is called becomes a line "PROCESS HOOK ..." in the file that TEST_PEER_LOG names.
#include <Application.h>
#include <Messenger.h>
#include <OS.h>

#include <csignal>
#include <cstdlib>
#include <fcntl.h>
#include <string>
#include <sys/stat.h>
#include <unistd.h>

namespace {

void Log(const std::string& text) {
    const char* path = std::getenv("TEST_PEER_LOG");
    const int file = path != nullptr ? open(path, O_WRONLY | O_APPEND | O_CREAT | O_CLOEXEC, 0600) : -1;
    if (file < 0)
        return;
    const std::string line = std::to_string(getpid()) + " " + text + "\n";
    (void)!write(file, line.data(), line.size());
    close(file);
}

class Peer : public BApplication {
  public:
    using BApplication::BApplication;

    void ReadyToRun() override { Log("ready"); }
    void ArgvReceived(int32 argc, char** argv) override {
        std::string text = "argv";
        for (int32 index = 1; index < argc; index++)
            text += std::string(" ") + argv[index];
        Log(text + (CurrentMessage()->HasString("cwd") ? "" : " without cwd"));
    }
    void RefsReceived(BMessage* message) override {
        entry_ref ref;
        message->FindRef("refs", &ref);
        Log(std::string("refs ") + (ref.name != nullptr ? ref.name : ""));
    }
    void AppActivated(bool active) override { Log(active ? "activated" : "deactivated"); }

    void MessageReceived(BMessage* message) override {
        switch (message->what) {
        case 'echo': {
            BMessage reply(*message);
            reply.what = 'back';
            reply.AddInt32("team", Team());
            reply.AddBool("remote", message->IsSourceRemote());
            message->SendReply(&reply);
            break;
        }
        case 'keep':
            // The sender waits in vain.
            (void)DetachCurrentMessage();
            break;
        case 'die ':
            raise(SIGKILL);
            break;
        case 'stop':
            raise(SIGSTOP);
            break;
        case 'slow':
            snooze(message->GetInt64("time", 0));
            break;
        case 'numb':
            if (message->GetInt32("number", -1) == mNumbers)
                mNumbers++;
            break;
        case 'sum?': {
            BMessage reply('sum!');
            reply.AddInt32("numbers", mNumbers);
            message->SendReply(&reply);
            break;
        }
        case 'pass': {
            // On to somebody whom the sender names.
            BMessenger target;
            BMessage passed('pass');
            status_t status = message->FindMessenger("target", &target);
            passed.AddBool("local", target.IsTargetLocal());
            passed.AddBool("valid", target.IsValid());
            if (status == B_OK)
                status = target.SendMessage(&passed);
            BMessage reply('done');
            reply.AddInt32("status", status);
            reply.AddMessenger("me", BMessenger(this));
            message->SendReply(&reply);
            break;
        }
        case 'text':
            Log(std::string("text ") + message->GetString("text", ""));
            break;
        case B_SILENT_RELAUNCH:
            Log("relaunched");
            BApplication::MessageReceived(message);
            break;
        default:
            Log("code " + std::to_string(message->what));
            BApplication::MessageReceived(message);
        }
    }

  private:
    int32 mNumbers = 0;
};

} // namespace

int main() {
    Peer peer(std::getenv("TEST_PEER_SIGNATURE"));
    const thread_id thread = peer.Run();
    Log(thread >= 0 ? "ended" : thread == B_ALREADY_RUNNING ? "runs already" : "failed");
    return 0;
}
