#include "host/linux/attribute_list.h"

#include <algorithm>
#include <cstring>

namespace host {

AttributeList& AttributeList::operator=(const AttributeList& other) {
    names_size_ = other.names_size_;
    values_size_ = other.values_size_;
    entry_count_ = other.entry_count_;
    if (this != &other) {
        std::copy_n(other.names_, names_size_, names_);
        std::copy_n(other.values_, values_size_, values_);
        std::copy_n(other.entries_, entry_count_, entries_);
    }
    return *this;
}

void AttributeList::clear() {
    names_size_ = 0;
    values_size_ = 0;
    entry_count_ = 0;
}

bool AttributeList::take_names(std::size_t size) {
    clear();
    for (std::size_t at = 0; at < size;) {
        if (entry_count_ == kMostEntries) {
            clear();
            return false;
        }
        const std::size_t length = ::strnlen(names_ + at, size - at);
        entries_[entry_count_++] = {static_cast<std::uint16_t>(at), static_cast<std::uint16_t>(length), 0, 0,
                                    false};
        at += length + 1;
    }
    names_size_ = size;
    return true;
}

bool AttributeList::add(std::string_view prefix, std::string_view name) {
    const std::size_t length = prefix.size() + name.size();
    if (entry_count_ == kMostEntries || length + 1 > kNamesRoom - names_size_)
        return false;
    char* const end = std::copy(prefix.begin(), prefix.end(), names_ + names_size_);
    *std::copy(name.begin(), name.end(), end) = '\0';
    entries_[entry_count_++] = {static_cast<std::uint16_t>(names_size_), static_cast<std::uint16_t>(length),
                                0, 0, false};
    names_size_ += length + 1;
    return true;
}

const AttributeList::Entry* AttributeList::find(std::string_view extended_name) const {
    for (std::size_t i = 0; i < entry_count_; ++i) {
        const Entry& entry = entries_[i];
        if (entry.name_size == extended_name.size() &&
            std::memcmp(names_ + entry.name, extended_name.data(), extended_name.size()) == 0)
            return &entry;
    }
    return nullptr;
}

std::optional<std::span<const std::byte>> AttributeList::value(std::string_view extended_name) const {
    const Entry* entry = find(extended_name);
    if (entry == nullptr || !entry->has_value)
        return std::nullopt;
    return std::span(values_ + entry->value, entry->value_size);
}

std::span<std::byte> AttributeList::make_room(Entry& entry, std::size_t size) {
    if (size > kValuesRoom - values_size_)
        return {};
    entry.value = static_cast<std::uint16_t>(values_size_);
    entry.value_size = static_cast<std::uint16_t>(size);
    entry.has_value = true;
    values_size_ += size;
    return {values_ + entry.value, size};
}

std::span<std::byte> AttributeList::value_of_last(std::size_t size) {
    return entry_count_ == 0 ? std::span<std::byte>() : make_room(entries_[entry_count_ - 1], size);
}

void AttributeList::keep(std::string_view extended_name, std::span<const std::byte> value) {
    const Entry* const found = find(extended_name);
    if (found == nullptr)
        return;
    const std::span<std::byte> room = make_room(entries_[found - entries_], value.size());
    std::copy_n(value.begin(), room.size(), room.begin());
}

} // namespace host
