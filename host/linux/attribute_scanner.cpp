#include "host/linux/attribute_scanner.h"

#include "host/linux/attribute_name.h"
#include "host/linux/blob_store.h"
#include "host/linux/raw_attribute.h"
#include "host/linux/system_calls.h"
#include <algorithm>
#include <cerrno>
#include <linux/limits.h>

namespace host {

AttributeScanner::AttributeScanner(std::size_t largest_value)
    : largest_value_(largest_value), names_(1024),
      value_(std::max(std::min<std::size_t>(largest_value, XATTR_SIZE_MAX) + 4, AttributeMarker::kSize)) {}

Status AttributeScanner::scan_erased(const AttributeFile& file, Callback callback, void* target) {
    passed_over_ = false;
    ssize_t listed = system_calls().flistxattr(file.descriptor, names_.data(), names_.size());
    if (listed < 0 && errno == ERANGE) {
        names_.resize(XATTR_LIST_MAX);
        listed = system_calls().flistxattr(file.descriptor, names_.data(), names_.size());
    }
    if (listed < 0)
        return errno;

    for_each_attribute(
        names_.data(), static_cast<std::size_t>(listed),
        [&](const char* extended_name, std::string_view name) {
            ScannedAttribute attribute;
            attribute.name = name;
            const ssize_t size =
                system_calls().fgetxattr(file.descriptor, extended_name, value_.data(), value_.size());
            if (size < 0 && errno == ERANGE) {
                attribute.complete = false;
                callback(target, attribute);
                return;
            }
            if (size < 4) {
                passed_over_ = true;
                return;
            }
            const std::span<const std::byte> stored(value_.data(), static_cast<std::size_t>(size));
            attribute.type = load_big_endian(stored.data());
            attribute.bytes = stored.subspan(4);
            if (attribute.type == AttributeMarker::kReservedType) {
                const std::optional<AttributeMarker> marker = AttributeMarker::decode(stored);
                if (!marker || !read_spilled(file, *marker, attribute)) {
                    passed_over_ = true;
                    return;
                }
            } else if (attribute.bytes.size() > largest_value_) {
                attribute.bytes = {};
                attribute.complete = false;
            }
            callback(target, attribute);
        });
    return {};
}

bool AttributeScanner::read_spilled(const AttributeFile& file, const AttributeMarker& marker,
                                    ScannedAttribute& attribute) {
    attribute.type = marker.type;
    attribute.bytes = {};
    attribute.spilled = true;
    // Its bytes are not wanted, so whether they are whole is not found out.
    attribute.complete = marker.size <= largest_value_;
    if (!attribute.complete)
        return true;
    const Result<Descriptor> blob = blob_store::open(file.device, file.descriptor, marker);
    if (!blob.ok())
        return false;
    spilled_.resize(static_cast<std::size_t>(marker.size));
    attribute.bytes = spilled_;
    return read_fully(blob->get(), spilled_.data(), spilled_.size(), 0).ok();
}

} // namespace host
