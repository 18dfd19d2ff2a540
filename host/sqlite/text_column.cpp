#include "host/sqlite/text_column.h"
#include <algorithm>
#include <cstring>
#include <limits>

namespace host {
namespace {

std::uint32_t hash_of(std::string_view text) {
    std::uint64_t hash = text.size() * 0x9e3779b97f4a7c15U;
    while (text.size() >= 8) {
        std::uint64_t word = 0;
        std::memcpy(&word, text.data(), 8);
        hash = (hash ^ word) * 0xff51afd7ed558ccdU;
        hash ^= hash >> 32;
        text.remove_prefix(8);
    }
    std::uint64_t word = 0;
    std::memcpy(&word, text.data(), text.size());
    hash = (hash ^ word) * 0xff51afd7ed558ccdU;
    return static_cast<std::uint32_t>(hash >> 40);
}

constexpr std::size_t kSmallestGarbage = 65536;

} // namespace

TextColumn::TextColumn() : recent_(std::make_unique<ValueNumber[]>(kRecentValues)) {
    std::fill_n(recent_.get(), kRecentValues, kNoValue);
}

void TextColumn::reserve(std::size_t rows, std::size_t bytes) {
    value_of_row_.reserve(rows);
    arena_.reserve(bytes);
}

void TextColumn::settle() {
    arena_.shrink_to_fit();
    starts_.shrink_to_fit();
    rows_of_value_.shrink_to_fit();
    value_of_row_.shrink_to_fit();
    value_of_block_.shrink_to_fit();
}

inline std::size_t TextColumn::value_end(ValueNumber value) const {
    return value + std::size_t{1} < starts_.size() ? starts_[value + 1] : arena_.size();
}

std::string_view TextColumn::value_text(ValueNumber value) const {
    const std::size_t start = starts_[value];
    return {arena_.data() + start, value_end(value) - start - 1};
}

bool TextColumn::holds(RowNumber row) const {
    return row < value_of_row_.size() && value_of_row_[row] != kNoValue;
}

std::string_view TextColumn::text(RowNumber row) const {
    return holds(row) ? value_text(value_of_row_[row]) : std::string_view();
}

TextColumn::ValueNumber TextColumn::add(std::string_view text) {
    const auto value = static_cast<ValueNumber>(starts_.size());
    const std::size_t start = arena_.size();
    starts_.push_back(static_cast<std::uint32_t>(start));
    rows_of_value_.push_back(kNoRow);
    arena_.append(text.data(), text.size());
    arena_.push_back('\0');
    while (value_of_block_.size() * kBlock < arena_.size())
        value_of_block_.push_back(value_of_block_.size() * kBlock >= start ? value : value - 1);
    garbage_ += text.size() + 1;
    return value;
}

TextColumn::ValueNumber TextColumn::find_or_add(std::string_view text) {
    ValueNumber& recent = recent_[hash_of(text) % kRecentValues];
    if (recent != kNoValue && value_text(recent) == text)
        return recent;
    if (arena_.size() + text.size() + 1 > std::numeric_limits<std::uint32_t>::max())
        return kNoValue;
    return recent = add(text);
}

void TextColumn::attach(RowNumber row, ValueNumber value) {
    if (row >= value_of_row_.size())
        value_of_row_.resize(row + std::size_t{1}, kNoValue);
    value_of_row_[row] = value;
    std::uint32_t& rows = rows_of_value_[value];
    if (rows == kNoRow) {
        garbage_ -= value_end(value) - starts_[value];
        rows = row;
        return;
    }
    if ((rows & kIsList) == 0) {
        if (free_lists_.empty()) {
            free_lists_.push_back(static_cast<std::uint32_t>(lists_.size()));
            lists_.emplace_back();
        }
        const std::uint32_t place = free_lists_.back();
        free_lists_.pop_back();
        lists_[place].rows.assign({rows});
        lists_[place].live = 1;
        list_capacity_ += lists_[place].rows.capacity();
        rows = kIsList | place;
    }
    RowList& list = lists_[rows & ~kIsList];
    if (list.live == 0)
        garbage_ -= value_end(value) - starts_[value];
    const std::size_t capacity = list.rows.capacity();
    if (list.rows.size() == capacity)
        list.rows.reserve(capacity + capacity / 4 + 2);
    list.rows.push_back(row);
    ++list.live;
    list_capacity_ += list.rows.capacity() - capacity;
}

void TextColumn::detach(RowNumber row, ValueNumber value) {
    value_of_row_[row] = kNoValue;
    std::uint32_t& rows = rows_of_value_[value];
    if ((rows & kIsList) == 0) {
        rows = kNoRow;
        garbage_ += value_end(value) - starts_[value];
        return;
    }
    RowList& list = lists_[rows & ~kIsList];
    if (--list.live == 0)
        garbage_ += value_end(value) - starts_[value];
    if (list.rows.size() > std::size_t{list.live} * 2 + 16)
        sweep(list, value);
}

void TextColumn::sweep(RowList& list, ValueNumber value) {
    list_capacity_ -= list.rows.capacity();
    std::erase_if(list.rows, [&](RowNumber row) { return value_of_row_[row] != value; });
    std::sort(list.rows.begin(), list.rows.end());
    list.rows.erase(std::unique(list.rows.begin(), list.rows.end()), list.rows.end());
    list.rows.shrink_to_fit();
    list_capacity_ += list.rows.capacity();
}

void TextColumn::set(RowNumber row, std::string_view text) {
    if (holds(row)) {
        const ValueNumber old = value_of_row_[row];
        if (value_text(old) == text)
            return;
        detach(row, old);
    }
    const ValueNumber value = find_or_add(text);
    if (value == kNoValue)
        return;
    attach(row, value);
    if (garbage_ > kSmallestGarbage && garbage_ > arena_.size() / 2)
        compact();
}

void TextColumn::remove(RowNumber row) {
    if (!holds(row))
        return;
    detach(row, value_of_row_[row]);
    if (garbage_ > kSmallestGarbage && garbage_ > arena_.size() / 2)
        compact();
}

void TextColumn::join(TextColumn&& other) {
    const auto bytes = static_cast<std::uint32_t>(arena_.size());
    if (arena_.size() + other.arena_.size() > std::numeric_limits<std::uint32_t>::max())
        return;
    const auto values = static_cast<ValueNumber>(starts_.size());
    const auto lists = static_cast<std::uint32_t>(lists_.size());
    arena_.append(other.arena_.data(), other.arena_.size());
    starts_.reserve(starts_.size() + other.starts_.size());
    rows_of_value_.reserve(starts_.size() + other.starts_.size());
    for (std::size_t i = 0; i < other.starts_.size(); ++i) {
        starts_.push_back(other.starts_[i] + bytes);
        const std::uint32_t rows = other.rows_of_value_[i];
        rows_of_value_.push_back((rows & kIsList) != 0 ? rows + lists : rows);
    }
    if (value_of_row_.size() < other.value_of_row_.size())
        value_of_row_.resize(other.value_of_row_.size(), kNoValue);
    for (std::size_t row = 0; row < other.value_of_row_.size(); ++row) {
        if (other.value_of_row_[row] != kNoValue)
            value_of_row_[row] = other.value_of_row_[row] + values;
    }
    for (RowList& list : other.lists_)
        lists_.push_back(std::move(list));
    for (const std::uint32_t place : other.free_lists_)
        free_lists_.push_back(place + lists);
    list_capacity_ += other.list_capacity_;
    garbage_ += other.garbage_;
    ValueNumber value = value_of_block_.empty() ? 0 : value_of_block_[value_of_block_.size() - 1];
    while (value_of_block_.size() * kBlock < arena_.size()) {
        while (value + std::size_t{1} < starts_.size() &&
               starts_[value + 1] <= value_of_block_.size() * kBlock)
            ++value;
        value_of_block_.push_back(value);
    }
    other = TextColumn();
}

inline TextColumn::ValueNumber TextColumn::value_at(std::size_t position, ValueNumber not_before) const {
    ValueNumber value = std::max(not_before, value_of_block_[position / kBlock]);
    while (value + std::size_t{1} < starts_.size() && starts_[value + 1] <= position)
        ++value;
    return value;
}

inline void TextColumn::insert_rows(ValueNumber value, RowSet& rows) const {
    const std::uint32_t holder = rows_of_value_[value];
    if (holder == kNoRow)
        return;
    if ((holder & kIsList) == 0) {
        rows.insert(holder);
        return;
    }
    const RowList& list = lists_[holder & ~kIsList];
    if (list.live == list.rows.size()) {
        for (const RowNumber row : list.rows)
            rows.insert(row);
        return;
    }
    for (const RowNumber row : list.rows) {
        if (value_of_row_[row] == value)
            rows.insert(row);
    }
}

std::size_t TextColumn::find_in_bytes(ValueNumber first, ValueNumber last, std::string_view needle,
                                      SearchKernel kernel, RowSet& rows) const {
    const std::size_t start = starts_[first];
    ValueNumber value = first;
    std::size_t hits = 0;
    search(kernel, arena_.data() + start, value_end(last - 1) - start, needle, [&](std::size_t position) {
        value = value_at(start + position, value);
        insert_rows(value, rows);
        ++hits;
        return value_end(value) - start;
    });
    return hits;
}

std::size_t TextColumn::find_by_value(ValueNumber first, ValueNumber last, std::string_view needle,
                                      RowSet& rows) const {
    std::size_t hits = 0;
#if defined(__x86_64__)
    match_texts_avx2(arena_.data(), arena_.size(), starts_.data(), first, last, value_end(last - 1), needle,
                     [&](std::size_t value, bool holds) {
                         hits += holds ? 1 : 0;
                         const std::uint32_t holder = rows_of_value_[value];
                         if (holder < kNoRow)
                             rows.insert_if(holder, holds);
                         else if (holds)
                             insert_rows(static_cast<ValueNumber>(value), rows);
                     });
#endif
    return hits;
}

void TextColumn::find_containing(std::string_view needle, SearchKernel kernel, RowSet& rows) const {
    // Few hits: one pass over the bytes, and the value is looked up for each hit. Many hits: value by value,
    // which costs the same for a hit as for none. Neighbouring values tell which it will be.
    constexpr ValueNumber kPart = 4096;
    const auto values = static_cast<ValueNumber>(starts_.size());
    bool many = false;
    for (ValueNumber first = 0; first < values;) {
        const ValueNumber last = first + std::min(kPart, values - first);
        const std::size_t hits = many && kernel == SearchKernel::avx2
                                     ? find_by_value(first, last, needle, rows)
                                     : find_in_bytes(first, last, needle, kernel, rows);
        many = hits > (last - first) / 4 * 3;
        first = last;
    }
}

void TextColumn::find(const Comparison& comparison, RowSet& rows) const {
    if (comparison.op() == Predicate::Operator::contains && !comparison.text().empty() &&
        comparison.letter_case() == Predicate::Case::sensitive)
        return find_containing(comparison.text(), best_search_kernel(), rows);
    for (ValueNumber value = 0; value < starts_.size(); ++value) {
        if (comparison.holds_for_text(value_text(value)))
            insert_rows(value, rows);
    }
}

void TextColumn::compact() {
    TextColumn fresh;
    fresh.arena_.reserve(arena_.size() - garbage_);
    fresh.value_of_row_.resize(value_of_row_.size(), kNoValue);
    for (RowNumber row = 0; row < value_of_row_.size(); ++row) {
        if (value_of_row_[row] == kNoValue)
            continue;
        const std::string_view text = value_text(value_of_row_[row]);
        fresh.attach(row, fresh.find_or_add(text));
    }
    *this = std::move(fresh);
}

std::size_t TextColumn::memory_bytes() const {
    return arena_.memory_bytes() + starts_.memory_bytes() + rows_of_value_.memory_bytes() +
           value_of_row_.memory_bytes() + value_of_block_.memory_bytes() +
           lists_.capacity() * sizeof(RowList) + free_lists_.capacity() * sizeof(std::uint32_t) +
           list_capacity_ * sizeof(RowNumber) + kRecentValues * sizeof(ValueNumber);
}

} // namespace host
