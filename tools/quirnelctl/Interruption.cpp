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
    for (const int signal : {SIGINT, SIGTERM, SIGHUP}) {
        // What the caller had ignored stays so: the hang-up of a job under nohup.
        if (std::signal(signal, Note) == SIG_IGN)
            std::signal(signal, SIG_IGN);
    }
}

bool Interrupted() {
    return gInterrupted != 0;
}
