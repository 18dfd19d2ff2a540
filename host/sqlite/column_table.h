#pragma once

#include "host/sqlite/condition.h"
#include "host/sqlite/index_store.h"
#include "host/sqlite/number_column.h"
#include "host/sqlite/row_set.h"
#include "host/sqlite/text_column.h"
#include <cstddef>
#include <map>
#include <memory>
#include <set>
#include <string>
#include <unordered_set>

namespace host {

/// The mirrored attributes of one volume in memory: a pair of columns for each attribute that a query has
/// used. One writer or many readers at a time.
class ColumnTable {
  public:
    ColumnTable() = default;

    /// Columns for all of these are there.
    bool has(const std::set<std::string>& attributes) const;
    void add(const std::set<std::string>& attributes);
    void remove_all();
    bool empty() const { return columns_.empty(); }
    std::set<std::string> attributes() const;

    /// Which attribute the numbers in records mean; may be called again with more.
    void set_names(const std::map<std::uint32_t, AttributeNameAndType>& names);
    bool knows(std::uint32_t attribute_id) const;

    /// The row's attributes from now on.
    void set_row(RowNumber row, std::span<const std::byte> record);
    /// For a row that has no values yet.
    void add_row(RowNumber row, std::span<const std::byte> record);
    void remove_row(RowNumber row);
    /// Takes over a table with the same attributes and other rows.
    void join(ColumnTable&& other);
    void reserve(std::size_t rows);
    void settle();

    /// Rows that satisfy a bound condition, and some that may: those whose values are not mirrored, and where
    /// name, size or time decide. All attributes of the condition must be there.
    std::vector<RowNumber> find(const Condition& condition) const;

    std::size_t memory_bytes() const;
    std::size_t arena_bytes() const;

  private:
    struct Columns {
        TextColumn text;
        NumberColumn numbers;
        /// Rows whose value is on the file only.
        std::unordered_set<RowNumber> unmirrored;
    };
    struct Target {
        Columns* columns = nullptr; ///< null: no query has used it
        std::uint32_t type = 0;
    };

    RowSet evaluate(const Condition& condition) const;
    bool narrows(const Condition& condition) const;
    std::size_t limit() const { return static_cast<std::size_t>(largest_) + 1; }

    std::map<std::string, std::unique_ptr<Columns>> columns_;
    std::vector<Target> targets_;
    std::map<std::uint32_t, AttributeNameAndType> names_;
    RowNumber largest_ = 0;
};

} // namespace host
