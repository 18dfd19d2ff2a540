// What may stand in an extended attribute, in its list of names, or in the table of mounts, by whoever made
// it.

#include "host/linux/attribute_marker.h"
#include "host/linux/attribute_name.h"
#include "host/linux/mount_table.h"
#include <algorithm>
#include <cstdlib>
#include <string>

namespace {

void check(bool holds) {
    if (!holds)
        std::abort();
}

void check_marker(const std::uint8_t* data, std::size_t size) {
    const std::span<const std::byte> bytes(reinterpret_cast<const std::byte*>(data), size);
    if (const auto marker = host::AttributeMarker::decode(bytes)) {
        check(marker->size <= static_cast<std::uint64_t>(host::kLargestAttribute));
        check(std::ranges::equal(marker->encode(), bytes));
    }
}

void check_names(const std::uint8_t* data, std::size_t size) {
    const char* list = reinterpret_cast<const char*>(data);
    std::size_t total = 0;
    host::for_each_attribute(list, size, [&](const char* extended_name, std::string_view name) {
        check(extended_name >= list && name.data() + name.size() <= list + size);
        check(!name.empty() && name.find('\0') == std::string_view::npos);
        total += name.size();
    });
    check(total <= size);

    const std::string name(list, size);
    const host::AttributeName extended(name.c_str());
    if (extended.error() == 0)
        check(std::string(extended.text()) == "user.be." + std::string(name.c_str()));
}

void check_mounts(const std::uint8_t* data, std::size_t size) {
    for (const host::MountEntry& entry : host::parse_mount_table({reinterpret_cast<const char*>(data), size}))
        (void)host::is_storage(entry);
}

} // namespace

extern "C" int LLVMFuzzerTestOneInput(const std::uint8_t* data, std::size_t size);

extern "C" int LLVMFuzzerTestOneInput(const std::uint8_t* data, std::size_t size) {
    check_marker(data, size);
    check_names(data, size);
    check_mounts(data, size);
    return 0;
}
