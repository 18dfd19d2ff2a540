#include "host/sqlite/column_table.h"
#include "host/sqlite/attribute_record.h"
#include <algorithm>

namespace host {

bool ColumnTable::has(const std::set<std::string>& attributes) const {
    return std::all_of(attributes.begin(), attributes.end(),
                       [this](const std::string& name) { return columns_.contains(name); });
}

void ColumnTable::add(const std::set<std::string>& attributes) {
    for (const std::string& name : attributes) {
        auto& columns = columns_[name];
        if (!columns)
            columns = std::make_unique<Columns>();
    }
    set_names(names_);
}

void ColumnTable::remove_all() {
    columns_.clear();
    targets_.clear();
    names_.clear();
    largest_ = 0;
}

std::set<std::string> ColumnTable::attributes() const {
    std::set<std::string> result;
    for (const auto& [name, columns] : columns_)
        result.insert(name);
    return result;
}

void ColumnTable::set_names(const std::map<std::uint32_t, AttributeNameAndType>& names) {
    if (&names != &names_)
        names_ = names;
    targets_.clear();
    for (const auto& [id, attribute] : names_) {
        if (targets_.size() <= id)
            targets_.resize(id + std::size_t{1});
        const auto found = columns_.find(attribute.name);
        targets_[id] = {found == columns_.end() ? nullptr : found->second.get(), attribute.type};
    }
}

bool ColumnTable::knows(std::uint32_t attribute_id) const {
    return names_.contains(attribute_id);
}

void ColumnTable::add_row(RowNumber row, std::span<const std::byte> record) {
    largest_ = std::max(largest_, row);
    RecordReader reader(record);
    RecordedAttribute attribute;
    while (reader.next(attribute)) {
        if (attribute.id >= targets_.size())
            continue;
        const Target& target = targets_[attribute.id];
        if (target.columns == nullptr)
            continue;
        if (attribute.cut) {
            target.columns->unmirrored.insert(row);
            continue;
        }
        const AttributeValue value = attribute_value(target.type, attribute.bytes);
        if (value.kind == AttributeValue::Kind::text)
            target.columns->text.set(row, value.text);
        else if (value.kind != AttributeValue::Kind::none)
            target.columns->numbers.set(row, value);
    }
}

void ColumnTable::set_row(RowNumber row, std::span<const std::byte> record) {
    largest_ = std::max(largest_, row);
    std::set<const Columns*> texts;
    std::set<const Columns*> numbers;
    std::set<const Columns*> unmirrored;
    RecordReader reader(record);
    RecordedAttribute attribute;
    while (reader.next(attribute)) {
        if (attribute.id >= targets_.size() || targets_[attribute.id].columns == nullptr)
            continue;
        const Target& target = targets_[attribute.id];
        if (attribute.cut)
            unmirrored.insert(target.columns);
        else if (kind_of_type(target.type) == AttributeValue::Kind::text)
            texts.insert(target.columns);
        else
            numbers.insert(target.columns);
    }
    for (auto& [name, columns] : columns_) {
        if (!texts.contains(columns.get()))
            columns->text.remove(row);
        if (!numbers.contains(columns.get()))
            columns->numbers.remove(row);
        if (!unmirrored.contains(columns.get()))
            columns->unmirrored.erase(row);
    }
    add_row(row, record);
}

void ColumnTable::remove_row(RowNumber row) {
    for (auto& [name, columns] : columns_) {
        columns->text.remove(row);
        columns->numbers.remove(row);
        columns->unmirrored.erase(row);
    }
}

void ColumnTable::join(ColumnTable&& other) {
    for (auto& [name, columns] : columns_) {
        Columns& others = *other.columns_.at(name);
        columns->text.join(std::move(others.text));
        columns->numbers.join(std::move(others.numbers));
        columns->unmirrored.merge(others.unmirrored);
    }
    largest_ = std::max(largest_, other.largest_);
}

void ColumnTable::reserve(std::size_t rows) {
    for (auto& [name, columns] : columns_)
        columns->text.reserve(rows, rows * 16);
}

void ColumnTable::settle() {
    for (auto& [name, columns] : columns_)
        columns->text.settle();
}

bool ColumnTable::narrows(const Condition& condition) const {
    return condition.bound();
}

RowSet ColumnTable::evaluate(const Condition& condition) const {
    if (condition.kind() == Condition::Kind::both) {
        // A side that does not narrow the rows down holds for all of them, as far as is known here.
        if (!narrows(condition.left()))
            return evaluate(condition.right());
        RowSet rows = evaluate(condition.left());
        if (narrows(condition.right()))
            rows.intersect(evaluate(condition.right()));
        return rows;
    }
    if (condition.kind() == Condition::Kind::either) {
        RowSet rows = evaluate(condition.left());
        rows.unite(evaluate(condition.right()));
        return rows;
    }
    RowSet rows(limit());
    const Comparison& comparison = condition.comparison();
    const Columns& columns = *columns_.at(comparison.attribute());
    columns.text.find(comparison, rows);
    columns.numbers.find(comparison, rows);
    for (const RowNumber row : columns.unmirrored)
        rows.insert(row);
    return rows;
}

std::vector<RowNumber> ColumnTable::find(const Condition& condition) const {
    return evaluate(condition).rows();
}

std::size_t ColumnTable::memory_bytes() const {
    std::size_t bytes = 0;
    for (const auto& [name, columns] : columns_)
        bytes += columns->text.memory_bytes() + columns->numbers.memory_bytes() +
                 columns->unmirrored.size() * 4 * sizeof(void*);
    return bytes;
}

std::size_t ColumnTable::arena_bytes() const {
    std::size_t bytes = 0;
    for (const auto& [name, columns] : columns_)
        bytes += columns->text.arena_bytes();
    return bytes;
}

} // namespace host
