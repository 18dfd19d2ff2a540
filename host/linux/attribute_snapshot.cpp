#include "host/linux/attribute_snapshot.h"

#include "host/linux/system_calls.h"
#include <array>
#include <atomic>
#include <cerrno>
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
    list_.clear();
}

AttributeSnapshot::Moment AttributeSnapshot::moment() const {
    return {count_of(volume_).changes.load(std::memory_order_acquire), now()};
}

Status AttributeSnapshot::take(int descriptor) {
    forget();
    missed_ = false;
    // Before the list, so that nothing that happens meanwhile is missed.
    const Moment before = moment();
    const std::span<char> room = list_.room();
    const ssize_t size = system_calls().flistxattr(descriptor, room.data(), room.size());
    if (size < 0)
        return errno;
    if (!list_.take_names(static_cast<std::size_t>(size)))
        return ERANGE;
    changes_ = before.changes;
    taken_at_ = before.time;
    return {};
}

void AttributeSnapshot::take(const AttributeList& list, const Moment& before) {
    list_ = list;
    missed_ = false;
    changes_ = before.changes;
    taken_at_ = before.time;
}

bool AttributeSnapshot::is_fresh() const {
    return taken_at_ != 0 && count_of(volume_).changes.load(std::memory_order_acquire) == changes_ &&
           now() - taken_at_ < kLifetime;
}

} // namespace host
