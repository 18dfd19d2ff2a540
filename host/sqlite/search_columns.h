#pragma once

#include "host/api/thread_safety.h"
#include "host/sqlite/column_table.h"
#include "host/sqlite/index_store.h"
#include <cstdint>
#include <shared_mutex>
#include <string>
#include <utility>
#include <vector>

namespace host {

/// A row as a transaction left it; no record when it was erased.
struct RowChange {
    RowNumber row = 0;
    bool erased = false;
    std::vector<std::byte> record;
};

/// One volume's columns and how they keep up with its database. Any thread.
class SearchColumns {
  public:
    explicit SearchColumns(std::string database) : database_(std::move(database)) {}

    /// Rows that may satisfy a bound condition, as of everything committed before the call, by any process.
    /// `store` is a connection of the caller's own.
    DatabaseResult find(IndexStore& store, const Condition& condition, std::vector<RowNumber>& rows);

    /// After a commit of this process: what it wrote under this number of the change log.
    void apply(IndexStore& store, const std::vector<RowChange>& changes, std::int64_t sequence);

    /// Forgets everything; the next find() loads again.
    void clear();
    std::size_t memory_bytes();
    std::size_t arena_bytes();

  private:
    DatabaseResult load(IndexStore& store, const std::set<std::string>& attributes);
    DatabaseResult catch_up(IndexStore& store);
    DatabaseResult load_half(IndexStore& store, RowNumber first, RowNumber last, ColumnTable& table);

    const std::string database_;
    std::shared_mutex mutex_;
    ColumnTable table_;
    std::int64_t seen_ = 0;
};

} // namespace host
