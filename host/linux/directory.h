#pragma once

#include "host/api/entry.h"
#include "host/api/result.h"
#include "host/api/thread_safety.h"
#include "host/linux/descriptor.h"
#include <atomic>
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

    struct Place {
        std::string leaf;
        dev_t parent_device = 0;
        std::uint64_t parent_inode = 0; ///< its own for "/"
    };
    /// Its name in its parent ("." for "/") and that parent, as they are now. ENOENT as above. Where the file
    /// system moves a directory's change time when it is renamed, this is remembered for as long as that time
    /// stands.
    Result<Place> place() const;
    /// ENOENT when the directory has been removed; `leaf`, the name of anything in it, spares a closer look.
    Status check_exists(const char* leaf) const;

  private:
    bool keeps_books() const;

    const Descriptor descriptor_;
    const DeviceId device_;
    const dev_t file_system_device_;
    const std::uint64_t inode_;
    enum class Answer : int { unknown, no, yes };
    mutable std::atomic<Answer> keeps_books_{Answer::unknown};
    mutable Mutex place_mutex_;
    mutable Place place_ GUARDED_BY(place_mutex_);
    /// Change time that place_ was read at, nanoseconds; -1: not to be used.
    mutable std::int64_t place_change_time_ GUARDED_BY(place_mutex_) = -1;
};

} // namespace host
