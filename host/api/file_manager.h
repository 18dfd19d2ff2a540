#pragma once

#include "host/api/result.h"
#include <string>
#include <vector>

namespace host {

/// Has the user's file manager open these folders, or show these entries selected in their folders, through
/// the session's org.freedesktop.FileManager1. Absolute paths, any bytes. Waits for its answer at most ten
/// seconds. ENOENT: there is no session bus or no such service; EIO: it refused; ETIMEDOUT. Needs no display.
/// Any thread.
Status open_folders(const std::vector<std::string>& paths);
Status show_entries(const std::vector<std::string>& paths);

} // namespace host
