// What passes between a program that launches an application and the process that it starts. Internal to the
// app kit.
#pragma once

#include "RunningApps.h"
#include <Message.h>

#include <memory>
#include <string>
#include <vector>

class ReplyBox;

using MessageList = std::vector<std::unique_ptr<BMessage>>;

// The launching side. The new process finds its way back by a variable of its environment; it asks for its
// messages, and reports when it runs or has handed them to another. One thread.
class AppLaunch {
  public:
    AppLaunch();
    ~AppLaunch();
    AppLaunch(const AppLaunch&) = delete;
    AppLaunch& operator=(const AppLaunch&) = delete;

    // Starts the executable and waits until the application runs: B_OK, or B_ALREADY_RUNNING when it has
    // found another one and given that the messages; `team` receives the one that runs. B_LAUNCH_FAILED,
    // B_TIMED_OUT and so on as BRoster::Launch().
    status_t Start(const std::string& executable, const std::vector<std::string>& arguments,
                   const MessageList& messages, team_id* team);

  private:
    const std::shared_ptr<ReplyBox> mRequest;
    const std::shared_ptr<ReplyBox> mReport;
    const int32 mRequestToken;
    const int32 mReportToken;
};

// The launched side. One thread.
class AppLauncher {
  public:
    // Reads the variable and removes it.
    AppLauncher();

    // Asks for the messages; none when this process was not launched by the kits.
    MessageList TakeMessages();
    // Tells that `team` is the one that runs now.
    void Report(team_id team);

  private:
    MessengerAddress mRequest;
    MessengerAddress mReport;
};
