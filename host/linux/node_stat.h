#pragma once

#include "host/api/entry.h"
#include <sys/stat.h>

namespace host {

/// What statx must be asked for.
inline constexpr unsigned kNodeStatMask = STATX_BASIC_STATS | STATX_BTIME;

NodeStat to_node_stat(const struct statx& status, DeviceId device);
NodeKind to_node_kind(unsigned mode);
dev_t to_device(const struct statx& status);

} // namespace host
