#pragma once

#include "host/api/index.h"
#include "host/api/thread_safety.h"
#include "host/linux/change_watcher.h"
#include "host/sqlite/background_task.h"
#include "host/sqlite/change_queue.h"
#include "host/sqlite/index_files.h"
#include "host/sqlite/live_queries.h"
#include "host/sqlite/own_work.h"
#include "host/sqlite/reader_pool.h"
#include "host/sqlite/row_writer.h"
#include "host/sqlite/search_columns.h"
#include "host/sqlite/shared_slots.h"
#include <atomic>
#include <memory>
#include <set>
#include <string>
#include <thread>
#include <vector>

namespace host {

/// The index of one volume: its database, its writer thread, its columns. docs/index.md tells how they work
/// together. Any thread.
class VolumeIndex {
  public:
    VolumeIndex(DeviceId device, const std::string& stable_key);
    /// Commits what is queued and ends the threads.
    ~VolumeIndex();

    DeviceId device() const { return device_; }
    const std::string& stable_key() const { return stable_key_; }

    Status create(const std::string& attribute, std::uint32_t type);
    Status remove(const std::string& attribute);
    std::vector<IndexInfo> list();

    ChangeTicket attributes_changed(const EntryRef& ref);
    void entry_changed(const EntryRef& ref);
    /// A watcher's event, or a walk's finding.
    void entry_observed(std::uint64_t directory, const std::string& leaf, ChangeNote::Source source);

    /// Rows that may satisfy a bound condition; every one must be looked at. ENOTSUP: the index cannot tell
    /// now (its database cannot be written or read), so walk.
    Status search(const Condition& condition, std::vector<RowNumber>& rows);

    /// A connection to the database for reading, from a pool; null when it cannot be opened.
    std::unique_ptr<IndexStore> borrow_reader() { return readers_.borrow(); }
    void give_back_reader(std::unique_ptr<IndexStore> reader) { readers_.give_back(std::move(reader)); }
    /// A reader has met a damaged page.
    void report_damage();

    LiveQueries& live_queries() { return live_; }
    /// What the writer has done since this index was opened.
    WriterStatistics statistics();

    Status flush();
    Status reconcile(Indexes::Depth depth, const std::atomic<bool>* cancelled);
    Status rebuild(const std::function<bool(std::uint64_t)>& progress);
    /// Follows other programs' changes from now on; later calls do nothing.
    void follow();
    /// Walks the whole volume in the background, at idle priority.
    void reconcile_in_background();

    /// There are indices on this volume (made by any process).
    bool in_use();
    std::size_t memory_bytes() { return columns_.memory_bytes(); }
    std::size_t arena_bytes() { return columns_.arena_bytes(); }

  private:
    enum class Opening { only_existing, create };
    enum class Looking { changed_only, everything };
    /// A walk in the background gives way to one that somebody waits for.
    enum class Ground { fore, back };
    /// An entry whose row is to be written when a walk has been gone through to its end.
    struct Finding {
        std::uint64_t directory = 0;
        std::string leaf;
    };

    bool open_locked(Opening opening) REQUIRES(mutex_);
    bool open_store_locked() REQUIRES(mutex_);
    /// Closes all that is open on the database's file.
    void let_go_locked() REQUIRES(mutex_);
    void start_over_locked() REQUIRES(mutex_);
    void check_file_locked() REQUIRES(mutex_);
    void write_groups();
    bool write_group(std::vector<ChangeNote>& group);
    void mark_incomplete_locked() REQUIRES(mutex_);
    bool is_complete();
    /// A process died that may have had changes left to write: rows are checked before they are relied upon.
    /// Waits until everything that was changed on the volume is on its device.
    bool volume_is_written() const;
    void mark_suspect_locked() REQUIRES(mutex_);
    bool is_suspect_locked() REQUIRES(mutex_);
    /// True when a process was found dead just now; the index is suspect from then on.
    bool take_over_dead();
    Status walk_volume(Looking looking, const std::atomic<bool>* cancelled,
                       const std::function<bool(std::uint64_t)>& progress, Ground ground = Ground::fore);
    Status walk_locked(Looking looking, const std::atomic<bool>* cancelled,
                       const std::function<bool(std::uint64_t)>& progress, Ground ground)
        REQUIRES(walk_mutex_);
    Status finish_walk(const std::vector<IndexStore::KnownDirectory>& directories, std::int64_t started,
                       std::int64_t suspect, std::uint64_t losses, std::size_t indices);
    Status look_at_directories(const std::atomic<bool>* cancelled);
    void note_directory(IndexStore& reader, std::uint64_t directory, const Directory& opened,
                        std::vector<std::uint64_t>* subdirectories);
    /// Walks until the index is complete and nobody wants it reconciled.
    void work_in_background();

    const DeviceId device_;
    const std::string stable_key_;
    const IndexFiles files_;
    SharedSlots slots_;
    ChangeQueue queue_;
    OwnWork own_work_;
    std::atomic<bool> reconcile_wanted_{false};
    SearchColumns columns_{files_.database()};
    LiveQueries live_;

    /// Guards the writer's connection; never held while waiting for the queue.
    Mutex mutex_;
    IndexStore store_ GUARDED_BY(mutex_);
    RowWriter writer_ GUARDED_BY(mutex_);
    std::uint64_t database_inode_ GUARDED_BY(mutex_) = 0;
    std::vector<ListedIndex> list_ GUARDED_BY(mutex_);
    std::set<std::string> indexed_ GUARDED_BY(mutex_);
    bool dirty_ GUARDED_BY(mutex_) = false;
    /// The database on disk lacks something: until a walk of the whole volume has been committed.
    bool lost_changes_ GUARDED_BY(mutex_) = false;
    /// How often changes were lost: tells a walk that some were while it went on.
    std::uint64_t losses_ GUARDED_BY(mutex_) = 0;
    bool found_unclean_ GUARDED_BY(mutex_) = false;
    std::thread writer_thread_ GUARDED_BY(mutex_);
    std::atomic<bool> open_{false};
    /// Changes were reported while there was an index that could not be opened.
    std::atomic<bool> changes_missed_{false};

    ReaderPool readers_{files_.database()};

    /// One walk at a time.
    Mutex walk_mutex_;
    std::atomic<int> walks_waiting_{0};
    std::atomic<bool> gave_way_{false};
    std::atomic<bool> stopping_{false};
    BackgroundTask background_{"index walker", [this] { work_in_background(); }};
    Mutex watcher_mutex_;
    std::unique_ptr<ChangeWatcher> watcher_ GUARDED_BY(watcher_mutex_);
};

} // namespace host
