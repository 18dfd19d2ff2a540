#include "AppLaunch.h"

#include "MessageDelivery.h"
#include "MessageTransport.h"
#include "ReplyBox.h"
#include "TokenTable.h"
#include "host/api/processes.h"
#include <Roster.h>

#include <algorithm>
#include <cstdio>

namespace {

constexpr const char* kVariable = "BEKITS_LAUNCH";
constexpr bigtime_t kSecond = 1'000'000;
// From the start of the process to its asking, and from there to its report.
constexpr bigtime_t kLongestStart = 10 * kSecond;
// The launcher only has to be woken up for its part.
constexpr bigtime_t kLauncherPatience = 5 * kSecond;

constexpr uint32 kRequest = '_LRQ';
constexpr uint32 kReport = '_LRP';
constexpr const char* kMessages = "messages";
constexpr const char* kTeam = "team";

status_t StatusOfStart(int error) {
    switch (error) {
    case ENOENT:
    case ENOTDIR:
        return B_LAUNCH_FAILED_APP_NOT_FOUND;
    case EACCES:
    case ENOEXEC:
        return B_LAUNCH_FAILED_EXECUTABLE;
    default:
        return B_LAUNCH_FAILED;
    }
}

} // namespace

AppLaunch::AppLaunch()
    : mRequest(std::make_shared<ReplyBox>(-1)), mReport(std::make_shared<ReplyBox>(-1)),
      mRequestToken(TokenTable::Instance().AddReplyBox(mRequest)),
      mReportToken(TokenTable::Instance().AddReplyBox(mReport)) {}

AppLaunch::~AppLaunch() {
    TokenTable::Instance().Remove(mReportToken);
    TokenTable::Instance().Remove(mRequestToken);
}

status_t AppLaunch::Start(const std::string& executable, const std::vector<std::string>& arguments,
                          const MessageList& messages, team_id* team) {
    if (const status_t status = MessageTransport::Open(); status != B_OK)
        return status;
    host::ProcessStart start;
    start.executable = executable;
    start.arguments = arguments;
    start.variables.emplace_back(kVariable, std::to_string(MessageDelivery::LocalAddress(0, false).team) +
                                                ":" + std::to_string(mRequestToken) + ":" +
                                                std::to_string(mReportToken));
    const bigtime_t deadline = system_time() + kLongestStart;
    const auto process = host::start_process(start, [request = mRequest, report = mReport](int) {
        request->Fail(B_LAUNCH_FAILED);
        report->Fail(B_LAUNCH_FAILED);
    });
    if (!process)
        return StatusOfStart(process.error());
    *team = *process;
    std::unique_ptr<BMessage> request;
    std::unique_ptr<BMessage> report;
    status_t status = mRequest->Wait(deadline - system_time(), &request);
    if (status == B_OK) {
        BMessage reply(B_REPLY);
        for (const std::unique_ptr<BMessage>& message : messages)
            reply.AddMessage(kMessages, message.get());
        status = request->SendReply(&reply, BMessenger(), std::max(deadline - system_time(), bigtime_t{0}));
    }
    if (status == B_OK)
        status = mReport->Wait(deadline - system_time(), &report);
    if (status != B_OK)
        return status == B_TIMED_OUT ? B_TIMED_OUT : B_LAUNCH_FAILED;
    *team = report->GetInt32(kTeam, *process);
    return *team == *process ? B_OK : B_ALREADY_RUNNING;
}

AppLauncher::AppLauncher() {
    const std::string value = host::take_environment_variable(kVariable);
    MessengerAddress request;
    MessengerAddress report;
    // Numbers are all that is read; a wrong one finds nobody.
    if (std::sscanf(value.c_str(), "%d:%d:%d", &request.team, &request.token, &report.token) != 3)
        return;
    report.team = request.team;
    mRequest = request;
    mReport = report;
}

MessageList AppLauncher::TakeMessages() {
    MessageList messages;
    if (mRequest.token == 0)
        return messages;
    BMessage request(kRequest);
    BMessage reply;
    const BMessenger launcher = MessageDelivery::MessengerTo(mRequest);
    // A launcher that has gone has nothing to give.
    if (launcher.SendMessage(&request, &reply, kLauncherPatience, kLauncherPatience) != B_OK)
        return messages;
    for (int32 index = 0;; index++) {
        auto message = std::make_unique<BMessage>();
        if (reply.FindMessage(kMessages, index, message.get()) != B_OK)
            return messages;
        messages.push_back(std::move(message));
    }
}

void AppLauncher::Report(team_id team) {
    if (mReport.token == 0)
        return;
    BMessage report(kReport);
    report.AddInt32(kTeam, team);
    MessageDelivery::MessengerTo(mReport).SendMessage(&report, BMessenger(), kLauncherPatience);
}
