// The program, with one addition: what its indexer window's buttons send can be sent to it from outside, for
// screens on which nobody can press them.

#include "app/AppMessages.h"
#include "app/QuirnelApp.h"

#include <Message.h>
#include <Window.h>

#include <cstdio>

namespace {

class SendableQuirnel : public QuirnelApp {
  public:
    void MessageReceived(BMessage* message) override {
        if (message->what < MSG_INDEX_STATUS || message->what > MSG_INDEX_START) {
            QuirnelApp::MessageReceived(message);
            return;
        }
        IndexWindowSlot().UseLocked([&](BWindow* window) { window->PostMessage(message->what); });
    }
};

} // namespace

int main() {
    brindle_app = new SendableQuirnel;
    brindle_app->Run();
    printf("Bye ");
    delete brindle_app;
    printf("!\n");
    return 0;
}
