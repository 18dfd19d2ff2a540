#pragma once

#include "host/api/entry.h"
#include "host/api/result.h"
#include "host/api/thread_safety.h"
#include "host/linux/descriptor.h"
#include <cstddef>
#include <cstdint>
#include <list>
#include <memory>
#include <string>
#include <sys/stat.h>
#include <unordered_map>

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
    /// Its name in its parent as it is now ("." for "/"). Remembered, and read again only when the
    /// directory's change time has moved.
    Result<std::string> leaf() const;

  private:
    const Descriptor descriptor_;
    const DeviceId device_;
    const dev_t file_system_device_;
    const std::uint64_t inode_;
    mutable Mutex leaf_mutex_;
    mutable std::string leaf_ GUARDED_BY(leaf_mutex_);
    mutable std::int64_t leaf_change_time_ GUARDED_BY(leaf_mutex_) = -1;
};

/// Finds open directories by volume and inode: the last few hundred stay open, and for many more is
/// remembered in which directory they were last seen and under what name. Any thread.
///
/// Directories on file systems other than those of "/" and of the user's home are closed when they have not
/// been used for a few seconds, so that a removable volume can be unmounted.
class DirectoryCache {
  public:
    static DirectoryCache& instance();

    explicit DirectoryCache(std::size_t open_limit = 384, std::size_t hint_limit = 65536);
    ~DirectoryCache();

    using Handle = std::shared_ptr<const Directory>;

    /// `whole_volume`: where neither the open directories nor the hints lead to it, the directory that it was
    /// last seen in is searched and then, breadth first, all directories of the volume. `hints_only` spares
    /// that.
    enum class Search { hints_only, whole_volume };
    /// ENOENT when the volume has no such directory (any more), ENODEV when there is no such volume.
    Result<Handle> find(DeviceId device, std::uint64_t inode, Search search = Search::whole_volume);

    /// Takes over a directory that the caller has opened and knows to lie on `device`. When it is open
    /// already the one that is open is returned.
    Handle adopt(Descriptor descriptor, DeviceId device, const struct stat& status);
    /// Opens a subdirectory; its volume is looked up where it may be another one than the parent's. ENOTDIR,
    /// ENOENT, EACCES ...
    Result<Handle> open_child(const Directory& parent, const char* leaf);
    /// Opens a directory by absolute path; symbolic links on the way are followed.
    Result<Handle> open_path(const char* path);

    /// Tells where a directory is thought to be, so that find() needs no search. May be wrong: whatever is
    /// found there is verified.
    void remember(DeviceId device, std::uint64_t inode, std::uint64_t parent, std::string leaf);

    /// Closes what nobody else holds of this volume, and forgets its hints.
    void forget(DeviceId device);
    void clear();

    std::size_t open_count() const;

  private:
    struct Key {
        DeviceId device = 0;
        std::uint64_t inode = 0;
        bool operator==(const Key&) const = default;
    };
    struct KeyHash {
        std::size_t operator()(const Key& key) const noexcept;
    };
    struct Slot {
        Key key;
        Handle directory;
        std::int64_t last_use = 0;
    };
    struct Hint {
        std::uint64_t parent = 0;
        std::string leaf;
    };
    class Janitor;

    Handle find_open(const Key& key);
    Result<Handle> find_by_hint(const Key& key, int depth);
    Result<Handle> search_parent(const Key& key);
    Result<Handle> search_volume(const Key& key);

    const std::size_t open_limit_;
    const std::size_t hint_limit_;
    mutable Mutex mutex_;
    std::list<Slot> recent_ GUARDED_BY(mutex_);
    std::unordered_map<Key, std::list<Slot>::iterator, KeyHash> open_ GUARDED_BY(mutex_);
    std::unordered_map<Key, Hint, KeyHash> hints_ GUARDED_BY(mutex_);
};

} // namespace host
