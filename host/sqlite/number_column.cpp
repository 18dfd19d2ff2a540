#include "host/sqlite/number_column.h"
#include <bit>

namespace host {

void NumberColumn::set(RowNumber row, const AttributeValue& number) {
    if (row >= kinds_.size()) {
        kinds_.resize(row + std::size_t{1}, AttributeValue::Kind::none);
        bits_.resize(row + std::size_t{1}, 0);
    }
    kinds_[row] = number.kind;
    switch (number.kind) {
    case AttributeValue::Kind::signed_integer:
        bits_[row] = static_cast<std::uint64_t>(number.signed_integer);
        break;
    case AttributeValue::Kind::unsigned_integer:
        bits_[row] = number.unsigned_integer;
        break;
    default:
        bits_[row] = std::bit_cast<std::uint64_t>(number.real);
    }
}

void NumberColumn::remove(RowNumber row) {
    if (row < kinds_.size())
        kinds_[row] = AttributeValue::Kind::none;
}

void NumberColumn::find(const Comparison& comparison, RowSet& rows) const {
    for (RowNumber row = 0; row < kinds_.size(); ++row) {
        if (kinds_[row] == AttributeValue::Kind::none)
            continue;
        AttributeValue value;
        value.kind = kinds_[row];
        value.signed_integer = static_cast<std::int64_t>(bits_[row]);
        value.unsigned_integer = bits_[row];
        value.real = std::bit_cast<double>(bits_[row]);
        if (comparison.holds(value))
            rows.insert(row);
    }
}

void NumberColumn::join(NumberColumn&& other) {
    if (kinds_.size() < other.kinds_.size()) {
        kinds_.resize(other.kinds_.size(), AttributeValue::Kind::none);
        bits_.resize(other.bits_.size(), 0);
    }
    for (std::size_t row = 0; row < other.kinds_.size(); ++row) {
        if (other.kinds_[row] != AttributeValue::Kind::none) {
            kinds_[row] = other.kinds_[row];
            bits_[row] = other.bits_[row];
        }
    }
}

} // namespace host
