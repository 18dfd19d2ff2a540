#pragma once

#include "host/api/entry.h"
#include "host/api/result.h"
#include "host/api/thread_safety.h"
#include "host/linux/descriptor.h"
#include <cstdint>
#include <string>
#include <sys/stat.h>

namespace host {

/// An open directory. Its descriptor serves openat and fstatat; it is shared between threads, so nothing that
/// moves its read position may be done with it (see reopen_directory). Any thread.
class Directory {
  public:
    Directory(Descriptor descriptor, DeviceId device, const struct stat& status);

    int descriptor() const { return descriptor_.get(); }
    DeviceId device() const { return device_; }
    /// st_dev of the directory.
    dev_t file_system_device() const { return file_system_device_; }
    std::uint64_t inode() const { return inode_; }
    NodeId id() const { return {device_, inode_}; }

    /// Absolute path as it is now, whatever was renamed. ENOENT when the directory has been removed.
    Result<std::string> path() const;
    /// Its name in its parent as it is now ("." for "/"). ENOENT as above. Where the file system moves a
    /// directory's change time when it is renamed, the name is remembered for as long as that time stands.
    Result<std::string> leaf() const;
    /// Inode of the directory above, as it is now; its own for "/".
    Result<std::uint64_t> parent_inode() const;

  private:
    const Descriptor descriptor_;
    const DeviceId device_;
    const dev_t file_system_device_;
    const std::uint64_t inode_;
    mutable Mutex leaf_mutex_;
    mutable std::string leaf_ GUARDED_BY(leaf_mutex_);
    /// Change time that leaf_ was read at, nanoseconds; -1: not to be used.
    mutable std::int64_t leaf_change_time_ GUARDED_BY(leaf_mutex_) = -1;
};

} // namespace host
