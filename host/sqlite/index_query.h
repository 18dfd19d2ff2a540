#pragma once

#include "host/api/index.h"
#include "host/linux/directory_cache.h"
#include "host/sqlite/condition.h"
#include "host/sqlite/entry_state.h"
#include "host/sqlite/live_queries.h"
#include "host/sqlite/volume_index.h"
#include "host/sqlite/walk_query.h"
#include <memory>
#include <set>
#include <string>
#include <unordered_map>
#include <vector>

namespace host {

/// Answers a bound condition from the rows that the columns found, looking at each file.
class IndexQuery final : public RunningQuery {
  public:
    IndexQuery(std::shared_ptr<VolumeIndex> index, std::shared_ptr<const Condition> condition,
               std::shared_ptr<LiveQuery> live, std::vector<RowNumber> rows);
    ~IndexQuery() override;

    Status next(Hit& hit) override;
    Status rewind() override;

  private:
    Status next_row(Hit& hit);
    /// Reads the next rows together. `done` when there are none left.
    DatabaseResult read_rows();
    /// The database cannot be read any further: goes on from a rebuilt index, or by a walk, without the hits
    /// that were given. EAGAIN: ask next_row() again.
    Status recover(DatabaseResult result);
    bool give(const Hit& hit);
    bool is_hit(const IndexRow& row, Hit& hit);
    void tell_attributes(const IndexRow& row);
    const Directory* directory_of(std::uint64_t inode);

    const std::shared_ptr<VolumeIndex> index_;
    const std::shared_ptr<const Condition> condition_;
    const std::shared_ptr<LiveQuery> live_;
    std::set<std::string> asked_for_;
    std::vector<RowNumber> rows_;
    /// The first of rows_ that has not been read.
    std::size_t position_ = 0;
    std::unique_ptr<IndexStore> reader_;
    AttributeNames names_;
    /// The rows that were read last, of which the first `looked_at_` have been looked at. Kept longer than
    /// `group_` says, for their memory.
    std::vector<IndexRow> read_;
    std::size_t group_ = 0;
    std::size_t looked_at_ = 0;
    /// The directories of recent hits; null: not to be found.
    std::unordered_map<std::uint64_t, DirectoryCache::Handle> directories_;
    bool volume_is_gone_ = false;
    std::uint64_t last_inode_ = 0;
    const Directory* last_directory_ = nullptr;
    bool searched_in_vain_ = false;
    /// Fingerprints of the hits that were given.
    std::vector<std::uint64_t> given_;
    /// So many of them, sorted, were given before the database was given up; they are not given again.
    std::size_t given_before_ = 0;
    bool recovered_ = false;
    std::unique_ptr<WalkQuery> walk_;
};

} // namespace host
