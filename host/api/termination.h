#pragma once

#include <functional>
#include <memory>

namespace host {

/// From now on a request of the system or the user to end this process (SIGTERM, SIGINT, SIGHUP) calls
/// `asked`, in a thread of its own, instead of ending it. A second request of the same kind ends the process
/// at once, so that one that hangs can be ended. A signal that the process was started to ignore stays
/// ignored. The watch ends with the last copy of the token, which `asked` must not drop: no call is under way
/// or follows then. Null when there is a watch already or the system refuses: requests end the process then.
[[nodiscard]] std::shared_ptr<void> watch_for_termination(std::function<void()> asked);

} // namespace host
