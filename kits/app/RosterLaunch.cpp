// BRoster: finding programs and starting them.
#include <Roster.h>

#include "AppClaim.h"
#include "AppFiles.h"
#include "AppFinder.h"
#include "AppLaunch.h"
#include "MessageDelivery.h"
#include "RunningApps.h"
#include "host/api/processes.h"
#include <List.h>

#include <algorithm>

namespace {

constexpr bigtime_t kPatience = 5'000'000;

// What a program is started with.
struct Luggage {
    MessageList messages;
    std::vector<std::string> arguments;
};

std::unique_ptr<BMessage> CopyOf(const BMessage* message) {
    return std::make_unique<BMessage>(*message);
}

Luggage WithMessages(const BMessage* message) {
    Luggage luggage;
    if (message != nullptr)
        luggage.messages.push_back(CopyOf(message));
    return luggage;
}

Luggage WithMessages(const BList* messages) {
    Luggage luggage;
    for (int32 index = 0; messages != nullptr && index < messages->CountItems(); index++) {
        if (const auto* message = static_cast<const BMessage*>(messages->ItemAt(index)))
            luggage.messages.push_back(CopyOf(message));
    }
    return luggage;
}

Luggage WithArguments(int argc, const char* const* args) {
    Luggage luggage;
    for (int index = 0; args != nullptr && index < argc && args[index] != nullptr; index++)
        luggage.arguments.emplace_back(args[index]);
    return luggage;
}

// The one in whose favour no other is started.
std::optional<RunningApp> RunningInstead(const FoundApp& found) {
    const uint32 launch = found.flags & B_LAUNCH_MASK;
    if (launch == B_MULTIPLE_LAUNCH)
        return std::nullopt;
    entry_ref ref;
    const std::string executable = ref_of_path(found.executable, &ref) ? path_of_ref(ref) : std::string();
    for (RunningApp& app : running_apps()) {
        if (is_same_signature(found.signature.c_str(), app.signature.c_str()) &&
            (launch == B_EXCLUSIVE_LAUNCH || app.executable == executable))
            return std::move(app);
    }
    return std::nullopt;
}

std::unique_ptr<BMessage> CommandLine(const FoundApp& found, const std::vector<std::string>& arguments) {
    auto message = std::make_unique<BMessage>(B_ARGV_RECEIVED);
    message->AddInt32("argc", static_cast<int32>(arguments.size() + 1));
    message->AddString("argv", found.executable.c_str());
    for (const std::string& argument : arguments)
        message->AddString("argv", argument.c_str());
    message->AddString("cwd", host::current_directory().c_str());
    return message;
}

// What an application that runs already gets in place of a start. B_ALREADY_RUNNING, or why it cannot be
// reached.
status_t HandOver(const RunningApp& app, const Luggage& luggage, const FoundApp& found) {
    std::unique_ptr<BMessage> instead;
    if (!luggage.arguments.empty())
        instead = CommandLine(found, luggage.arguments);
    else if (luggage.messages.empty())
        instead = std::make_unique<BMessage>(B_SILENT_RELAUNCH);
    std::vector<BMessage*> messages;
    if (instead != nullptr)
        messages.push_back(instead.get());
    for (const std::unique_ptr<BMessage>& message : luggage.messages)
        messages.push_back(message.get());
    const BMessenger application = MessageDelivery::MessengerTo(app.address);
    for (BMessage* message : messages) {
        if (const status_t status = application.SendMessage(message, BMessenger(), kPatience); status != B_OK)
            return status;
    }
    // Whether its windows come to the front is no matter of whether it runs.
    if ((app.flags & B_BACKGROUND_APP) == 0)
        (void)activate_app(app, activation_token());
    return B_ALREADY_RUNNING;
}

// The files that messages name.
std::vector<std::string> PathsIn(const MessageList& messages) {
    std::vector<std::string> paths;
    for (const std::unique_ptr<BMessage>& message : messages) {
        entry_ref ref;
        for (int32 index = 0; message->FindRef("refs", index, &ref) == B_OK; index++) {
            if (const std::string path = path_of_ref(ref); !path.empty())
                paths.push_back(path);
        }
    }
    return paths;
}

status_t StatusOfStart(int error) {
    return error == ENOENT ? B_LAUNCH_FAILED_APP_NOT_FOUND : B_LAUNCH_FAILED_EXECUTABLE;
}

status_t StartProgram(const FoundApp& found, const Luggage& luggage, team_id* team) {
    std::vector<std::string> paths = PathsIn(luggage.messages);
    std::vector<std::vector<std::string>> starts = {paths};
    if (found.desktop) {
        // Nobody has a terminal to give it.
        if (found.desktop->in_terminal)
            return B_LAUNCH_FAILED_EXECUTABLE;
        starts = host::arguments_for(*found.desktop, paths);
    }
    for (std::vector<std::string>& arguments : starts) {
        host::ProcessStart start;
        start.executable = found.executable;
        start.arguments = std::move(arguments);
        start.arguments.insert(start.arguments.end(), luggage.arguments.begin(), luggage.arguments.end());
        const auto process = host::start_process(start, {});
        if (!process)
            return StatusOfStart(process.error());
        *team = *process;
    }
    return B_OK;
}

status_t LaunchFound(const FoundApp& found, Luggage luggage, team_id* team) {
    team_id started = -1;
    team_id& answer = team != nullptr ? *team : started;
    if (!found.IsApplication())
        return StartProgram(found, luggage, &answer);
    if (const std::optional<RunningApp> running = RunningInstead(found)) {
        const status_t status = HandOver(*running, luggage, found);
        if (status == B_ALREADY_RUNNING)
            answer = running->address.team;
        // One that is just ending does not count; the new process will wait for its end.
        if (status != B_BAD_PORT_ID && status != B_BAD_TEAM_ID)
            return status;
    }
    if ((found.flags & B_ARGV_ONLY) != 0)
        luggage.messages.clear();
    return AppLaunch().Start(found.executable, luggage.arguments, luggage.messages, &answer);
}

status_t LaunchType(const char* mimeType, Luggage luggage, team_id* team) {
    FoundApp found;
    const status_t status = mimeType != nullptr ? find_app_by_type(mimeType, &found) : B_BAD_VALUE;
    return status == B_OK ? LaunchFound(found, std::move(luggage), team) : status;
}

status_t LaunchFile(const entry_ref* ref, Luggage luggage, team_id* team) {
    if (ref == nullptr)
        return B_BAD_VALUE;
    const std::string path = path_of_ref(*ref);
    if (path.empty())
        return B_ENTRY_NOT_FOUND;
    FoundApp found;
    if (find_app_that_is(path, &found))
        return LaunchFound(found, std::move(luggage), team);
    if (const status_t status = find_app_for_file(*ref, &found); status != B_OK)
        return status;
    if (luggage.arguments.empty()) {
        auto refs = std::make_unique<BMessage>(B_REFS_RECEIVED);
        refs->AddRef("refs", ref);
        luggage.messages.insert(luggage.messages.begin(), std::move(refs));
    } else {
        luggage.arguments.push_back(path);
    }
    return LaunchFound(found, std::move(luggage), team);
}

status_t Found(status_t status, const FoundApp& found, entry_ref* app) {
    if (status != B_OK)
        return status;
    return ref_of_path(found.executable, app) ? B_OK : B_LAUNCH_FAILED_APP_NOT_FOUND;
}

} // namespace

