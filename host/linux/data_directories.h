#pragma once

#include <string>
#include <vector>

namespace host {

/// The XDG base directories as other programs use them, without "bekits" behind. Read from the environment at
/// every call; relative values in it count as not set. The user's own comes first, as it counts first.
std::vector<std::string> data_directories();   ///< $XDG_DATA_HOME, then $XDG_DATA_DIRS
std::vector<std::string> config_directories(); ///< $XDG_CONFIG_HOME, then $XDG_CONFIG_DIRS

/// The absolute directories of a list separated by colons.
std::vector<std::string> directories_of(const char* list);

} // namespace host
