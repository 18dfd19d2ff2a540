#pragma once

#include "descriptor.h"
#include "host/api/local_transport.h"
#include "host/api/thread_safety.h"
#include <memory>
#include <string>

namespace host {

class LocalPeers;

/// The listening side of this process: its socket and its locked team file in the runtime directory.
class LocalEndpoint {
  public:
    /// Never destroyed.
    static LocalEndpoint& instance();

    /// Listens in the runtime directory as the environment names it now, and moves there when it listens
    /// elsewhere. The first receiver stays.
    Status open(LocalReceiver& receiver) EXCLUDES(mutex_);
    /// Null before open().
    LocalReceiver* receiver() const EXCLUDES(mutex_);

    /// Replaces what others read of this process (running_applications.cpp). ENOTCONN before open().
    Status write_team_file(const std::string& content) EXCLUDES(mutex_);

  private:
    LocalEndpoint() = default;
    Status listen(Descriptor directory, const std::string& path) REQUIRES(mutex_);
    void close() REQUIRES(mutex_);
    static void remove_files_at_exit();

    mutable Mutex mutex_;
    LocalReceiver* receiver_ GUARDED_BY(mutex_) = nullptr;
    /// The process that has made the files; a child of fork() leaves them alone.
    std::int32_t owner_ GUARDED_BY(mutex_) = 0;
    std::string path_ GUARDED_BY(mutex_);
    Descriptor directory_ GUARDED_BY(mutex_);
    Descriptor team_file_ GUARDED_BY(mutex_);
    std::shared_ptr<LocalPeers> peers_ GUARDED_BY(mutex_);
};

} // namespace host
