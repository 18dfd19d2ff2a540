#include "host/linux/raw_attribute.h"

#include "host/linux/attribute_snapshot.h"
#include "host/linux/system_calls.h"
#include <cerrno>
#include <linux/limits.h>
#include <memory>

namespace host {

Status attribute_error(int error) {
    return error == ENODATA ? ENOENT : error;
}

Status RawAttribute::load(int descriptor, const char* extended_name) {
    marker_.reset();
    ssize_t size = system_calls().fgetxattr(descriptor, extended_name, short_, sizeof(short_));
    const std::byte* bytes = short_;
    if (size < 0 && errno == ERANGE) {
        static thread_local std::unique_ptr<std::byte[]> large;
        if (!large)
            large.reset(new std::byte[XATTR_SIZE_MAX]);
        size = system_calls().fgetxattr(descriptor, extended_name, large.get(), XATTR_SIZE_MAX);
        bytes = large.get();
    }
    if (size < 0)
        return attribute_error(errno);
    bytes_ = {bytes, static_cast<std::size_t>(size)};
    return take_apart();
}

Status RawAttribute::load(const AttributeFile& file, const char* extended_name) {
    if (file.recent == nullptr)
        return load(file.descriptor, extended_name);
    AttributeSnapshot& recent = *file.recent;
    const std::string_view name = extended_name;
    bool known = recent.is_fresh();
    // A program that asked for something in vain is likely to go on asking.
    if (!known && recent.missed_before())
        known = recent.take(file.descriptor).ok();
    if (known && !recent.has(name))
        return ENOENT;
    if (const auto kept = known ? recent.value(name) : std::nullopt) {
        marker_.reset();
        bytes_ = *kept;
        return take_apart();
    }
    const Status loaded = load(file.descriptor, extended_name);
    if (loaded.ok() && known)
        recent.keep(name, bytes_);
    else if (loaded.error() == ENOENT)
        recent.note_miss();
    return loaded;
}

Status RawAttribute::take_apart() {
    if (bytes_.size() < 4)
        return ENOENT;
    if (load_big_endian(bytes_.data()) == AttributeMarker::kReservedType) {
        marker_ = AttributeMarker::decode(bytes_);
        if (!marker_)
            return ENOENT;
    }
    return {};
}

std::int64_t RawAttribute::size() const {
    return spilled() ? static_cast<std::int64_t>(marker_->size)
                     : static_cast<std::int64_t>(bytes_.size() - 4);
}

} // namespace host
