#pragma once

#include "host/api/result.h"
#include <string>

namespace host {

/// The absolute path of an open directory, found by climbing from parent to parent and looking for each name:
/// for where /proc is not mounted, and for paths that are longer than what the system tells at once (4095
/// bytes). Such a path cannot be handed back to the system in one piece. Slow: reads every directory on the
/// way. ENOENT when the directory has been removed, or lies on what is mounted no more; EACCES where one on
/// the way may not be read. Any thread.
Result<std::string> path_by_climbing(int directory);

} // namespace host
