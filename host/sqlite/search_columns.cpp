#include "host/sqlite/search_columns.h"
#include <algorithm>
#include <mutex>
#include <thread>

namespace host {
namespace {

constexpr RowNumber kWorthASecondThread = 20000;

} // namespace

DatabaseResult SearchColumns::find(IndexStore& store, const Condition& condition,
                                   std::vector<RowNumber>& rows) {
    std::set<std::string> attributes;
    condition.collect_attributes(attributes);
    std::int64_t last = 0;
    DatabaseResult result = store.last_sequence(last);
    if (!succeeded(result))
        return result;
    {
        std::shared_lock lock(mutex_);
        if (table_.has(attributes) && seen_ >= last) {
            rows = table_.find(condition);
            return DatabaseResult::done;
        }
    }
    std::unique_lock lock(mutex_);
    if (!table_.has(attributes))
        result = load(store, attributes);
    else
        result = catch_up(store);
    if (succeeded(result))
        rows = table_.find(condition);
    return result;
}

DatabaseResult SearchColumns::load_half(IndexStore& store, RowNumber first, RowNumber last,
                                        ColumnTable& table) {
    return store.scan(first, last, [&table](RowNumber row, std::span<const std::byte> record) {
        table.add_row(row, record);
    });
}

DatabaseResult SearchColumns::load(IndexStore& store, const std::set<std::string>& attributes) {
    std::set<std::string> all = table_.attributes();
    all.insert(attributes.begin(), attributes.end());
    table_.remove_all();
    std::map<std::uint32_t, AttributeNameAndType> names;
    // Rows that are committed during the scan are read again by the catch-up that follows.
    std::int64_t sequence = 0;
    RowNumber largest = 0;
    DatabaseResult result = store.last_sequence(sequence);
    if (succeeded(result))
        result = store.attributes(names);
    if (succeeded(result))
        result = store.largest_row(largest);
    if (!succeeded(result))
        return result;
    const auto prepare = [&](ColumnTable& table) {
        table.set_names(names);
        table.add(all);
    };
    prepare(table_);
    table_.reserve(largest + std::size_t{1});
    if (largest < kWorthASecondThread) {
        result = load_half(store, 0, largest, table_);
    } else {
        ColumnTable upper;
        prepare(upper);
        const RowNumber middle = largest / 2;
        DatabaseResult upper_result = DatabaseResult::failed;
        std::thread helper([&] {
            IndexStore second;
            upper_result = second.open(database_, Connection::Mode::existing);
            if (succeeded(upper_result))
                upper_result = load_half(second, middle + 1, largest, upper);
        });
        result = load_half(store, 0, middle, table_);
        helper.join();
        if (succeeded(result))
            result = upper_result;
        if (succeeded(result))
            table_.join(std::move(upper));
    }
    if (!succeeded(result)) {
        table_.remove_all();
        return result;
    }
    table_.settle();
    seen_ = sequence;
    return catch_up(store);
}

DatabaseResult SearchColumns::catch_up(IndexStore& store) {
    std::vector<RowNumber> rows;
    bool whole = true;
    std::int64_t last = seen_;
    DatabaseResult result = store.changes_since(seen_, rows, whole, last);
    if (!succeeded(result))
        return result;
    if (!whole)
        return load(store, {});
    if (last == seen_)
        return result;
    std::map<std::uint32_t, AttributeNameAndType> names;
    result = store.attributes(names);
    if (!succeeded(result))
        return result;
    table_.set_names(names);
    IndexRow row;
    for (const RowNumber number : rows) {
        result = store.read(number, row);
        if (!succeeded(result))
            return result;
        if (result == DatabaseResult::row)
            table_.set_row(number, row.attributes);
        else
            table_.remove_row(number);
    }
    seen_ = last;
    return DatabaseResult::done;
}

void SearchColumns::apply(IndexStore& store, const std::vector<RowChange>& changes, std::int64_t sequence) {
    std::unique_lock lock(mutex_);
    if (table_.empty() || seen_ >= sequence)
        return;
    if (seen_ + 1 != sequence) {
        // Another process committed in between; a failure shows at the next query.
        (void)catch_up(store);
        return;
    }
    std::map<std::uint32_t, AttributeNameAndType> names;
    if (!succeeded(store.attributes(names)))
        return;
    table_.set_names(names);
    for (const RowChange& change : changes) {
        if (change.erased)
            table_.remove_row(change.row);
        else
            table_.set_row(change.row, change.record);
    }
    seen_ = sequence;
}

void SearchColumns::clear() {
    std::unique_lock lock(mutex_);
    table_.remove_all();
    seen_ = 0;
}

std::size_t SearchColumns::memory_bytes() {
    std::shared_lock lock(mutex_);
    return table_.memory_bytes();
}

std::size_t SearchColumns::arena_bytes() {
    std::shared_lock lock(mutex_);
    return table_.arena_bytes();
}

} // namespace host