status_t BRoster::FindApp(const char* mimeType, entry_ref* app) const {
    if (mimeType == nullptr || app == nullptr)
        return B_BAD_VALUE;
    FoundApp found;
    const status_t status = find_app_by_type(mimeType, &found);
    return Found(status, found, app);
}

status_t BRoster::FindApp(const entry_ref* ref, entry_ref* app) const {
    if (ref == nullptr || app == nullptr)
        return B_BAD_VALUE;
    FoundApp found;
    const status_t status = find_app_for_file(*ref, &found);
    return Found(status, found, app);
}

status_t BRoster::Launch(const char* mimeType, const BMessage* message, team_id* team) const {
    return LaunchType(mimeType, WithMessages(message), team);
}

status_t BRoster::Launch(const char* mimeType, const BList* messages, team_id* team) const {
    return LaunchType(mimeType, WithMessages(messages), team);
}

status_t BRoster::Launch(const char* mimeType, int argc, const char* const* args, team_id* team) const {
    return LaunchType(mimeType, WithArguments(argc, args), team);
}

status_t BRoster::Launch(const entry_ref* ref, const BMessage* message, team_id* team) const {
    return LaunchFile(ref, WithMessages(message), team);
}

status_t BRoster::Launch(const entry_ref* ref, const BList* messages, team_id* team) const {
    return LaunchFile(ref, WithMessages(messages), team);
}

status_t BRoster::Launch(const entry_ref* ref, int argc, const char* const* args, team_id* team) const {
    return LaunchFile(ref, WithArguments(argc, args), team);
}
