#include "host/sqlite/row_set.h"
#include <bit>

namespace host {

void RowSet::unite(const RowSet& other) {
    for (std::size_t i = 0; i < words_.size(); ++i)
        words_[i] |= other.words_[i];
}

void RowSet::intersect(const RowSet& other) {
    for (std::size_t i = 0; i < words_.size(); ++i)
        words_[i] &= other.words_[i];
}

std::size_t RowSet::size() const {
    std::size_t count = 0;
    for (const std::uint64_t word : words_)
        count += static_cast<std::size_t>(std::popcount(word));
    return count;
}

std::vector<RowNumber> RowSet::rows() const {
    std::vector<RowNumber> result(size());
    std::size_t next = 0;
    for (std::size_t i = 0; i < words_.size(); ++i) {
        for (std::uint64_t word = words_[i]; word != 0; word &= word - 1)
            result[next++] =
                static_cast<RowNumber>(i * 64 + static_cast<std::size_t>(std::countr_zero(word)));
    }
    return result;
}

} // namespace host
