#pragma once

#include "host/api/thread_safety.h"
#include "host/sqlite/index_store.h"
#include <cstdint>
#include <memory>
#include <set>
#include <string>
#include <vector>

namespace host {

/// Connections for reading one database, kept open between their uses. Any thread.
class ReaderPool {
  public:
    explicit ReaderPool(std::string database) : database_(std::move(database)) {}

    /// The caller's alone until it is given back, or destroyed where its database turned out damaged. Null
    /// when the database cannot be opened.
    std::unique_ptr<IndexStore> borrow();
    void give_back(std::unique_ptr<IndexStore> reader);
    /// The file has been replaced, or is to be closed: idle connections are closed, lent ones when they are
    /// given back.
    void clear();

  private:
    const std::string database_;
    Mutex mutex_;
    std::vector<std::unique_ptr<IndexStore>> idle_ GUARDED_BY(mutex_);
    /// Those that may come back: lent since the file was replaced last.
    std::set<const IndexStore*> lent_ GUARDED_BY(mutex_);
    std::uint64_t replacements_ GUARDED_BY(mutex_) = 0;
};

} // namespace host
