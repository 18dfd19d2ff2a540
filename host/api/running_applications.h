#pragma once

#include "host/api/result.h"
#include <cstdint>
#include <functional>
#include <string>
#include <vector>

// The applications of this user that run, in whatever process. Each process writes itself down; one that has
// been killed is never among them. Where: docs/applications.md. Any thread.

namespace host {

struct RunningApplication {
    std::int32_t process = 0;
    std::string signature;
    std::string executable; ///< absolute path
    std::uint32_t flags = 0;
    std::int32_t token = 0;  ///< whom its process delivers messages for the application to
    std::int32_t thread = 0; ///< as the process itself calls it
    std::int64_t began = 0;  ///< uptime_nanoseconds() of the registration

    bool operator==(const RunningApplication&) const = default;
};

/// Which others of the same signature (letters' case aside) stand in the way.
enum class Instances { any, one_per_executable, one_per_signature };

/// Writes this process down as a running application. Of several processes that
/// stand in each other's way and try at once exactly one succeeds; the others get EEXIST, and `other` is the
/// one that runs. ENOTCONN before open_local_transport(). `process` and `began` are filled in here.
Status register_application(RunningApplication application, Instances instances, RunningApplication& other);
/// Completes what others read of this process. ENOENT when it is none.
Status set_application_thread(std::int32_t thread);
/// No longer one. Without effect when it is none.
void unregister_application();

/// Those that run, this process's included, the one that began first in front.
std::vector<RunningApplication> running_applications();

/// Whether a process that has sent something to this one, or run an application, lives; this process does.
/// False also when that cannot be found out.
bool process_lives(std::int32_t process);

/// From now on, calls for each application that begins or ends, within a second when its process was killed,
/// until the process ends. Calls come in the transport's own thread and must not wait. One watcher in a
/// process; another one takes its place, an empty one ends the watch.
using ApplicationWatcher = std::function<void(const RunningApplication& application, bool runs)>;
Status watch_running_applications(ApplicationWatcher watcher);

} // namespace host
