#include "host/api/processes.h"

#include "descriptor.h"
#include "event_thread.h"
#include "host/api/threads.h"

#include <algorithm>
#include <climits>
#include <csignal>
#include <cstdlib>
#include <fcntl.h>
#include <fstream>
#include <iterator>
#include <memory>
#include <spawn.h>
#include <sys/epoll.h>
#include <sys/stat.h>
#include <sys/syscall.h>
#include <sys/wait.h>
#include <unistd.h>

namespace host {

namespace {

// What was meant for this process alone: who launched it, and the user's click that did.
constexpr const char* own_variables[] = {"BEKITS_LAUNCH", "XDG_ACTIVATION_TOKEN", "DESKTOP_STARTUP_ID"};

bool names(const std::string& variable, const std::string& name) {
    return variable.size() > name.size() && variable.compare(0, name.size(), name) == 0 &&
           variable[name.size()] == '=';
}

std::vector<std::string> environment_for(const ProcessStart& start) {
    std::vector<std::string> variables;
    for (char** next = environ; next != nullptr && *next != nullptr; ++next) {
        const std::string variable = *next;
        const bool own = std::any_of(std::begin(own_variables), std::end(own_variables),
                                     [&](const char* name) { return names(variable, name); });
        const bool replaced = std::any_of(start.variables.begin(), start.variables.end(),
                                          [&](const auto& given) { return names(variable, given.first); });
        if (!own && !replaced)
            variables.push_back(variable);
    }
    for (const auto& [name, value] : start.variables)
        variables.push_back(name + "=" + value);
    return variables;
}

std::vector<char*> pointers_to(std::vector<std::string>& texts) {
    std::vector<char*> pointers;
    for (std::string& text : texts)
        pointers.push_back(text.data());
    pointers.push_back(nullptr);
    return pointers;
}

bool standard_error_is_kept() {
    struct stat status = {};
    return ::fstat(STDERR_FILENO, &status) == 0 && !S_ISFIFO(status.st_mode);
}

// The file actions and attributes of one start.
class SpawnSettings {
  public:
    SpawnSettings() {
        ::posix_spawn_file_actions_init(&actions);
        ::posix_spawnattr_init(&attributes);
    }
    ~SpawnSettings() {
        ::posix_spawnattr_destroy(&attributes);
        ::posix_spawn_file_actions_destroy(&actions);
    }
    SpawnSettings(const SpawnSettings&) = delete;
    SpawnSettings& operator=(const SpawnSettings&) = delete;

    int fill() {
        sigset_t none;
        sigset_t all;
        sigemptyset(&none);
        sigfillset(&all);
        int error = ::posix_spawn_file_actions_addopen(&actions, STDIN_FILENO, "/dev/null", O_RDONLY, 0);
        if (error == 0)
            error = ::posix_spawn_file_actions_addopen(&actions, STDOUT_FILENO, "/dev/null", O_WRONLY, 0);
        if (error == 0 && !standard_error_is_kept())
            error = ::posix_spawn_file_actions_addopen(&actions, STDERR_FILENO, "/dev/null", O_WRONLY, 0);
        // Libraries leave descriptors open that are not marked to be closed.
        if (error == 0)
            error = ::posix_spawn_file_actions_addclosefrom_np(&actions, STDERR_FILENO + 1);
        if (error == 0)
            error = ::posix_spawnattr_setsigmask(&attributes, &none);
        if (error == 0)
            error = ::posix_spawnattr_setsigdefault(&attributes, &all);
        if (error == 0)
            error = ::posix_spawnattr_setflags(&attributes, POSIX_SPAWN_SETSIGMASK | POSIX_SPAWN_SETSIGDEF |
                                                                POSIX_SPAWN_SETSID);
        return error;
    }

    posix_spawn_file_actions_t actions;
    posix_spawnattr_t attributes;
};

// Collects a child's end, so that it is no zombie. True when that is done.
bool collect(std::int32_t process, const std::function<void(int)>& ended) {
    int status = 0;
    const pid_t answer = ::waitpid(process, &status, WNOHANG);
    if (answer == 0 || (answer < 0 && errno == EINTR))
        return false;
    // Someone else in this process may have collected it, or the system does where SIGCHLD is ignored.
    if (answer < 0)
        status = 0;
    if (ended != nullptr)
        ended(WIFSIGNALED(status) ? 128 + WTERMSIG(status) : WEXITSTATUS(status));
    return true;
}

// On systems whose processes have no descriptors.
void collect_by_looking(std::int32_t process, std::function<void(int)> ended) {
    constexpr std::int64_t pause = 50'000'000;
    EventThread::instance().call_at(uptime_nanoseconds() + pause, [process, ended = std::move(ended)] {
        if (!collect(process, ended))
            collect_by_looking(process, ended);
    });
}

// In the event thread.
void watch_for_end(std::int32_t process, std::function<void(int)> ended) {
    const auto descriptor =
        std::make_shared<Descriptor>(static_cast<int>(::syscall(SYS_pidfd_open, process, 0)));
    const auto watch = std::make_shared<EventThread::Watch>(0);
    if (descriptor->valid())
        *watch = EventThread::instance().watch(
            descriptor->get(), EPOLLIN, [process, ended, watch, descriptor](auto) {
                if (collect(process, ended))
                    EventThread::instance().forget(*watch, descriptor->get());
            });
    if (*watch == 0)
        collect_by_looking(process, std::move(ended));
}

} // namespace

std::string executable_path() {
    std::string path(PATH_MAX, '\0');
    const ssize_t length = ::readlink("/proc/self/exe", path.data(), path.size());
    path.resize(length > 0 ? static_cast<std::size_t>(length) : 0);
    return path;
}

std::vector<std::string> command_line_arguments() {
    std::ifstream file("/proc/self/cmdline", std::ios::binary);
    std::vector<std::string> arguments;
    for (std::string argument; std::getline(file, argument, '\0');)
        arguments.push_back(argument);
    return arguments;
}

std::string current_directory() {
    std::string path(PATH_MAX, '\0');
    return ::getcwd(path.data(), path.size()) != nullptr ? std::string(path.c_str()) : std::string();
}

std::string environment_variable(const char* name) {
    const char* value = std::getenv(name);
    return value != nullptr ? value : "";
}

std::string take_environment_variable(const char* name) {
    std::string value = environment_variable(name);
    if (!value.empty())
        ::unsetenv(name);
    return value;
}

Result<std::int32_t> start_process(const ProcessStart& start, std::function<void(int status)> ended) {
    std::vector<std::string> arguments = {start.executable};
    arguments.insert(arguments.end(), start.arguments.begin(), start.arguments.end());
    std::vector<std::string> variables = environment_for(start);
    SpawnSettings settings;
    pid_t process = 0;
    int error = settings.fill();
    if (error == 0)
        error = ::posix_spawn(&process, start.executable.c_str(), &settings.actions, &settings.attributes,
                              pointers_to(arguments).data(), pointers_to(variables).data());
    if (error != 0)
        return Status(error);
    EventThread::instance().call_at(0,
                                    [process, ended = std::move(ended)] { watch_for_end(process, ended); });
    return process;
}

} // namespace host
