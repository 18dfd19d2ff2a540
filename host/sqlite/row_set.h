#pragma once

#include <cstddef>
#include <cstdint>
#include <vector>

namespace host {

/// Number of a row of the index: the database's id of it. At most kLargestRow.
using RowNumber = std::uint32_t;
inline constexpr RowNumber kLargestRow = 0x7ffffffe;

/// A set of row numbers below a fixed limit, as bits. One thread at a time.
class RowSet {
  public:
    explicit RowSet(std::size_t limit) : words_((limit + 63) / 64) {}

    void insert(RowNumber row) { words_[row / 64] |= std::uint64_t{1} << (row % 64); }
    /// Without a branch: for conditions that nobody can foresee.
    void insert_if(RowNumber row, bool wanted) {
        words_[row / 64] |= std::uint64_t{wanted ? 1U : 0U} << (row % 64);
    }
    void erase(RowNumber row) { words_[row / 64] &= ~(std::uint64_t{1} << (row % 64)); }
    bool holds(RowNumber row) const {
        return row / 64 < words_.size() && (words_[row / 64] >> (row % 64) & 1U) != 0;
    }
    /// Both sets must have the same limit.
    void unite(const RowSet& other);
    void intersect(const RowSet& other);

    std::size_t size() const;
    /// Ascending.
    std::vector<RowNumber> rows() const;

  private:
    std::vector<std::uint64_t> words_;
};

} // namespace host
