#include "host/linux/attribute_snapshot.h"

#include "host/linux/system_calls.h"
#include <array>
#include <cerrno>
#include <cstring>
#include <ctime>

namespace host {

namespace {

// Volumes may share a count: a snapshot that ends too early costs a system call.
struct alignas(64) Count {
    std::atomic<std::uint64_t> changes{0};
};

Count& count_of(std::uint64_t volume) {
    static std::array<Count, 16> counts;
    return counts[(volume ^ (volume >> 8) ^ (volume >> 32)) % counts.size()];
}

std::int64_t now() {
    struct timespec time = {};
    ::clock_gettime(CLOCK_MONOTONIC, &time);
    return std::int64_t{time.tv_sec} * 1'000'000'000 + time.tv_nsec;
}

} // namespace

void AttributeSnapshot::volume_changed(std::uint64_t volume) {
    count_of(volume).changes.fetch_add(1, std::memory_order_release);
}

void AttributeSnapshot::forget() {
    taken_at_ = 0;
    names_size_ = 0;
    values_size_ = 0;
    entry_count_ = 0;
}

Status AttributeSnapshot::take(int descriptor) {
    forget();
    missed_ = false;
    // Both are read before the list, so that nothing that happens meanwhile is missed.
    const std::uint64_t changes = count_of(volume_).changes.load(std::memory_order_acquire);
    const std::int64_t time = now();
    const ssize_t size = system_calls().flistxattr(descriptor, names_, sizeof(names_));
    if (size < 0)
        return errno;
    const auto end = static_cast<std::size_t>(size);
    for (std::size_t at = 0; at < end;) {
        if (entry_count_ == kMostEntries) {
            forget();
            return ERANGE;
        }
        const std::size_t length = ::strnlen(names_ + at, end - at);
        entries_[entry_count_++] = {static_cast<std::uint16_t>(at), static_cast<std::uint16_t>(length), 0, 0,
                                    false};
        at += length + 1;
    }
    names_size_ = end;
    changes_ = changes;
    taken_at_ = time;
    return {};
}

bool AttributeSnapshot::is_fresh() const {
    return taken_at_ != 0 && count_of(volume_).changes.load(std::memory_order_acquire) == changes_ &&
           now() - taken_at_ < kLifetime;
}

const AttributeSnapshot::Entry* AttributeSnapshot::find(std::string_view extended_name) const {
    for (std::size_t i = 0; i < entry_count_; ++i) {
        const Entry& entry = entries_[i];
        if (entry.name_size == extended_name.size() &&
            std::memcmp(names_ + entry.name, extended_name.data(), extended_name.size()) == 0)
            return &entry;
    }
    return nullptr;
}

std::optional<std::span<const std::byte>> AttributeSnapshot::value(std::string_view extended_name) const {
    const Entry* entry = find(extended_name);
    if (entry == nullptr || !entry->has_value)
        return std::nullopt;
    return std::span(values_ + entry->value, entry->value_size);
}

void AttributeSnapshot::keep(std::string_view extended_name, std::span<const std::byte> value) {
    const Entry* found = find(extended_name);
    if (found == nullptr || value.size() > kValuesRoom - values_size_)
        return;
    Entry& entry = entries_[found - entries_];
    std::memcpy(values_ + values_size_, value.data(), value.size());
    entry.value = static_cast<std::uint16_t>(values_size_);
    entry.value_size = static_cast<std::uint16_t>(value.size());
    entry.has_value = true;
    values_size_ += value.size();
}

} // namespace host
