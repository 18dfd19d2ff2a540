#pragma once

#include "host/api/entry.h"
#include "host/api/result.h"
#include "host/api/thread_safety.h"
#include "host/linux/descriptor.h"
#include "host/linux/directory.h"
#include "host/linux/volume_snapshot.h"
#include <condition_variable>
#include <cstddef>
#include <cstdint>
#include <list>
#include <memory>
#include <string>
#include <sys/stat.h>
#include <thread>
#include <unordered_map>
#include <vector>

namespace host {

/// Finds open directories by volume and inode: the last few hundred stay open, and of a million more is
/// remembered in which directory they were last seen and under what name (some 130 bytes each). Any thread.
///
/// Directories on file systems other than those of "/" and of the user's home are closed when they have not
/// been used for a few seconds, so that a removable volume can be unmounted.
class DirectoryCache {
  public:
    static DirectoryCache& instance();

    explicit DirectoryCache(std::size_t open_limit = 384, std::size_t hint_limit = 1048576);
    ~DirectoryCache();
    DirectoryCache(const DirectoryCache&) = delete;
    DirectoryCache& operator=(const DirectoryCache&) = delete;

    using Handle = std::shared_ptr<const Directory>;

    /// `whole_volume`: where neither the open directories nor the hints lead to it, the directory that it was
    /// last seen in is searched and then, breadth first, all directories of the volume; those that it passes
    /// are remembered. That takes seconds on a large one, so whoever asks for many that may be gone asks for
    /// `hints_only`.
    enum class Search { hints_only, whole_volume };
    /// ENOENT when the volume has no such directory (any more), ENODEV when there is no such volume.
    Result<Handle> find(DeviceId device, std::uint64_t inode, Search search = Search::whole_volume);

    /// Takes over a directory that the caller has opened and knows to lie on `device`. When it is open
    /// already the one that is open is returned.
    Handle adopt(Descriptor descriptor, DeviceId device, const struct stat& status);
    /// Opens a subdirectory (not ".."); its volume is looked up where it may be another one than the
    /// parent's. ENOTDIR, ENOENT, EACCES ...
    Result<Handle> open_child(const Directory& parent, const char* leaf);
    /// Opens a directory by absolute path; symbolic links on the way and at its end are followed.
    Result<Handle> open_path(const char* path);

    /// Tells where a directory is thought to be, so that find() needs no search. May be wrong: whatever is
    /// found there is verified. At least the `hint_limit` / 2 that were told or used last are kept.
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
        /// Steady clock, nanoseconds; kept for directories that must not stay open only.
        std::int64_t last_use = 0;
        bool closes_when_idle = false;
    };
    struct Hint {
        std::uint64_t parent = 0;
        std::string leaf;
    };
    using Hints = std::unordered_map<Key, Hint, KeyHash>;

    Handle find_open(const Key& key);
    const Hint* find_hint(const Key& key) REQUIRES(mutex_);
    void put_hint(const Key& key, Hint hint) REQUIRES(mutex_);
    Result<Handle> find_root(const Key& key);
    Result<Handle> find_by_hint(const Key& key, int depth);
    Result<Handle> find_in_hinted_parent(const Key& key);
    Result<Handle> search_volume(const Key& key);
    /// Opens `path` below `base` and keeps it when it is the directory that is wanted.
    Result<Handle> open_wanted(const Key& key, int base, const char* path, const VolumeSnapshot& volumes);
    /// Remembers where directories that are about to be closed are.
    void remember_closed(const std::vector<Handle>& closed);
    void start_janitor() REQUIRES(mutex_);
    void run_janitor();

    const std::size_t open_limit_;
    const std::size_t hint_limit_;
    /// Held while a volume is searched: a second search waits, and often finds what the first one opened.
    /// Taken before mutex_.
    Mutex search_mutex_;
    mutable Mutex mutex_;
    std::list<Slot> recent_ GUARDED_BY(mutex_); ///< most recently used first
    std::unordered_map<Key, std::list<Slot>::iterator, KeyHash> open_ GUARDED_BY(mutex_);
    /// Two generations: new and used hints go into the young one; when that holds half of what there may be,
    /// it becomes the old one, whose place it takes.
    Hints young_hints_ GUARDED_BY(mutex_);
    Hints old_hints_ GUARDED_BY(mutex_);
    /// Searched for in vain: until when, on the steady clock, no new search is made.
    std::unordered_map<Key, std::int64_t, KeyHash> missing_ GUARDED_BY(mutex_);
    std::thread janitor_ GUARDED_BY(mutex_);
    bool janitor_runs_ GUARDED_BY(mutex_) = false;
    bool ending_ GUARDED_BY(mutex_) = false;
    std::condition_variable_any wake_;
};

} // namespace host
