#pragma once

#include "host/sqlite/comparison.h"
#include "host/sqlite/growing_array.h"
#include "host/sqlite/row_set.h"
#include <cstddef>
#include <cstdint>

namespace host {

/// The numbers of one attribute, by row number. One writer or many readers at a time.
class NumberColumn {
  public:
    void set(RowNumber row, const AttributeValue& number);
    void remove(RowNumber row);
    /// Adds the rows whose number satisfies the comparison.
    void find(const Comparison& comparison, RowSet& rows) const;
    /// Takes over the numbers of a column that has no row in common with this one.
    void join(NumberColumn&& other);
    std::size_t memory_bytes() const { return kinds_.memory_bytes() + bits_.memory_bytes(); }

  private:
    GrowingArray<AttributeValue::Kind> kinds_;
    GrowingArray<std::uint64_t> bits_;
};

} // namespace host
