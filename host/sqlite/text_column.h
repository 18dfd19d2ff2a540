#pragma once

#include "host/sqlite/comparison.h"
#include "host/sqlite/growing_array.h"
#include "host/sqlite/row_set.h"
#include "host/sqlite/text_search.h"
#include <cstddef>
#include <cstdint>
#include <memory>
#include <string_view>
#include <vector>

namespace host {

/// The texts of one attribute, by row number, for searching them all at once: docs/index.md, "In memory".
/// One writer or many readers at a time.
class TextColumn {
  public:
    TextColumn();

    /// The row's value from now on. The text has no zero byte.
    void set(RowNumber row, std::string_view text);
    void remove(RowNumber row);
    /// Takes over the values of a column that has no row in common with this one.
    void join(TextColumn&& other);

    bool holds(RowNumber row) const;
    /// Empty where the row has no value.
    std::string_view text(RowNumber row) const;

    /// Adds the rows whose value satisfies the comparison.
    void find(const Comparison& comparison, RowSet& rows) const;
    void find_containing(std::string_view needle, SearchKernel kernel, RowSet& rows) const;

    void reserve(std::size_t rows, std::size_t bytes);
    /// Gives back what loading has over.
    void settle();
    std::size_t memory_bytes() const;
    std::size_t arena_bytes() const { return arena_.size(); }
    const char* arena() const { return arena_.data(); }

  private:
    using ValueNumber = std::uint32_t;
    static constexpr ValueNumber kNoValue = 0xffffffff;
    static constexpr std::uint32_t kNoRow = 0x7fffffff;
    static constexpr std::uint32_t kIsList = 0x80000000;
    static constexpr std::size_t kBlock = 256;
    static constexpr std::size_t kRecentValues = 65536;

    /// Rows of a value that more than one row has had. May name rows that have another value by now.
    struct RowList {
        std::vector<RowNumber> rows;
        std::uint32_t live = 0;
    };

    std::size_t value_end(ValueNumber value) const;
    std::string_view value_text(ValueNumber value) const;
    ValueNumber value_at(std::size_t position, ValueNumber not_before) const;
    ValueNumber find_or_add(std::string_view text);
    ValueNumber add(std::string_view text);
    void attach(RowNumber row, ValueNumber value);
    void detach(RowNumber row, ValueNumber value);
    void sweep(RowList& list, ValueNumber value);
    void insert_rows(ValueNumber value, RowSet& rows) const;
    std::size_t find_in_bytes(ValueNumber first, ValueNumber last, std::string_view needle,
                              SearchKernel kernel, RowSet& rows) const;
    /// Only where the processor has AVX2.
    std::size_t find_by_value(ValueNumber first, ValueNumber last, std::string_view needle,
                              RowSet& rows) const;
    void compact();

    GrowingArray<char> arena_;
    GrowingArray<std::uint32_t> starts_;
    /// One row, or kIsList and a place in lists_.
    GrowingArray<std::uint32_t> rows_of_value_;
    GrowingArray<ValueNumber> value_of_row_;
    /// The value that each block of the arena begins in.
    GrowingArray<ValueNumber> value_of_block_;
    std::vector<RowList> lists_;
    std::vector<std::uint32_t> free_lists_;
    std::size_t list_capacity_ = 0;
    std::unique_ptr<ValueNumber[]> recent_;
    std::size_t garbage_ = 0;
};

} // namespace host
