#include "Programs.h"

#include "Output.h"
#include <Errors.h>
#include <Roster.h>
#include <fcntl.h>
#include <optional>
#include <unistd.h>

namespace {

/// Standard error leads nowhere, and so does that of a program which is started meanwhile.
class SilencedErrors {
  public:
    SilencedErrors() : mErrors(fcntl(STDERR_FILENO, F_DUPFD_CLOEXEC, 3)) {
        const int nowhere = open("/dev/null", O_WRONLY | O_CLOEXEC);
        if (mErrors >= 0 && nowhere >= 0)
            dup2(nowhere, STDERR_FILENO);
        if (nowhere >= 0)
            close(nowhere);
    }
    ~SilencedErrors() {
        if (mErrors < 0)
            return;
        dup2(mErrors, STDERR_FILENO);
        close(mErrors);
    }
    SilencedErrors(const SilencedErrors&) = delete;
    SilencedErrors& operator=(const SilencedErrors&) = delete;

  private:
    const int mErrors;
};

} // namespace

std::string ProblemOf(const std::string& signature, status_t status) {
    const std::string application = Printable(signature);
    switch (status) {
    case B_LAUNCH_FAILED_APP_NOT_FOUND:
        return application + " is not installed";
    case B_BAD_PORT_ID:
    case B_BAD_TEAM_ID:
        return application + " is not running";
    case B_TIMED_OUT:
        return application + " does not answer";
    default:
        return application + ": " + strerror(status);
    }
}

std::string StartProgram(const std::string& signature, LaunchedErrors errors, bool& launched) {
    launched = false;
    if (be_roster->IsRunning(signature.c_str()))
        return "";
    status_t status = B_OK;
    {
        std::optional<SilencedErrors> silence;
        if (errors == LaunchedErrors::dropped)
            silence.emplace();
        status = be_roster->Launch(signature.c_str());
    }
    if (status != B_OK && status != B_ALREADY_RUNNING)
        return ProblemOf(signature, status);
    launched = status == B_OK;
    return "";
}
