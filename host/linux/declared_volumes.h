#pragma once

#include <string>
#include <vector>

namespace host {

/// The directories that the user declared to be volumes, as they are written down; some may not exist.
struct DeclaredVolumes {
    /// True when BEKITS_VOLUMES is set: these and no mounted file systems are the volumes.
    bool exclusive = false;
    std::vector<std::string> paths; ///< absolute, in order

    bool operator==(const DeclaredVolumes&) const = default;
};

/// From BEKITS_VOLUMES (directories separated by colons; what is not absolute is passed over), else from the
/// file `volumes` in the configuration directory: one directory a line, "~/" at its start is the home
/// directory, lines that begin with "#" are comments. Read anew at every call.
DeclaredVolumes read_declared_volumes();

/// Makes the file `volumes` with the user's music directory in it, unless the file is there already or there
/// is no music directory or BEKITS_VOLUMES is set.
void make_volumes_file();

} // namespace host
