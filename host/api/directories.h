#pragma once

#include "host/api/result.h"
#include <string>

namespace host {

/// The user's base directories, by the XDG Base Directory rules (freedesktop.org, version 0.8). Paths are
/// absolute and without a trailing slash. Read from the environment at every call; any thread.
std::string home_directory();
std::string config_directory();  ///< $XDG_CONFIG_HOME/bekits
std::string data_directory();    ///< $XDG_DATA_HOME/bekits
std::string cache_directory();   ///< $XDG_CACHE_HOME/bekits
std::string runtime_directory(); ///< $XDG_RUNTIME_DIR/bekits, else a 0700 directory of this user's below the
                                 ///< temporary directory
std::string temporary_directory();
/// The user's music directory (xdg user-dirs), empty when there is none.
std::string music_directory();
/// The user's desktop and trash directories, by the same rules.
std::string desktop_directory();
std::string trash_directory();

/// Makes a directory and those above it (mode 0700 for what is made). An existing directory is success.
Status make_directories(const std::string& path);

} // namespace host
