#pragma once

#include "host/linux/directory_cache.h"
#include "host/sqlite/change_queue.h"
#include "host/sqlite/entry_state.h"
#include "host/sqlite/live_queries.h"
#include "host/sqlite/search_columns.h"
#include <map>
#include <set>
#include <string>
#include <utility>
#include <vector>

namespace host {

/// What a writer has done since it was made.
struct WriterStatistics {
    std::uint64_t reported = 0;      ///< notes of changes that were made through the kits
    std::uint64_t observed = 0;      ///< notes of a watcher or a walk, our own changes coming back among them
    std::uint64_t reported_read = 0; ///< files whose attributes were read for the former
    std::uint64_t observed_read = 0; ///< and for the latter: none where the row's change time was the file's
    std::uint64_t rows_changed = 0;
};

/// Brings the rows of noted entries up to date, a group in one transaction. One thread at a time.
class RowWriter {
  public:
    RowWriter(DeviceId device, IndexStore& store) : device_(device), store_(store) {}

    /// Looks at every noted entry and commits what that changed. On failure everything is rolled back.
    DatabaseResult write(std::vector<ChangeNote>& notes, const std::set<std::string>& indexed,
                         LiveQueries& live);

    /// What the last write() changed, and the number of the change log it went under; no changes: nothing
    /// was committed.
    const std::vector<RowChange>& changes() const { return changes_; }
    std::int64_t sequence() const { return sequence_; }

    /// In the last write() a change that was made through the kits could not be read from its file, because
    /// the medium failed: its row is as it was.
    bool left_unread() const { return left_unread_; }
    const WriterStatistics& statistics() const { return statistics_; }

    /// Forgets what it remembers of the database: another one has taken its place.
    void reset();

  private:
    struct LiveChange {
        std::shared_ptr<LiveQuery> query;
        std::uint64_t directory = 0;
        std::string leaf;
        std::uint64_t inode = 0;
        bool was = false;
        bool is = false;
    };

    DatabaseResult write_note(const ChangeNote& note, const std::set<std::string>& indexed,
                              const std::vector<std::shared_ptr<LiveQuery>>& live);
    DatabaseResult write_row(const ChangeNote& note, const IndexRow* old, const EntryState& state);
    DatabaseResult write_links(const IndexRow& row);
    DatabaseResult erase_row(const IndexRow& row);
    DatabaseResult make_record(const EntryState& state, std::vector<std::byte>& record);
    DatabaseResult remember_directory(std::uint64_t directory);
    void compare_live(const ChangeNote& note, const IndexRow* old, const EntryState* state,
                      const std::vector<std::shared_ptr<LiveQuery>>& live);
    DirectoryCache::Handle find_directory(const ChangeNote& note);
    DatabaseResult leave_as_it_is(const ChangeNote& note);

    const DeviceId device_;
    IndexStore& store_;
    StateReader reader_;
    std::map<std::pair<std::string, std::uint32_t>, std::uint32_t, std::less<>> attribute_ids_;
    AttributeNames names_;
    std::set<std::uint64_t> known_directories_;
    std::vector<RowChange> changes_;
    std::vector<LiveChange> live_changes_;
    bool left_unread_ = false;
    WriterStatistics statistics_;
    std::int64_t sequence_ = 0;
    std::uint64_t last_directory_ = 0;
    DirectoryCache::Handle last_handle_;
    /// Why there is no last_handle_.
    Status last_error_;
    /// For a directory of the group at hand.
    bool searched_in_vain_ = false;
};

} // namespace host
