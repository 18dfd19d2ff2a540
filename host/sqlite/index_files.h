#pragma once

#include "host/api/result.h"
#include "host/sqlite/index_store.h"
#include <cstdint>
#include <string>
#include <vector>

namespace host {

/// The files that hold one volume's index (docs/index.md). Any thread.
class IndexFiles {
  public:
    explicit IndexFiles(const std::string& stable_key);

    const std::string& database() const { return database_; }
    const std::string& slots() const { return slots_; }

    bool exist() const;
    /// The files are there and may be written, or can be made: nothing that is no file is in their way.
    bool can_be_kept() const;
    Status make_directory() const;
    /// Deletes the database; the list of indices stays.
    void discard_database() const;
    /// Tells whether a file was deleted or replaced; 0 when there is none.
    std::uint64_t database_inode() const;
    std::int64_t database_size() const;
    /// Readable by the user alone.
    void protect() const;

    /// The list that survives the database; empty when there is none.
    std::vector<ListedIndex> read_list() const;
    Status write_list(const std::vector<ListedIndex>& list) const;

  private:
    std::string directory_;
    std::string database_;
    std::string list_;
    std::string slots_;
};

} // namespace host
