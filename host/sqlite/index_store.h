#pragma once

#include "host/sqlite/database.h"
#include "host/sqlite/row_set.h"
#include <cstdint>
#include <functional>
#include <map>
#include <optional>
#include <string>
#include <string_view>
#include <utility>
#include <vector>

namespace host {

/// One row of the file table. Times and inodes as in NodeStat.
struct IndexRow {
    RowNumber id = 0;
    std::uint64_t directory = 0;
    std::string name;
    std::uint64_t inode = 0;
    std::int64_t change_time = 0;
    std::uint32_t links = 1;
    /// The change time was already past when the attributes were read, so no later change can carry it.
    bool settled = false;
    /// The record names all attributes of the file, and every entry that is not cut is the attribute's whole
    /// value, but for the one zero byte behind a text. Kept for settled rows only.
    bool exact = false;
    std::vector<std::byte> attributes;
};

struct ListedIndex {
    std::string attribute;
    std::uint32_t type = 0;
    std::int64_t created = 0;
};

/// Which attribute names and types the numbers in records stand for.
struct AttributeNameAndType {
    std::string name;
    std::uint32_t type = 0;
};

/// The tables of one volume's database (docs/index.md) behind one connection. One thread at a time.
///
/// Every call may answer `damaged` or `failed`; inside a transaction the caller then rolls back.
class IndexStore {
  public:
    /// Opens, and makes the tables in an empty file. `damaged` for another version or application, too.
    DatabaseResult open(const std::string& path, Connection::Mode mode);
    void close();
    bool is_open() const { return connection_.is_open(); }
    Connection& connection() { return connection_; }

    DatabaseResult begin();
    /// For reading several rows: they are then of one moment, and the database's locks are taken once.
    DatabaseResult begin_reading();
    DatabaseResult commit();
    void roll_back();

    std::int64_t meta(const char* key, std::int64_t missing);
    DatabaseResult set_meta(const char* key, std::int64_t value);
    /// The same, and on the disk when it returns. Outside of transactions.
    DatabaseResult set_meta_durably(const char* key, std::int64_t value);

    DatabaseResult indices(std::vector<ListedIndex>& result);
    DatabaseResult add_index(const ListedIndex& index);
    DatabaseResult remove_index(const std::string& attribute);

    /// All attribute numbers, by number.
    DatabaseResult attributes(std::map<std::uint32_t, AttributeNameAndType>& result);
    /// The number of an attribute, newly given where it has none.
    DatabaseResult attribute_id(std::string_view name, std::uint32_t type, std::uint32_t& id);

    /// `done`: no such row.
    DatabaseResult find(std::uint64_t directory, std::string_view name, IndexRow& row);
    /// The same without the attributes.
    DatabaseResult find_place(std::uint64_t directory, std::string_view name, IndexRow& row);
    DatabaseResult read(RowNumber id, IndexRow& row);
    DatabaseResult rows_of_inode(std::uint64_t inode, std::vector<RowNumber>& ids);
    /// Rows in one directory, attributes left out.
    DatabaseResult rows_in(std::uint64_t directory, std::vector<IndexRow>& rows);
    DatabaseResult directories_of_rows(std::vector<std::uint64_t>& directories);
    /// Gives the row a number.
    DatabaseResult insert(IndexRow& row);
    DatabaseResult update(const IndexRow& row);
    DatabaseResult erase(RowNumber id);
    DatabaseResult largest_row(RowNumber& largest);
    /// Calls for each row from `first` to `last`: number and record.
    DatabaseResult scan(RowNumber first, RowNumber last,
                        const std::function<void(RowNumber, std::span<const std::byte>)>& visit);

    struct KnownDirectory {
        std::uint64_t inode = 0;
        std::uint64_t parent = 0;
        std::string name;
        std::int64_t change_time = 0; ///< 0: never compared with its rows
    };
    DatabaseResult directory(std::uint64_t inode, KnownDirectory& result);
    DatabaseResult all_directories(std::vector<KnownDirectory>& result);
    DatabaseResult put_directory(const KnownDirectory& directory);
    DatabaseResult erase_directory(std::uint64_t inode);

    /// Appends to the change log; the number it got.
    DatabaseResult log_changes(const std::vector<RowNumber>& rows, std::int64_t& sequence);
    DatabaseResult last_sequence(std::int64_t& last);
    /// Rows that were changed after `seen`. False in `whole` when the log does not reach back so far.
    DatabaseResult changes_since(std::int64_t seen, std::vector<RowNumber>& rows, bool& whole,
                                 std::int64_t& last);
    std::int64_t data_version();

  private:
    Statement& statement(const char* sql);
    DatabaseResult take_id(std::int64_t& id);
    static void read_row(const Statement& statement, IndexRow& row);

    Connection connection_;
    /// By the address of the statement's text: every text is a literal that is used in one place.
    std::map<const char*, Statement> statements_;
    /// Within a transaction: no free numbers are left, and the next one after the largest row's.
    bool no_free_ids_ = false;
    std::int64_t next_id_ = 0;
};

} // namespace host
