#pragma once

#include "host/api/running_applications.h"
#include <optional>
#include <string>
#include <string_view>

namespace host {

/// The text of a team file, which others read while it is written: it counts only with its last line. Lines
/// of "key value", of which unknown ones are passed over; a value's line ends and backslashes are escaped.
std::string team_file_text(const RunningApplication& application);

/// Nothing for a file that is empty, incomplete or of another version. Any bytes.
std::optional<RunningApplication> read_team_file(std::string_view text);

} // namespace host
