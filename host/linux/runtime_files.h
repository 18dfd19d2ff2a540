#pragma once

#include "descriptor.h"
#include "host/api/result.h"
#include <cstdint>
#include <string>

namespace host {

/// The runtime directory (directories.h): made when it is missing, this user's own, and closed to all others.
/// EPERM when it belongs to somebody else. What lies in it: docs/applications.md.
Result<Descriptor> open_runtime_directory();

/// The file that a process holds locked for as long as it lives, and its socket. A process that has ended,
/// however, has lost its lock.
std::string team_file_name(std::int32_t process);
std::string socket_name(std::int32_t process);

/// The path by which a socket in an open directory is bound or connected to. Always short enough for a socket
/// address, however long the directory's own path is.
std::string socket_path(const Descriptor& directory, std::int32_t process);

/// Whoever makes or removes team files and sockets, or claims a signature, holds this for that moment. Taken
/// within five seconds, else ETIMEDOUT.
class RuntimeLock {
  public:
    static Result<RuntimeLock> take(const Descriptor& directory);

  private:
    explicit RuntimeLock(Descriptor file) : file_(std::move(file)) {}
    /// Closing it releases the lock.
    Descriptor file_;
};

/// Whether the process that owns a team file lives. Never to be asked about this process's own file: closing
/// any descriptor of it would give up the lock.
bool team_lives(const Descriptor& directory, std::int32_t process);

/// Removes the files of processes that have ended. With the lock held.
void remove_stale_files(const Descriptor& directory, const RuntimeLock& lock);

} // namespace host
