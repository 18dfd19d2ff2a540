#include "Interruption.h"

#include <csignal>
#include <initializer_list>

namespace {

volatile std::sig_atomic_t gInterrupted = 0;

void Note(int signal) {
    gInterrupted = 1;
    std::signal(signal, SIG_DFL);
}

} // namespace

void CatchInterruptions() {
    for (const int signal : {SIGINT, SIGTERM, SIGHUP})
        std::signal(signal, Note);
}

bool Interrupted() {
    return gInterrupted != 0;
}
