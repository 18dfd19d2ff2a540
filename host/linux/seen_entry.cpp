#include "host/linux/seen_entry.h"

#include "host/linux/attribute_marker.h"
#include "host/linux/attribute_name.h"
#include <algorithm>
#include <cstring>
#include <ctime>

namespace host {

namespace {

constexpr std::int64_t kLifetime = 50'000'000; // nanoseconds
constexpr std::size_t kLongestLeaf = 255;

struct SeenFile {
    std::int64_t time = 0;
    DeviceId device = 0;
    std::uint64_t directory = 0;
    std::size_t leaf_size = 0;
    char leaf[kLongestLeaf];
    KnownAttributes attributes;
};

SeenFile& seen_file() {
    static thread_local SeenFile seen;
    return seen;
}

std::int64_t now() {
    struct timespec time = {};
    ::clock_gettime(CLOCK_MONOTONIC_COARSE, &time);
    return std::int64_t{time.tv_sec} * 1'000'000'000 + time.tv_nsec;
}

} // namespace

void KnownAttributes::add(std::string_view name) {
    known = known && list.add(kAttributePrefix, name);
}

void KnownAttributes::add(std::string_view name, std::uint32_t type, std::span<const std::byte> bytes,
                          Ending ending) {
    add(name);
    // A value of that type never lies on a file as it is.
    if (!known || type == AttributeMarker::kReservedType)
        return;
    const std::size_t end = sizeof(type) + bytes.size();
    const std::span<std::byte> stored = list.value_of_last(end + (ending == Ending::terminated ? 1 : 0));
    if (stored.empty())
        return;
    store_big_endian(type, stored.data());
    std::copy(bytes.begin(), bytes.end(), stored.begin() + sizeof(type));
    if (ending == Ending::terminated)
        stored[end] = std::byte{0};
}

void set_seen_file(const EntryRef& ref) {
    SeenFile& seen = seen_file();
    seen.attributes.known = false;
    if (ref.leaf.empty() || ref.leaf.size() > kLongestLeaf)
        return;
    seen.time = now();
    seen.device = ref.device;
    seen.directory = ref.directory;
    seen.leaf_size = ref.leaf.size();
    std::memcpy(seen.leaf, ref.leaf.data(), ref.leaf.size());
}

bool was_seen_as_file(const EntryRef& ref) {
    const SeenFile& seen = seen_file();
    return seen.directory == ref.directory && seen.device == ref.device && !ref.leaf.empty() &&
           seen.leaf_size == ref.leaf.size() &&
           std::memcmp(seen.leaf, ref.leaf.data(), ref.leaf.size()) == 0 && now() - seen.time < kLifetime;
}

KnownAttributes& attributes_of_seen_file() {
    return seen_file().attributes;
}

} // namespace host
